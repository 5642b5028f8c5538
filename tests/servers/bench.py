#!/usr/bin/env python3
"""Measures the module in real CIM servers, each in a machine of its own, prints tables and writes them as JSON.

usage: bench.py [--only TEXT] [--rounds N] [--sittings N] [--requests N] --build BITS=FOLDER... --output FILE PATH...

PATH and FOLDER are those of run.py. Two things are measured: what the module costs where plain providers of the same answers
cost the least, and how `kldrcim serve` does beside the servers. --only takes the servers whose name holds the text; `serve` is one
of them. All of a row are measured by turns; a sitting begins with servers that are started anew.
"""

import argparse
import json
import sys
from pathlib import Path

import archives
from bench_of_providers import measure_providers
from bench_of_serving import measure_serving


def main():
    parser = argparse.ArgumentParser(usage=__doc__)
    parser.add_argument("--only", default="")
    parser.add_argument("--rounds", type=int, default=10)
    parser.add_argument("--sittings", type=int, default=3)
    parser.add_argument("--requests", type=int, default=100_000)
    parser.add_argument("--build", action="append", default=[])
    parser.add_argument("--output", type=Path, required=True)
    parser.add_argument("paths", nargs="+")
    options = parser.parse_args()
    builds = {int(bits): Path(folder).resolve() for bits, folder in (each.split("=", 1) for each in options.build)}
    servers = [server for path in options.paths for server in archives.find(path)]
    result = {"providers": [], "serving": []}
    for server in servers:
        if options.only in server.name:
            result["providers"] += measure_providers(server, builds[server.word_size], options)
    word_size = archives.SERVE.word_size
    if word_size in builds and options.only in archives.SERVE.name:
        beside = [archives.SERVE, *(server for server in servers if server.word_size == word_size)]
        result["serving"] = measure_serving(beside, builds[word_size], options)
    options.output.write_text(json.dumps(result, indent=1) + "\n", encoding="utf-8")
    return 0


if __name__ == "__main__":
    sys.exit(main())
