# How OpenPegasus is found and told, which its server has to run for.
# shellcheck shell=sh disable=SC2034,SC2154 # the variables are those of the program that sources this file

find_pegasus() {
    has cimprovider || has cimmof || has cimserver
}

# OpenPegasus takes registrations back through its server only, and keeps old ones where new ones are given. Its
# cimmofl, which writes into the repository of a stopped server, is not used: what is registered cannot be seen then, so
# an old registration would stay, and a server that does not answer may yet run, and write there too.
pegasus_server() {
    for tool in cimmof cimprovider; do
        has "$tool" || {
            failed "OpenPegasus is installed without its command $tool, which is needed"
            return 1
        }
    done
    pegasus_modules >/dev/null || {
        failed "OpenPegasus: its server does not answer, and is needed: start cimserver"
        return 1
    }
}

# Those of ours that are registered.
pegasus_modules() {
    modules=$(limited cimprovider -l 2>/dev/null) || return 1
    for module in $(modules_in "$data"/pegasus/*.mof); do
        if printf '%s\n' "$modules" | grep -qx "$module"; then
            echo "$module"
        fi
    done
}

# Module and provider of what is registered of ours. Where that cannot be known it fails: there may be something.
pegasus_registered() {
    found=$(pegasus_modules) || return 1
    for module in $found; do
        names=$(limited cimprovider -l -m "$module" 2>/dev/null) || return 1
        [ -z "$names" ] || printf '%s\n' "$names" | sed "s/^/$module /"
    done
}

pegasus_unknown() {
    failed "OpenPegasus: its server does not tell what is registered"
}

# Its builds keep registrations in namespaces of different names. That is looked for by asking: cimmof would make a
# namespace that is not there.
pegasus_find_interop() {
    places=${interop:-root/PG_InterOp root/interop interop}
    for interop in $places; do
        if ! has cimcli || pegasus_has_class "$interop" PG_ProviderModule; then
            return 0
        fi
    done
    failed "OpenPegasus: no namespace of $places has the class PG_ProviderModule: name the one for --interop"
    return 1
}

pegasus_has_class() { # NAMESPACE CLASS
    limited cimcli gc -n "$1" "$2" >/dev/null 2>&1
}

# Computers may be served by another agent's provider: their class is not ours then. What cannot be known is left alone.
pegasus_find_other_computers() {
    others=yes
    if has_computers || pegasus_modules | grep -qx "$(modules_in "$data/pegasus/$computers.mof")"; then
        others=no
    elif has cimcli && served=$(pegasus_served) &&
        ! printf '%s\n' "$served" | grep -qix "$(classes_of "$computers")"; then
        others=no
    fi
}

# The classes that anybody's provider is registered for.
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
    # One call a file: of several, cimmof tells only how the last one went.
    for class in $(our_classes); do
        run cimmof -uc -n "$namespace" "$data/$class.mof" || return 1
    done
}

# Associations refer to computers. A class that another agent may have declared is declared where there is none, and not
# changed.
pegasus_declare_computers() {
    for class in $(classes_of "$computers"); do
        if has cimcli && pegasus_has_class "$namespace" "$class"; then
            continue
        fi
        run cimmof -n "$namespace" "$data/$class.mof" ||
            complain "OpenPegasus: going on: $class may be declared already"
    done
}

pegasus_remove_modules() {
    former_modules=$(pegasus_modules) || return 1
    for module in $former_modules; do
        [ "$module" = "$stays" ] || pegasus_remove_module "$module" || return 1
    done
}

# OpenPegasus does not remove a module that answers requests.
pegasus_remove_module() { # MODULE
    run cimprovider -r -m "$1" && return
    case $told in
    *"rovider is busy"*) complain "OpenPegasus: clients use $1: stop them, and begin again" ;;
    esac
    return 1
}

pegasus_load_provider() { # LIBRARY
    run cimmof -n "$interop" "$data/pegasus/$1.mof"
}

# A provider's place is taken when the former one is gone. It comes back where that or the new one fails.
pegasus_replace() { # FORMER: module and provider, a line each
    pegasus_load_classes || return 1
    pegasus_remove_modules && pegasus_load_provider "$library" &&
        { ! has_computers || pegasus_load_provider "$computers"; } && return
    [ -z "$1" ] || pegasus_put_back "$1"
    return 1
}

pegasus_new_name() { # PROVIDER
    if [ "$1" = "$former_computers" ]; then echo "$computers"; else echo "$1"; fi
}

# What cannot be removed is not registered over.
pegasus_put_back() { # FORMER
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

# The module of computers by their former name, where the agent has them by that.
pegasus_former_computers() { # FORMER
    ! has_former_computers || printf '%s\n' "$1" | sed -n "s/ $former_computers\$//p"
}

# A signal is not heeded before the new registration has taken the old one's place.
register_pegasus() {
    pegasus_server && pegasus_find_interop || return
    before=$(pegasus_registered) || {
        pegasus_unknown
        return
    }
    choose_library "$before" || {
        say "OpenPegasus: nothing was registered, and nothing is renewed"
        return
    }
    stays=$(pegasus_former_computers "$before")
    on_signal ''
    if pegasus_replace "$before"; then
        registered_with=$registered_with,pegasus
        done_saying "OpenPegasus: registered $library; it takes effect at once"
        pegasus_look_for_library
    else
        failed "OpenPegasus: not registered as it should be; now it has:"
        list_pegasus >&2
    fi
    on_signal -
}

pegasus_delete_classes() {
    has cimcli || {
        say "OpenPegasus: the class definitions stay, since cimcli is not installed to delete them"
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
    stays=''
    on_signal ''
    pegasus_find_other_computers
    if pegasus_remove_modules && pegasus_delete_classes; then
        done_saying "OpenPegasus: unregistered"
    else
        failed "OpenPegasus: not unregistered; now it has:"
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
