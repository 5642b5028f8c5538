# What `install` remembers of each server for the verbs that come later: a package manager runs `remove` with a PATH that
# lacks the folders of many a server's tools, and without the options.

memory_file() { printf '%s\n' "$root/var/lib/kldrprovider/$server.registered"; }

remembered() { # NAME DEFAULT
    setting "$(memory_file)" "$1" "$2"
}

# Below another root stand the tools of another machine.
find_remembered_tools() {
    local folders
    folders=$(remembered tools "")
    [ -n "$root" ] || [ -z "$folders" ] || PATH=$PATH:$folders
}

folders_of_tools() { # TOOL...
    local tool
    for tool in "$@"; do
        dirname "$(command -v "$tool")" 2>/dev/null
    done | sort -u | paste -sd :
}

remember() { # NAME=VALUE...
    [ -z "$dry_run" ] || return 0
    local file
    file=$(memory_file)
    mkdir -p "$(dirname "$file")" && printf '%s\n' "$@" >"$file" || fail "$FAILED" "cannot write $file"
}

forget_memory() {
    [ -e "$(memory_file)" ] || return 0
    take_away "$(memory_file)"
    [ -n "$dry_run" ] || rmdir "$root/var/lib/kldrprovider" 2>/dev/null || true
}
