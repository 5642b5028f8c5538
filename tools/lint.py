#!/usr/bin/env python3
"""House rules that a machine can check: include arrows, file sizes, mirrored tests, known traps."""

import os
import re
import sys
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent

# A room may include what stands on a lower floor, and itself.
FLOORS = {
    "runtime": 1,
    "adapter": 2,
    "schema": 2,
    "cmpi": 3,
    "model": 4,
    "agent": 5,
    "diagnostics": 5,
    "alerts": 5,
    "update": 5,
    "providers": 6,
    "module": 7,
}
# The managers send a class id to the helper that owns it, those of higher rooms included: they are the roof of their room, and
# no helper may include them.
ROOF = {"model/FCHBAManager.cpp": 5, "model/HDRManager.cpp": 5, "model/ServerManager.cpp": 5}
# Beside the house: what they may include of it. The simulator shares the exception type with the module, and the host reads
# the catalogue's records.
BESIDE = {
    "host": {"host", "cmpi", "runtime"},
    "simulator": {"simulator", "adapter"},
    "tests": None,
    "bench": None,
    "fuzz": None,
}

# What a folder beside the house may read although it may not include their room: tables without code, and locks.
LENT = {"host": {"agent/Methods.def"}, "simulator": {"runtime/Standard_Mutex.h"}}

LONGEST = 600

# Patterns that have bitten before, with the folders where they are at home.
TRAPS = [
    (r"\.as(String|Int|UInt|Bool|CString|Double|Int64|UInt64)\(\)",
     "Json::Value conversions go through adapter/Json_Access.h", {"adapter/Json_Access.cpp"},
     {"host", "simulator", "tests", "bench", "fuzz"}),
    (r"\b(system|popen)\s*\(", "no shell: run argument vectors", set(), {"tests", "bench"}),
    (r"using namespace std;", "no 'using namespace std'", set(), set()),
    # Two debugging aids print by their contract.
    (r"\bstd::cout\b|\bprintf\(", "nothing writes to standard output inside a server",
     {"runtime/Buffer.cpp", "runtime/cimom.cpp"}, {"host", "tests", "simulator", "bench", "fuzz"}),
    # The word that a provider's `once` marks is not ours to annotate.
    (r"\bstd::(recursive_|shared_)?mutex\s+\w+\s*;|\bpthread_mutex_t\s+\w+\s*[;=]",
     "clang cannot follow it: take runtime/Standard_Mutex.h", {"host/Broker_System.cpp", "runtime/Mutex.h"},
     {"tests", "bench", "fuzz"}),
    (r"^\s*#\s*include\s*<iostream>", "iostream brings static constructors and compile time", set(), {"tests"}),
]


def sources():
    """Every source but what is built. Git is not asked: the files may have come without it."""
    for top, folders, names in os.walk(ROOT):
        folders[:] = sorted(each for each in folders if each != "build" and not each.startswith("."))
        for name in sorted(names):
            if name.endswith((".h", ".cpp", ".py")):
                yield Path(top, name).relative_to(ROOT)


def check_arrows(path, lines, complain):
    room = path.parts[0]
    for number, line in enumerate(lines, 1):
        match = re.match(r'\s*#\s*include\s*"(([^"/]+)/[^"]*)"', line)
        if not match or match.group(1) in LENT.get(room, ()):
            continue
        target = match.group(2)
        if target == room or (target not in FLOORS and target not in BESIDE):
            continue
        if room in FLOORS:
            floor = ROOF.get(str(path), FLOORS[room] - 1)
            if FLOORS.get(target, 99) > floor:
                complain(path, number, f"{room}/ may not include {target}/, which does not stand below it")
        elif room in BESIDE and BESIDE[room] is not None and target not in BESIDE[room]:
            complain(path, number, f"{room}/ may not include {target}/")


def check_traps(path, lines, complain):
    for pattern, reason, files, rooms in TRAPS:
        if str(path) in files or path.parts[0] in rooms:
            continue
        for number, line in enumerate(lines, 1):
            code = re.sub(r"//.*", "", line)
            if re.search(pattern, code):
                complain(path, number, reason)


def check_mutexes(path, lines, complain):
    """A mutex says what it guards, in the file where it stands."""
    if path.parts[0] in ("tests", "bench", "fuzz"):
        return
    text = "\n".join(lines)
    for number, line in enumerate(lines, 1):
        match = re.search(r"\b(?:Mutex|Standard_Mutex<[^>]*>)\s+(\w+)\s*;", line)
        if match and not re.search(rf"\b(?:(?:PT_)?GUARDED_BY|REQUIRES)\({match.group(1)}\)", text):
            complain(path, number, f"{match.group(1)} guards nothing: GUARDED_BY or REQUIRES is missing")


def main():
    failures = []

    def complain(path, number, text):
        failures.append(f"{path}:{number}: {text}")

    for path in sources():
        text = (ROOT / path).read_text(encoding="utf-8")
        lines = text.splitlines()
        if len(lines) > LONGEST:
            complain(path, len(lines), f"longer than {LONGEST} lines: is it one thing?")
        if path.suffix == ".h" and "#pragma once" not in text and not text.startswith("#ifndef") and \
                "#ifndef" not in text:
            complain(path, 1, "header without include guard")
        if path.suffix in (".h", ".cpp"):
            check_arrows(path, lines, complain)
            check_traps(path, lines, complain)
            check_mutexes(path, lines, complain)

    for failure in failures:
        print(failure)
    print(f"lint: {len(failures)} failures")
    return 1 if failures else 0


if __name__ == "__main__":
    sys.exit(main())
