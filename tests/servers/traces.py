"""What a server keeps, and what of ours is left on the machine."""

import hashlib
import os
import re
import subprocess
from pathlib import Path

#: Where each kind of server keeps classes, registrations and settings.
STORES = {
    "sfcb": ("/var/lib/sfcb", "/etc/sfcb"),
    "pegasus": ("/var/lib/Pegasus/repository", "/etc/Pegasus/cimserver_planned.conf"),
}
OURS = re.compile(rb"KALDERA|kldr|KLDR|kaldera")
#: Of what is written into the machine: the diaries of package manager and server, and what the test itself has put there.
PASSED_OVER = ("var/log/", "var/cache/", "var/lib/dpkg/status-old", "usr/lib/cim/libdzntj.so", "tmp/next.deb")


def digest(data):
    return hashlib.sha256(data).hexdigest()


def live_instances(index):
    """Of an OpenPegasus file of instances: those in use, without the room that deleted ones still take."""
    data = index.with_suffix(".instances").read_bytes()
    found = []
    for line in index.read_bytes().splitlines()[1:]:
        gone, _, begin, size, key = line.split(b" ", 4)
        if gone == b"0":
            found.append((key, data[int(begin) : int(begin) + int(size)]))
    return sorted(found)


def sfcb_repository_file(file):
    """sfcbmof leaves chance bytes between what it writes, so that two runs on the same files differ: of classes counts what the
    server's own tool reads, of the others the index and the size."""
    if file.name == "classSchemas":
        shown = subprocess.run(["/usr/local/bin/sfcbdump", file], capture_output=True, text=True, check=True).stdout
        return digest(shown.encode())
    return str(file.stat().st_size)


def stored(kind):
    """Each file that the server keeps, with a sum of what it says."""
    found = {}
    for store in STORES[kind]:
        top = Path(os.path.realpath(store))
        for file in [top] if top.is_file() else sorted(top.rglob("*")):
            if file.is_dir():
                found[f"{file}/"] = ""
            elif file.suffix == ".idx" and kind == "pegasus":
                instances = live_instances(file)
                if instances:
                    found[str(file)] = digest(repr(instances).encode())
            elif kind == "sfcb" and "repository/" in str(file) and file.suffix != ".idx":
                found[str(file)] = sfcb_repository_file(file)
            elif file.suffix != ".instances" or kind != "pegasus":
                found[str(file)] = digest(file.read_bytes())
    return found


def registered_text(kind):
    """What the server reads of its providers at its start, as text."""
    if kind == "sfcb":
        return Path("/var/lib/sfcb/registration/providerRegister").read_text(encoding="utf-8")
    folder = Path("/var/lib/Pegasus/repository/root#PG_InterOp/instances")
    return "\n".join(key.decode() for name in sorted(folder.glob("PG_Provider*.idx")) for key, _ in live_instances(name))


def of_ours():
    """Files written into the machine that are named after us or speak of us, and links to them."""
    found = []
    top = Path("/mnt/written")
    for path in sorted(top.rglob("*")):
        name = str(path.relative_to(top))
        # A file that is in the machine no more has a special file in its place.
        if name.startswith(PASSED_OVER) or name.endswith("sfcbd.out") or not (path.is_file() or path.is_symlink() or path.is_dir()):
            continue
        text = name.encode()
        if path.is_symlink():
            text += os.readlink(path).encode()
        elif path.is_file() and not is_freed(path):
            text += path.read_bytes()
        if OURS.search(text):
            found.append(name)
    return found


def is_freed(path):
    """OpenPegasus leaves deleted instances in their file until it is tidied; they are looked at through their index."""
    if path.suffix == ".idx":
        path = path.with_suffix(".instances")
    return path.suffix == ".instances" and "Pegasus" in str(path)
