"""What the tests of qxtool as a process have in common: the program, a folder for each test, messages."""

import os
import pathlib
import shutil
import sys
import tempfile
import unittest

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import wine  # noqa: E402

TOOL = []  # the words that start the tool, known once main has begun
ON_WINE = "wine" in sys.argv[2:]


class ToolCase(unittest.TestCase):
    def setUp(self):
        self.folder = pathlib.Path(tempfile.mkdtemp(prefix="qxtool-test-"))
        self.addCleanup(shutil.rmtree, self.folder, ignore_errors=True)

    def assert_done(self, result):
        self.assertEqual((result.returncode, result.stderr.decode("utf-8")), (0, ""))

    def assert_one_line(self, result, code, *words):
        """Failed with this code, one line of explanation that has the words, and no data."""
        text = result.stderr.decode("utf-8")
        self.assertEqual(result.returncode, code, text)
        self.assertEqual(text.count("\n"), 1, text)
        self.assertTrue(text.startswith("qxtool: "), text)
        for word in words:
            self.assertIn(word, text)
        self.assertFalse(result.stdout)


def main():
    """Runs the tests of the program that was started as: TEST.py TOOL [WRAPPER...]."""
    tool, *wrapper = sys.argv[1:]
    wine.keep_running(wrapper)
    TOOL.extend(wrapper + [os.path.abspath(tool)])
    unittest.main("__main__", argv=sys.argv[:1], verbosity=2)
