#!/usr/bin/env python3
"""Holds ./dev to taking packages back to older versions only when somebody said so.

usage: set_up_test.py DEV
The package manager is a stand-in that fails unless it may downgrade, and writes its arguments down.
"""

import os
import pathlib
import pty
import shutil
import subprocess
import sys
import tempfile
import unittest

DEV = pathlib.Path(sys.argv[1]).resolve()
STAND_INS = {
    "apt-get": 'echo "$@" >>"$CALLS"; case "$*" in *--allow-downgrades*|*update*) ;; *) exit 100 ;; esac',
    "apt-cache": 'echo " 500 http://mirror.example/debian stable/main amd64 Packages"',
    "dpkg-query": "exit 1",
    "dpkg": ":",
    "sudo": 'exec "$@"',
}


class SetUpTest(unittest.TestCase):
    def setUp(self):
        self.folder = pathlib.Path(tempfile.mkdtemp(prefix="qxcore-dev-"))
        self.addCleanup(shutil.rmtree, self.folder)
        shutil.copy(DEV, self.folder / "dev")
        (self.folder / "bin").mkdir()
        for name, body in STAND_INS.items():
            path = self.folder / "bin" / name
            path.write_text(f"#!/bin/sh\n{body}\n")
            path.chmod(0o755)
        self.environment = {"PATH": f"{self.folder}/bin:{os.environ['PATH']}", "CALLS": str(self.folder / "calls"),
                            "HOME": str(self.folder)}

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


unittest.main(argv=sys.argv[:1])
