# OpenPegasus: instances and classes of its repository, through the server while it runs, beside it while it does not.

pegasus_is_here() { [ -d "$root/etc/Pegasus" ] || [ -d "$root/var/lib/Pegasus" ]; }

pegasus_folders() {
    local conf=$root/etc/Pegasus/cimserver_planned.conf folder
    pegasus_repository=$root$(setting "$conf" repositoryDir /var/lib/Pegasus/repository)
    pegasus_interop=${interop:-$(remembered interop root/PG_InterOp)}
    pegasus_schema=${schema:-$(remembered schema own)}
    pegasus_providers=()
    for folder in $(setting "$conf" providerDir "/usr/lib64/Pegasus/providers /usr/lib/Pegasus/providers" | tr : ' '); do
        pegasus_providers+=("$root$folder")
    done
    pegasus_mof=("$share/mof/kldrprovider.mof")
    [ "$pegasus_schema" = server ] ||
        pegasus_mof=("$share/mof/kldr_qualifiers.mof" "$share/mof/kldr_structure.mof" "${pegasus_mof[@]}")
    pegasus_look
}

# Sums of what `install` loads, with the schema and the namespace.
pegasus_sum() {
    { (cd "$share" && cksum mof/*.mof registration/kldrprovider.p*.mof); echo "$pegasus_schema $pegasus_interop"; } | cksum
}

pegasus_compile() { # NAMESPACE FILE
    local -a how=(cimmof)
    [ "$pegasus_state" = running ] || how=(cimmofl -W "-R$(dirname "$pegasus_repository")" "-N$(basename "$pegasus_repository")")
    run "${how[@]}" -w -aEV -uc "-n$1" "$2"
}

# Where the module is of another word size than the server, the registration says so; otherwise it must not.
pegasus_registration() {
    local folder other ours theirs=""
    ours=$(word_size_of "$library")
    for folder in "${pegasus_providers[@]}"; do
        for other in "$folder"/lib*.so; do
            [ "${other##*/}" = "lib$MODULE.so" ] || theirs=${theirs:-$(word_size_of "$other")}
        done
    done
    if [ -z "$theirs" ] || [ "$theirs" = "$ours" ]; then
        cat "$share/registration/kldrprovider.pegasus.mof"
    else
        sed "s/^\( *\)Location = .*/&\n\1Bitness = $((ours + 1));/" "$share/registration/kldrprovider.pegasus.mof"
    fi
}

pegasus_compile_all() {
    local file folder
    for file in "${pegasus_mof[@]}"; do
        pegasus_compile "$NAMESPACE" "$file" || return
    done
    folder=$(mktemp -d) && pegasus_registration >"$folder/kldrprovider.pegasus.mof" &&
        pegasus_compile "$pegasus_interop" "$folder/kldrprovider.pegasus.mof" &&
        pegasus_compile "$pegasus_interop" "$share/registration/kldrprovider.profiles.mof"
    local result=$?
    rm -rf "$folder"
    return "$result"
}

pegasus_remember() { # NAME=VALUE...
    remember "tools=$(folders_of_tools cimmof cimmofl cimprovider cimcli cimserver)" "schema=$pegasus_schema" \
        "interop=$pegasus_interop" "namespace=$pegasus_namespace_is" "$@"
}

pegasus_is_complete() {
    some_folder_has_library "${pegasus_providers[@]}" && pegasus_has_loaded && pegasus_knows && pegasus_has_classes
}

pegasus_has_loaded() {
    [ "$(remembered sum "")" = "$(pegasus_sum)" ] || { echo "another release, or other options"; return 1; }
}

pegasus_install() {
    local known=0
    pegasus_can_be_asked || return
    if pegasus_is_complete >/dev/null; then
        say "already registered"
        return
    fi
    pegasus_knows >/dev/null || known=$?
    if [ "$pegasus_state" = running ]; then need_tools cimmof cimprovider cimcli; else need_tools cimmofl; fi || return
    # Whose the namespace is decides what `remove` takes away with it.
    pegasus_namespace_is=$(remembered namespace "$(pegasus_namespace_now)")
    # The compiler updates no instances, and no class with subclasses: those of another release go first.
    if [ "$known" = 0 ] || pegasus_has_classes >/dev/null; then
        pegasus_with_server pegasus_forget || return
    fi
    link_library "${pegasus_providers[@]}" && pegasus_remember && pegasus_compile_all && pegasus_remember "sum=$(pegasus_sum)" ||
        return
    if [ "$pegasus_state" = running ]; then
        conclude "registered: the server loads the module at the next request"
    else
        conclude "registered: the server will know the module when it starts"
    fi
}

pegasus_remove() {
    pegasus_can_be_asked || return
    if pegasus_knows >/dev/null || pegasus_some_classes >/dev/null; then
        pegasus_namespace_is=$(remembered namespace found)
        pegasus_with_server pegasus_forget || return
    else
        say "not registered"
    fi
    unlink_library "${pegasus_providers[@]}"
    forget_memory
}

pegasus_list() {
    local known=0 words="registered as $SERVER_MODULE"
    pegasus_can_be_asked || return
    pegasus_knows >/dev/null || known=$?
    [ "$known" = 0 ] || words="not registered"
    say "server $pegasus_state, $words"
}

pegasus_check() {
    pegasus_can_be_asked || return
    report "library in one of ${pegasus_providers[*]}" some_folder_has_library "${pegasus_providers[@]}"
    report "classes and profiles of this release loaded" pegasus_has_loaded
    report "module $SERVER_MODULE registered" pegasus_knows
    report "product classes in the class repository" pegasus_has_classes
    if [ "$pegasus_state" = running ]; then
        report "the running server answers for $FIRST_CLASS" pegasus_answers
    else
        say "not asked, as it does not run: whether the server answers"
    fi
}
