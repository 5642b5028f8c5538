"""How CIM servers are told of the providers: one table of rows, written in the form that each server reads."""

from dataclasses import dataclass

from .module import INTERFACES, MODULE

NAMESPACE = "root/kaldera"
#: Where clients look for profiles first. sfcb has the module serve it too, so that all that can be reached from a profile is there.
INTEROP = "root/interop"
#: What a server tells of itself there, and the associations that end at it. The module asks its server for the object manager
#: in that namespace: a provider of its own there would ask itself for ever.
OF_THE_SERVER = {
    "KALDERA_CIMXMLCommunicationMechanism",
    "KALDERA_CommMechHostedAccessPoint",
    "KALDERA_CommMechanismForManager",
    "KALDERA_Namespace",
    "KALDERA_NamespaceInManager",
    "KALDERA_ObjectManager",
    "KALDERA_ObjectManagerHostedService",
}
#: What the module is called among those of a server, and the process that all its providers share.
SERVER_MODULE = "KLDRProviderModule"
GROUP = "kldrprovider"
VENDOR = "KLDR"

#: ProviderType of OpenPegasus.
TYPE_CODES = {"instance": 2, "association": 3, "indication": 4, "method": 5}
#: UserContext of OpenPegasus: the privileged user. With the requestor's own, each user would get a process of his own, and
#: would not see the jobs that another one has started.
PRIVILEGED_USER = 4


@dataclass
class Row:
    class_name: str
    #: Words of `TYPE_CODES`.
    types: list

    @property
    def provider(self):
        return f"{self.class_name}_Provider"

    @property
    def namespaces(self):
        return [NAMESPACE] if self.class_name in OF_THE_SERVER else [NAMESPACE, INTEROP]


def rows(providers):
    """One row a provider. An indication provider has a method interface too, but is not registered for it: one server cleans
    up an interface once a library, so that the delivery thread would outlive the alerts' own cleanup."""
    return [
        Row(class_.name, ["indication"] if kind == "indication" else [name.lower() for name, _ in INTERFACES[kind]])
        for class_, kind in providers
    ]


def sections(table):
    """sfcb: a section a class. A library unloaded when idle would lose its jobs, its records and its subscriptions."""
    return "\n".join(
        f"[{row.class_name}]\n"
        f"   provider: {row.provider}\n"
        f"   location: {MODULE}\n"
        f"   type: {' '.join(row.types)}\n"
        f"   namespace: {' '.join(row.namespaces)}\n"
        f"   unload: never\n"
        f"   group: {GROUP}\n"
        for row in table
    )


def instance(class_name, **properties):
    lines = [f"    {name} = {value};" for name, value in properties.items()]
    return "\n".join([f"instance of {class_name}", "{", *lines, "};", ""])


def text(value):
    return f'"{value}"'


def instances(table, version):
    """OpenPegasus: instances of the interop namespace. Without a word about the word size, which means the server's own; only a
    server that was built to run others takes one."""
    parts = [
        instance(
            "PG_ProviderModule",
            Name=text(SERVER_MODULE),
            Vendor=text(VENDOR),
            Version=text(version),
            InterfaceType=text("CMPI"),
            InterfaceVersion=text("2.0.0"),
            Location=text(MODULE),
            UserContext=PRIVILEGED_USER,
        )
    ]
    for row in table:
        codes = sorted(TYPE_CODES[word] for word in row.types)
        parts.append(instance("PG_Provider", ProviderModuleName=text(SERVER_MODULE), Name=text(row.provider)))
        parts.append(
            instance(
                "PG_ProviderCapabilities",
                ProviderModuleName=text(SERVER_MODULE),
                ProviderName=text(row.provider),
                CapabilityID=text(row.class_name),
                ClassName=text(row.class_name),
                Namespaces="{" + text(NAMESPACE) + "}",
                ProviderType="{" + ", ".join(map(str, codes)) + "}",
            )
        )
    return "\n".join(parts)


def lines(table):
    """Neutral: class, namespace, provider, library and types, single blanks between them."""
    return "".join(
        f"{' '.join([row.class_name, NAMESPACE, row.provider, MODULE, *row.types])}\n" for row in table
    )


def emit(providers, output, version):
    table = rows(providers)
    output.add("registration/kldrprovider.sfcb", sections(table))
    output.add("registration/kldrprovider.pegasus.mof", instances(table, version))
    output.add("registration/kldrprovider.registration", lines(table))
