#!/usr/bin/env python3
"""Measures qxtool and qxworkbench beside the tools that people use for the same work, and prints the ratios.

usage: tool_table.py QXTOOL QXWORKBENCH EMPTY_WINDOW [FILTER]   FILTER is a regular expression for the work

Every figure is the median of several runs of a whole process, ours and the peer's in turn, on files that were read
before: at least five, and up to twenty-five as long as they take no more than three seconds.
Output goes to /dev/null or to a file that is replaced; the files are made anew for each row.
"""

import pathlib
import random
import re
import shutil
import statistics
import subprocess
import sys
import tempfile
import time

from table import print_table, show

FEWEST_RUNS, MOST_RUNS, PATIENCE = 5, 25, 3.0
TEXT = "Größe, Übermaß und Äpfel für jeden 5 €; съёмка северного склона; 北斜面の測量は; plain English in between. "


def large_text(folder):
    piece = "".join(TEXT + str(i) + "\n" for i in range(1000)).encode()
    (folder / "large.txt").write_bytes(piece * (300_000_000 // len(piece)))


def many_files(folder):
    (folder / "many").mkdir()
    for i in range(20_000):
        (folder / "many" / f"{i}.txt").write_text(TEXT * (i % 20 + 1), encoding="utf-8")


def many_lines(folder):
    numbers = random.Random(1)
    (folder / "lines.txt").write_text("".join(f"line{numbers.randrange(10**9)} {i}\n" for i in range(2_000_000)))


def ten_thousand_files(folder):
    (folder / "many").mkdir()
    for i in range(10_000):
        (folder / "many" / f"{i}.txt").write_text(TEXT * (i % 20 + 1), encoding="utf-8")
    (folder / "open.txt").write_text("open many\n")


def an_empty_folder(folder):
    (folder / "empty").mkdir()


def nothing(_):
    pass


# work, what makes its files, ours, peer, the peer's name, goal. "@" is the tool, "%" the workbench, "&w" the empty
# window; commands run in the folder, by the shell.
ROWS = [
    ("convert 300 MB UTF-8 to UTF-16", large_text, "@ convert --from UTF-8 --to UTF-16 large.txt - >/dev/null",
     "iconv -f UTF-8 -t UTF-16LE large.txt >/dev/null", "iconv", 0.5),
    ("detect 20,000 files", many_files, "find many -type f -print0 | xargs -0 @ detect >/dev/null",
     "find many -type f -print0 | xargs -0 file -i >/dev/null", "file -i", 0.07),
    ("find over /usr", nothing, "@ find /usr >/dev/null", "find /usr ! -type d >/dev/null", "find", 1.3),
    ("sort 2 million lines", many_lines, "@ sort --from ASCII lines.txt >/dev/null",
     "LC_ALL=C.UTF-8 sort --parallel=1 lines.txt >/dev/null", "sort", 0.7),
    ("sort 2 million lines in natural order", many_lines, "@ sort --by number --from ASCII lines.txt >/dev/null",
     "LC_ALL=C.UTF-8 sort -V --parallel=1 lines.txt >/dev/null", "sort -V", 0.6),
    ("--version", nothing, "for i in 1 2 3 4 5 6 7 8 9 10; do @ --version; done >/dev/null",
     "for i in 1 2 3 4 5 6 7 8 9 10; do iconv --version; done >/dev/null", "iconv", 4.0),
    ("workbench: detect and list 10,000 files", ten_thousand_files, "% --script open.txt",
     "find many -type f -print0 | xargs -0 @ detect >/dev/null", "qxtool detect", 1.5),
    ("start of the workbench until its first picture", an_empty_folder, "% empty --picture ours.png",
     "&w theirs.png", "QMainWindow", 0.5),
]


def seconds(command, folder):
    start = time.perf_counter()
    subprocess.run(["sh", "-c", command], cwd=folder, check=True)
    return time.perf_counter() - start


def measure(make, ours, peer):
    folder = pathlib.Path(tempfile.mkdtemp(prefix="qxtool-bench-"))
    try:
        make(folder)
        for command in (ours, peer):
            seconds(command, folder)
        start, pairs = time.perf_counter(), []
        while len(pairs) < MOST_RUNS and (len(pairs) < FEWEST_RUNS or time.perf_counter() - start < PATIENCE):
            pairs.append((seconds(ours, folder), seconds(peer, folder)))
        return [statistics.median(column) for column in zip(*pairs)]
    finally:
        shutil.rmtree(folder, ignore_errors=True)


def main():
    if not 4 <= len(sys.argv) <= 5:
        sys.exit(__doc__)
    programs = dict(zip(("@", "%", "&w"), (str(pathlib.Path(path).resolve()) for path in sys.argv[1:4])))
    lines = []
    for work, make, ours, peer, name, goal in ROWS:
        if not re.search(sys.argv[4] if len(sys.argv) == 5 else ".", work):
            continue
        for mark, program in programs.items():
            ours, peer = ours.replace(mark, program), peer.replace(mark, program)
        mine, theirs = measure(make, ours, peer)
        ratio = mine / theirs
        lines.append([work, name, show(mine * 1e9, "time"), show(theirs * 1e9, "time"), f"{ratio:.3g}", f"at most {goal:g}",
                      "yes" if ratio <= goal else "NO"])
    print_table(["work", "peer", "ours", "peer's", "ratio", "goal", "met"], lines)


main()
