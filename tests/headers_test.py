"""Each header stands for itself: what shares compiler runs would not show that one leans on its neighbour's includes.

A header is passed over where a source of the same name, which begins with it, has a run of its own. So are those of the tests.

Most of the time would go into what many of them include. Some of that is precompiled, and a header begins with the most that it
includes anyway: its own text then sees what it always sees, and a header between that leans on another is found out by itself.

headers_test.py SOURCE BUILD COMPILER
"""

import os
import re
import subprocess
import sys
import tempfile
from concurrent.futures import ThreadPoolExecutor
from functools import cache
from pathlib import Path

SHARE_RUNS = ("broker", "kldrcim", "simulator")
# Of the C interface only the whole is promised.
PASSED_OVER = ("contracts/cmpi", "tests")
# What a header takes, about: a library's is worth a few of ours, and to precompile takes longer than to compile.
LIBRARY_HEADER, PRECOMPILING = 5, 3
INCLUDE = re.compile(r'(?m)^#include [<"]([^>"]+)[>"]')


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
    first = INCLUDE.search(own.read_text(encoding="utf-8"))
    return bool(first) and first[1] == str(header)


class Includes:
    """What each header of ours includes, itself or through others."""

    def __init__(self, roots):
        self.roots = roots

    def _ours(self, name):
        return next((root / name for root in self.roots if (root / name).is_file()), None)

    @cache
    def of(self, name):
        """The name itself among them."""
        ours = self._ours(name)
        direct = INCLUDE.findall(ours.read_text(encoding="utf-8")) if ours else []
        return frozenset([name]).union(*map(self.of, direct))

    @cache
    def cost(self, name):
        return sum(1 if self._ours(each) else LIBRARY_HEADER for each in self.of(name))


def worth_precompiling(names, includes):
    """The headers that are: one at a time, the one that saves most beside those before."""
    chosen = []
    saved = dict.fromkeys(names, 0)

    def gain(candidate):
        cost = includes.cost(candidate)
        users = [each for each in names if candidate in includes.of(each)]
        return sum(max(0, cost - saved[each]) for each in users) - PRECOMPILING * cost

    candidates = sorted(frozenset().union(*map(includes.of, names)))
    while gain(best := max(candidates, key=gain)) > 0:
        chosen.append(best)
        for each in names:
            if best in includes.of(each):
                saved[each] = max(saved[each], includes.cost(best))
    return chosen


def main():
    source, build, compiler = Path(sys.argv[1]), Path(sys.argv[2]), sys.argv[3]
    roots = [source, build / "generated", source / "contracts/cmpi"]
    command = [
        compiler, "-std=c++20", "-Wall", "-Wextra", "-Werror", "-Wno-invalid-offsetof", "-D_GNU_SOURCE",
        "-D_FILE_OFFSET_BITS=64", "-D_TIME_BITS=64", *(f"-I{root}" for root in roots), "-isystem", "/usr/include/jsoncpp",
        "-x",
    ]  # fmt: skip
    includes = Includes(roots)
    wanted = [
        str(each) for each in headers(source) if not str(each).startswith(PASSED_OVER) and not is_proven(source, each)
    ]

    def compiled(*arguments, text=""):
        return subprocess.run([*command, *arguments], input=text, capture_output=True, text=True, check=False)

    with tempfile.TemporaryDirectory() as folder, ThreadPoolExecutor(os.cpu_count()) as pool:

        def precompiled(name):
            path = Path(folder, name)
            path.parent.mkdir(parents=True, exist_ok=True)
            path.write_text(f"#include <{name}>\n", encoding="utf-8")
            done = compiled("c++-header", str(path), "-o", f"{path}.gch")
            return None if done.returncode else path

        prepared = dict(pool.map(lambda name: (name, precompiled(name)), worth_precompiling(wanted, includes)))

        def complaint(header):
            fitting = [each for each in includes.of(header) if prepared.get(each)]
            begin = ["-include", str(prepared[max(fitting, key=includes.cost)])] if fitting else []
            # Through an empty source, so that nothing is said of a header that is compiled by itself.
            done = compiled("c++", "-Winvalid-pch", *begin, "-fsyntax-only", "-", text=f'#include "{header}"\n')
            return done.stderr if done.returncode else ""

        complaints = [each for each in pool.map(complaint, wanted) if each]
    print(f"{len(wanted)} headers, {len(complaints)} do not stand for themselves")
    print("".join(complaints))
    return 1 if complaints or not wanted else 0


sys.exit(main())
