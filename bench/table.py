#!/usr/bin/env python3
"""Runs the benchmarks and prints ours beside the peers', with the goal of each row.

usage: table.py PROGRAM [FILTER]          the table of ratios; FILTER is a regular expression
       table.py --wine PROGRAM LINUX_PROGRAM [FILTER]
                                          our figures under Wine, beside the same rows of the program for Linux

Under Wine each row runs in a process of its own that is ended when it takes longer than a minute, and the whole ends
after five; what was left out is said.

Every figure is the median of the repetitions of one run, in which the benchmarks take turns. The
rows with two threads run in a process of their own: once a process has started a thread, the runtime's
heap and our counters take locks that a program with one thread does without.
"""

import json
import re
import statistics
import subprocess
import sys
import time

REPETITIONS = 5
MIN_TIME = 0.2  # seconds a repetition

# work, peer, kind, goal. Kinds: "time", ours as a part of the peer's time, at most the goal; "speed",
# how many times as fast as the peer, at least the goal; "bytes", ours as a part of the peer's bytes; "processor", ours
# alone, in nanoseconds of processor time.
ROWS = [
    ("copy and drop a shared string", "QString", "time", 1.0),
    ("copy and drop a shared string", "std::shared_ptr", "time", 0.6),
    ("make and drop 40 characters", "std::u16string", "time", 1.0),
    ("make and drop 40 characters", "QString", "time", 0.8),
    ("a + b + c, 10 characters each", "QString", "time", 0.8),
    ("find a word at the end of 1 MB", "std::u16string", "time", 0.3),
    ("find a word at the end of 1 MB, without case", "QString", "time", 1.0),
    ("find a word with k, i and an accent, without case", "QString", "time", 0.3),
    ("CharToOem of 1.6 million characters", "ICU", "time", 2.0),
    ("a million appends of 8 characters", "std::u16string", "time", 1.0),
    ("MD5 of 64 MB", "OpenSSL", "time", 1.05),
    ("allocate and free 48 bytes", "malloc", "time", 1.0),
    ("48 bytes, two threads", "std::mutex", "time", 1.0),
    ("100,000 keys into the string map", "std::map", "time", 0.8),
    ("find in the string map", "std::map", "time", 1.0),
    ("iterate the string map", "std::map", "time", 1.0),
    ("bytes an entry of the string map", "std::map", "bytes", 1.0),
    ("append a million to a table of int", "std::vector", "time", 1.5),
    ("append a million to a table of int, in one call", "std::vector", "time", 1.0),
    ("append a million to a table of strings", "std::vector", "time", 1.2),
    ("push, walk and erase a million list nodes", "std::list", "time", 1.0),
    ("single-byte Read over a 64 MB file", "std::ifstream", "time", 0.4),
    ("64 MB of ASCII through the reader", "memcpy", "speed", 0.5),
    ("64 MB of mixed UTF-8 through the reader", "memcpy", "speed", 0.3),
    ("64 MB of mixed UTF-8 through the reader", "ICU", "speed", 2.0),
    ("64 MB of mixed UTF-8 through the reader", "iconv", "speed", 4.0),
    ("64 MB of UTF-16 through the reader", "memcpy", "speed", 0.5),
    ("64 MB of windows-1252 through the reader", "ICU", "speed", 2.0),
    ("64 MB of Shift-JIS through the reader", "ICU", "speed", 1.0),
    ("detect 64 MB of ASCII", "memcpy", "speed", 0.25),
    ("detect 64 MB of ASCII", "uchardet", "speed", 1.2),
    ("detect 64 MB of mixed UTF-8", "memcpy", "speed", 0.5),
    ("detect 64 MB of mixed UTF-8", "uchardet", "speed", 1.2),
    ("detect 4096 bytes", "ICU", "speed", 200.0),
    ("detect 4096 bytes", "uchardet", "speed", 2.0),
    ("horizontal gradient", "memset", "time", 2.0),
    ("horizontal gradient", "QPainter", "time", 1.7),
    ("vertical gradient", "QPainter", "time", 5.0),
    ("10,000 texts drawn", "QPainter", "time", 0.2),
    ("100,000 text extents", "QFontMetrics", "time", 0.05),
    ("format a time", "strftime", "time", 1.2),
    ("format a time", "QDateTime", "time", 0.5),
    ("100,000 settings read", "QSettings", "time", 6.0),
    ("a setting written", "QSettings", "time", 0.05),
    ("send a message to a plain procedure", "Qt sendEvent", "time", 1.0),
    ("post, get and dispatch 1000 messages", "Qt postEvent", "time", 0.7),
    ("make and destroy 1000 children", "Qt widgets", "time", 0.25),
    ("walk 200,000 files of a tree", "std::filesystem", "time", 2.0),
    ("walk one level of 50,000 files", "std::filesystem", "time", 1.1),
    ("sort 100,000 lines", "std::u16string", "time", 0.8),
    ("sort 100,000 lines in natural order", "strverscmp", "time", 1.0),
    ("join a million strings", "QStringList", "time", 0.7),
    ("split into a million strings", "QString", "time", 0.7),
    ("notify eight sinks", "Qt signal", "time", 1.0),
    ("a million strings in binary form", "QDataStream", "time", 0.45),
    ("list a zip archive of 60,000 entries", "libzip", "time", 0.5),
    ("list a zip archive of 60,000 entries", "minizip", "time", 0.5),
    ("inflate a zip entry of 256 MB", "libzip", "time", 1.2),
    ("read 20,000 small zip entries in sequence", "minizip", "time", 1.0),
    ("merge two font tables of 1,000 entries", "plain loop", "time", 0.1),
    ("RTF to text, 10 MB of real documents", "memcpy", "speed", 0.03),
    ("RTF to text, 10 MB of real documents", "catdoc", "time", 1.0),
    ("RTF to text, 10 MB of real documents", "unrtf", "time", 1.0),
    ("escape 64 MB of plain UTF-16", "memcpy", "speed", 0.5),
    ("escape 64 MB of mixed UTF-16", "memcpy", "speed", 0.1),
    ("unescape 64 MB without escapes", "memcpy", "speed", 0.5),
    ("unescape 64 MB with escapes", "memcpy", "speed", 0.1),
    ("a handled message, three bases down", "virtual call", "time", 3.0),
    ("a handled message, three bases down", "wxWidgets", "time", 0.4),
    ("a handled message, three bases down", "Qt sendEvent", "time", 0.25),
    ("an unhandled message", "virtual call", "time", 2.0),
    ("SendMessage to a handler", "Qt sendEvent", "time", 1.0),
    ("a command through view, frame and application", "wxWidgets", "time", 1.0),
    ("an idle program, ten seconds", None, "processor", 10e6),
    ("lay out a status bar of 20 panes", "QStatusBar", "time", 0.3),
    ("resize a splitter of 16 x 16 panes", "QSplitter", "time", 0.3),
    ("insert 1,000 tabs", "text extents", "time", 2.0),
    ("make the last of 1,000 tabs visible", "QTabBar", "time", 0.3),
]

# What a row may take under Wine, as a multiple of the same row on Linux; the others have no goal.
WINE_GOALS = {
    "detect 64 MB of mixed UTF-8": 1.3,
    "64 MB of mixed UTF-8 through the reader": 1.5,
    "a million appends of 8 characters": 1.5,
    "append a million to a table of int": 1.5,
}
# Under Wine there are no peers but the system's own functions.
WINE_ROWS = [
    ("SendMessage to a handler", "plain procedure", "time", 1.25),
]

TO_NANOSECONDS = {"ns": 1, "us": 1e3, "ms": 1e6, "s": 1e9}


WINE_ROW_SECONDS = 60
WINE_SECONDS = 300


def run_bounded(command, works):
    """As run, row by row on standard error, each and all of them within their time."""
    figures, end = {}, time.monotonic() + WINE_SECONDS
    for number, work in enumerate(works, 1):
        left = min(WINE_ROW_SECONDS, end - time.monotonic())
        if left <= 1:
            print(f"left out, the time is over: {work}", file=sys.stderr)
            continue
        print(f"{number} of {len(works)}: {work}", file=sys.stderr)
        try:
            figures |= run(command, {work}, left, repetitions=3)
        except subprocess.TimeoutExpired:
            print(f"left out, longer than {left:.0f} s: {work}", file=sys.stderr)
    return figures


def run(command, works, seconds=None, repetitions=REPETITIONS, only_ours=False):
    """The median figure of every benchmark, by name: nanoseconds, or bytes where it counts them."""
    if not works:
        return {}
    names = "|".join(re.sub(r"([+.()])", r"[\1]", work) for work in sorted(works))
    options = [
        f"--benchmark_filter=^({names})/{'ours' if only_ours else ''}",
        "--benchmark_format=json",
        f"--benchmark_repetitions={repetitions}",
        f"--benchmark_min_time={MIN_TIME}",
        "--benchmark_enable_random_interleaving=true",
    ]
    output = subprocess.run(command + options, check=True, stdout=subprocess.PIPE, timeout=seconds).stdout
    samples = {}
    for one in json.loads(output)["benchmarks"]:
        if one["run_type"] != "iteration":
            continue
        name = re.sub(r"/(real_time|repeats:\d+|iterations:\d+)", "", one["name"])
        counted = one.get("bytes", one.get("processor_ns"))
        figure = counted if counted is not None else one["real_time"] * TO_NANOSECONDS[one["time_unit"]]
        samples.setdefault(name, []).append(figure)
    return {name: statistics.median(figures) for name, figures in samples.items()}


def show(figure, kind):
    if kind == "bytes":
        return f"{figure:.1f} B"
    for unit, size in (("s", 1e9), ("ms", 1e6), ("us", 1e3)):
        if figure >= size:
            return f"{figure / size:.3g} {unit}"
    return f"{figure:.3g} ns"


def print_table(header, lines):
    widths = [max(len(line[i]) for line in [header] + lines) for i in range(len(header))]
    for line in [header, ["-" * width for width in widths]] + lines:
        print("| " + " | ".join(cell.ljust(width) for cell, width in zip(line, widths)) + " |")


def compare(figures, rows):
    lines = []
    missed = 0
    for work, peer, kind, goal in rows:
        ours, theirs = figures.get(f"{work}/ours"), figures.get(f"{work}/{peer}")
        if kind == "processor" and ours is not None:
            missed += ours > goal
            lines.append([work, "", show(ours, kind), "", "", f"at most {show(goal, kind)}", "yes" if ours <= goal else "NO"])
        if ours is None or theirs is None:
            continue
        ratio = theirs / ours if kind == "speed" else ours / theirs
        met = ratio >= goal if kind == "speed" else ratio <= goal
        missed += not met
        bound = "at least" if kind == "speed" else "at most"
        lines.append([work, peer, show(ours, kind), show(theirs, kind), f"{ratio:.3g}",
                      f"{bound} {goal:g}", "yes" if met else "NO"])
    print_table(["work", "peer", "ours", "peer's", "ratio", "goal", "met"], lines)
    print(f"\nRatios: time and bytes ours / peer's; of goals with \"at least\", speed ours / peer's. "
          f"{len(lines) - missed} of {len(lines)} goals met.")


def compare_under_wine(figures, linux):
    """One table, ours under Wine beside ours on Linux; another, ours beside the peers that a Windows program has."""
    lines = []
    for work in dict.fromkeys(row[0] for row in ROWS):
        ours, there = figures.get(f"{work}/ours"), linux.get(f"{work}/ours")
        if ours is None:
            continue
        ratio, goal = ours / there if there else None, WINE_GOALS.get(work)
        lines.append([work, show(ours, "time"), show(there, "time") if there else "", f"{ratio:.3g}" if ratio else "",
                      f"at most {goal:g}" if goal else "", ("yes" if ratio <= goal else "NO") if goal and ratio else ""])
    print_table(["work", "under Wine", "on Linux", "ratio", "goal", "met"], lines)
    rows = ROWS + WINE_ROWS
    if any(f"{row[0]}/{row[1]}" in figures for row in rows):
        print()
        compare(figures, rows)


def main():
    arguments = sys.argv[1:]
    under_wine = arguments[:1] == ["--wine"]
    programs = [arguments.pop(0) for _ in range(min(len(arguments), 3 if under_wine else 1))][under_wine:]
    if len(programs) != 1 + under_wine or len(arguments) > 1:
        sys.exit(__doc__)
    pattern = arguments[0] if arguments else "."
    works = {row[0] for row in ROWS if re.search(pattern, f"{row[0]}/ours") or re.search(pattern, f"{row[0]}/{row[1]}")}
    if under_wine:
        in_order = [work for work in dict.fromkeys(row[0] for row in ROWS) if work in works]
        figures = run_bounded(["wine", programs[0]], in_order)
        compare_under_wine(figures, run(programs[1:], works & set(WINE_GOALS), only_ours=True))
        return
    threaded = {work for work in works if "two threads" in work}
    compare(run(programs, works - threaded) | run(programs, threaded), ROWS)


if __name__ == "__main__":
    main()
