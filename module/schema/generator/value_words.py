"""value_map_table.cpp: for programs that show values to people, which map each feature of each class has."""

from . import cpp
from .value_maps import effective


def text_literal(text):
    return '"' + text.replace("\\", "\\\\").replace('"', '\\"') + '"'


def table(symbol, value_map):
    """Single numbers in order, then ranges, then the rest: the first that holds is the one."""
    meanings = sorted(value_map.meanings, key=lambda each: (each.is_rest, each.least != each.most, each.least))
    rows = ", ".join(f'{{{each.least}u, {each.most}u, {text_literal(each.word)}}}' for each in meanings)
    return f"static constexpr Value_Meaning {symbol}[] = {{{rows}}};"


def emit(classes, maps, output):
    symbols = {id(value_map): f"map_{number}" for number, value_map in enumerate(maps.values())}
    body = ["namespace kldrcim {", *(table(symbols[id(each)], each) for each in maps.values())]
    rows = []
    for class_ in classes:
        for feature in class_.features:
            found = effective(class_, feature, maps)
            if found:
                rows.append((class_.name.lower(), feature.name.lower(), symbols[id(found)]))
    body.append("static constexpr Mapped_Feature features[] = {")
    body += [f'    {{"{class_name}", "{feature}", {symbol}}},' for class_name, feature, symbol in sorted(rows)]
    body += ["};", "std::span<const Mapped_Feature> mapped_features()", "{", "    return features;", "}", "} // namespace kldrcim"]
    output.add("kldrcim/value_map_table.cpp", cpp.namespaced(["kldrcim/words/Value_Words.h"], body))
