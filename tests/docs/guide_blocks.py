"""The fenced blocks of a guide."""

import dataclasses

# console: commands with their output. cpp: statements of C++; "cpp global" are declarations, which all
# later blocks see; "cpp program" is a whole program. text: what the cpp block right before it prints.
KINDS = ("console", "cpp", "cpp global", "cpp program", "text")
EXAMPLES = ("cpp", "cpp program")  # what is run


@dataclasses.dataclass
class Block:
    kind: str
    start: int  # the lines inside are lines[start:end]
    end: int


def blocks(lines):
    """Every block of these kinds, in order. A text block that follows no cpp block is left out."""
    open_kind = start = None
    previous = None
    for number, line in enumerate(lines):
        fence = line.rstrip()
        if open_kind is None:
            if fence.startswith("```"):
                open_kind, start = fence[3:], number + 1
            elif fence:
                previous = None if not fence.startswith("<!--") else previous
        elif fence == "```":
            if open_kind in KINDS and (open_kind != "text" or previous in EXAMPLES):
                yield Block(open_kind, start, number)
            previous, open_kind = open_kind, None
    if open_kind is not None:
        raise SystemExit(f"the block that begins in line {start} has no end")
