"""What the parser reads, as it stands in the MOF."""

from dataclasses import dataclass, field
from typing import Optional

from .errors import Where


@dataclass
class QualifierType:
    name: str
    type: str
    default: object
    scopes: list
    flavors: list
    where: Where


@dataclass
class Qualifier:
    """A use of a qualifier; value is True where none is written."""

    name: str
    value: object
    where: Where


@dataclass
class Literal:
    """A default: kind is number, string, char or name (true, false, null); a list of literals for an array."""

    kind: str
    value: object
    where: Where


@dataclass
class Element:
    """A property, reference, method or parameter. `type` is the CIM type, or the target class of a reference."""

    kind: str
    name: str
    type: str
    array: bool
    qualifiers: list
    where: Where
    default: Optional[Literal] = None
    parameters: list = field(default_factory=list)
    is_reference: bool = False
    #: Offset in the file of the bracket that ends the qualifiers; without qualifiers, of the type.
    qualifiers_end: int = 0


@dataclass
class ClassDeclaration:
    name: str
    superclass: Optional[str]
    qualifiers: list
    elements: list
    where: Where
