"""The MOF that a server's compiler loads: declarations as they stand in the sources, no class before what it needs."""

from .output import read

HEADS = {
    "kldr_qualifiers.mof": "// Qualifiers, for a namespace that has none: load this first.\n",
    "kldr_structure.mof": "// Structure of the CIM Schema 2.26.0 classes that the product classes build on, for a server without\n"
    "// that schema: after the qualifiers, before the product classes.\n",
    "kldrprovider.mof": "// The product classes, for the namespace root/kaldera.\n",
}


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


def emit(classes, qualifiers, prefix, output):
    """`qualifiers` are the declarations of the qualifiers."""
    product = [class_ for class_ in classes if class_.name.startswith(prefix)]
    structure = [class_ for class_ in classes if not class_.name.startswith(prefix)]
    for name, places in (
        ("kldr_qualifiers.mof", [declaration.where for declaration in qualifiers]),
        ("kldr_structure.mof", [class_.where for class_ in loading_order(structure)]),
        ("kldrprovider.mof", [class_.where for class_ in loading_order(product)]),
    ):
        output.add(f"mof/{name}", HEADS[name] + "".join("\n" + read(file) for file in sources(places)))
