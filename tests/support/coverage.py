#!/usr/bin/env python3
"""Prints the branch coverage of the library by folder, without the branches that exceptions take.

usage: coverage.py BUILD [FOLDER]
BUILD is a build with --coverage whose tests have run. With FOLDER ("qxcore/stream") the lines of the files below it
whose branches were not all taken are listed, too.
"""

import collections
import gzip
import json
import pathlib
import subprocess
import sys
import tempfile

ROOT = pathlib.Path(__file__).resolve().parents[2]
# Below qxcore/platform/posix/; what else is in qxcore/platform is one row.
OWN_ROWS = ("controls", "display", "draw", "window")


def row_of(name):
    """The row of the table that a file belongs to."""
    parts = name.split("/")
    if parts[1] == "platform":
        return "/".join(parts[:4]) if parts[3:] and parts[3] in OWN_ROWS else "qxcore/platform, the rest"
    return "/".join(parts[:2])


def branches(build):
    """(file, line, number) of each branch: whether it was taken in any object."""
    taken = collections.defaultdict(bool)
    objects = [str(path) for path in (build / "CMakeFiles/qxcore11e.dir").rglob("*.gcda")]
    with tempfile.TemporaryDirectory() as folder:
        subprocess.run(["gcov", "--json-format", "--branch-probabilities", *objects], cwd=folder, check=True,
                       stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
        for path in pathlib.Path(folder).glob("*.gcov.json.gz"):
            for file in json.loads(gzip.decompress(path.read_bytes()))["files"]:
                name = (build / file["file"]).resolve()
                if not name.is_relative_to(ROOT / "qxcore"):
                    continue
                for line in file["lines"]:
                    for number, branch in enumerate(line["branches"]):
                        if not branch["throw"]:
                            taken[str(name.relative_to(ROOT)), line["line_number"], number] |= branch["count"] > 0
    return taken


def main():
    build = pathlib.Path(sys.argv[1]).resolve()
    wanted = sys.argv[2] if len(sys.argv) > 2 else None
    counts = collections.defaultdict(lambda: [0, 0])
    missed = collections.defaultdict(set)
    for (name, line, _), is_taken in branches(build).items():
        for key in (row_of(name), "all"):
            counts[key][0] += is_taken
            counts[key][1] += 1
        if not is_taken:
            missed[name].add(line)
    for folder, (hit, all_) in sorted(counts.items()):
        print(f"{100 * hit / all_:5.1f} %  {hit:6} of {all_:6} branches  {folder}")
    for name, lines in sorted(missed.items()):
        if wanted and name.startswith(wanted):
            print(name + ": " + " ".join(map(str, sorted(lines))))


main()
