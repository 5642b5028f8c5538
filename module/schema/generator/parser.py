"""Tokens to declarations, with the files that a file includes."""

import os

from .declarations import ClassDeclaration, Element, Literal, Qualifier, QualifierType
from .errors import MofError, Where
from .lexer import tokens


class Parser:
    """Reads one file; what it finds goes to the lists that all files share."""

    def __init__(self, file, declarations, included, open_files):
        try:
            with open(file, encoding="utf-8") as stream:
                text = stream.read()
        except OSError as error:
            raise MofError(Where(file, 1), f"cannot be read: {error.strerror}") from error
        self.file = file
        self.declarations = declarations
        self.included = included
        self.open_files = open_files + [os.path.realpath(file)]
        self.tokens = tokens(text, file)
        self.at = 0

    # Token by token.

    @property
    def token(self):
        return self.tokens[self.at]

    def take(self):
        token = self.token
        self.at += 1
        return token

    def accept(self, text):
        """Takes the mark or keyword if it comes next."""
        token = self.token
        if token.kind in ("mark", "name") and token.text.lower() == text:
            self.at += 1
            return token
        return None

    def expect(self, text):
        token = self.token
        return self.accept(text) or self.refuse(token, f"expected '{text}' before {token}")

    def expect_kind(self, kind, what):
        token = self.token
        if token.kind != kind:
            self.refuse(token, f"expected {what} before {token}")
        return self.take()

    def name(self, what):
        return self.expect_kind("name", what)

    @staticmethod
    def refuse(token, reason):
        raise MofError(token.where, reason)

    # Declarations.

    def parse(self):
        while self.token.kind != "end":
            if self.accept("#pragma"):
                self.pragma()
            elif self.accept("qualifier"):
                self.declarations.append(self.qualifier_type())
            else:
                self.declarations.append(self.class_declaration())

    def pragma(self):
        self.expect("include")
        self.expect("(")
        name = self.expect_kind("string", "a file name")
        self.expect(")")
        path = os.path.join(os.path.dirname(self.file), name.text)
        if not os.path.isfile(path):
            self.refuse(name, f"cannot include '{name.text}': no such file")
        if os.path.realpath(path) in self.open_files:
            self.refuse(name, f"'{name.text}' includes itself")
        self.included[os.path.realpath(path)] = self.file
        Parser(path, self.declarations, self.included, self.open_files).parse()

    def qualifier_type(self):
        name = self.name("the name of a qualifier")
        self.expect(":")
        type_name = self.name("a type")
        if type_name.text not in ("boolean", "string"):
            self.refuse(type_name, f"qualifier '{name.text}' is neither boolean nor string")
        of_type = type_name.text
        if self.accept("["):
            self.expect("]")
            of_type += "[]"
        self.expect("=")
        default = self.name("true, false or null").text.lower()
        clauses = {"scope": [], "flavor": []}
        while self.accept(","):
            clause = self.name("Scope or Flavor")
            words = clauses.get(clause.text.lower())
            if words is None:
                self.refuse(clause, f"expected Scope or Flavor before {clause}")
            self.expect("(")
            words.append(self.name("a word").text.lower())
            while self.accept(","):
                words.append(self.name("a word").text.lower())
            self.expect(")")
        self.expect(";")
        return QualifierType(
            name.text, of_type, default == "true" if of_type == "boolean" else None, clauses["scope"], clauses["flavor"], name.where
        )

    def class_declaration(self):
        qualifiers = self.qualifiers()
        self.expect("class")
        name = self.name("the name of a class")
        superclass = self.name("the name of the superclass").text if self.accept(":") else None
        self.expect("{")
        elements = []
        while not self.accept("}"):
            elements.append(self.element())
        self.expect(";")
        return ClassDeclaration(name.text, superclass, qualifiers, elements, name.where)

    def qualifiers(self):
        result = []
        if self.accept("["):
            result.append(self.qualifier())
            while self.accept(","):
                result.append(self.qualifier())
            self.expect("]")
        return result

    def qualifier(self):
        name = self.name("the name of a qualifier")
        value = True
        if self.accept("("):
            token = self.take()
            if token.kind == "string":
                value = token.text
            elif token.kind == "name" and token.text.lower() in ("true", "false"):
                value = token.text.lower() == "true"
            else:
                self.refuse(token, f"expected a text, true or false before {token}")
            self.expect(")")
        elif self.accept("{"):
            value = [self.expect_kind("string", "a text").text]
            while self.accept(","):
                value.append(self.expect_kind("string", "a text").text)
            self.expect("}")
        return Qualifier(name.text, value, name.where)

    def element(self):
        """A property, reference or method."""
        element = self.typed_name("property")
        if self.accept("("):
            if element.kind == "reference" or element.array:
                raise MofError(element.where, f"method '{element.name}' does not return a scalar")
            element.kind = "method"
            if not self.accept(")"):
                element.parameters.append(self.typed_name("parameter"))
                while self.accept(","):
                    element.parameters.append(self.typed_name("parameter"))
                self.expect(")")
        elif self.accept("="):
            element.default = self.literal()
        self.expect(";")
        return element

    def typed_name(self, kind):
        """[qualifiers] type [REF] name [ [] ]"""
        qualifiers = self.qualifiers()
        end = (self.tokens[self.at - 1] if qualifiers else self.token).at
        type_name = self.name("a type")
        reference = self.accept("ref") is not None
        name = self.name("a name")
        array = self.accept("[") is not None
        if array and not self.accept("]"):
            self.refuse(self.token, f"'{name.text}' is an array of fixed size, which the catalogue does not know")
        if reference and kind == "property":
            kind = "reference"
        return Element(
            kind, name.text, type_name.text, array, qualifiers, name.where, is_reference=reference, qualifiers_end=end
        )

    def literal(self):
        opening = self.accept("{")
        if not opening:
            return self.scalar_literal()
        values = []
        if not self.accept("}"):
            values.append(self.scalar_literal())
            while self.accept(","):
                values.append(self.scalar_literal())
            self.expect("}")
        return Literal("array", values, opening.where)

    def scalar_literal(self):
        token = self.take()
        if token.kind not in ("number", "string", "char", "name"):
            self.refuse(token, f"expected a value before {token}")
        return Literal(token.kind, token.text, token.where)


def parse(files):
    """The declarations of the files, and of what they include, in order."""
    return parse_all(files)[0]


def parse_all(files):
    """The same, and beside it which file includes which: the including one by the included one's real path."""
    declarations, included = [], {}
    for file in files:
        Parser(file, declarations, included, []).parse()
    return declarations, included
