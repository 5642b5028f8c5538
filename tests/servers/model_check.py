#!/usr/bin/env python3
"""Every class: its instances, their names, each instance by its name, and what an enumeration of a superclass shows; all of it
as the command line has it, property by property, types included."""

import shutil
import subprocess
import sys
import tempfile
import time
from contextlib import contextmanager
from pathlib import Path

from catalogue import Catalogue
from client import Check, pywbem
from comparison import Comparison
from kldrcim import Kldrcim


@contextmanager
def management_application():
    """A process of the name that has the module show its access point; any program will do."""
    with tempfile.TemporaryDirectory() as folder:
        program = Path(folder) / "qxmagent"
        shutil.copy(shutil.which("sleep"), program)
        with subprocess.Popen([program, "600"]) as process:
            time.sleep(0.2)
            try:
                yield
            finally:
                process.kill()


def check_class(check, comparison, kldrcim, name):
    connection = check.connection
    expected = kldrcim.ask("ei", name)
    found = check.attempt(f"enumerate {name}", connection.EnumerateInstances, name)
    comparison.instances(f"enumerate {name}", found or [], expected)
    found = check.attempt(f"names of {name}", connection.EnumerateInstanceNames, name) or []
    comparison.names(f"names of {name}", found, kldrcim.ask("ein", name))
    comparison.namespace(f"names of {name}", found)
    for path in dict.fromkeys(each["path"] for each in expected):
        alike = [each for each in expected if each["path"] == path]
        wanted = kldrcim.ask("gi", path) if check.long or len(alike) > 1 else alike[0]
        found = check.attempt(f"get {path}", connection.GetInstance, pywbem.CIMInstanceName.from_wbem_uri(path))
        if found:
            comparison.instance(f"get {path}", found, wanted)


def check_property_list(check, comparison, kldrcim, name):
    """A list of two properties brings just these, and the keys in the path."""
    expected = kldrcim.ask("ei", name)
    if not expected:
        return
    asked = list(expected[0]["properties"])[-2:]
    if comparison.traits.list_takes_keys:
        asked += pywbem.CIMInstanceName.from_wbem_uri(expected[0]["path"]).keybindings
    what = f"enumerate {asked} of {name}"
    found = check.attempt(what, check.connection.EnumerateInstances, name, PropertyList=asked) or []
    comparison.names(what, [each.path for each in found], [each["path"] for each in expected])
    for instance in found:
        surplus = [key for key in instance.keys() if key not in asked and key not in instance.path.keybindings]
        check.expect(what, surplus, [])


def check_superclass(check, comparison, kldrcim, catalogue, name):
    """Its own instances are those of all its subclasses."""
    subclasses = catalogue.subclasses(name)
    if comparison.traits.may_lack(name, subclasses):
        try:
            check.connection.GetClass(name)
        except pywbem.CIMError:
            return
    found = check.attempt(f"names of {name}", check.connection.EnumerateInstanceNames, name) or []
    comparison.names(f"names of {name}", found, [each for one in subclasses for each in kldrcim.ask("ein", one)])
    if check.long:
        found = check.attempt(f"enumerate {name}", check.connection.EnumerateInstances, name, DeepInheritance=True) or []
        comparison.instances(f"enumerate {name}", found, [each for one in subclasses for each in kldrcim.ask("ei", one)])


def check_missing(check, kldrcim, name):
    """An instance that is not there."""
    for text in kldrcim.ask("ein", name)[:1]:
        path = pywbem.CIMInstanceName.from_wbem_uri(text)
        keys = [key for key, value in path.keybindings.items() if isinstance(value, str) and "CreationClassName" not in key]
        if keys:
            path[keys[0]] = "nobody"
            check.refused(f"get {path}", pywbem.CIM_ERR_NOT_FOUND, check.connection.GetInstance, path)


def check_words(check):
    """The server's class says what numbers mean: of a property that the product class declares anew, and of an inherited one."""
    for name, number, word in (("PortType", 10, "N"), ("OperationalStatus", 11, "In Service"), ("EnabledState", 2, "Enabled")):
        said = check.attempt(
            f"value map of {name}", pywbem.ValueMapping.for_property, check.connection, None, "KALDERA_FCPort", name
        )
        check.expect(f"{name} {number}", said and said.tovalues(number), word)


def main():
    check = Check(__doc__)
    catalogue, kldrcim = Catalogue(), Kldrcim(check)
    comparison = Comparison(check, catalogue)
    kldrcim.know_server(check.connection.EnumerateInstances("CIM_ObjectManager", namespace=check.interop))
    check.expect("classes with a provider", len(catalogue.kinds), 76)
    for name in catalogue.of_kind("indication"):
        check.expect(f"enumerate {name}", check.connection.EnumerateInstances(name), [])
    check_words(check)
    with management_application():
        for name in catalogue.of_kind("instance", "association"):
            check_class(check, comparison, kldrcim, name)
            check_property_list(check, comparison, kldrcim, name)
            check_missing(check, kldrcim, name)
        for class_ in catalogue.classes:
            check_superclass(check, comparison, kldrcim, catalogue, class_.name)
    check.finish()


if __name__ == "__main__":
    sys.exit(main())
