"""What is asked where processor time is measured: messages that plain providers answer, too."""

import re
import sys
from dataclasses import dataclass
from xml.etree import ElementTree

from machine import SOURCE

sys.path.insert(0, str(SOURCE / "tests/kldrcim/server"))

from serving import class_parameter, intrinsic, message, parameter, request  # noqa: E402

NAMES = re.compile(r'<INSTANCENAME CLASSNAME="(KALDERA_\w+)">.*?</INSTANCENAME>', re.S)
PATH = "KALDERA_SCSIInitiatorTargetLogicalUnitPath"


@dataclass
class Question:
    title: str
    message: str
    #: What the answer holds, or 1 where it is one thing.
    count: int = 1


def enumeration(class_name):
    return intrinsic("EnumerateInstances", class_parameter("ClassName", class_name))


def names(class_name):
    return intrinsic("EnumerateInstanceNames", class_parameter("ClassName", class_name))


def get_instance(path):
    return intrinsic("GetInstance", parameter("InstanceName", path))


def associator_names(path, association):
    return intrinsic("AssociatorNames", parameter("ObjectName", path) + class_parameter("AssocClass", association))


def execute_method(service, text):
    """A call of the agent."""
    place = request("x").partition("<LOCALNAMESPACEPATH>")[2].partition("</LOCALNAMESPACEPATH>")[0]
    return message(
        f'<SIMPLEREQ><METHODCALL NAME="executeMethod"><LOCALINSTANCEPATH><LOCALNAMESPACEPATH>{place}</LOCALNAMESPACEPATH>'
        f'{service}</LOCALINSTANCEPATH><PARAMVALUE NAME="request"><VALUE>{text}</VALUE></PARAMVALUE></METHODCALL></SIMPLEREQ>'
    )


def paths_in(answer):
    """Names of instances as they stand in an answer, without the white space between their elements."""
    return [each[0] for each in NAMES.finditer(re.sub(r">\s+<", "><", answer))]


def key_in(path, name):
    return re.search(rf'<KEYBINDING NAME="{name}"><KEYVALUE[^>]*>([^<]*)<', path)[1]


def questions(ask):
    """`ask(message)` is the answer of a server that has the module: it knows the names of what is asked for."""

    def last(class_name):
        return paths_in(ask(names(class_name)))[-1]

    adapter, port, unit = last("KALDERA_PortController"), last("KALDERA_FCPort"), last("KALDERA_StorageExtent")
    wwn = key_in(port, "DeviceID")
    wwn = ":".join(wwn[each : each + 2] for each in range(0, len(wwn), 2))
    call = f'{{"method": "discovery.getFcByFcWwn", "params": ["{wwn}"], "id": 1, "version": "1.1"}}'
    found = [
        Question("enumerate adapters", enumeration("KALDERA_PortController")),
        Question("enumerate FC ports", enumeration("KALDERA_FCPort")),
        Question("enumerate extents", enumeration("KALDERA_StorageExtent")),
        Question("enumerate paths", enumeration(PATH)),
        Question("enumerate adapters with ports", enumeration("KALDERA_ControlledBy")),
        Question("get the last adapter", get_instance(adapter)),
        Question("get the last FC port", get_instance(port)),
        Question("get the last extent", get_instance(unit)),
        Question("names of the ports of an adapter", associator_names(adapter, "KALDERA_ControlledBy")),
        Question("names of the ends of a LUN's path", associator_names(unit, PATH)),
        Question("executeMethod", execute_method(last("KALDERA_AgentService"), call)),
    ]
    for each in found:
        each.count = max(1, len(objects_in(ask(each.message))))
    return found


def plain_form(element):
    """What an element says, whatever the order in which a server writes properties and keys."""
    below = [plain_form(each) for each in element]
    if element.tag in ("INSTANCE", "INSTANCENAME"):
        below.sort()
    return (element.tag, *sorted(element.attrib.items()), (element.text or "").strip(), *below)


def objects_in(answer):
    """The objects of an answer, or what a method gives back, in comparable form and in their order."""
    top = ElementTree.fromstring(answer)
    errors = [each.attrib for each in top.iter("ERROR")]
    if errors:
        raise AssertionError(f"an error: {errors}")
    results = list(top.iter("IRETURNVALUE")) or list(top.iter("METHODRESPONSE"))
    return [plain_form(each) for result in results for each in result]


def difference(found, expected):
    """None, or the first of what two answers differ in, in words."""
    for number, (one, other) in enumerate(zip(found, expected, strict=False)):
        if one != other:
            return f"object {number}: {one} instead of {other}"
    return None if len(found) == len(expected) else f"{len(found)} objects instead of {len(expected)}"
