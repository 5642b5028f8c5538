#!/usr/bin/env python3
"""Writes the inventory of a large host to standard output: the same one for the same arguments."""

import argparse
import json
import os
import random
import sys

MOST_UNITS_WRITTEN = 1_000_000
PORTS_PER_ARRAY = 4  # target ports through which an array shows its units, in each fabric
TAPE_EVERY = 16  # one target in so many is a part of a tape library
FABRICS = 2  # as sites build them: even ports on one switch, odd ports on the other


def number(least, most):
    def convert(text):
        value = int(text)
        if not least <= value <= most:
            raise ValueError
        return value

    convert.words = f"a number from {least} to {most}"
    return convert


def share(text):
    value = float(text)
    if not 0 <= value <= 1:
        raise ValueError
    return value


share.words = "a share from 0 to 1"

# name, default, how to read it, what it is
OPTIONS = [
    ("adapters", 4, number(0, 256), "adapters of the host"),
    ("ports", 2, number(1, 8), "FC or FCoE ports of each adapter"),
    ("targets", 8, number(0, 1024), "target ports that each port sees; one in 16 is a tape drive or a media changer"),
    ("luns", 16, number(0, 65536), "LUNs of each disk target"),
    ("cna", 0.25, share, "share of the adapters that are converged"),
    ("seed", 1, number(0, 2**32 - 1), "seed of serial numbers and counters"),
]


class One_Line_Parser(argparse.ArgumentParser):
    def error(self, message):
        self.exit(2, f"make_inventory.py: {message}\n")


def arguments():
    parser = One_Line_Parser(description=__doc__, allow_abbrev=False)
    for name, default, _, words in OPTIONS:
        parser.add_argument(f"--{name}", default=str(default), help=f"{words} (default {default})")
    args = parser.parse_args()
    for name, _, convert, _ in OPTIONS:
        text = getattr(args, name)
        try:
            setattr(args, name, convert(text))
        except (ValueError, OverflowError):
            parser.error(f"--{name} must be {convert.words}, not {text!r}")
    args.fabrics = min(FABRICS, args.ports)
    units = args.fabrics * args.targets * args.luns
    if units > MOST_UNITS_WRITTEN:
        parser.error(f"{units} LUNs are more than the {MOST_UNITS_WRITTEN} that one inventory can have")
    return args


def colons(digits):
    return ":".join(digits[at:at + 2] for at in range(0, len(digits), 2))


class Host:
    def __init__(self, args):
        self.args = args
        self.random = random.Random(args.seed)
        self.converged = [self.cnas_among(place + 1) > self.cnas_among(place) for place in range(args.adapters)]
        self.site = self.random.getrandbits(16)

    def cnas_among(self, adapters):
        return int(adapters * self.args.cna + 1e-9)  # a share such as 0.29 falls short of its hundredths

    def target_wwn(self, fabric, place):
        return colons(f"5024b4c{fabric:x}{self.site:04x}{place:04x}")

    def units(self, place):
        """The LUNs of a target; all ports of an array, in both fabrics, show the same ones."""
        array = place // PORTS_PER_ARRAY
        for lun in range(self.args.luns):
            yield {"number": lun, "vendor": "KLDR", "productID": "ARRAY 4000",
                   "productSerialNumber": f"KA{self.site:04x}{array:04x}{lun:05x}",
                   "lunDescription": f"6024b4c0{self.site:04x}{array:04x}{0:08x}{lun:08x}"}

    def remote_port(self, fabric, place):
        kind, units = "Disk", self.units(place)
        if place % TAPE_EVERY == TAPE_EVERY - 1:
            changer = place // TAPE_EVERY % 2 == 1
            kind = "Media Changer" if changer else "Tape"
            units = [{"number": 0, "vendor": "KLDR", "productID": "TAPE LIBRARY 24" if changer else "ULTRA TD5",
                      "productSerialNumber": f"KT{self.site:04x}{place:04x}",
                      "lunDescription": f"5024b4c1{self.site:04x}{place:04x}"}]
        return {"remotePortWwn": self.target_wwn(fabric, place), "deviceData": {"type": kind}}, units

    def optics(self, adapter, port):
        return {"vendorName": "KLDR OPTICS", "serialNo": f"KO{adapter:03d}{port}{self.random.getrandbits(24):06x}"}

    def counters(self, converged):
        ids = [1615, 1616, 1624, 1625, 1626, 1627, 1628] if converged else [1411, 1412, 1416, 1421, 1423, 1424, 1428]
        busy = [] if converged else [[each, self.random.getrandbits(44)] for each in (1402, 1403, 1409, 1410)]
        return busy + [[each, self.random.getrandbits(6)] for each in ids]

    def fc_port(self, adapter, port):
        converged = self.converged[adapter]
        seen = [self.target_wwn(port % FABRICS, place) for place in range(self.args.targets)]
        return {"wwn": colons(f"1000024b4c{adapter:04x}{port:02x}"),
                "PortSymbolicName": f"KLDR {1020 if converged else 825} port {port} in slot {adapter}",
                **({"operatingSpeed": 10, "supportedPortSpeeds": [10]} if converged else {}),
                "optics": self.optics(adapter, port), "statistics": self.counters(converged),
                "remotePorts": seen}

    def adapter(self, adapter):
        hba = {"wwn": colons(f"2000024b4c{adapter:04x}00"), "serialNumber": f"KLDR{self.random.getrandbits(28):07x}"}
        ports = range(self.args.ports)
        written = {"hbaData": hba, "fcPorts": [self.fc_port(adapter, port) for port in ports]}
        if self.converged[adapter]:
            macs = [colons(f"024b4c{adapter:04x}{port:02x}") for port in ports]
            hba["hbaMAC"] = macs[0]
            written["ethPorts"] = [{"mac": mac, "ethData": {"mtu": 9000}} for mac in macs]
        return written


def compact(value):
    return json.dumps(value, separators=(", ", ": "))


def separated(pieces, last="\n"):
    """The pieces with a comma behind each but the last."""
    behind = None
    for piece in pieces:
        if behind is not None:
            yield behind + ",\n"
        behind = piece
    yield behind + last if behind is not None else ""


def remote_port_text(remote, units):
    head = compact(remote)[:-1]
    return head + ', "lunList": [\n' + "".join(separated(f"    {compact(unit)}" for unit in units)) + "  ]}"


def inventory_text(args):
    host = Host(args)
    words = " ".join(f"--{name} {getattr(args, name)}" for name, *_ in OPTIONS)
    yield f'// Made by make_inventory.py {words}\n{{\n"host": {{"hostModel": "Generated host"}},\n"remotePorts": [\n'
    yield from separated("  " + remote_port_text(*host.remote_port(fabric, place))
                         for fabric in range(args.fabrics) for place in range(args.targets))
    yield '],\n"adapters": [\n'
    yield from separated("  " + compact(host.adapter(adapter)) for adapter in range(args.adapters))
    yield "]\n}\n"


def main():
    try:
        sys.stdout.writelines(inventory_text(arguments()))
        sys.stdout.flush()
    except BrokenPipeError:
        os.dup2(os.open(os.devnull, os.O_WRONLY), sys.stdout.fileno())
        return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
