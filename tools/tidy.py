"""clang-tidy over all that is used, with the checks of .clang-tidy: every compiler run of a build by clang, or files by name.

Files that share a compiler run are looked at together, which is several times faster. What is generated is passed over.

tidy.py BUILD [FILE...]
"""

import json
import os
import re
import subprocess
import sys
from concurrent.futures import ThreadPoolExecutor
from pathlib import Path

ROOT = Path(__file__).resolve().parents[1]
FOLDERS = "module|broker|kldrcim|simulator|contracts"


def runs(build):
    """The files of the build's own compiler runs, those that CMake makes of several of ours among them."""
    ours = re.compile(rf"{ROOT}/({FOLDERS})/|{build}/({FOLDERS}|command_line)/.*/Unity/")
    for each in json.loads((build / "compile_commands.json").read_text(encoding="utf-8")):
        if ours.match(each["file"]):
            yield each["file"]


def found_in(build, file):
    """What is found in our files, and whether that is nothing."""
    command = ["clang-tidy", "--quiet", "-p", str(build), f"--header-filter=^{ROOT}/({FOLDERS})/", file]
    done = subprocess.run(command, capture_output=True, text=True, check=False)
    return done.stdout, done.returncode == 0


def main():
    build = Path(sys.argv[1]).resolve()
    files = [str(Path(each).resolve()) for each in sys.argv[2:]] or sorted(runs(build))
    if not files:
        sys.exit(f"tidy: nothing to look at in {build}")
    # A header is included by many: each finding is told once.
    told, clean = set(), True
    with ThreadPoolExecutor(os.cpu_count()) as pool:
        for text, is_clean in pool.map(lambda each: found_in(build, each), files):
            clean = clean and is_clean
            for finding in re.split(r"(?m)^(?=/)", text):
                if finding.strip() and finding not in told:
                    told.add(finding)
                    print(finding.replace(f"{ROOT}/", ""), end="", flush=True)
    print(f"tidy: {len(files)} compiler runs, {'clean' if clean else 'not clean'}")
    return 0 if clean else 1


if __name__ == "__main__":
    sys.exit(main())
