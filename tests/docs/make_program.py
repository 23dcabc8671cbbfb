#!/usr/bin/env python3
"""Makes one program of all C++ examples of a guide; called with a number it runs that example.

Every cpp block becomes a function of its own, and so does the main function of a "cpp program" block;
#include lines and "cpp global" blocks go to the top. The examples may call Print, which writes a text or a number and ends the line.

usage: make_program.py GUIDE OUT.cpp
"""

import pathlib
import re
import sys

from guide_blocks import blocks

PRELUDE = """\
#include <cstdio>
#include <cstdlib>
#include <vector>

#include "qxcore/qxcore.h"

[[maybe_unused]] static void Print(const SString& text) {
  std::vector<char> utf8(3 * static_cast<std::size_t>(text.Length()) + 1);
  ST2UTF8Helper(utf8.data(), text, text.Length());
  std::printf("%s\\n", utf8.data());
}
[[maybe_unused]] static void Print(long long number) { std::printf("%lld\\n", number); }
[[maybe_unused]] static void Print(long number) { std::printf("%ld\\n", number); }
[[maybe_unused]] static void Print(int number) { std::printf("%d\\n", number); }
"""


def main():
    guide, out = sys.argv[1:]
    lines = pathlib.Path(guide).read_text(encoding="utf-8").split("\n")
    includes, code, count = [], [], 0
    for block in blocks(lines):
        if not block.kind.startswith("cpp"):
            continue
        inside = lines[block.start : block.end]
        includes += [line for line in inside if line.startswith("#include")]
        rest = [line if not line.startswith("#include") else "" for line in inside]
        code.append(f'#line {block.start + 1} "{guide}"')
        if block.kind == "cpp global":
            code += rest
        elif block.kind == "cpp program":
            count += 1
            code += [re.sub(r"^int main\(\)", f"static int Program{count}()", line) for line in rest]
            code.append(f"static void Example{count}() {{ std::exit(Program{count}()); }}")
        else:
            count += 1
            code += [f"static void Example{count}() {{", f'#line {block.start + 1} "{guide}"', *rest, "}"]
    if count == 0:
        raise SystemExit(f"{guide} has no C++ examples")
    calls = ", ".join(f"Example{number}" for number in range(1, count + 1))
    main_function = [
        "int main(int, char** arguments) {",
        f"  void (*const examples[])() = {{{calls}}};",
        "  examples[std::atoi(arguments[1]) - 1]();",
        "}",
        "",
    ]
    text = "\n".join([*includes, PRELUDE, *code, *main_function])
    pathlib.Path(out).write_text(text, encoding="utf-8")


if __name__ == "__main__":
    main()
