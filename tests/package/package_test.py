#!/usr/bin/env python3
"""Installs the package, moves the folder, builds samples/hello against it and runs that.

usage: package_test.py (cmake|pkgconfig|imports) SOURCE_DIR BUILD_DIR [TOOLCHAIN_FILE]

With a toolchain file everything is cross-built for Windows and runs under Wine with nothing but the
moved folder to find DLLs in.
"""

import os
import pathlib
import re
import shutil
import subprocess
import sys

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import wine  # noqa: E402

SAMPLE = "utf16le-bom-japanese.txt"

# What a Windows system has; everything else that a program needs must lie in our bin folder.
SYSTEM_DLLS = {"advapi32.dll", "comctl32.dll", "gdi32.dll", "kernel32.dll", "msvcrt.dll", "ole32.dll", "shell32.dll", "user32.dll"}


def run(command, **options):
    print("+", " ".join(str(part) for part in command), flush=True)
    result = subprocess.run([str(part) for part in command], stdout=subprocess.PIPE, stderr=subprocess.PIPE, timeout=600, **options)
    if result.returncode != 0:
        sys.stdout.write(result.stdout.decode("utf-8", "replace") + result.stderr.decode("utf-8", "replace"))
        sys.exit(f"failed with exit code {result.returncode}: {command[0]}")
    return result.stdout


def installed(build, work):
    """The package, installed into one folder and moved to another."""
    first, moved = work / "installed", work / "moved here"
    run(["cmake", "--install", build, "--prefix", first])
    first.rename(moved)
    return moved


def check_output(output, expected):
    text = output.decode("utf-8").replace("\r\n", "\n")
    if not text.startswith("Unicode") or expected not in text:
        sys.exit(f"the program printed:\n{text}\nand not the text of {SAMPLE}")


def imports(path):
    listing = run(["i686-w64-mingw32-objdump", "-p", path]).decode()
    return {name.lower() for name in re.findall(r"DLL Name: (\S+)", listing)}


def main():
    kind, source, build, *toolchain = sys.argv[1:]
    source, build = pathlib.Path(source), pathlib.Path(build)
    work = build / f"package-{kind}"
    shutil.rmtree(work, ignore_errors=True)
    work.mkdir()
    wine.keep_running(["wine"] if toolchain and kind == "cmake" else [])
    package = installed(build, work)
    sample = source / "samples/texts/files" / SAMPLE
    expected = sample.read_bytes().decode("utf-16").replace("\r\n", "\n")
    environment = dict(os.environ)

    if kind == "imports":
        shipped = {path.name.lower() for path in (package / "bin").iterdir() if path.suffix == ".dll"}
        for program in (path for path in (package / "bin").iterdir() if path.suffix in (".dll", ".exe")):
            strangers = imports(program) - shipped - SYSTEM_DLLS
            if strangers:
                sys.exit(f"{program.name} needs {sorted(strangers)}, which nobody ships")
        if "qxcore11e.dll" not in shipped:
            sys.exit("the library is not in the package")
    elif kind == "cmake":
        configure = ["cmake", "-S", source / "samples/hello", "-B", work / "hello", f"-Dqxcore11e_DIR={package}/lib/cmake/qxcore11e",
                     "-DCMAKE_BUILD_TYPE=Release", "-G", "Ninja"]
        run(configure + [f"-DCMAKE_TOOLCHAIN_FILE={path}" for path in toolchain])
        run(["cmake", "--build", work / "hello"])
        if toolchain:
            environment["WINEPATH"] = run(["winepath", "-w", package / "bin"]).decode().strip()
            check_output(run(["wine", work / "hello/hello.exe", sample], env=environment), expected)
        else:
            check_output(run([work / "hello/hello", sample]), expected)
    elif kind == "pkgconfig":
        environment["PKG_CONFIG_PATH"] = f"{package}/lib/pkgconfig"
        # The quoting in the flags is for a shell: a folder's name may hold a blank.
        run(["sh", "-c", 'eval "${CXX:-c++} -std=c++20 -o \\"$2\\" \\"$1\\" $(pkg-config --cflags --libs qxcore11e)"', "sh",
             source / "samples/hello/hello.cpp", work / "hello"], env=environment)
        environment["LD_LIBRARY_PATH"] = f"{package}/lib"
        check_output(run([work / "hello", sample], env=environment), expected)
    else:
        sys.exit(__doc__)


if __name__ == "__main__":
    main()
