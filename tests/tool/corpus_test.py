#!/usr/bin/env python3
"""Lets qxtool detect and convert real files whose encodings are known.

The files lie in the folder that QXCORE_CORPUS names, under encodings/, with their labels in
MANIFEST.tsv; without it the test is left out. What must come out stands in corpus_expected.tsv, one
list for both targets; the few results that differ under Wine stand there with the reason.

usage: corpus_test.py [--write] TOOL [WRAPPER...]
"""

import ctypes
import ctypes.util
import json
import os
import pathlib
import subprocess
import sys
import tempfile

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import wine  # noqa: E402

EXPECTED = pathlib.Path(__file__).with_name("corpus_expected.tsv")
COLUMNS = ("value", "bom", "xml", "bytes", "warning")

# What a label must come out as: kind ASCII, the active code page, UTF-8, UTF-16 of either order.
FAMILIES = {
    "ascii": {"0x00010000"},
    "utf-8": {"0x00040004"},
    "utf-8-bom": {"0x0004000C"},
    "utf-16le-bom": {"0x0004000A"},
    "utf-16be-bom": {"0x00040009"},
    "utf-16le-nobom": {"0x00040002", "0x0004000A"},
    "utf-16be-nobom": {"0x00040001", "0x00040009"},
    "windows-1252": {"0x00020000"},
    "iso-8859-1": {"0x00020000"},
}

ICU_NAMES = {0x10000: b"US-ASCII", 0x20000: b"windows-1252", 0x30000: b"ibm-437", 0x40004: b"UTF-8", 0x40002: b"UTF-16LE",
             0x40001: b"UTF-16BE"}
MARKS = {0x40004: b"\xef\xbb\xbf", 0x40002: b"\xff\xfe", 0x40001: b"\xfe\xff"}


def detect(tool, folder, paths):
    result = subprocess.run(tool + ["detect", "--json", "--", *paths], cwd=folder, stdout=subprocess.PIPE, stderr=subprocess.PIPE, timeout=300)
    report = json.loads(result.stdout.decode("utf-8"))
    found = {entry["file"]: entry for entry in report["files"]}
    failed = [f"{path}: {entry['error']}" for path, entry in found.items() if entry["error"]]
    return found, failed + ([] if result.returncode == 0 else [f"exit code {result.returncode}"])


def row(entry):
    return tuple("" if entry[column] is None else str(entry[column]).lower() if isinstance(entry[column], bool) else str(entry[column])
                 for column in COLUMNS)


def read_expected():
    lines = [line.split("\t") for line in EXPECTED.read_text(encoding="utf-8").splitlines() if not line.startswith("#")]
    return {line[0]: (tuple(line[1:6]), line[6] if len(line) > 6 else "") for line in lines[1:]}


def write_expected(found):
    on_wine = {path: value for path, (_, value) in read_expected().items()} if EXPECTED.exists() else {}
    with EXPECTED.open("w", encoding="utf-8", newline="\n") as out:
        out.write("# What qxtool detect --json says of the real files; the last column is the value under Wine 8 where that differs,\n")
        out.write("# because its IsTextUnicode never reports ASCII characters in UTF-16 as such. Made by corpus_test.py --write.\n")
        out.write("path\t" + "\t".join(COLUMNS) + "\twine\n")
        for path in sorted(found):
            out.write("\t".join((path, *row(found[path]), on_wine.get(path, ""))) + "\n")


def decided_otherwise(label, content):
    """Whether the documented rules give another encoding than the label."""
    if label.startswith("utf-8"):
        # Four-byte sequences are not read; a mark decides before they are looked at.
        return label == "utf-8" and any(byte >= 0xF0 for byte in content)
    if label.endswith("-nobom"):
        text = content.decode("utf-16-le" if "le" in label else "utf-16-be", "replace")
        return all(byte < 0x80 for byte in content) and not text.isascii()
    return False


def check_labels(folder, labels, found):
    counted = right = 0
    wrong = []
    for path, label in labels.items():
        if label not in FAMILIES or decided_otherwise(label, (folder / path).read_bytes()):
            continue
        counted += 1
        value = f"0x{int(found[path]['value'], 16) & 0xFFFFF:08X}"
        if value in FAMILIES[label]:
            right += 1
        else:
            wrong.append(f"  {path}: labelled {label}, detected {found[path]['encoding']}")
    print(f"{right} of {counted} labelled files come out as labelled")
    for line in wrong:
        print(line)
    return [] if right * 100 >= counted * 99 else ["fewer than 99 of 100 come out as labelled"]


class Icu:
    """ICU's converter, called in the library that ours stands on."""

    def __init__(self):
        name = ctypes.util.find_library("icuuc")
        self.library = ctypes.CDLL(name) if name else None
        version = name.rsplit(".", 1)[1] if name else ""
        self.convert = getattr(self.library, f"ucnv_convert_{version}") if name else None

    def to_utf8(self, converter, content):
        room = len(content) * 4 + 16
        target = ctypes.create_string_buffer(room)
        error = ctypes.c_int(0)
        length = self.convert(b"UTF-8", converter, target, room, content, len(content), ctypes.byref(error))
        if error.value > 0:
            raise SystemExit(f"ICU cannot convert from {converter.decode()}: error {error.value}")
        return target.raw[:length]


def check_conversions(tool, folder, found):
    icu = Icu()
    if icu.convert is None:
        print("left out: the comparison with ICU, which is not installed")
        return []
    problems = []
    compared = 0
    with tempfile.TemporaryDirectory() as out:
        target = os.path.join(out, "out.txt")
        for path, entry in found.items():
            value = int(entry["value"], 16) & 0xFFFE7
            subprocess.run(tool + ["convert", "--to", "UTF-8 (with signature)", path, target], cwd=folder, check=True, timeout=60,
                           stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
            content = (folder / path).read_bytes()
            content = content.removeprefix(MARKS.get(value, b"")) if entry["bom"] else content
            wanted = b"\xef\xbb\xbf" + icu.to_utf8(ICU_NAMES[value], content)
            if pathlib.Path(target).read_bytes() != wanted:
                problems.append(f"{path}: converted differently from ICU, from {entry['encoding']}")
            compared += 1
    print(f"{compared - len(problems)} of {compared} files are converted as ICU converts them")
    return problems


def main():
    arguments = sys.argv[1:]
    write = arguments[:1] == ["--write"]
    tool, *wrapper = arguments[1:] if write else arguments
    corpus = os.environ.get("QXCORE_CORPUS")
    if not corpus:
        print("left out: detection of real files, because QXCORE_CORPUS is not set")
        return
    wine.keep_running(wrapper)
    folder = pathlib.Path(corpus) / "encodings"
    lines = [line.split("\t") for line in (folder / "MANIFEST.tsv").read_text(encoding="utf-8").splitlines()]
    labels = {line[0]: line[1] for line in lines[1:]}
    command = wrapper + [os.path.abspath(tool)]
    found, problems = detect(command, folder, list(labels))
    if write:
        write_expected(found)
    expected = read_expected()
    for path in sorted(set(labels) | set(expected)):
        if path not in expected or path not in found:
            problems.append(f"{path}: not in both lists")
            continue
        wanted, on_wine = expected[path]
        wanted = (on_wine, *wanted[1:]) if on_wine and wrapper else wanted
        if row(found[path]) != wanted:
            problems.append(f"{path}: detected {row(found[path])}, expected {wanted}")
    print(f"{len(found)} files detected")
    if not wrapper:
        problems += check_labels(folder, labels, found)
        problems += check_conversions(command, folder, found)
    for problem in problems:
        print(problem)
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
