"""Base of the generator's tests: tiny schemas in a temporary folder."""

import os
import tempfile
import unittest

from generator.cli import generate
from generator.errors import MofError
from generator.parser import parse
from generator.resolver import resolve

QUALIFIERS = os.path.join(os.getcwd(), "qualifiers.mof")


class SchemaCase(unittest.TestCase):
    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.folder = folder.name

    def file(self, text, name="tiny.mof"):
        path = os.path.join(self.folder, name)
        os.makedirs(os.path.dirname(path), exist_ok=True)
        with open(path, "w", encoding="utf-8") as stream:
            stream.write(text)
        return path

    def classes(self, text):
        """The resolved classes of the text, by name, under the qualifiers of the project."""
        return {class_.name: class_ for class_ in resolve(parse([QUALIFIERS, self.file(text)]))}

    def generated(self, text, without=()):
        """The generated files of the text; classes whose names begin with P_ have providers."""
        return generate([QUALIFIERS, self.file(text)], "P_", without).files

    def refuse(self, text, line, reason, name="tiny.mof"):
        """The text is refused at that line, with exactly that reason."""
        path = os.path.join(self.folder, name)
        with self.assertRaises(MofError) as caught:
            self.generated(text)
        self.assertEqual(str(caught.exception), f"{path}:{line}: {reason}")
