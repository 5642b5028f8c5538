"""What the tests of `kldrcim --url` share: the program as users run it."""

import os
import subprocess

PATIENCE = 120


def environment(home, **more):
    own = {
        "PATH": "/usr/bin:/bin",
        "HOME": home,
        "LC_ALL": "C.UTF-8",
        "LD_LIBRARY_PATH": os.environ["KLDR_SIMULATOR"],
        "KLDR_SIMULATOR_INVENTORY": os.environ["KLDR_INVENTORY"],
    }
    return own | {name: value for name, value in os.environ.items() if name.endswith("SAN_OPTIONS")} | more


def start(*arguments, home="/nonexistent", **more):
    """Without a terminal."""
    return subprocess.Popen(
        [os.environ["KLDRCIM"], *arguments],
        env=environment(home, **more),
        stdin=subprocess.DEVNULL,
        stdout=subprocess.PIPE,
        stderr=subprocess.PIPE,
        text=True,
        start_new_session=True,
    )


def run(*arguments, **options):
    """Exit status, output and errors."""
    process = start(*arguments, **options)
    out, errors = process.communicate(timeout=PATIENCE)
    return process.returncode, out, errors


def in_process(*arguments, **options):
    return run("--module", os.environ["KLDR_MODULE"], *arguments, **options)
