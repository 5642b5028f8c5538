"""What a faulty schema is refused for beyond its syntax."""

from .errors import MofError

CPP_WORDS = set(
    "alignas alignof and asm auto bool break case catch char class const constexpr continue default delete do "
    "double else enum explicit export extern false float for friend goto if inline int long mutable namespace "
    "new not operator or private protected public register return short signed sizeof static struct switch "
    "template this throw true try typedef typeid typename union unsigned using virtual void volatile while xor"
    .split()
)


def name(element):
    """A name becomes a member of a C++ record, beside those of every record."""
    if element.name in CPP_WORDS or element.name.startswith("_"):
        raise MofError(element.where, f"'{element.name}' cannot be the name of a C++ member")
    if element.name.lower() in ("static_meta_class", "return_value"):
        raise MofError(element.where, f"'{element.name}' is a name of the runtime")


def unique_parameter(method, parameter):
    if any(other.name.lower() == parameter.name.lower() for other in method.parameters):
        raise MofError(parameter.where, f"'{parameter.name}' is declared twice in '{method.name}'")


def override(feature, element, inherited):
    """A feature of an inherited name says so, and keeps kind, type and spelling."""
    named = next((use.value for use in element.qualifiers if use.name.lower() == "override"), None)
    if not inherited:
        if named is not None:
            raise MofError(feature.where, f"'{feature.name}' overrides nothing: no superclass declares it")
        return
    if named is None:
        raise MofError(
            feature.where,
            f"'{feature.name}' is already declared in '{inherited.owner}': Override(\"{inherited.name}\") is missing",
        )
    if named != feature.name or inherited.name != feature.name:
        raise MofError(
            feature.where, f"'{feature.name}' cannot override '{named}': the names must be the same"
        )
    old, new = shape(inherited), shape(feature)
    if old != new:
        raise MofError(
            feature.where, f"'{feature.name}' is {new}, but overrides {old} of '{inherited.owner}'"
        )
    method_override(feature, inherited)


def shape(feature):
    """How a refusal names the type: "uint16", "string array", "a reference"."""
    base = {"reference": "a reference", "method": f"a method of {feature.type}"}.get(feature.kind, feature.type)
    return base + (" array" if feature.array else "")


def method_override(feature, inherited):
    if feature.kind != "method":
        return
    for old, new in zip(inherited.parameters, feature.parameters):
        if signature(old) != signature(new):
            raise MofError(
                new.where,
                f"parameter '{new.name}' of '{feature.name}' differs from that of '{inherited.owner}'",
            )
    if len(inherited.parameters) != len(feature.parameters):
        raise MofError(
            feature.where,
            f"'{feature.name}' has {len(feature.parameters)} parameters, but overrides a method of "
            f"'{inherited.owner}' with {len(inherited.parameters)}",
        )


def signature(parameter):
    return (parameter.name, parameter.type, parameter.target, parameter.array, parameter.flags)


def targets(feature, classes):
    """References of the feature, or of its parameters, point to known classes."""
    for each in [feature, *feature.parameters]:
        if each.target and each.target not in classes:
            raise MofError(each.where, f"'{each.name}' refers to the unknown class '{each.target}'")


def narrowing(class_, feature, classes):
    """A reference that overrides one points to the same class or to one that derives from it."""
    position = class_.superclass.find(feature.name) if class_.superclass else -1
    if position < 0 or feature.kind != "reference":
        return
    wide = class_.superclass.features[position].target
    if not classes[feature.target].derives_from(classes[wide]):
        raise MofError(
            feature.where,
            f"'{feature.name}' refers to '{feature.target}', which does not derive from '{wide}'",
        )
