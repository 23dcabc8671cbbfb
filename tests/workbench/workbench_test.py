#!/usr/bin/env python3
"""Drives qxworkbench by scripts, as a process, and looks at what a user would find: the list, messages, files.

usage: workbench_test.py WORKBENCH QXTOOL [WRAPPER...]
Each run has a time limit: whatever waits for a person fails the test.
"""

import os
import pathlib
import shutil
import signal
import struct
import subprocess
import sys
import tempfile
import time
import unittest

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import wine  # noqa: E402

WORKBENCH, TOOL = [], []
ON_WINE = "wine" in sys.argv[3:]
LIMIT = 120  # seconds
SAMPLES = pathlib.Path(__file__).resolve().parents[2] / "samples/texts/files"
CORPUS = pathlib.Path(os.environ.get("QXCORE_CORPUS", "/nowhere")) / "encodings"
MODES = ("show", "answer", "abort")
GERMAN = "Größe, Übermaß und Äpfel\nfür jeden etwas\n"
EURO = "für jeden 5 €\n"


class WorkbenchTest(unittest.TestCase):
    def setUp(self):
        self.folder = pathlib.Path(tempfile.mkdtemp(prefix="qxworkbench-test-"))
        self.addCleanup(shutil.rmtree, self.folder, ignore_errors=True)
        self.texts = self.folder / "texts"
        self.texts.mkdir()

    def run_script(self, text, *options, before=None):
        (self.folder / "script.txt").write_text(text, encoding="utf-8")
        environment = dict(os.environ, QXCORE_REGISTRY=str(self.folder / "registry.db"))
        return subprocess.run([*WORKBENCH, "--script", "script.txt", *options], cwd=self.folder, env=environment,
                              stdin=subprocess.DEVNULL, capture_output=True, timeout=LIMIT, preexec_fn=before)

    def run_done(self, text, *options):
        result = self.run_script(text, *options)
        self.assertEqual((result.returncode, result.stderr.decode()), (0, ""), result.stdout.decode())
        return result.stdout.decode().replace("\r\n", "\n")

    def write(self, name, content, encoding="utf-8"):
        path = self.texts / name
        path.parent.mkdir(parents=True, exist_ok=True)
        path.write_bytes(content if isinstance(content, bytes) else content.encode(encoding))
        return path

    def write_three(self):
        self.write("a.txt", GERMAN, "cp1252")
        self.write("b.txt", GERMAN)
        self.write("below/c.txt", GERMAN, "utf-16")

    def contents(self):
        return {path.relative_to(self.folder).as_posix(): path.read_bytes() for path in self.texts.rglob("*") if path.is_file()}

    def converted_by_tool(self, name, to):
        subprocess.run([*TOOL, "convert", "--to", to, "texts/" + name, "expected.out"], cwd=self.folder, check=True,
                       capture_output=True, timeout=LIMIT)
        return (self.folder / "expected.out").read_bytes()

    # --- the list ---

    def test_a_folder_is_listed_and_sorted(self):
        self.write_three()
        rows = self.run_done("open texts\nsort size down\nprint list\nsort name\nprint list\nprint status\n").splitlines()
        self.assertEqual([row.split("\t")[0].replace("\\", "/") for row in rows[:3]], ["below/c.txt", "b.txt", "a.txt"])
        self.assertEqual([row.split("\t")[0].replace("\\", "/") for row in rows[3:6]], ["a.txt", "b.txt", "below/c.txt"])
        self.assertIn("Cp1252", rows[3].split("\t")[1])
        self.assertTrue(rows[6].startswith("3 files in "), rows[6])

    def test_a_dropped_folder_is_opened(self):
        self.write_three()
        self.assertEqual(len(self.run_done("drop texts\nprint list\n").splitlines()), 3)

    def test_of_several_dropped_folders_none_is_opened(self):
        self.write_three()
        result = self.run_script("open texts\n-drop texts/below texts\nprint list\n")
        self.assertEqual(result.returncode, 0)
        self.assertIn("script.txt:2: one folder can be open, and 2 were dropped", result.stderr.decode())
        self.assertEqual(len(result.stdout.decode().splitlines()), 3)

    def test_a_window_that_nobody_sees_is_an_error(self):
        if ON_WINE:
            self.skipTest("there is a screen")
        environment = dict(os.environ, QXCORE_REGISTRY=str(self.folder / "registry.db"), QXCORE_DISPLAY="headless")
        result = subprocess.run(WORKBENCH, env=environment, capture_output=True, timeout=LIMIT)
        self.assertEqual(result.returncode, 1)
        self.assertIn("nobody would see the window", result.stderr.decode())

    def test_keys_move_and_show(self):
        self.write_three()
        shown = self.run_done("open texts\nkey home\nkey down\nwait\nkey enter\nwait\nprint preview\n")
        self.assertEqual(shown, GERMAN)

    def test_escape_brings_the_splitter_back(self):
        moves = "key f8\nkey right\nkey right\n"
        before, moved, after = self.run_done(f"split 300\nprint splitter\n{moves}wait\nprint splitter\nkey escape\nwait\nprint splitter\n").splitlines()
        self.assertNotEqual(before, moved)
        self.assertEqual(after, before)

    def test_a_preview_in_another_encoding(self):
        self.write("a.txt", GERMAN, "cp850")
        shown = self.run_done("open texts\npreview a.txt as Cp850\nprint preview\n")
        self.assertEqual(shown, GERMAN)

    def test_a_large_file_is_shown_in_parts(self):
        line = b"0123456789 a line of sixty-three characters and its end, LF...\n"
        self.write("large.txt", line * (18 * 1024 * 1024 // len(line)))
        shown = self.run_done("open texts\nprint list\npreview large.txt\npart next\nwait\npart next\nwait\nprint preview\nprint timing\n")
        self.assertIn("ASCII", shown.splitlines()[0])
        lines = shown.splitlines()[1:-1]
        self.assertEqual(lines[-1].encode() + b"\n", line)
        self.assertLess(len(lines), 18 * 1024 * 1024 // len(line))

    @unittest.skipUnless(CORPUS.is_dir(), "needs QXCORE_CORPUS")
    def test_the_corpus_is_detected_as_by_the_tool(self):
        shutil.copytree(CORPUS, self.texts, dirs_exist_ok=True)
        names = sorted(path.relative_to(self.texts).as_posix() for path in self.texts.rglob("*") if path.is_file())
        lines = self.run_done("open texts\nprint list\n").splitlines()
        listed = {row.split("\t")[0].replace("\\", "/"): row.split("\t")[1] for row in lines}
        self.assertEqual(sorted(listed), names)
        report = subprocess.run([*TOOL, "detect", *names], cwd=self.texts, capture_output=True, timeout=LIMIT).stdout.decode()
        for row in report.splitlines():
            name = next(name for name in names if row.startswith(name + " "))
            self.assertTrue(row[len(name):].strip().startswith(listed[name]), (row, listed[name]))

    @unittest.skipIf(ON_WINE, "needs names and files that Windows does not have")
    def test_odd_names_and_kinds_of_files(self):
        """Whatever bytes a name has, its file is listed, shown and converted; what has no end is not read."""
        names = [b"bad\xff\xfe.txt", b"new\nline", b"tab\there", b"colon:star*?", b"back\\slash", b"-", b" blanks ", b"dot.",
                 b'quote"', b"CON", b"x" * 255, "é".encode() * 127, "\U0001F600日本".encode(), b"below/it"]
        folder = os.fsencode(self.texts) + b"/"
        for name in names:
            os.makedirs(os.path.dirname(folder + name), exist_ok=True)
            pathlib.Path(os.fsdecode(folder + name)).write_bytes(GERMAN.encode("cp1252"))
        os.mkfifo(folder + b"pipe")
        os.symlink("nowhere", folder + b"dangling")
        os.makedirs(folder + b"/".join([b"d" * 200] * 8))
        result = self.run_script("-open " + "/".join(["texts"] + ["d" * 200] * 8) + "\n-open texts\nopen texts/below\nprint status\n-open texts\nprint list\nselect all\nanswer yes\n-convert UTF-8 to out\nprint status\n")
        self.assertEqual(result.returncode, 0, result.stderr)
        for line in (b"script.txt:1: ", b"script.txt:2: "):
            self.assertRegex(result.stderr, line + rb"[^ ]*\.\.\.d+: the path is too long; a folder's may have 255 characters\n")
        below, *rows, status = result.stdout.decode().splitlines()
        self.assertTrue(below.endswith("1 file in " + str(self.texts / "below")), below)
        self.assertEqual(len(rows), len(names) + 2)
        self.assertIn("pipe\t\t0\tit is a pipe or a device", rows)
        self.assertEqual([row.split("\t")[0] for row in rows if "Cannot open" in row], ["dangling"])
        self.assertTrue(status.startswith(f"{len(names)} files were converted"), status)
        for name in names:
            converted = pathlib.Path(os.fsdecode(os.fsencode(self.folder) + b"/out/" + name))
            self.assertEqual(converted.read_bytes(), GERMAN.encode(), name)

    @unittest.skipIf(ON_WINE or os.geteuid() == 0 and not shutil.which("setpriv"), "needs rights of files, and to have none")
    def test_what_belongs_to_somebody_else(self):
        """A folder and a file that cannot be read are told; the rest is done."""
        self.write("a.txt", GERMAN)
        self.write("secret.txt", GERMAN).chmod(0)
        self.write("locked/b.txt", GERMAN)
        (self.texts / "locked").chmod(0)
        (self.folder / "files").mkdir()
        self.write("../files/c.txt", GERMAN).chmod(0)
        self.addCleanup((self.texts / "locked").chmod, 0o700)
        self.folder.chmod(0o777)
        (self.folder / "script.txt").write_text("-open texts/locked\n-open texts\nprint list\nopen files\nprint status\n")
        nobody = ["setpriv", "--reuid=65534", "--regid=65534", "--clear-groups"] if os.geteuid() == 0 else []
        if subprocess.run([*nobody, *WORKBENCH, "--version"], capture_output=True).returncode != 0:
            self.skipTest("nobody else may run the program where it lies")
        # Nobody else may write where a build that counts coverage keeps its counts.
        environment = dict(os.environ, QXCORE_REGISTRY=str(self.folder / "registry.db"), GCOV_PREFIX=str(self.folder))
        result = subprocess.run([*nobody, *WORKBENCH, "--script", "script.txt"], cwd=self.folder, env=environment,
                                capture_output=True, timeout=LIMIT)
        messages = result.stderr.decode().splitlines()
        self.assertEqual((result.returncode, len(messages)), (0, 2), messages)
        for message in messages:
            self.assertRegex(message, "texts/locked: .*denied")
        first, second, status = result.stdout.decode().splitlines()
        self.assertTrue(first.startswith("a.txt\tUTF-8\t"), first)
        self.assertIn("Permission denied", second)
        self.assertTrue(status.endswith("/files; 1 file could not be read"), status)

    def test_a_folder_that_disappears(self):
        """While it is open, and for good: what was listed stays, each step says what it misses."""
        self.write_three()
        process = self.start("open texts\nselect all\necho ready\npause go\nanswer yes\n-convert UTF-8\n-preview a.txt\n"
                             "print status\n-open texts\nprint list\n")
        shutil.rmtree(self.texts)
        (self.folder / "go").write_bytes(b"")
        out, err = process.communicate(timeout=LIMIT)
        self.assertEqual(process.returncode, 0, err.decode())
        self.assertEqual(len(out.decode().splitlines()), 4, out.decode())
        self.assertIn("0 files were converted; a.txt: ", out.decode().splitlines()[0])
        self.assertIn("there is no such folder", err.decode().splitlines()[-1])

    # --- conversion, in each mode ---

    @unittest.skipUnless(CORPUS.is_dir(), "needs QXCORE_CORPUS")
    def test_the_corpus_is_converted_as_by_the_tool(self):
        for part in ("ascii", "cp850", "cp866", "euc-jp", "derived"):
            shutil.copytree(CORPUS / part, self.texts / part)
        before = self.contents()
        self.run_done("open texts\nselect all\nanswer yes\nconvert UTF-8 to out\nwait\n")
        self.assertEqual(self.contents(), before)
        for name in before:
            name = name.removeprefix("texts/")
            self.assertEqual((self.folder / "out" / name).read_bytes(), self.converted_by_tool(name, "UTF-8"), name)

    def test_a_file_is_converted_as_it_is_shown(self):
        self.write("a.txt", GERMAN, "cp850")
        self.run_done("open texts\nselect all\npreview a.txt as Cp850\nanswer yes\nconvert UTF-8\nwait\n")
        self.assertEqual((self.texts / "a.txt").read_text(encoding="utf-8"), GERMAN)

    def test_converted_files_are_read_in_their_new_encoding(self):
        """By the list, by a preview and by the next conversion, also where detection would find another one."""
        self.write("a.txt", GERMAN)
        shown = self.run_done("open texts\nselect all\npreview a.txt\nanswer yes\nconvert Cp850\nprint list\nprint preview\n"
                              "answer yes\nconvert UTF-16\nprint list\n").splitlines()
        size = len(GERMAN.encode("cp850"))
        self.assertEqual(shown[0].split("\t")[:3], ["a.txt", "OEM - Multilingual Latin I", str(size)])
        self.assertEqual("\n".join(shown[1:3]) + "\n", GERMAN)
        self.assertEqual(shown[3].split("\t")[1], "Unicode")
        self.assertEqual((self.texts / "a.txt").read_text(encoding="utf-16le"), GERMAN)

    def test_the_question_in_each_mode(self):
        """Without losses the default is to convert; with losses it is not; abort never guesses."""
        for mode in MODES:
            for target, lossy in (("UTF-8", False), ("Cp437", True)):
                with self.subTest(mode=mode, lossy=lossy):
                    self.write("a.txt", GERMAN + EURO, "cp1252")
                    before = self.contents()
                    answer = "answer yes\n" if mode == "show" else ""
                    result = self.run_script(f"open texts\nselect all\n{answer}convert {target}\nprint status\n", "--mode", mode)
                    changed = self.contents() != before
                    if mode == "abort":
                        self.assertEqual(result.returncode, 1)
                        self.assertIn('Aborting on "Convert" dialog', result.stderr.decode())
                        self.assertFalse(changed)
                    else:
                        self.assertEqual(result.returncode, 0, result.stderr.decode())
                        self.assertEqual(changed, mode == "show" or not lossy)
                        text = "1 file was converted" if changed else "Nothing was converted."
                        self.assertEqual(result.stdout.decode().strip(), text)

    def test_no_is_an_answer(self):
        self.write_three()
        before = self.contents()
        self.assertIn("Nothing was converted.", self.run_done("open texts\nselect all\nanswer no\nconvert UTF-8\nprint status\n"))
        self.assertEqual(self.contents(), before)

    # --- what goes wrong ---

    def test_bad_folders_are_told_in_each_mode(self):
        self.write("a.txt", GERMAN)
        for mode in MODES:
            result = self.run_script("-open nowhere\n-open texts/a.txt\nopen texts\nprint list\n", "--mode", mode)
            self.assertEqual(result.returncode, 0)
            messages = result.stderr.decode().splitlines()
            self.assertEqual(len(messages), 2, messages)
            self.assertIn("script.txt:1: ", messages[0])
            self.assertIn("there is no such folder", messages[0])
            self.assertIn("it is no folder", messages[1])
            self.assertEqual(len(result.stdout.decode().splitlines()), 1)
        result = subprocess.run([*WORKBENCH, "nowhere", "--picture", "p.png"], cwd=self.folder, capture_output=True, timeout=LIMIT)
        self.assertEqual(result.returncode, 1)
        self.assertIn(b"there is no such folder", result.stderr)

    def test_a_file_that_vanishes(self):
        """Between listing and converting one file goes: the others are converted, the message names it."""
        self.write_three()
        fifo = self.folder / "go"
        script = "open texts\nselect all\necho listed\npause go\nanswer yes\nconvert UTF-8\nprint status\n"
        (self.folder / "script.txt").write_text(script)
        process = subprocess.Popen([*WORKBENCH, "--script", "script.txt"], cwd=self.folder, stdout=subprocess.PIPE, stderr=subprocess.PIPE)
        try:
            self.assertEqual(process.stdout.readline().strip(), b"listed")
            (self.texts / "b.txt").unlink()
            fifo.write_bytes(b"")
            out, err = process.communicate(timeout=LIMIT)
        finally:
            process.kill()
        self.assertEqual(process.returncode, 1)
        self.assertIn("2 files were converted; b.txt: ", err.decode())
        self.assertEqual((self.texts / "a.txt").read_bytes(), GERMAN.encode())

    @unittest.skipIf(ON_WINE, "needs a limit of the size of files")
    def test_a_full_disk_leaves_the_files_as_they_were(self):
        self.write("a.txt", GERMAN * 20000, "cp1252")
        before = self.contents()

        def limit():
            import resource
            import signal
            signal.signal(signal.SIGXFSZ, signal.SIG_IGN)
            resource.setrlimit(resource.RLIMIT_FSIZE, (200000, 200000))

        result = self.run_script("open texts\nselect all\nanswer yes\nconvert UTF-8\n", before=limit)
        self.assertEqual(result.returncode, 1)
        self.assertRegex(result.stderr.decode(), r"script.txt:4: 0 files were converted; a.txt: \S")
        self.assertEqual(self.contents(), before)

    def test_a_full_device_is_told(self):
        self.write("full", GERMAN, "cp1252")
        (self.folder / "out").mkdir()
        (self.folder / "out/full").symlink_to("/dev/full")
        result = self.run_script("open texts\nselect all\nanswer yes\nconvert UTF-8 to out\n")
        self.assertEqual(result.returncode, 1)
        self.assertIn("0 files were converted; full: ", result.stderr.decode())

    def test_cancel_in_the_middle(self):
        for number in range(300):
            self.write(f"{number:03}.txt", GERMAN, "cp1252")
        before = self.contents()
        # In the trial, in the conversion itself, while the folder is being looked at.
        shown = self.run_done("open texts\nselect all\ncancel after 50\nconvert UTF-8\nprint status\n")
        self.assertEqual(shown, "Cancelled: 0 files were converted, 300 files left as before\n")
        self.assertEqual(self.contents(), before)
        shown = self.run_done("open texts\nselect all\nanswer yes\ncancel after 400\nconvert UTF-8\nprint status\n")
        self.assertEqual(shown, "Cancelled: 100 files were converted, 200 files left as before\n")
        for name, content in self.contents().items():
            self.assertEqual(content, GERMAN.encode("utf-8" if name < "texts/100" else "cp1252"), name)
        shown = self.run_done("cancel after 20\nopen texts\nprint status\n")
        self.assertEqual(shown, "Cancelled after 20 files\n")

    # --- interruption: by Ctrl-C in a terminal, or a request to end ---

    def start(self, text, *options):
        """Starts a script and returns the process when it has said "ready"."""
        (self.folder / "script.txt").write_text(text, encoding="utf-8")
        environment = dict(os.environ, QXCORE_REGISTRY=str(self.folder / "registry.db"))
        process = subprocess.Popen([*WORKBENCH, "--script", "script.txt", *options], cwd=self.folder, env=environment,
                                   stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.PIPE)
        self.addCleanup(process.kill)
        self.assertEqual(process.stdout.readline().strip(), b"ready")
        return process

    def interrupt(self, process, number):
        process.send_signal(number)
        out, err = process.communicate(timeout=LIMIT)
        self.assertEqual((process.returncode, err.decode()), (128 + number, "qxworkbench: cancelled\n"), out.decode())

    @unittest.skipIf(ON_WINE, "needs signals")
    def test_an_interruption_ends_what_waits(self):
        """Whatever it waits for: a file, an answer, work."""
        self.write("large.txt", GERMAN * 400000)
        for text in ("echo ready\npause never\n", "open texts\nselect all\necho ready\nconvert UTF-16\n",
                     "open texts\nselect all\necho ready\n-convert UTF-16\nopen texts\n"):
            for number in (signal.SIGINT, signal.SIGTERM, signal.SIGHUP):
                self.interrupt(self.start(text), number)

    @unittest.skipIf(ON_WINE, "needs signals")
    def test_an_interruption_leaves_each_file_whole(self):
        for number in range(3):
            self.write(f"{number}.txt", GERMAN * 200000, "cp1252")
        process = self.start("open texts\nselect all\nanswer yes\necho ready\nconvert UTF-16\n")
        end = time.monotonic() + LIMIT
        while not list(self.texts.glob("*.tmp")) and time.monotonic() < end:
            time.sleep(0.001)
        self.interrupt(process, signal.SIGINT)
        self.assertEqual(sorted(self.contents()), [f"texts/{number}.txt" for number in range(3)])
        for name, content in self.contents().items():
            is_whole = content in ((GERMAN * 200000).encode("cp1252"), (GERMAN * 200000).encode("utf-16le"))
            self.assertTrue(is_whole, name)

    # --- pictures, settings ---

    def test_a_picture_is_saved(self):
        self.write_three()
        for arguments in (["texts", "--picture", "one.png"], ["--script", "script.txt"]):
            (self.folder / "script.txt").write_text("size 600 400\nopen texts\npreview a.txt\npicture two.png\n")
            subprocess.run([*WORKBENCH, *arguments], cwd=self.folder, check=True, timeout=LIMIT, capture_output=True)
        for name, size in (("one.png", None), ("two.png", (600, 400))):
            content = (self.folder / name).read_bytes()
            self.assertEqual(content[:8], b"\x89PNG\r\n\x1a\n")
            if size:
                self.assertEqual(struct.unpack(">II", content[16:24]), size)

    @unittest.skipIf(ON_WINE, "the registry is the user's")
    def test_the_splitter_keeps_its_place(self):
        self.run_done("split 222\n")
        self.assertIn(" 222 ", self.run_done("print splitter\n"))

    def test_wrong_scripts_are_refused_before_they_begin(self):
        result = self.run_script("open texts\nfly away\n")
        self.assertEqual(result.returncode, 2)
        self.assertIn('script.txt: line 2: there is no command "fly"', result.stderr.decode())


if __name__ == "__main__":
    workbench, tool, *wrapper = sys.argv[1:]
    wine.keep_running(wrapper)
    WORKBENCH.extend(wrapper + [os.path.abspath(workbench)])
    TOOL.extend(wrapper + [os.path.abspath(tool)])
    unittest.main("__main__", argv=sys.argv[:1], verbosity=2)
