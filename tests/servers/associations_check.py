#!/usr/bin/env python3
"""Every association, from the objects that it can start at: the four operations, with filters and without, as the command
line has them. The quick form starts at one object that is associated and at one that is not, at each end; the long one at all
of them, with all filters at those two."""

import itertools
import sys
from dataclasses import dataclass

from catalogue import Catalogue
from client import Check, pywbem
from comparison import Comparison
from kldrcim import Kldrcim, Refusal


@dataclass
class Start:
    """An association from one of its ends: the role and the class of the object there, and those of the other end."""

    association: str
    role: str
    target: str
    other_role: str
    other_target: str


@dataclass
class Operation:
    name: str
    verb: str
    #: How the command line calls the filters of the client library.
    options: dict
    #: The filter that names the class of the association.
    association: str
    names_only: bool = False


OF_OBJECTS = {"AssocClass": "--assoc", "ResultClass": "--result", "Role": "--role", "ResultRole": "--result-role"}
OF_REFERENCES = {"ResultClass": "--assoc", "Role": "--role"}
ASSOCIATORS = [
    Operation("AssociatorNames", "ain", OF_OBJECTS, "AssocClass", True),
    Operation("Associators", "ai", OF_OBJECTS, "AssocClass"),
]
REFERENCES = [
    Operation("ReferenceNames", "rin", OF_REFERENCES, "ResultClass", True),
    Operation("References", "ri", OF_REFERENCES, "ResultClass"),
]


def starts_of(catalogue, association):
    targets = catalogue.references(association)
    return [
        Start(association, role, targets[role], other, targets[other])
        for role, other in itertools.permutations(targets, 2)
    ]


def object_filters(catalogue, start):
    """What a client may add to the class of the association, some of which leaves nothing over."""
    yield {"Role": start.role, "ResultRole": start.other_role, "ResultClass": start.other_target}
    yield {"Role": start.role}
    yield {"Role": start.other_role}
    yield {"ResultRole": start.other_role}
    yield {"ResultRole": start.role}
    yield {"ResultClass": next(catalogue.superclasses(start.other_target), start.other_target)}
    yield {"ResultClass": "KALDERA_AgentService"}


def reference_filters(start):
    yield {"Role": start.role}
    yield {"Role": start.other_role}


class Walk:
    """Asks both sides the same."""

    def __init__(self, check):
        self.check = check
        self.catalogue = Catalogue()
        self.kldrcim = Kldrcim(check)
        self.comparison = Comparison(check, self.catalogue)
        self.kldrcim.know_server(check.connection.EnumerateInstances("CIM_ObjectManager", namespace=check.interop))

    def objects(self, start):
        """Where an association can start: the objects of all classes that its end can hold, those with filters first."""
        every = [each for name in self.catalogue.subclasses(start.target) for each in self.kldrcim.ask("ein", name)]
        associated = {each["properties"][start.role] for each in self.kldrcim.ask("ei", start.association)}
        joined = [each for each in every if each in associated]
        alone = [each for each in every if each not in associated]
        filtered = list(dict.fromkeys(joined[-1:] + alone[:1]))
        return filtered, [each for each in dict.fromkeys(every) if each not in filtered]

    def request(self, operation, path, filters):
        """What is found on several ways, both servers show several times, and the command line once."""
        what = f"{operation.name} of {path} {filters}"
        words = [word for name, value in filters.items() for word in (operation.options[name], value)]
        try:
            expected, status = self.kldrcim.ask(operation.verb, path, *words), 0
        except Refusal as refusal:
            expected, status = [], refusal.status
        try:
            asked = pywbem.CIMInstanceName.from_wbem_uri(path)
            found = getattr(self.check.connection, operation.name)(asked, **filters)
        except pywbem.CIMError as error:
            self.check.expect(f"{what}: status", error.status_code, status)
            return
        if not self.check.expect(f"{what}: status", 0, status):
            return
        if operation.names_only:
            self.comparison.names(what, found, expected, repeated=True)
            self.comparison.namespace(what, found)
        else:
            self.comparison.instances(what, found, expected, repeated=True)

    def association(self, start):
        filtered, others = self.objects(start)
        for path in filtered + (others if self.check.long else []):
            for operation in (*ASSOCIATORS, *REFERENCES):
                self.request(operation, path, {operation.association: start.association})
        for path in filtered:
            self.filtered(start, path)
        self.superclass(start, filtered[:1])

    def filtered(self, start, path):
        """The quick form looks at names, with one filter."""
        for operations, filters in (
            (ASSOCIATORS, list(object_filters(self.catalogue, start))),
            (REFERENCES, list(reference_filters(start))),
        ):
            for operation in operations if self.check.long else operations[:1]:
                for each in filters if self.check.long else filters[:1]:
                    self.request(operation, path, {operation.association: start.association, **each})

    def superclass(self, start, paths):
        """A client that knows the schema alone names the superclass of an association."""
        name = next(self.catalogue.superclasses(start.association))
        for path in paths:
            for operation in (ASSOCIATORS[0], REFERENCES[0]):
                self.request(operation, path, {operation.association: name})

    def unfiltered(self, path):
        for operation in (*ASSOCIATORS, *REFERENCES):
            self.request(operation, path, {})


def main():
    check = Check(__doc__)
    walk = Walk(check)
    associations = walk.catalogue.of_kind("association")
    check.expect("associations", len(associations), 41)
    # Port groups of one adapter share a name.
    walk.comparison.know_namesakes(walk.kldrcim.ask("ei", "KALDERA_LogicalPortGroup"))
    for association in associations:
        for start in starts_of(walk.catalogue, association):
            walk.association(start)
    for name in walk.catalogue.of_kind("instance"):
        paths = walk.kldrcim.ask("ein", name)
        for path in dict.fromkeys(paths if check.long else paths[:1]):
            walk.unfiltered(path)
    check.finish()


if __name__ == "__main__":
    sys.exit(main())
