#!/usr/bin/env python3
"""Do the tests notice when the module is wrong? Draws small mutations at random places of its folders, builds each in a copy of
the sources and runs the tests that should notice. What survives has no test, or makes no difference to anybody: then a comment
at the line says so, `// Either way (KIND, ...): REASON`."""

import argparse
import os
import queue
import random
import sys
import threading
from collections import Counter
from dataclasses import dataclass

from mutants import places as reading
from mutants.tree import Broken, Tree

ROOT = os.path.dirname(os.path.dirname(os.path.abspath(__file__)))

# folder: its own tests, then those of others that reach it, quickest first.
MODULE = ["allocation_failures_test", "faults_test", "module_test", "bad_answers_test"]
TESTS = {
    "runtime":     ["runtime_test", "cmpi_test", "providers_test", "model_test", "alerts_test", "schema_test", *MODULE],
    "adapter":     ["adapter_test", "model_test", "missing_symbols_test", *MODULE],
    "cmpi":        ["cmpi_test", "cmpi_contained_test", "contracts_test", "providers_test", "module_alerts_test", *MODULE],
    "model":       ["model_test", "providers_test", *MODULE],
    "agent":       ["agent_test", *MODULE],
    "diagnostics": ["diagnostics_test", "module_diagnostics_test", "bad_answers_alone_test", *MODULE],
    "alerts":      ["alerts_test", "module_alerts_test", "bad_answers_alone_test", *MODULE],
    "update":      ["update_test", *MODULE],
    "providers":   ["providers_test", "alerts_test", "module_alerts_test", "module_diagnostics_test", *MODULE],
    "managers":    ["managers_test", "model_test", "providers_test", *MODULE],
    "exports":     ["module_alone_test", *MODULE],
}
# Of those that are not equivalent, in percent.
GOAL = 95


@dataclass
class Mutant:
    path: str
    place: reading.Place
    choice: str
    text: str
    verdict: str = ""
    by: str = ""

    @property
    def folder(self):
        return self.path.split("/")[1]

    def __str__(self):
        place, text = self.place, self.text
        where = f"{self.path}:{reading.line_of(text, place)}: {place.kind}: "
        if place.kind == "statement":
            return where + " ".join(text[place.start : place.end].split()) + " -> dropped"
        if "\n" in text[place.start : place.end]:
            return where + " ".join(text[place.start : place.end].split()) + " -> " + " ".join(self.choice.split())
        begin, end = text.rfind("\n", 0, place.start) + 1, text.find("\n", place.end)
        after = text[begin : place.start] + self.choice + text[place.end : end]
        return where + text[begin:end].strip() + " -> " + after.strip()


def mutants_of(root, only=None):
    """Every place of every folder that has tests, by kind: (path, text, place)."""
    found = {kind: [] for kind in reading.KINDS}
    for folder in TESTS:
        for top, folders, names in os.walk(os.path.join(root, "module", folder)):
            folders.sort()
            for name in sorted(names):
                path = os.path.relpath(os.path.join(top, name), root)
                if not name.endswith((".cpp", ".h", ".def")) or (only and path != only[0]):
                    continue
                with open(os.path.join(root, path), encoding="utf-8") as file:
                    text = file.read()
                for place in reading.places(text):
                    if not only or only[1] in (0, reading.line_of(text, place)):
                        found[place.kind].append((path, text, place))
    return found


def drawn(found, seed):
    """Mutants in the order of their drawing: first the kind, that the rare ones have their turn, then one of its places."""
    chance = random.Random(seed)
    left = {kind: list(places) for kind, places in found.items()}
    while kinds := [kind for kind in reading.KINDS if left[kind]]:
        places = left[chance.choice(kinds)]
        path, text, place = places.pop(chance.randrange(len(places)))
        yield Mutant(path, place, chance.choice(place.choices), text)


class Trial:
    """Takes from the drawing until so many have been judged; what the compiler refuses is not counted."""

    def __init__(self, drawing, count, out=print):
        self.drawing, self.count, self.out = drawing, count, out
        self.judged, self.refused, self.under_way = [], 0, 0
        self.changed = threading.Condition()
        self.failure = None

    def next(self):
        """None if there is nothing left to do. Waits while it may yet have to stand in for one that is under way."""
        with self.changed:
            while len(self.judged) + self.under_way >= self.count and self.under_way:
                self.changed.wait()
            if self.failure or len(self.judged) >= self.count:
                return None
            mutant = next(self.drawing, None)
            self.under_way += mutant is not None
            return mutant

    def done(self, mutant):
        with self.changed:
            self.under_way -= 1
            if mutant.verdict == "refused":
                self.refused += 1
            else:
                self.judged.append(mutant)
                by = f" by {mutant.by}" if mutant.by else ""
                self.out(f"{len(self.judged):4}/{self.count} {mutant.verdict}{by}: {mutant}")
            self.changed.notify_all()

    def work(self, judge):
        try:
            while mutant := self.next():
                if reading.is_equivalent(mutant.text, mutant.place):
                    mutant.verdict = "equivalent"
                else:
                    mutant.verdict, mutant.by = judge(
                        mutant.path, mutant.place.apply(mutant.text, mutant.choice), TESTS[mutant.folder])
                self.done(mutant)
        except BaseException as failure:
            with self.changed:
                self.failure = failure
                self.changed.notify_all()


def report(trial, seed, out=print):
    """The table and the survivors. True if the goal is reached."""
    rows = {folder: Counter(each.verdict for each in trial.judged if each.folder == folder) for folder in TESTS}
    rows["all"] = sum(rows.values(), Counter())
    out(f"\n{'folder':<12}{'killed':>8}{'survived':>10}{'equivalent':>12}")
    for folder, row in rows.items():
        out(f"{folder:<12}{row['killed']:>8}{row['survived']:>10}{row['equivalent']:>12}")
    survivors = [each for each in trial.judged if each.verdict == "survived"]
    if survivors:
        out("\nSurvived:")
        for each in sorted(survivors, key=lambda each: (each.path, each.place.start)):
            out(f"  {each}")
    all_ = rows["all"]
    counted = all_["killed"] + all_["survived"]
    share = 100 * all_["killed"] / counted if counted else 100
    out(f"\nseed {seed}: {share:.1f} % of {counted} killed, {GOAL} % is the goal; {trial.refused} more did not compile")
    return share >= GOAL


def prepared_trees(root, folder, count, tests):
    """The trees, built and tested side by side."""
    trees = queue.Queue()
    failures = []

    def prepare(number):
        try:
            tree = Tree(root, os.path.join(folder, f"tree{number}"), max(1, (os.cpu_count() or 1) // count))
            tree.prepare(tests)
            trees.put(tree)
        except BaseException as failure:
            failures.append(failure)

    threads = [threading.Thread(target=prepare, args=(number,)) for number in range(count)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    if failures:
        raise failures[0]
    ready = [trees.get() for _ in range(count)]
    for tree in ready:
        tree.seconds = {test: max(each.seconds[test] for each in ready) for test in tests}
    return ready


def place_named(text):
    path, _, line = text.partition(":")
    return os.path.normpath(path), int(line or 0)


def main(arguments):
    parser = argparse.ArgumentParser(prog="./dev mutate", description=__doc__)
    parser.add_argument("count", nargs="?", type=int, default=50, metavar="N", help="how many are judged (50)")
    parser.add_argument("seed", nargs="?", type=int, help="of the drawing; one is drawn if none is named")
    parser.add_argument("--at", type=place_named, metavar="FILE[:LINE]", help="only in this file, or at this line")
    parser.add_argument("--list", action="store_true", help="only tell what would be drawn, compiling or not")
    parser.add_argument("--trees", type=int, default=2, help="how many are tried at the same time (2)")
    options = parser.parse_args(arguments)
    seed = random.randrange(10**6) if options.seed is None else options.seed
    found = mutants_of(ROOT, options.at)
    changed = [options.at[0].split("/")[1]] if options.at else list(TESTS)
    trial = Trial(drawn(found, seed), min(options.count, sum(map(len, found.values()))), lambda text: print(text, flush=True))
    trial.out(f"seed {seed}, {trial.count} of {sum(map(len, found.values()))} places")
    if options.list:
        for _ in range(trial.count):
            trial.out(str(next(trial.drawing)))
        return 0
    try:
        tests = sorted({test for folder in changed for test in TESTS[folder]})
        trees = prepared_trees(ROOT, os.path.join(ROOT, "build", "mutate"), options.trees, tests)
    except Broken as broken:
        print(f"mutate: not even without a mutation:\n{broken}", file=sys.stderr)
        return 2
    trial.out("seconds without a mutation: " + ", ".join(f"{test} {trees[0].seconds[test]:.1f}" for test in tests))
    workers = [threading.Thread(target=trial.work, args=(tree.judge,)) for tree in trees]
    for worker in workers:
        worker.start()
    for worker in workers:
        worker.join()
    if trial.failure:
        raise trial.failure
    return 0 if report(trial, seed, trial.out) else 1


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
