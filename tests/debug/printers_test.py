#!/usr/bin/env python3
"""Stops a program in gdb and compares what the printers show. usage: printers_test.py PRINTERS PROGRAM"""

import shutil
import subprocess
import sys

EXPECTED = {
    "empty": '""',
    "text": '"Größe 漢 🙂"',
    "buffer": '"built"',
    "table": 'STable<SString> of 2 = {"one", "two"}',
    "numbers": "STableDumb<int> of 3 = {3, 1, 2}",
    "none": "STableDumb<int> of 0",
    "strings": 'STableMem<SString> of 1 = {"three"}',
    "list": "of 2 = {7, 8}",
    "map": 'SMap of 2 = {[1] = "a", [2] = "b"}',
    "order": "SUnsortedMap of 2 = {[2] = 20, [1] = 10}",
    "byReference": 'SMap of 2 = {[1] = "a", [2] = "b"}',
    "place": "}",
    "texts": 'SStringTable of 2 = {"first", "second"}',
    "time": "STime 1970-01-02 00:00:00 UTC",
    "names": 'SStringMap of 1 = {["key"] = "value"}',
}


def main():
    printers, program = sys.argv[1:]
    if not shutil.which("gdb"):
        print("left out: the debugger's printers, because gdb is not installed")
        return
    command = ["gdb", "-nx", "-batch", "-ex", "set charset UTF-8", "-ex", "set debuginfod enabled off", "-ex", f"source {printers}",
               "-ex", "break StopHere", "-ex", "run", "-ex", "up"]
    for name in EXPECTED:
        command += ["-ex", f'printf "@{name}: "', "-ex", f"print {name}"]
    result = subprocess.run(command + [program], capture_output=True, timeout=120, env={"LC_ALL": "C.UTF-8", "PATH": "/usr/bin:/bin"})
    text = result.stdout.decode("utf-8", "replace")
    shown = {part.split(": ", 1)[0]: part.split(": ", 1)[1].split("\n")[0] for part in text.split("@")[1:] if ": " in part}
    wrong = [f"{name}: expected {wanted}, shown {shown.get(name)}" for name, wanted in EXPECTED.items() if not shown.get(name, "").endswith(wanted)]
    if wrong:
        print(text + result.stderr.decode("utf-8", "replace"))
        sys.exit("\n".join(wrong))
    print(f"{len(EXPECTED)} variables shown")


if __name__ == "__main__":
    main()
