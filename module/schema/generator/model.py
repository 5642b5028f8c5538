"""The resolved catalogue: classes with flat feature lists."""

from dataclasses import dataclass, field
from typing import Optional


@dataclass
class Feature:
    """A feature as one class declares it; heirs share it. `kind` is property, reference or method."""

    kind: str
    name: str
    owner: str
    #: CIM type of a property, return type of a method; None for a reference.
    type: Optional[str]
    #: Name of the class that a reference points to, else None.
    target: Optional[str]
    array: bool
    flags: int
    where: object
    #: The qualifier values that an override inherits.
    qualifiers: dict
    #: C++ text of the default, a list of texts for an array, None for none; and the class that states it.
    default: object = None
    default_owner: Optional[str] = None
    parameters: list = field(default_factory=list)


@dataclass
class Class:
    name: str
    superclass: Optional["Class"]
    flags: int
    qualifiers: dict
    where: object
    #: All features, the inherited ones first, each as its nearest class declares it.
    features: list = field(default_factory=list)

    def find(self, name):
        """Position of the feature in the flat list, or -1."""
        for position, feature in enumerate(self.features):
            if feature.name.lower() == name.lower():
                return position
        return -1

    def owns(self, feature):
        return feature.owner == self.name

    @property
    def own_features(self):
        return [feature for feature in self.features if self.owns(feature)]

    @property
    def methods(self):
        return [feature for feature in self.features if feature.kind == "method"]

    @property
    def cells(self):
        """What an instance holds: properties and references."""
        return [feature for feature in self.features if feature.kind != "method"]

    def derives_from(self, ancestor):
        class_ = self
        while class_ and class_ is not ancestor:
            class_ = class_.superclass
        return class_ is ancestor
