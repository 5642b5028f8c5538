"""What is refused while reading, and what is read."""

from schema_case import SchemaCase

from generator.lexer import tokens


class Syntax(SchemaCase):
    def test_tokens_know_their_kind_and_line(self):
        found = [(t.kind, t.text, t.where.line) for t in tokens('// x\nclass A /* a\nb */ { "q\\"" -5 \'c\' ];', "f")]
        self.assertEqual(
            found,
            [
                ("name", "class", 2),
                ("name", "A", 2),
                ("mark", "{", 3),
                ("string", 'q"', 3),
                ("number", "-5", 3),
                ("char", "c", 3),
                ("mark", "]", 3),
                ("mark", ";", 3),
                ("end", "", 3),
            ],
        )

    def test_unexpected_character(self):
        self.refuse("class A {};\nclass B { uint8 x$; };", 2, "unexpected character '$'")

    def test_unclosed_string(self):
        self.refuse('class A { string x = "abc; };\n', 1, "unexpected character '\"'")

    def test_number_with_a_tail(self):
        self.refuse("class A { uint8 x = 5x; };", 1, "unexpected character '5'")

    def test_missing_semicolon(self):
        self.refuse("class A\n{\n    uint8 x\n};", 4, "expected ';' before '}'")

    def test_missing_end_of_class(self):
        self.refuse("class A {\n", 2, "expected a type before the end of the file")

    def test_missing_name(self):
        self.refuse("class { };", 1, "expected the name of a class before '{'")

    def test_something_that_is_no_class(self):
        self.refuse("instance of A { };", 1, "expected 'class' before 'instance'")

    def test_array_of_fixed_size(self):
        self.refuse(
            "class A {\nuint8 x[4]; };",
            2,
            "'x' is an array of fixed size, which the catalogue does not know",
        )

    def test_method_that_returns_an_array(self):
        self.refuse("class A { uint8 x[](); };", 1, "method 'x' does not return a scalar")

    def test_qualifier_value(self):
        self.refuse("class A { [Key(3)] uint8 x; };", 1, "expected a text, true or false before '3'")

    def test_missing_value(self):
        self.refuse("class A { uint8 x = ; };", 1, "expected a value before ';'")

    def test_keywords_have_no_case(self):
        self.assertIn("A", self.classes("CLASS A { [key] B Ref b; }; Class B {};"))


class Includes(SchemaCase):
    def test_included_classes_stand_where_they_are_included(self):
        self.file("class B {};", "more/b.mof")
        names = list(self.classes('class A {};\n#pragma include ("more/b.mof")\nclass C {};'))
        self.assertEqual(names, ["A", "B", "C"])

    def test_missing_include(self):
        self.refuse('class A {};\n#pragma include ("none.mof")', 2, "cannot include 'none.mof': no such file")

    def test_include_of_itself(self):
        self.refuse('#pragma include ("tiny.mof")', 1, "'tiny.mof' includes itself")

    def test_include_circle(self):
        self.file('#pragma include ("../tiny.mof")', "more/b.mof")
        self.refuse('#pragma include ("more/b.mof")', 1, "'../tiny.mof' includes itself", "more/b.mof")

    def test_an_error_names_the_included_file(self):
        self.file("\nclass B : None {};", "b.mof")
        self.refuse('#pragma include ("b.mof")', 2, "unknown superclass 'None'", "b.mof")

    def test_unknown_pragma(self):
        self.refuse("#pragma locale", 1, "expected 'include' before 'locale'")
