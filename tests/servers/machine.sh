#!/bin/bash
# machine.sh SERVER SOURCE PACKAGES COMMAND... - a machine of its own for one server: what is written stays in namespaces that
# end with the command, and with them all that it has started. SERVER is an archive or a folder with an unpacked one. The
# command finds /mnt/source, the repository, and /mnt/packages, both to read only.
set -euo pipefail

server=$1 source=$2 packages=$3
shift 3

if [ -z "${KLDR_INSIDE:-}" ]; then
    # The command gets a clean environment: what it needs, it is given. What a shell has in the background ignores SIGINT, and so
    # would all that it starts.
    exec env -i --default-signal KLDR_INSIDE=yes PATH=/usr/local/sbin:/usr/local/bin:/usr/sbin:/usr/bin:/sbin:/bin HOME=/root LC_ALL=C.UTF-8 \
        KLDR_ROOM="${KLDR_ROOM:-}" KLDR_CLIENTS="${KLDR_CLIENTS:-}" \
        unshare --mount --net --ipc --uts --pid --fork --kill-child --mount-proc "$0" "$server" "$source" "$packages" "$@"
fi
unset KLDR_INSIDE

hostname cim-machine
ip link set lo up
mount -t tmpfs tmpfs /mnt
mkdir /mnt/source /mnt/packages /mnt/server
mount --bind -o ro "$source" /mnt/source
mount --bind -o ro "$packages" /mnt/packages
if [ -n "$KLDR_CLIENTS" ]; then
    mkdir /mnt/clients
    mount --bind -o ro "$KLDR_CLIENTS" /mnt/clients
    export KLDR_CLIENTS=/mnt/clients
fi
if [ -d "$server" ]; then
    mount --bind -o ro "$server" /mnt/server
else
    touch /mnt/archive
    mount --bind -o ro "$server" /mnt/archive
fi

for folder in etc opt root tmp usr var; do
    mkdir -p "/mnt/written/$folder" "/mnt/work/$folder"
    mount -t overlay overlay -o "lowerdir=/$folder,upperdir=/mnt/written/$folder,workdir=/mnt/work/$folder" "/$folder"
done
mount -t tmpfs tmpfs /run
echo "127.0.0.1 localhost cim-machine" >/etc/hosts
# Of a server that the machine itself has, nothing is seen; nor of the package.
rm -rf /etc/sfcb /etc/Pegasus /var/lib/sfcb /var/lib/Pegasus /var/lib/kldrprovider /opt/cim-servers
# The index of pages would take seconds at each package, and is nobody's concern here.
rm -f /var/lib/man-db/auto-update
! dpkg-query -s kldrprovider >/dev/null 2>&1 || dpkg --purge --force-all kldrprovider >/dev/null

if [ -e /mnt/archive ]; then
    tar xzf /mnt/archive -C /
else
    mkdir -p /opt/cim-servers && cp -a /mnt/server "/opt/cim-servers/$(basename "$server")"
fi
cd /tmp
# The shell stays, as the first process, and takes in those whose parents have gone.
"$@"
