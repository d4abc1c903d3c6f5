#!/usr/bin/env python3
"""Reads the doc comments of all members that hosts use and writes them as C++ source for the command and the interface
definition: member_texts.py OUTPUT.cpp, or member_texts.py --check.

A member's text stands once, at its declaration. CONTRIBUTING.md describes its form. Which members there are, and which
parameters they have, follows from the tables (members_of). Whatever does not fit the form is an error with file and
line, and nothing is written.
"""
import os
import re
import sys
from dataclasses import dataclass, field

SOURCES = os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "src")
DOCUMENTS = os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "docs")

# The classes that hosts create, each with the header of its table and the headers of its declarations.
CLASSES = [
    ("ORVUtils", "library/interface_table.hpp", ["library/orv_utils.hpp", "library/shared_settings.hpp"]),
    ("cControlPosition", "library/c_control_position.hpp", []),
    ("Grid", "controls/grid.hpp", []),
    ("CommonDialog", "controls/common_dialog.hpp", []),
    ("ZipControl", "controls/zip_controls.hpp", []),
    ("UnzipControl", "controls/zip_controls.hpp", []),
]

# In the order of the reference.
FAMILIES = ["text", "strings", "checks", "passwords", "calendar", "weeks", "stepping", "durations", "system time",
            "periods", "settings", "files", "text files", "event log", "registry", "archives", "network", "combo boxes",
            "grids", "windows", "input box", "drawing", "control positions", "reports", "information windows"]

LONGEST_SUMMARY = 120
TAGS = {"param", "raises", "reads", "changes", "family", "see", "example"}

errors = []


def complain(place, message):
    file, line = place
    errors.append(f"src/{file}:{line}: {message}")


# ---- Reading the tables

@dataclass
class Row:
    name: str
    declared: list  # (class or its alias, C++ name), the one with the text first
    parameters: list
    kind: str
    place: tuple


def balanced(text, start, opening, closing):
    """The position after the bracket that closes the one at `start`; brackets in literals do not count."""
    depth, i = 0, start
    while i < len(text):
        c = text[i]
        if c == '"':
            i += 1
            while text[i] != '"':
                i += 2 if text[i] == "\\" else 1
        elif c == opening:
            depth += 1
        elif c == closing:
            depth -= 1
            if depth == 0:
                return i + 1
        i += 1
    raise ValueError(f"{opening} without {closing}")


def split(text):
    """The parts between commas that stand in no brackets and in no literal."""
    parts, start, i = [], 0, 0
    while i < len(text):
        c = text[i]
        if c == '"':
            i += 1
            while text[i] != '"':
                i += 2 if text[i] == "\\" else 1
        elif c in "({<":
            i = balanced(text, i, c, {"(": ")", "{": "}", "<": ">"}[c]) - 1
        elif c == ",":
            parts.append(text[start:i].strip())
            start = i + 1
        i += 1
    parts.append(text[start:].strip())
    return [part for part in parts if part]


def literal(text, place):
    match = re.search(r'"((?:[^"\\]|\\.)*)"', text)
    if not match:
        complain(place, f'"{text}" has no name in quotes')
        return ""
    return match.group(1)


def rows_of(class_name, file):
    with open(os.path.join(SOURCES, file), encoding="utf-8") as source:
        text = source.read()
    head = re.search(r"members_of\(std::type_identity<%s>\)\s*\{" % class_name, text)
    if not head:
        complain((file, 1), f"there is no table (members_of) of {class_name}")
        return []
    body_end = balanced(text, head.end() - 1, "{", "}")
    rows = []
    for match in re.compile(r"P::template (\w+)<").finditer(text, head.end(), body_end):
        place = (file, text.count("\n", 0, match.start()) + 1)
        after = balanced(text, match.end() - 1, "<", ">")
        pointers = [part for part in split(text[match.end():after - 1]) if part.startswith("&")]
        arguments = split(text[after + 1:balanced(text, after, "(", ")") - 1])
        rows.append(Row(literal(arguments[0], place), [pointer.lstrip("&").split("::")[-1] for pointer in pointers],
                        [literal(argument, place) for argument in arguments[1:]], match.group(1), place))
    return rows


# ---- Reading the declarations

@dataclass
class Comment:
    lines: list  # (number of the line, text behind the slashes)
    place: tuple


@dataclass
class Declared:
    bases: list
    comment: Comment = None
    members: dict = field(default_factory=dict)


def declared_name(code):
    """The name that a declaration declares."""
    head = re.split(r"[;{=]", code, maxsplit=1)[0]
    match = re.search(r"(\w+)\s*\(", head) or re.search(r"(\w+)\s*$", head)
    return match.group(1) if match else None


def classes_in(file):
    """The classes of a header with the comments at their members."""
    with open(os.path.join(SOURCES, file), encoding="utf-8") as source:
        lines = source.read().split("\n")
    classes, current, comment, i = {}, None, [], 0
    while i < len(lines):
        line = lines[i]
        stripped = line.strip()
        if stripped.startswith("///") and not stripped.startswith("///<"):
            comment.append((i + 1, stripped[3:]))
        elif match := re.match(r"(?:class|struct) (\w+)\b([^;]*)$", line):
            bases = re.findall(r"(?:public )(\w+)", match.group(2))
            current = Declared(bases, Comment(comment, (file, i + 1)) if comment else None)
            classes[match.group(1)] = current
            comment = []
        elif not stripped or stripped.startswith("//") or stripped.startswith("#"):
            comment = []
        elif current and line.startswith("  ") and not line.startswith("   "):
            start, code = i, line
            while not re.search(r"[;{]", code.split("//")[0]) and i + 1 < len(lines):
                i += 1
                code += " " + lines[i].strip()
            behind = re.search(r"///<(.*)", lines[i])
            while behind and i + 1 < len(lines) and lines[i + 1].strip().startswith("///<"):
                i += 1
                comment.append((i + 1, lines[i].strip()[4:]))
            if behind:
                comment.insert(0, (start + 1, behind.group(1)))
            name = declared_name(code.split("//")[0])
            if name and comment:
                current.members.setdefault(name, Comment(comment, (file, start + 1)))
            comment = []
        i += 1
    return classes


# ---- Reading a comment

@dataclass
class Example:
    title: str
    code: str
    shows_window: bool


@dataclass
class Description:
    name: str
    place: tuple
    summary: str = ""
    details: str = ""
    family: str = ""
    parameters: list = field(default_factory=list)
    errors: list = field(default_factory=list)
    reads: list = field(default_factory=list)
    changes: list = field(default_factory=list)
    see: list = field(default_factory=list)
    examples: list = field(default_factory=list)


def paragraphs(lines):
    """Lines joined to paragraphs, which an empty line separates."""
    text = "\n".join(line.strip() for line in lines).strip()
    return "\n\n".join(" ".join(part.split()) for part in re.split(r"\n\n+", text))


def read_example(first, lines, place):
    words = first.split(None, 1)
    shows_window = bool(words) and words[0] == "windows"
    title = " ".join(words[1:]) if shows_window else first
    for number, line in enumerate(lines, place[1] + 1):
        if line.endswith("\\"):
            complain((place[0], number),
                     f'the line "{line.strip()}" ends with a backslash, and so goes on in the next line for C++')
        if line.strip() and not line.startswith("     "):
            complain((place[0], number), f'the line "{line.strip()}" of the example is not indented by four blanks')
    code = [line.rstrip() for line in lines]
    while code and not code[0].strip():
        code.pop(0)
    while code and not code[-1].strip():
        code.pop()
    if not code:
        complain(place, "the example is empty")
        return Example(title, "", shows_window)
    return Example(title, "\n".join(line[5:] for line in code), shows_window)


def read_list(text, separator=r",\s*"):
    return [item for item in re.split(separator, text.strip().rstrip(".")) if item]


def read_tag(result, tag, first, lines, place):
    text = paragraphs([first] + lines)
    if tag == "example":
        result.examples.append(read_example(first.strip(), lines, place))
    elif tag == "family":
        result.family = text
        if text not in FAMILIES:
            complain(place, f'there is no family "{text}"; there are {", ".join(FAMILIES)}')
    elif tag in ("reads", "changes", "see"):
        getattr(result, tag).extend((item, place) for item in read_list(text))
    else:
        name, _, meaning = text.partition(" ")
        if not meaning:
            complain(place, f'@{tag} {name} does not say what it means')
        if tag == "raises":
            if not name.isdigit():
                complain(place, f'@raises begins with "{name}"; write the number of the error')
                name = "0"
            result.errors.append((int(name), meaning))
        else:
            result.parameters.append((name, meaning, place))


def describe(name, comment):
    """What a comment says, taken apart."""
    result = Description(name, comment.place)
    file = comment.place[0]
    tag, first, lines, place = None, "", [], comment.place
    blocks = []
    for number, text in comment.lines:
        match = re.match(r"\s*@(\w+)(?:\s+(.*))?$", text)
        if match and not (tag == "example" and text.startswith("     ")):
            blocks.append((tag, first, lines, place))
            tag, first, lines, place = match.group(1), match.group(2) or "", [], (file, number)
        else:
            lines.append(text)
    blocks.append((tag, first, lines, place))
    text = paragraphs(blocks[0][2])
    match = re.match(r"(.*?[.?])(?:\s+(?=[A-Z\"0-9(])|\s*$)(.*)", text, re.S)
    if not match:
        complain(comment.place, f"the text of {name} does not begin with a sentence")
    else:
        result.summary, result.details = match.group(1), match.group(2)
    for tag, first, lines, place in blocks[1:]:
        if tag in TAGS:
            read_tag(result, tag, first, lines, place)
        else:
            complain(place, f'there is no tag "@{tag}"; there are {", ".join(sorted(TAGS))}')
    return result


# ---- Putting both together

def find_comment(classes, class_names, name):
    """The comment of a member, which a base class may declare."""
    for class_name in class_names:
        found = classes.get(class_name)
        if not found:
            continue
        if name in found.members:
            return found.members[name]
        if comment := find_comment(classes, found.bases, name):
            return comment
    return None


def check_member(row, text):
    place = text.place
    if len(text.summary) > LONGEST_SUMMARY:
        complain(place, f"the first sentence of {row.name} has {len(text.summary)} characters; "
                        f"{LONGEST_SUMMARY} fit a help string")
    if not text.summary.isascii():
        complain(place, f"the first sentence of {row.name} has characters that a help string cannot have")
    if not text.family:
        complain(place, f"{row.name} has no @family")
    if not text.examples:
        complain(place, f"{row.name} has no @example")
    given = [name for name, _, _ in text.parameters]
    if given != row.parameters:
        complain(place, f"the @param of {row.name} are ({', '.join(given)}); "
                        f"the table has ({', '.join(row.parameters)})")


def read_class(name, table, headers):
    classes = {}
    for file in [table] + headers:
        classes.update(classes_in(file))
    rows = rows_of(name, table)
    described = classes.get(name)
    if not described or not described.comment:
        complain((table, 1), f"the class {name} has no text")
        return Description(name, (table, 1)), []
    members = {}
    for row in rows:
        if row.name in members:
            continue
        comment = None
        for declared in row.declared:
            comment = comment or find_comment(classes, [name, "SharedSettings"], declared)
        if not comment:
            complain(row.place, f"{name}.{row.name} has no text at its declaration ({', '.join(row.declared)})")
            continue
        members[row.name] = describe(row.name, comment)
        check_member(row, members[row.name])
    return describe(name, described.comment), list(members.values())


def resolved(item, own, names):
    """The full name of what an item refers to: "Member" of the toolkit, "Class.Member", or a page. None if it leads
    nowhere. A bare name is that of a member of the text's own class, of the toolkit, or of the only class with one."""
    class_name, _, member = item.rpartition(".")
    if item in names or os.path.exists(os.path.join(DOCUMENTS, "..", item)):
        return item
    owners = [owner for owner in [own, "ORVUtils"] if not class_name and member in names[owner]]
    if not owners:
        owners = [owner for owner in names if class_name in ("", owner) and member in names[owner]]
        if len(owners) != 1:
            return None
    return member if owners[0] == "ORVUtils" else f"{owners[0]}.{member}"


def check_references(classes):
    """Replaces every name that a text refers to by its full name; one that leads nowhere is an error."""
    names = {text.name: {member.name for member in members} for text, members in classes}
    for text, members in classes:
        for member in [text] + members:
            for kind in ("see", "reads", "changes"):
                for i, (item, place) in enumerate(getattr(member, kind)):
                    full = resolved(item, text.name, names)
                    if not full or full in names and kind != "see":
                        complain(place, f'"@{kind} {item}" leads nowhere; name a member, Class.Member or a page')
                    getattr(member, kind)[i] = (full or item, place)


def read_all():
    classes = [read_class(*entry) for entry in CLASSES]
    check_references(classes)
    return classes


# ---- Writing

def quoted(text):
    escaped = text.replace("\\", "\\\\").replace('"', '\\"').replace("\n", "\\n").replace("\t", "\\t")
    return f'"{escaped}"'


class Writer:
    def __init__(self):
        self.arrays = []

    def array(self, kind, items):
        """A named array of the items; the expression that stands for it."""
        if not items:
            return "{}"
        name = f"list_{len(self.arrays)}"
        self.arrays.append(f"constexpr {kind} {name}[] = {{{', '.join(items)}}};")
        return name

    def member(self, text):
        parameters = self.array("NamedText", [f"{{{quoted(n)}, {quoted(t)}}}" for n, t, _ in text.parameters])
        errors_raised = self.array("RaisedError", [f"{{{n}, {quoted(t)}}}" for n, t in text.errors])
        names = [self.array("std::string_view", [quoted(item) for item, _ in getattr(text, kind)])
                 for kind in ("reads", "changes", "see")]
        examples = self.array("Example", [f"{{{quoted(e.title)}, {quoted(e.code)}, {str(e.shows_window).lower()}}}"
                                          for e in text.examples])
        return (f"{{{quoted(text.name)}, {quoted(text.summary)}, {quoted(text.details)}, {quoted(text.family)}, "
                f"{parameters}, {errors_raised}, {', '.join(names)}, {examples}}}")

    def source(self, classes):
        entries = []
        for text, members in classes:
            list_name = self.array("MemberText", [self.member(member) for member in members])
            entries.append(f"{{{self.member(text)}, {list_name}}}")
        classes_name = self.array("ClassText", entries)
        families_name = self.array("std::string_view", [quoted(family) for family in FAMILIES])
        return ("// Written by tools/member_texts.py from the doc comments of the headers.\n"
                '#include "texts/member_texts.hpp"\n\nnamespace talutil::texts {\n\nnamespace {\n\n' +
                "\n".join(self.arrays) + "\n\n}  // namespace\n\n"
                f"std::span<const ClassText> all_classes() noexcept {{ return {classes_name}; }}\n"
                f"std::span<const std::string_view> families() noexcept {{ return {families_name}; }}\n\n"
                "}  // namespace talutil::texts\n")


def main(arguments):
    if len(arguments) != 1:
        print("usage: member_texts.py OUTPUT.cpp | --check", file=sys.stderr)
        return 2
    classes = read_all()
    if errors:
        print("\n".join(errors), file=sys.stderr)
        return 1
    if arguments[0] != "--check":
        unfinished = arguments[0] + ".new"
        with open(unfinished, "w", encoding="utf-8") as output:
            output.write(Writer().source(classes))
        os.replace(unfinished, arguments[0])
    return 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
