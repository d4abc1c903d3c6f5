#!/usr/bin/env python3
"""Writes what the core needs to know of characters to put a line into the order in which it is seen, as C++ source, from
the Unicode Character Database: character_tables.py FOLDER OUTPUT.cpp. src/documents/character_tables.hpp describes the
tables.
"""
import os
import re
import sys

CLASSES = ["L", "R", "AL", "EN", "ES", "ET", "AN", "CS", "NSM", "BN", "B", "S", "WS", "ON",
           "LRE", "LRO", "RLE", "RLO", "PDF", "LRI", "RLI", "FSI", "PDI"]
LONG_NAMES = {"Left_To_Right": "L", "Right_To_Left": "R", "Arabic_Letter": "AL", "European_Terminator": "ET"}
FORMS = ["<isolated>", "<final>", "<initial>", "<medial>"]
LAST_OF_PLANE = 0xFFFF


def lines(folder, name):
    with open(os.path.join(folder, name), encoding="utf-8") as file:
        yield from file


def fields(line):
    return [field.strip() for field in line.split("#")[0].split(";")]


def span(text):
    first, _, last = text.partition("..")
    return int(first, 16), int(last or first, 16)


def class_starts(folder):
    """Where the class changes: (first character, class)."""
    classes = ["L"] * 0x110000
    rows, defaults = [], []
    for line in lines(folder, "extracted/DerivedBidiClass.txt"):
        missing = re.match(r"# @missing: (\S+); (\S+)", line)
        if missing:
            defaults.append((span(missing[1]), LONG_NAMES[missing[2]]))
        elif fields(line)[0]:
            place, name = fields(line)
            rows.append((span(place), name))
    for (first, last), name in defaults + rows:
        classes[first:last + 1] = [name] * (last + 1 - first)
    return [(c, name) for c, name in enumerate(classes) if c == 0 or name != classes[c - 1]]


def brackets(folder):
    # The angle brackets that are the same as others (canonical equivalents) are paired with these.
    rows = [fields(line) for line in lines(folder, "BidiBrackets.txt")]
    return sorted((int(row[0], 16), int(row[1], 16), row[2] == "o") for row in rows if row[0])


def mirrored(folder):
    rows = [fields(line) for line in lines(folder, "BidiMirroring.txt")]
    pairs = sorted((int(row[0], 16), int(row[1], 16)) for row in rows if row[0])
    return [pair for pair in pairs if pair[0] <= LAST_OF_PLANE]


def arabic_forms(folder):
    """The letters with their four forms, 0 for one that there is not; and the ligatures of lam with an alef."""
    letters, ligatures = {}, {}
    for line in lines(folder, "UnicodeData.txt"):
        row = line.split(";")
        kind, *parts = row[5].split() or [""]
        form, parts = int(row[0], 16), [int(part, 16) for part in parts]
        if kind not in FORMS or form > LAST_OF_PLANE:
            continue
        if len(parts) == 1:
            letters.setdefault(parts[0], [0] * len(FORMS))[FORMS.index(kind)] = form
        elif 0xFEF5 <= form <= 0xFEFC:
            ligatures.setdefault(parts[1], [0, 0])[FORMS.index(kind)] = form
    return ([(letter, *forms) for letter, forms in sorted(letters.items())],
            [(alef, *forms) for alef, forms in sorted(ligatures.items())])


def table(kind, name, rows):
    text = f"const {kind} {name}_rows[] = {{\n"
    return text + "".join("    " + row + "\n" for row in rows) + f"}};\nconst std::span<const {kind}> {name} = {name}_rows;\n\n"


def row_of(values):
    return "{" + ", ".join(str(value).lower() if isinstance(value, bool) else hex(value) for value in values) + "},"


def source(folder):
    letters, ligatures = arabic_forms(folder)
    starts = [f"{{{hex(first)}, BidiClass::{name}}}," for first, name in class_starts(folder)]
    return ('#include "documents/character_tables.hpp"\n\nnamespace talutil {\n\n' +
            table("ClassStart", "class_starts", starts) +
            table("Bracket", "brackets", map(row_of, brackets(folder))) +
            table("MirroredPair", "mirrored_pairs", map(row_of, mirrored(folder))) +
            table("ArabicLetter", "arabic_letters", map(row_of, letters)) +
            table("LamAlef", "lam_alefs", map(row_of, ligatures)) +
            "}  // namespace talutil\n")


def main():
    folder, output = sys.argv[1:]
    text = source(folder)
    with open(output + ".new", "w", encoding="utf-8") as file:
        file.write(text)
    os.replace(output + ".new", output)


if __name__ == "__main__":
    main()
