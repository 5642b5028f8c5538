"""The classes as their sources declare them, read by the generator that makes the module of them."""

import sys
from functools import cached_property
from pathlib import Path

SCHEMA = Path(__file__).resolve().parents[2] / "module/schema"
sys.path.insert(0, str(SCHEMA))

from generator.cli import providers_of, read
from generator.resolver import resolve

PREFIX = "KALDERA_"
#: The base of four tests, which have providers of their own.
WITHOUT_PROVIDER = ["KALDERA_DiagnosticTest"]


class Catalogue:
    def __init__(self):
        self.classes = resolve(read([str(SCHEMA / "cim.mof"), str(SCHEMA / "kaldera.mof")]))
        self.by_name = {class_.name: class_ for class_ in self.classes}

    @cached_property
    def kinds(self):
        """Kind of each class that has a provider: instance, association or indication."""
        return {class_.name: kind for class_, kind in providers_of(self.classes, PREFIX, WITHOUT_PROVIDER)}

    def of_kind(self, *kinds):
        return [name for name, kind in self.kinds.items() if kind in kinds]

    def subclasses(self, name):
        """Those that have instances, the class itself included."""
        ancestor = self.by_name[name]
        return [each for each in self.of_kind("instance", "association") if self.by_name[each].derives_from(ancestor)]

    def superclasses(self, name):
        """From the direct one up."""
        class_ = self.by_name[name].superclass
        while class_:
            yield class_.name
            class_ = class_.superclass

    def references(self, name):
        """Name of each reference of an association, with the class that it points to."""
        return {cell.name: cell.target for cell in self.by_name[name].cells if cell.kind == "reference"}

    def cells(self, name):
        """Properties and references by name in lower case."""
        return {cell.name.lower(): cell for cell in self.by_name[name].cells}
