#!/usr/bin/env python3
"""Runs the commands of qxtool that are about files (find, sort, info) as a process, beside Python's own walk.

usage: files_test.py TOOL [WRAPPER...]
With the wrapper "wine" the tool is the Windows one; the list of tests is the same.
"""

import json
import os
import pathlib
import random
import signal
import subprocess
import time
import unittest

from tool_case import ON_WINE, TOOL, ToolCase, main

SOURCES = pathlib.Path(__file__).resolve().parents[2] / "qxcore"
DRIVE = "Z:" if ON_WINE else "C:"


def native(path):
    """The bytes of a path of this system for one that the tool wrote."""
    name = path[len(DRIVE) :].replace("\\", "/")
    return b"".join(bytes([ord(c) & 0xFF]) if 0xF000 <= ord(c) <= 0xF0FF else c.encode() for c in name)


def walk(folder):
    """All files and all folders of a tree, links not followed; a link to a folder counts as one."""
    files, folders = set(), set()
    for at, names, others in os.walk(os.fsencode(folder)):
        folders |= {os.path.join(at, name) for name in names}
        files |= {os.path.join(at, name) for name in others}
    return files, folders


class FilesTest(ToolCase):
    def run_tool(self, *arguments, stdin=b"", zone=None):
        environment = {**os.environ, "TZ": zone} if zone else None
        return subprocess.run(TOOL + [str(argument) for argument in arguments], cwd=self.folder, input=stdin,
                              stdout=subprocess.PIPE, stderr=subprocess.PIPE, timeout=300, env=environment)

    def output(self, *arguments, **options):
        result = self.run_tool(*arguments, **options)
        self.assertEqual((result.returncode, result.stderr.decode("utf-8")), (0, ""), arguments)
        return result.stdout.decode("utf-8")

    def found(self, *arguments):
        return [native(line) for line in self.output("find", *arguments).splitlines()]

    def make(self, *names):
        for name in names:
            path = self.folder / name
            path.parent.mkdir(parents=True, exist_ok=True)
            path.write_text(name)

    def paths(self, *names):
        return {os.fsencode(self.folder / name) for name in names}

    # --- find ---

    def test_find_sees_what_another_walk_sees(self):
        files, folders = walk(SOURCES)
        headers = {file for file in files if file.endswith(b".h")}
        for arguments, expected in (([], files), (["--folders"], folders), (["*.h"], headers)):
            with self.subTest(arguments=arguments):
                lines = self.found(SOURCES, *arguments)
                self.assertEqual((len(lines), set(lines)), (len(expected), expected))
        ordered = self.output("find", "--sorted", SOURCES).splitlines()
        self.assertEqual((len(ordered), ordered), (len(files), sorted(ordered)))

    def test_masks_hold_in_every_folder(self):
        self.make("a.c", "A.C2", "s/b.c", "s/t/Cc.C", "s/t/name")
        (self.folder / "name").mkdir()
        self.assertEqual(set(self.found(".", "*.c")), self.paths("a.c", "s/b.c", "s/t/Cc.C"))
        self.assertEqual(set(self.found(".", "?.c")), self.paths("a.c", "s/b.c"))
        self.assertEqual(set(self.found(".", "name")), self.paths("s/t/name"))
        self.assertEqual(set(self.found(".", "t", "--folders")), self.paths("s/t"))
        self.assertEqual(self.found(".", "none*"), [])

    def test_attributes_choose_entries(self):
        self.make("plain", "locked", "s/locked")
        for name in ("locked", "s/locked"):
            (self.folder / name).chmod(0o444)
        self.assertEqual(set(self.found(".", "--match", "r")), self.paths("locked", "s/locked"))
        self.assertEqual(set(self.found(".", "--match", "0x1")), self.paths("locked", "s/locked"))
        self.assertEqual(set(self.found(".", "--reject", "Rh")), self.paths("plain"))
        self.assertEqual(self.found(".", "--match", "r", "--reject", "1"), [])

    def test_find_as_json(self):
        self.make("a", "s/bb")
        os.utime(self.folder / "a", (1720000000, 1720000000))
        report = json.loads(self.output("find", "--json", "--sorted", "."))
        self.assertEqual((report["version"], report["errors"]), (1, []))
        rows = [(native(row["path"]), row["bytes"]) for row in report["entries"]]
        self.assertEqual(rows, [(os.fsencode(self.folder / "a"), 1), (os.fsencode(self.folder / "s/bb"), 4)])
        self.assertEqual(report["entries"][0]["written"], "2024-07-03T09:46:40Z")
        self.assertTrue(int(report["entries"][0]["attributes"], 16) & 0x20)

    @unittest.skipIf(ON_WINE, "names and links of Linux")
    def test_find_with_foreign_names_and_links(self):
        names = [b"a:b", b"line\nbreak", b"latin\xe9", b"private\xef\x81\x81", b"caf\xc3\xa9", b"CASE", b"case", b"q?*"]
        root = os.fsencode(self.folder)
        for name in names:
            with open(os.path.join(root, name), "wb"):
                pass
        os.mkdir(os.path.join(root, b"dir\xff"))
        os.symlink("nowhere", os.path.join(root, b"dangling"))
        os.symlink(".", os.path.join(root, b"dir\xff", b"loop"))
        expected = {os.path.join(root, name) for name in [*names, b"dangling"]}
        self.assertEqual(set(self.found(".")), expected)
        self.assertEqual(len(self.found(".")), len(expected))
        self.assertEqual(set(self.found(".", "--folders")), {os.path.join(root, b"dir\xff"), os.path.join(root, b"dir\xff/loop")})
        self.assertEqual(set(self.found(".", "--match", "l")), {os.path.join(root, b"dangling")})

    @unittest.skipIf(ON_WINE, "the length of paths is the system's matter there")
    def test_what_cannot_be_read_is_told(self):
        self.make("b/seen")
        deep = self.folder
        os.chdir(deep)
        for _ in range(8):
            os.mkdir("d" * 40)
            os.chdir("d" * 40)
        os.chdir("/")
        result = self.run_tool("find", ".")
        errors = result.stderr.decode("utf-8")
        self.assertEqual(result.returncode, 1)
        self.assertEqual([native(line) for line in result.stdout.decode("utf-8").splitlines()], list(self.paths("b/seen")))
        self.assertEqual(errors.count("\n"), 1, errors)
        self.assertRegex(errors, "^qxtool: [^ ]*\\.\\.\\.[^ ]*dddd: the path is too long; a folder's may have 255 characters\n$")
        self.assertLess(len(errors), 220)
        report = json.loads(self.run_tool("find", "--json", ".").stdout.decode("utf-8"))
        self.assertEqual((len(report["entries"]), len(report["errors"])), (1, 1))
        self.assertIn("too long", report["errors"][0]["error"])
        self.assertGreater(len(report["errors"][0]["folder"]), 255)
        named = ("d" * 40 + "/") * 8
        for words in (["find", named], ["convert", "--to", "UTF-8", "--recursive", "--in-place", named]):
            self.assert_one_line(self.run_tool(*words), 1, "...", "the path is too long")
        self.assert_one_line(self.run_tool("convert", "--to", "UTF-8", "--recursive", "--in-place", "d" * 40), 1, "...",
                             "the path is too long")

    def test_interruption_ends_a_walk(self):
        process = subprocess.Popen(TOOL + ["find", "/"], stdout=subprocess.PIPE, stderr=subprocess.PIPE)
        try:
            process.stdout.read(1000)
            process.send_signal(signal.SIGINT)
            time.sleep(0.3)
            _, errors = process.communicate(timeout=60)
        finally:
            process.kill()
        self.assertEqual(process.returncode, 130, errors)
        self.assertIn("cancelled", errors.decode("utf-8"))

    @unittest.skipIf(ON_WINE, "needs a terminal")
    def test_progress_shows_on_a_long_walk(self):
        import pty

        terminal, stderr = pty.openpty()
        process = subprocess.Popen(TOOL + ["find", "--sorted", "/"], stdout=subprocess.DEVNULL, stderr=stderr)
        os.close(stderr)
        shown = b""
        try:
            while b" files  " not in shown:
                shown += os.read(terminal, 65536)
            process.send_signal(signal.SIGINT)
            self.assertEqual(process.wait(timeout=60), 130)
        except OSError:  # the walk ended within the second that shows nothing
            self.assertIn(process.wait(timeout=60), (0, 1))
        finally:
            process.kill()
            os.close(terminal)

    def test_wrong_usage(self):
        self.make("file")
        for arguments, code, word in ((["find"], 2, "DIR"), (["find", "none"], 1, "no such folder"),
                                      (["find", "file"], 1, "it is no folder"), (["find", ".", "--match", "x"], 2, "--match"),
                                      (["find", ".", "--reject", "0x"], 2, "--reject"), (["find", ".", "s/*.c"], 2, "s/*.c"),
                                      (["sort", "none"], 1, "none"), (["sort", "--by", "size", "file"], 2, "--by"),
                                      (["sort", "--by", "length", "--ignore-case", "file"], 2, "--ignore-case"),
                                      (["info"], 2, "FILE"), (["info", "none"], 1, "none: ")):
            with self.subTest(arguments=arguments):
                result = self.run_tool(*arguments)
                text = result.stderr.decode("utf-8")
                self.assertEqual((result.returncode, text.count("\n"), result.stdout), (code, 1, b""), text)
                self.assertIn(word, text)

    # --- sort ---

    def sorted_by(self, text, *options, codec="utf-8"):
        (self.folder / "in.txt").write_bytes(text.encode(codec))
        return self.output("sort", *options, "in.txt").splitlines()

    def test_orders(self):
        lines = ["b10", "b9", "B1", "a", "aaaa", "", "b9"]
        text = "\n".join(lines) + "\n"
        self.assertEqual(self.sorted_by(text), sorted(lines))
        self.assertEqual(self.sorted_by(text, "--reverse"), sorted(lines, reverse=True))
        self.assertEqual([line.lower() for line in self.sorted_by(text, "--ignore-case")], sorted(line.lower() for line in lines))
        self.assertEqual(self.sorted_by(text, "--by", "number"), ["", "B1", "a", "aaaa", "b9", "b9", "b10"])
        self.assertEqual(self.sorted_by(text, "--by", "number", "--ignore-case"), ["", "a", "aaaa", "B1", "b9", "b9", "b10"])
        self.assertEqual([len(line) for line in self.sorted_by(text, "--by", "length")], [0, 1, 2, 2, 2, 3, 4])

    def test_every_encoding_and_every_break(self):
        for codec, options in (("utf-8", []), ("utf-16", []), ("cp1252", ["--from", "windows-1252"]), ("cp932", ["--from", "shift_jis"])):
            letters = "Ü" if codec != "cp932" else "日本"
            text = f"z{letters}\r\ny\ny\rx{letters}\r\n\r\nlast"
            self.assertEqual(self.sorted_by(text, *options, codec=codec), ["", "last", "x" + letters, "y", "y", "z" + letters])
        self.assertEqual(self.output("sort", "-", stdin=b"b\na"), "a\nb\n")
        self.assertEqual(self.output("sort", "-", stdin=b""), "")

    def test_many_lines_agree_with_another_sort(self):
        random.seed(5)
        lines = ["".join(random.choices("abc0é日", k=random.randrange(12))) for _ in range(20000)]
        self.assertEqual(self.sorted_by("".join(line + "\n" for line in lines)), sorted(lines))

    # --- info ---

    def test_info_of_files_and_folders(self):
        self.make("some file.tar.gz")
        (self.folder / "sub").mkdir()
        # Summer and winter, each with its own difference to UTC.
        for stamp, local, utc in ((1720000000, "2024-07-03 11:46:40", "2024-07-03T09:46:40Z"), (1705000000, "2024-01-11 20:06:40", "2024-01-11T19:06:40Z")):
            os.utime(self.folder / "some file.tar.gz", (stamp, stamp))
            report = json.loads(self.output("info", "--json", "some file.tar.gz", "sub", zone="Europe/Berlin"))
            self.assertEqual(report["files"][0]["written"]["utc"], utc)
            if not ON_WINE:  # which has a time zone of its own
                self.assertEqual(report["files"][0]["written"]["local"], local)
        file, folder = report["files"]
        path = DRIVE + str(self.folder / "some file.tar.gz").replace("/", "\\")
        self.assertEqual((file["path"], file["bytes"], file["urlPath"]), (path, 16, path))
        self.assertEqual((file["drive"], file["name"], file["extension"]), (DRIVE + "\\", "some file.tar", "gz"))
        self.assertEqual(file["drive"] + file["directory"] + file["name"] + "." + file["extension"], path)
        self.assertEqual(file["url"], "file:///" + path.replace("\\", "/").replace(":", "|"))
        self.assertEqual((folder["bytes"], "folder" in folder["attributeNames"]), (None, True))
        lines = self.output("info", "some file.tar.gz").splitlines()
        self.assertEqual(lines[0], path)
        self.assertIn("  size        16", lines)

    def test_info_of_several_goes_on_after_a_failure(self):
        self.make("a")
        result = self.run_tool("info", "--json", "none", "a")
        report = json.loads(result.stdout.decode("utf-8"))
        self.assertEqual(result.returncode, 1)
        self.assertTrue(report["files"][0]["error"])
        self.assertIsNone(report["files"][1]["error"])


if __name__ == "__main__":
    main()
