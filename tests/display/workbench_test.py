#!/usr/bin/env python3
"""The workbench on an X server, used by another client: what a person does with it that no script can do.

usage: workbench_test.py WORKBENCH HAND

HAND is x_hand, the person. Left out, and said so, where there is no Xvfb.
"""

import contextlib
import os
import pathlib
import select
import shutil
import subprocess
import sys
import tempfile
import time
import unittest
import urllib.parse

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import x_server  # noqa: E402

LIMIT = 60  # seconds
TURNS = 300  # how often a workbench can be asked what it shows
INSIDE = (300, 300)  # a point of the window, which comes up at 20, 20
KEYS = {"/": "slash", "-": "minus", "_": "Shift_L+underscore"}  # of the letters of a temporary folder
NOBODY = ["setpriv", "--reuid=65534", "--regid=65534", "--clear-groups"]


class ScreenCase(unittest.TestCase):
    def setUp(self):
        self.folder = pathlib.Path(tempfile.mkdtemp(prefix="qxworkbench-screen-"))
        self.addCleanup(shutil.rmtree, self.folder, ignore_errors=True)
        used = contextlib.ExitStack()
        self.addCleanup(used.close)
        self.environment = used.enter_context(x_server.running())
        self.environment["QXCORE_REGISTRY"] = str(self.folder / "registry.db")
        self.hand = self.start([HAND])
        if self.line(self.hand) != "ready":
            self.skipTest("the server takes no input from clients, or there is no libXtst")

    def start(self, arguments):
        process = subprocess.Popen(arguments, cwd=self.folder, env=self.environment, bufsize=0, stdin=subprocess.PIPE,
                                   stdout=subprocess.PIPE, stderr=subprocess.PIPE)

        def stop():
            process.kill()
            process.communicate()

        self.addCleanup(stop)
        return process

    def line(self, process):
        """The next line of its output."""
        self.assertTrue(select.select([process.stdout], [], [], LIMIT)[0], "no answer")
        return os.fsdecode(process.stdout.readline().rstrip(b"\n"))

    def do(self, *words):
        """Lets the person do something and returns the answer."""
        self.hand.stdin.write(b"\t".join(os.fsencode(str(word)) for word in words) + b"\n")
        return self.line(self.hand)

    def drop(self, *paths):
        """Names files as file managers do."""
        uris = ["file://" + urllib.parse.quote_from_bytes(os.fsencode(path)) for path in paths]
        self.assertEqual(self.do("drop", *INSIDE, *uris), "taken")

    def wait_for(self, condition):
        """Waits until the titles on the screen are as they should be."""
        end = time.monotonic() + LIMIT
        while not condition(titles := self.do("titles").split("\t")):
            self.assertLess(time.monotonic(), end, titles)
            time.sleep(0.02)

    def wait_for_title(self, title):
        self.wait_for(lambda titles: title in titles)

    def texts(self, folder, *names):
        """Makes a folder with texts of these names, and returns it."""
        path = self.folder / folder
        path.mkdir(parents=True)
        for name in names:
            (path / name).write_text("Größe", encoding="utf-8")
        return path

    def start_and_wait(self, *wrapper, shows="print list\necho -\nprint status\n", first=""):
        """Starts a workbench that writes what it shows whenever ready for the next turn and told to."""
        self.turn = 0
        turns = "".join(f"-echo ready\npause go{turn}\n{shows}" for turn in range(TURNS))
        (self.folder / "script.txt").write_text(first + turns)
        self.workbench = self.start([*wrapper, WORKBENCH, "--script", "script.txt"])
        self.assertEqual(self.line(self.workbench), "ready", "the workbench does not come up")

    def next_turn(self):
        (self.folder / f"go{self.turn}").touch()
        self.turn += 1


class DropTest(ScreenCase):
    def go(self):
        """The names in the list and the status, once all work is done."""
        self.next_turn()
        names = []
        while (line := self.line(self.workbench)) != "-":
            names.append(line.split("\t")[0])
        status = self.line(self.workbench)
        self.assertEqual(self.line(self.workbench), "ready")
        return names, status

    def test_a_folder_fills_the_list(self):
        self.start_and_wait()
        self.drop(self.texts("first", "b.txt", "a.txt"))
        self.assertEqual(self.go(), (["a.txt", "b.txt"], f"2 files in {self.folder}/first"))
        self.wait_for_title(f"{self.folder}/first – qxcore workbench")
        self.drop(self.texts("second/below", "c.txt").parent)  # takes the place of the one before
        self.assertEqual(self.go(), (["below/c.txt"], f"1 file in {self.folder}/second"))

    def test_whatever_its_name_is(self):
        self.start_and_wait()
        for name in ("two  blanks ", "100%25 #1?&=+~", "Größe \u65e5\u672c\U0001f600", "it's; \"quoted\"", "new\nline", "back\\slash", "A:b",
                     os.fsdecode(b"bad \xff\xfe\xc3")):
            folder = self.texts(name, "in " + name)
            self.drop(folder)
            names, status = self.go()
            self.assertEqual((len(names), status[:10]), (1, "1 file in "), (name, names, status))
    def test_what_cannot_be_opened_is_told(self):
        """Each in one line; what was open stays."""
        folder, other, gone = self.texts("texts", "a.txt"), self.texts("other", "b.txt"), self.texts("gone")
        gone.rmdir()
        self.start_and_wait()
        self.drop(folder)
        self.go()
        for paths, said in (([folder / "a.txt"], f"{folder}/a.txt: it is no folder"), ([gone], f"{gone}: there is no such folder"),
                            (["/dev/null"], "/dev/null: it is no folder"),
                            ([folder, other], "one folder can be open, and 2 were dropped")):
            self.drop(*paths)
            self.assertEqual(self.go(), (["a.txt"], said))
        self.assertEqual(self.do("drop", *INSIDE, "https://example.com/texts"), "taken")  # as a browser's link
        self.assertEqual(self.go()[0], ["a.txt"])
        self.workbench.kill()
        messages = os.fsdecode(self.workbench.stderr.read()).splitlines()
        self.assertEqual(len(messages), 4, messages)

    @unittest.skipIf(os.geteuid() == 0 and not shutil.which("setpriv"), "needs rights of files, and to have none")
    def test_a_folder_of_somebody_else(self):
        folder, locked = self.texts("texts", "a.txt"), self.texts("locked", "b.txt")
        locked.chmod(0)
        self.addCleanup(locked.chmod, 0o700)
        self.folder.chmod(0o777)
        nobody = NOBODY if os.geteuid() == 0 else []
        if subprocess.run([*nobody, WORKBENCH, "--version"], capture_output=True).returncode != 0:
            self.skipTest("nobody else may run the program where it lies")
        self.start_and_wait(*nobody)
        self.drop(folder)
        self.go()
        self.drop(locked)
        names, status = self.go()
        self.assertEqual(names, ["a.txt"])
        self.assertRegex(status, "/locked: .*denied")

    def test_boxes_come_before_further_drops(self):
        """As a user meets it, without a script: a message is a box, and until it is closed the window takes nothing."""
        folder, other = self.texts("texts", "a.txt"), self.texts("other", "b.txt")
        self.start([WORKBENCH])
        self.wait_for_title("qxcore workbench")
        self.drop(folder)
        self.wait_for_title(f"{folder} – qxcore workbench")
        self.drop(folder / "a.txt")
        self.wait_for_title("qxcore workbench")  # the box
        self.drop(other)
        self.do("keys", "Return")
        self.wait_for(lambda titles: titles == [f"{folder} – qxcore workbench"])
        self.drop(other)
        self.wait_for_title(f"{other} – qxcore workbench")


class HandTest(ScreenCase):
    """Mouse and keyboard of the server, through the window system to the parts of the window."""

    def start_and_wait(self, folder):
        super().start_and_wait(shows="print splitter\n", first=f"size 800 500\nsplit 300\nopen {folder}\n")
        self.wait_for_title(f"{folder} – qxcore workbench")

    def list_width(self):
        """Of the list, in pixels; the state names the ideal width and the minimum of each column last."""
        self.next_turn()
        state = self.line(self.workbench)
        self.assertEqual(self.line(self.workbench), "ready")
        columns = state.split(" columns ")[1].split()
        return int(columns[1])

    def expect_width(self, expected):
        """What the hand did may still be on its way."""
        end = time.monotonic() + LIMIT
        while (width := self.list_width()) != expected:
            self.assertLess(time.monotonic(), end, f"{width}, not {expected}")
            time.sleep(0.2)

    def test_a_bar_is_dragged(self):
        self.start_and_wait(self.texts("texts", "a.txt"))
        before = self.list_width()
        bar = 20 + 4 + 2 + before + 3  # the window, its border, that of the splitter, the middle of the bar
        self.do("drag", bar, 300, bar + 100, 310)
        self.expect_width(before + 100)

    def test_the_bar_by_the_keyboard(self):
        self.start_and_wait(self.texts("texts", "a.txt"))
        before = self.list_width()
        self.do("keys", "F8", "Right", "Right", "Control_L+Left")
        self.expect_width(before + 15)
        self.do("keys", "Home")
        self.expect_width(60)
        self.do("keys", "Return")
        self.expect_width(0)
        self.do("keys", "Return")
        self.expect_width(60)
        self.do("keys", "Escape")
        self.expect_width(before)

    def test_by_the_keyboard_alone(self):
        """Show two files, choose an encoding, convert, answer: what is seen is what the file then holds."""
        folder = self.texts("texts", "a.txt", "b.txt")
        (folder / "b.txt").write_bytes("Größe".encode("cp850"))
        self.start([WORKBENCH])
        self.wait_for_title("qxcore workbench")
        self.do("keys", "Control_L+o")
        self.wait_for_title("Open Folder")
        self.do("keys", "Control_L+a", *(KEYS.get(c, c) for c in str(folder)), "Return")
        self.wait_for_title(f"{folder} – qxcore workbench")
        self.do("keys", "Home", "Return", "F6", "F6", "Down", "Return")  # from the list to a preview, its tab, and back
        self.do("keys", "Control_L+Tab", "Control_L+Tab")
        self.do("keys", "Alt_L+p", "o")
        self.wait_for_title("View As")
        self.do("keys", "Control_L+a", "c", "p", "8", "5", "0", "Return")
        self.wait_for(lambda titles: "View As" not in titles)
        self.do("keys", "Control_L+e")
        self.wait_for_title("Convert")
        self.do("keys", "Return")  # UTF-8 is proposed
        self.wait_for(lambda titles: titles.count("Convert") == 1)
        end = time.monotonic() + LIMIT
        while (folder / "b.txt").read_bytes() != "Größe".encode():
            self.assertLess(time.monotonic(), end, (folder / "b.txt").read_bytes())
            self.do("keys", "y")  # to the question, once it is there
            time.sleep(0.05)
        self.assertEqual((folder / "a.txt").read_bytes(), "Größe".encode())


if __name__ == "__main__":
    WORKBENCH, HAND = (os.path.abspath(program) for program in sys.argv[1:])
    if not x_server.is_installed():
        print("left out: the workbench on a real screen needs Xvfb")
        sys.exit(0)
    unittest.main("__main__", argv=sys.argv[:1], verbosity=2)
