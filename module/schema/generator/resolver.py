"""Declarations to the model: inheritance, overrides, flags."""

from . import checks, flags
from .declarations import QualifierType
from .errors import MofError
from .literals import SCALARS, cpp_default
from .model import Class, Feature
from .qualifiers import Qualifiers, flag_bits


class Resolver:
    def __init__(self):
        self.qualifiers = Qualifiers()
        self.classes = {}

    def resolve(self, declarations):
        for declaration in declarations:
            if isinstance(declaration, QualifierType):
                self.qualifiers.declare(declaration)
            else:
                self.add_class(declaration)
        # A reference may point forward, so targets are looked at when all classes are known.
        for class_ in self.classes.values():
            for feature in class_.own_features:
                checks.targets(feature, self.classes)
                checks.narrowing(class_, feature, self.classes)
        return list(self.classes.values())

    def add_class(self, declaration):
        name = declaration.name
        if name.lower() in (known.lower() for known in self.classes):
            raise MofError(declaration.where, f"class '{name}' is declared twice")
        superclass = None
        if declaration.superclass:
            superclass = self.classes.get(declaration.superclass)
            if not superclass:
                raise MofError(declaration.where, f"unknown superclass '{declaration.superclass}'")
        inherited = superclass.qualifiers if superclass else None
        values = self.qualifiers.effective(
            declaration.qualifiers, class_scope(declaration, inherited), inherited
        )
        word = flag_bits(values)
        if not word & (flags.ASSOCIATION | flags.INDICATION):
            word |= flags.CLASS
        class_ = Class(name, superclass, word, values, declaration.where)
        if superclass:
            class_.features = list(superclass.features)
        own = set()
        for element in declaration.elements:
            if element.name.lower() in own:
                raise MofError(element.where, f"'{element.name}' is declared twice in '{name}'")
            own.add(element.name.lower())
            self.add_feature(class_, element)
        self.classes[name] = class_

    def add_feature(self, class_, element):
        position = class_.find(element.name)
        inherited = class_.features[position] if position >= 0 else None
        feature = self.feature(class_.name, element, element.kind, inherited)
        checks.override(feature, element, inherited)
        if inherited:
            if feature.default is None:
                feature.default, feature.default_owner = inherited.default, inherited.default_owner
            class_.features[position] = feature
        else:
            class_.features.append(feature)

    def feature(self, owner, element, scope, inherited=None):
        """A property, reference, method or parameter with its flags. An embedded instance is a reference."""
        checks.name(element)
        values = self.qualifiers.effective(
            element.qualifiers, scope, inherited.qualifiers if inherited else None
        )
        embedded = values.get("embeddedinstance")
        if embedded and (element.is_reference or element.type != "string"):
            raise MofError(element.where, f"'{element.name}' is embedded, but not a string")
        if not element.is_reference and element.type not in SCALARS:
            raise MofError(element.where, f"unknown type '{element.type}'")
        target = element.type if element.is_reference else embedded or None
        kind = "reference" if target else "method" if element.kind == "method" else "property"
        feature = Feature(
            kind=kind,
            name=element.name,
            owner=owner,
            type=None if target else element.type,
            target=target,
            array=element.array,
            flags=flags.KINDS[kind] | flag_bits(values),
            where=element.where,
            qualifiers=values,
        )
        if element.default is not None and target:
            raise MofError(element.default.where, f"'{element.name}' is a reference and takes no default")
        feature.default = cpp_default(element)
        if feature.default is not None:
            feature.default_owner = owner
        for parameter in element.parameters:
            checks.unique_parameter(feature, parameter)
            feature.parameters.append(self.feature(owner, parameter, "parameter"))
        return feature


def class_scope(declaration, inherited):
    """class, association or indication: by the class's own qualifier or by what it derives from."""
    used = {qualifier.name.lower() for qualifier in declaration.qualifiers if qualifier.value is True}
    for scope in ("association", "indication"):
        if scope in used or (inherited or {}).get(scope):
            return scope
    return "class"


def resolve(declarations):
    """The classes of the catalogue, in the order of their declarations."""
    return Resolver().resolve(declarations)
