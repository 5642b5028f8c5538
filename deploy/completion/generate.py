"""Writes the completion of kldrcim for bash, zsh and fish from its own tables, and beside it what the classes have.

Usage: generate.py OUTPUT SCHEMA TABLES KLDRCIM MODULE"""

import json
import re
import subprocess
import sys
from pathlib import Path

HERE = Path(__file__).parent
#: What completes a word of a verb's arguments or an option's value; a word that is not here has nothing to offer.
KINDS = {
    "CLASS": "classes",
    "PATH": "classes",
    "PATTERN": "classes",
    "METHOD": "methods",
    "TEST": "tests",
    "FILE": "files",
    "CERT KEY": "files",
    "NAME=VALUE": "assignments",
    "NAME=VALUE...": "assignments",
    "A,B,C": "properties",
    "[-]NAME": "properties",
}
#: The same words, where they mean something else: of cm they are parameters, which are not looked up.
OTHERWISE = {("rpc", "METHOD"): "rpc_methods", ("cm", "[NAME=VALUE...]"): "value"}


def kind(word, takes=None):
    """Of a word in a table: "words:a b" for a choice."""
    if re.fullmatch(r"[a-z]+(\|[a-z]+)+", word):
        return "words:" + word.replace("|", " ")
    if takes and (words := re.fullmatch(r"[a-z]+(, [a-z]+)* or [a-z]+", takes)):
        return "words:" + " ".join(re.split(", | or ", words[0]))
    return KINDS.get(word.strip("[]"), KINDS.get(word, "value"))


def values(tables):
    """(verb or *, option, kind) of the options that take a value; what is a verb's own comes first."""
    rows = []
    for verb in tables["verbs"]:
        rows.append((verb["name"], "--format", "words:" + verb["formats"]))
        rows += [(verb["name"], each["name"], kind(each["value"], each["takes"])) for each in verb["options"] if each["value"]]
    everyone = {each["name"]: each for verb in tables["verbs"] for each in verb["options"]}
    everyone.update({each["name"]: each for each in tables["common"]})
    # An option without value stands for both of its name, as it does for the program.
    flags = {each["name"] for verb in tables["verbs"] for each in verb["options"] if not each["value"]}
    for name, each in everyone.items():
        if each["value"] and name not in flags:
            rows.append(("*", name, kind(each["value"], each["takes"])))
    return rows


def pairs(tables):
    """The options that take two values."""
    return sorted({each["name"] for verb in tables["verbs"] for each in verb["options"] if " " in (each["value"] or "")})


def arguments(tables):
    """(verb, first word or *, place or *, kind) of the arguments that have something to offer."""
    rows, firsts = [], {}
    for verb in tables["verbs"]:
        for form in verb["arguments"].split("\n"):
            words, first = form.split(), "*"
            for place, word in enumerate(words):
                if word.startswith("-"):
                    break
                if not place and re.fullmatch("[a-z]+", word):
                    first = word
                    firsts.setdefault(verb["name"], []).append(word)
                    continue
                what = OTHERWISE.get((verb["name"], word), kind(word))
                if what != "value":
                    rows.append((verb["name"], first, "*" if "..." in word else str(place), what))
    rows += [(verb, "*", "0", "words:" + " ".join(words)) for verb, words in firsts.items()]
    # The narrower place first.
    return sorted(rows, key=lambda row: (row[0], row[2] == "*", row[1] == "*"))


def names(options):
    return sorted({each["name"] for each in options})


def options_of(tables):
    common = names(tables["common"])
    every = names([*tables["common"], *(each for verb in tables["verbs"] for each in verb["options"])])
    return {verb["name"]: sorted({*common, *names(verb["options"])}) for verb in tables["verbs"]}, every


def shell_cases(rows, indent=8):
    return "\n".join(f"{' ' * indent}{pattern}) {action} ;;" for pattern, action in rows)


def fish_cases(rows):
    return "\n".join(f"        case {pattern}\n            {action}" for pattern, action in rows)


def pattern(*parts):
    return "\\ ".join(parts)


def fish_pattern(*parts):
    return "'" + " ".join(parts) + "'"


def described(names_and_texts):
    """Words with what they mean, as fish shows them."""
    return " ".join("'" + f"{name}\t{text}".replace("\\", "\\\\").replace("'", "\\'") + "'" for name, text in names_and_texts)


def fills(tables, tests, rpc_methods):
    by_verb, every = options_of(tables)
    value_rows, argument_rows = values(tables), arguments(tables)
    summaries = {each["name"]: each["summary"] for verb in tables["verbs"] for each in [*verb["options"], *tables["common"]]}
    offers = [*by_verb.items(), ("*", every)]
    return {
        "VALUES": shell_cases((pattern(verb, name), f'_kldrcim_kind="{what}"') for verb, name, what in value_rows),
        "VALUES_FISH": fish_cases((fish_pattern(verb, name), f"echo '{what}'") for verb, name, what in value_rows),
        "ARGUMENTS": shell_cases((pattern(*row[:3]), f'_kldrcim_kind="{row[3]}"') for row in argument_rows),
        "ARGUMENTS_FISH": fish_cases((fish_pattern(*row[:3]), f"echo '{row[3]}'") for row in argument_rows),
        "OPTIONS": shell_cases((verb, f'echo "{" ".join(known)}"') for verb, known in by_verb.items()),
        "OPTIONS_FISH": fish_cases(
            (f"'{verb}'", "printf '%s\\n' " + described((name, summaries[name]) for name in known)) for verb, known in offers
        ),
        "COMMON": " ".join(every),
        "PAIRS": "|".join(pairs(tables)),
        "PAIRS_FISH": " ".join(pairs(tables)),
        "VERBS": " ".join(sorted(verb["name"] for verb in tables["verbs"])),
        "VERBS_FISH": described((verb["name"], verb["summary"].split("\n")[0]) for verb in tables["verbs"]),
        "TESTS": " ".join(tests),
        "RPC_METHODS": " ".join(rpc_methods),
    }


def filled(text, words):
    return re.sub("@([A-Z_]+)@", lambda match: filled(words[match[1]], words) if match[1] in words else match[0], text)


def class_lines(schema):
    """CLASS|properties|methods of each product class."""
    sys.path.insert(0, str(schema))
    from generator.parser import parse
    from generator.resolver import resolve

    for class_ in resolve(parse([str(schema / "cim.mof"), str(schema / "kaldera.mof")])):
        if class_.name.startswith("KALDERA_") and class_.name != "KALDERA_DiagnosticTest":
            cells, methods = [each.name for each in class_.cells], [each.name for each in class_.methods]
            yield f"{class_.name}|{' '.join(cells)}|{' '.join(methods)}"


def main():
    output, schema, tables, kldrcim, module = map(Path, sys.argv[1:])

    def asked(*words):
        command = [kldrcim, "--module", module, "--format", "json", *words]
        return json.loads(subprocess.run(command, capture_output=True, text=True, check=True).stdout)

    tests = sorted(each["properties"]["Name"].split(":")[-1] for each in asked("diag", "list") if "Name" in each["properties"])
    rpc_methods = [each["method"] for each in asked("rpc", "--list")]
    words = fills(json.loads(subprocess.run([tables], capture_output=True, text=True, check=True).stdout), tests, rpc_methods)
    words["LOOK"] = (HERE / "look.sh.in").read_text(encoding="utf-8").rstrip("\n")
    output.mkdir(parents=True, exist_ok=True)
    for shell in ("bash", "zsh", "fish"):
        text = (HERE / f"kldrcim.{shell}.in").read_text(encoding="utf-8")
        (output / f"kldrcim.{shell}").write_text(filled(text, words), encoding="utf-8")
    (output / "classes").write_text("\n".join(class_lines(schema)) + "\n", encoding="utf-8")


if __name__ == "__main__":
    main()
