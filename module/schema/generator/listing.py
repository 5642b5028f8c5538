"""MOF that lies beside what is read, and that nobody reads: a class that was forgotten in its list."""

import os

from .errors import MofError, Where


def check(files, included):
    """Refuses a MOF file in the folder of an included one that is neither included nor given."""
    known = set(included) | {os.path.realpath(file) for file in files}
    lists = {os.path.dirname(path): includer for path, includer in included.items()}
    for folder, includer in sorted(lists.items()):
        for name in sorted(os.listdir(folder)):
            path = os.path.join(folder, name)
            if name.endswith(".mof") and path not in known:
                line = os.path.relpath(path, os.path.dirname(os.path.realpath(includer)))
                raise MofError(Where(path, 1), f'not included: {includer} lacks the line #pragma include ("{line}")')
