"""Writes the profile registrations for OpenPegasus, which makes registered profiles of them and leads from there to the objects
that conform to them. Asks the module itself for its profiles, so that both say the same.

Usage: profile_registration.py OUTPUT SCHEMA KLDRCIM MODULE"""

import json
import re
import subprocess
import sys
from pathlib import Path

HEAD = """// Profile registrations for the interop namespace of OpenPegasus, loaded after the registration of the providers.
// Generated from the module.
"""
ORGANIZATIONS = {2: "DMTF", 11: "SNIA"}
#: The server registers these by itself.
OF_THE_SERVER = {"SMI-S", "Server"}


class Module:
    def __init__(self, kldrcim, module):
        self.command = [kldrcim, "--module", module, "--format", "json"]

    def properties(self, class_name):
        """Those of each instance."""
        done = subprocess.run([*self.command, "ei", class_name], capture_output=True, text=True, check=False)
        if done.returncode:
            sys.exit(f"profile_registration.py: {class_name}: {done.stderr.strip()}")
        return [each["properties"] for each in json.loads(done.stdout)]


def key_of(path):
    """InstanceID of a path to a profile."""
    return re.search(r'InstanceID="([^"]*)"', path)[1]


def class_of(path):
    return re.match(r"[^:]*:(\w+)\.", path)[1]


def joined(associations, role, key, other_role):
    """The paths at the other end of the associations that a profile has in the role."""
    return [
        each[other_role]
        for each in associations
        if class_of(each[role]) == "KALDERA_RegisteredProfile" and key_of(each[role]) == key
    ]


def texts(values):
    return "{" + ", ".join(f'"{value}"' for value in values) + "}"


def subprofile_names(subprofiles):
    """Empty lists are left out: the server's compiler takes an empty list for one of the type of the value before it."""
    if not subprofiles:
        return {}
    return {
        "OtherRegisteredSubProfiles": texts(each["RegisteredName"] for each in subprofiles),
        "OtherSubProfileOrganizations": texts(ORGANIZATIONS[each["RegisteredOrganization"]] for each in subprofiles),
        "SubProfileVersions": texts(each["RegisteredVersion"] for each in subprofiles),
    }


def registration(profile, subprofiles, elements, instance):
    """Every profile is called "other", with its name: what numbers there are depends on the server's release."""
    return instance(
        "PG_ProviderProfileCapabilities",
        ProviderModuleName='"KLDRProviderModule"',
        # The one that is asked for the elements.
        ProviderName=f'"{elements[0]}_Provider"',
        CapabilityID=f'"{profile["InstanceID"]}"',
        # The list must be there, and stands behind a number since it may be empty.
        RegisteredProfile=0,
        RegisteredSubProfiles="{" + ", ".join("0" for _ in subprofiles) + "}",
        OtherRegisteredProfile=f'"{profile["RegisteredName"]}"',
        OtherProfileOrganization=f'"{ORGANIZATIONS[profile["RegisteredOrganization"]]}"',
        ProfileVersion=f'"{profile["RegisteredVersion"]}"',
        **subprofile_names(subprofiles),
        ConformingElements=texts(elements),
    )


def main(output, schema, kldrcim, module):
    sys.path.insert(0, schema)
    from generator.registrations import instance

    asked = Module(kldrcim, module)
    conforming = asked.properties("KALDERA_ElementConformsToProfile")
    required = asked.properties("KALDERA_SubProfileRequiresProfile")
    subprofiles = {each["InstanceID"]: each for each in asked.properties("KALDERA_RegisteredSubProfile")}
    parts = [HEAD]
    for profile in asked.properties("KALDERA_RegisteredProfile"):
        key = profile["InstanceID"]
        if key not in OF_THE_SERVER:
            elements = [class_of(path) for path in joined(conforming, "ConformantStandard", key, "ManagedElement")]
            needed = [subprofiles[key_of(path)] for path in joined(required, "Antecedent", key, "Dependent")]
            parts.append(registration(profile, needed, list(dict.fromkeys(elements)), instance))
    Path(output).write_text("\n".join(parts), encoding="utf-8")


if __name__ == "__main__":
    main(*sys.argv[1:])
