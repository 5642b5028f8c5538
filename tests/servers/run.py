"""Runs the cases and checks of this folder in real CIM servers, each in a machine of its own.

run.py [--long] --build BITS=FOLDER... PATH...

PATH is an archive, an unpacked server or a folder of them; FOLDER the build of that word size, with its package in FOLDER/servers.
"""

import argparse
import shutil
import subprocess
import sys
import time
import unittest
from concurrent.futures import ThreadPoolExecutor
from dataclasses import dataclass
from pathlib import Path

import archives
import machine

HERE = machine.HERE
#: In seconds, for one machine.
QUICK, LONG = 300, 3600
REMOTE = "remote_kldrcim"
#: What runs the command line over the wire.
OVER_THE_WIRE = "remote_check"


@dataclass
class Job:
    server: archives.Found
    title: str
    command: list

    def __str__(self):
        return f"{self.server.name}: {self.title}"


def cases():
    """Module and name of each test method, and when it is passed over, found without a server."""
    sys.path.insert(0, str(HERE))
    found = []

    def walk(suite):
        for each in suite:
            if isinstance(each, unittest.TestSuite):
                walk(each)
            else:
                method = getattr(each, each.id().rpartition(".")[2])
                found.append((type(each).__module__, each.id(), getattr(method, "long", False), each.once_a_kind))

    walk(unittest.defaultTestLoader.discover(str(HERE), "*_test.py"))
    return found


def belongs(module, server):
    """Files whose names begin with a kind of server are for that kind alone."""
    kind = module.partition("_")[0]
    return kind not in archives.PROGRAMS or kind == server.kind


def jobs(servers, long):
    kinds = set()
    for server in servers:
        # Cases are about what an administrator does with a server.
        for module, case, is_long, once_a_kind in [] if server is archives.SERVE else cases():
            too_much = is_long or (once_a_kind and server.kind in kinds)
            if belongs(module, server) and (long or not too_much):
                yield Job(server, case, ["python3", "-B", "-m", "unittest", case])
        for file in sorted(HERE.glob("*_check.py")):
            if belongs(file.stem, server):
                options = ["--long"] if long else []
                yield Job(server, file.stem, ["python3", "-B", "checked.py", f"/mnt/source/tests/servers/{file.name}", *options])
        kinds.add(server.kind)


def knows_url(build):
    """Whether the command line of a build was made with the libraries that `--url` needs."""
    done = subprocess.run([build / "kldrcim", "--url", "http://127.0.0.1:1", "ein", "X"], capture_output=True, check=False)
    return b"built without" not in done.stderr


def lend_remote(builds):
    """Puts a command line that knows `--url` beside the packages of the builds whose own does not; where there is none, these are
    told. The word size of a client is of no concern to a server."""
    lender = next((build for build in builds.values() if knows_url(build)), None)
    told = []
    for size, build in builds.items():
        lent = build / "servers" / REMOTE
        lent.unlink(missing_ok=True)
        if not knows_url(build) and lender:
            shutil.copy(lender / "kldrcim", lent)
        elif not lender:
            told.append(size)
    return told


def run(job, builds, long):
    """Status and output of a job, with the seconds that it took."""
    build = builds[job.server.word_size]
    packages = build / "servers"
    remote = f"/mnt/packages/{REMOTE}" if (packages / REMOTE).exists() else ""
    begin = time.monotonic()
    try:
        done = subprocess.run(
            machine.command_in(job.server, packages, job.command),
            env=machine.environment_for(job.server, long=long, remote_kldrcim=remote), stdin=subprocess.DEVNULL,
            stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True, errors="replace", check=False,
            timeout=LONG if long else QUICK,
        )  # fmt: skip
        status, output = done.returncode, done.stdout
    except subprocess.TimeoutExpired as late:
        status, output = 124, f"{late.stdout or ''}\nnot done within {late.timeout:.0f} s"
    return status, output, time.monotonic() - begin


def main():
    parser = argparse.ArgumentParser(description="Runs the module in real CIM servers.")
    parser.add_argument("--long", action="store_true", help="all that takes time too")
    parser.add_argument("--build", action="append", default=[], metavar="BITS=FOLDER")
    parser.add_argument("--needs", action="store_true", help="print the word sizes of the servers, and end")
    parser.add_argument("--only", default="", metavar="TEXT", help="cases and checks with this in their name, or in that of their server")
    parser.add_argument("paths", nargs="+", metavar="PATH")
    options = parser.parse_args()
    servers = [server for path in options.paths for server in archives.find(path)]
    if options.needs:
        print(*sorted({server.word_size for server in servers}, reverse=True))
        return 0
    if not servers:
        print(f"no CIM server in {', '.join(options.paths)}", file=sys.stderr)
        return 1
    builds = {int(bits): Path(folder).resolve() for bits, folder in (each.split("=", 1) for each in options.build)}
    if archives.SERVE.word_size in builds:
        servers.append(archives.SERVE)
    planned = [job for job in jobs(servers, options.long) if options.only in str(job)]
    without = lend_remote(builds)
    for job in [job for job in planned if job.title == OVER_THE_WIRE and job.server.word_size in without]:
        planned.remove(job)
        print(f"not run: {job}: no command line was built with --url", flush=True)
    failed = 0
    with ThreadPoolExecutor(2) as pool:
        for job, (status, output, seconds) in zip(planned, pool.map(lambda job: run(job, builds, options.long), planned)):
            word = "FAILED" if status else "ok"
            print(f"{word:6} {seconds:5.1f} s  {job}", flush=True)
            failed += bool(status)
            if status:
                print("    " + output.rstrip().replace("\n", "\n    "), flush=True)
    form = "" if options.long else " in the short form"
    print(f"{len(servers)} servers, {len(planned)} machines{form}, {failed} failures")
    return 1 if failed or not planned else 0


if __name__ == "__main__":
    sys.exit(main())
