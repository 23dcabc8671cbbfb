#!/usr/bin/env python3
"""Runs the tests of the real screen on an X server of their own.

usage: screen_test.py PROGRAM [ARGS]

Left out, and said so, where there is no Xvfb.
"""

import pathlib
import subprocess
import sys

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import x_server  # noqa: E402


def main():
    if not x_server.is_installed():
        print("left out: the tests of the real screen need Xvfb")
        return 0
    with x_server.running() as environment:
        return subprocess.run(sys.argv[1:], env=environment, timeout=300).returncode


if __name__ == "__main__":
    sys.exit(main())
