# Steps, and what is said of them.

say() { printf '%s: %s\n' "$server" "$*"; }

# A conclusion, which only what has really been done allows.
conclude() { [ -n "$dry_run" ] || say "$@"; }

# Remembers the worst status; the next server still has its turn.
fail() { # STATUS WORDS...
    local code=$1
    shift
    printf 'kldr-register: %s: %s\n' "$server" "$*" >&2
    [ "$code" -le "$status" ] || status=$code
    return 1
}

# Of all that a tool says when it fails, the line that tells why: not its usage, not its general warnings.
reason_in() { # OUTPUT
    local line
    line=$(awk '
        /^[[:space:]]*$/ || /^[Uu]sage/ || /^Warning: / || /-help/ { next }
        !first { first = $0 }
        !telling && tolower($0) ~ /error|fail|invalid|cannot|could not|unknown|not found|no such|denied|refused|not supported/ {
            telling = $0
        }
        END { print telling ? telling : first }' <<<"$1")
    if [ -n "$verbose" ]; then
        printf '%s\n' "${1:-no reason given}"
    elif [ "$(grep -c . <<<"$1")" -gt 1 ]; then
        printf '%s (--verbose shows all of it)\n' "${line:-no reason given}"
    else
        printf '%s\n' "${line:-no reason given}"
    fi
}

# Runs a step, or says that it would.
run() {
    if [ -n "$dry_run" ]; then
        say "would run: $*"
        return 0
    fi
    say "run: $*"
    quietly "$@"
}

quietly() {
    local output
    output=$("$@" 2>&1 </dev/null) || fail "$FAILED" "'$1' failed: $(reason_in "$output")"
}

# Before the first of several steps, so that none is done if one cannot be.
need_tools() {
    local tool good=0
    for tool in "$@"; do
        command -v "$tool" >/dev/null || {
            fail "$FAILED" "'$tool' is not on PATH; it comes with the server, and nothing was changed"
            good=1
        }
    done
    return "$good"
}

# One line of `check`. The command tells by its status: 0 yes, 1 no, anything else that it could not find out; its words are
# what is missing, or why it could not.
report() { # WHAT COMMAND...
    local what=$1 words code=0
    shift
    words=$("$@") || code=$?
    case $code in
        0) say "ok: $what" ;;
        1) say "missing: $what${words:+: $words}"; worst "$MISSING" ;;
        *) say "unknown: $what${words:+: $words}"; worst "$FAILED" ;;
    esac
}

worst() { [ "$status" -ge "$1" ] || status=$1; }

# A process of that name which is no zombie, and which sees the files that we see: that of a container does not.
runs() { # NAME
    local process
    for process in $(pgrep -x "$1"); do
        case $(ps -o stat= -p "$process") in Z* | "") continue ;; esac
        [ -e "/proc/$process/root" ] && [ ! "/proc/$process/root" -ef / ] || return 0
    done
    return 1
}
