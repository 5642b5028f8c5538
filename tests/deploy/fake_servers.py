"""The folders of CIM servers below a root, and stand-ins for their tools, which do what matters here and keep a record."""

import textwrap
from pathlib import Path

from deploy_case import PROGRAMS

REGISTRATION = "KLDRProviderModule"

TOOLS = {
    # Makes the registration anew from all that is staged.
    "sfcbrepos": """
        cat "$FAKE_ROOT"/var/lib/sfcb/stage/default.reg "$FAKE_ROOT"/var/lib/sfcb/stage/regs/*.reg \\
            >"$FAKE_ROOT/var/lib/sfcb/registration/providerRegister" 2>/dev/null
        true""",
    # Both compilers: last argument a file, one argument -nNAMESPACE.
    "cimmofl": """
        for word in "$@"; do case $word in -n*) namespace=${word#-n} ;; esac; file=$word; done
        folder=$FAKE_ROOT/var/lib/Pegasus/repository/$(echo "$namespace" | tr / '#')
        mkdir -p "$folder"
        cp "$file" "$folder/"
        """,
    "cimprovider": """
        file=$FAKE_ROOT/var/lib/Pegasus/repository/root#PG_InterOp/kldrprovider.pegasus.mof
        case $1 in -l) [ -e "$file" ] ;; -r) rm "$file" ;; esac
        """,
    "cimcli": "true",
}
TOOLS["cimmof"] = TOOLS["cimmofl"]


class Fake_Servers:
    def __init__(self, root):
        self.root = Path(root)
        self.tools = self.root / "tools"
        self.record = self.root / "calls"
        self.tools.mkdir()
        for name in TOOLS:
            self.tool(name)

    def tool(self, name, status=0, words=""):
        """Puts the tool there, to succeed or to fail with these words."""
        body = textwrap.dedent(TOOLS[name]) if not status else f'echo "{words}" >&2; exit {status}'
        file = self.tools / name
        file.write_text(f'#!/bin/bash\necho "{name} $*" >>"$FAKE_ROOT/calls"\n{body}\n', encoding="utf-8")
        file.chmod(0o755)

    def without(self, name):
        (self.tools / name).unlink()

    def environment(self):
        return {"PATH": f"{self.tools}:{PROGRAMS}", "FAKE_ROOT": str(self.root), "LC_ALL": "C"}

    def calls(self):
        """The tools called since the last look, the root taken out."""
        if not self.record.exists():
            return []
        lines = self.record.read_text(encoding="utf-8").replace(str(self.root), "").splitlines()
        self.record.unlink()
        return lines

    def sfcb(self, settings="", schema=True):
        for folder in ("etc/sfcb", "var/lib/sfcb/registration", "var/lib/sfcb/stage/regs", "usr/share/sfcb/CIM", "usr/lib"):
            (self.root / folder).mkdir(parents=True, exist_ok=True)
        (self.root / "etc/sfcb/sfcb.cfg").write_text(settings, encoding="utf-8")
        (self.root / "var/lib/sfcb/stage/default.reg").write_text("[Other]\n   location: other\n", encoding="utf-8")
        if schema:
            (self.root / "usr/share/sfcb/CIM/CIM_Schema.mof").touch()

    def pegasus(self):
        for folder in ("etc/Pegasus", "var/lib/Pegasus/repository/root#PG_InterOp", "usr/lib/Pegasus/providers"):
            (self.root / folder).mkdir(parents=True, exist_ok=True)

    def files(self, folder):
        """Names of the files and links below a folder of the root."""
        top = self.root / folder
        return sorted(str(path.relative_to(top)) for path in top.rglob("*") if path.is_symlink() or path.is_file())
