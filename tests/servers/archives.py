"""Which servers there are: archives that unpack below /opt/cim-servers, or folders unpacked from them."""

import re
import tarfile
from dataclasses import dataclass
from pathlib import Path

#: The program of each kind of server, below the server's own folder.
PROGRAMS = {"sfcb": "usr/sbin/sfcbd", "pegasus": "usr/sbin/cimserver"}
HOME = "opt/cim-servers"


@dataclass(frozen=True)
class Found:
    #: Folder below /opt/cim-servers.
    name: str
    #: A key of PROGRAMS.
    kind: str
    word_size: int
    #: The archive, or the folder.
    path: Path

    @property
    def title(self):
        return f"{self.kind} ({self.word_size} bits)"


#: `kldrcim serve`, which comes with the package and needs no archive.
SERVE = Found("serve", "serve", 64, Path(__file__).resolve().parent / "serve")


def word_size(head):
    """Of an ELF file with these first bytes."""
    if head[:4] != b"\x7fELF":
        raise ValueError("no ELF file")
    return {1: 32, 2: 64}[head[4]]


def in_archive(path):
    with tarfile.open(path) as archive:
        for member in archive:
            match = re.fullmatch(rf"(?:\./)?{HOME}/([^/]+)/(.*)", member.name)
            for kind, program in PROGRAMS.items():
                if match and match[2] == program:
                    return Found(match[1], kind, word_size(archive.extractfile(member).read(5)), path)
    return None


def in_folder(path):
    for kind, program in PROGRAMS.items():
        file = path / program
        if file.is_file():
            with file.open("rb") as stream:
                return Found(path.name, kind, word_size(stream.read(5)), path)
    return None


def find(path):
    """The servers at a path: an archive, an unpacked server, or a folder of either. Something else gives none."""
    path = Path(path).resolve()
    if path.is_file():
        found = [in_archive(path)] if tarfile.is_tarfile(path) else []
    elif path.is_dir():
        found = [in_folder(path)]
        if not found[0]:
            found = [each for entry in sorted(path.iterdir()) for each in find_entry(entry)]
    else:
        found = []
    return [each for each in found if each]


def find_entry(entry):
    """One entry of a folder; folders of folders are those of an unpacked archive."""
    if entry.is_dir() and not in_folder(entry):
        home = entry / HOME if (entry / HOME).is_dir() else entry
        return [in_folder(each) for each in sorted(home.iterdir()) if each.is_dir()] if home != entry else []
    return find(entry)
