#!/usr/bin/env python3
"""Installs the package, moves the folder, builds the samples against it and runs them.

usage: package_test.py (cmake|pkgconfig|imports|headers) SOURCE_DIR BUILD_DIR [TOOLCHAIN_FILE]

headers: every installed header compiles alone, and all of them in either order; none offers what is there for the tests.

With a toolchain file everything is cross-built for Windows and runs under Wine with nothing but the
moved folder to find DLLs in.
"""

import concurrent.futures
import os
import pathlib
import re
import shutil
import subprocess
import sys
import zipfile

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


def check_samples(run_sample, work, source, environment):
    """Every sample over a folder that holds a text twice and an archive of texts."""
    texts = source / "samples/texts/files"
    folder = work / "texts"
    folder.mkdir()
    for name in ("ascii-english.txt", "utf16le-french.txt", "utf8-french.txt"):
        shutil.copy(texts / name, folder / name)
    shutil.copy(texts / "utf8-french.txt", folder / "again.txt")
    (folder / "old.txt").write_bytes("Höhe = 12 m\r\nno setting\r\nBreite=30 m\r\n".encode("utf-16"))
    with zipfile.ZipFile(work / "texts.zip", "w", zipfile.ZIP_DEFLATED) as archive:
        archive.write(texts / "utf16le-french.txt", "letters/french.txt")
    environment["QXCORE_REGISTRY"] = str(work / "settings.db")
    expected = {
        ("find_duplicates", folder): ["again.txt", "utf8-french.txt"],
        ("inspect_archive", work / "texts.zip"): ["letters/french.txt: ", "Unicode"],
        ("import_settings", "Samples", folder / "old.txt"): ["2 settings, read as Unicode", "Höhe = 12 m", "Breite = 30 m"],
    }
    for (name, *arguments), parts in expected.items():
        output = run_sample(name, *arguments).decode("utf-8")
        missing = [part for part in parts if part not in output]
        if missing or "ascii-english" in output:
            sys.exit(f"{name} printed:\n{output}\nwithout {missing}")


def imports(path):
    listing = run(["i686-w64-mingw32-objdump", "-p", path]).decode()
    return {name.lower() for name in re.findall(r"DLL Name: (\S+)", listing)}


def check_hooks(source, include, headers):
    """The functions by which tests make memory fail are for the library's own tests only."""
    declared = (source / "qxcore/core/internal/memory_failures.h").read_text(encoding="utf-8")
    hooks = re.findall(r"^QXCORE_API [\w ]*?\b(\w+)\(", declared, re.M)
    if not hooks:
        sys.exit("no hook is declared where they should be")
    for header in headers:
        words = set(re.findall(r"\w+", (include / header).read_text(encoding="utf-8")))
        if found := words.intersection(hooks):
            sys.exit(f"{header} offers {sorted(found)}, which only tests need")


def check_headers(source, package, work, compiler):
    """Each header as a client's only one, and all of them from the first to the last and back."""
    include = package / "include"
    headers = sorted(path.relative_to(include).as_posix() for path in include.rglob("*.h"))
    if not headers or any(not header.startswith("qxcore/") for header in headers):
        sys.exit(f"not all headers lie in include/qxcore: {headers}")
    check_hooks(source, include, headers)
    # Those in win32/ are the pieces of win32.h, and no client includes them.
    headers = [header for header in headers if "/win32/" not in header]
    texts = {header.replace("/", "_"): [header] for header in headers}
    texts["all_forward"], texts["all_backward"] = headers, headers[::-1]

    def compiles(item):
        name, included = item
        source = work / f"{name}.cpp"
        source.write_text("".join(f'#include "{header}"\n' for header in included), encoding="utf-8")
        command = [*compiler, "-std=c++20", "-Wall", "-Wextra", "-Werror", "-fsyntax-only", f"-I{include}", str(source)]
        return subprocess.run(command, stderr=subprocess.PIPE, timeout=300).stderr.decode("utf-8", "replace")

    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
        failures = [failure for failure in pool.map(compiles, texts.items()) if failure]
    if failures:
        sys.exit("\n".join(failures))
    print(f"{len(headers)} headers")


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
    elif kind == "headers":
        cross = ["i686-w64-mingw32-g++-posix", "-DUNICODE", "-D_UNICODE", "-msse2"]
        check_headers(source, package, work, cross if toolchain else [os.environ.get("CXX", "c++")])
    elif kind == "cmake":
        configure = ["cmake", "-S", source / "samples", "-B", work / "samples", f"-Dqxcore11e_DIR={package}/lib/cmake/qxcore11e",
                     "-DCMAKE_BUILD_TYPE=Release", "-G", "Ninja"]
        run(configure + [f"-DCMAKE_TOOLCHAIN_FILE={path}" for path in toolchain])
        run(["cmake", "--build", work / "samples"])
        if toolchain:
            environment["WINEPATH"] = run(["winepath", "-w", package / "bin"]).decode().strip()

        def run_sample(name, *arguments):
            program = ["wine", work / "samples" / f"{name}.exe"] if toolchain else [work / "samples" / name]
            return run([*program, *arguments], env=environment)

        check_output(run_sample("hello", sample), expected)
        check_samples(run_sample, work, source, environment)
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
