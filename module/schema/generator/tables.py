"""module/schema/tables.cpp: the metadata of the catalogue, as constants."""

import hashlib

from . import cpp
from .flags import KEY, OUT, PROPERTY

SAME_OFFSET = (
    "#define SAME(C, S, F) static_assert(__builtin_offsetof(C, F) == __builtin_offsetof(S, F))"
)


def head(flags, name):
    """Initialiser of a record's `Meta_Qualified_Object`: no count, no qualifiers."""
    return f'{{0, 0x{flags:08X}, "{name}", nullptr, 0}}'


def property_record(symbol, record, feature):
    value = f"&{cpp.default_symbol(feature)}" if feature.default is not None else "nullptr"
    return (
        f"static constinit const Meta_Property {symbol}{{{{{head(feature.flags, feature.name)}}}, "
        f"{cpp.type_code(feature.type)}, {cpp.subscript(feature)}, "
        f"__builtin_offsetof({record}, {feature.name}), {value}}};"
    )


def reference_record(symbol, record, feature):
    return (
        f"static constinit const Meta_Reference {symbol}{{{{{head(feature.flags, feature.name)}}}, "
        f"{cpp.subscript(feature)}, &{feature.target}::static_meta_class, "
        f"__builtin_offsetof({record}, {feature.name})}};"
    )


def is_text(feature):
    """Strings and datetimes have defaults that are texts."""
    return feature.type in ("string", "datetime")


def default_record(feature):
    """The default of the feature, at the class that states it."""
    symbol = cpp.default_symbol(feature)
    if isinstance(feature.default, list):
        # A zero-length array is no C++: an empty default has no elements at all.
        lines, elements = [], "nullptr"
        if feature.default:
            element = "const char* const" if is_text(feature) else f"const {feature.type}"
            elements = f"{symbol}_elements"
            lines = [f"static {element} {elements}[] = {{{', '.join(feature.default)}}};"]
        value = f".array_value = {{{elements}, {len(feature.default)}}}"
        return [*lines, f"static constinit const Meta_Value {symbol}{{{value}}};"]
    member = "string" if is_text(feature) else feature.type
    return [f"static constinit const Meta_Value {symbol}{{.{member}_value = {feature.default}}};"]


def feature_array(symbol, addresses):
    if not addresses:
        return [], "nullptr"
    return [f"static constexpr const Meta_Feature* {symbol}[] = {{{', '.join(addresses)}}};"], symbol


def address(feature):
    if feature.kind == "method":
        return f"&{cpp.method_record(feature)}::static_meta_class"
    return f"&{cpp.record_symbol(feature)}"


def method_table(method):
    """The records of the parameters and of the return value, then that of the method."""
    record = cpp.method_record(method)
    symbol = f"_{method.owner}_{method.name}"
    lines, addresses = [], []
    for parameter in method.parameters:
        make = reference_record if parameter.kind == "reference" else property_record
        lines.append(make(f"{symbol}_{parameter.name}", record, parameter))
        addresses.append(f"&{symbol}_{parameter.name}")
    result = head(PROPERTY | OUT, "return_value")
    lines.append(
        f"static constinit const Meta_Property {symbol}_return_value{{{{{result}}}, "
        f"{cpp.type_code(method.type)}, 0, __builtin_offsetof({record}, return_value), nullptr}};"
    )
    addresses.append(f"&{symbol}_return_value")
    array, name = feature_array(f"{symbol}_MFA", addresses)
    return lines + array + [
        f"constinit const Meta_Method {record}::static_meta_class{{{{{head(method.flags, method.name)}}}, "
        f"{name}, {len(addresses)}, sizeof({record}), {cpp.type_code(method.type)}}};"
    ]


def class_table(class_, repository):
    lines = []
    for feature in class_.own_features:
        if feature.default_owner == class_.name:
            lines += default_record(feature)
        if feature.kind == "method":
            lines += method_table(feature)
        else:
            make = reference_record if feature.kind == "reference" else property_record
            lines.append(make(cpp.record_symbol(feature), class_.name, feature))
    if class_.superclass:
        # Heirs share the records, and with them the offsets, of what they inherit.
        pair = f"{class_.name}, {class_.superclass.name}"
        lines += [f"SAME({pair}, {cell.name});" for cell in class_.superclass.cells]
    array, features = feature_array(f"_{class_.name}_MFA", [address(feature) for feature in class_.features])
    lines += array
    locals_ = "nullptr"
    if class_.features:
        locals_ = f"_{class_.name}_locals"
        marks = ",".join(str(int(class_.owns(feature))) for feature in class_.features)
        lines.append(f"static constexpr uint8 {locals_}[] = {{{marks}}};")
    superclass = f"&{class_.superclass.name}::static_meta_class" if class_.superclass else "nullptr"
    keys = sum(1 for feature in class_.features if feature.flags & KEY)
    lines.append(
        f"constinit const Meta_Class {class_.name}::static_meta_class{{{{{head(class_.flags, class_.name)}}}, "
        f"{features}, {len(class_.features)}, sizeof({class_.name}), {locals_}, {superclass}, {keys}, &{repository}}};"
    )
    return lines


def repository_symbol(classes):
    """Its tag is drawn from the tables' content, so that two catalogues never share a name."""
    digest = hashlib.blake2s(digest_size=16)
    for class_ in classes:
        digest.update("\n".join(class_table(class_, "")).encode())
    return f"__meta_repository_{digest.hexdigest()}"


def emit(classes, output):
    repository = repository_symbol(classes)
    # The version's header makes a runtime of another version a link error.
    includes = ["module/runtime/objects/Meta_Class.h", "module/runtime/dispatch/version.h"]
    for class_ in classes:
        includes.append(f"module/schema/{class_.name}.h")
        if any(class_.owns(method) for method in class_.methods):
            includes.append(f"module/schema/{class_.name}_methods.h")
    body = [SAME_OFFSET, f"extern const Meta_Repository {repository};"]
    for class_ in classes:
        body += class_table(class_, repository)
    records = ", ".join(f"&{class_.name}::static_meta_class" for class_ in classes)
    body += [
        f"static constexpr const Meta_Class* classes[] = {{{records}}};",
        f"constinit const Meta_Repository {repository}{{classes, {len(classes)}}};",
    ]
    output.add("module/schema/tables.cpp", cpp.namespaced(includes, body))
