"""How C++ names and types the things of the model."""

TYPES = {"string": "String", "datetime": "Datetime"}


def cpp_type(cim_type):
    return TYPES.get(cim_type, cim_type)


def type_code(cim_type):
    """The enumerator of the runtime's `Type`."""
    return cim_type.upper()


def subscript(feature):
    return -1 if feature.array else 0


def cell_type(feature):
    """The type of the feature's member in a record."""
    if feature.kind == "reference":
        return "Property<Array<Instance*>>" if feature.array else f"{feature.target}*"
    scalar = cpp_type(feature.type)
    return f"Property<Array<{scalar}>>" if feature.array else f"Property<{scalar}>"


def record_symbol(feature):
    """The name of a property's or reference's metadata record."""
    return f"_{feature.owner}_{feature.name}"


def default_symbol(feature):
    return f"_{feature.default_owner}_{feature.name}_MV"


def method_record(feature):
    """The record of a method's invocations."""
    return f"{feature.owner}_{feature.name}_method"


def namespaced(includes, body):
    """A header or source: includes, then the body in the namespace."""
    lines = [f'#include "{include}"' for include in includes]
    return "\n".join([*lines, "namespace KPRV {", *body, "}", ""])


def header(includes, body):
    return "#pragma once\n" + namespaced(includes, body)


def forward_declarations(features, known=()):
    names = sorted({f.target for f in features if f.target and not f.array} - set(known))
    return [f"struct {name};" for name in names]
