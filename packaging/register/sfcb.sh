# How SFCB is found and told. Its commands work on files: the server may be stopped.
# shellcheck shell=sh disable=SC2034,SC2154 # the variables are those of the program that sources this file

find_sfcb() {
    has sfcbrepos || has sfcbstage || has sfcbd
}

sfcb_tools() {
    for tool in sfcbstage sfcbunstage sfcbrepos; do
        has "$tool" || {
            failed "SFCB is installed without its command $tool, which is needed"
            return 1
        }
    done
    sfcb_look_for_place
}

# Sets where stage and registration are. Without an option, the command itself knows best.
sfcb_look_for_place() {
    sfcb_place=$sfcb_directory
    if [ -z "$sfcb_place" ] && has sfcbrepos; then
        sfcb_place=$(limited sfcbrepos -h 2>&1 | sed -n 's|.*\[\(/.*\)/registration\].*|\1|p')
    fi
    sfcb_place=${sfcb_place:-/var/lib/sfcb}
    sfcb_stanza_file=$sfcb_place/registration/providerRegister
}

sfcb_stage() {
    run sfcbstage ${sfcb_directory:+-s "$sfcb_directory/stage"} "$@"
}

sfcb_unstage() {
    run sfcbunstage ${sfcb_directory:+-s "$sfcb_directory/stage"} "$@"
}

# Makes the repository again from the staged files.
sfcb_rebuild() {
    run sfcbrepos -f ${sfcb_directory:+-s "$sfcb_directory/stage" -r "$sfcb_directory/registration"}
}

# Names in the stage of those that are not to stay there.
sfcb_registrations() {
    for file in "$data"/*.reg "$data"/*/*.reg; do
        [ "$others ${file##*/}" = "yes $computers.reg" ] || echo "${file##*/}"
    done
    if [ "$command" = unregister ] || ! has_former_computers; then
        sfcb_former_registration
    fi
}

# That of our computers by their former name, if it is staged. Somebody else's may bear that name too.
sfcb_former_registration() {
    file=$sfcb_place/stage/regs/$former_computers.reg
    if grep -qs '^ *group: LeaseAndWarranty$' "$file"; then
        echo "${file##*/}"
    fi
}

sfcb_unstage_all() {
    for each in $(sfcb_registrations); do
        sfcb_unstage -r "$each" || return 1
    done
    # shellcheck disable=SC2046 # one word a class: names of classes have no blanks
    sfcb_unstage $(our_classes | sed 's/$/.mof/') || return 1
    sfcb_is_unstaged
}

# The command ends with success even where it could not delete.
sfcb_is_unstaged() {
    [ "$dry_run" = no ] || return 0
    for each in $(sfcb_registrations | sed 's|^|regs/|') $(our_classes | sed "s|.*|mofs/$namespace/&.mof|"); do
        [ ! -e "$sfcb_place/stage/$each" ] || {
            complain "$sfcb_place/stage/$each could not be deleted"
            return 1
        }
    done
}

sfcb_register_all() {
    sfcb_unstage_all || return 1
    # shellcheck disable=SC2046 # one word a file: installation directories have no blanks
    sfcb_stage -r "$(registration_of "$library")" $(our_classes | sed "s|.*|$data/&.mof|") || return 1
    if has_computers; then
        sfcb_stage -r "$(registration_of "$computers")"
    fi
}

# Copies lie beside the originals, so that putting them back is renaming, which takes no space; unless an original is a
# link to another file system. SFCB's commands run in the directory of the copies, which has no MOF files: the compiler
# looks for the files that the CIM schema includes, such as qualifiers.mof, in the current directory first.
sfcb_save() {
    [ "$dry_run" = no ] || return 0
    if ! sfcb_copies=$(mktemp -d "$sfcb_place/before-$program.XXXXXX") || ! cd "$sfcb_copies"; then
        complain "SFCB: $sfcb_place cannot be written to; is there another --sfcb-directory?"
        return 1
    fi
    on_signal 'sfcb_leave "it was to end"; exit 1'
    for each in stage registration; do
        [ ! -e "$sfcb_place/$each" ] || cp -aH "$sfcb_place/$each" "$sfcb_copies/" || {
            sfcb_leave "no copy could be made of $sfcb_place/$each"
            return 1
        }
    done
    on_signal 'sfcb_put_back; exit 1'
}

# The originals are as they were, and the copies may not be whole.
sfcb_leave() { # REASON
    sfcb_discard
    complain "SFCB: nothing is changed, since $1"
}

# A signal finds the copies whole, or is ignored.
sfcb_discard() {
    [ "$dry_run" = no ] || return 0
    on_signal ''
    cd /
    rm -rf "$sfcb_copies"
    on_signal -
}

# Another run of sfcbrepos would not do: after a first that broke off, it deletes the last good repository.
sfcb_put_back() {
    on_signal ''
    if sfcb_put_back_one stage && sfcb_put_back_one registration; then
        complain "SFCB: what was there before has been put back"
        sfcb_discard
    else
        complain "SFCB: what was there could not be put back: it is in $sfcb_copies"
        on_signal -
    fi
}

# Where the original is a link, it stays one.
sfcb_put_back_one() { # DIRECTORY
    original=$(readlink -f "$sfcb_place/$1") || return 1
    if [ -e "$original" ]; then
        mv "$original" "$sfcb_copies/failed-$1" || return 1
    fi
    [ ! -e "$sfcb_copies/$1" ] || mv "$sfcb_copies/$1" "$original"
}

# Does a step with what is staged, and makes the repository of it.
sfcb_change() { # STEP
    sfcb_save || return 1
    if "$1" && sfcb_rebuild; then
        sfcb_discard
        return 0
    fi
    [ "$dry_run" = yes ] || sfcb_put_back
    return 1
}

# SFCB reads its repository when it starts, and may be stopped meanwhile.
sfcb_restart() {
    for unit in sblim-sfcb sfcb sfcbd; do
        if has systemctl && systemctl --quiet is-active "$unit" 2>/dev/null; then
            if [ "$restart" = yes ]; then
                run systemctl restart "$unit" || failed "SFCB: restart it by hand: until then it serves what it did"
            else
                done_saying "SFCB is running: it takes effect when it is restarted (systemctl restart $unit)"
            fi
            return
        fi
    done
    done_saying "SFCB: if its server is running, it takes effect when it is restarted"
}

# Prints a value of SFCB's configuration, in which the last line counts. Fails if the configuration cannot be read.
sfcb_setting() { # NAME
    [ -r "$sfcb_config" ] && sed -n "s/^[[:space:]]*$1:[[:space:]]*//p" "$sfcb_config" | tail -n 1
}

# A library is found by its name alone, in the directories that the configuration lists. Where it has no line for them,
# SFCB looks in cmpi below the directory of its own libraries, among others.
sfcb_look_for_library() {
    directories=$(sfcb_setting providerDirs) || {
        say "SFCB may not find the library: $sfcb_config cannot be read; its providerDirs has to name $libraries"
        return
    }
    case " $directories " in
    *" $libraries "*) ;;
    "  ")
        case $libraries in
        /usr/lib*/cmpi | /usr/local/lib*/cmpi) ;;
        *) say "SFCB may not find the library: $sfcb_config has no line providerDirs, which could name $libraries" ;;
        esac
        ;;
    *) say "SFCB will not find the library: add $libraries to the line providerDirs in $sfcb_config" ;;
    esac
}

# SFCB trims values by default, and takes the bytes of characters outside of ASCII for white space. Clients see success.
sfcb_look_for_trimming() {
    sfcb_setting trimWhitespace | grep -qixE 'false([[:space:]].*)?' ||
        say "SFCB trims values, also non-ASCII characters at their ends, unless $sfcb_config has trimWhitespace: false"
}

# Prints class and provider of each stanza that comes in.
sfcb_stanzas() {
    awk '/^[ \t]*\[/ { class = $0; gsub(/[][ \t\r]/, "", class) }
         tolower($1) == "provider:" { print class, $2 }'
}

# Class and provider of what is registered of ours.
sfcb_registered() {
    [ -r "$sfcb_stanza_file" ] || return 0
    sfcb_stanzas <"$sfcb_stanza_file" | while read -r class name; do
        [ -z "$(registration_of "$name")" ] || echo "$class $name"
    done
}

# Computers may be served by another agent's provider: what it has staged of them is not ours then.
sfcb_find_other_computers() {
    others=no
    has_computers && return
    for class in $(classes_of "$computers"); do
        if sfcb_staged_stanzas | grep "^$class " | grep -qv " $computers\$"; then
            others=yes
        fi
    done
}

# Class and provider of what anybody has staged, but ourselves under a former name.
sfcb_staged_stanzas() {
    former_registration=$(sfcb_former_registration)
    for file in "$sfcb_place"/stage/regs/*.reg; do
        [ "${file##*/}" = "$former_registration" ] || cat "$file" 2>/dev/null
    done | sfcb_stanzas
}

sfcb_registered_classes() {
    sfcb_look_for_place
    [ -r "$sfcb_stanza_file" ] && sfcb_registered | sed 's/ .*//'
}

register_sfcb() {
    sfcb_tools || return
    choose_library "$(sfcb_registered)" || {
        say "SFCB: nothing was registered, and nothing is renewed"
        return
    }
    sfcb_find_other_computers
    if sfcb_change sfcb_register_all; then
        registered_with=$registered_with,sfcb
        done_saying "SFCB: registered $library"
        sfcb_look_for_library
        sfcb_restart
    else
        failed "SFCB: not registered"
    fi
}

unregister_sfcb() {
    sfcb_tools || return
    sfcb_find_other_computers
    if sfcb_change sfcb_unstage_all; then
        done_saying "SFCB: unregistered"
        sfcb_restart
    else
        failed "SFCB: not unregistered"
    fi
}

list_sfcb() {
    sfcb_look_for_place
    if [ ! -r "$sfcb_stanza_file" ]; then
        failed "SFCB: $sfcb_stanza_file cannot be read; is there another --sfcb-directory?"
        return
    fi
    lines=$(sfcb_registered | sed 's/^/SFCB: /; s/ \([^ ]*\)$/ by \1/')
    echo "${lines:-SFCB: nothing is registered}"
}
