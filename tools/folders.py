#!/usr/bin/env python3
"""Draws who includes, links and opens whom: folders.py LINKS, the list of what the build links, writes a drawing to standard output.
With --tables it writes the linter's table into the tables of README.md and CONTRIBUTING.md.

What is included comes from the linter's table, what is linked from the build. An arrow is left out where a way of other arrows leads
there as well. Graphviz finds the places; colours and words are ours."""

import html
import re
import subprocess
import sys
from pathlib import Path

from lint import ALLOWED, ROOT, folder_of
from tables import aligned_page, cells_of

# Who opens whom at run time; the simulator stands where the adapter library is.
OPENED = {"broker": "module/exports", "module/adapter": "simulator"}

# What is no part of a product: it may include and link all.
WORKSHOP = {"tests", "tools"}

KINDS = {"includes": "#4a5a6a", "linked": "#b3541e", "opened": "#2f7d4f"}
LEGEND = {"includes": "includes", "linked": "generated or linked, not included", "opened": "opened at run time"}
COLOURS = {"module": "#e8eef6", "kldrcim": "#f5eee2", "contracts": "#eeeeee", "broker": "#f5eee2", "simulator": "#e9f3ea"}


def may_include(folder):
    """A row of the linter's table as the pages have it: folders below the same one are named without it."""
    names = [name.removeprefix(folder.split("/")[0] + "/") for name in ALLOWED[folder].split()]
    return "all" if names == ["*"] else " ".join(f"`{name}`" for name in names) or "nothing"


def with_table(page):
    """The page with its table of folders as the linter has it. What a folder holds is for a person to write."""
    lines = page.split("\n")
    begin = next(at for at, line in enumerate(lines) if re.match(r"\| folder +\|( holds +\|)? may include +\|", line))
    end = next(at for at in range(begin, len(lines)) if not lines[at].startswith("|"))
    rows = {cells[0].strip("`/"): cells for cells in map(cells_of, lines[begin + 2:end])}
    shows_all = len(cells_of(lines[begin])) == 2
    made = []
    for folder in ALLOWED if shows_all else [each for each in reversed(ALLOWED) if each not in WORKSHOP]:
        holds = [] if shows_all else [rows.get(folder, ["", ""])[1]]
        made.append(f"| {' | '.join([f'`{folder}/`', *holds, may_include(folder)])} |")
    return aligned_page("\n".join(lines[:begin + 2] + made + lines[end:]))


def included():
    return {(folder, each) for folder, row in ALLOWED.items() if folder not in WORKSHOP
            for each in row.split() if each in ALLOWED}


def linked(lines):
    """Of lines `TARGET FOLDER LIBRARY...`; a library is a target, or none of ours."""
    rows = [line.split(" ") for line in lines]
    homes = {target: folder_of(folder + "/") for target, folder, *_ in rows}
    return {(homes[target], homes[library]) for target, _, *libraries in rows for library in libraries
            if library in homes and homes[target] != homes[library] and not {homes[target], homes[library]} & {*WORKSHOP, None}}


def reachable(start, arrows):
    seen, waiting = set(), [start]
    while waiting:
        for each in {head for tail, head in arrows if tail == waiting[-1]} - seen:
            seen.add(each)
            waiting.insert(0, each)
        waiting.pop()
    return seen


def without_shortcuts(arrows):
    """Without the arrows for which a longer way stands."""
    return {(tail, head) for tail, head in arrows
            if not any(head in reachable(each, arrows) for start, each in arrows if start == tail and each != head)}


def drawn(lines):
    """Every arrow that is drawn: tail, head, kind."""
    includes, links = included(), linked(lines)
    kept = without_shortcuts(includes | links)
    return sorted([(*arrow, "includes" if arrow in includes else "linked") for arrow in kept]
                  + [(*arrow, "opened") for arrow in OPENED.items()])


def width_of(folder):
    return 0.45 + 0.09 * len(folder)


def places(arrows):
    """Where Graphviz puts folders and arrows, in inches from the lower left corner."""
    folders = sorted({end for tail, head, _ in arrows for end in (tail, head)})
    text = ["digraph {", "newrank=true; nodesep=0.35; ranksep=0.5;",
            'node [shape=box, fixedsize=true, height=0.36, label=""]; edge [arrowhead=none, headport=n];']
    for group in ("module", "kldrcim"):
        members = " ".join(f'"{each}";' for each in folders if each.split("/")[0] == group)
        text.append(f'subgraph "cluster_{group}" {{ margin=14; {members} }}')
    text += [f'"{each}" [width={width_of(each):.2f}];' for each in folders]
    text += [f'"{tail}" -> "{head}";' for tail, head, _ in arrows] + ["}"]
    plain = subprocess.run(["dot", "-Tplain"], input="\n".join(text), capture_output=True, text=True, check=True).stdout
    nodes, ways, size = {}, {}, None
    for name, *rest in (line.replace('"', "").split() for line in plain.splitlines()):
        if name == "graph":
            size = tuple(map(float, rest[1:3]))
        elif name == "node":
            nodes[rest[0]] = tuple(map(float, rest[1:3]))
        elif name == "edge":
            numbers = list(map(float, rest[3:3 + 2 * int(rest[2])]))
            ways[rest[0], rest[1]] = list(zip(numbers[::2], numbers[1::2]))
    return size, nodes, ways


def svg(arrows):
    (width, height), nodes, ways = places(arrows)
    scale, margin, foot = 72, 22, 44

    def at(x, y):
        return f"{x * scale + margin:.0f},{(height - y) * scale + margin:.0f}"

    size = f"{width * scale + 2 * margin:.0f}", f"{height * scale + 2 * margin + foot:.0f}"
    out = [f'<svg xmlns="http://www.w3.org/2000/svg" width="{size[0]}" height="{size[1]}" '
           f'viewBox="0 0 {size[0]} {size[1]}" font-family="sans-serif" font-size="13">',
           "<title>Who includes, links and opens whom</title>",
           '<rect width="100%" height="100%" fill="#ffffff"/>', "<defs>"]
    for kind, colour in KINDS.items():
        out.append(f'<marker id="{kind}" viewBox="0 0 8 8" refX="8" refY="4" markerWidth="8" markerHeight="8" orient="auto">'
                   f'<path d="M0,0 L8,4 L0,8 z" fill="{colour}"/></marker>')
    out.append("</defs>")
    dashes = {"includes": "", "linked": ' stroke-dasharray="7 3"', "opened": ' stroke-dasharray="2 3"'}
    for tail, head, kind in arrows:
        first, *others = ways[tail, head]
        way = f"M{at(*first)} C" + " ".join(at(*point) for point in others)
        out.append(f'<path class="{kind}" d="{way}" fill="none" stroke="{KINDS[kind]}" stroke-width="1.3"{dashes[kind]} '
                   f'marker-end="url(#{kind})"><title>{tail}/ {LEGEND[kind].split(",")[0]}: {head}/</title></path>')
    for folder, (x, y) in nodes.items():
        wide = width_of(folder)
        corner = at(x - wide / 2, y + 0.18).split(",")
        out.append(f'<rect x="{corner[0]}" y="{corner[1]}" width="{wide * scale:.0f}" height="26" rx="4" '
                   f'fill="{COLOURS[folder.split("/")[0]]}" stroke="#4a5a6a"/>')
        middle = at(x, y).split(",")
        out.append(f'<text x="{middle[0]}" y="{int(middle[1]) + 4}" text-anchor="middle">{html.escape(folder)}/</text>')
    left, line = margin, int(size[1]) - 20
    for kind, words in LEGEND.items():
        out.append(f'<path d="M{left},{line} h34" fill="none" stroke="{KINDS[kind]}" stroke-width="1.3"{dashes[kind]} '
                   f'marker-end="url(#{kind})"/>')
        out.append(f'<text x="{left + 42}" y="{line + 4}">{words}</text>')
        left += 70 + 7 * len(words)
    return "\n".join([*out, "</svg>"]) + "\n"


def main():
    if sys.argv[1] == "--tables":
        for page in map(ROOT.joinpath, ("README.md", "CONTRIBUTING.md")):
            page.write_text(with_table(page.read_text(encoding="utf-8")), encoding="utf-8")
        return
    sys.stdout.write(svg(drawn(Path(sys.argv[1]).read_text(encoding="utf-8").splitlines())))


if __name__ == "__main__":
    main()
