"""Each header stands for itself: what shares compiler runs would not show that one leans on its neighbour's includes.

A header is passed over where a source of the same name, which begins with it, has a run of its own. So are those of the tests.

headers_test.py SOURCE BUILD COMPILER
"""

import os
import re
import subprocess
import sys
from concurrent.futures import ThreadPoolExecutor
from pathlib import Path

SHARE_RUNS = ("broker", "kldrcim", "simulator")
# Of the C interface only the whole is promised.
PASSED_OVER = ("contracts/cmpi", "tests")


def headers(source):
    for top, folders, names in os.walk(source):
        folders[:] = sorted(each for each in folders if each != "build" and not each.startswith("."))
        for name in sorted(names):
            if name.endswith(".h"):
                yield Path(top, name).relative_to(source)


def is_proven(source, header):
    """True if a source of its own begins with it."""
    own = source / header.with_suffix(".cpp")
    if header.parts[0] in SHARE_RUNS or not own.exists():
        return False
    first = re.search(r'(?m)^#include [<"]([^>"]+)[>"]', own.read_text(encoding="utf-8"))
    return bool(first) and first[1] == str(header)


def main():
    source, build, compiler = Path(sys.argv[1]), Path(sys.argv[2]), sys.argv[3]
    command = [
        compiler, "-std=c++20", "-fsyntax-only", "-Wall", "-Wextra", "-Werror", "-Wno-invalid-offsetof", "-D_GNU_SOURCE",
        "-D_FILE_OFFSET_BITS=64", "-D_TIME_BITS=64", f"-I{source}", f"-I{build}/generated", f"-I{source}/contracts/cmpi",
        "-isystem", "/usr/include/jsoncpp", "-x", "c++",
    ]  # fmt: skip
    wanted = [
        each
        for each in headers(source)
        if not str(each).startswith(PASSED_OVER) and not is_proven(source, each)
    ]

    def complaint(header):
        # Through an empty source, so that nothing is said of a header that is compiled by itself.
        text = f'#include "{header}"\n'
        done = subprocess.run([*command, "-"], input=text, capture_output=True, text=True, check=False)
        return done.stderr if done.returncode else ""

    with ThreadPoolExecutor(os.cpu_count()) as pool:
        complaints = [each for each in pool.map(complaint, wanted) if each]
    print(f"{len(wanted)} headers, {len(complaints)} do not stand for themselves")
    print("".join(complaints))
    return 1 if complaints or not wanted else 0


sys.exit(main())
