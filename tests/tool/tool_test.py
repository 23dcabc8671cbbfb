#!/usr/bin/env python3
"""Runs qxtool as a process and looks at what a user sees: output, messages, exit codes, files.

usage: tool_test.py TOOL [WRAPPER...]
With the wrapper "wine" the tool is the Windows one; the list of tests is the same.
"""

import json
import os
import pathlib
import re
import resource
import shlex
import shutil
import signal
import subprocess
import time
import unittest

from tool_case import ON_WINE, TOOL, ToolCase, main

SAMPLES = pathlib.Path(__file__).resolve().parents[2] / "samples/texts/files"
COMMANDS = ["detect", "convert", "escape", "unescape", "encodings", "find", "sort", "info", "zip", "settings", "ini"]
GERMAN = "Größe, Übermaß und Äpfel\nfür jeden 5 €\n"


def command(*arguments):
    return TOOL + [str(argument) for argument in arguments]


class ToolTest(ToolCase):
    def run_tool(self, *arguments, stdin=b"", stdout=subprocess.PIPE):
        return subprocess.run(command(*arguments), cwd=self.folder, input=stdin, stdout=stdout, stderr=subprocess.PIPE, timeout=120)

    def write(self, name, content):
        path = self.folder / name
        path.write_bytes(content if isinstance(content, bytes) else content.encode("utf-8"))
        return path

    def sample(self, name):
        shutil.copy(SAMPLES / name, self.folder / name)
        return name

    def names(self):
        return sorted(path.name for path in self.folder.iterdir())

    # --- arguments ---

    def test_help_and_version_are_data(self):
        for arguments in (["--help"], *([name, "--help"] for name in COMMANDS)):
            result = self.run_tool(*arguments)
            self.assert_done(result)
            self.assertTrue(result.stdout, arguments)
        for arguments in (["--version"], *([name, "--version"] for name in COMMANDS)):
            self.assertRegex(self.run_tool(*arguments).stdout.decode(), r"^qxtool \d+\.\d+\.\d+\n$")

    def test_wrong_usage_is_told_in_one_line(self):
        self.write("a.txt", "a")
        for arguments, word in (
            ([], "subcommand"),
            (["translate"], "translate"),
            (["detect"], "FILE"),
            (["detect", "--colour", "a.txt"], "--colour"),
            (["detect", "--level", "deep", "a.txt"], "--level"),
            (["detect", "--favor", "me", "a.txt"], "--favor"),
            (["detect", "--hint", "Klingon", "a.txt"], "Klingon"),
            (["detect", "--hint", "UTF-8x", "a.txt"], "UTF-8x"),
            (["detect", "--hint", "UTF-8+Guess", "a.txt"], "UTF-8+Guess"),
            (["detect", "--hint", "Cp65000", "a.txt"], "Cp65000"),
            (["detect", "--hint", "", "a.txt"], "--hint"),
            (["convert", "a.txt"], "OUT"),
            (["convert", "--from", "Latin-99", "a.txt", "b.txt"], "Latin-99"),
            (["convert", "--to", "Latin-99", "a.txt", "b.txt"], "Latin-99"),
            (["convert", "--replacement", "ab", "a.txt", "b.txt"], "--replacement"),
            (["encodings", "extra"], "extra"),
        ):
            with self.subTest(arguments=arguments):
                self.assert_one_line(self.run_tool(*arguments), 2, word)
        self.assertEqual(self.names(), ["a.txt"])

    # --- detect ---

    def test_detect_tells_sample_files(self):
        expected = {
            "ascii-english.txt": ("ASCII", False, False),
            "utf8-french.txt": ("UTF-8", False, False),
            "utf8-bom-german.txt": ("UTF-8", True, False),
            "utf16le-bom-japanese.txt": ("Unicode", True, False),
            "utf16be-bom-greek.txt": ("Unicode big endian", True, False),
            "utf16le-english.txt": ("Unicode", False, False),
            "utf16be-english.txt": ("Unicode big endian", False, False),
            "windows1252-spanish.txt": ("ANSI", False, False),
            "xml-ascii.xml": ("ASCII", False, True),
            "xml-utf16le.xml": ("Unicode", False, True),
            "xml-utf16be-bom.xml": ("Unicode big endian", True, True),
            "late-accent.txt": ("UTF-8", False, False),
        }
        for name in expected:
            self.sample(name)
        result = self.run_tool("detect", "--json", *expected)
        self.assert_done(result)
        report = json.loads(result.stdout.decode("utf-8"))
        self.assertEqual(report["version"], 1)
        for entry, (name, (encoding, bom, xml)) in zip(report["files"], expected.items(), strict=True):
            with self.subTest(name=name):
                self.assertEqual(set(entry), {"file", "encoding", "value", "bom", "xml", "bytes", "warning", "error"})
                self.assertEqual((entry["file"], entry["bom"], entry["xml"]), (name, bom, xml))
                self.assertEqual(entry["encoding"].removesuffix(" (XML)").split(" (")[0], encoding)
                self.assertEqual(entry["bytes"], (SAMPLES / name).stat().st_size)
                self.assertRegex(entry["value"], r"^0x[0-9A-F]{8}$")
                self.assertIsNone(entry["error"])
        lines = self.run_tool("detect", *expected).stdout.decode("utf-8").splitlines()
        self.assertEqual([line.split()[0] for line in lines], list(expected))

    def test_detect_goes_on_after_a_file_that_fails(self):
        self.write("first.txt", "plain")
        self.write("last.txt", GERMAN)
        (self.folder / "folder").mkdir()
        result = self.run_tool("detect", "--json", "first.txt", "missing.txt", "folder", "last.txt")
        self.assertEqual(result.returncode, 1)
        files = json.loads(result.stdout.decode("utf-8"))["files"]
        self.assertEqual([entry["error"] is None for entry in files], [True, False, False, True])
        self.assertEqual(files[3]["encoding"], "UTF-8")
        self.assertIsNone(files[1]["encoding"])
        errors = result.stderr.decode("utf-8").splitlines()
        self.assertEqual(len(errors), 2)
        self.assertIn("missing.txt: Cannot open for reading", errors[0])
        plain = self.run_tool("detect", "first.txt", "missing.txt", "last.txt")
        self.assertEqual((plain.returncode, len(plain.stdout.splitlines())), (1, 2))

    def test_levels_and_favours(self):
        self.sample("late-accent.txt")
        self.write("both.txt", GERMAN)
        found = {}
        for level in ("none", "quick", "fair", "full"):
            out = self.run_tool("detect", "--json", "--hint", "OEM", "--level", level, "late-accent.txt").stdout
            found[level] = json.loads(out.decode("utf-8"))["files"][0]["encoding"]
        self.assertEqual(found, {"none": "OEM", "quick": "ASCII", "fair": "ASCII", "full": "UTF-8"})
        warned = {}
        for favor in ("guess", "hint", "none"):
            out = self.run_tool("detect", "--json", "--hint", "ANSI", "--favor", favor, "both.txt").stdout
            entry = json.loads(out.decode("utf-8"))["files"][0]
            warned[favor] = (entry["encoding"].split(" (")[0], entry["warning"] is not None)
        self.assertEqual(warned["guess"], ("UTF-8", False))
        self.assertEqual(warned["hint"], ("ANSI", False))
        self.assertEqual(warned["none"], ("ANSI", True))

    def test_names_of_files_are_unicode(self):
        name = "Ωμέγα – größer 漢字 🙂.txt"
        self.write(name, GERMAN)
        result = self.run_tool("detect", "--json", name)
        self.assert_done(result)
        self.assertEqual(json.loads(result.stdout.decode("utf-8"))["files"][0]["file"], name)
        self.assertTrue(self.run_tool("detect", name).stdout.decode("utf-8").startswith(name + "  UTF-8"))
        out = "naïve ☃.txt"
        self.assert_done(self.run_tool("convert", "--to", "UTF-16", name, out))
        self.assertEqual((self.folder / out).read_bytes(), GERMAN.encode("utf-16-le"))

    @unittest.skipIf(ON_WINE, "such names do not exist there")
    def test_strange_names_are_escaped_in_json(self):
        name = 'quote " backslash \\ tab \t newline \n bell \x07.txt'
        self.write(name.replace("\\", ""), "a")
        entry = json.loads(self.run_tool("detect", "--json", name.replace("\\", "")).stdout)["files"][0]
        self.assertEqual(entry["file"], name.replace("\\", ""))
        broken = subprocess.run(TOOL + ["detect", "--json", b"no-utf8-\xff.txt"], cwd=self.folder, capture_output=True, timeout=120)
        self.assertEqual(broken.returncode, 1)
        self.assertEqual(json.loads(broken.stdout.decode("utf-8"))["files"][0]["file"], "no-utf8-\uf0ff.txt")

    def test_tiny_inputs(self):
        for content in (b"", b"a", b"\xff\xfe", b"\xef\xbb\xbf"):
            self.write("tiny.txt", content)
            result = self.run_tool("detect", "--json", "tiny.txt")
            self.assert_done(result)
            self.assertEqual(json.loads(result.stdout)["files"][0]["bytes"], len(content))
            self.assert_done(self.run_tool("convert", "tiny.txt", "out.txt"))

    # --- standard streams ---

    def test_standard_input_is_like_a_file(self):
        for name in ("utf16le-bom-japanese.txt", "windows1252-spanish.txt", "utf8-french.txt"):
            self.sample(name)
            content = (SAMPLES / name).read_bytes()
            by_name = json.loads(self.run_tool("detect", "--json", name).stdout.decode("utf-8"))["files"][0]
            by_pipe = json.loads(self.run_tool("detect", "--json", "-", stdin=content).stdout.decode("utf-8"))["files"][0]
            self.assertEqual(by_pipe.pop("file"), "-")
            by_name.pop("file")
            self.assertEqual(by_pipe, by_name)
            self.assert_done(self.run_tool("convert", name, "by-name.txt"))
            result = self.run_tool("convert", "-", "-", stdin=content)
            self.assert_done(result)
            self.assertEqual(result.stdout, (self.folder / "by-name.txt").read_bytes())

    def test_streams_are_binary(self):
        content = "line\r\nline\nend of file \x1a is a character\r\n".encode("utf-16-le")
        result = self.run_tool("convert", "--from", "UTF-16", "--to", "UTF-16", "-", "-", stdin=content)
        self.assert_done(result)
        self.assertEqual(result.stdout, content)

    @unittest.skipUnless(os.path.exists("/dev/full"), "needs /dev/full")
    def test_full_disk_is_told(self):
        self.sample("late-accent.txt")
        with open("/dev/full", "wb") as full:
            for arguments in (["detect", "late-accent.txt"], ["encodings"], ["convert", "late-accent.txt", "-"], ["--help"]):
                with self.subTest(arguments=arguments):
                    self.assert_one_line(self.run_tool(*arguments, stdout=full), 1)
        if not ON_WINE:
            self.assert_one_line(self.run_tool("convert", "late-accent.txt", "/dev/full"), 1, "/dev/full: Disk Full.")

    def test_broken_pipe_is_no_error(self):
        self.write("long.txt", "a long line of text\n" * 200000)
        for arguments in (["encodings", "--json"], ["convert", "long.txt", "-"]):
            with self.subTest(arguments=arguments):
                process = subprocess.Popen(command(*arguments), cwd=self.folder, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                                           stderr=subprocess.PIPE)
                process.stdout.read(10)
                process.stdout.close()
                errors = process.stderr.read()
                process.stderr.close()
                self.assertEqual((process.wait(timeout=60), errors), (0, b""))

    def test_interruption_leaves_no_half_written_file(self):
        # Under Wine a signal other than that of Ctrl-C ends the process before the tool hears of it.
        signals = {signal.SIGINT: 130} if ON_WINE else {signal.SIGINT: 130, signal.SIGTERM: 143, signal.SIGHUP: 129}
        for number, code in signals.items():
            with self.subTest(signal=number):
                self.write("out.txt", "precious")
                process = subprocess.Popen(command("convert", "--from", "UTF-8", "-", "out.txt"), cwd=self.folder,
                                           stdin=subprocess.PIPE, stdout=subprocess.PIPE, stderr=subprocess.PIPE)
                try:
                    process.stdin.write(b"a line that arrives in time\n" * 20000)
                    process.stdin.flush()
                    deadline = time.monotonic() + 60
                    while len(self.names()) < 2 and time.monotonic() < deadline:
                        time.sleep(0.05)
                    self.assertEqual(len(self.names()), 2, "no temporary file beside the target")
                    process.send_signal(number)
                    time.sleep(0.3)
                    _, errors = process.communicate(timeout=60)
                finally:
                    process.kill()
                self.assertEqual(process.returncode, code, errors)
                self.assertEqual(self.names(), ["out.txt"])
                self.assertEqual((self.folder / "out.txt").read_text(), "precious")

    @unittest.skipIf(ON_WINE, "needs a terminal and a pipe with a name")
    def test_progress_shows_on_a_terminal_after_a_second(self):
        import pty

        pipe = self.folder / "slow.txt"
        os.mkfifo(pipe)
        for pause, shows in ((0.1, True), (0.0, False)):
            terminal, stderr = pty.openpty()
            process = subprocess.Popen(command("convert", "--from", "UTF-8", pipe, "out.txt"), cwd=self.folder, stderr=stderr)
            os.close(stderr)
            with open(pipe, "wb") as writer:
                for _ in range(16):
                    writer.write(b"a line\n" * 10000)
                    writer.flush()
                    time.sleep(pause)
            self.assertEqual(process.wait(timeout=60), 0)
            os.set_blocking(terminal, False)
            try:
                shown = os.read(terminal, 65536)
            except OSError:  # nothing was written, and nobody is left to write
                shown = b""
            os.close(terminal)
            self.assertEqual(b"MB  " in shown, shows)
            if shows:
                self.assertTrue(shown.endswith(b"\r\x1b[K"), "the bar is still there")
        quiet = subprocess.run(["sh", "-c", "sleep 1.3 | " + shlex.join(command("convert", "-", "out.txt"))], cwd=self.folder, stderr=subprocess.PIPE)
        self.assertEqual(quiet.stderr, b"")

    # --- convert ---

    def test_conversions_equal_those_of_another_implementation(self):
        pages = {"UTF-8": "utf-8", "UTF-8 (with signature)": "utf-8-sig", "UTF-16": "utf-16-le", "UTF16Big": "utf-16-be",
                 "windows-1252": "cp1252", "Cp850": "cp850", "ISO-8859-15": "iso8859-15", "windows-1250": "cp1250"}
        text = "Größe, Übermaß und Äpfel\r\nfür jeden\n"
        for source, codec in pages.items():
            self.write("in.txt", text.encode(codec))
            for target in ("UTF-8", "UTF16Big", "windows-1252"):
                with self.subTest(source=source, target=target):
                    self.assert_done(self.run_tool("convert", "--from", source, "--to", target, "in.txt", "out.txt"))
                    self.assertEqual((self.folder / "out.txt").read_bytes(), text.encode(pages[target]))
        for target in ("UTF-8 (with signature)", "Cp850", "ISO-8859-15"):
            self.write("in.txt", text)
            self.assert_done(self.run_tool("convert", "--to", target, "in.txt", "out.txt"))
            self.assertEqual((self.folder / "out.txt").read_bytes(), text.encode(pages[target]))

    def test_double_byte_pages(self):
        for name, encoding, codec in (("shiftjis-japanese.txt", "shift_jis", "cp932"), ("gbk-chinese.txt", "GBK", "gbk"),
                                      ("big5-chinese.txt", "big5", "big5"), ("koi8r-russian.txt", "koi8-r", "koi8-r"),
                                      ("oem866-russian.txt", "Cp866", "cp866")):
            with self.subTest(name=name):
                self.sample(name)
                self.assert_done(self.run_tool("convert", "--from", encoding, name, "out.txt"))
                self.assertEqual((self.folder / "out.txt").read_bytes().decode("utf-8"), (SAMPLES / name).read_bytes().decode(codec))

    def test_losses_are_told_and_done(self):
        self.write("in.txt", "5 € für Ωmega\n")
        for replacement, out in (([], None), (["--replacement", "*"], b"5 * f*r *mega\n"), (["--replacement", "drop"], b"5  fr mega\n")):
            result = self.run_tool("convert", "--from", "UTF-8", "--to", "ASCII", *replacement, "in.txt", "out.txt")
            self.assertEqual(result.returncode, 3)
            self.assertIn("in.txt: Some characters were re", result.stderr.decode("utf-8"))
            if out is not None:
                self.assertEqual((self.folder / "out.txt").read_bytes(), out)
        self.write("damaged.txt", b"caf\xc3 noir\n")
        result = self.run_tool("convert", "--from", "UTF-8", "--replacement", "#", "damaged.txt", "out.txt")
        self.assertEqual((result.returncode, (self.folder / "out.txt").read_bytes()), (3, b"caf# noir\n"))
        self.assertIn("during read", result.stderr.decode("utf-8"))
        quiet = self.run_tool("convert", "--quiet", "--from", "UTF-8", "damaged.txt", "out.txt")
        self.assertEqual((quiet.returncode, quiet.stderr), (3, b""))

    def test_lossless_fails_and_leaves_the_target_alone(self):
        self.write("in.txt", "5 € für Ωmega\n")
        self.write("damaged.txt", b"fine so far\ncaf\xc3 noir\n")
        self.write("out.txt", "precious")
        for arguments, words in (
            (["--lossless", "--to", "ASCII", "in.txt"], "in.txt: line 1, character 3 (U+20AC): Illegal non ASCII character"),
            (["--lossless", "--to", "windows-1252", "in.txt"], "in.txt: line 1, character 9 (U+03A9): Some characters could not be mapped through UTF-16 --> ANSI"),
            (["--lossless", "--from", "UTF-8", "damaged.txt"], "damaged.txt: line 2, character 4: Illegal non UTF8 sequence"),
            (["--from", "UTF-8", "--to", "ASCII+Lossless", "in.txt"], "in.txt: line 1, character 3 (U+20AC): Illegal non ASCII character"),
        ):
            with self.subTest(arguments=arguments):
                self.assert_one_line(self.run_tool("convert", *arguments, "out.txt"), 1, words)
                self.assertEqual((self.folder / "out.txt").read_text(), "precious")
                self.assertEqual(self.names(), ["damaged.txt", "in.txt", "out.txt"])

    def test_many_files_are_converted(self):
        for folder in ("in", "in/sub"):
            (self.folder / folder).mkdir()
        texts = {"in/a.txt": "ä\n", "in/sub/b.txt": "ö\n", "in/sub/c.dat": "plain\n"}
        for name, text in texts.items():
            self.write(name, text)
        self.assert_one_line(self.run_tool("convert", "--to", "UTF-16", "--output-dir", "out", "in"), 1, "--recursive")
        self.assert_done(self.run_tool("convert", "--to", "UTF-16", "--output-dir", "out", "--recursive", "in"))
        for name, text in texts.items():
            self.assertEqual((self.folder / "out" / name.removeprefix("in/")).read_bytes(), text.encode("utf-16-le"))
        result = self.run_tool("convert", "--verbose", "--to", "windows-1252", "--output-dir", "flat", "in/a.txt", "in/sub/b.txt")
        self.assertEqual((result.returncode, result.stderr.decode().count(" -> ")), (0, 2))
        self.assertEqual((self.folder / "flat/b.txt").read_bytes(), b"\xf6\n")
        self.assert_one_line(self.run_tool("convert", "--output-dir", "flat", "in/a.txt", "in/a.txt"), 1, "would become this one")
        # One that fails does not keep the others back.
        result = self.run_tool("convert", "--in-place", "--to", "UTF-16", "in/a.txt", "none.txt", "in/sub/b.txt")
        self.assertEqual(result.returncode, 1)
        self.assertEqual((self.folder / "in/sub/b.txt").read_bytes(), "ö\n".encode("utf-16-le"))
        for arguments in (["--in-place", "--output-dir", "x", "in/a.txt"], ["--recursive", "in", "x"], ["a", "b", "c"], ["--in-place", "-"]):
            self.assert_one_line(self.run_tool("convert", *arguments), 2)

    def test_in_place_loses_nothing_unless_that_is_wanted(self):
        self.write("a.txt", "5 €\n")
        self.assert_one_line(self.run_tool("convert", "--in-place", "--to", "ASCII", "a.txt"), 1, "a.txt: line 1, character 3 (U+20AC)")
        self.assertEqual((self.folder / "a.txt").read_text(encoding="utf-8"), "5 €\n")
        self.assertEqual(self.run_tool("convert", "--in-place", "--quiet", "--replacement", "?", "--to", "ASCII", "a.txt").returncode, 3)
        self.assertEqual((self.folder / "a.txt").read_bytes(), b"5 ?\n")

    @unittest.skipIf(ON_WINE, "such names do not exist there")
    def test_files_with_every_name_can_be_opened(self):
        names = [b"a:b", b"q?*", b'quote"', b"<x>", b"pipe|", b"back\\slash", b"tab\tx", b"latin\xe9", b"C:\\x.txt"]
        root = os.fsencode(self.folder)
        for name in names:
            with open(os.path.join(root, name), "wb") as file:
                file.write(GERMAN.encode())

        def run(*arguments):
            return subprocess.run(TOOL + list(arguments), cwd=self.folder, capture_output=True, timeout=120)

        listed = [entry["path"] for entry in json.loads(run("find", self.folder, "--json").stdout)["entries"]]
        self.assertEqual(len(listed), len(names))
        for argument in [*names, *listed]:
            with self.subTest(argument=argument):
                self.assertEqual(run("detect", argument).returncode, 0)
                self.assertEqual(run("convert", "--in-place", "--to", "UTF-8", argument).stderr, b"")
                self.assertEqual(run("info", argument).returncode, 0)
        bytes_of = run("find", "--native", "-0", self.folder).stdout
        self.assertEqual(set(bytes_of.split(b"\0")[:-1]), {os.path.join(root, name) for name in names})
        self.assertEqual(run("convert", "--to", "UTF-16", b"a:b", b"new:\xff").returncode, 0)
        self.assertTrue(os.path.exists(os.path.join(root, b"new:\xff")))

    def test_detected_names_are_understood(self):
        for name in ("utf8-bom-german.txt", "xml-utf16le.xml", "windows1252-spanish.txt"):
            self.sample(name)
            entry = json.loads(self.run_tool("detect", "--json", name).stdout.decode())["files"][0]
            for shown in (entry["encoding"], entry["value"]):
                self.assert_done(self.run_tool("convert", "--from", shown, name, "out.txt"))
            self.assertNotIn("(Active Code Page)", entry["encoding"])
        self.write("a.txt", "abc")
        for name in ("UTF-16LE", "utf-16be", "latin2", "latin9", "SJIS", "TIS-620", "MacRoman", "EUC-JP"):
            self.assertNotEqual(self.run_tool("convert", "--from", name, "a.txt", "out.txt").returncode, 2, name)

    def test_if_changed_keeps_the_time(self):
        self.write("in.txt", GERMAN)
        self.assert_done(self.run_tool("convert", "--to", "UTF-16", "in.txt", "out.txt"))
        os.utime(self.folder / "out.txt", (1000000000, 1000000000))
        self.assert_done(self.run_tool("convert", "--if-changed", "--to", "UTF-16", "in.txt", "out.txt"))
        self.assertEqual((self.folder / "out.txt").stat().st_mtime, 1000000000)
        self.assert_done(self.run_tool("convert", "--if-changed", "--to", "UTF-8", "in.txt", "out.txt"))
        self.assertEqual((self.folder / "out.txt").read_bytes(), GERMAN.encode("utf-8"))
        self.assertEqual(self.names(), ["in.txt", "out.txt"])

    def test_input_and_output_may_be_one_file(self):
        self.write("same.txt", GERMAN * 5000)
        self.assert_done(self.run_tool("convert", "--to", "UTF-16", "same.txt", "same.txt"))
        self.assertEqual((self.folder / "same.txt").read_bytes(), (GERMAN * 5000).encode("utf-16-le"))

    def test_files_that_cannot_be_used(self):
        self.write("in.txt", "a")
        (self.folder / "folder").mkdir()
        self.assert_one_line(self.run_tool("convert", "missing.txt", "out.txt"), 1, "missing.txt: Cannot open for reading: ")
        self.assert_one_line(self.run_tool("convert", "folder", "out.txt"), 1, "folder: Cannot open for reading: it is a folder")
        self.assert_one_line(self.run_tool("convert", "in.txt", "folder"), 1, "folder: Cannot open for writing")
        self.assert_one_line(self.run_tool("convert", "in.txt", "nowhere/out.txt"), 1, "nowhere/out.txt: Cannot open for writing")
        self.assertEqual(self.names(), ["folder", "in.txt"])

    def run_in_little_memory(self, *arguments, **keywords):
        """With a gigabyte for all that the process maps; under Wine the 32 bits are bound enough."""
        def bound():
            resource.setrlimit(resource.RLIMIT_AS, (1 << 30, 1 << 30))
        return subprocess.Popen([*TOOL, *arguments], cwd=self.folder, preexec_fn=None if ON_WINE else bound, **keywords)

    def test_sizes_beyond_two_and_four_gigabytes(self):
        if not ON_WINE and b"__asan_init" in pathlib.Path(TOOL[-1]).read_bytes():
            self.skipTest("the sanitizer's shadow memory alone is larger than the bound")
        tail = "café été\n".encode()
        for size in ((2 << 30) - 7, (4 << 30) + 5):
            with open(self.folder / "sparse.txt", "wb") as file:
                file.write(b"begins as text\n")
                file.seek(size)
                file.write(tail)
            with self.run_in_little_memory("detect", "--json", "sparse.txt", stdout=subprocess.PIPE) as tool:
                entry = json.loads(tool.communicate()[0])["files"][0]
            self.assertEqual((tool.returncode, entry["bytes"], entry["error"]), (0, size + len(tail), None))
            self.assertNotEqual(entry["encoding"], "ASCII", size)  # the accents at the end are seen
            if size > 4 << 30:
                break  # reading all of it once is enough
            words = ("convert", "--from", "UTF-8", "--to", "ASCII", "--replacement", "?", "--quiet", "sparse.txt", "-")
            with self.run_in_little_memory(*words, stdout=subprocess.PIPE) as tool:
                count, end = 0, b""
                while piece := tool.stdout.read(1 << 20):
                    count += len(piece)
                    end = (end + piece)[-20:]
            self.assertEqual((tool.returncode, count, end), (3, size + 9, bytes(11) + b"caf? ?t?\n"))

    def test_missing_code_page_is_told(self):
        self.write("in.txt", "äöü")
        self.assert_one_line(self.run_tool("convert", "--to", "Cp12345", "in.txt", "out.txt"), 1, "Cp12345", "NOT INSTALLED")
        self.assert_one_line(self.run_tool("convert", "--from", "Cp12345", "in.txt", "out.txt"), 1, "in.txt", "not supported by machine", "Cp12345")
        self.assertEqual(self.names(), ["in.txt"])

    @unittest.skipIf(ON_WINE, "links and permissions of the other system")
    def test_links_and_permissions_stay(self):
        self.write("in.txt", GERMAN)
        self.write("real.txt", "old").chmod(0o640)
        (self.folder / "link.txt").symlink_to("real.txt")
        self.assert_done(self.run_tool("convert", "in.txt", "link.txt"))
        self.assertTrue((self.folder / "link.txt").is_symlink())
        self.assertEqual((self.folder / "real.txt").read_text(encoding="utf-8"), GERMAN)
        self.assertEqual((self.folder / "real.txt").stat().st_mode & 0o777, 0o640)
        self.assert_done(self.run_tool("convert", "in.txt", "/dev/null"))
        self.assertTrue(pathlib.Path("/dev/null").is_char_device())

    @unittest.skipIf(ON_WINE, "there is no /proc")
    def test_file_that_hides_its_size(self):
        expected = pathlib.Path("/proc/version").read_bytes()
        entry = json.loads(self.run_tool("detect", "--json", "/proc/version").stdout)["files"][0]
        self.assertEqual((entry["encoding"], entry["bytes"]), ("ASCII", len(expected)))
        self.assertEqual(self.run_tool("convert", "/proc/version", "-").stdout, expected)

    @unittest.skipIf(ON_WINE, "there is no /proc")
    def test_failed_read_is_not_the_end_of_the_text(self):
        # This file opens, but its first page cannot be read.
        self.assert_one_line(self.run_tool("detect", "/proc/self/mem"), 1, "/proc/self/mem: Cannot be read")
        self.assert_one_line(self.run_tool("convert", "/proc/self/mem", "out.txt"), 1, "/proc/self/mem: Cannot be read")
        self.assertEqual(self.names(), [])

    # --- encodings ---

    # --- escape and unescape ---

    def test_escapes_are_those_of_the_rules_and_go_round(self):
        text = "Größe \\u00e9 \\uu0041 \\u004 日本 \\\n" * 9000  # more than a piece, and cut anywhere
        marked = re.sub(r"\\(u+)(?=[0-9A-Fa-f]{4})", r"\\u\1", text)
        units = memoryview(marked.encode("utf-16-le")).cast("H")
        escaped = "".join(chr(unit) if unit < 128 else f"\\u{unit:04X}" for unit in units)
        self.write("in.txt", text)
        self.assert_done(self.run_tool("escape", "in.txt", "escaped.txt"))
        self.assertEqual((self.folder / "escaped.txt").read_bytes(), escaped.encode("ascii"))
        self.assert_done(self.run_tool("unescape", "escaped.txt", "out.txt"))
        self.assertEqual((self.folder / "out.txt").read_text(encoding="utf-8"), text)
        self.assert_done(self.run_tool("escape", "--to", "UTF-16", "in.txt", "escaped16.txt"))
        self.assert_done(self.run_tool("unescape", "--from", "UTF-16", "--to", "UTF16Big", "escaped16.txt", "out.txt"))
        self.assertEqual((self.folder / "out.txt").read_text(encoding="utf-16-be"), text)

    def test_unescape_takes_text_that_is_only_partly_escaped(self):
        self.write("in.txt", "é\\u00e9日\\u65e5\\uu0041\\u00")
        self.assert_done(self.run_tool("unescape", "--from", "UTF-8", "in.txt", "-", stdin=b""))
        self.assertEqual(self.run_tool("unescape", "--from", "UTF-8", "in.txt", "-").stdout.decode("utf-8"), "éé日日\\u0041\\u00")
        self.assert_one_line(self.run_tool("unescape", "missing.txt", "out.txt"), 1, "missing.txt")
        self.assertEqual(self.names(), ["in.txt"])

    def test_encodings_are_listed(self):
        result = self.run_tool("encodings", "--json")
        self.assert_done(result)
        report = json.loads(result.stdout.decode("utf-8"))
        rows = report["encodings"]
        names = [name.lower() for row in rows for name in [row["name"], *row["aliases"]]]
        self.assertEqual((report["version"], len(names)), (1, len(set(names))))
        by_name = {row["name"]: row for row in rows}
        self.assertEqual(by_name["ANSI - Latin I"]["value"], "0x000204E4")
        self.assertIn("Latin1", by_name["ANSI - Latin I"]["aliases"])
        self.assertIn("ISO-8859-1", by_name["ISO8859_1"]["aliases"])
        installed = json.loads(self.run_tool("encodings", "--json", "--installed").stdout.decode("utf-8"))["encodings"]
        self.assertEqual(installed, [row for row in rows if row["installed"]])
        self.assertEqual(len(self.run_tool("encodings").stdout.splitlines()), len(rows))


if __name__ == "__main__":
    main()
