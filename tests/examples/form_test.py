#!/usr/bin/env python3
"""Whether tools/member_texts.py refuses doc comments that do not have the form, naming file and line. The last line is
"N passed, N failed"."""
import io
import os
import sys

TOP = os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "..")
sys.path.insert(0, os.path.join(TOP, "tools"))
import member_texts  # Behind the path to it.

HEADER = "src/library/orv_utils.hpp"

# What is replaced in the header, by what, and the complaint.
ROWS = [
    ("no parameter", "  /// @param s the text\n", "", 'the @param of StripNulls are (); the table has (s)'),
    ("a parameter without a meaning", "@param s the text", "@param s", '@param s does not say what it means'),
    ("an unknown tag", "  /// @param s the text\n", "  /// @param s the text\n  /// @returns a text\n",
     'there is no tag "@returns"'),
    ("no number of an error", "@raises 5 if sChr", "@raises Five if sChr", '@raises begins with "Five"'),
    ("an unknown family", "/// @family strings", "/// @family string", 'there is no family "string"'),
    ("a member that is none", "@see RemoveStringsFromNumber,", "@see Remove,", '"@see Remove" leads nowhere'),
    ("no example", "  /// @example\n  ///     u.Terminate\n", "", "Terminate has no @example"),
    ("an example that is not indented", "  ///     u.Terminate\n", "  /// u.Terminate\n", "is not indented"),
    ("a backslash at the end", "  ///     u.Terminate\n", "  ///     u.Terminate \\\n", "ends with a backslash"),
    ("a long sentence", "  /// Ends the host's use of the library:", "  /// " + "Long " * 20 + "ends the library:",
     "characters; 120 fit a help string"),
    ("no text", "  /// True, whatever the address is: the test is disabled.\n", "",
     "the text of PingSite does not begin with a sentence"),
]


def main():
    with open(os.path.join(TOP, HEADER), encoding="utf-8") as header:
        original = header.read()
    failed = 0
    for name, before, after, complaint in ROWS:
        changed = original.replace(before, after, 1)
        assert changed != original, before
        member_texts.open = lambda path, **how: open(path, **how) if HEADER not in path else io.StringIO(changed)
        member_texts.errors.clear()
        member_texts.read_all()
        line = original[:original.index(before)].count("\n") + 1
        found = [error for error in member_texts.errors if complaint in error and error.startswith(HEADER)]
        # A complaint about a whole member names its declaration, which follows.
        if not any(line <= int(error.split(":")[1]) <= line + 30 for error in found):
            failed += 1
            print(f"FAILED {name}: expected {complaint!r} at line {line} or soon after, got {member_texts.errors}")
    print(f"{len(ROWS) - failed} passed, {failed} failed")
    return 1 if failed else 0


if __name__ == "__main__":
    sys.exit(main())
