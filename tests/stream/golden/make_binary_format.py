#!/usr/bin/env python3
"""Writes binary_format.bin by the rules of docs/binary-format.md, without the library.

It holds a table, a sorted map, a sorted map without case, and the two maps in the order of insertion;
binary_stream_test.cpp has the same values.
"""

import pathlib
import struct


def text(value):
    data = value.encode("utf-16-le", "surrogatepass")
    units = struct.unpack(f"<{len(data) // 2}H", data)
    utf8 = b"".join(chr(unit).encode("utf-8", "surrogatepass") for unit in units) + b"\0"
    n = len(utf8)
    if n < 255:
        return bytes([n]) + utf8
    if n < 65535:
        return b"\xff" + struct.pack("<H", n) + utf8
    return b"\xff\xff\xff" + struct.pack("<i", n) + utf8


def table(values):
    return struct.pack("<i", len(values)) + b"".join(text(value) for value in values)


def pairs(entries):
    return struct.pack("<i", len(entries)) + b"".join(text(key) + text(value) for key, value in entries)


STRINGS = ["", "AB", "é€😀", "x" * 253, "y" * 254, "ü" * 32767 + "z", "w" * 65534]
PAIRS = [("b", "2"), ("B", "two"), ("a", "1"), ("", "nothing")]

content = table(STRINGS)
content += pairs(sorted(PAIRS))
content += pairs([("", "nothing"), ("a", "1"), ("b", "two")])
content += pairs(PAIRS)
content += pairs([("b", "two"), ("a", "1"), ("", "nothing")])
pathlib.Path(__file__).with_name("binary_format.bin").write_bytes(content)
