#!/usr/bin/env python3
"""Turns the ordinary comments of a header into the form that doxygen reads.

How the headers document, and what this makes of it:
- a comment above a declaration documents it, and the declarations that follow it in the same paragraph
  (up to a blank line or another comment);
- a comment behind a declaration documents that one alone;
- a section comment, "// --- search: what holds for all of these ---", documents what has none of its own;
- the comment that opens the file documents its first class, where that has none of its own; in a file
  without classes, whatever has none of its own.

- names whose meaning the language or the standard library fixes (copies, moves, begin, value_type, ...)
  need no comment.

A public name that none of these reaches stays undocumented, and doxygen reports it as an error.
"""

import re
import sys

# What these stand for ends itself, without a semicolon.
DECLARING_MACRO = re.compile(r"\s*QXCORE_DECLARE_\w+\(.*\)\s*")
SECTION = re.compile(r"^\s*// --- (.*?)(?: ---)?$")
TRAILING = re.compile(r"^(?P<code>.*?\S)\s+//\s?(?P<text>.*)$")

STANDARD_NAMES = (
    "value_type|reference|const_reference|pointer|size_type|difference_type|iterator|const_iterator|iterator_category|key_type|"
    "mapped_type|reverse_iterator|const_reverse_iterator|iterator_concept"
)
STANDARD_MEMBERS = "begin|end|cbegin|cend|rbegin|rend|crbegin|crend|size|empty|push_back|clear|front|back|data|swap"
CONVENTIONS = (
    (re.compile(rf"\busing ({STANDARD_NAMES})\s*="), "As the standard library's containers have it."),
    (re.compile(rf"\b({STANDARD_MEMBERS})\(.*\)"), "As the standard library's containers have it."),
    (re.compile(r"^(?:constexpr |explicit )*(\w+)\(const (\w+)(<[\w, ]*>)?& ?\w*\)"), "Copies."),
    (re.compile(r"^(?:constexpr |explicit )*(\w+)\((\w+)(<[\w, ]*>)?&& ?\w*\)"), "Moves; the other is left empty."),
    (re.compile(r"^(\w+)& operator=\(const (\w+)(<[\w, ]*>)?& ?\w*\)"), "Copies."),
    (re.compile(r"^(\w+)& operator=\((\w+)(<[\w, ]*>)?&& ?\w*\)"), "Moves; the other is left empty."),
    (re.compile(r"\boperator(\+\+|--|->|\*)\("), "As the standard library's iterators have it."),
    (re.compile(r"^(?:explicit )?\w+\(std::initializer_list<"), "Holds copies of the values, in their order."),
    (re.compile(r"\bGetCount\(\) const\b"), "How many elements there are."),
    (re.compile(r"\bIsEmpty\(\) const\b"), "Whether there is no element."),
    (re.compile(r"\bGetCapacity\(\) const\b"), "How many elements there is room for."),
    (re.compile(r"\boperator(==|!=|<=>|<|>|<=|>=)\("), "Compares."),
)


def by_convention(code):
    """The comment for a name whose meaning is fixed, or nothing."""
    code = code.strip().removeprefix("QXCORE_API ")
    for pattern, text in CONVENTIONS:
        match = pattern.search(code)
        if match and (text not in ("Copies.", "Moves; the other is left empty.") or match[1] == match[2]):
            return [text]
    return []


def literal(comment):
    """The comment with its backslashes as characters, which doxygen would take for commands."""
    return comment.replace("\\", "\\\\")


def with_examples(header):
    """The comment that opens a file: between fences stands code as it is."""
    inside, lines = False, []
    for line in header:
        inside ^= line.startswith("```")
        lines.append(line if inside else literal(line.strip()))
    return lines


def strip_code(line):
    """The line without strings and comments, for counting braces."""
    line = re.sub(r'"(\\.|[^"\\])*"', '""', line)
    line = re.sub(r"'(\\.|[^'\\])'", "''", line)
    return line.split("//")[0]


def without_template_head(statement):
    """The statement behind "template <...>", whose default arguments would confuse."""
    head = statement.lstrip()
    if not head.startswith("template"):
        return head
    depth = 0
    for position, character in enumerate(head):
        depth += {"<": 1, ">": -1}.get(character, 0)
        if character == ">" and depth == 0:
            return without_template_head(head[position + 1 :])
    return head


class Filter:
    def __init__(self, lines):
        self.lines = lines
        self.out = []
        self.section = []
        self.block = []  # the comment that stands above, of this paragraph
        self.fresh = False  # the block has not been written yet
        self.header = []
        self.header_used = False
        self.stack = []  # what each open brace is: "class", "enum", "namespace" or "body"
        self.statement = ""  # code of the declaration that is being read

    def scope_documents(self):
        return all(kind != "body" for kind in self.stack)

    def emit_doc(self, indent, text):
        self.out.append(indent + "/** " + "\n".join([text[0]] + [indent + " *  " + line for line in text[1:]]) + " */")

    def doc_for(self, code):
        if self.block:
            return self.block
        if re.match(r"\s*(template.*>\s*)?(class|struct)\b[^;]*$", code) and self.header and not self.header_used:
            self.header_used = True
            return self.header
        return self.section or by_convention(code)

    def begins_name(self, code):
        stripped = code.strip()
        if not stripped or stripped.startswith(("#", "}", "{", ")", ":", "public", "private", "protected", "static_assert", "using namespace", "namespace", "extern template", "template class", "template struct")):
            return False
        if re.match(r"(class|struct|enum)\s+[\w ]+;", stripped):
            return False  # a forward declaration is documented where it is defined
        if stripped.startswith("friend") and "(" not in stripped:
            return False
        return True

    def run(self):
        lines = self.lines
        i = 0
        while i < len(lines) and (lines[i].startswith("//") or not lines[i].strip()):
            if lines[i].startswith("//"):
                self.header.append(lines[i][2:].removeprefix(" ").rstrip())
            i += 1
        self.header = with_examples(self.header)
        if self.header:
            self.out.append("/** @file\n * " + "\n * ".join(self.header) + " */")
        if not any(re.match(r"(template.*>\s*)?(class|struct)\b[^;]*$", line) for line in lines):
            self.section = self.header
        continued_macro = False
        while i < len(lines):
            line = lines[i]
            i += 1
            stripped = line.strip()
            if continued_macro or stripped.startswith("#"):
                if stripped.startswith("#define") and self.fresh:
                    self.emit_doc("", self.block)
                    self.fresh = False
                continued_macro = stripped.endswith("\\")
                self.out.append(line)
                continue
            if re.match(r"struct (std::)?hash<", stripped):
                # doxygen cannot place a specialisation of another namespace's template.
                self.block, self.fresh = [], False
                while not lines[i - 1].startswith("};"):
                    i += 1
                if self.out and self.out[-1].strip() == "template <>":
                    self.out.pop()
                continue
            if not stripped:
                if not self.statement:
                    self.block, self.fresh = [], False
                self.out.append(line)
                continue
            if stripped.startswith("//!"):
                self.out.append(line)  # a command of doxygen itself
                continue
            if stripped.startswith("//"):
                section = SECTION.match(line)
                text = literal(stripped[2:].strip())
                if section:
                    self.section, self.block, self.fresh = [literal(section[1])], [], False
                elif self.fresh:
                    self.block.append(text)
                else:
                    self.block, self.fresh = [text], True
                continue
            if DECLARING_MACRO.fullmatch(line):
                self.out.append(line)
                continue
            self.code_line(line)
        return "\n".join(self.out) + "\n"

    def code_line(self, line):
        indent = line[: len(line) - len(line.lstrip())]
        trailing = TRAILING.match(line)
        in_scope = self.scope_documents()
        if in_scope and not self.statement and self.begins_name(line):
            own = trailing and strip_code(line).rstrip().endswith((";", ",", "{", "}"))
            if not own or self.fresh:
                doc = self.doc_for(line)
                if doc:
                    self.emit_doc(indent, doc)
            if own:
                line = trailing["code"] + ("  ///< " if not self.fresh else "  // ") + literal(trailing["text"])
        self.fresh = False
        self.out.append(line)
        self.track(strip_code(line))

    def track(self, code):
        for character in code:
            if character == "{":
                head = without_template_head(self.statement)
                if re.search(r"\benum\b", head):
                    kind = "enum"
                elif re.search(r"\b(class|struct|union)\b", head) and "(" not in re.sub(r"\balignas\([^)]*\)|__attribute__\(\(.*?\)\)", "", head) and "=" not in head:
                    kind = "class"
                elif re.search(r"\b(namespace|extern\s*\"\")", head):
                    kind = "namespace"
                else:
                    kind = "body"
                self.stack.append(kind)
                if kind != "body":
                    self.statement = ""
                    self.section = [] if kind == "class" else self.section
                    self.block = [] if kind == "class" else self.block
            elif character == "}":
                kind = self.stack.pop() if self.stack else "body"
                if kind != "body":
                    self.block = []
                if self.scope_documents() and kind == "body":
                    self.statement = ""
            elif character == ";" and self.scope_documents():
                self.statement = ""
            elif character == "," and self.stack and self.stack[-1] == "enum":
                self.statement = ""
            elif self.scope_documents():
                if not (character.isspace() and not self.statement):
                    self.statement += character
        if re.fullmatch(r"\s*(public|private|protected)\s*:\s*", self.statement):
            self.statement = ""
        if self.statement:
            self.statement += " "


def main():
    with open(sys.argv[1], encoding="utf-8") as file:
        text = file.read()
    if sys.argv[1].endswith(".md"):
        # Doxygen takes a backslash at the end of code, as in the names of folders, for an escape.
        sys.stdout.write(text.replace("\\`", "\\ `"))
    else:
        sys.stdout.write(Filter(text.split("\n")).run())


if __name__ == "__main__":
    main()
