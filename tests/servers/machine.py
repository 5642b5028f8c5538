"""How a program is started in a machine of its own: what `machine.sh` and what runs inside are told."""

import json
import os
from pathlib import Path

HERE = Path(__file__).resolve().parent
SOURCE = HERE.parent.parent


def command_in(server, packages, words):
    """The command that runs another one beside a server, in this folder."""
    inside = "cd /mnt/source/tests/servers && exec \"$@\""
    return [HERE / "machine.sh", server.path, SOURCE, packages, "bash", "-c", inside, "machine", *words]


def environment_for(server, **more):
    """What the program inside reads with `server.room()`."""
    room = {
        "name": server.name,
        "kind": server.kind,
        "word_size": server.word_size,
        "package": "/mnt/packages/kldrprovider.deb",
        "adapter_library": "/mnt/packages/libdzntj.so",
        **more,
    }
    return {**os.environ, "KLDR_ROOM": json.dumps(room)}
