#!/usr/bin/env python3
"""Runs the tests of the real screen on an X server of their own.

usage: screen_test.py PROGRAM [ARGS]

Left out, and said so, where there is no Xvfb.
"""

import os
import shutil
import subprocess
import sys


def main():
    if not shutil.which("Xvfb"):
        print("left out: the tests of the real screen need Xvfb")
        return 0
    read, write = os.pipe()
    server = subprocess.Popen(
        ["Xvfb", "-displayfd", str(write), "-screen", "0", "1280x1024x24", "-nolisten", "tcp"],
        pass_fds=[write],
        stderr=subprocess.DEVNULL,
    )
    os.close(write)
    try:
        with os.fdopen(read) as numbers:
            number = numbers.readline().strip()
        if not number:
            sys.exit("Xvfb does not start")
        environment = dict(os.environ, DISPLAY=f":{number}", QXCORE_DISPLAY="sdl")
        environment.pop("XAUTHORITY", None)
        return subprocess.run(sys.argv[1:], env=environment, timeout=300).returncode
    finally:
        server.terminate()
        server.wait()


if __name__ == "__main__":
    sys.exit(main())
