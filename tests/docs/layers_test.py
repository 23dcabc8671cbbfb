#!/usr/bin/env python3
"""Compares the arrows between folders that docs/architecture.md draws with the includes, and finds circles.

usage: layers_test.py SOURCE_DIR [--update]

The document's block that begins with ```layers has a line a layer: its folders below qxcore/, an arrow, and the layers
that they include. A folder without a line belongs to the nearest folder above it. --update writes the arrows anew.

Layers form no circle, headers form none, and neither do files, a file being a header with the source of its name;
only where objects of one system know each other (see KNIT) the sources may.
"""

import pathlib
import re
import sys

BLOCK = re.compile(r"^```layers\n(.*?)^```$", re.M | re.S)
INCLUDE = re.compile(r'^#\s*include "qxcore/([^"]+)"', re.M)
# Windows, menus, frames and device contexts make, paint and end each other: their sources include each other's headers.
KNIT = ("ui/", "platform/posix/window/", "platform/posix/draw/", "platform/posix/controls/")


def file_of(path):
    """The header and the source of one name are one file, and so is win32.h with its pieces."""
    return "platform/win32" if path.startswith("platform/win32/") else path.rpartition(".")[0]


def read_includes(root, suffixes):
    includes = {}
    for path in sorted(path for path in root.rglob("*") if path.suffix in suffixes):
        name = path.relative_to(root).as_posix()
        found = {file_of(included) for included in INCLUDE.findall(path.read_text(encoding="utf-8"))}
        includes.setdefault(file_of(name), set()).update(found - {file_of(name)})
    includes.pop("qxcore", None)  # the umbrella includes everything
    return includes


def circles(graph):
    """The groups of nodes that reach each other (Tarjan's strongly connected components)."""
    number, lowest, stack, found = {}, {}, [], []

    def visit(node):
        number[node] = lowest[node] = len(number)
        stack.append(node)
        for following in sorted(graph.get(node, ())):
            if following not in number:
                visit(following)
            if following in stack:
                lowest[node] = min(lowest[node], lowest[following])
        if lowest[node] == number[node]:
            group = stack[stack.index(node) :]
            del stack[stack.index(node) :]
            if len(group) > 1:
                found.append(sorted(group))

    for node in sorted(graph):
        if node not in number:
            visit(node)
    return found


def layer_of(file, layers):
    folder = file.rpartition("/")[0]
    while folder and not any(folder in layer for layer in layers):
        folder = folder.rpartition("/")[0]
    return next((layer for layer in layers if folder in layer), (file.partition("/")[0],))


def arrows(includes, layers):
    drawn = {layer: set() for layer in layers}
    for file, others in includes.items():
        own = layer_of(file, layers)
        drawn.setdefault(own, set()).update(layer_of(other, layers) for other in others)
    return {layer: others - {layer} for layer, others in drawn.items()}


def as_text(drawn):
    order = list(drawn)
    width = max(len(", ".join(layer)) for layer in order)
    lines = []
    for layer, others in drawn.items():
        targets = "; ".join(", ".join(other) for other in sorted(others, key=order.index))
        lines.append(f"{', '.join(layer):<{width}} -> {targets}".rstrip())
    return "".join(line + "\n" for line in lines)


def main():
    source = pathlib.Path(sys.argv[1]).resolve()
    sys.setrecursionlimit(10000)
    document = source / "docs/architecture.md"
    text = document.read_text(encoding="utf-8")
    block = BLOCK.search(text)
    if not block:
        sys.exit("docs/architecture.md has no ```layers block")
    layers = [tuple(line.split("->")[0].strip().split(", ")) for line in block.group(1).splitlines()]
    files = read_includes(source / "qxcore", (".h", ".cpp", ".inc"))
    drawn = arrows(files, layers)
    if "--update" in sys.argv:
        document.write_text(text[: block.start(1)] + as_text(drawn) + text[block.end(1) :], encoding="utf-8")
    elif as_text(drawn) != block.group(1):
        sys.exit(f"docs/architecture.md draws\n{block.group(1)}and the includes say (--update writes it)\n{as_text(drawn)}")
    loose = {file: others for file, others in files.items() if not file.startswith(KNIT)}
    found = circles(drawn) + circles(read_includes(source / "qxcore", (".h",))) + circles(loose)
    if found:
        sys.exit("circles:\n" + "\n".join(f"  {group}" for group in found))
    print(f"{len(files)} files in {len(layers)} layers, no circles")


if __name__ == "__main__":
    main()
