"""The package inside the machine, handled by the real package tools."""

import re
import shutil
import subprocess
import tempfile
from pathlib import Path

from server import ADMINISTRATOR, MAINTAINER, room

NAME = "kldrprovider"
LIBRARY_FOLDER = Path("/usr/lib/cim")


def run(*command, path=ADMINISTRATOR, status=0, environment=None, **options):
    """Output and complaints together, of a command that must end with this status."""
    # A program that goes on in the background may keep the output: a file ends nevertheless.
    with tempfile.TemporaryFile(mode="w+", encoding="utf-8") as output:
        done = subprocess.run(
            [str(word) for word in command], check=False, timeout=300, stdin=subprocess.DEVNULL, stdout=output,
            stderr=subprocess.STDOUT,
            env={"HOME": "/root", "LC_ALL": "C.UTF-8", "DEBIAN_FRONTEND": "noninteractive", "PATH": path, **(environment or {})},
            **options,
        )  # fmt: skip
        output.seek(0)
        shown = output.read()
    if done.returncode != status:
        raise AssertionError(f"{' '.join(map(str, command))}: status {done.returncode}, not {status}\n{shown}")
    return shown


def install(file=None):
    """Installs the package of the server's word size, or the given file, and the simulator as the adapter library."""
    # Package managers give their scripts this path.
    shown = run("dpkg", "-i", file or room()["package"], path=MAINTAINER)
    if not (LIBRARY_FOLDER / "libdzntj.so").exists():
        shutil.copy(room()["adapter_library"], LIBRARY_FOLDER / "libdzntj.so")
    return shown


def remove():
    return run("dpkg", "-r", NAME, path=MAINTAINER)


def purge():
    return run("dpkg", "-P", NAME, path=MAINTAINER)


def register(*words, status=0, path=ADMINISTRATOR):
    """Lines of kldr-register, which must end with this status."""
    return run("kldr-register", *words, status=status, path=path).splitlines()


def next_release(change):
    """A package of version 1.0.99 whose installed folder `change(folder)` has altered."""
    with tempfile.TemporaryDirectory() as name:
        folder = Path(name) / "package"
        run("dpkg-deb", "-R", room()["package"], folder)
        control = folder / "DEBIAN/control"
        control.write_text(re.sub(r"(?m)^Version: .*$", "Version: 1.0.99", control.read_text(encoding="utf-8")), encoding="utf-8")
        change(folder)
        file = Path("/tmp/next.deb")
        run("dpkg-deb", "--root-owner-group", "-Znone", "-b", folder, file)
        return file
