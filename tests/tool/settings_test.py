#!/usr/bin/env python3
"""Runs qxtool settings and qxtool ini as a process: values of each type, lists, deletion, messages.

usage: settings_test.py TOOL [WRAPPER...]
With the wrapper "wine" the tool is the Windows one; the list of tests is the same.
"""

import json
import os
import subprocess
import unittest

from tool_case import ON_WINE, TOOL, ToolCase, main

ROOT = "qxtool test"


class SettingsTest(ToolCase):
    def setUp(self):
        super().setUp()
        self.environment = dict(os.environ, QXCORE_REGISTRY=str(self.folder / "data" / "registry.db"), QXCORE_HOME="here")
        self.run_tool("settings", "delete", ROOT, "--recursive")
        self.addCleanup(self.run_tool, "settings", "delete", ROOT, "--recursive")

    def run_tool(self, *arguments):
        return subprocess.run(TOOL + [str(argument) for argument in arguments], cwd=self.folder, env=self.environment,
                              stdout=subprocess.PIPE, stderr=subprocess.PIPE, timeout=120)

    def output(self, *arguments):
        result = self.run_tool(*arguments)
        self.assertEqual((result.returncode, result.stderr.decode("utf-8")), (0, ""))
        return result.stdout.decode("utf-8")

    # --- the registry ---

    def test_values_of_each_type(self):
        cases = (("text", "Größe 中 \U0001F600", "Größe 中 \U0001F600"), ("text", "", ""), ("number", "-5", "-5"),
                 ("number", "0xFFFFFFFF", "-1"), ("binary", "00FFa1", "00ffa1"), ("expand", "%QXCORE_HOME%!", "here!"))
        for kind, value, shown in cases:
            with self.subTest(kind=kind, value=value):
                self.output("settings", "set", ROOT + "\\a", "name", "--type", kind, "--", value)
                self.assertEqual(self.output("settings", "get", ROOT + "\\A\\", "NAME"), shown + "\n")
                document = json.loads(self.output("settings", "get", ROOT + "\\a", "name", "--json"))
                self.assertEqual((document["version"], document["setting"]["type"], document["setting"]["value"]), (1, kind, shown))
        self.output("settings", "set", ROOT, "", "unnamed")
        self.assertEqual(self.output("settings", "get", ROOT), "unnamed\n")

    def test_lists_of_keys_and_values(self):
        self.output("settings", "set", ROOT, "one", "1")
        self.output("settings", "set", ROOT + "\\b\\c", "two", "0x10", "--type", "number")
        self.output("settings", "set", ROOT + "\\b", "three", "%PATH%", "--type", "expand")
        self.assertEqual(self.output("settings", "list", ROOT), "one (text) 1\nb\\\n")
        self.assertEqual(self.output("settings", "list", ROOT, "--recursive"),
                         "one (text) 1\nb\\\nb\\three (expand) %PATH%\nb\\c\\\nb\\c\\two (number) 16\n")
        document = json.loads(self.output("settings", "list", ROOT, "--recursive", "--json"))
        self.assertEqual(document["keys"], ["b", "b\\c"])
        self.assertEqual([(value["path"], value["name"], value["value"]) for value in document["values"]],
                         [("", "one", "1"), ("b", "three", "%PATH%"), ("b\\c", "two", "16")])

    def test_deletion(self):
        self.output("settings", "set", ROOT + "\\b\\c", "v", "1")
        self.output("settings", "set", ROOT, "b", "a value of the same name")
        self.output("settings", "delete", ROOT, "b")
        self.assert_one_line(self.run_tool("settings", "get", ROOT, "b"), 1, "no such value")
        self.assert_one_line(self.run_tool("settings", "delete", ROOT, "b"), 1, "--recursive")
        self.output("settings", "delete", ROOT, "b", "--recursive")
        self.output("settings", "delete", ROOT, "b")
        self.assert_one_line(self.run_tool("settings", "list", ROOT + "\\b"), 1, "no such key")
        self.output("settings", "delete", ROOT)
        self.assert_one_line(self.run_tool("settings", "list", ROOT), 1, "no such key")

    def test_wrong_usage(self):
        for value, kind in (("12x", "number"), ("4294967296", "number"), ("abc", "binary"), ("zz", "binary"), ("x", "list")):
            self.assert_one_line(self.run_tool("settings", "set", ROOT, "n", value, "--type", kind), 2)
        self.assert_one_line(self.run_tool("settings", "set", ROOT, "n"), 2)
        self.assert_one_line(self.run_tool("settings", "rename", ROOT), 2, "rename")
        self.assert_one_line(self.run_tool("ini"), 2)
        self.assert_one_line(self.run_tool("ini", "set", "a.ini", "s", "k", "two\nlines"), 2, "line end")

    @unittest.skipIf(ON_WINE, "the registry is the system's own there")
    def test_the_database_cannot_be_had(self):
        self.environment["QXCORE_REGISTRY"] = "/proc/none/registry.db"
        self.assert_one_line(self.run_tool("settings", "set", ROOT, "n", "1"), 1, "cannot be opened for writing")
        self.assert_one_line(self.run_tool("settings", "get", ROOT, "n"), 1, "no such key")
        (self.folder / "broken.db").write_bytes(b"this is no database" * 100)
        self.environment["QXCORE_REGISTRY"] = str(self.folder / "broken.db")
        self.assert_one_line(self.run_tool("settings", "set", ROOT, "n", "1"), 1, "cannot be opened for writing")
        self.assertEqual((self.folder / "broken.db").read_bytes(), b"this is no database" * 100)

    # --- initialisation files ---

    def test_ini_files_keep_what_is_theirs(self):
        path = self.folder / "a.ini"
        path.write_bytes("; top\r\n[One]\r\nkey = old\r\n\r\n[Two]\r\n".encode("utf-16"))
        self.output("ini", "set", "a.ini", "one", "KEY", "Größe 中")
        self.output("ini", "set", "a.ini", "Two", "k2", "x" * 3000)
        self.assertEqual(self.output("ini", "get", "a.ini", "ONE", "key"), "Größe 中\n")
        self.assertEqual(self.output("ini", "get", "a.ini", "two", "k2"), "x" * 3000 + "\n")
        self.assertEqual(self.output("ini", "list", "a.ini"), "One\nTwo\n")
        self.assertEqual(self.output("ini", "list", "a.ini", "one"), "key=Größe 中\n")
        document = json.loads(self.output("ini", "list", "a.ini", "one", "--json"))
        self.assertEqual(document, {"version": 1, "entries": [{"key": "key", "value": "Größe 中"}]})
        self.assertEqual(json.loads(self.output("ini", "list", "a.ini", "--json"))["sections"], ["One", "Two"])
        text = path.read_bytes().decode("utf-16")
        self.assertIn("; top\r\n[One]\r\n", text)
        if not ON_WINE:
            self.assertEqual(text, "; top\r\n[One]\r\nkey = Größe 中\r\n\r\n[Two]\r\nk2=" + "x" * 3000 + "\r\n")

    def test_ini_set_writes_what_the_file_can_hold_or_refuses(self):
        path = self.folder / "a.ini"
        for content, value, word in (
            (b"[s]\r\nk=\xe9\r\n", "\u4e2d", "code page"),  # not in the ANSI page
            (b"[s]\r\nk=\xc3\xa9\r\n", "\xfc", "UTF-8"),  # UTF-8 without a mark
            (b"[s]\r\nk=\xc3\xa9\r\n", "\u4e2d", "UTF-8"),
        ):
            path.write_bytes(content)
            self.assert_one_line(self.run_tool("ini", "set", "a.ini", "s", "k2", value), 1, "a.ini", word)
            self.assert_one_line(self.run_tool("ini", "set", "a.ini", "s", value, "v"), 1, "a.ini", word)
            self.assertEqual(path.read_bytes(), content)
        self.output("ini", "set", "a.ini", "s", "k2", "plain")
        self.assertEqual(path.read_bytes(), b"[s]\r\nk=\xc3\xa9\r\nk2=plain\r\n")
        path.write_bytes(b"[s]\r\n")
        self.output("ini", "set", "a.ini", "s", "k", "Gr\xf6\xdfe")
        self.assertEqual(path.read_bytes(), b"[s]\r\nk=Gr\xf6\xdfe\r\n")
        # A new file can be made so that it holds everything.
        self.output("ini", "set", "new.ini", "s", "k", "\u4e2d \U0001f642")
        self.assertEqual(self.output("ini", "get", "new.ini", "s", "k"), "\u4e2d \U0001f642\n")

    def test_ini_messages(self):
        self.output("ini", "set", "new.ini", "s", "k", "")
        self.assertEqual(self.output("ini", "get", "new.ini", "s", "k"), "\n")
        self.assert_one_line(self.run_tool("ini", "get", "new.ini", "s", "none"), 1, "no such key")
        self.assert_one_line(self.run_tool("ini", "get", "none.ini", "s", "k"), 1, "none.ini")
        self.assert_one_line(self.run_tool("ini", "set", "no/such/a.ini", "s", "k", "v"), 1, "no/such/a.ini")


if __name__ == "__main__":
    main()
