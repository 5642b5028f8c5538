"""Defaults: whether a literal fits its type, and how C++ writes it."""

import re

from .errors import MofError

INTEGERS = {
    "uint8": (0, 2**8 - 1),
    "sint8": (-(2**7), 2**7 - 1),
    "uint16": (0, 2**16 - 1),
    "sint16": (-(2**15), 2**15 - 1),
    "uint32": (0, 2**32 - 1),
    "sint32": (-(2**31), 2**31 - 1),
    "uint64": (0, 2**64 - 1),
    "sint64": (-(2**63), 2**63 - 1),
}
SCALARS = ["boolean", *INTEGERS, "real32", "real64", "char16", "string", "datetime"]

# yyyymmddhhmmss.mmmmmmsutc, or an interval, whose end is ":000".
DATETIME = re.compile(r"\d{14}\.\d{6}(:000|[+-]\d{3})")


def misfit(literal, element):
    shown = "{...}" if literal.kind == "array" else literal.value
    array = " array" if element.array else ""
    raise MofError(literal.where, f"default {shown} of '{element.name}' does not fit {element.type}{array}")


def cpp_text(text):
    """A C++ string literal."""
    escaped = text.replace("\\", "\\\\").replace('"', '\\"').replace("\n", "\\n").replace("\t", "\\t")
    return f'"{escaped}"'


def cpp_scalar(literal, element):
    """The C++ form of one literal of the element's type; refuses what does not fit."""
    type_, kind, value = element.type, literal.kind, literal.value
    if type_ == "boolean":
        if kind == "name" and value.lower() in ("true", "false"):
            return value.lower()
    elif type_ in INTEGERS:
        if kind == "number" and re.fullmatch(r"[+-]?(0[xX][0-9a-fA-F]+|\d+)", value):
            number = int(value, 16 if "x" in value.lower() else 10)
            low, high = INTEGERS[type_]
            if low <= number <= high:
                return cpp_integer(type_, number)
    elif type_ in ("real32", "real64"):
        if kind == "number" and "x" not in value.lower():
            number = repr(float(value))
            return number + "f" if type_ == "real32" else number
    elif type_ == "char16":
        if kind == "char" and len(value) == 1:
            return f"char16({ord(value)})"
    elif kind == "string" and (type_ == "string" or DATETIME.fullmatch(value)):
        return cpp_text(value)
    return misfit(literal, element)


def cpp_integer(type_, number):
    if type_ == "sint64" and number == -(2**63):
        return "-9223372036854775807 - 1"
    return f"{number}u" if type_ == "uint64" and number >= 2**63 else str(number)


def cpp_default(element):
    """The default of the element: text for a scalar, a list of texts for an array, None where it has none."""
    literal = element.default
    if literal is None or (literal.kind == "name" and literal.value.lower() == "null"):
        return None
    if element.array != (literal.kind == "array"):
        misfit(literal, element)
    if element.array:
        return [cpp_scalar(value, element) for value in literal.value]
    return cpp_scalar(literal, element)
