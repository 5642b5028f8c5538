"""Writes the profile registrations for a server's interop namespace: two classes, and the instances that the module itself
enumerates, so that both say the same. Usage: interop_mof.py OUTPUT KLDRCIM MODULE MOF..."""

import subprocess
import sys
from pathlib import Path

HEAD = """// Profile registrations for the interop namespace, where clients look for them first: the profiles and subprofiles that the
// provider module publishes in root/kaldera. Generated from the module.
"""


def instances(kldrcim, module, class_name):
    command = [kldrcim, "--module", module, "--format", "mof", "ei", class_name]
    done = subprocess.run(command, capture_output=True, text=True, check=False)
    if done.returncode:
        sys.exit(f"interop_mof.py: {' '.join(command)}: {done.stderr.strip()}")
    return done.stdout


def main(output, kldrcim, module, *classes):
    parts = [HEAD, *(Path(file).read_text(encoding="utf-8") for file in classes)]
    parts += [instances(kldrcim, module, Path(file).stem) for file in classes]
    Path(output).write_text("\n".join(parts), encoding="utf-8")


if __name__ == "__main__":
    main(*sys.argv[1:])
