# Files and links that are put in place, and settings that are read.

# The value of a setting in a file of "name: value" or "name=value" lines; the last one counts.
setting() { # FILE NAME DEFAULT
    local value
    value=$(sed -n "s/^[[:space:]]*$2[[:space:]]*[:=][[:space:]]*//p" "$1" 2>/dev/null | tail -n 1)
    printf '%s\n' "${value:-$3}"
}

# True if both have the same content.
same() { cmp -s "$1" "$2"; }

# Copies a file unless it is there already.
place() { # FROM TO
    same "$1" "$2" && return 0
    run mkdir -p "$(dirname "$2")" && run cp "$1" "$2"
}

# Removes a file if it is there.
take_away() {
    [ -e "$1" ] || [ -L "$1" ] || return 0
    run rm -f "$1"
}

# Where a server looks for its providers, a link to the library stands unless the library itself is there.
has_library() { # FOLDER
    [ "$(readlink -f "$1/lib$MODULE.so" 2>/dev/null)" = "$(readlink -f "$library")" ] ||
        [ "$(readlink "$1/lib$MODULE.so" 2>/dev/null)" = "${library#"$root"}" ]
}

some_folder_has_library() { # FOLDER...
    local folder
    for folder in "$@"; do
        ! has_library "$folder" || return 0
    done
    return 1
}

link_library() { # FOLDER...
    local folder
    some_folder_has_library "$@" && return 0
    for folder in "$@"; do
        [ -d "$folder" ] || continue
        run ln -sfn "${library#"$root"}" "$folder/lib$MODULE.so"
        return
    done
    fail "$FAILED" "none of its provider folders exists: $*"
}

# Only links that this program made: those of the installation go with it.
unlink_library() { # FOLDER...
    local folder
    for folder in "$@"; do
        if [ "$(readlink "$folder/lib$MODULE.so" 2>/dev/null)" = "${library#"$root"}" ]; then
            take_away "$folder/lib$MODULE.so"
        fi
    done
}

# 1 or 2, for 32 or 64 bits; nothing if it is no such file.
word_size_of() { # LIBRARY
    [ "$(head -c 4 "$1" 2>/dev/null)" = $'\x7fELF' ] && od -An -tu1 -j4 -N1 "$1" | tr -d ' '
}

classes_in() { sed -n 's/^class \([A-Za-z0-9_]*\).*/\1/p' "$@"; }

# Names of the first list that are not in the second, both one a line.
names_without() { # NAMES OTHERS
    grep -vxF -f <(printf '%s\n' "$2") <<<"$1"
}

# A list in words: the first few, and how many more.
in_words() {
    awk '{ if (NR <= 3) words = words (NR > 1 ? ", " : "") $0 }
        END { if (NR > 3) words = words " and " NR - 3 " more"; print words }'
}
