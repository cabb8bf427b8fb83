# How OpenPegasus is found and told, which its server has to run for.
# shellcheck shell=sh disable=SC2154 # the variables are those of the program that sources this file

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
    pegasus_modules=$(cimprovider -l 2>/dev/null </dev/null) || {
        failed "OpenPegasus: its server does not answer, and nothing can be registered without it: start cimserver"
        return 1
    }
}

pegasus_remove_modules() {
    for module in $all_modules; do
        if printf '%s\n' "$pegasus_modules" | grep -qx "$module"; then
            run cimprovider -r -m "$module" || return 1
        fi
    done
}

pegasus_load() {
    schema=$data/classes.mof
    [ "$with_qualifiers" = no ] || schema=$data/velko.mof
    run cimmof -uC -n "$namespace" -I "$data" "$schema" &&
        run cimmof -n root/PG_InterOp "$data/pegasus/$library.mof" || return 1
    if has_computer_system; then
        run cimmof -n root/PG_InterOp "$data/pegasus/ComputerSystemProvider.mof"
    fi
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
    if pegasus_remove_modules && pegasus_load; then
        say "OpenPegasus: registered $library"
        pegasus_look_for_library
    else
        failed "OpenPegasus: not registered"
    fi
}

pegasus_delete_classes() {
    has cimcli || {
        say "OpenPegasus: the class definitions stay, since cimcli is not installed to delete them"
        return 0
    }
    for class in $(all_classes | tac); do
        if cimcli gc -n "$namespace" "$class" </dev/null >/dev/null 2>&1; then
            run cimcli dc -n "$namespace" "$class" || return 1
        fi
    done
}

unregister_pegasus() {
    pegasus_server || return
    if pegasus_remove_modules && pegasus_delete_classes; then
        say "OpenPegasus: unregistered"
    else
        failed "OpenPegasus: not unregistered"
    fi
}

list_pegasus() {
    pegasus_server || return
    found=no
    for module in $all_modules; do
        if printf '%s\n' "$pegasus_modules" | grep -qx "$module"; then
            found=yes
            cimprovider -l -m "$module" </dev/null | sed "s/^/OpenPegasus: module $module, provider /"
        fi
    done
    [ "$found" = yes ] || echo "OpenPegasus: nothing is registered"
}
