"""What the qualifiers of an element amount to: its own, inherited and declared values, and its flags."""

from .errors import MofError
from .flags import BITS


def kind_of(value):
    """The type of a qualifier that can have the value."""
    if isinstance(value, bool):
        return "boolean"
    return "string[]" if isinstance(value, list) else "string"


class Qualifiers:
    """The qualifier declarations, by lower-case name."""

    def __init__(self):
        self.types = {}

    def declare(self, type_):
        key = type_.name.lower()
        if key in self.types:
            raise MofError(type_.where, f"qualifier '{type_.name}' is declared twice")
        if type_.type == "boolean" and key not in BITS:
            raise MofError(type_.where, f"qualifier '{type_.name}' has no bit in the flag word")
        self.types[key] = type_

    def effective(self, used, scope, inherited=None):
        """Values by lower-case name. `inherited` are those of the superclass or of the overridden feature."""
        own = {}
        for use in used:
            key = use.name.lower()
            self._check(use, scope, own, inherited or {})
            own[key] = use.value
        values = {}
        for key, type_ in self.types.items():
            if scope not in type_.scopes and "any" not in type_.scopes:
                continue
            if key in own:
                values[key] = own[key]
            elif inherited and "restricted" not in type_.flavors:
                values[key] = inherited.get(key, type_.default)
            else:
                values[key] = type_.default
        return values

    def _check(self, use, scope, own, inherited):
        key = use.name.lower()
        type_ = self.types.get(key)
        if not type_:
            raise MofError(use.where, f"unknown qualifier '{use.name}'")
        if key in own:
            raise MofError(use.where, f"qualifier '{use.name}' stands twice")
        if scope not in type_.scopes and "any" not in type_.scopes:
            raise MofError(use.where, f"qualifier '{use.name}' does not apply to a {scope}")
        if kind_of(use.value) != type_.type:
            raise MofError(use.where, f"qualifier '{use.name}' takes a {type_.type}")
        if "disableoverride" in type_.flavors and inherited.get(key) is True and use.value is False:
            raise MofError(use.where, f"qualifier '{use.name}' is inherited and cannot be turned off")


def flag_bits(values):
    """The bits of the qualifiers that hold. A text, such as that of EmbeddedInstance, counts as true."""
    word = 0
    for key, value in values.items():
        if value:
            word |= BITS.get(key, 0)
    return word
