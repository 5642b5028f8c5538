"""The folders of CIM servers below a root, and tools that fail, in ways that the real ones of tests/servers/ cannot be brought to."""

from pathlib import Path

from deploy_case import PROGRAMS

TOOLS = ("sfcbrepos", "sfcbdump", "cimmofl", "cimmof", "cimprovider", "cimcli", "cimserver")


class Fake_Servers:
    def __init__(self, root):
        self.root = Path(root)
        self.tools = self.root / "tools"
        self.tools.mkdir()
        for name in TOOLS:
            self.tool(name)

    def tool(self, name, status=1, words=""):
        """Puts the tool there, to say these words and end with this status."""
        said = self.tools / f"{name}.words"
        said.write_text(words, encoding="utf-8")
        file = self.tools / name
        file.write_text(f'#!/bin/sh\necho "$*" >>"{self.tools}/{name}.calls"\ncat "{said}" >&2\nexit {status}\n', encoding="utf-8")
        file.chmod(0o755)

    def calls(self, name):
        """How the tool was called, the root taken out."""
        record = self.tools / f"{name}.calls"
        return record.read_text(encoding="utf-8").replace(str(self.root), "").splitlines() if record.exists() else []

    def environment(self):
        return {"PATH": f"{self.tools}:{PROGRAMS}", "LC_ALL": "C.UTF-8"}

    def sfcb(self, schema):
        """`schema` are the names of the classes that the server's CIM Schema includes."""
        for folder in ("etc/sfcb", "var/lib/sfcb/registration", "var/lib/sfcb/stage/regs", "usr/share/sfcb/CIM", "usr/lib"):
            (self.root / folder).mkdir(parents=True, exist_ok=True)
        (self.root / "etc/sfcb/sfcb.cfg").touch()
        (self.root / "usr/share/sfcb/CIM/CIM_Schema.mof").write_text(
            "".join(f'#pragma include ("Core/{name}.mof")\n' for name in schema), encoding="utf-8"
        )

    def pegasus(self):
        for folder in ("etc/Pegasus", "var/lib/Pegasus/repository/root#PG_InterOp/instances", "usr/lib/Pegasus/providers"):
            (self.root / folder).mkdir(parents=True, exist_ok=True)

    def files(self):
        """Paths of the files and links below the root, those of the tools left out."""
        return sorted(
            str(path.relative_to(self.root))
            for path in self.root.rglob("*")
            if (path.is_symlink() or path.is_file()) and self.tools not in path.parents
        )
