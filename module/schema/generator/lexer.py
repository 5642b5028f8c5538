"""MOF text to tokens."""

import re

from .errors import MofError, Where

TOKEN = re.compile(
    r"""
    (?P<space>[ \t\r]+|//[^\n]*)
  | (?P<newline>\n)
  | (?P<comment>/\*.*?\*/)
  | (?P<string>"(?:[^"\\\n]|\\.)*")
  | (?P<char>'(?:[^'\\\n]|\\.)')
  | (?P<number>[+-]?(?:0[xX][0-9a-fA-F]+|[0-9]+(?:\.[0-9]+)?(?:[eE][+-]?[0-9]+)?)(?![0-9A-Za-z_.]))
  | (?P<name>[A-Za-z_][A-Za-z0-9_]*)
  | (?P<mark>\#pragma|[][(){}:;,=])
    """,
    re.VERBOSE | re.DOTALL,
)


class Token:
    """Kind (name, number, string, char, mark or end), text without quotes, place, and offset in the file."""

    __slots__ = ("kind", "text", "where", "at")

    def __init__(self, kind, text, where, at):
        self.kind = kind
        self.text = text
        self.where = where
        self.at = at

    def __str__(self):
        return "the end of the file" if self.kind == "end" else f"'{self.text}'"


def unquote(text):
    return re.sub(r"\\(.)", lambda m: {"n": "\n", "t": "\t"}.get(m[1], m[1]), text[1:-1])


def tokens(text, file):
    """All tokens of a file, then an end token."""
    result = []
    line, at = 1, 0
    while at < len(text):
        match = TOKEN.match(text, at)
        where = Where(file, line)
        if not match:
            raise MofError(where, f"unexpected character '{text[at]}'")
        kind = match.lastgroup
        if kind in ("string", "char"):
            result.append(Token(kind, unquote(match[0]), where, at))
        elif kind in ("number", "name", "mark"):
            result.append(Token(kind, match[0], where, at))
        line += match[0].count("\n")
        at = match.end()
    result.append(Token("end", "", Where(file, line), at))
    return result
