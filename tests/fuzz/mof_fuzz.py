#!/usr/bin/env python3
"""Feeds the schema generator with MOF that was damaged at random: it accepts or refuses, and fails in no other way.

mof_fuzz.py SECONDS [SEED]
"""

import random
import sys
import time
from pathlib import Path

ROOT = Path(__file__).resolve().parents[2]
sys.path.insert(0, str(ROOT / "module/schema"))

from generator import errors, parser, resolver  # noqa: E402

SNIPPETS = ["class", "[key]", "{", "}", ";", "uint32", "string", '"', "\\", "/*", "//", "NULL", "= {", "REF", ":",
            "association", "0x", "-1", "99999999999999999999", "\0", "\u00e9", "#pragma include (\"x\")", "ref", ","]


def damaged(text, chance):
    """The text with one to six places cut, doubled, swapped or overwritten."""
    for _ in range(chance.randint(1, 6)):
        start = chance.randrange(len(text) + 1)
        end = min(len(text), start + chance.choice([0, 1, 2, 8, 40, 400]))
        piece = chance.choice(["", text[start:end] * 2, chance.choice(SNIPPETS), text[start:end][::-1]])
        text = text[:start] + piece + text[end:]
    return text


def main():
    seconds = float(sys.argv[1])
    chance = random.Random(int(sys.argv[2]) if len(sys.argv) > 2 else 1)
    seeds = [path.read_text() for path in sorted((ROOT / "module/schema/kaldera").glob("*.mof"))]
    standard = parser.parse([ROOT / "module/schema/cim.mof"])
    damaged_file = Path("damaged.mof")
    end = time.monotonic() + seconds
    accepted = refused = 0
    while time.monotonic() < end:
        text = damaged(chance.choice(seeds), chance)
        damaged_file.write_text(text)
        try:
            resolver.resolve(standard + parser.parse([damaged_file]))
            accepted += 1
        except errors.MofError:
            refused += 1
        except Exception:
            print(f"failed on {damaged_file}", file=sys.stderr)
            raise
    print(f"{accepted} accepted, {refused} refused")


if __name__ == "__main__":
    main()
