"""The language of the examples in the members' texts: a small part of VBScript that is VBA as well. Reads it, and runs
it by an evaluator of members; see run.py."""
import operator
import re
from dataclasses import dataclass, field

TOKEN = re.compile(r'\s*(?:"((?:[^"]|"")*)"|(\d+(?:\.\d+)?)|([A-Za-z]\w*)|(<>|[().,&+=<>-]))')
EMPTY = {"empty": True}
CONSTANTS = {"true": True, "false": False, "null": None, "empty": EMPTY, "vbcrlf": "\r\n", "vbtab": "\t"}


class Mistake(Exception):
    """The example is not written in the language."""


class RunTimeError(Exception):
    """An error that the example may handle."""

    def __init__(self, number, description):
        super().__init__(f"error {number}: {description}")
        self.number, self.description = number, description


@dataclass
class Node:
    kind: str  # value, name, member, call or operator
    value: object = None
    parts: list = field(default_factory=list)


@dataclass
class Statement:
    kind: str  # print, assign, use or resume
    target: Node = None
    value: Node = None
    expected: list = field(default_factory=list)


class Parser:
    def __init__(self, line):
        self.line, self.tokens, at = line, [], 0
        while line[at:].strip():
            match = TOKEN.match(line, at)
            if not match:
                raise Mistake(f"cannot read {line[at:]!r} in {line!r}")
            text, number, name, mark = match.groups()
            if text is not None:
                self.tokens.append(("text", text.replace('""', '"')))
            elif number is not None:
                self.tokens.append(("number", float(number) if "." in number else int(number)))
            else:
                self.tokens.append(("name", name) if name else ("mark", mark))
            at = match.end()
        self.at = 0

    def peek(self, value=None):
        token = self.tokens[self.at] if self.at < len(self.tokens) else (None, None)
        return token if value is None else token == ("mark", value)

    def take(self, value=None):
        token = self.peek()
        if token[0] is None or value is not None and not self.peek(value):
            raise Mistake(f"expected {value or 'more'} in {self.line!r}")
        self.at += 1
        return token

    def arguments(self, end):
        parts = []
        while not (self.peek(end) if end else self.peek()[0] is None):
            parts.append(self.expression())
            if not self.peek(","):
                break
            self.take(",")
        if end:
            self.take(end)
        return parts

    def primary(self):
        kind, value = self.take()
        if kind in ("text", "number"):
            return Node("value", value)
        if (kind, value) == ("mark", "-"):
            return Node("value", -self.primary().value)
        if (kind, value) == ("mark", "("):
            inner = self.expression()
            self.take(")")
            return inner
        if kind != "name":
            raise Mistake(f"unexpected {value} in {self.line!r}")
        node = Node("value", CONSTANTS[value.lower()]) if value.lower() in CONSTANTS else Node("name", value)
        while self.peek(".") or self.peek("("):
            if self.take()[1] == ".":
                node = Node("member", self.take()[1], [node])
            else:
                node = Node("call", node, self.arguments(")"))
        return node

    def expression(self):
        node = self.primary()
        while self.peek("&") or self.peek("+"):
            node = Node("operator", self.take()[1], [node, self.primary()])
        return node

    def comparison(self):
        node = self.expression()
        if any(self.peek(mark) for mark in COMPARISONS):
            node = Node("operator", self.take()[1], [node, self.expression()])
        return node

    def statement(self):
        if self.line == "On Error Resume Next":
            return Statement("resume")
        if self.tokens[0] == ("name", "Print"):
            self.take()
            result = Statement("print", value=self.comparison())
        else:
            if self.tokens[0] == ("name", "Set"):
                self.take()
            target = self.primary()
            if self.peek("="):
                self.take()
                result = Statement("assign", target, self.expression())
            else:
                parts = self.arguments(None)
                result = Statement("use", Node("call", target, parts) if target.kind != "call" else target)
        if self.peek()[0] is not None:
            raise Mistake(f"did not expect {self.peek()[1]} in {self.line!r}")
        return result


def read(code):
    """The statements of an example; the comments directly below a Print are its expected lines."""
    statements, is_answer = [], False
    for line in code.split("\n"):
        if line.startswith("'"):
            if is_answer:
                statements[-1].expected.append(line[2:])
        elif line.strip():
            statements.append(Parser(line).statement())
            is_answer = statements[-1].kind == "print"
        else:
            is_answer = False
    return statements


NUMBERS = ("integer", "long", "byte", "single", "double")


def text_of(value):
    """A value as the host's output shows it."""
    if isinstance(value, dict) and next(iter(value)) in NUMBERS:
        value = next(iter(value.values()))
    if isinstance(value, str):
        return value
    if isinstance(value, (bool, int)):
        return str(value)
    if isinstance(value, float):
        return f"{value:.15g}"
    if value == EMPTY:
        return ""
    raise Mistake(f"do not print {value!r}: hosts show it differently")


def type_name(value):
    if isinstance(value, dict):
        return {"empty": "Empty", "date": "Date", "object": "Object", "currency": "Currency"}[next(iter(value))]
    names = {str: "String", bool: "Boolean", float: "Double", list: "String()", type(None): "Null"}
    if type(value) not in names:
        raise Mistake(f"TypeName of {value!r} depends on the host")
    return names[type(value)]


def upper_bound(value):
    return len(value) - 1


FUNCTIONS = {
    "array": lambda *values: list(values),
    "chr": chr,
    "len": lambda value: len(text_of(value)),
    "isnull": lambda value: value is None,
    "isempty": lambda value: value == EMPTY,
    "typename": type_name,
    "ubound": upper_bound,
    "dateserial": lambda y, m, d: {"date": f"{y:04}-{m:02}-{d:02}T00:00:00"},
    "timeserial": lambda h, m, s: {"date": f"1899-12-30T{h:02}:{m:02}:{s:02}"},
}


def plus(left, right):
    """Numbers are added, texts joined; a day and a time of day become a date with a time."""
    if isinstance(left, dict) and isinstance(right, dict):
        return {"date": left["date"][:11] + right["date"][11:]}
    return left + right


COMPARISONS = {"=": operator.eq, "<>": operator.ne, "<": operator.lt, ">": operator.gt}
OPERATORS = {"&": lambda left, right: text_of(left) + text_of(right), "+": plus, **COMPARISONS}


class Interpreter:
    """Runs statements. `members` creates objects, and gets, puts and calls what they have:
    create(class) -> object, use(object, name, arguments) -> (result, values written back), put(object, name, arguments,
    value). Arguments that are variables may be written back, by position."""

    def __init__(self, members, variables):
        self.members, self.variables = members, dict(variables)
        self.error, self.resumes, self.printed = (0, ""), False, []

    def run(self, statements):
        for statement in statements:
            try:
                self.execute(statement)
            except RunTimeError as error:
                if not self.resumes:
                    raise
                self.error = (error.number, error.description)

    def execute(self, statement):
        if statement.kind == "resume":
            self.resumes = True
        elif statement.kind == "print":
            self.printed.append(text_of(self.value(statement.value)))
        elif statement.kind == "assign":
            self.assign(statement.target, self.value(statement.value))
        else:
            self.value(statement.target)

    def assign(self, target, value):
        arguments = []
        if target.kind == "call":
            arguments, target = [self.value(part) for part in target.parts], target.value
        if target.kind == "member":
            self.members.put(self.value(target.parts[0]), target.value, arguments, value)
        elif target.kind == "name" and not arguments:
            self.variables[target.value.lower()] = value
        else:
            raise Mistake("only variables and properties can be assigned")

    def value(self, node):
        if node.kind == "value":
            return node.value
        if node.kind == "name":
            return self.variables.get(node.value.lower(), EMPTY)
        if node.kind == "operator":
            left, right = (self.value(part) for part in node.parts)
            return OPERATORS[node.value](left, right)
        if node.kind == "member":
            return self.use_member(node, [])
        if node.value.kind == "member":
            return self.use_member(node.value, node.parts)
        return self.call(node.value.value, node.parts)

    def call(self, name, parts):
        """An element of an array, or a function of the host's language."""
        key, values = name.lower(), [self.value(part) for part in parts]
        if key == "createobject":
            return self.members.create(values[0])
        if key in self.variables:
            return self.variables[key][values[0]]
        if key not in FUNCTIONS:
            raise Mistake(f"there is no function {name}")
        return FUNCTIONS[key](*values)

    def use_member(self, member, parts):
        owner = member.parts[0]
        if owner.kind == "name" and owner.value == "Err":
            return self.error[0 if member.value == "Number" else 1]
        result, written_back = self.members.use(self.value(owner), member.value, [self.value(part) for part in parts])
        for position, value in written_back:
            if position < len(parts) and parts[position].kind == "name":
                self.variables[parts[position].value.lower()] = value
        return result
