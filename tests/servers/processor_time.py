"""What a server's processes have taken of the processor, in nanoseconds: the one that has the module, and all others."""

import time


def own_time(process):
    """Of all its threads, also of those that have ended."""
    # What clock_getcpuclockid(3) gives for a process.
    return time.clock_gettime_ns((~process << 3) | 2)


class Reading:
    """All of these processes at one moment, those that have ended and are not forgotten yet among them; `provider` is the one with
    the module, or None. A child that begins and is forgotten between two readings is missed."""

    def __init__(self, processes, provider):
        self.provider = provider
        self.times = {}
        for process in processes:
            try:
                self.times[process] = own_time(process)
            except OSError:
                continue

    def since(self, before):
        """Of the provider's process, and of all others."""
        taken = {process: each - before.times.get(process, 0) for process, each in self.times.items()}
        provider = taken.pop(self.provider, 0)
        return provider, sum(taken.values())
