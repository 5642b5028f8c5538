"""The command line of the generator."""

import argparse
import sys

from . import listing, loading, module, records, registrations, skeletons, tables, value_maps, value_words
from .errors import MofError
from .flags import ASSOCIATION, INDICATION
from .output import Output
from .parser import parse_all
from .resolver import resolve


def provider_kind(class_):
    if class_.flags & INDICATION:
        return "indication"
    return "association" if class_.flags & ASSOCIATION else "instance"


def providers_of(classes, prefix, without):
    """The classes that have a provider, with their kind, in the order of the catalogue."""
    return [
        (class_, provider_kind(class_))
        for class_ in classes
        if class_.name.startswith(prefix) and class_.name not in without
    ]


def read(files):
    """The declarations of the files, which must be all that there are."""
    declarations, included = parse_all(files)
    listing.check(files, included)
    return declarations


def generate(files, prefix, without=()):
    """All generated files of the MOF files, in memory."""
    classes = resolve(read(files))
    providers = providers_of(classes, prefix, without)
    output = Output()
    records.emit(classes, output)
    tables.emit(classes, output)
    skeletons.emit(providers, output)
    module.emit(providers, output)
    return output


def maps_of(path, classes):
    return value_maps.read(path, classes) if path else {}


def words(files, maps):
    """What programs read that show values to people, in memory."""
    classes = resolve(read(files))
    output = Output()
    value_words.emit(classes, maps_of(maps, classes), output)
    return output


def deployment(files, prefix, without, version, maps=None):
    """What servers read, in memory: registrations and MOF."""
    declarations = read(files)
    classes = resolve(declarations)
    output = Output()
    registrations.emit(providers_of(classes, prefix, without), output, version)
    loading.emit(classes, declarations, prefix, maps_of(maps, classes), output)
    return output


def main(arguments=None):
    parser = argparse.ArgumentParser(prog="generate.py", description="Generates the class catalogue from MOF.")
    parser.add_argument("mof", nargs="+", help="MOF files, in order")
    parser.add_argument("--output", metavar="DIR", help="where the generated files go")
    parser.add_argument("--list", action="store_true", help="print the names of the generated files, write none")
    parser.add_argument("--provider-prefix", default="KALDERA_", help="prefix of the classes that have a provider")
    parser.add_argument("--without-provider", action="append", default=[], metavar="CLASS")
    parser.add_argument("--deployment", action="store_true", help="generate what CIM servers read, not C++")
    parser.add_argument("--module-version", default="0", metavar="TEXT", help="with --deployment")
    parser.add_argument("--value-maps", metavar="FILE", help="what numbers mean, for --deployment and --words")
    parser.add_argument("--words", action="store_true", help="generate the table of value maps alone")
    options = parser.parse_args(arguments)
    if not options.list and not options.output:
        parser.error("--output or --list is needed")
    try:
        catalogue = (options.mof, options.provider_prefix, options.without_provider)
        if options.deployment:
            output = deployment(*catalogue, options.module_version, options.value_maps)
        elif options.words:
            output = words(options.mof, options.value_maps)
        else:
            output = generate(*catalogue)
    except MofError as error:
        print(error, file=sys.stderr)
        return 1
    if options.list:
        print("\n".join(output.files))
    else:
        output.write(options.output)
    return 0
