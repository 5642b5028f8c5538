#!/usr/bin/env python3
"""House rules that a machine can check: include arrows, file sizes, mirrored tests, known traps."""

import itertools
import os
import re
import sys
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent

# Who may include whom: a row a folder, what it may include besides itself. What a generated source includes is not seen here, but
# in the lists of what is linked. A library's name in angle brackets stands for its headers.
ALLOWED = {
    "contracts/cmpi":     "",
    "contracts/adapter":  "<json>",
    "contracts/agent":    "",
    "module/runtime/ground": "",
    "module/runtime/text": "module/runtime/ground",
    "module/runtime/system": "module/runtime/ground module/runtime/text",
    "module/runtime/objects": "module/runtime/ground module/runtime/text module/runtime/system",
    "module/runtime/dispatch": "module/runtime/ground module/runtime/text module/runtime/system module/runtime/objects",
    # Whoever may include it may include all of its folders.
    "module/runtime":     "module/runtime/dispatch",
    "module/schema":      "module/runtime",
    "module/cmpi":        "module/runtime contracts/adapter contracts/cmpi",
    "module/adapter":     "module/runtime contracts/adapter <json>",
    "module/model":       "module/runtime module/schema module/adapter <json>",
    "module/agent":       "module/runtime module/schema module/adapter contracts/adapter contracts/agent <json>",
    "module/alerts":      "module/runtime module/schema module/adapter",
    "module/update":      "module/runtime module/schema module/adapter module/model",
    "module/diagnostics": "module/runtime module/schema module/adapter module/model",
    "module/managers":    "module/runtime module/schema module/adapter module/model module/diagnostics module/update",
    "module/providers":   "module/runtime module/schema module/adapter module/model module/agent module/alerts module/update"
                          " module/diagnostics module/managers",
    "module/exports":     "module/runtime/dispatch",
    "broker/values":      "contracts/cmpi",
    "broker":             "broker/values module/runtime contracts/cmpi",
    # Verbs and what stands below them know connections, not who answers.
    "kldrcim/input":      "broker/values",
    "kldrcim/connection": "broker/values",
    "kldrcim/local":      "broker/values broker kldrcim/input kldrcim/connection <json>",
    "kldrcim/walks":      "broker/values kldrcim/input kldrcim/connection contracts/agent <json>",
    "kldrcim/words":      "broker/values",
    "kldrcim/wire":       "broker/values kldrcim/words",
    "kldrcim/server":     "broker/values broker kldrcim/wire module/runtime/system",
    "kldrcim/client":     "broker/values kldrcim/input kldrcim/connection kldrcim/wire module/runtime/system",
    "kldrcim/formats":    "broker/values kldrcim/words kldrcim/walks <json>",
    "kldrcim/verbs":      "broker/values kldrcim/input kldrcim/connection kldrcim/words kldrcim/walks kldrcim/formats module/runtime/system",
    "kldrcim":            "broker kldrcim/client kldrcim/connection kldrcim/local kldrcim/input kldrcim/formats kldrcim/server kldrcim/verbs",
    "simulator":          "module/runtime/system contracts/adapter <json>",
    "tests":              "*",
    "tools":              "*",
}
# Headers that every program finds by these names, whoever's they are.
STANDARD = {"cmpidt.h": "contracts/cmpi", "cmpift.h": "contracts/cmpi", "cmpimacs.h": "contracts/cmpi"}

# Whose headers are seen; the standard library and the system are everyone's.
LIBRARIES = {"<json>"}

LONGEST = 600

# Patterns that have bitten before, with the folders where they are at home.
TRAPS = [
    (r"\.as(String|Int|UInt|Bool|CString|Double|Int64|UInt64)\(\)",
     "Json::Value conversions go through module/adapter/Json_Access.h", {"module/adapter/Json_Access.cpp"},
     {"broker", "kldrcim", "simulator", "tests"}),
    (r"\b(system|popen)\s*\(", "no shell: run argument vectors", set(), {"tests"}),
    (r"using namespace std;", "no 'using namespace std'", set(), set()),
    # Two debugging aids print by their contract.
    (r"\bstd::cout\b|\bprintf\(", "nothing writes to standard output inside a server",
     {"module/runtime/text/Buffer.cpp", "module/runtime/dispatch/cimom.cpp"}, {"broker", "kldrcim", "simulator", "tests"}),
    # The word that a provider's `once` marks is not ours to annotate.
    (r"\bstd::(recursive_|shared_)?mutex\s+\w+\s*;|\bpthread_mutex_t\s+\w+\s*[;=]",
     "clang cannot follow it: take module/runtime/system/Standard_Mutex.h", {"broker/Broker_System.cpp", "module/runtime/system/Mutex.h"},
     {"tests"}),
    (r"^\s*#\s*include\s*<iostream>", "iostream brings static constructors and compile time", set(), {"tests"}),
]


def sources():
    """Every source but what is built. Git is not asked: the files may have come without it."""
    for top, folders, names in os.walk(ROOT):
        folders[:] = sorted(each for each in folders if each != "build" and not each.startswith("."))
        for name in sorted(names):
            if name.endswith((".h", ".cpp", ".py")):
                yield Path(top, name).relative_to(ROOT)


def folder_of(path):
    """The row that a path belongs to, the innermost, or None."""
    return max((each for each in ALLOWED if path.startswith(each + "/")), key=len, default=None)


def check_arrows(path, lines, complain):
    folder = folder_of(str(path))
    if folder is None:
        complain(path, 1, "stands in a folder that has no row of allowed includes")
        return
    allowed = {folder, *ALLOWED[folder].split()}
    if "*" in allowed:
        return
    for number, line in enumerate(lines, 1):
        match = re.match(r'\s*#\s*include\s*(["<])([^">]+)[">]', line)
        if not match:
            continue
        bracket, name = match.groups()
        target = STANDARD.get(name) or folder_of(name)
        if bracket == "<" and not target:
            target = f"<{name.split('/')[0]}>" if "/" in name else None
            target = target if target in LIBRARIES else None
        elif not target and "/" not in name:
            complain(path, number, f'"{name}" does not say where it stands')
        if target and not {target, str(Path(target).parent)} & allowed:
            complain(path, number, f"{folder}/ may not include {target}")


def check_traps(path, lines, complain):
    for pattern, reason, files, folders in TRAPS:
        if str(path) in files or path.parts[0] in folders:
            continue
        for number, line in enumerate(lines, 1):
            code = re.sub(r"//.*", "", line)
            if re.search(pattern, code):
                complain(path, number, reason)


def check_mutexes(path, lines, complain):
    """A mutex says what it guards, in the file where it stands."""
    if path.parts[0] == "tests":
        return
    text = "\n".join(lines)
    for number, line in enumerate(lines, 1):
        match = re.search(r"\b(?:Mutex|Standard_Mutex<[^>]*>)\s+(\w+)\s*;", line)
        if match and not re.search(rf"\b(?:(?:PT_)?GUARDED_BY|REQUIRES)\({match.group(1)}\)", text):
            complain(path, number, f"{match.group(1)} guards nothing: GUARDED_BY or REQUIRES is missing")


def check_head(path, lines, complain):
    """A source without a header of its own says first what of whom stands in it. A provider's class says so, and tests are named
    after what they test."""
    if path.suffix == ".h" or path.parts[0] == "tests" or (ROOT / path.with_suffix(".h")).exists() or \
            path.match("module/providers/*_Provider.cpp"):
        return
    head = " ".join(itertools.takewhile(lambda line: line.startswith("// "), lines))
    if not re.search(r"\w{2}.*[.:]( |$)", head):
        complain(path, 1, "has no header: which sentence says what of whom stands here?")


def check_names(path, lines, complain):
    """Tests say what is so in one style, and members have their underscore in front."""
    for number, line in enumerate(lines, 1):
        if re.match(r"(TYPED_)?TEST(_[FP])?\(\w+, *[a-z]", line):
            complain(path, number, "a test's name is ThatOfASentence")
        member = re.match(r" +(?:mutable )?(?:const )?[A-Za-z_][\w:<>, *&]* [*&]*([a-z]\w*_)(?: = [^;]*|\{[^;]*)?;", line)
        if member and path.parts[0] != "module":
            complain(path, number, f"{member[1]} is a member: _{member[1][:-1]}")


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
            check_head(path, lines, complain)
            check_names(path, lines, complain)

    for failure in failures:
        print(failure)
    print(f"lint: {len(failures)} failures")
    return 1 if failures else 0


if __name__ == "__main__":
    sys.exit(main())
