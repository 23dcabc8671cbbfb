#!/usr/bin/env python3
"""Converts real documents to text and to RTF, each in a process of its own.

The documents lie in the folder that QXCORE_CORPUS names, under rtf/; without it the test is left out. On
Linux the text must equal the texts that came with 14 of them, blanks aside, and hold, in order, at least 98 of
100 words that unrtf finds; its faults are sorted out by the rules below. What was written anew must read the
same. On Windows the control is the system's: which documents it refuses, and no more, is checked.

usage: corpus_test.py CONVERTER [WRAPPER...]
"""

import difflib
import os
import pathlib
import re
import subprocess
import sys
import tempfile

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[1] / "support"))
import wine  # noqa: E402

LIMIT = 20  # seconds a document

# Texts that came with documents, where their writer shows more than the document does: what is taken out of them.
OWN_SIGNS = {
    "striprtf__hyperlink": (r'\("https://google\.com"\)', "it adds the targets of links"),
    "striprtf__nested_table": (r"\|", "it ends cells with a bar, where ours have a tab between them"),
}

# Not RTF by their first characters, and so plain texts, which come back as they are.
PLAIN = {"rsrtf__RTF-test", "rtfpipe__RtfParserTest_fail_0", "rtfpipe__RtfParserTest_fail_6"}

# Without any text of the body, so that the conversion returns 0.
EMPTY = {"rtfjs__simplepng", "rtfjs__simplepngbin"}

# Those in which Wine's control finds no text: what stands in shapes, results of fields and objects is lost.
REFUSED_BY_WINE = EMPTY | {"lo__fdo49666", "oimo__textframe-table", "striprtf__hyperlink", "tika__testBinControlWord", "wpf__simpleURL"}

# What is the peer's fault: words that it could not write, targets that it shows in place of a link's text, words
# of its own about the document.
PEERS_FAULTS = (
    ("characters that it could not show", lambda word, ours: "\ufffd" in word or any(ord(c) < 32 for c in word) or any(ord(c) > 126 for c in ours)),
    ("targets in place of links' texts", lambda word, ours: word.startswith(('"', '("'))),
)


def convert(command, what, path):
    """The output, or None when the conversion returned 0, or why there is none."""
    try:
        result = subprocess.run(command + [what, str(path)], stdout=subprocess.PIPE, stderr=subprocess.PIPE, timeout=LIMIT)
    except subprocess.TimeoutExpired:
        return f"did not end within {LIMIT} seconds"
    if result.returncode == 3:
        return None
    return result.stdout if result.returncode == 0 else f"exit code {result.returncode}"


def without_blanks(text):
    return re.sub(r"\s", "", text)


def check_expected(folder, texts):
    problems = []
    expected = sorted((folder / "expected").glob("*.peer.txt"))
    for path in expected:
        name = path.name.removesuffix(".peer.txt")
        wanted = path.read_text(encoding="utf-8")
        if name in OWN_SIGNS:
            wanted = re.sub(OWN_SIGNS[name][0], "", wanted)
            print(f"{name}: {OWN_SIGNS[name][1]}")
        if without_blanks(wanted) != without_blanks(texts[name]):
            problems.append(f"{name}: differs from the text that came with it")
    print(f"{len(expected) - len(problems)} of {len(expected)} texts that came with documents are equal")
    return problems


def peers_words(path):
    lines = path.read_text(encoding="utf-8", errors="replace").splitlines()
    return " ".join(line for line in lines if not line.startswith("###")).split()


def check_words(folder, texts):
    found = total = 0
    faults = {reason: 0 for reason, _ in PEERS_FAULTS}
    missed = []
    for path in sorted((folder / "expected").glob("*.unrtf*.txt")):
        name = path.name.split(".unrtf")[0]
        if name in PLAIN:
            continue
        words, ours = peers_words(path), texts[name].split()
        total += len(words)
        for tag, first, end, our_first, our_end in difflib.SequenceMatcher(None, words, ours, autojunk=False).get_opcodes():
            if tag == "equal":
                found += end - first
            elif end > first:
                ours_there = " ".join(ours[our_first:our_end])
                for word in words[first:end]:
                    reason = next((reason for reason, holds in PEERS_FAULTS if holds(word, ours_there)), None)
                    if reason:
                        faults[reason] += 1
                    else:
                        missed.append(f"{name}: {word!r} where ours has {ours_there[:60]!r}")
    counted = total - sum(faults.values())
    print(f"{found} of {counted} words that unrtf finds are there in order; besides, its faults: {faults}")
    for line in missed:
        print("  missed:", line)
    return [] if found >= 0.98 * counted else ["fewer than 98 of 100 words"]


def check_round_trips(command, paths, texts):
    problems = []
    with tempfile.TemporaryDirectory() as out:
        written = pathlib.Path(out) / "written.rtf"
        for path in paths:
            if path.stem in PLAIN | EMPTY:
                continue
            rtf = convert(command, "rtf", path)
            if not isinstance(rtf, bytes):
                problems.append(f"{path.stem}: not written anew: {rtf}")
                continue
            written.write_bytes(rtf)
            again = convert(command, "text", written)
            if not isinstance(again, bytes) or again.decode("utf-8", "surrogatepass") != texts[path.stem]:
                problems.append(f"{path.stem}: reads otherwise once it is written anew")
    return problems


def main():
    converter, *wrapper = sys.argv[1:]
    corpus = os.environ.get("QXCORE_CORPUS")
    if not corpus:
        print("left out: conversion of real RTF documents, because QXCORE_CORPUS is not set")
        return
    wine.keep_running(wrapper)
    command = wrapper + [os.path.abspath(converter)]
    folder = pathlib.Path(corpus) / "rtf"
    paths = sorted((folder / "files").glob("*.rtf"))
    texts, refused, problems = {}, set(), []
    for path in paths:
        text = convert(command, "text", path)
        if isinstance(text, str):
            problems.append(f"{path.stem}: {text}")
        elif text is None:
            refused.add(path.stem)
        texts[path.stem] = text.decode("utf-8", "surrogatepass") if isinstance(text, bytes) else ""
    print(f"{len(paths)} documents; without text: {', '.join(sorted(refused))}")
    if refused != (REFUSED_BY_WINE if wrapper else EMPTY):
        problems.append("others without text than expected")
    if not wrapper:
        problems += check_expected(folder, texts) + check_words(folder, texts) + check_round_trips(command, paths, texts)
    for problem in problems:
        print(problem)
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
