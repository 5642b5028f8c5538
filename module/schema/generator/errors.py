"""The one way in which the generator refuses its input."""


class Where:
    """A place in a MOF file, printed as FILE:LINE."""

    __slots__ = ("file", "line")

    def __init__(self, file, line):
        self.file = file
        self.line = line

    def __str__(self):
        return f"{self.file}:{self.line}"


class MofError(Exception):
    """Faulty MOF: where, and why."""

    def __init__(self, where, reason):
        super().__init__(f"{where}: {reason}")
