#!/usr/bin/env python3
"""Compares the functions of the installed headers with what the library exports.

usage: exports_test.py SOURCE_DIR BUILD_DIR LIBRARY [--update]

A function that a header declares and the library does not export cannot be linked; one that is exported and
stands in no installed header is nobody's interface. The exported functions stand in one sorted list a subsystem,
exports/SUBSYSTEM.txt, which is compared as well, so that growth is seen; --update writes it (on Linux). The
Windows library must export the same names; only the system's own, which the portable layer has, are not there.
"""

import pathlib
import re
import subprocess
import sys
import tempfile
import xml.etree.ElementTree as ElementTree

LISTS = pathlib.Path(__file__).resolve().parent / "exports"
# The hooks by which tests make memory fail, of qxcore/core/internal/memory_failures.h, which is not installed.
HOOKS = {"SMemFailAt", "SMemHasFailed", "SMemMustFail"}
# Members that the macros of class records, exceptions and message maps declare.
OF_MACROS = {"GetClassInfoW", "CreateObject", "GetExceptionName", "GetMessageMap", "_GetBaseMessageMap"}
DOXYGEN = """
@INCLUDE = docs/Doxyfile
INPUT = {headers}
EXCLUDE_PATTERNS = {excluded}
INCLUDE_PATH = {headers}
OUTPUT_DIRECTORY = {out}
GENERATE_HTML = NO
GENERATE_XML = YES
XML_PROGRAMLISTING = NO
EXTRACT_ALL = YES
EXTRACT_PRIVATE = YES
EXTRACT_STATIC = YES
WARNINGS = NO
WARN_IF_DOC_ERROR = NO
WARN_IF_UNDOCUMENTED = NO
WARN_AS_ERROR = NO
PREDEFINED += {defines}
"""


def run(command, **options):
    return subprocess.run([str(part) for part in command], check=True, stdout=subprocess.PIPE, **options).stdout.decode("utf-8")


def without_arguments(text):
    """The name in front of template arguments and parameters: both may hold names and brackets of their own."""
    if "operator()" in text:
        return text[: text.index("operator()")] + "operator()"
    operator = re.search(r"\boperator\s*(<=>|<<=?|>>=?|<=?|>=?|->|[^\s(<]+|\s[\w: *&]+)", text)
    if operator:
        return without_template(text[: operator.start()]) + re.sub(r"\s+", " ", operator.group(0)).strip()
    return without_template(text.split("(")[0])


def without_template(text):
    previous = None
    while previous != text:
        previous, text = text, re.sub(r"<[^<>]*>", "", text)
    return text.split(" ")[-1]


class Function:
    def __init__(self, subsystem):
        self.subsystem, self.must_link = subsystem, False


def subsystem_of(element):
    found = re.search(r"qxcore/(\w+)/", element.find("location").get("file"))
    return found.group(1) if found else "qxcore"


def declared(source, build, headers, is_windows):
    """Every function of the headers by its qualified name, and the subsystem of every class."""
    with tempfile.TemporaryDirectory(dir=build) as out:
        excluded = "*/platform/win32*" if is_windows else "*/nothing*"
        defines = "_WIN32 UNICODE" if is_windows else "__GNUC__"
        configuration = DOXYGEN.format(headers=headers, out=out, excluded=excluded, defines=defines)
        run(["doxygen", "-"], cwd=source, input=configuration.encode(), stderr=subprocess.DEVNULL)
        functions, classes = {}, {}
        for path in (pathlib.Path(out) / "xml").glob("*.xml"):
            for compound in ElementTree.parse(path).getroot().findall("compounddef"):
                if compound.get("kind") in ("class", "struct"):
                    classes[compound.findtext("compoundname")] = subsystem_of(compound)
                for member in compound.iter("memberdef"):
                    if member.get("kind") == "function":
                        add(functions, compound, member)
        return functions, classes


def add(functions, compound, member):
    kind = compound.get("kind")
    scope = compound.findtext("compoundname") + "::" if kind in ("class", "struct", "namespace") else ""
    name = without_template(scope + "x")[:-1] + member.findtext("name")
    arguments = member.findtext("argsstring") or ""
    is_template = member.find("templateparamlist") is not None or "<" in scope or compound.find("templateparamlist") is not None
    links = (
        member.get("inline") == "no"
        and not is_template
        and member.get("virt") != "pure-virtual"
        and not re.search(r"=\s*(0|delete|default)\s*$", arguments)
        and "constexpr" not in (member.findtext("type") or "")
    )
    functions.setdefault(name, Function(subsystem_of(member))).must_link |= links


def exported_linux(library):
    names = []
    for line in run(["nm", "-DC", "--defined-only", library]).splitlines():
        kind, _, text = line[17:].partition(" ")
        if kind == "T" and "(" in text and not text.startswith(("non-virtual thunk", "virtual thunk")):
            names.append(re.sub(r"\[abi:\w+\]", "", text))
    return names


def exported_windows(library):
    listing = run(["i686-w64-mingw32-objdump", "-p", library])
    table = listing[listing.index("[Ordinal/Name Pointer] Table") :]
    mangled = re.findall(r"^\s*\[\s*\d+\](?:\s+\+base\[\s*\d+\])?\s+(?:[0-9a-f]+\s+)?(\S+)$", table, re.M)
    text = run(["c++filt", "-n"], input="\n".join(f"_{name}" if name.startswith("Z") else name for name in mangled).encode())
    names = re.sub(r"\[abi:\w+\]", "", text).splitlines()
    return [name for name in names if "(" in name and "thunk to" not in name]


def is_implicit(name, classes):
    """A member that the compiler makes for an exported class, or a macro, or a hook of the tests."""
    scope, _, last = name.rpartition("::")
    made = last in (scope.split("::")[-1], "operator=") or last.startswith("~")
    return name in HOOKS or last in OF_MACROS or (scope in classes and made)


def main():
    source, build, library = (pathlib.Path(argument).resolve() for argument in sys.argv[1:4])
    is_windows = library.suffix == ".dll"
    with tempfile.TemporaryDirectory(dir=build) as prefix:
        run(["cmake", "--install", build, "--component", "dev", "--prefix", prefix])
        functions, classes = declared(source, build, pathlib.Path(prefix) / "include", is_windows)
    exported = exported_windows(library) if is_windows else exported_linux(library)
    names = {without_arguments(text) for text in exported}
    problems = [f"declared in an installed header, not exported: {name}" for name, function in functions.items()
                if function.must_link and name not in names]
    problems += [f"exported, in no installed header: {name}" for name in names
                 if name not in functions and not is_implicit(name, classes)]
    if is_windows:
        listed = {without_arguments(line) for path in LISTS.glob("*.txt") if path.stem != "platform"
                  for line in path.read_text(encoding="utf-8").splitlines()}
        problems += [f"exported on Linux only: {name}" for name in listed - names]
    else:
        problems += compare_lists(exported, functions, classes, "--update" in sys.argv)
    if problems:
        sys.exit("\n".join(sorted(problems)))
    print(f"{len(names)} exported names, {len(functions)} in the headers")


def compare_lists(exported, functions, classes, updates):
    lists = {}
    for text in exported:
        name = without_arguments(text)
        scope = name.rpartition("::")[0]
        while scope and scope not in classes:
            scope = scope.rpartition("::")[0]
        subsystem = functions[name].subsystem if name in functions else classes.get(scope, "core")
        lists.setdefault(subsystem, set()).add(text)
    problems = []
    LISTS.mkdir(exist_ok=True)
    for path in LISTS.glob("*.txt") if updates else ():
        path.unlink()
    for subsystem, texts in lists.items():
        path = LISTS / f"{subsystem}.txt"
        if updates:
            path.write_text("".join(f"{text}\n" for text in sorted(texts)), encoding="utf-8")
        listed = set(path.read_text(encoding="utf-8").splitlines()) if path.exists() else set()
        problems += [f"exported, not listed in exports/{path.name} (./dev exports lists it): {text}" for text in texts - listed]
        problems += [f"listed in exports/{path.name}, no longer exported: {text}" for text in listed - texts]
    return problems


if __name__ == "__main__":
    main()
