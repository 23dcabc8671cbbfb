#!/usr/bin/env python3
"""Holds ./dev to what it promises to who runs it: to take packages back to older versions only when somebody said so,
and to say what a variable that it names is for.

usage: dev_test.py DEV
The package manager is a stand-in that fails unless it may downgrade, and writes its arguments down; so are the
programs that build and test.
"""

import os
import pathlib
import pty
import re
import shutil
import subprocess
import sys
import tempfile
import unittest

DEV = pathlib.Path(sys.argv[1]).resolve()
PACKAGE_MANAGER = {
    "apt-get": 'echo "$@" >>"$CALLS"; case "$*" in *--allow-downgrades*|*update*) ;; *) exit 100 ;; esac',
    "apt-cache": 'echo " 500 http://mirror.example/debian stable/main amd64 Packages"',
    "dpkg-query": "exit 1",
    "dpkg": ":",
    "sudo": 'exec "$@"',
}
# Everything is there, builds, and passes.
WELL_EQUIPPED = {
    "dpkg-query": "echo install ok installed",
    "cmake": ":",
    "ctest": 'echo "1/1 Test #1: core ..... Passed 0.01 sec"',
    "pkg-config": ":",
}


class DevTest(unittest.TestCase):
    """A copy of the script among stand-ins."""

    STAND_INS = {}

    def setUp(self):
        self.folder = pathlib.Path(tempfile.mkdtemp(prefix="qxcore-dev-"))
        self.addCleanup(shutil.rmtree, self.folder)
        shutil.copy(DEV, self.folder / "dev")
        (self.folder / "bin").mkdir()
        for name, body in self.STAND_INS.items():
            path = self.folder / "bin" / name
            path.write_text(f"#!/bin/sh\n{body}\n")
            path.chmod(0o755)
        self.environment = {"PATH": f"{self.folder}/bin:{os.environ['PATH']}", "CALLS": str(self.folder / "calls"),
                            "HOME": str(self.folder)}


class SetUpTest(DevTest):
    STAND_INS = PACKAGE_MANAGER

    def set_up(self, *options, ci=False, answer=None):
        """The exit status, and whether anything was taken back."""
        environment = self.environment | ({"CI": "true"} if ci else {})
        command = [str(self.folder / "dev"), *options, "setup", "windows"]
        if answer is None:
            status = subprocess.run(command, env=environment, stdin=subprocess.DEVNULL, capture_output=True).returncode
        else:
            status = self.answered(command, environment, answer)
        return status, "--allow-downgrades" in (self.folder / "calls").read_text()

    def answered(self, command, environment, answer):
        """As a person does it, at a terminal."""
        process, terminal = pty.fork()
        if process == 0:
            os.execve(command[0], command, environment)
        os.write(terminal, answer)
        try:
            while os.read(terminal, 4096):
                pass
        except OSError:
            pass  # the other end was closed
        return os.waitstatus_to_exitcode(os.waitpid(process, 0)[1])

    def test_nobody_was_asked(self):
        status, is_taken_back = self.set_up()
        self.assertNotEqual(status, 0)
        self.assertFalse(is_taken_back)

    def test_the_option_and_ci_allow_it(self):
        self.assertEqual(self.set_up("--allow-downgrades"), (0, True))
        (self.folder / "calls").unlink()
        self.assertEqual(self.set_up(ci=True), (0, True))

    def test_a_person_is_asked(self):
        for answer in (b"\n", b"n\n", b"yes, please\n"):
            status, is_taken_back = self.set_up(answer=answer)
            self.assertNotEqual(status, 0, answer)
            self.assertFalse(is_taken_back, answer)
        self.assertEqual(self.set_up(answer=b"y\n"), (0, True))


class CorpusTest(DevTest):
    STAND_INS = WELL_EQUIPPED
    VARIABLE = "QXCORE_CORPUS"

    def said_of_it(self, environment):
        """What a run of the tests says of the variable."""
        (self.folder / "build/linux").mkdir(parents=True, exist_ok=True)
        run = subprocess.run([str(self.folder / "dev"), "test", "linux"], env=self.environment | environment,
                             stdin=subprocess.DEVNULL, capture_output=True, text=True)
        self.assertEqual(run.returncode, 0, run.stderr)
        return [line for line in (run.stdout + run.stderr).splitlines() if self.VARIABLE in line]

    def test_without_it_a_run_says_what_it_is(self):
        said = self.said_of_it({})
        self.assertEqual(len(said), 1)
        self.assertRegex(said[0], "folder of real files")
        document = re.search(r"\((\S+\.md)\)", said[0])
        self.assertIsNotNone(document, said[0])
        self.assertRegex((DEV.parent / document[1]).read_text(), rf"`{self.VARIABLE}`.*folder of real files")

    def test_with_it_nothing_needs_to_be_said(self):
        self.assertEqual(self.said_of_it({self.VARIABLE: str(self.folder)}), [])


unittest.main(argv=sys.argv[:1])
