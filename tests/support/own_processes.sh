#!/bin/sh
# Runs a test where it sees no process but its own: an agent on the machine, or that of another run, would be taken for the one
# that the test starts or misses. Where the kernel grants nobody such a view, the test runs in the machine's. Signals that whoever
# started it ignores, as nohup and a shell's background do, end it as ever.
#   own_processes.sh PROGRAM [ARGUMENT...]
for user in '' --map-root-user; do
    if unshare $user --pid --fork --mount-proc true 2>/dev/null; then
        # The shell is the first process of the view, which signals and orphans treat unlike others.
        exec env --default-signal unshare $user --pid --fork --mount-proc --kill-child sh -c '"$@"; exit $?' sh "$@"
    fi
done
exec env --default-signal "$@"
