"""The language of the examples in the members' texts: a small part of VBScript that is VBA as well. Reads it, and runs
it by an evaluator of members; see run.py."""
import ast
import operator
import re
from dataclasses import dataclass, field

TOKEN = re.compile(r'\s*(?:"((?:[^"]|"")*)"|(\d+(?:\.\d+)?|[A-Za-z]\w*)|(<>|[().,&+=<>-]))')
STATEMENTS = [("resume", re.compile("On Error Resume Next$")), ("print", re.compile("Print (.*)")),
              ("assign", re.compile(r"(?:Set )?([\w.]+(?:\([^=]*\))?) = (.*)")),
              ("use", re.compile(r"([\w.]+)(?: (.*))?$"))]
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
class Statement:
    kind: str  # One of STATEMENTS.
    parts: list  # What is printed or used; of an assignment, the target and the value.
    expected: list = field(default_factory=list)


def expression(code):
    """An expression as Python has it, whose operators bind in the same order."""
    words, at = [], 0
    while code[at:].strip():
        match = TOKEN.match(code, at)
        if not match:
            raise Mistake(f"cannot read {code[at:]!r} in {code!r}")
        text, word, mark = match.groups()
        words.append(word or {"<>": "!=", "=": "=="}.get(mark, mark) or repr(text.replace('""', '"')))
        at = match.end()
    try:
        return ast.parse(" ".join(words), mode="eval").body
    except SyntaxError as error:
        raise Mistake(f"cannot read {code!r}") from error


def read_statement(line):
    for kind, pattern in STATEMENTS:
        if match := pattern.match(line):
            parts = [f"{match[1]}({match[2] or ''})"] if kind == "use" else match.groups()
            return Statement(kind, [expression(part) for part in parts])
    raise Mistake(f"{line!r} is no statement")


def read(code):
    """The statements of an example; the comments directly below a Print are its expected lines."""
    statements, is_answer = [], False
    for line in code.split("\n"):
        if line.startswith("'"):
            if is_answer:
                statements[-1].expected.append(line[2:])
        elif line.strip():
            statements.append(read_statement(line))
            is_answer = statements[-1].kind == "print"
        else:
            is_answer = False
    return statements


NUMBERS = ("integer", "long", "byte", "single", "double")


def text_of(value):
    """A value as the host's output shows it."""
    if isinstance(value, dict) and next(iter(value)) in NUMBERS:
        value = next(iter(value.values()))
    if isinstance(value, (str, bool, int)):
        return str(value)
    if isinstance(value, float):
        return f"{value:.15g}"
    if value == EMPTY:
        return ""
    raise Mistake(f"do not print {value!r}: hosts show it differently")


FUNCTIONS = {
    "array": lambda *values: list(values),
    "chr": chr,
    "len": lambda value: len(text_of(value)),
    "isempty": lambda value: value == EMPTY,
    "typename": lambda value: {str: "String", bool: "Boolean"}.get(type(value), "(depends on the host)"),
    "ubound": lambda value: len(value) - 1,
    "dateserial": lambda y, m, d: {"date": f"{y:04}-{m:02}-{d:02}T00:00:00"},
    "timeserial": lambda h, m, s: {"date": f"1899-12-30T{h:02}:{m:02}:{s:02}"},
}


def plus(left, right):
    """Numbers are added, texts joined; a day and a time of day become a date with a time."""
    if isinstance(left, dict) and isinstance(right, dict):
        return {"date": left["date"][:11] + right["date"][11:]}
    return left + right


OPERATORS = {ast.BitAnd: lambda left, right: text_of(left) + text_of(right), ast.Add: plus, ast.Eq: operator.eq,
             ast.NotEq: operator.ne, ast.Lt: operator.lt, ast.Gt: operator.gt}


class Interpreter:
    """Runs statements. `members` creates objects, and gets, puts and calls what they have:
    create(class) -> object, use(object, name, arguments) -> (result, values written back), put(object, name, arguments,
    value). Arguments that are variables may be written back, by position."""

    def __init__(self, members, variables):
        self.members, self.variables = members, CONSTANTS | variables
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
        self.resumes |= statement.kind == "resume"
        if statement.kind == "assign":
            self.assign(statement.parts[0], self.value(statement.parts[1]))
        elif statement.kind != "resume":
            value = self.value(statement.parts[0])
            if statement.kind == "print":
                self.printed.append(text_of(value))

    def assign(self, target, value):
        arguments = []
        if isinstance(target, ast.Call):
            arguments, target = [self.value(part) for part in target.args], target.func
        if isinstance(target, ast.Attribute):
            self.members.put(self.value(target.value), target.attr, arguments, value)
        elif isinstance(target, ast.Name) and not arguments:
            self.variables[target.id.lower()] = value
        else:
            raise Mistake("only variables and properties can be assigned")

    def value(self, node):
        match node:
            case ast.Constant():
                return node.value
            case ast.Name():
                return self.variables.get(node.id.lower(), EMPTY)
            case ast.UnaryOp(op=ast.USub()):
                return -self.value(node.operand)
            case ast.BinOp(left, op, right) | ast.Compare(left, [op], [right]):
                return OPERATORS[type(op)](self.value(left), self.value(right))
            case ast.Attribute():
                return self.use_member(node, [])
            case ast.Call(ast.Attribute() as member, parts):
                return self.use_member(member, parts)
            case ast.Call(ast.Name() as name, parts):
                return self.call(name.id.lower(), [self.value(part) for part in parts])
        raise Mistake(f"{ast.unparse(node)} is not in the language")

    def call(self, name, values):
        """An element of an array, or a function of the host's language."""
        if name == "createobject":
            return self.members.create(values[0])
        if name in self.variables:
            return self.variables[name][values[0]]
        if name not in FUNCTIONS:
            raise Mistake(f"there is no function {name}")
        return FUNCTIONS[name](*values)

    def use_member(self, member, parts):
        if isinstance(member.value, ast.Name) and member.value.id == "Err":
            return self.error[member.attr != "Number"]
        result, written_back = self.members.use(self.value(member.value), member.attr, list(map(self.value, parts)))
        for position, value in written_back:
            if position < len(parts) and isinstance(parts[position], ast.Name):
                self.variables[parts[position].id.lower()] = value
        return result
