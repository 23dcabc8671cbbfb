"""Compiles a source once as it is, which must succeed, and once for each of its cases, which must fail.

A case is a block of the source that only counts when its name is defined; its comment holds the words that the
compiler's message must contain, so that it fails for the right reason.
"""

import re
import subprocess
import sys

root, source, compiler = sys.argv[1:]
command = [compiler, "-std=c++20", "-fsyntax-only", f"-I{root}", "-DUNICODE", "-D_UNICODE", source]
failures = []


def compile_with(*options):
    return subprocess.run([*command, *options], capture_output=True, text=True, timeout=300)


result = compile_with()
if result.returncode != 0:
    failures.append("the source without a case does not compile:\n" + result.stderr)
with open(source, encoding="utf-8") as file:
    cases = re.findall(r"^#ifdef (CASE_\w+)  // (.*)$", file.read(), re.MULTILINE)
if len(cases) < 8:
    failures.append(f"only {len(cases)} cases were found")
for name, words in cases:
    result = compile_with(f"-D{name}")
    if result.returncode == 0:
        failures.append(f"{name} compiles")
    elif words not in result.stderr:
        failures.append(f"{name} fails, but not with '{words}':\n{result.stderr[:2000]}")
print("\n".join(failures))
sys.exit(1 if failures else 0)
