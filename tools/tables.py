#!/usr/bin/env python3
"""Aligns the columns of the tables in the pages; with --check, names those that are not.

A table whose bars stand below each other is left as it is, so that figures may stand at the right. So is one that would be wider
than a screen: its cells are sentences."""

import re
import sys
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent
WIDEST = 210
BAR = re.compile(r"(?<!\\)\|")


def pages():
    """Every page but what is built, nor what lies in folders that are the tools' own."""
    return sorted(page for page in ROOT.rglob("*.md")
                  if not any(part == "build" or part.startswith(".") for part in page.relative_to(ROOT).parts))


def cells_of(line):
    return [cell.strip() for cell in BAR.split(line.strip().strip("|"))]


def bars(line):
    return tuple(found.start() for found in BAR.finditer(line.rstrip()))


def aligned(lines):
    """The lines of one table, each column as wide as its widest cell."""
    rows = [cells_of(line) for line in lines]
    is_table = len(rows) > 1 and len({len(row) for row in rows}) == 1 and all(re.fullmatch("-+", cell) for cell in rows[1])
    if not is_table or len({bars(line) for line in lines}) == 1:
        return lines
    del rows[1]
    widths = [max(3, *(len(row[at]) for row in rows)) for at in range(len(rows[0]))]
    made = ["| " + " | ".join(cell.ljust(width) for cell, width in zip(row, widths)) + " |" for row in rows]
    if len(made[0]) > WIDEST:
        return lines
    return [made[0], "|" + "|".join("-" * (width + 2) for width in widths) + "|", *made[1:]]


def aligned_page(text):
    """The page with its tables aligned; a fenced block shows what it shows."""
    made, table, is_fenced = [], [], False
    for line in [*text.split("\n"), None]:
        if line is not None and re.match(r"\s*```", line):
            is_fenced = not is_fenced
        if line is not None and line.startswith("|") and not is_fenced:
            table.append(line)
            continue
        made += aligned(table)
        table = []
        made += [] if line is None else [line]
    return "\n".join(made)


def main():
    is_check, failures = "--check" in sys.argv[1:], 0
    for page in pages():
        text = page.read_text(encoding="utf-8")
        made = aligned_page(text)
        if made != text and is_check:
            failures += 1
            print(f"{page.relative_to(ROOT)}: a table's columns are not aligned: ./dev format")
        elif made != text:
            page.write_text(made, encoding="utf-8")
    return 1 if failures else 0


if __name__ == "__main__":
    sys.exit(main())
