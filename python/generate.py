#!/usr/bin/env python3
"""Writes the Python class of the toolkit: talutil list --json | python/generate.py >members.py"""

import json
import sys
import textwrap

HEAD = '''"""The members of the toolkit. Made from the table of the interface."""

from __future__ import annotations

import datetime
from typing import Any, NamedTuple, Optional

from .library import Library, Object


'''

CLASS = '''class ORVUtils(Object):
    """The toolkit. Without a library it starts one of its own; toolkits of one library share their settings.

    Errors are raised as RunTimeError. A member that writes arguments back returns them with its result in a tuple.
    """

    def __init__(self, library: Optional[Library] = None, code_page: Optional[int] = None) -> None:
        super().__init__(library or Library(code_page))
'''

HINTS = {"Boolean": "bool", "Integer": "int", "Long": "int", "Single": "float", "Date": "datetime.datetime",
         "String": "str", "Variant": "Any", "String()": "list[str]", "SYSTEMTIME": "dict[str, int]"}


def docstring(text, indent):
    lines = textwrap.wrap(text, 110 - indent)
    if len(lines) == 1:
        return f'{" " * indent}"""{lines[0]}"""\n'
    return textwrap.indent('"""' + "\n".join(lines) + '\n"""\n', " " * indent)


def written_back(member):
    return [parameter for parameter in member["parameters"] if parameter["written_back"]]


def result_class(member):
    fields = ([] if member["type"] == "" else [f'    result: {HINTS[member["type"]]}\n'])
    fields += [f'    {p["name"]}: {HINTS[p["type"]]}\n' for p in written_back(member)]
    return (f'class {member["name"]}Result(NamedTuple):\n    """What {member["name"]} returns."""\n\n'
            + "".join(fields) + "\n\n")


def parameter_text(parameter):
    text = f'{parameter["name"]}: {HINTS[parameter["type"]]}'
    return text + f' = {parameter["default"]!r}' if parameter["optional"] else text


def method(member):
    names = ", ".join(p["name"] for p in member["parameters"])
    parameters = "".join(", " + parameter_text(p) for p in member["parameters"])
    returned = f'{member["name"]}Result' if written_back(member) else HINTS.get(member["type"], "None")
    head = f'\n    def {member["name"]}(self{parameters}) -> {returned}:\n' + docstring(member["help"], 8)
    call = f'self._request("{member["name"]}", [{names}])'
    if written_back(member):
        first = "" if member["type"] == "" else "result, "
        return (head + f'        result, after = {call}\n'
                f'        return {returned}({first}**after)\n')
    return head + (f"        {call}\n" if member["type"] == "" else f"        return {call}[0]\n")


def property_of(member):
    name, hint = member["name"], HINTS[member["type"]]
    text = ""
    if "get" in member["access"]:
        text += f"\n    @property\n    def {name}(self) -> {hint}:\n" + docstring(member["help"], 8)
        text += f'        return self.get("{name}")\n'
    if "put" in member["access"]:
        setter = f"\n    @{name}.setter\n" if text else "\n"
        text += setter + f"    def {name}(self, value: {hint}) -> None:\n"
        text += "" if "get" in member["access"] else docstring(member["help"], 8)
        text += f'        self.put("{name}", value)\n'
        if "get" not in member["access"]:
            text += f"\n    {name} = property(None, {name}, None, {name}.__doc__)\n"
    return text


def main():
    members = json.load(sys.stdin)
    methods = [member for member in members if member["access"] == "call"]
    text = HEAD + "".join(result_class(member) for member in methods if written_back(member)) + CLASS
    for member in members:
        text += method(member) if member["access"] == "call" else property_of(member)
    sys.stdout.write(text)


main()
