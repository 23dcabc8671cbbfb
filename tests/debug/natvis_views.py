#!/usr/bin/env python3
"""Turns a natvis file into C++, so that a compiler reads what a debugger would read.

usage: natvis_views.py NATVIS HEADER
Each type of the file becomes a class derived from a sample of it, and each of its expressions a function of that
class (or of one derived from the nodes that it walks over): one that names no member does not compile.
"""

import re
import sys
import xml.etree.ElementTree as ElementTree

# For each type a name, the sample, and what stands for $T1, $T2.
SAMPLES = {
    "SString": ("Text", "SString"),
    "SStringBuffer": ("Buffer", "SStringBuffer"),
    "STime": ("Time", "STime"),
    "STable<*>": ("Table", "STable<int>", "int"),
    "STableDumb<*>": ("DumbTable", "STableDumb<int>", "int"),
    "STableMem<*>": ("MemTable", "STableMem<SString>", "SString"),
    "SStringTable": ("Texts", "SStringTable"),
    "SList<*>": ("List", "SList<int>", "int"),
    "SMap<*>": ("Map", "SMap<int, SString>", "int", "SString"),
    "SMapEntry<*>": ("Entry", "SMapEntry<int, SString>", "int", "SString"),
}
OF_NODES = {"NextPointer", "LeftPointer", "RightPointer", "ValueNode"}


def closing(text, start):
    """The place of the bracket that closes the one at `start`."""
    depth = 0
    for place in range(start, len(text)):
        depth += (text[place] in "([{") - (text[place] in ")]}")
        if depth == 0:
            return place
    sys.exit(f"no bracket closes: {text[start:]}")


def in_braces(text):
    """The expressions of a text that is displayed; doubled braces stand for themselves."""
    text = text.replace("{{", "").replace("}}", "")
    expressions = []
    while "{" in text:
        start = text.index("{")
        end = closing(text, start)
        expressions.append(text[start + 1 : end])
        text = text[end + 1 :]
    return expressions


def with_length(name, text):
    """An expression, and behind it perhaps a format with the number of characters."""
    expression, _, form = text.partition(",")
    yield name, expression
    if form.startswith("["):
        yield name + "Length", form[1 : closing(form, 0)]


def expressions_of(element):
    """The named expressions of an element and of all below it."""
    displayed = list(element.iter("DisplayString"))
    for number, expression in enumerate(expression for shown in displayed for expression in in_braces(shown.text)):
        yield from with_length(f"Shown{number}", expression)
    for number, condition in enumerate(shown.get("Condition") for shown in displayed if shown.get("Condition")):
        yield f"Condition{number}", condition
    for shown in element.iter("StringView"):
        yield from with_length("StringView", shown.text)
    for item in element.iter("Item"):
        yield "Item_" + re.sub(r"\W", "", item.get("Name")), item.text
    for part in element.iter():
        if part.tag.endswith(("Pointer", "Node", "Size")):
            yield part.tag, part.text
        if part.get("Condition") and part.tag.endswith("Items"):
            yield "HasItems", part.get("Condition")


def view_of(element):
    name, sample, *arguments = SAMPLES.get(element.get("Name")) or sys.exit(f"no sample of {element.get('Name')}")
    functions = {"": [], "Node": []}
    for function, expression in expressions_of(element):
        for number, argument in enumerate(arguments, 1):
            expression = expression.replace(f"$T{number}", argument)
        functions["Node" if function in OF_NODES else ""].append(
            f"  decltype(auto) {function}() {{ return ({expression}); }}\n")
    view = f"struct {name} : {sample} {{\n{''.join(functions[''])}}};\n"
    if functions["Node"]:
        head = f"std::remove_pointer_t<std::remove_reference_t<decltype(std::declval<{name}&>().HeadPointer())>>"
        view += f"struct {name}Node : {head} {{\n{''.join(functions['Node'])}}};\n"
    return view


def main():
    natvis, header = sys.argv[1:]
    text = re.sub(r' xmlns="[^"]*"', "", open(natvis, encoding="utf-8").read())
    types = ElementTree.fromstring(text.encode()).findall("Type")
    if missing := SAMPLES.keys() - {element.get("Name") for element in types}:
        sys.exit(f"natvis has no type {sorted(missing)}")
    with open(header, "w", encoding="utf-8") as out:
        out.write("// Made of the natvis file; see natvis_views.py.\nnamespace natvis {\n")
        out.writelines(view_of(element) for element in types)
        out.write("}  // namespace natvis\n")


if __name__ == "__main__":
    main()
