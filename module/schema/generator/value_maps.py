"""What the numbers of properties, and of what methods return, mean: read from the data file and bound to the features of the
classes."""

import re
from dataclasses import dataclass, field

from .errors import MofError, Where

HEADING = re.compile(r"(\w+)\.(\w+)(\(\))?$")
LINE = re.compile(r"  (\S+) +(\S.*)$")
NUMBERS = re.compile(r"(0x[0-9A-Fa-f]+|[0-9]+)?(\.\.)?(0x[0-9A-Fa-f]+|[0-9]+)?$")


@dataclass
class Meaning:
    """A number, range of numbers or, without either bound, all that have no other meaning."""

    text: str
    least: int
    most: int
    word: str

    @property
    def is_rest(self):
        return self.text == ".."


@dataclass
class ValueMap:
    class_name: str
    feature_name: str
    is_method: bool
    where: Where
    meanings: list = field(default_factory=list)


def meaning(where, text, word):
    least, dots, most = NUMBERS.match(text).groups() if NUMBERS.match(text) else (None, None, None)
    if not (least or dots) or (most and not (least and dots)):
        raise MofError(where, f"'{text}' is no number, A..B, A.. or ..")
    first = int(least, 0) if least else 0
    last = int(most, 0) if most else 0xFFFFFFFF if dots else first
    if last < first:
        raise MofError(where, f"'{text}' ends before it begins")
    return Meaning(text, first, last, word)


def add(value_map, each, where):
    for known in value_map.meanings:
        if each.is_rest and known.is_rest or not (each.is_rest or known.is_rest) and (
            known.least <= each.least <= known.most or each.least <= known.least <= each.most
        ):
            raise MofError(where, f"'{each.text}' has a meaning already: '{known.word}'")
    value_map.meanings.append(each)


def parsed(path):
    """The maps of the file, in order."""
    maps = []
    with open(path, encoding="utf-8") as stream:
        for number, line in enumerate(stream, 1):
            where, line = Where(path, number), line.rstrip()
            if not line or line.startswith("#"):
                continue
            if heading := HEADING.match(line):
                maps.append(ValueMap(heading[1], heading[2], bool(heading[3]), where))
            elif maps and (row := LINE.match(line)):
                add(maps[-1], meaning(where, row[1], row[2]), where)
            else:
                raise MofError(where, "neither CLASS.PROPERTY nor '  NUMBER  WORD'")
    return maps


def check(value_map, classes, known):
    place, feature = f"{value_map.class_name}.{value_map.feature_name}", None
    if value_map.class_name in classes:
        at = classes[value_map.class_name].find(value_map.feature_name)
        feature = classes[value_map.class_name].features[at] if at >= 0 else None
    if not feature or feature.owner != value_map.class_name or (feature.kind == "method") != value_map.is_method:
        raise MofError(value_map.where, f"no class declares {place}{'()' if value_map.is_method else ''}")
    if not re.fullmatch("[us]int(8|16|32|64)", feature.type or ""):
        raise MofError(value_map.where, f"{place} is no integer")
    if (value_map.class_name, value_map.feature_name) in known:
        raise MofError(value_map.where, f"{place} has a map already")
    if not value_map.meanings:
        raise MofError(value_map.where, f"{place} has no line")


def read(path, classes):
    """The maps by (class, feature) that states them."""
    by_name, maps = {class_.name: class_ for class_ in classes}, {}
    for each in parsed(path):
        check(each, by_name, maps)
        maps[each.class_name, each.feature_name] = each
    return maps


def effective(class_, feature, maps):
    """The map that holds for a feature in a class: its nearest; None if there is none."""
    while class_:
        found = maps.get((class_.name, feature.name))
        if found:
            return found
        class_ = class_.superclass
    return None
