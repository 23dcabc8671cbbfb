#!/usr/bin/env python3
"""Lists the public functions and members whose name is called in no test.

usage: untested.py LIBRARY TESTS
LIBRARY is the shared library of Linux, whose exported names are looked at; TESTS the folder of the tests. Overloads are
not told apart. The exit status is 1 when something is listed.
"""

import pathlib
import re
import subprocess
import sys

# A name behind a type, or at the beginning of a line, as constructors are; not one behind these words.
DECLARED = re.compile(r"(?:^\s*|([\w>:&*]+)\s+[&*]*)(\w+)\(")
CALLS = ("return", "new", "throw", "else", "case")
SPECIAL = re.compile(r"^(vtable|typeinfo|VTT|guard variable|non-virtual thunk|virtual thunk|construction vtable)")


def exported(library):
    """Qualified names of functions, without arguments. The platform's own have C linkage and are left out: they are
    called through the library."""
    listed = subprocess.run(["nm", "-DC", "--defined-only", library], capture_output=True, text=True, check=True).stdout
    names = set()
    for line in listed.splitlines():
        _, kind, name = line.split(" ", 2)
        if kind not in "TW" or "(" not in name or SPECIAL.match(name) or name.startswith("std::"):
            continue
        name = re.sub(r"\[abi:\w+\]|<[^<>]*(<[^<>]*>[^<>]*)*>", "", name).split("(")[0].split(" ")[-1]
        if not re.search(r"operator|~", name):
            names.add(name)
    return names


def published(headers):
    """The functions that the installed headers offer: (class or "", name), those of private and protected parts left out."""
    offered = set()
    for path in pathlib.Path(headers).rglob("*.h"):
        if "internal" in path.parts or "posix" in path.parts or "win32" in path.parts:
            continue
        scopes = []  # (class, its part is public) by depth of braces
        waiting = None
        for line in path.read_text(encoding="utf-8").splitlines():
            line = re.sub(r'"(\\.|[^"\\])*"|//.*', "", line)
            if begin := re.match(r"\s*(class|struct) (?:QXCORE_API )?(\w+)[^;(]*$", line):
                waiting = (begin[2], begin[1] == "struct")
            elif scopes and (access := re.match(r"\s*(?:(public|protected|private):|QXCORE_DECLARE_\w*CLASS\()", line)):
                scopes[-1] = (scopes[-1][0], access[1] in ("public", None))  # the macros of class records end in a public part
            if all(is_public for _, is_public in scopes):
                name = next((name for name, _ in reversed(scopes) if name), "")
                for before, member in re.findall(DECLARED, line):
                    if member == name if before == "" else before not in CALLS:
                        offered.add((name, member))
            for brace in re.findall(r"[{}]", line):
                if brace == "{":
                    scopes.append(waiting or ("", True))
                    waiting = None
                elif scopes:
                    scopes.pop()
    return offered


def called(tests):
    words = set()
    for path in pathlib.Path(tests).rglob("*"):
        if path.suffix in (".cpp", ".h", ".md"):
            words.update(re.findall(r"\w+", path.read_text(encoding="utf-8", errors="replace")))
    return words


def main():
    library, tests = sys.argv[1:]
    words, offered = called(tests), published(pathlib.Path(__file__).resolve().parents[2] / "qxcore")
    missing = []
    for name in sorted(exported(library)):
        last = name.split("::")[-1]
        if (name.split("::")[-2] if "::" in name and not name.startswith("platform::") else "", last) not in offered:
            continue
        # A client may write the name of a member that the Windows headers change without its W.
        if last not in words and (not last.endswith("W") or last[:-1] not in words):
            missing.append(name)
    print("\n".join(missing) if missing else "every exported name is called in a test")
    sys.exit(1 if missing else 0)


main()
