# sfcb: files in its staging folder, from which sfcbrepos makes class repository and registration anew.

sfcb_is_here() { [ -e "$root/etc/sfcb/sfcb.cfg" ] || [ -d "$root/var/lib/sfcb" ]; }

sfcb_folders() {
    local folder
    sfcb_settings=$root/etc/sfcb/sfcb.cfg
    sfcb_stage=$root/var/lib/sfcb/stage
    sfcb_registration=$root$(setting "$sfcb_settings" registrationDir /var/lib/sfcb/registration)
    sfcb_schema_folder=$root/usr/share/sfcb/CIM
    sfcb_schema=${schema:-$(remembered schema server)}
    sfcb_interop=${interop:-$(remembered interop root/interop)}
    sfcb_complement=
    sfcb_complete_schema
    sfcb_providers=()
    for folder in $(setting "$sfcb_settings" providerDirs "/usr/lib64 /usr/lib /usr/lib64/cmpi /usr/lib/cmpi"); do
        case $folder in */cmpi) sfcb_providers=("$root$folder" ${sfcb_providers[@]+"${sfcb_providers[@]}"}) ;;
            *) sfcb_providers+=("$root$folder") ;;
        esac
    done
}

# What belongs into the staging folder: the file, and its place there.
sfcb_staged() {
    [ "$sfcb_schema" = server ] || printf '%s\n' "$sfcb_complement mofs/$NAMESPACE/11_kldr_structure.mof" \
        "$sfcb_complement mofs/$sfcb_interop/51_kldr_structure.mof"
    printf '%s\n' "$share/mof/kldrprovider.mof mofs/$NAMESPACE/20_kldrprovider.mof" \
        "$share/mof/kldrprovider.mof mofs/$sfcb_interop/60_kldrprovider.mof" \
        "$share/registration/kldrprovider.sfcb regs/kldrprovider.reg"
}

# sfcbrepos puts the server's schema before whatever is staged, and no class may come twice: of our structure only those classes
# are staged that it lacks. Sets `sfcb_complement`.
sfcb_complete_schema() {
    [ "$sfcb_schema" = own ] && [ -e "$sfcb_schema_folder/CIM_Schema.mof" ] || return 0
    sfcb_complement=$(mktemp) && trap 'rm -f "$sfcb_complement"' EXIT
    awk -v names=" $(sfcb_schema_lacks "$(classes_in "$share/mof/kldr_structure.mof")" | tr '\n' ' ')" '
        { block = block $0 "\n" }
        /^class / { name = $2 }
        /^};/ { if (index(names, " " name " ")) printf "%s", block; block = "" }' \
        "$share/mof/kldr_structure.mof" >"$sfcb_complement"
}

# What of ours stands there, from whichever release and with whichever options.
sfcb_found_staged() {
    (cd "$sfcb_stage" && find mofs regs -name '*_kldr_*.mof' -o -name '*_kldrprovider.mof' -o -name kldrprovider.reg) 2>/dev/null
}

sfcb_stages_all() {
    local file place
    while read -r file place; do
        same "$file" "$sfcb_stage/$place" || { printf '%s\n' "$place"; return 1; }
    done < <(sfcb_staged)
    [ "$(sfcb_found_staged | sort)" = "$(sfcb_staged | cut -d' ' -f2 | sort)" ] || { echo "something else of ours"; return 1; }
}

# How many of our classes the registration has that sfcb reads at its start.
sfcb_known() {
    local file=$sfcb_registration/providerRegister
    [ -e "$file" ] || { echo 0; return 0; }
    [ -r "$file" ] || { echo "$file cannot be read"; return 2; }
    grep -c "^[[:space:]]*location:[[:space:]]*${MODULE}[[:space:]]*\$" "$file" || true
}

sfcb_class_count() { grep -c '^\[' "$share/registration/kldrprovider.sfcb"; }

sfcb_knows_all() {
    local known
    known=$(sfcb_known) || { echo "$known"; return 2; }
    [ "$known" = "$(sfcb_class_count)" ] || { echo "$known are there"; return 1; }
}

# The repository's classes are told by sfcb's own tool alone.
sfcb_has_classes() {
    local file=$sfcb_registration/repository/$NAMESPACE/classSchemas lacking classes
    [ -e "$file" ] || { echo "no class repository for $NAMESPACE"; return 1; }
    command -v sfcbdump >/dev/null || { echo "sfcbdump is not on PATH"; return 2; }
    classes=$(sfcbdump "$file" 2>/dev/null | sed -n 's/^ *Class name:  *"\(.*\)"$/\1/p')
    [ -n "$classes" ] || { echo "sfcbdump does not read $file"; return 2; }
    lacking=$(names_without "$(classes_in "$share/mof/kldrprovider.mof")" "$classes") || return 0
    in_words <<<"$lacking"
    return 1
}

sfcb_is_complete() {
    some_folder_has_library "${sfcb_providers[@]}" && sfcb_stages_all && sfcb_knows_all && sfcb_has_classes
}

# Of these classes, those that the server's CIM Schema does not have.
sfcb_schema_lacks() { # NAMES
    local file=$sfcb_schema_folder/CIM_Schema.mof
    names_without "$1" "$(sed -n 's|^#pragma include *("\(.*/\)*\(CIM_[A-Za-z0-9_]*\)\.mof").*|\2|p' "$file"; classes_in "$file")"
}

sfcb_schema_suffices() {
    local needed gaps
    [ -e "$sfcb_schema_folder/CIM_Schema.mof" ] ||
        fail "$FAILED" "no CIM Schema in $sfcb_schema_folder: install the one that comes with the server" || return
    [ "$sfcb_schema" = server ] || return 0
    needed=$(sed -n 's/^class [A-Za-z0-9_]* : \(CIM_[A-Za-z0-9_]*\).*/\1/p' "$share/mof/kldrprovider.mof" | sort -u)
    gaps=$(sfcb_schema_lacks "$needed") || return 0
    fail "$FAILED" "the CIM Schema in $sfcb_schema_folder lacks $(in_words <<<"$gaps"):" \
        "use --schema own, or install one that is newer or has the experimental classes; nothing was changed"
}

# Makes repository and registration from a copy of all that is staged, ours included or not, and changes what is in use only
# when that has succeeded. sfcbrepos itself would leave half of both behind.
sfcb_rebuild() { # with|without
    local work=$sfcb_registration/kldrprovider.new good=
    if [ -n "$dry_run" ]; then
        say "would run: sfcbrepos -f, on a copy of $sfcb_stage $1 our files, and take over what it makes"
        return 0
    fi
    rm -rf "$work" && mkdir -p "$work/registration" && cp -a "$sfcb_stage/." "$work/stage" ||
        fail "$FAILED" "cannot copy $sfcb_stage to $work" || return
    for each in repository providerRegister; do
        [ ! -e "$sfcb_registration/$each" ] || cp -a "$sfcb_registration/$each" "$work/registration/" || return
    done
    sfcb_restage "$work/stage" "$1" >/dev/null &&
        run sfcbrepos -f -s "$work/stage" -r "$work/registration" ${root:+-c "$sfcb_schema_folder"} &&
        sfcb_carry_over "$work/registration/repository" &&
        sfcb_restage "$sfcb_stage" "$1" && sfcb_take_over "$work/registration" && good=yes
    rm -rf "$work"
    [ -n "$good" ] || fail "$FAILED" "the server's classes and registration are as they were"
}

# Instances that clients have stored, subscriptions above all: sfcbrepos means to keep them and loses them. Each class's are a file
# and its index, named after the class in small letters.
sfcb_carry_over() { # REPOSITORY
    local file
    while read -r file; do
        [ ! -d "$1/$(dirname "$file")" ] || [ -e "$1/$file" ] || cp -a "$sfcb_registration/repository/$file" "$1/$file" ||
            fail "$FAILED" "cannot write to $1" || return
    done < <(cd "$sfcb_registration/repository" 2>/dev/null &&
        find . -type f ! -name 'classSchemas*' ! -name 'qualifiers*' ! -name 'kaldera_*')
}

# Our files in a staging folder, and no others of ours: those of this release, or none.
sfcb_restage() { # STAGE with|without
    local file place
    for file in $(sfcb_found_staged); do
        [ "$2" = with ] && sfcb_staged | grep -q " $file\$" || take_away "$1/$file" || return
    done
    if [ "$2" = with ]; then
        while read -r file place; do
            place "$file" "$1/$place" || return
        done < <(sfcb_staged)
    else
        rmdir "$1/mofs/$NAMESPACE" 2>/dev/null || true
    fi
}

sfcb_take_over() { # REGISTRATION
    rm -rf "$sfcb_registration/repository" && mv "$1/repository" "$sfcb_registration/repository" &&
        mv -f "$1/providerRegister" "$sfcb_registration/providerRegister" ||
        fail "$FAILED" "cannot write to $sfcb_registration"
}

sfcb_runs() { [ -z "$root" ] && runs sfcbd; }

sfcb_conclude() {
    if sfcb_runs; then
        conclude "restart sfcb when it suits: it reads its registration at its start"
    else
        conclude "$1"
    fi
}

sfcb_install() {
    if sfcb_is_complete >/dev/null; then
        say "already registered: $(sfcb_known) classes"
        return
    fi
    need_tools sfcbrepos && sfcb_schema_suffices && sfcb_rebuild with && link_library "${sfcb_providers[@]}" || return
    remember "tools=$(folders_of_tools sfcbrepos sfcbdump)" "schema=$sfcb_schema" "interop=$sfcb_interop" || return
    sfcb_conclude "registered: the server will know the module when it starts"
}

sfcb_remove() {
    local known
    known=$(sfcb_known) || fail "$FAILED" "$known; nothing was changed" || return
    if [ "$known" = 0 ] && [ -z "$(sfcb_found_staged)" ]; then
        say "not registered"
    else
        need_tools sfcbrepos && sfcb_rebuild without && sfcb_conclude "the server no longer knows the module" || return
    fi
    # Last, so that a server that starts meanwhile still finds what it is told of.
    unlink_library "${sfcb_providers[@]}"
    forget_memory
}

sfcb_list() {
    local known
    known=$(sfcb_known) || fail "$FAILED" "$known" || return
    say "$known of $(sfcb_class_count) classes registered"
}

sfcb_check() {
    report "library in one of ${sfcb_providers[*]}" some_folder_has_library "${sfcb_providers[@]}"
    report "classes, profiles and registration of this release staged" sfcb_stages_all
    report "$(sfcb_class_count) classes in providerRegister" sfcb_knows_all
    report "product classes in the class repository" sfcb_has_classes
    if sfcb_runs; then
        report "the running server answers for $FIRST_CLASS" sfcb_answers
    else
        say "not asked, as it does not run: whether the server answers"
    fi
}

# One real question, as a client asks it. A server that wants a password is not asked twice.
sfcb_answers() {
    local port answer="" reason="no instance"
    [ "$(setting "$sfcb_settings" enableHttp true)" = true ] || { echo "it takes no HTTP"; return 2; }
    port=$(setting "$sfcb_settings" httpPort 5988)
    # One that has just been started does not listen yet.
    for _ in {1..10}; do
        ! answer=$(enumerate_names "$port") || break
        sleep 0.5
    done
    [ -n "$answer" ] || { echo "no answer on port $port"; return 2; }
    case $answer in
        *"<INSTANCENAME "*) return 0 ;;
        HTTP*" 401"*) echo "it asks for a name and a password"; return 2 ;;
        *"<ERROR "*) reason=$(sed -n 's/.*<ERROR CODE="\([0-9]*\)" DESCRIPTION="\([^"]*\)".*/error \1, \2/p' <<<"$answer") ;;
    esac
    echo "$reason; restart it if it was not restarted since"
    return 1
}

# The whole answer to EnumerateInstanceNames of the first class.
enumerate_names() { # PORT
    local path="" word body
    for word in ${NAMESPACE//\// }; do
        path+="<NAMESPACE NAME=\"$word\"/>"
    done
    body="<?xml version=\"1.0\" encoding=\"utf-8\"?><CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"1\"
 PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><IMETHODCALL NAME=\"EnumerateInstanceNames\"><LOCALNAMESPACEPATH>$path</LOCALNAMESPACEPATH>
<IPARAMVALUE NAME=\"ClassName\"><CLASSNAME NAME=\"$FIRST_CLASS\"/></IPARAMVALUE></IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>"
    # In a process of its own, so that neither a refused connection nor a silent server ends or holds this one.
    (
        exec 3<>"/dev/tcp/127.0.0.1/$1" && printf '%s' "POST /cimom HTTP/1.1
Host: localhost
Content-Type: application/xml; charset=\"utf-8\"
Content-Length: ${#body}
CIMOperation: MethodCall
CIMMethod: EnumerateInstanceNames
CIMObject: $NAMESPACE

$body" >&3 && read_answer <&3
    ) 2>/dev/null
}

# The server keeps the connection, so that the end of the answer has to be seen in it.
read_answer() {
    local piece
    IFS= read -r -t 30 piece || return
    printf '%s\n' "$piece"
    case $piece in HTTP*" 401"*) return 0 ;; esac
    while IFS= read -r -t 30 -d '>' piece; do
        printf '%s>' "$piece"
        case $piece in *"</CIM") return 0 ;; esac
    done
    return 1
}
