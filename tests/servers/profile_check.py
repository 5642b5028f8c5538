#!/usr/bin/env python3
"""The walk of an SMI-S client that knows the CIM Schema and no class of ours: from the interop name space to the registered
profiles, from there to the central instances and the subprofiles, from a subprofile over its profile back, and from a central
instance on through the model. The quick form takes one object of each class on that last part, the long one all."""

import sys

from catalogue import Catalogue
from client import NAMESPACE, Check, pywbem
from comparison import Comparison, path_of, path_of_text, shown
from kldrcim import Kldrcim

CONFORMS = {"AssocClass": "CIM_ElementConformsToProfile", "Role": "ConformantStandard", "ResultRole": "ManagedElement"}
REQUIRES = {"AssocClass": "CIM_SubProfileRequiresProfile"}
#: Those whose central instance is the host.
OF_THE_HOST = {"FC HBA", "Storage HBA", "Host Discovered Resources"}


def identity(profile):
    """What a client looks a profile up by."""
    return profile["RegisteredName"], profile["RegisteredVersion"]


class Walk:
    def __init__(self, check):
        self.check = check
        self.traits = check.traits
        self.catalogue, self.kldrcim = Catalogue(), Kldrcim(check)
        self.comparison = Comparison(check, self.catalogue)
        self.connection = check.connect(check.interop)
        self.kldrcim.know_server(self.connection.EnumerateInstances("CIM_ObjectManager"))
        self.profiles = {}

    def ours(self, class_name):
        return [each["properties"] for each in self.kldrcim.ask("ei", class_name)]

    def find_profiles(self):
        server = pywbem.WBEMServer(self.connection)
        self.check.expect("interop name space", server.interop_ns, self.check.interop)
        found = self.check.attempt("CIM_RegisteredProfile", self.connection.EnumerateInstances, "CIM_RegisteredProfile") or []
        # Where the server has one of the same name, ours is what the rest is about.
        for profile in sorted(found, key=lambda each: each.classname in self.catalogue.kinds):
            self.profiles[identity(profile)] = profile
        for profile in self.ours("KALDERA_RegisteredProfile") + self.ours("KALDERA_RegisteredSubProfile"):
            name = identity(profile)
            if not self.check.expect_that(f"profile {name}", name in self.profiles, "not registered"):
                continue
            known = self.profiles[name]["RegisteredOrganization"] == profile["RegisteredOrganization"]
            self.check.expect_that(f"profile {name}", known or self.traits.profile_gives_organization, "organization")

    def central_instances(self, name):
        """What conforms to a profile: by the association, and as the client library finds it."""
        path = self.profiles[name].path
        what = f"central instances of {name}"
        found = self.check.attempt(what, self.connection.AssociatorNames, path, **CONFORMS) or []
        by_library = self.check.attempt(
            what, pywbem.WBEMServer(self.connection).get_central_instances, path, "CIM_ComputerSystem", ["CIM_ComputerSystem"]
        )
        self.check.expect(f"{what}: client library", sorted(map(path_of, by_library or [])), sorted(map(path_of, found)))
        return found

    def host_of(self, name):
        """The host that conforms to a profile, read where its path says that it is."""
        hosts = [each for each in self.central_instances(name) if each.classname == "KALDERA_ComputerSystem"]
        if not self.check.expect(f"hosts that conform to {name}", len(hosts), 1):
            return None
        instance = self.check.attempt(f"get {hosts[0]}", self.connection.GetInstance, hosts[0])
        if instance:
            self.comparison.instance(f"get {hosts[0]}", instance, self.kldrcim.ask("ei", "KALDERA_ComputerSystem")[0])
        return hosts[0]

    def subprofiles(self, name, key):
        """Those of a profile; and from each over its profile to the host again."""
        path = self.profiles[name].path
        what = f"subprofiles of {name}"
        found = self.check.attempt(what, self.connection.Associators, path, **REQUIRES) or []
        profile = f'KALDERA_RegisteredProfile.InstanceID="{key}"'
        expected = self.kldrcim.ask("ai", profile, "--assoc", "KALDERA_SubProfileRequiresProfile")
        self.check.expect(what, sorted(map(identity, found)), sorted(identity(each["properties"]) for each in expected))
        for subprofile in found:
            scope = self.connection.AssociatorNames(subprofile.path, Role="Dependent", ResultRole="Antecedent", **REQUIRES)
            self.check.expect(f"profile of {identity(subprofile)}", list(map(path_of, scope)), [path_of(path)])

    def standard(self):
        """SMI-S leads to all profiles, the server's own ones included."""
        for name, profile in self.profiles.items():
            if name[0] == "SMI-S":
                found = {path_of(each) for each in self.connection.AssociatorNames(profile.path, **CONFORMS)}
                for each in OF_THE_HOST:
                    paths = {path_of(other.path) for key, other in self.profiles.items() if key[0] == each}
                    self.check.expect_that(f"SMI-S: {each}", paths & found, found)

    def server_profile(self):
        """The object manager that conforms; one that the server shows and does not give is read where the model is."""
        for name in [each for each in self.profiles if each[0] == "Server"]:
            for path in self.central_instances(name):
                if path.classname in self.traits.own_in_interop:
                    self.check.refused(f"get {path}", pywbem.CIM_ERR_INVALID_CLASS, self.connection.GetInstance, path)
                    path.namespace = NAMESPACE
                self.check.attempt(f"get {path}", self.connection.GetInstance, path)

    def model(self, host):
        """Breadth first, over whatever associations the server knows, with what the command line shows of each object."""
        waiting, seen, classes = [host], {path_of(host)}, set()
        while waiting:
            path = waiting.pop(0)
            if path.classname in classes and not self.check.long:
                continue
            classes.add(path.classname)
            what = f"associators of {path}"
            found = self.check.attempt(what, self.connection.AssociatorNames, path) or []
            # A server joins objects of its own to ours: a profile as it has registered it, or its services.
            found = [each for each in found if each.classname in self.catalogue.kinds]
            self.compare(what, path, found)
            for each in found:
                if path_of(each) not in seen and each.classname not in self.traits.own_in_interop:
                    seen.add(path_of(each))
                    waiting.append(each)
        reached = {path[0] for path in seen}
        for name in self.catalogue.of_kind("instance"):
            # Some stand alone, in the command line too.
            joined = any(self.kldrcim.ask("ain", path) for path in self.kldrcim.ask("ein", name)[:1])
            if joined and name not in self.traits.own_in_interop:
                self.check.expect_that(f"from {host}", name.lower() in reached, f"no {name} is reached")

    def compare(self, what, path, found):
        asked = path.copy()
        asked.host, asked.namespace = None, NAMESPACE
        text = asked.to_wbem_uri(format="historical")
        expected = {path_of_text(each) for each in self.kldrcim.ask("ain", text)}
        left_out = {name.lower() for name in self.traits.own_in_interop}
        found = {path_of(each) for each in found}
        for each in sorted(expected ^ found, key=str):
            if each[0] not in left_out:
                self.check.differs(what, "surplus" if each in found else "missing", shown(each))
        self.check.compared += 1


def main():
    check = Check(__doc__)
    walk = Walk(check)
    walk.find_profiles()
    host = None
    for profile in walk.ours("KALDERA_RegisteredProfile"):
        name = identity(profile)
        if profile["RegisteredName"] in OF_THE_HOST and name in walk.profiles:
            host = walk.host_of(name) or host
            walk.subprofiles(name, profile["InstanceID"])
    walk.standard()
    walk.server_profile()
    if check.expect_that("central instance", host is not None, "none"):
        walk.model(host)
    walk.connection.close()
    check.finish()


if __name__ == "__main__":
    sys.exit(main())
