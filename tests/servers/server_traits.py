"""What CIM servers themselves add to a provider's answers, each with its reason. Whatever is not named here must be the same
in every server."""

import re
from dataclasses import dataclass, field, replace

#: Properties with a default in the CIM Schema. Both servers put it where a provider leaves the property null. So they do with
#: properties that a newer schema has added to a class, and that no provider of ours can know.
WITH_DEFAULT = {
    "EnabledDefault",
    "EnabledState",
    "IsComposite",
    "IsEntity",
    "IsLargeBuildNumber",
    "NameFormat",
    "PortAvailability",
    "Primordial",
    "RemovalConditions",
    "RequestedState",
    "SampleInterval",
    "TransitioningToState",
}


@dataclass
class Traits:
    defaults: set = field(default_factory=lambda: WITH_DEFAULT)
    #: sfcb compiles into a name space only those classes of its CIM Schema on which others there are built.
    drops_unneeded_classes: bool = False
    #: Superclasses that the server's newer CIM Schema has taken out from above ours.
    removed_superclasses: set = field(default_factory=set)
    #: What the server tells of itself in the interop name space, where the module tells all else. It names the module's object
    #: manager there as what conforms to a profile, but finds no provider to read it from.
    own_in_interop: set = field(default_factory=set)
    #: A subprofile bears the organization of the profile that it belongs to, whoever has defined it.
    profile_gives_organization: bool = False
    #: How the server's own classes begin. It shows profiles as it has registered them beside those of the module.
    own_prefix: str = ""
    #: An operation that gives nothing back is answered with an empty list, which the client library takes for a broken answer.
    void_is_a_list: bool = False
    #: A property list without the keys takes them out of the paths, too.
    list_takes_keys: bool = False
    #: Threads that the server may have taken on for a moment with many requests, and keeps for later ones.
    thread_pool: int = 0
    #: How often each alert comes where there is a filter for the interop name space, too; 0 for a server that takes none. sfcb has
    #: the module registered there and matches what is delivered in one name space with the filters of all, so that filters in two
    #: of them bring each alert twice.
    alerts_in_interop: int = 0
    #: Each delivered alert is handed to a thread of the server, and on a busy machine one overtakes others, as many as this at the
    #: most. The module numbers them before, so that a client can tell.
    alerts_overtake: int = 0
    #: The server puts a number of its own in place of the module's.
    numbers_alerts: bool = False
    #: Properties of an alert, in lower case, that the server fills where the module leaves them null.
    fills_in_alerts: set = field(default_factory=set)

    def is_own(self, class_name):
        return bool(self.own_prefix) and class_name.startswith(self.own_prefix)

    def may_lack(self, class_name, subclasses):
        """`subclasses` are those of the class that have providers."""
        return class_name in self.removed_superclasses or (self.drops_unneeded_classes and not subclasses)


TRAITS = {
    "sfcb": Traits(
        drops_unneeded_classes=True,
        # In its schema, CIM_DiagnosticRecord is derived from CIM_RecordForLog directly.
        removed_superclasses={"CIM_LogEntry"},
        void_is_a_list=True,
        alerts_in_interop=2,
        alerts_overtake=16,
        numbers_alerts=True,
        fills_in_alerts={"indicationfiltername", "sequencecontext"},
        own_in_interop={"KALDERA_ObjectManager", "KALDERA_Namespace", "KALDERA_CIMXMLCommunicationMechanism"},
    ),
    # `kldrcim serve` adds nothing to what the module says, but for the sequence of what each listener gets. A filter for the
    # name space where filters live is one for the module's.
    "serve": Traits(defaults=set(), fills_in_alerts={"sequencecontext"}, alerts_in_interop=1),
    "pegasus": Traits(profile_gives_organization=True, own_prefix="PG_", thread_pool=80, alerts_overtake=16),
}


def traits_of(server, version):
    """`version` is the server's own word, such as "1.3.18-preview"."""
    numbers = tuple(int(each) for each in re.findall(r"\d+", version or "")[:3])
    old = server == "sfcb" and numbers < (1, 3, 18)
    return replace(TRAITS[server], list_takes_keys=True) if old else TRAITS[server]
