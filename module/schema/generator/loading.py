"""The MOF that a server's compiler loads: declarations as they stand in the sources, with their value maps, no class before what
it needs."""

import json

from .declarations import ClassDeclaration, QualifierType
from .output import read
from .value_maps import effective

HEADS = {
    "kldr_qualifiers.mof": "// Qualifiers, for a namespace that has none: load this first.\n",
    "kldr_structure.mof": "// Structure of the CIM Schema 2.26.0 classes that the product classes build on, for a server without\n"
    "// that schema: after the qualifiers, before the product classes.\n",
    "kldrprovider.mof": "// The product classes, for the namespace root/kaldera.\n",
}

WIDTH = 120


def elements(class_):
    """What may name another class: the class's own features, and their parameters."""
    for feature in class_.own_features:
        yield feature
        yield from feature.parameters


def loading_order(classes):
    """The classes in their own order, but each behind its superclass and the classes of its embedded instances, without which
    compilers refuse it, and behind the targets of its references unless they lead back to it."""
    by_name = {class_.name: class_ for class_ in classes}
    placed, begun = [], set()

    def needed(class_):
        """The superclass, and the classes of embedded instances."""
        found = [class_.superclass] if class_.superclass else []
        embedded = [each.target for each in elements(class_) if each.qualifiers.get("embeddedinstance")]
        return found + [by_name[name] for name in embedded if name in by_name]

    def can_stand_before(target):
        waiting, seen = [target], set()
        while waiting:
            class_ = waiting.pop()
            if class_.name in begun and class_ not in placed:
                return False
            if class_.name not in seen:
                seen.add(class_.name)
                waiting += needed(class_)
        return True

    def place(class_):
        if class_.name in begun or class_.name not in by_name:
            return
        begun.add(class_.name)
        for each in needed(class_):
            place(each)
        for element in elements(class_):
            target = by_name.get(element.target)
            if target and can_stand_before(target):
                place(target)
        placed.append(class_)

    for class_ in classes:
        place(class_)
    return placed


def sources(places):
    """The files of the places, each once, in order."""
    return list(dict.fromkeys(place.file for place in places))


def map_of(class_, feature, prefix, maps):
    """The map to state with a declaration. A product class restates what it inherits, since not every server's compiler hands
    the qualifiers of an overridden feature down."""
    return effective(class_, feature, maps) if class_.name.startswith(prefix) else maps.get((class_.name, feature.name))


def words(name, texts):
    """A qualifier of many texts, on lines of its own."""
    lines = [f"     {name} {{{json.dumps(texts[0])}"]
    for each in texts[1:]:
        lines[-1] += ","
        if len(lines[-1]) + len(each) + 5 > WIDTH:
            lines.append("        ")
        lines[-1] += f" {json.dumps(each)}"
    return "\n".join(lines) + "}"


def qualified(text, places):
    """The MOF text with the maps stated at the places, which are (offset, has qualifiers, map)."""
    for offset, has_qualifiers, value_map in sorted(places, key=lambda place: place[0], reverse=True):
        meanings = value_map.meanings
        both = words("ValueMap", [each.text for each in meanings]) + ",\n" + words("Values", [each.word for each in meanings])
        added = f",\n{both}" if has_qualifiers else f"[{both.lstrip()}]\n    "
        text = text[:offset] + added + text[offset:]
    return text


def mapped(classes, elements_of, prefix, maps):
    """By file, where a map belongs."""
    places = {}
    for class_ in classes:
        for feature in class_.own_features:
            value_map = map_of(class_, feature, prefix, maps)
            if value_map:
                element = elements_of[class_.name, feature.name]
                place = (element.qualifiers_end, bool(element.qualifiers), value_map)
                places.setdefault(feature.where.file, []).append(place)
    return places


def emit(classes, declarations, prefix, maps, output):
    """`declarations` are those that the classes come from."""
    qualifiers = [each for each in declarations if isinstance(each, QualifierType)]
    elements_of = {
        (each.name, element.name): element
        for each in declarations
        if isinstance(each, ClassDeclaration)
        for element in each.elements
    }
    places_of = mapped(classes, elements_of, prefix, maps)
    product = [class_ for class_ in classes if class_.name.startswith(prefix)]
    structure = [class_ for class_ in classes if not class_.name.startswith(prefix)]
    for name, places in (
        ("kldr_qualifiers.mof", [declaration.where for declaration in qualifiers]),
        ("kldr_structure.mof", [class_.where for class_ in loading_order(structure)]),
        ("kldrprovider.mof", [class_.where for class_ in loading_order(product)]),
    ):
        texts = [qualified(read(file), places_of.get(file, [])) for file in sources(places)]
        output.add(f"mof/{name}", HEADS[name] + "".join("\n" + text for text in texts))
