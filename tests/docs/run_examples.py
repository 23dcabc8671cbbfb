#!/usr/bin/env python3
"""Runs the examples of a guide and compares what comes out with what the guide shows.

An example is a fenced block of the kind "console": each line that begins with "$ " is a command, the
lines below it are its output, standard error included. "..." alone in a line stands for any lines.
All examples of a guide run in one temporary folder that holds the sample texts, in the guide's order.

usage: run_examples.py [--update] GUIDE SAMPLES TOOL [WRAPPER...]
"""

import os
import pathlib
import re
import shlex
import shutil
import subprocess
import sys
import tempfile

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import wine  # noqa: E402


def matches(expected, actual):
    """Whether the lines agree, where an expected "..." stands for any number of lines."""
    pattern = "".join("(?:.*\n)*" if line == "..." else re.escape(line) + "\n" for line in expected)
    return re.fullmatch(pattern, "".join(line + "\n" for line in actual)) is not None


def blocks(lines):
    """(first line, line behind the last) of the inside of each console block."""
    start = None
    for number, line in enumerate(lines):
        if start is None and line.rstrip() == "```console":
            start = number + 1
        elif start is not None and line.rstrip() == "```":
            yield start, number
            start = None
    if start is not None:
        raise SystemExit("a console block has no end")


def main():
    arguments = sys.argv[1:]
    update = arguments[:1] == ["--update"]
    guide, samples, *tool = arguments[1:] if update else arguments
    lines = pathlib.Path(guide).read_text(encoding="utf-8").split("\n")
    wine.keep_running(tool[1:])
    wrapped = [os.path.abspath(tool[0]), *tool[1:]]
    command_line = shlex.join(wrapped[1:] + wrapped[:1])
    ran = failed = 0
    out = []
    with tempfile.TemporaryDirectory() as folder:
        work = pathlib.Path(folder) / "work"
        shutil.copytree(samples, work)
        commands = pathlib.Path(folder) / "bin"
        commands.mkdir()
        (commands / "qxtool").write_text(f'#!/bin/sh\nexec {command_line} "$@"\n')
        (commands / "qxtool").chmod(0o755)
        environment = dict(os.environ, PATH=f"{commands}:{os.environ['PATH']}")
        done = 0
        for start, end in blocks(lines):
            out += lines[done:start]
            position = start
            while position < end:
                if not lines[position].startswith("$ "):
                    raise SystemExit(f"{guide}:{position + 1}: output without a command")
                command = lines[position][2:]
                last = position + 1
                while last < end and not lines[last].startswith("$ "):
                    last += 1
                expected = lines[position + 1 : last]
                result = subprocess.run(["sh", "-c", command], cwd=work, env=environment, stdin=subprocess.DEVNULL,
                                        stdout=subprocess.PIPE, stderr=subprocess.STDOUT, timeout=120)
                actual = result.stdout.decode("utf-8", "backslashreplace").replace("\r\n", "\n").split("\n")
                if actual[-1] == "":
                    actual.pop()
                ran += 1
                out.append(lines[position])
                if matches(expected, actual):
                    out += expected
                else:
                    failed += 1
                    out += actual
                    if not update:
                        print(f"{guide}:{position + 1}: $ {command}")
                        for line in expected:
                            print(f"  expected: {line}")
                        for line in actual:
                            print(f"  came out: {line}")
                position = last
            done = end
        out += lines[done:]
    if update:
        pathlib.Path(guide).write_text("\n".join(out), encoding="utf-8")
    elif ran == 0:
        raise SystemExit(f"{guide} has no examples")
    print(f"{guide}: {ran} examples, {failed} {'changed' if update else 'failed'}")
    sys.exit(1 if failed and not update else 0)


if __name__ == "__main__":
    main()
