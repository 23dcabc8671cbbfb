#!/usr/bin/env python3
"""Lets qxtool list, test and extract real zip archives, good and bad ones, of many makers.

The archives lie in the folder that QXCORE_CORPUS names, under zip/, with what Info-ZIP and Python make of
them in EXPECTED.tsv (a verdict each) and ENTRIES.tsv (sizes, checksums and hashes of the data); without it
the test is left out. What the tool must say of each stands in zip_corpus_expected.tsv, one list for both
targets: "ok" or the message. An archive that both peers call good and the tool refuses stands there with
its message; the test counts them. Archives that are installed on the system are compared with Python.

usage: zip_corpus_test.py [--write] TOOL [WRAPPER...]
"""

import collections
import concurrent.futures
import csv
import hashlib
import json
import os
import pathlib
import subprocess
import sys
import tempfile
import zipfile

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import wine  # noqa: E402

EXPECTED = pathlib.Path(__file__).with_name("zip_corpus_expected.tsv")
COLUMNS = ("file", "verdict", "list", "test", "extract-all", "extract-all under Wine")
# Where packages put archives, and how those are called.
INSTALLED = (("/usr/share", "/usr/lib"), (".jar", ".zip", ".whl", ".xpi", ".odt", ".ods", ".docx", ".epub", ".egg"))
MOST_INSTALLED = 300


def rows(path):
    lines = [line for line in path.read_text(encoding="utf-8").splitlines() if not line.startswith("#")]
    return list(csv.DictReader(lines, delimiter="\t", quoting=csv.QUOTE_NONE))


def run(tool, folder, *arguments):
    result = subprocess.run(tool + ["zip", *arguments], cwd=folder, stdin=subprocess.DEVNULL, capture_output=True, timeout=120)
    return result.returncode, result.stdout, result.stderr.decode("utf-8")


def outcome(code, stderr, archive):
    """"ok", or the message without its beginning; anything else than success or a message is a fault."""
    if code == 0 and not stderr:
        return "ok"
    lines = [line.removeprefix("qxtool: ").removeprefix(archive + ": ") for line in stderr.splitlines()]
    if code != 1 or not lines:
        return f"exit code {code}: {stderr}"
    return " | ".join(lines)


def ansi(name):
    """The name that Python decoded as code page 437, as the ANSI code page has it."""
    raw = name.encode("cp437").split(b"\0")[0]
    return "".join(bytes([byte]).decode("cp1252", "ignore") or chr(byte) for byte in raw)


def expected_entries(entries):
    """What list must give of each entry, by what Python read."""
    expected = []
    for entry in entries:
        name = json.loads(entry["name_json"])
        name = name if int(entry["flags_hex"], 16) & 0x800 else ansi(name)
        expected.append((name, int(entry["method"]), int(entry["size"]), int(entry["comp_size"]), int(entry["crc_hex"], 16)))
    return expected


def listed_entries(report):
    return [(entry["name"], entry["method"], entry["size"], entry["compressed"], entry["crc"]) for entry in report["entries"]]


def extracted_data(folder):
    """Name by name the hash of each file."""
    return {str(path.relative_to(folder)).replace("\\", "/"): hashlib.sha256(path.read_bytes()).hexdigest()
            for path in folder.rglob("*") if path.is_file()}


def check_archive(tool, archive, entries):
    """The outcomes of the three commands, and the problems."""
    problems = []
    with tempfile.TemporaryDirectory() as name:
        outside = pathlib.Path(name)
        (outside / "inside").mkdir()
        path = outside / "inside" / archive.name
        path.write_bytes(archive.read_bytes())
        code, stdout, stderr = run(tool, path.parent, "list", "--json", path.name)
        report = json.loads(stdout.decode("utf-8"))
        listed = outcome(code, stderr, path.name)
        if (report["error"] or "ok") != listed:
            problems.append(f"{archive.name}: the JSON error is {report['error']}")
        code, _, stderr = run(tool, path.parent, "test", path.name)
        tested = outcome(code, stderr, path.name)
        code, _, stderr = run(tool, path.parent, "extract-all", path.name, "out")
        extracted = outcome(code, stderr, path.name)
        there = {str(item.relative_to(outside)) for item in outside.rglob("*")}
        if any(not item.startswith(os.path.join("inside", "out")) for item in there - {"inside", os.path.join("inside", path.name)}):
            problems.append(f"{archive.name}: something was written outside: {sorted(there)}")
        if listed == "ok" and entries is not None and listed_entries(report) != entries["listed"]:
            problems.append(f"{archive.name}: listed {listed_entries(report)}, expected {entries['listed']}")
        if extracted == "ok" and entries is not None:
            found = sorted(extracted_data(path.parent / "out").values())
            if found != sorted(entries["hashes"]):
                problems.append(f"{archive.name}: the data of some entries is not what Python reads")
    return (listed, tested, extracted), problems


def entries_by_file(folder):
    entries = collections.defaultdict(list)
    for entry in rows(folder / "ENTRIES.tsv"):
        entries[entry["file"]].append(entry)
    return {
        name: {"listed": expected_entries(of_file),
               "hashes": [entry["sha256_of_data"] for entry in of_file if not json.loads(entry["name_json"]).endswith("/")]}
        for name, of_file in entries.items()
    }


def check_corpus(tool, folder, write, on_wine):
    verdicts = {row["file"]: row["verdict"] for row in rows(folder / "EXPECTED.tsv")}
    entries = entries_by_file(folder)
    expected = {row["file"]: row for row in rows(EXPECTED)} if EXPECTED.exists() else {}
    problems, written = [], []
    counts = collections.Counter()

    def check(name):
        known = entries.get(name, {"listed": [], "hashes": []}) if verdicts[name].startswith("agree_ok") else None
        return check_archive(tool, folder / "files" / name, known)

    # Under Wine most of the time of a program goes by in waiting for its server.
    with concurrent.futures.ThreadPoolExecutor(max_workers=2) as pool:
        checked = list(pool.map(check, sorted(verdicts)))
    for name, (found, more) in zip(sorted(verdicts), checked):
        problems += more
        if verdicts[name] == "agree_bad" and found[1] == "ok":
            problems.append(f"{name}: both peers say that it is bad, and it passes")
        if verdicts[name].startswith("agree_ok"):
            counts["good, and read" if found[1] == "ok" else "good, and refused with a message"] += 1
        former = expected.get(name, {})
        on_other = former.get("extract-all under Wine") or ""
        wanted = (former.get("list"), former.get("test"), (on_wine and on_other) or former.get("extract-all"))
        if not write and found != wanted:
            problems.append(f"{name}: {found}, expected {wanted}")
        if write and on_wine:
            on_other = found[2] if found[2] != former["extract-all"] else ""
            found = (former["list"], former["test"], former["extract-all"])
        written.append((name, verdicts[name], *found, on_other))
    if write:
        with EXPECTED.open("w", encoding="utf-8", newline="\n") as out:
            out.write("# What qxtool says of real archives; what differs under Wine, in the last column, are names that Windows forbids.\n")
            out.write("# Made by zip_corpus_test.py --write.\n" + "\t".join(COLUMNS) + "\n")
            out.writelines("\t".join(row) + "\n" for row in written)
    print(f"{len(verdicts)} archives: " + ", ".join(f"{count} {what}" for what, count in sorted(counts.items())))
    return problems


def check_installed(tool):
    """Archives of the system: whatever Python finds whole must be read, or refused with one of the stated messages."""
    folders, endings = INSTALLED
    paths = [path for folder in folders for path in pathlib.Path(folder).rglob("*") if path.suffix in endings and path.is_file()]
    problems, read = [], 0
    for path in sorted(paths)[:MOST_INSTALLED]:
        try:
            with zipfile.ZipFile(path) as archive:
                infos = archive.infolist()
                if archive.testzip() is not None or any(info.compress_type not in (0, 8) or info.flag_bits & 1 for info in infos):
                    continue
        except (OSError, zipfile.BadZipFile, NotImplementedError, RuntimeError):
            continue
        code, stdout, stderr = run(tool, "/", "list", "--json", str(path))
        listed = [(entry["size"], entry["crc"]) for entry in json.loads(stdout.decode("utf-8"))["entries"]]
        tested = outcome(*run(tool, "/", "test", str(path))[::2], str(path))
        if code == 0 and listed == [(info.file_size, info.CRC) for info in infos] and tested == "ok":
            read += 1
        else:
            problems.append(f"{path}: list {outcome(code, stderr, str(path))}, test {tested}")
    print(f"{read} archives of this system are read as Python reads them")
    return problems


def main():
    arguments = sys.argv[1:]
    write = arguments[:1] == ["--write"]
    tool, *wrapper = arguments[1:] if write else arguments
    corpus = os.environ.get("QXCORE_CORPUS")
    if not corpus:
        print("left out: real archives, because QXCORE_CORPUS is not set")
        return
    wine.keep_running(wrapper)
    command = wrapper + [os.path.abspath(tool)]
    problems = check_corpus(command, pathlib.Path(corpus) / "zip", write, bool(wrapper))
    if not wrapper:
        problems += check_installed(command)
    for problem in problems:
        print(problem)
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
