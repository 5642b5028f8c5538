"""Where a source can be mutated, and how: read from its text alone, by the layout that the formatter gives it."""

import re
from dataclasses import dataclass

KINDS = ("comparison", "boundary", "constant", "condition", "statement")

FLIPPED = {"==": "!=", "!=": "==", "<": ">=", ">=": "<", ">": "<=", "<=": ">"}
MOVED = {"<": "<=", "<=": "<", ">": ">=", ">=": ">"}

HIDDEN = re.compile(
    r"""//[^\n]*
      | /\*.*?\*/
      | R"(?P<mark>[^()\s]*)\(.*?\)(?P=mark)"
      | "(?:\\.|[^"\\\n])*"
      | (?<!\w)'(?:\\.|[^'\\\n])+'
      | ^[ \t]*\#(?:\\\n|[^\n])*""",
    re.VERBOSE | re.DOTALL | re.MULTILINE,
)
NUMBER = re.compile(r"(?<![\w.'])(0[xX][0-9a-fA-F']+|[0-9][0-9']*)([uUlL]*)(?![\w.])")
# A second look at what has been found: a pure function is no number.
PURE = re.compile(r"\)\s*(?:const|noexcept|override|\s)*=\s*$")
# Declarations within a condition: `if (const T x = ...)`.
DECLARED = re.compile(r"\s*(?:const\s|auto\b|[\w:]+(?:<[^=]*>)?[\s*&]+\w+\s*=[^=])")

TYPE_HEAD = re.compile(r"\b(namespace|class|struct|union|enum)\b|\bextern\s*$")
CODE_HEAD = re.compile(r"(?:\)\s*(?:const|noexcept|override|final|mutable|->[\w:<>*&\s]+|\s)*|\belse|\bdo|\btry|:)\s*$")
LAMBDA_HEAD = re.compile(r"(?<![\w\])])\[[^\[\]]*\]\s*(?:\([^()]*\))?\s*(?:mutable|noexcept|\s)*(?:->[\w:<>*&\s]+)?$")
LABEL = re.compile(r"\s*(?:case\b(?:[^:?]|::)*:(?!:)|default\s*:)")
CONTROL = re.compile(r"\s*(?:(else|do|try)\b|(?:if|for|while|switch)\b(?:\s*constexpr)?\s*(?=\())")
KEYWORDS = re.compile(
    r"(?:const|constexpr|constinit|auto|static|thread_local|using|typedef|struct|class|enum|extern|unsigned|goto|friend"
    r"|template|typename|public|private|protected)\b|\[\["
)
NAMED = re.compile(r"(?!(?:delete|throw|return)\b)[\w:]+(?:<[^;=()]*>)?[\s*&]+(?:const\s+)?\w+\s*(?:[(={\[,]|$)")


@dataclass(frozen=True)
class Place:
    """A stretch of a text, and what may stand there instead."""

    kind: str
    start: int
    end: int
    choices: tuple

    def apply(self, text, choice):
        return text[: self.start] + choice + text[self.end :]


def visible(text):
    """The text with everything blank that is no code, or that is checked while it is compiled; sizes and lines stay."""

    def blank(match):
        return re.sub(r"[^\n]", " ", match.group())

    code = HIDDEN.sub(blank, text)
    for match in re.finditer(r"\bstatic_assert\s*\(", code):
        end = closing(code, match.end() - 1)
        code = code[: match.start()] + re.sub(r"[^\n]", " ", code[match.start() : end]) + code[end:]
    return code


def closing(code, opening):
    """Just behind the parenthesis that closes the one at `opening`."""
    depth = 0
    for at in range(opening, len(code)):
        depth += {"(": 1, ")": -1}.get(code[at], 0)
        if depth == 0:
            return at + 1
    return len(code)


def operators(code):
    # The formatter sets blanks around comparisons, and none around the brackets of templates.
    for match in re.finditer(r"(?<=\s)(==|!=|<=|>=|<|>)(?=\s)", code):
        operator = match.group()
        yield Place("comparison", *match.span(), (FLIPPED[operator],))
        if operator in MOVED:
            yield Place("boundary", *match.span(), (MOVED[operator],))


def constants(code):
    for match in NUMBER.finditer(code):
        if PURE.search(code, max(0, match.start() - 40), match.start()):
            continue
        digits, suffix = match.groups()
        digits = digits.replace("'", "")
        if digits[:2] in ("0x", "0X"):
            value, form = int(digits, 16), "0x{:x}"
        else:
            value, form = int(digits, 8 if digits[0] == "0" else 10), "{}"
        near = [value + 1] + ([value - 1] if value else [])
        yield Place("constant", *match.span(), tuple(form.format(each) + suffix for each in near))
    for match in re.finditer(r"\b(true|false)\b", code):
        yield Place("constant", *match.span(), ("false" if match.group() == "true" else "true",))


def conditions(code):
    for match in re.finditer(r"\b(?:if|while)\s*(?=\()", code):
        start, end = match.end() + 1, closing(code, match.end()) - 1
        condition = code[start:end]
        if ";" not in condition and not DECLARED.match(condition):
            yield Place("condition", start, end, (None,))
    for match in re.finditer(r"(?<=[\s(\[{])!(?=[\w(*])", code):
        if not re.search(r"\b(?:if|while)\s*\($", code[max(0, match.start() - 12) : match.start()]):
            yield Place("condition", *match.span(), ("",))


class Scope:
    def __init__(self, is_code, goes_on=False, head=0, parentheses=0):
        self.is_code, self.goes_on, self.head, self.parentheses = is_code, goes_on, head, parentheses


def opened(code, head, at, scope, parentheses):
    """The scope that a brace opens."""
    text = code[head:at]
    if LAMBDA_HEAD.search(text):
        return Scope(True, True, head, parentheses)
    last = text.rstrip()[-1:]
    if parentheses == 0 and (CODE_HEAD.search(text) or (last == "" and scope.is_code) or (last == "}" and ") :" in text)):
        return Scope(True)
    if parentheses == 0 and TYPE_HEAD.search(text):
        return Scope(False)
    # An initialiser is a part of its statement.
    return Scope(False, True, head, parentheses)


def statements(code):
    """Statements that could be missing: no declarations, no return that ends a function, no break that ends a switch."""
    stack, head, parentheses = [Scope(False)], 0, 0
    for match in re.finditer(r"[(){};]", code):
        at, mark = match.start(), match.group()
        if mark in "()":
            parentheses += 1 if mark == "(" else -1
        elif mark == "{":
            stack.append(opened(code, head, at, stack[-1], parentheses))
            head, parentheses = at + 1, 0
        elif mark == "}" and len(stack) > 1:
            closed = stack.pop()
            head, parentheses = (closed.head, closed.parentheses) if closed.goes_on else (at + 1, 0)
        elif mark == ";" and parentheses == 0:
            if stack[-1].is_code:
                yield from droppable(code, head, at, len(stack) > 1 and stack[-2].is_code)
            head = at + 1


def droppable(code, head, end, is_inner):
    start, is_guarded, ends_switch = head, is_inner, False
    while True:
        if match := LABEL.match(code, start, end):
            start = match.end()
            ends_switch = match.group().lstrip().startswith("default")
        elif match := CONTROL.match(code, start, end):
            start = match.end() if match.group(1) else closing(code, match.end())
            is_guarded = True
        else:
            break
    start += len(code[start:end]) - len(code[start:end].lstrip())
    text = code[start:end]
    if not text or KEYWORDS.match(text) or NAMED.match(text) or (text.startswith("return") and not is_guarded):
        return
    if text == "break" and ends_switch:
        return
    # Behind a condition an empty block must stay.
    yield Place("statement", start, end + 1, ("{}",))


def places(text):
    """Every place of a text, by kind and from front to back."""
    code = visible(text)
    found = [*operators(code), *constants(code), *conditions(code), *statements(code)]
    whole = [
        Place(each.kind, each.start, each.end, (f"!({text[each.start:each.end]})",)) if each.choices == (None,) else each
        for each in found
    ]
    return sorted(whole, key=lambda each: (KINDS.index(each.kind), each.start))


def line_of(text, place):
    return text.count("\n", 0, place.start) + 1


def is_equivalent(text, place):
    """Whether a comment at the line, behind it or on the lines above it, tells that the mutation changes nothing that anybody
    could see: `// Either way (KIND, ...): REASON`."""
    lines = text.split("\n")
    at = line_of(text, place) - 1
    comments = [lines[at]]
    while at > 0 and lines[at - 1].lstrip().startswith("//"):
        at -= 1
        comments.insert(0, lines[at])
    match = re.search(r"//.*?\bEither way \(([\w, ]+)\): \S", "\n".join(comments))
    return bool(match) and place.kind in match.group(1).split(", ")
