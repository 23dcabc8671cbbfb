#!/usr/bin/env python3
"""Shows a program on an X server of its own and writes what the server has on its screen as a PNG file.

usage: screen_picture.py OUT.png WIDTH HEIGHT READY PROGRAM [ARGS]

The picture is taken once the file READY is there, which the program writes when its window is complete, and the screen
no longer changes. Then the file READY.taken is made, at which the program is to end.
"""

import os
import pathlib
import struct
import subprocess
import sys
import tempfile
import time
import zlib

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[2] / "tests/support"))
import x_server  # noqa: E402


def png(width, height, rows):
    def chunk(kind, data):
        return struct.pack(">I", len(data)) + kind + data + struct.pack(">I", zlib.crc32(kind + data))

    lines = b"".join(b"\0" + row for row in rows)
    header = struct.pack(">IIBBBBB", width, height, 8, 2, 0, 0, 0)
    return b"\x89PNG\r\n\x1a\n" + chunk(b"IHDR", header) + chunk(b"IDAT", zlib.compress(lines, 9)) + chunk(b"IEND", b"")


def read_screen(path):
    """The server's screen, which it keeps in a file of the format XWD: width, height, rows of RGB."""
    data = path.read_bytes()
    header = struct.unpack(">25I", data[:100])
    size, width, height, stride, colors = header[0], header[4], header[5], header[12], header[19]
    start = size + colors * 12
    rows = []
    for y in range(height):
        row = data[start + y * stride : start + y * stride + width * 4]
        pixels = bytearray(width * 3)
        pixels[0::3], pixels[1::3], pixels[2::3] = row[2::4], row[1::4], row[0::4]
        rows.append(bytes(pixels))
    return width, height, rows


def wait_for(condition, seconds=60):
    end = time.monotonic() + seconds
    while not condition():
        if time.monotonic() > end:
            sys.exit("the window does not come")
        time.sleep(0.1)


def settled(path):
    """The screen after it stayed the same for half a second."""
    former = None
    while True:
        now = path.read_bytes()
        if now == former:
            return read_screen(path)
        former = now
        time.sleep(0.5)


def main():
    out, width, height, ready, *program = sys.argv[1:]
    taken = pathlib.Path(ready + ".taken")
    for file in (pathlib.Path(ready), taken):
        file.unlink(missing_ok=True)
    with tempfile.TemporaryDirectory() as folder, x_server.running(width, height, folder) as environment:
        shown = subprocess.Popen(program, env=environment)
        try:
            wait_for(lambda: os.path.exists(ready))
            pathlib.Path(out).write_bytes(png(*settled(pathlib.Path(folder) / "Xvfb_screen0")))
            taken.touch()
            if shown.wait(timeout=60) != 0:
                sys.exit("the program failed")
        finally:
            shown.kill()
            shown.wait()


main()
