"""Objects of both sides in one form, and what they differ in."""

import re

from client import NAMESPACE, pywbem


def path_of(name):
    """An object path as nested tuples without host and name space: names in lower case, keys in their order."""
    keys = sorted((key.lower(), plain(value)) for key, value in name.keybindings.items())
    return (name.classname.lower(), *keys)


def path_of_text(text):
    return path_of(pywbem.CIMInstanceName.from_wbem_uri(text))


def plain(value):
    """A value of the client library in the words of JSON, a reference as its path."""
    if isinstance(value, pywbem.CIMInstanceName):
        return path_of(value)
    if isinstance(value, list):
        return [plain(each) for each in value]
    if isinstance(value, bool) or value is None:
        return value
    if isinstance(value, int):
        return int(value)
    return str(value)


def in_comparable_form(value):
    """A value of JSON, a reference without what the server has added to it."""
    if isinstance(value, str) and re.match(r"(?:[\w/]+:)?[A-Za-z]+_\w+\.\w+=", value):
        return path_of_text(value)
    return value


def shown(path):
    """A path for a reader."""
    keys = ",".join(f"{key}={shown(value) if isinstance(value, tuple) else value!r}" for key, value in path[1:])
    return f"{path[0]}.{keys}"


class Comparison:
    """Compares what a server answers with what the command line answers, by the types of the catalogue."""

    def __init__(self, check, catalogue):
        self.check = check
        self.catalogue = catalogue
        self.traits = check.traits
        self.server_classes = {}
        self.namesakes = {}

    def server_cells(self, class_name):
        """Properties of the class as the server has it, by name in lower case."""
        if class_name not in self.server_classes:
            class_ = self.check.connection.GetClass(class_name, LocalOnly=False)
            self.server_classes[class_name] = {name.lower(): cell for name, cell in class_.properties.items()}
        return self.server_classes[class_name]

    def names(self, what, found, expected, repeated=False):
        """`found` are paths of the client library, `expected` texts; `repeated` says that the server may name one twice."""
        found = [path_of(each) for each in found if not self.traits.is_own(each.classname)]
        expected = [path_of_text(each) for each in expected]
        if repeated:
            found, expected = list(dict.fromkeys(found)), list(dict.fromkeys(expected))
        self.check.compared += 1
        for path in list(expected):
            if path in found:
                found.remove(path)
                expected.remove(path)
        for path in expected:
            self.check.differs(what, "missing", shown(path))
        for path in found:
            self.check.differs(what, "surplus", shown(path))

    def instances(self, what, found, expected, repeated=False):
        """`expected` are objects of the command line: class, path and properties that are not null. Objects of one name are
        compared in their order; where the server repeats objects, each is one of those that bear its name."""
        self.names(what, [each.path for each in found], [each["path"] for each in expected], repeated)
        by_path = {}
        for each in expected:
            by_path.setdefault(path_of_text(each["path"]), []).append(each)
        for instance in found:
            path = path_of(instance.path)
            alike = by_path.get(path)
            if not alike:
                continue
            if repeated:
                self.one_of(f"{what}: {shown(path)}", instance, alike + self.namesakes.get(path, []))
            else:
                self.instance(f"{what}: {shown(path)}", instance, alike.pop(0))

    def one_of(self, what, found, candidates):
        """The last candidate's differences are kept if none is the same."""
        before = list(self.check.differences)
        for candidate in candidates:
            self.check.differences = list(before)
            self.instance(what, found, candidate)
            if self.check.differences == before:
                return

    def know_namesakes(self, objects):
        """Different objects of one name, which an association may lead to."""
        for each in objects:
            self.namesakes.setdefault(path_of_text(each["path"]), []).append(each)

    def instance(self, what, found, expected):
        self.check.expect(f"{what}: class", found.classname, expected["class"])
        cells = self.catalogue.cells(expected["class"])
        wanted = {name.lower(): value for name, value in expected["properties"].items()}
        for name, cell in found.properties.items():
            value = wanted.pop(name.lower(), None)
            if name.lower() in cells:
                self.property(f"{what}: {name}", expected["class"], cells[name.lower()], cell, value)
            elif cell.value is not None and not self.is_default(expected["class"], cell):
                self.check.differs(what, f"property {name} is not of the class", cell.value)
        for name, value in wanted.items():
            self.check.differs(what, f"property {name} is missing", value)

    def property(self, what, class_name, cell, found, value):
        reference = cell.kind == "reference"
        type_ = ("reference" if reference else cell.type, cell.array)
        self.check.expect(f"{what}: type", (found.type, bool(found.is_array)), type_)
        added = value is None and cell.name in self.traits.defaults and self.is_default(class_name, found)
        if not added:
            self.check.expect(what, plain(found.value), path_of_text(value) if reference and value else value)

    def objects(self, what, found, expected):
        """The same for two answers of the command line: objects with class, path and properties that are not null, or paths."""
        texts = [[each if isinstance(each, str) else each["path"] for each in side] for side in (found, expected)]
        self.names(what, [pywbem.CIMInstanceName.from_wbem_uri(text) for text in texts[0]], texts[1], repeated=True)
        by_path = {}
        for each in expected:
            if not isinstance(each, str):
                by_path.setdefault(path_of_text(each["path"]), []).append(each)
        for each in found:
            alike = [] if isinstance(each, str) else by_path.get(path_of_text(each["path"]), [])
            if alike:
                differences = [self.of_object(each, other) for other in alike]
                self.check.expect(f"{what}: {each['path']}", min(differences, key=len), {})

    def of_object(self, found, expected):
        """Properties that are not alike: what is found, and what is expected."""
        wanted, shown_ = expected["properties"], found["properties"]
        return {
            name: (shown_.get(name), wanted.get(name))
            for name in {*wanted, *shown_}
            if in_comparable_form(shown_.get(name)) != in_comparable_form(wanted.get(name))
            and not (name not in wanted and self.is_added(found["class"], name, shown_[name]))
        }

    def is_added(self, class_name, name, value):
        """A default by the server, of a property that a provider has left null or does not know."""
        known = name.lower() in self.catalogue.cells(class_name)
        return (name in self.traits.defaults or not known) and self.has_default(class_name, name, value)

    def is_default(self, class_name, found):
        """What a server puts where a provider leaves a property null."""
        return self.has_default(class_name, found.name, plain(found.value))

    def has_default(self, class_name, name, value):
        cell = self.server_cells(class_name).get(name.lower())
        return cell is not None and plain(cell.value) == value

    def namespace(self, what, names, expected=NAMESPACE):
        for name in names:
            if not self.traits.is_own(name.classname):
                self.check.expect(f"{what}: name space", name.namespace, expected)
