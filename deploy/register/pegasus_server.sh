# OpenPegasus as it is: whether it runs, what it knows, and what only it can be told.

# Sets `pegasus_state`: running, down, or unknown with `pegasus_doubt`; and `pegasus_modules` of a server that runs.
pegasus_look() {
    pegasus_state=down pegasus_doubt=''
    case $state in
        down) return ;;
        running) ;;
        *) [ -z "$root" ] && runs cimserver || return 0 ;;
    esac
    pegasus_state=running
    command -v cimprovider >/dev/null || {
        pegasus_state=unknown pegasus_doubt="it runs, and 'cimprovider', which comes with it, is not on PATH"
        return
    }
    pegasus_modules=$(cimprovider -l -s 2>&1) || {
        pegasus_state=unknown pegasus_doubt="it runs, and does not answer: $(reason_in "$pegasus_modules")"
    }
}

pegasus_can_be_asked() {
    [ "$pegasus_state" != unknown ] || fail "$FAILED" "$pegasus_doubt; nothing was changed" || return
    local known=0 words
    words=$(pegasus_knows) || known=$?
    [ "$known" -le 1 ] || fail "$FAILED" "$words; nothing was changed"
}

# Whether the module is registered. Beside a server that is down, its index of instances tells: 0 stands before those that are
# in use, 1 before those that are gone.
pegasus_knows() {
    if [ "$pegasus_state" = running ]; then
        awk -v name="$SERVER_MODULE" '$1 == name { found = 1 } END { exit !found }' <<<"$pegasus_modules"
        return
    fi
    local instances=$pegasus_repository/${pegasus_interop//\//#}/instances
    [ -d "$instances" ] && [ -r "$instances" ] || { echo "$instances cannot be read"; return 2; }
    [ -e "$instances/PG_ProviderModule.idx" ] || return 1
    [ -r "$instances/PG_ProviderModule.idx" ] || { echo "$instances/PG_ProviderModule.idx cannot be read"; return 2; }
    grep -q "^0 .*Name=\"$SERVER_MODULE\"" "$instances/PG_ProviderModule.idx"
}

# The classes of a namespace, one a line; a namespace that is not there has none.
pegasus_classes() { # NAMESPACE
    local folder=$pegasus_repository/${1//\//#}/classes
    if [ -d "$folder" ]; then
        (cd "$folder" && find . -type f | sed 's|^\./||; s|\..*||')
    elif [ "$pegasus_state" = running ]; then
        cimcli nc -di -n "$1" 2>/dev/null
    fi
}

pegasus_has_classes() {
    local lacking
    lacking=$(names_without "$(classes_in "$share/mof/kldrprovider.mof")" "$(pegasus_classes "$NAMESPACE")") || return 0
    in_words <<<"$lacking"
    return 1
}

pegasus_some_classes() { pegasus_classes "$NAMESPACE" | grep -x 'KALDERA_.*'; }

pegasus_namespace_now() {
    if [ -n "$(pegasus_classes "$NAMESPACE")" ]; then echo found; else echo made; fi
}

# One real question, as a client asks it.
pegasus_answers() {
    local answer
    command -v cimcli >/dev/null || { echo "cimcli is not on PATH"; return 2; }
    answer=$(cimcli ni -n "$NAMESPACE" "$FIRST_CLASS" 2>&1) || { reason_in "$answer"; return 1; }
    grep -q "^$FIRST_CLASS\." <<<"$answer" || { echo "no instance"; return 1; }
}

# Only the server itself can forget. One that is down is started for it, without network, and stopped again.
pegasus_with_server() { # COMMAND...
    if [ "$pegasus_state" = running ]; then
        "$@"
        return
    fi
    [ -z "$root" ] || fail "$SERVER_DOWN" "it must run to forget a registration: start it, and run this again" || return
    need_tools cimserver cimprovider cimcli || return
    say "only a running server forgets a registration: it $([ -n "$dry_run" ] && echo "would be" || echo is) started for this, without network"
    run cimserver enableHttpConnection=false enableHttpsConnection=false || return
    local result=0
    if [ -z "$dry_run" ]; then
        pegasus_wait && pegasus_state=running && "$@" || result=1
    fi
    pegasus_state=down
    run cimserver -s && return "$result"
}

pegasus_wait() {
    local turn
    for turn in {1..100}; do
        ! pegasus_modules=$(cimprovider -l -s 2>&1) || return 0
        sleep 0.2
    done
    fail "$FAILED" "the server has been started, and does not answer after $turn attempts"
}

pegasus_forget() {
    need_tools cimprovider cimcli || return
    ! pegasus_knows || run cimprovider -r -m "$SERVER_MODULE" || return
    pegasus_forget_profiles && pegasus_forget_classes
}

# The profiles that stand in the interop namespace; they stay when the module goes. Their names are those of the installed file.
pegasus_forget_profiles() {
    local file=$share/registration/kldrprovider.profiles.mof provider="" word value
    local module="ProviderModuleName=\"$SERVER_MODULE\""
    local -a paths=()
    while read -r word value; do
        case $word in
            provider) provider=$value ;;
            key) paths+=("PG_ProviderProfileCapabilities.CapabilityID=$value,$module,ProviderName=$provider") ;;
        esac
    done < <(sed -n -e 's/^ *ProviderName = \(".*"\);$/provider \1/p' -e 's/^ *CapabilityID = \(".*"\);$/key \1/p' "$file")
    pegasus_delete di "$pegasus_interop" "profile registrations" "${paths[@]}"
}

# A class goes after its subclasses. In a namespace that was there before us, only the product classes are ours.
pegasus_forget_classes() {
    local -a files=("$share/mof/kldr_structure.mof" "$share/mof/kldrprovider.mof") classes qualifiers
    [ "$pegasus_namespace_is" = made ] || files=("$share/mof/kldrprovider.mof")
    mapfile -t classes < <(classes_in "${files[@]}" | tac)
    # The server itself puts these into the namespace of what conforms to a profile.
    [ "$pegasus_namespace_is" != made ] || classes=(PG_ElementConformsToProfile PG_RegisteredProfile "${classes[@]}")
    pegasus_delete dc "$NAMESPACE" "classes" "${classes[@]}"
    [ "$pegasus_namespace_is" = made ] || return 0
    mapfile -t qualifiers < <(sed -n 's/^Qualifier \([A-Za-z]*\) .*/\1/p' "$share/mof/kldr_qualifiers.mof")
    pegasus_delete dq "$NAMESPACE" "qualifiers" "${qualifiers[@]}"
    if [ -z "$(pegasus_classes "$NAMESPACE")" ]; then
        run cimcli di -n "$(dirname "$NAMESPACE")" "__Namespace.Name=\"$(basename "$NAMESPACE")\""
    fi
}

# What is not there is gone already; what stays is said.
pegasus_delete() { # di|dc|dq NAMESPACE WHAT OBJECT...
    local verb=$1 namespace=$2 what=$3 object output left="" reason=""
    shift 3
    if [ -n "$dry_run" ]; then
        say "would run: cimcli $verb -n $namespace, for $# $what"
        return 0
    fi
    say "run: cimcli $verb -n $namespace, for $# $what"
    for object in "$@"; do
        output=$(cimcli "$verb" -n "$namespace" "$object" 2>&1) && continue
        case $output in *CIM_ERR_NOT_FOUND* | *CIM_ERR_INVALID_CLASS* | *CIM_ERR_INVALID_NAMESPACE*) continue ;; esac
        left+="$object"$'\n' reason=$output
    done
    [ -z "$left" ] || say "left in $namespace: $(printf '%s' "$left" | in_words): $(reason_in "$reason")"
}
