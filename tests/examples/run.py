#!/usr/bin/env python3
"""Runs the examples in the members' texts and compares what they print with the comments below each Print.

  run.py native TALUTIL                 runs them by `talutil batch`
  run.py scripts TALUTIL FOLDER         writes scripts that run them through the DLL: all.vbs and one for each example
                                        with a window, for which it prints a line: its name and, for each window, the
                                        keys of its user, blanks in between
  run.py compare TALUTIL OUTPUT...      compares what scripts have printed

Whatever fails is a line; the last line is "N passed, N failed".
"""
import json
import os
import re
import subprocess
import sys
import tempfile
from dataclasses import dataclass

import language

HERE = os.path.dirname(os.path.abspath(__file__))

# Controls and forms of a host, which only scripts can make: see host_objects.vbs.
HOST_OBJECTS = re.compile(r'(?<!")\b(frmBooking|cboBranch|txtNotes|lstBranches|picSchedule)\b(?!")')
KEYS = re.compile(r"^' The user (types|presses): (.*)$", re.M)


@dataclass
class Example:
    name: str
    number: int
    code: str
    has_window: bool

    @property
    def folder(self):
        return f"C:\\EXAMPLES\\{self.number}"

    @property
    def needs_dll(self):
        return self.has_window or HOST_OBJECTS.search(self.code)

    @property
    def expected(self):
        return [line for statement in language.read(self.code) for line in statement.expected]


def read_reference(talutil):
    reference = json.loads(subprocess.run([talutil, "reference", "--json"], check=True, capture_output=True).stdout)
    return reference["classes"]


def examples_of(classes):
    examples = []
    for owner in classes:
        for member in [owner] + owner["members"]:
            name = owner["name"] if member is owner else f"{owner['name']}.{member['name']}"
            for example in member["examples"]:
                examples.append(Example(name, len(examples) + 1, example["code"], example["windows"]))
    return examples


class Batch:
    """The members, natively."""

    def __init__(self, talutil, classes, folder, **environment):
        self.parameters = {owner["name"]: {member["name"].lower(): member["parameters"] for member in owner["members"]}
                           for owner in classes}
        self.classes = {0: "ORVUtils"}
        environment = dict(os.environ, TALUTIL_HIVE=os.path.join(folder, "hive.db"),
                           TALUTIL_DRIVES=os.path.join(folder, "drives"), LC_ALL="C.UTF-8", **environment)
        self.process = subprocess.Popen([talutil, "batch"], stdin=subprocess.PIPE, stdout=subprocess.PIPE, text=True,
                                        encoding="utf-8", env=environment)

    def close(self):
        self.process.stdin.close()
        self.process.wait()
        self.process.stdout.close()

    def ask(self, request, target=None):
        if target and target["object"]:
            request["on"] = target["object"]
        self.process.stdin.write(json.dumps(request) + "\n")
        self.process.stdin.flush()
        answer = json.loads(self.process.stdout.readline() or '{"error": {"description": "no answer"}}')
        if "error" in answer:
            error = answer["error"]
            if error.get("source") == "talutil" or "number" not in error:
                raise language.Mistake(error["description"])
            raise language.RunTimeError(error["number"], error["description"])
        return answer

    def create(self, program_id):
        name = program_id.partition(".")[2]
        result = self.ask({"create": name})["result"]
        self.classes[result["object"]] = name
        return result

    def use(self, target, name, arguments):
        answer = self.ask({"call": name, "args": arguments}, target)
        parameters = self.parameters[self.classes[target["object"]]].get(name.lower(), [])
        written = answer.get("arguments", {})
        return answer.get("result"), [(position, written[parameter["name"]])
                                      for position, parameter in enumerate(parameters) if parameter["name"] in written]

    def put(self, target, name, arguments, value):
        self.ask({"call": name, "args": arguments + [value]}, target)


class Verdicts:
    def __init__(self):
        self.passed = self.failed = 0

    def check(self, name, holds, *lines):
        self.passed += bool(holds)
        self.failed += not holds
        if not holds:
            print(f"FAILED {name}", *lines, sep="\n  ")

    def note(self, example, expected, actual):
        self.check(f"the example of {example.name} (number {example.number})", expected == actual,
                   f"expected: {expected}", f"actual:   {actual}")

    def close(self):
        print(f"{self.passed} passed, {self.failed} failed")
        return 1 if self.failed else 0


def run_natively(talutil, classes, example):
    with tempfile.TemporaryDirectory() as folder:
        os.makedirs(os.path.join(folder, "drives", "c", "EXAMPLES", str(example.number)))
        batch = Batch(talutil, classes, folder, TZ="UTC")
        interpreter = language.Interpreter(batch, {"u": {"object": 0}, "folder": example.folder})
        try:
            interpreter.run(language.read(example.code))
        except (language.Mistake, language.RunTimeError) as error:
            interpreter.printed.append(str(error))
        finally:
            batch.close()
        return "\n".join(interpreter.printed).replace("\r\n", "\n").split("\n") if interpreter.printed else []


def native(talutil):
    classes, verdicts = read_reference(talutil), Verdicts()
    for example in examples_of(classes):
        if not example.needs_dll:
            verdicts.note(example, example.expected, run_natively(talutil, classes, example))
    return verdicts.close()


# ---- Scripts for the DLL

def restored_settings(classes, example):
    """Puts back what an example has put into settings: those of one script are shared."""
    lines = []
    for member in classes[0]["members"]:
        name, kind = member["name"], member["type"]
        is_put = re.search(rf"\bu\.{name} = ", example.code, re.I)
        if is_put and kind in ("String", "Boolean", "Integer", "Long", "Single"):
            lines.append(f'  u.{name} = {dict(String=chr(34) * 2, Boolean="False").get(kind, "0")}')
        if member["access"] == "put" and re.search(rf"\bSet u\.{name} = ", example.code, re.I):
            lines.append(f"  Set u.{name} = Nothing")
    return lines


def script_of(example, classes):
    # Scripts of another language cannot read the properties of a JScript object by themselves in every script host.
    code = re.sub(HOST_OBJECTS.pattern + r"\.(\w+)(?=$| &)", r'property_of(\1, "\2")', example.code, flags=re.M)
    # Joined to a text, because the output shows a Boolean as a number otherwise.
    body = [re.sub(r"^Print (.*)", r'WScript.Echo "" & (\1)', line) for line in code.split("\n")]
    if "On Error Resume Next" in body:
        body.append("Err.Clear")
    return [f"Sub Example{example.number}(folder)", *("  " + line for line in body), "End Sub",
            f'WScript.Echo "== {example.number}"', f'MakeFolder "{example.folder}"', "Err.Clear",
            f'Example{example.number} "{example.folder}"',
            'If Err.Number <> 0 Then WScript.Echo "error " & Err.Number & ": " & Err.Description',
            "Err.Clear", *restored_settings(classes, example), "NewHostObjects", ""]


def write_script(path, examples, classes):
    with open(os.path.join(HERE, "host_objects.vbs"), encoding="utf-8") as source:
        lines = [source.read()]
    for example in examples:
        lines += script_of(example, classes)
    lines += ['WScript.Echo "== end"']
    with open(path, "w", encoding="cp1252", newline="\r\n") as output:
        output.write("\n".join(lines))


def keys_of(what, text):
    """A key, or the letters of a text and the Return key, as user_client takes them."""
    if what == "presses":
        return {"Return": "{ENTER}", "Escape": "{ESC}"}[text]
    return "".join(f"{{SHIFT+{letter}}}" if letter.isupper() else letter for letter in text) + "{ENTER}"


def scripts(talutil, folder):
    classes = read_reference(talutil)
    examples = examples_of(classes)
    write_script(os.path.join(folder, "all.vbs"), [each for each in examples if not each.has_window], classes)
    for example in [each for each in examples if each.has_window]:
        name = f"example_{example.number}.vbs"
        write_script(os.path.join(folder, name), [example], classes)
        print(name, *(keys_of(what, text.strip()) for what, text in KEYS.findall(example.code)))
    return 0


def compare(talutil, *paths):
    classes, verdicts = read_reference(talutil), Verdicts()
    examples = {example.number: example for example in examples_of(classes)}
    for path in paths:
        with open(path, encoding="utf-8", errors="replace") as output:
            parts = re.split(r"^== (\w+)\n", output.read().replace("\r\n", "\n"), flags=re.M)
        for number, text in zip(parts[1::2], parts[2::2]):
            if number != "end":
                example = examples[int(number)]
                verdicts.note(example, example.expected, text.split("\n")[:-1])
        if len(parts) < 2 or parts[-2] != "end":
            verdicts.check(f"{path}: the script ended early", False)
    return verdicts.close()


def main(arguments):
    actions = {"native": native, "scripts": scripts, "compare": compare}
    if len(arguments) < 2 or arguments[0] not in actions:
        print(__doc__, file=sys.stderr)
        return 2
    return actions[arguments[0]](*arguments[1:])


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
