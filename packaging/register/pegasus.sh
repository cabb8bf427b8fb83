# Registers with OpenPegasus, whose server must run.
# shellcheck shell=sh disable=SC2034,SC2154 # the program that sources this file sets the variables, or uses them

find_pegasus() {
    has cimprovider || has cimmof || has cimserver
}

# Checks that the server responds. OpenPegasus removes registrations only through its server, and keeps an old
# registration if a new one is loaded. cimmofl, which writes to the repository of a stopped server, is not used:
# without the server, the registrations cannot be read, so that an old one would remain, and a server that does not
# respond may still be writing to the repository.
pegasus_server() {
    for tool in cimmof cimprovider; do
        has "$tool" || {
            failed "OpenPegasus is installed without the required command $tool"
            return 1
        }
    done
    pegasus_modules >/dev/null || {
        failed "OpenPegasus: the server does not respond; start cimserver"
        return 1
    }
}

# Prints the registered modules that belong to this package.
pegasus_modules() {
    modules=$(limited cimprovider -l 2>/dev/null) || return 1
    for module in $(modules_in "$data"/pegasus/*.mof); do
        if printf '%s\n' "$modules" | grep -qx "$module"; then
            echo "$module"
        fi
    done
}

# Prints module and provider of this package's registrations. Fails if they cannot be read.
pegasus_registered() {
    found=$(pegasus_modules) || return 1
    for module in $found; do
        names=$(limited cimprovider -l -m "$module" 2>/dev/null) || return 1
        [ -z "$names" ] || printf '%s\n' "$names" | sed "s/^/$module /"
    done
}

pegasus_unknown() {
    failed "OpenPegasus: the server does not list its registrations"
}

# Sets `interop` to the namespace of the registrations, which differs between builds. Queries the namespace first,
# because cimmof would create a missing one.
pegasus_find_interop() {
    candidates=${interop:-root/PG_InterOp root/interop interop}
    for interop in $candidates; do
        if ! has cimcli || pegasus_has_class "$interop" PG_ProviderModule; then
            return 0
        fi
    done
    failed "OpenPegasus: none of the namespaces $candidates has the class PG_ProviderModule; name the right one with --interop"
    return 1
}

pegasus_has_class() { # NAMESPACE CLASS
    limited cimcli gc -n "$1" "$2" >/dev/null 2>&1
}

# Sets `others` to whether another agent's provider serves computers; yes if that is unknown. If yes, the class of
# computers is not changed.
pegasus_find_other_computers() {
    others=yes
    if has_computers || pegasus_modules | grep -qx "$(modules_in "$data/pegasus/$computers.mof")"; then
        others=no
    elif has cimcli && served=$(pegasus_served) &&
        ! printf '%s\n' "$served" | grep -qix "$(classes_of "$computers")"; then
        others=no
    fi
}

# Prints the classes for which any provider is registered.
pegasus_served() {
    pegasus_find_interop >/dev/null 2>&1 || return 1
    capabilities=$(limited cimcli ei -n "$interop" PG_ProviderCapabilities 2>/dev/null) || return 1
    printf '%s\n' "$capabilities" | sed -n 's/^[[:space:]]*ClassName = "\(.*\)";.*/\1/p'
}

pegasus_load_classes() {
    [ "$with_qualifiers" = no ] || run cimmof -uc -n "$namespace" "$data/velko-qualifiers.mof" || return 1
    others=no
    if ! has_computers; then
        others=yes
        pegasus_declare_computers
    fi
    # One call per file: for several files, cimmof returns only the status of the last.
    for class in $(our_classes); do
        run cimmof -uc -n "$namespace" "$data/$class.mof" || return 1
    done
}

# Declares the class of computers if it is missing, since associations refer to it. Does not change a class that
# another agent may have declared.
pegasus_declare_computers() {
    for class in $(classes_of "$computers"); do
        if has cimcli && pegasus_has_class "$namespace" "$class"; then
            continue
        fi
        run cimmof -n "$namespace" "$data/$class.mof" ||
            complain "OpenPegasus: continuing, since $class may be declared already"
    done
}

pegasus_remove_modules() {
    former_modules=$(pegasus_modules) || return 1
    for module in $former_modules; do
        [ "$module" = "$kept_module" ] || pegasus_remove_module "$module" || return 1
    done
}

# OpenPegasus does not remove a module that is serving requests.
pegasus_remove_module() { # MODULE
    run cimprovider -r -m "$1" && return
    case $output in
    *"rovider is busy"*) complain "OpenPegasus: clients use $1; stop them and try again" ;;
    esac
    return 1
}

pegasus_load_provider() { # LIBRARY
    run cimmof -n "$interop" "$data/pegasus/$1.mof"
}

# Removes the former registration, then loads the new one. If either fails, restores the former one.
pegasus_replace() { # FORMER: module and provider per line
    pegasus_load_classes || return 1
    pegasus_remove_modules && pegasus_load_provider "$library" &&
        { ! has_computers || pegasus_load_provider "$computers"; } && return
    [ -z "$1" ] || pegasus_restore "$1"
    return 1
}

pegasus_new_name() { # PROVIDER
    if [ "$1" = "$former_computers" ]; then echo "$computers"; else echo "$1"; fi
}

# Loads the former registrations again, except those that could not be removed.
pegasus_restore() { # FORMER
    pegasus_remove_modules
    left=$(pegasus_modules) || return
    printf '%s\n' "$1" | while read -r module name; do
        if ! printf '%s\n' "$left" | grep -qx "$module"; then
            name=$(pegasus_new_name "$name")
            complain "OpenPegasus: trying to register $name again"
            pegasus_load_provider "$name"
        fi
    done
}

pegasus_look_for_library() {
    has cimconfig || return 0
    directories=$(limited cimconfig -g providerDir 2>/dev/null) || return 0
    case $directories in
    *"$libraries"*) ;;
    *)
        say "OpenPegasus may not find the library: add $libraries to providerDir, with absolute names (cimconfig -c -p -s)"
        ;;
    esac
}

# Prints the module of the provider of computers under its former name, if the agent still has that provider.
pegasus_former_computers() { # FORMER
    ! has_former_computers || printf '%s\n' "$1" | sed -n "s/ $former_computers\$//p"
}

# Ignores signals until the new registration has replaced the old one.
register_pegasus() {
    pegasus_server && pegasus_find_interop || return
    before=$(pegasus_registered) || {
        pegasus_unknown
        return
    }
    choose_library "$before" || {
        say "OpenPegasus: not registered before; nothing was changed"
        return
    }
    kept_module=$(pegasus_former_computers "$before")
    on_signal ''
    if pegasus_replace "$before"; then
        registered_with=$registered_with,pegasus
        report_change "OpenPegasus: registered $library; it takes effect at once"
        pegasus_look_for_library
    else
        failed "OpenPegasus: not registered completely; registered now:"
        list_pegasus >&2
    fi
    on_signal -
}

pegasus_delete_classes() {
    has cimcli || {
        say "OpenPegasus: the class definitions are kept, since deleting them needs cimcli"
        return 0
    }
    for class in $(our_classes | tac); do
        if pegasus_has_class "$namespace" "$class"; then
            run cimcli dc -n "$namespace" "$class" || return 1
        fi
    done
}

unregister_pegasus() {
    pegasus_server || return
    kept_module=''
    on_signal ''
    pegasus_find_other_computers
    if pegasus_remove_modules && pegasus_delete_classes; then
        report_change "OpenPegasus: unregistered"
    else
        failed "OpenPegasus: not unregistered completely; registered now:"
        list_pegasus >&2
    fi
    on_signal -
}

pegasus_registered_classes() {
    lines=$(pegasus_registered) || return 1
    [ -z "$lines" ] || printf '%s\n' "$lines" | while read -r module name; do
        classes_of "$(pegasus_new_name "$name")"
    done
}

list_pegasus() {
    pegasus_server || return
    lines=$(pegasus_registered) || {
        pegasus_unknown
        return
    }
    lines=$(printf '%s\n' "$lines" | sed 's/^\([^ ]*\) /OpenPegasus: module \1, provider /')
    echo "${lines:-OpenPegasus: nothing is registered}"
}
