"""The small edits that can be made to a source, found in the compiler's syntax tree."""

import collections.abc
import dataclasses
import pathlib
import re

import clang.cindex as cindex
from clang.cindex import Cursor, CursorKind, TypeKind

TURNED = {"<": ">=", ">": "<=", "<=": ">", ">=": "<", "==": "!=", "!=": "=="}
MOVED = {"<": "<=", ">": ">=", "<=": "<", ">=": ">"}
REPLACED = {"+": "-", "-": "+", "*": "/", "/": "*", "%": "*", "<<": ">>", ">>": "<<", "&": "|", "|": "&",
            "+=": "-=", "-=": "+=", "*=": "/=", "/=": "*=", "&=": "|=", "|=": "&=",
            "&&": "||", "||": "&&"}
ASSIGNMENTS = ("=", "+=", "-=", "*=", "/=", "%=", "&=", "|=", "^=", "<<=", ">>=")

FUNCTIONS = (CursorKind.FUNCTION_DECL, CursorKind.CXX_METHOD, CursorKind.CONSTRUCTOR, CursorKind.DESTRUCTOR,
             CursorKind.CONVERSION_FUNCTION, CursorKind.FUNCTION_TEMPLATE)
SCOPES = FUNCTIONS + (CursorKind.NAMESPACE, CursorKind.CLASS_DECL, CursorKind.STRUCT_DECL,
                      CursorKind.CLASS_TEMPLATE)


class UnreadableSource(Exception):
    """What the compiler has to say of a source that it cannot read."""


@dataclasses.dataclass(frozen=True)
class Edit:
    """Puts `text` in place of the bytes from `start` to `end` of a source."""

    source: str
    """The path in the tree."""
    function: str
    """Which function it is made in; empty outside of all."""
    kind: str
    start: int
    end: int
    text: str

    def applied(self, content: bytes) -> bytes:
        return content[: self.start] + self.text.encode() + content[self.end:]

    def diff(self, content: bytes) -> tuple[str, ...]:
        """The lines that it takes away and puts in place, without their indentation."""
        first = content.rfind(b"\n", 0, self.start) + 1
        last = content.find(b"\n", self.end)
        last = len(content) if last < 0 else last
        before = content[first:last]
        after = content[first: self.start] + self.text.encode() + content[self.end: last]
        return tuple(sign + line.strip() for sign, text in (("-", before), ("+", after))
                     for line in text.decode().splitlines())


Change = tuple[str, int, int, str]
"""A kind of edit, and from where to where which text replaces what is there."""


def start_of(cursor: Cursor) -> int:
    return cursor.extent.start.offset


def end_of(cursor: Cursor) -> int:
    return cursor.extent.end.offset


def children(cursor: Cursor) -> list[Cursor]:
    return list(cursor.get_children())


def bare(cursor: Cursor) -> Cursor:
    """Without the conversions that the compiler adds around an expression."""
    while cursor.kind == CursorKind.UNEXPOSED_EXPR and len(inner := children(cursor)) == 1:
        cursor = inner[0]
    return cursor


class Finder:
    """Finds the edits of one source."""

    def __init__(self, source: str, content: bytes) -> None:
        self._source = source
        self._content = content

    def edits(self, unit: cindex.TranslationUnit) -> list[Edit]:
        """In the order of the source, each once."""
        found = (edit for cursor in children(unit.cursor)
                 if cursor.location.file and cursor.location.file.name == unit.spelling
                 for edit in self._below(cursor, "", None))
        return sorted(set(found), key=lambda edit: (edit.start, edit.end, edit.text))

    def _text(self, start: int, end: int) -> str:
        return self._content[start:end].decode()

    def _text_of(self, cursor: Cursor) -> str:
        return self._text(start_of(cursor), end_of(cursor))

    def _below(self, cursor: Cursor, function: str, result: cindex.Type | None
               ) -> collections.abc.Iterator[Edit]:
        if cursor.kind == CursorKind.STATIC_ASSERT:
            return
        if cursor.kind in FUNCTIONS:
            function, result = qualified_name(cursor), cursor.result_type
        if cursor.kind == CursorKind.LAMBDA_EXPR:
            result = None
        for kind, start, end, text in self._changes(cursor, result):
            if self._text(start, end) != text:
                yield Edit(self._source, function, kind, start, end, text)
        inner = children(cursor)
        for child in inner[1:] if cursor.kind == CursorKind.CASE_STMT else inner:
            yield from self._below(child, function, result)

    def _changes(self, cursor: Cursor, result: cindex.Type | None) -> collections.abc.Iterator[Change]:
        match cursor.kind:
            case (CursorKind.BINARY_OPERATOR | CursorKind.COMPOUND_ASSIGNMENT_OPERATOR
                  | CursorKind.CALL_EXPR | CursorKind.UNEXPOSED_EXPR):
                yield from self._operators(cursor)
            case CursorKind.UNARY_OPERATOR:
                yield from self._signs(cursor)
            case CursorKind.CXX_BOOL_LITERAL_EXPR | CursorKind.INTEGER_LITERAL | CursorKind.FLOATING_LITERAL:
                yield from self._numbers(cursor)
            case CursorKind.STRING_LITERAL:
                yield from self._strings(cursor)
            case CursorKind.DECL_REF_EXPR:
                yield from self._enumerators(cursor)
            case CursorKind.IF_STMT | CursorKind.WHILE_STMT:
                yield from self._conditions(cursor)
            case CursorKind.CONDITIONAL_OPERATOR:
                condition = children(cursor)[0]
                for text in ("true", "false"):
                    yield "condition made constant", start_of(condition), end_of(condition), text
            case CursorKind.RETURN_STMT:
                yield from self._returns(cursor, result)
            case CursorKind.COMPOUND_STMT:
                yield from self._statements(cursor)

    def _operators(self, cursor: Cursor) -> collections.abc.Iterator[Change]:
        operands = sorted(children(cursor), key=start_of)
        if len(operands) < 2:
            return
        left, right = operands[0], operands[-1]
        between = self._text(end_of(left), start_of(right))
        operator = between.strip()
        start = end_of(left) + len(between[: len(between) - len(between.lstrip())].encode())
        end = start + len(operator.encode())
        if operator in TURNED:
            yield "comparison turned", start, end, TURNED[operator]
        if operator in MOVED:
            yield "boundary moved", start, end, MOVED[operator]
        if operator in REPLACED and cursor.kind != CursorKind.CALL_EXPR:
            yield "operator replaced", start, end, REPLACED[operator]

    def _signs(self, cursor: Cursor) -> collections.abc.Iterator[Change]:
        start, end, text = start_of(cursor), end_of(cursor), self._text_of(cursor)
        if text.startswith(("++", "--")):
            yield "operator replaced", start, start + 2, "--" if text.startswith("++") else "++"
        elif text.endswith(("++", "--")):
            yield "operator replaced", end - 2, end, "--" if text.endswith("++") else "++"
        elif text.startswith("!"):
            yield "negation dropped", start, start + 1, ""
        elif text.startswith("-"):
            yield "operator replaced", start, start + 1, "+"

    def _numbers(self, cursor: Cursor) -> collections.abc.Iterator[Change]:
        start, text = start_of(cursor), self._text_of(cursor)
        if text in ("true", "false"):
            yield "constant changed", start, end_of(cursor), "false" if text == "true" else "true"
        elif text.startswith(("0x", "0b")):
            yield "constant changed", start, end_of(cursor), "1" if int(text.rstrip("uUlL"), 0) == 0 else "0"
        elif digits := re.match(r"[\d']+", text):
            number = int(digits[0].replace("'", ""))
            yield "constant changed", start, start + len(digits[0]), str(0 if number == 1 else number + 1)

    def _strings(self, cursor: Cursor) -> collections.abc.Iterator[Change]:
        text = self._text_of(cursor)
        if re.fullmatch(r'"([^"\\]|\\.)*"', text):
            yield "constant changed", end_of(cursor) - 1, end_of(cursor), '~"'

    def _enumerators(self, cursor: Cursor) -> collections.abc.Iterator[Change]:
        chosen = cursor.referenced
        if chosen is None or chosen.kind != CursorKind.ENUM_CONSTANT_DECL:
            return
        if not re.search(rf"\b{chosen.spelling}$", self._text_of(cursor)):
            return
        all_of_them = [child for child in children(chosen.semantic_parent)
                       if child.kind == CursorKind.ENUM_CONSTANT_DECL]
        place = next(i for i, other in enumerate(all_of_them) if other.spelling == chosen.spelling)
        for other in all_of_them[place + 1:] + all_of_them[:place]:
            if other.enum_value != chosen.enum_value:
                end = end_of(cursor)
                yield "constant changed", end - len(chosen.spelling.encode()), end, other.spelling
                return

    def _conditions(self, cursor: Cursor) -> collections.abc.Iterator[Change]:
        body = next((child for child in children(cursor) if child.kind == CursorKind.COMPOUND_STMT), None)
        if body is None:
            return
        start = self._content.index(b"(", start_of(cursor)) + 1
        end = self._content.rindex(b")", start, start_of(body))
        text = self._text(start, end)
        kept = ""  # what the body may use
        if ";" in text:
            kept = text[: text.rindex(";") + 1] + " "
        elif any(child.kind in (CursorKind.VAR_DECL, CursorKind.DECL_STMT) for child in children(cursor)):
            kept = text + "; "
        for value in ("true", "false") if cursor.kind == CursorKind.IF_STMT else ("false",):
            yield "condition made constant", start, end, kept + value

    def _returns(self, cursor: Cursor, result: cindex.Type | None) -> collections.abc.Iterator[Change]:
        values = children(cursor)
        if not values or result is None or result.get_canonical().kind in (
                TypeKind.LVALUEREFERENCE, TypeKind.AUTO):
            return
        value = bare(values[0])
        is_zero = (value.kind == CursorKind.DECL_REF_EXPR and value.referenced is not None
                   and value.referenced.kind == CursorKind.ENUM_CONSTANT_DECL
                   and value.referenced.enum_value == 0)
        if not is_zero and self._text_of(value) not in ("{}", "nullptr", "std::nullopt", "true", "false", "0"):
            yield "default returned", start_of(values[0]), end_of(values[0]), "{}"

    def _statements(self, cursor: Cursor) -> collections.abc.Iterator[Change]:
        previous = None
        for statement in children(cursor):
            expression = bare(statement)
            if self._has_effect(expression):
                yield "statement dropped", start_of(statement), end_of(statement), ""
            is_call = expression.kind == CursorKind.CALL_EXPR
            if is_call and previous is not None:
                between = self._text(end_of(previous), start_of(statement))
                swapped = self._text_of(statement) + between + self._text_of(previous)
                yield "statements swapped", start_of(previous), end_of(statement), swapped
            previous = statement if is_call else None

    def _has_effect(self, expression: Cursor) -> bool:
        match expression.kind:
            case CursorKind.CALL_EXPR | CursorKind.COMPOUND_ASSIGNMENT_OPERATOR:
                return True
            case CursorKind.UNARY_OPERATOR:
                return self._text_of(expression).startswith(("++", "--"))
            case CursorKind.BINARY_OPERATOR:
                left, right = children(expression)
                return self._text(end_of(left), start_of(right)).strip() in ASSIGNMENTS
        return False


def qualified_name(cursor: Cursor) -> str:
    names = []
    while cursor is not None and cursor.kind in SCOPES:
        if not cursor.is_anonymous() and cursor.spelling:
            names.append(cursor.spelling)
        cursor = cursor.semantic_parent
    return "::".join(reversed(names))


def edits_of(root: pathlib.Path, source: str, arguments: list[str]) -> list[Edit]:
    """All edits of a source of the tree at `root`, which is compiled with `arguments`."""
    path = root / source
    unit = cindex.Index.create().parse(str(path), args=arguments)
    errors = [str(said) for said in unit.diagnostics if said.severity >= cindex.Diagnostic.Error]
    if errors:
        raise UnreadableSource("\n".join(errors))
    return Finder(source, path.read_bytes()).edits(unit)
