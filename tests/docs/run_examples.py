#!/usr/bin/env python3
"""Runs the examples of a guide and compares what comes out with what the guide shows.

In a block of the kind "console" each line that begins with "$ " is a command, the lines below it are its
output, standard error included. A block "cpp" or "cpp program" is run as the example of that number of the program that
make_program.py made; it must end well, and a block "text" right behind it is its output. "..." alone in a
line stands for any lines. All examples of a guide run in one temporary folder that holds the sample
texts, in the guide's order.

usage: run_examples.py [--update] [--program PROGRAM] GUIDE SAMPLES TOOL [WRAPPER...]
"""

import argparse
import os
import pathlib
import re
import shlex
import shutil
import subprocess
import sys
import tempfile

from guide_blocks import EXAMPLES, blocks

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import wine  # noqa: E402


def matches(expected, actual):
    """Whether the lines agree, where an expected "..." stands for any number of lines."""
    pattern = "".join("(?:.*\n)*" if line == "..." else re.escape(line) + "\n" for line in expected)
    return re.fullmatch(pattern, "".join(line + "\n" for line in actual)) is not None


def output_lines(output):
    lines = output.decode("utf-8", "backslashreplace").replace("\r\n", "\n").split("\n")
    return lines[:-1] if lines[-1] == "" else lines


class Runner:
    """Runs examples, and keeps the guide's lines as they ought to be."""

    def __init__(self, options, lines, work, environment):
        self.options, self.lines, self.work, self.environment = options, lines, work, environment
        self.out, self.done = [], 0
        self.ran = self.failed = 0

    def copy_up_to(self, line):
        self.out += self.lines[self.done : line]
        self.done = line

    def run(self, command):
        return subprocess.run(command, cwd=self.work, env=self.environment, stdin=subprocess.DEVNULL,
                              stdout=subprocess.PIPE, stderr=subprocess.STDOUT, timeout=120)

    def compare(self, line, example, expected, actual):
        """Counts an example, and takes its output into the guide."""
        self.ran += 1
        if matches(expected, actual):
            self.out += expected
            return
        self.failed += 1
        self.out += actual
        if not self.options.update:
            print(f"{self.options.guide}:{line}: {example}")
            print("".join(f"  expected: {one}\n" for one in expected), end="")
            print("".join(f"  came out: {one}\n" for one in actual), end="")

    def run_console(self, block):
        position = block.start
        while position < block.end:
            if not self.lines[position].startswith("$ "):
                raise SystemExit(f"{self.options.guide}:{position + 1}: output without a command")
            last = position + 1
            while last < block.end and not self.lines[last].startswith("$ "):
                last += 1
            self.copy_up_to(position + 1)
            command = self.lines[position]
            actual = output_lines(self.run(["sh", "-c", command[2:]]).stdout)
            self.compare(position + 1, command, self.lines[position + 1 : last], actual)
            self.done = position = last

    def run_cpp(self, number, block, text):
        wrapper = self.options.wrapper
        result = self.run([*wrapper, os.path.abspath(self.options.program), str(number)])
        expected = self.lines[text.start : text.end] if text else []
        actual = output_lines(result.stdout) if text or result.returncode != 0 else []
        if result.returncode != 0:
            actual.append(f"(the example ended with code {result.returncode})")
        if text:
            self.copy_up_to(text.start)
            self.done = text.end
        self.compare(block.start + 1, f"example {number}", expected, actual)


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--update", action="store_true")
    parser.add_argument("--program")
    parser.add_argument("guide")
    parser.add_argument("samples")
    parser.add_argument("tool")
    parser.add_argument("wrapper", nargs="*")
    options = parser.parse_args()

    lines = pathlib.Path(options.guide).read_text(encoding="utf-8").split("\n")
    wine.keep_running(options.wrapper)
    with tempfile.TemporaryDirectory() as folder:
        work = pathlib.Path(folder) / "work"
        shutil.copytree(options.samples, work)
        commands = pathlib.Path(folder) / "bin"
        commands.mkdir()
        for name in ("qxtool", "qxworkbench"):  # which stand in one folder
            program = pathlib.Path(os.path.abspath(options.tool))
            command_line = shlex.join([*options.wrapper, str(program.with_name(program.name.replace("qxtool", name)))])
            (commands / name).write_text(f'#!/bin/sh\nexec {command_line} "$@"\n')
            (commands / name).chmod(0o755)
        # A zone, a locale and a registry of the examples' own.
        environment = dict(os.environ, PATH=f"{commands}:{os.environ['PATH']}", TZ="UTC", LC_ALL="C.UTF-8",
                           QXCORE_REGISTRY=str(pathlib.Path(folder) / "registry.db"))
        runner = Runner(options, lines, work, environment)
        found = [block for block in blocks(lines) if block.kind != "cpp global"]
        examples = 0
        for block, following in zip(found, [*found[1:], None]):
            if block.kind == "console":
                runner.run_console(block)
            elif block.kind in EXAMPLES:
                examples += 1
                runner.run_cpp(examples, block, following if following and following.kind == "text" else None)
        runner.copy_up_to(len(lines))
    if options.update:
        pathlib.Path(options.guide).write_text("\n".join(runner.out), encoding="utf-8")
    elif runner.ran == 0:
        raise SystemExit(f"{options.guide} has no examples")
    print(f"{options.guide}: {runner.ran} examples, {runner.failed} {'changed' if options.update else 'failed'}")
    sys.exit(1 if runner.failed and not options.update else 0)


if __name__ == "__main__":
    main()
