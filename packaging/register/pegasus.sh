# How OpenPegasus is found and told, which its server has to run for.
# shellcheck shell=sh disable=SC2034,SC2154 # the variables are those of the program that sources this file

find_pegasus() {
    has cimprovider || has cimmof || has cimserver
}

# OpenPegasus takes registrations back through its server only, and keeps old ones where new ones are given.
pegasus_server() {
    for tool in cimmof cimprovider; do
        has "$tool" || {
            failed "OpenPegasus is installed without its command $tool, which is needed"
            return 1
        }
    done
    pegasus_modules >/dev/null || {
        failed "OpenPegasus: its server does not answer, and nothing can be registered without it: start cimserver"
        return 1
    }
}

# Those of ours that are registered.
pegasus_modules() {
    modules=$(cimprovider -l 2>/dev/null </dev/null) || return 1
    for module in $(modules_in "$data"/pegasus/*.mof); do
        if printf '%s\n' "$modules" | grep -qx "$module"; then
            echo "$module"
        fi
    done
}

# Module and provider of what is registered of ours.
pegasus_registered() {
    for module in $(pegasus_modules); do
        cimprovider -l -m "$module" </dev/null | sed "s/^/$module /"
    done
}

pegasus_has_class() {
    cimcli gc -n "$namespace" "$1" </dev/null >/dev/null 2>&1
}

# Computers may be served by another agent's provider: their class is not ours then.
pegasus_find_other_computers() {
    others=no
    if ! has_computers && ! pegasus_modules | grep -qx "$(modules_in "$data/pegasus/$computers.mof")" &&
        has cimcli && pegasus_has_class "$(classes_of "$computers")"; then
        others=yes
    fi
}

pegasus_load_classes() {
    # shellcheck disable=SC2046 # one word a file: installation directories have no blanks
    set -- $(our_classes | sed "s|.*|$data/&.mof|")
    [ "$with_qualifiers" = no ] || set -- "$data/qualifiers.mof" "$@"
    run cimmof -uc -n "$namespace" "$@"
}

pegasus_remove_modules() {
    former_modules=$(pegasus_modules) || return 1
    for module in $former_modules; do
        run cimprovider -r -m "$module" || return 1
    done
}

pegasus_load_provider() { # LIBRARY
    run cimmof -n root/PG_InterOp "$data/pegasus/$1.mof"
}

# A provider's place is taken when the former one is gone. It comes back where that or the new one fails.
pegasus_replace() { # FORMER: module and provider, a line each
    pegasus_load_classes || return 1
    pegasus_remove_modules && pegasus_load_provider "$library" &&
        { ! has_computers || pegasus_load_provider "$computers"; } && return
    [ -z "$1" ] || pegasus_put_back "$1"
    return 1
}

# What cannot be removed is not registered over.
pegasus_put_back() { # FORMER
    pegasus_remove_modules
    left=$(pegasus_modules) || return
    printf '%s\n' "$1" | while read -r module name; do
        if ! printf '%s\n' "$left" | grep -qx "$module"; then
            [ "$name" != "$former_computers" ] || name=$computers
            complain "OpenPegasus: trying to register $name again"
            pegasus_load_provider "$name"
        fi
    done
}

pegasus_look_for_library() {
    has cimconfig || return 0
    directories=$(cimconfig -g providerDir 2>/dev/null </dev/null) || return 0
    case $directories in
    *"$libraries"*) ;;
    *) say "OpenPegasus may not find the library: set providerDir to a list with $libraries (cimconfig -p -s)" ;;
    esac
}

register_pegasus() {
    pegasus_server || return
    before=$(pegasus_registered)
    choose_library "$before" || {
        say "OpenPegasus: nothing was registered, and nothing is renewed"
        return
    }
    pegasus_find_other_computers
    if pegasus_replace "$before"; then
        registered_with=$registered_with,pegasus
        done_saying "OpenPegasus: registered $library"
        pegasus_look_for_library
    else
        failed "OpenPegasus: not registered as it should be; now it has:"
        list_pegasus >&2
    fi
}

pegasus_delete_classes() {
    has cimcli || {
        say "OpenPegasus: the class definitions stay, since cimcli is not installed to delete them"
        return 0
    }
    for class in $(our_classes | tac); do
        if pegasus_has_class "$class"; then
            run cimcli dc -n "$namespace" "$class" || return 1
        fi
    done
}

unregister_pegasus() {
    pegasus_server || return
    pegasus_find_other_computers
    if pegasus_remove_modules && pegasus_delete_classes; then
        done_saying "OpenPegasus: unregistered"
    else
        failed "OpenPegasus: not unregistered; now it has:"
        list_pegasus >&2
    fi
}

list_pegasus() {
    pegasus_server || return
    lines=$(pegasus_registered | sed 's/^\([^ ]*\) /OpenPegasus: module \1, provider /')
    echo "${lines:-OpenPegasus: nothing is registered}"
}
