#!/usr/bin/env python3
"""Takes the examples out of the headers, so that the tests beside this file can compile and run them.

usage: header_examples.py SOURCE_DIR OUT_DIR

An example stands in a header's comment between "// ```cpp" and "// ```"; qxcore/core/error_cause.h's becomes
OUT_DIR/core_error_cause.inc. One that no test includes is an error.
"""

import pathlib
import re
import sys

EXAMPLE = re.compile(r"^// ```cpp\n((?://.*\n)*?)// ```$", re.M)


def main():
    source, out = map(pathlib.Path, sys.argv[1:])
    out.mkdir(parents=True, exist_ok=True)
    test = "".join(path.read_text(encoding="utf-8") for path in pathlib.Path(__file__).parent.glob("*_test.cpp"))
    missing = []
    for header in sorted((source / "qxcore").rglob("*.h")):
        text = header.read_text(encoding="utf-8")
        example = EXAMPLE.search(text)
        if example is None:
            continue
        name = header.relative_to(source / "qxcore").with_suffix("").as_posix().replace("/", "_") + ".inc"
        if f'#include "{name}"' not in test:
            missing.append(f"{header}: no test in tests/docs includes {name}")
        line = text[: example.start(1)].count("\n") + 1
        code = re.sub(r"^// ?", "", example.group(1), flags=re.M)
        made = f'#line {line} "{header}"\n{code}'
        path = out / name
        if not path.exists() or path.read_text(encoding="utf-8") != made:
            path.write_text(made, encoding="utf-8")
    if missing:
        sys.exit("\n".join(missing))


if __name__ == "__main__":
    main()
