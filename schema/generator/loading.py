"""The MOF that a server's compiler loads: declarations as they stand in the sources, no class before what it needs."""

from .output import read

HEADS = {
    "kldr_qualifiers.mof": "// Qualifiers, for a namespace that has none: load this first.\n",
    "kldr_structure.mof": "// Structure of the CIM Schema 2.26.0 classes that the product classes build on, for a server without\n"
    "// that schema: after the qualifiers, before the product classes.\n",
    "kldrprovider.mof": "// The product classes, for the namespace root/kaldera.\n",
}


def ancestors(class_):
    """The class and its superclasses."""
    while class_:
        yield class_
        class_ = class_.superclass


def loading_order(classes):
    """The classes in their own order, but each behind its superclass, and behind the targets of its references unless they
    lead back to it."""
    by_name = {class_.name: class_ for class_ in classes}
    placed, begun = [], set()

    def can_stand_before(target):
        return not any(each.name in begun and each not in placed for each in ancestors(target))

    def place(class_):
        if class_.name in begun or class_.name not in by_name:
            return
        begun.add(class_.name)
        if class_.superclass:
            place(class_.superclass)
        for feature in class_.own_features:
            target = by_name.get(feature.target)
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
