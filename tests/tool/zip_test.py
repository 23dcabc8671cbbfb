#!/usr/bin/env python3
"""Runs qxtool zip as a process, over archives that Python makes, sound ones and hostile ones.

usage: zip_test.py TOOL [WRAPPER...]
"""

import json
import os
import pathlib
import shutil
import signal
import struct
import subprocess
import time
import unittest
import warnings
import zipfile
import zlib

from tool_case import ON_WINE, TOOL, ToolCase, main

STAMP = (2026, 11, 21, 13, 34, 52)
TEXT = b"".join(b"line %d\n" % (i * 7919 % 10007) for i in range(20000))


def entry(name, method=zipfile.ZIP_DEFLATED, comment=b""):
    info = zipfile.ZipInfo("x", STAMP)
    info.filename = name  # as it is; the constructor would tidy it
    info.compress_type = method
    info.comment = comment
    return info


class ZipTest(ToolCase):
    def setUp(self):
        super().setUp()
        self.outside = self.folder
        self.folder = self.outside / "inner"
        self.folder.mkdir()

    def run_tool(self, *arguments):
        return subprocess.run(TOOL + ["zip", *map(str, arguments)], cwd=self.folder, stdin=subprocess.DEVNULL, capture_output=True, timeout=120)

    def make(self, entries, name="a.zip"):
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")  # two entries of one name
            with zipfile.ZipFile(self.folder / name, "w") as archive:
                for info, data in entries:
                    archive.writestr(info, data)
        return name

    def write_archive(self, name, content, end):
        (self.folder / name).write_bytes(content + b"PK\x05\x06" + end)

    def sound(self):
        return self.make([
            (entry("stored.txt", zipfile.ZIP_STORED), b"stored text"),
            (entry("folder/", zipfile.ZIP_STORED), b""),
            (entry("folder/deflated.txt", comment=b"a comment"), TEXT),
            (entry("folder/deeper/k\u00e4se \U0001F9C0.txt"), b"cheese"),
            (entry("empty", zipfile.ZIP_STORED), b""),
        ])

    def patch(self, name, at, content):
        path = self.folder / name
        data = bytearray(path.read_bytes())
        data[at : at + len(content)] = content
        path.write_bytes(data)

    def tree(self, root=None):
        root = root or self.outside
        return sorted(str(path.relative_to(root)).replace("\\", "/") for path in root.rglob("*"))

    def assert_fails(self, result, *words):
        text = result.stderr.decode("utf-8")
        self.assertEqual(result.returncode, 1, text)
        self.assertEqual(text.count("\n"), 1, text)
        for word in words:
            self.assertIn(word, text)

    # --- list ---

    def test_times_and_execute_bits_are_kept(self):
        script = entry("run.sh")
        script.create_system, script.external_attr = 3, 0o100755 << 16
        self.make([(script, b"#!/bin/sh\n"), (entry("plain.txt"), b"x")])
        self.assert_done(self.run_tool("extract-all", "a.zip", "out"))
        for name in ("run.sh", "plain.txt"):
            written = (self.folder / "out" / name).stat()
            self.assertEqual(time.localtime(written.st_mtime)[:6], STAMP)
            if not ON_WINE:
                self.assertEqual(bool(written.st_mode & 0o100), name == "run.sh")

    def test_list_tells_every_field(self):
        result = self.run_tool("list", "--json", self.sound())
        self.assert_done(result)
        report = json.loads(result.stdout)
        self.assertEqual((report["version"], report["error"]), (1, None))
        with zipfile.ZipFile(self.folder / "a.zip") as archive:
            expected = [
                {
                    "name": info.filename, "method": info.compress_type, "size": info.file_size, "compressed": info.compress_size,
                    "crc": info.CRC, "time": "2026-11-21T13:34:52", "directory": info.is_dir(), "comment": info.comment.decode() or None,
                }
                for info in archive.infolist()
            ]
        self.assertEqual(report["entries"], expected)
        lines = self.run_tool("list", "a.zip").stdout.decode("utf-8").splitlines()
        self.assertEqual(len(lines), 5)
        self.assertRegex(lines[0], r"^ *11 +11  stored    [0-9a-f]{8}  2026-11-21T13:34:52  stored\.txt$")

    def test_list_of_a_damaged_directory_gives_what_it_could_read(self):
        name = self.sound()
        data = (self.folder / name).read_bytes()
        second = data.index(b"PK\x01\x02", data.index(b"PK\x01\x02") + 1)
        self.patch(name, second, b"XX")
        result = self.run_tool("list", "--json", name)
        self.assert_fails(result, "invalid CEN header signature")
        report = json.loads(result.stdout)
        self.assertEqual([e["name"] for e in report["entries"]], ["stored.txt"])
        self.assertEqual(report["error"], "invalid CEN header signature")

    def test_names_cannot_steer_the_screen(self):
        self.make([(entry("a\x1b[2Jb"), b"x")])
        self.assertIn(b"a?[2Jb", self.run_tool("list", "a.zip").stdout)
        self.patch("a.zip", 30 + 7 + 1, b"\x00")
        self.assertNotIn(b"\x1b", self.run_tool("test", "a.zip").stderr)

    # --- test ---

    def test_sound_archives_pass(self):
        result = self.run_tool("test", self.sound())
        self.assert_done(result)
        self.assertIn(f"5 entries, {11 + len(TEXT) + 6} bytes", result.stdout.decode())
        self.make([], "none.zip")
        self.assert_done(self.run_tool("test", "none.zip"))

    def test_damage_and_disagreement_fail(self):
        name = self.sound()
        sound = (self.folder / name).read_bytes()
        local, central = [m for m in range(len(sound)) if sound.startswith(b"PK\x03\x04", m)], sound.index(b"PK\x01\x02")
        for what, at, content, word in (
            ("data", sound.index(b"stored text"), b"S", "CRC"),
            ("the directory's CRC", central + 16, b"\0", "CRC"),
            ("the directory's size", central + 24, b"\x0c", "size"),
            ("the local name", sound.index(b"stored.txt"), b"S", "another name"),
            ("the directory's place of an entry", central + 42, b"\x01", "not in the central directory"),
            ("a local signature", local[2], b"PK\x03\x05", "not met in sequence"),
            ("encryption", local[0] + 6, b"\x01", 'entry "stored.txt": encrypted ZIP entry not supported'),
        ):
            with self.subTest(what=what):
                (self.folder / name).write_bytes(sound)
                self.patch(name, at, content)
                self.assert_fails(self.run_tool("test", name), name, word)

    def test_an_archive_that_only_the_directory_can_see_fails(self):
        # The first entry's place is not where the sequential reader begins: it sees none.
        self.make([(entry("a.txt"), TEXT)])
        data = (self.folder / "a.zip").read_bytes()
        end = data.index(b"PK\x05\x06")
        offset = struct.unpack_from("<L", data, end + 16)[0]
        moved = bytearray(b"MZ.." + data)
        struct.pack_into("<L", moved, offset + 4 + 42, 4)
        struct.pack_into("<L", moved, end + 4 + 16, offset + 4)
        (self.folder / "b.zip").write_bytes(moved)
        self.assertEqual(zipfile.ZipFile(self.folder / "b.zip").testzip(), None)
        self.assert_done(self.run_tool("list", "b.zip"))
        self.assert_fails(self.run_tool("test", "b.zip"), "a.txt", "not met in sequence")
        self.assert_fails(self.run_tool("extract-all", "b.zip", "out"), "not met in sequence")

    def test_files_that_are_no_archives(self):
        (self.folder / "empty").write_bytes(b"")
        (self.folder / "text").write_bytes(b"no archive" * 10000)
        for command in ("list", "test"):
            self.assert_fails(self.run_tool(command, "empty"), "END header not found")
            self.assert_fails(self.run_tool(command, "text"), "END header not found")
            self.assert_fails(self.run_tool(command, "absent.zip"), "absent.zip")
            self.assert_fails(self.run_tool(command, "."))

    # --- extract ---

    def test_extract_writes_one_entry(self):
        name = self.sound()
        self.assert_done(self.run_tool("extract", name, "folder/deflated.txt", "out.txt"))
        self.assertEqual((self.folder / "out.txt").read_bytes(), TEXT)
        result = self.run_tool("extract", name, "folder/deeper/k\u00e4se \U0001F9C0.txt", "-")
        self.assert_done(result)
        self.assertEqual(result.stdout, b"cheese")

    def test_extract_leaves_the_target_alone_when_it_fails(self):
        name = self.sound()
        (self.folder / "out.txt").write_bytes(b"former")
        self.assert_fails(self.run_tool("extract", name, "absent", "out.txt"), "absent", "entry not found")
        data = (self.folder / name).read_bytes()
        self.patch(name, data.index(b"PK\x01\x02", data.index(b"folder/deflated.txt", data.index(b"PK\x01\x02")) - 60) + 16, b"\0\0")
        self.assert_fails(self.run_tool("extract", name, "folder/deflated.txt", "out.txt"), "folder/deflated.txt", "CRC")
        self.assertEqual(self.tree(self.folder), ["a.zip", "out.txt"])
        self.assertEqual((self.folder / "out.txt").read_bytes(), b"former")

    # --- extract-all ---

    def test_extract_all_makes_folders_and_files(self):
        self.assert_done(self.run_tool("extract-all", self.sound(), "new/out"))
        self.assertEqual(self.tree(self.folder / "new/out"),
                         ["empty", "folder", "folder/deeper", "folder/deeper/k\u00e4se \U0001F9C0.txt", "folder/deflated.txt", "stored.txt"])
        self.assertEqual((self.folder / "new/out/folder/deflated.txt").read_bytes(), TEXT)
        self.assertEqual((self.folder / "new/out/empty").read_bytes(), b"")

    def test_existing_files_are_replaced_by_force_only(self):
        name = self.sound()
        (self.folder / "out").mkdir()
        (self.folder / "out/stored.txt").write_bytes(b"former")
        self.assert_fails(self.run_tool("extract-all", name, "out"), "stored.txt", "--force")
        self.assertEqual((self.folder / "out/stored.txt").read_bytes(), b"former")
        self.assertEqual(self.tree(self.folder / "out"), ["stored.txt"])
        self.assert_done(self.run_tool("extract-all", "--force", name, "out"))
        self.assertEqual((self.folder / "out/stored.txt").read_bytes(), b"stored text")

    def test_nothing_is_written_elsewhere(self):
        before = self.tree()
        for name in ("../evil", "a/../../evil", "..\\evil", "a\\..\\..\\evil", "/evil", "\\evil", "\\\\server\\share\\evil", "C:evil", "C:\\evil",
                     "c:/evil", "a/C:/evil", "file:stream", "..", "a/..", ".. /evil", "..../evil", "CON", "a/nul.txt", "com1"):
            with self.subTest(name=name):
                archive = self.make([(entry("harmless"), b"x"), (entry(name), b"evil")])
                self.assert_fails(self.run_tool("extract-all", archive, "out"), "cannot be extracted")
                (self.folder / archive).unlink()
                self.assertEqual(self.tree(), before)  # not even what is harmless

    def test_backslashes_part_folders(self):
        self.make([(entry("a\\b\\c.txt"), b"x"), (entry("./d//e.txt"), b"y")])
        self.assert_done(self.run_tool("extract-all", "a.zip", "out"))
        self.assertEqual(self.tree(self.folder / "out"), ["a", "a/b", "a/b/c.txt", "d", "d/e.txt"])

    @unittest.skipIf(ON_WINE, "Wine 8 makes no links")
    def test_links_in_the_way_are_not_followed(self):
        target = self.outside / "target"
        target.mkdir()
        (target / "file").write_bytes(b"former")
        for link, leads_to in (("out/folder", target), ("out/stored.txt", target / "file"), ("out/stored.txt", target / "absent")):
            with self.subTest(link=link, leads_to=leads_to):
                shutil.rmtree(self.folder / "out", ignore_errors=True)
                (self.folder / "out").mkdir()
                os.symlink(leads_to, self.folder / link)
                self.assert_fails(self.run_tool("extract-all", "--force", self.sound(), "out"), "a link is in the way")
                self.assertEqual(self.tree(target), ["file"])
                self.assertEqual((target / "file").read_bytes(), b"former")
        # The folder itself may be one: the user named it.
        shutil.rmtree(self.folder / "out")
        os.symlink(target, self.folder / "out")
        self.assert_done(self.run_tool("extract-all", self.sound(), "out"))

    def test_files_and_folders_in_the_way(self):
        (self.folder / "out").mkdir()
        (self.folder / "out/folder").write_bytes(b"a file")
        self.assert_fails(self.run_tool("extract-all", "--force", self.sound(), "out"), "a file is in the way")
        shutil.rmtree(self.folder / "out")
        (self.folder / "out/stored.txt").mkdir(parents=True)
        self.assert_fails(self.run_tool("extract-all", "--force", self.sound(), "out"), "in the way")
        self.make([(entry("twice"), b"1"), (entry("twice"), b"2")])
        shutil.rmtree(self.folder / "out")
        self.assert_fails(self.run_tool("extract-all", "a.zip", "out"), "exists already")
        self.assertEqual((self.folder / "out/twice").read_bytes(), b"1")

    def test_the_size_limit_holds(self):
        name = self.make([(entry("small"), b"x"), (entry("bomb"), bytes(50_000_000))])
        self.assert_fails(self.run_tool("extract-all", "--max-bytes", 1_000_000, name, "out"), "more than 1000000 bytes")
        self.assertFalse((self.folder / "out").exists())
        # The headers claim less than there is.
        data = (self.folder / name).read_bytes()
        for at in (data.index(b"PK\x03\x04", 1) + 22, data.rindex(b"PK\x01\x02") + 24):
            self.patch(name, at, struct.pack("<L", 1000))
        self.assert_fails(self.run_tool("extract-all", "--max-bytes", 1_000_000, name, "out"), "bomb", "invalid entry size")
        self.assertEqual(self.tree(self.folder / "out"), ["small"])
        self.assert_done(self.run_tool("extract-all", "--max-bytes", 50_000_001, self.make([(entry("a"), bytes(50_000_001))]), "all"))

    def test_a_failure_leaves_no_half_written_file(self):
        name = self.make([(entry("first"), b"1"), (entry("second"), TEXT), (entry("third"), b"3")])
        data = (self.folder / name).read_bytes()
        self.patch(name, data.index(b"PK\x03\x04", 1) + 20000, b"\xff" * 400)
        self.assert_fails(self.run_tool("extract-all", name, "out"), "second")
        self.assertEqual(self.tree(self.folder / "out"), ["first"])

    @unittest.skipIf(ON_WINE, "needs a device that is full")
    def test_a_full_device_is_told(self):
        self.assert_fails(self.run_tool("extract", self.sound(), "folder/deflated.txt", "/dev/full"), "/dev/full", "Disk Full")
        self.assertTrue(pathlib.Path("/dev/full").is_char_device())

    def test_entries_that_share_their_data_fail_at_once(self):
        # Each directory entry leads to the same local header: little data that looks like much.
        name = self.make([(entry("a"), bytes(1_000_000))])
        data = (self.folder / name).read_bytes()
        central = data.index(b"PK\x01\x02")
        end = data.index(b"PK\x05\x06")
        count = 60000
        more = data[central:end] * count
        self.write_archive("many.zip", data[:central] + more, struct.pack("<HHHHLLH", 0, 0, count, count, len(more), central, 0))
        began = time.monotonic()
        self.assert_fails(self.run_tool("test", "many.zip"), "not met in sequence")
        self.assert_fails(self.run_tool("extract-all", "many.zip", "out", "--max-bytes", 2_000_000), "more than 2000000 bytes")
        self.assert_fails(self.run_tool("extract-all", "many.zip", "out"), "not met in sequence")
        self.assertLess(time.monotonic() - began, 300)  # to read all 60 GB would take longer on any machine

    @unittest.skipIf(ON_WINE, "no signals reach a program under Wine")
    def test_interruption_ends_cleanly(self):
        # Two gigabytes, as forty times the same blocks; the CRC is wrong, but that would be told at the end.
        packer = zlib.compressobj(wbits=-15)
        blocks = packer.compress(bytes(50_000_000)) + packer.flush(zlib.Z_FULL_FLUSH)
        data = blocks * 40 + packer.flush()
        fields = struct.pack("<HHHHHLLLHH", 20, 0, 8, 0, 33, 0, len(data), 2_000_000_000, 5, 0)
        local = b"PK\x03\x04" + fields + b"large" + data
        central = b"PK\x01\x02\x14\0" + fields + struct.pack("<HHHLL", 0, 0, 0, 0, 0) + b"large"
        end = b"PK\x05\x06" + struct.pack("<HHHHLLH", 0, 0, 1, 1, len(central), len(local), 0)
        name = "a.zip"
        (self.folder / name).write_bytes(local + central + end)
        for arguments in (["test", name], ["extract-all", name, "out"], ["extract", name, "large", "one"]):
            process = subprocess.Popen(TOOL + ["zip", *arguments], cwd=self.folder, stdout=subprocess.PIPE, stderr=subprocess.PIPE)
            time.sleep(0.3)
            process.send_signal(signal.SIGINT)
            _, text = process.communicate(timeout=30)
            self.assertEqual((process.returncode, text), (130, b"qxtool: cancelled\n"), arguments)
        self.assertIn(self.tree(self.folder), (["a.zip", "out"], ["a.zip"]))

    def test_wrong_usage(self):
        for arguments, word in (([], "subcommand"), (["pack"], "pack"), (["list"], "ARCHIVE"), (["extract", "a.zip", "b"], "OUT"),
                                (["extract-all", "a.zip", "b", "--max-bytes", "many"], "--max-bytes")):
            result = self.run_tool(*arguments)
            self.assertEqual(result.returncode, 2, arguments)
            self.assertIn(word, result.stderr.decode())


if __name__ == "__main__":
    main()
