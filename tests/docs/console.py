#!/usr/bin/env python3
"""Runs the ```console blocks of Markdown files against a build, and compares what they show.

A line that begins with "$ " is a command, also over several lines that end in a backslash; what follows up to the next one is
its output, standard error included. In the output, a line "..." stands for any number of lines, and "..." inside a line for
any text; trailing blanks do not count. The commands of a block run in one shell, one after the other, in a folder that looks
like the repository after `./dev build`: `build/native` there is the build under test. The programs of the build are on PATH,
and the simulator with its demo host stands in for the adapter library.

Usage: console.py --source DIR --build DIR FILE...
"""

import argparse
import difflib
import re
import subprocess
import sys
import tempfile
from dataclasses import dataclass
from pathlib import Path

MARK = "--- end of a command of the documentation ---"
SECONDS = 120


@dataclass
class Step:
    line: int
    command: str
    expected: list


def blocks(text):
    """The console blocks of a file, each a list of steps."""
    found, block, fence = [], None, None
    for number, line in enumerate(text.splitlines(), 1):
        opening = re.match(r"\s*(```+)(\w*)", line)
        if fence:
            if opening and opening[1] == fence and not opening[2]:
                fence, block = None, None
            elif block is not None:
                add_line(block, number, line)
        elif opening:
            fence = opening[1]
            if opening[2] == "console":
                block = []
                found.append(block)
    return [block for block in found if block]


def add_line(block, number, line):
    if block and block[-1].command.endswith("\\") and not block[-1].expected:
        block[-1].command += "\n" + line
    elif line.startswith("$ "):
        block.append(Step(number, line[2:], []))
    elif block:
        block[-1].expected.append(line.rstrip())
    else:
        raise SystemExit(f"console.py: line {number}: a console block begins with a command")


def line_matches(expected, line):
    return re.fullmatch(".*".join(map(re.escape, expected.split("..."))), line) is not None


def matches(expected, lines):
    """Whether the output is what the page shows. `reach` holds how much of the output the lines so far can account for."""
    reach = {0}
    for each in expected:
        if each.strip() == "...":
            reach = set(range(min(reach), len(lines) + 1)) if reach else set()
        else:
            reach = {at + 1 for at in reach if at < len(lines) and line_matches(each, lines[at])}
    return len(lines) in reach


def outputs(block, folder, environment):
    """What each command of the block writes."""
    script = "".join(f"{step.command}\nprintf '\\n%s\\n' '{MARK}'\n" for step in block)
    done = subprocess.run(
        ["bash", "-c", script], stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, cwd=folder, env=environment,
        timeout=SECONDS, check=False, encoding="utf-8", errors="replace",
    )
    parts = done.stdout.split(f"\n{MARK}\n")
    return [[line.rstrip() for line in part.splitlines()] for part in parts[: len(block)]]


def trimmed(lines):
    """Without empty lines at the end."""
    end = len(lines)
    while end and not lines[end - 1].strip():
        end -= 1
    return lines[:end]


def failures(file, block, folder, environment):
    try:
        shown = outputs(block, folder, environment)
    except subprocess.TimeoutExpired:
        yield f"{file}:{block[0].line}: the block does not end within {SECONDS} seconds"
        return
    for step, lines in zip(block, shown):
        expected, lines = trimmed(step.expected), trimmed(lines)
        if not matches(expected, lines):
            difference = "\n".join(difflib.unified_diff(expected, lines, "in the page", "run", lineterm="", n=2))
            yield f"{file}:{step.line}: $ {step.command}\n{difference}\n"
    if len(shown) < len(block):
        yield f"{file}:{block[len(shown)].line}: the shell ended before this command"


def checkout(source, build, folder):
    """The repository as a reader has it, with the build under test at its usual place."""
    for entry in source.iterdir():
        if entry.name not in ("build", ".git"):
            (folder / entry.name).symlink_to(entry)
    (folder / "build").mkdir()
    (folder / "build/native").symlink_to(build)
    (folder / "home").mkdir()


def environment_of(build, folder):
    return {
        "PATH": f"{build}:{build / 'deploy'}:/usr/bin:/bin",
        "HOME": str(folder / "home"),
        "LANG": "C.UTF-8",
        "LC_ALL": "C.UTF-8",
        "LD_LIBRARY_PATH": str(build / "simulator"),
        "KLDR_SIMULATOR_INVENTORY": str(folder / "simulator/inventories/demo.json"),
    }


def main(arguments=None):
    parser = argparse.ArgumentParser(description="Runs the console blocks of Markdown files.")
    parser.add_argument("--source", type=Path, required=True)
    parser.add_argument("--build", type=Path, required=True)
    parser.add_argument("files", type=Path, nargs="+")
    options = parser.parse_args(arguments)
    count, failed = 0, []
    for file in options.files:
        for block in blocks(file.read_text(encoding="utf-8")):
            count += len(block)
            # A folder for each block: none builds upon another.
            with tempfile.TemporaryDirectory() as name:
                folder = Path(name)
                checkout(options.source.resolve(), options.build.resolve(), folder)
                failed += failures(file, block, folder, environment_of(options.build.resolve(), folder))
    print("\n".join(failed))
    print(f"{count} commands, {len(failed)} failures")
    return 1 if failed or not count else 0


if __name__ == "__main__":
    sys.exit(main())
