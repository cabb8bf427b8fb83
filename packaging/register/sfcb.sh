# Registers with SFCB. Its commands change files, so the server need not run.
# shellcheck shell=sh disable=SC2034,SC2154 # the program that sources this file sets the variables, or uses them

find_sfcb() {
    has sfcbrepos || has sfcbstage || has sfcbd
}

sfcb_tools() {
    for tool in sfcbstage sfcbunstage sfcbrepos; do
        has "$tool" || {
            failed "SFCB is installed without the required command $tool"
            return 1
        }
    done
    sfcb_find_directory
}

# Sets the directory that contains stage and registration: that of the option, or else the default of sfcbrepos.
sfcb_find_directory() {
    sfcb_base=$sfcb_directory
    if [ -z "$sfcb_base" ] && has sfcbrepos; then
        sfcb_base=$(limited sfcbrepos -h 2>&1 | sed -n 's|.*\[\(/.*\)/registration\].*|\1|p')
    fi
    sfcb_base=${sfcb_base:-/var/lib/sfcb}
    sfcb_stanza_file=$sfcb_base/registration/providerRegister
}

sfcb_stage() {
    run sfcbstage ${sfcb_directory:+-s "$sfcb_directory/stage"} "$@"
}

sfcb_unstage() {
    run sfcbunstage ${sfcb_directory:+-s "$sfcb_directory/stage"} "$@"
}

# Rebuilds the repository from the staged files.
sfcb_rebuild() {
    run sfcbrepos -f ${sfcb_directory:+-s "$sfcb_directory/stage" -r "$sfcb_directory/registration"}
}

# Prints the staged registration files to remove.
sfcb_registrations() {
    for file in "$data"/*.reg "$data"/*/*.reg; do
        [ "$others ${file##*/}" = "yes $computers.reg" ] || echo "${file##*/}"
    done
    if [ "$command" = unregister ] || ! has_former_computers; then
        sfcb_former_registration
    fi
}

# Prints the name of the staged registration file of computers under their former name, unless it is the file of other
# software.
sfcb_former_registration() {
    file=$sfcb_base/stage/regs/$former_computers.reg
    if grep -qs '^ *group: LeaseAndWarranty$' "$file"; then
        echo "${file##*/}"
    fi
}

sfcb_unstage_all() {
    for each in $(sfcb_registrations); do
        sfcb_unstage -r "$each" || return 1
    done
    # shellcheck disable=SC2046 # one word per class: names of classes have no blanks
    sfcb_unstage $(our_classes | sed 's/$/.mof/') || return 1
    sfcb_is_unstaged
}

# Checks the stage, because sfcbunstage succeeds even if it cannot delete a file.
sfcb_is_unstaged() {
    [ "$dry_run" = no ] || return 0
    for each in $(sfcb_registrations | sed 's|^|regs/|') $(our_classes | sed "s|.*|mofs/$namespace/&.mof|"); do
        [ ! -e "$sfcb_base/stage/$each" ] || {
            complain "$sfcb_base/stage/$each could not be deleted"
            return 1
        }
    done
}

sfcb_register_all() {
    sfcb_unstage_all || return 1
    # shellcheck disable=SC2046 # one word per file: installation directories have no blanks
    sfcb_stage -r "$(registration_of "$library")" $(our_classes | sed "s|.*|$data/&.mof|") || return 1
    if has_computers; then
        sfcb_stage -r "$(registration_of "$computers")"
    fi
}

# Copies stage and registration. The copies are in the same file system as the originals, unless the originals are
# links, so that renaming restores them and needs no space. SFCB's commands run in the directory of the copies, which
# has no MOF files, because the compiler first looks in the current directory for the files that the CIM schema
# includes, such as qualifiers.mof.
sfcb_save() {
    [ "$dry_run" = no ] || return 0
    if ! sfcb_copies=$(mktemp -d "$sfcb_base/before-$program.XXXXXX") || ! cd "$sfcb_copies"; then
        complain "SFCB: $sfcb_base is not writable; if SFCB uses another directory, name it with --sfcb-directory"
        return 1
    fi
    on_signal 'sfcb_abandon "the command was interrupted"; exit 1'
    for each in stage registration; do
        [ ! -e "$sfcb_base/$each" ] || cp -aH "$sfcb_base/$each" "$sfcb_copies/" || {
            sfcb_abandon "$sfcb_base/$each could not be copied"
            return 1
        }
    done
    on_signal 'sfcb_restore; exit 1'
}

# Deletes the copies, which may be incomplete. The originals are unchanged.
sfcb_abandon() { # REASON
    sfcb_discard
    complain "SFCB: nothing was changed: $1"
}

# Deletes the copies. Ignores signals meanwhile, because their handler would restore incomplete copies.
sfcb_discard() {
    [ "$dry_run" = no ] || return 0
    on_signal ''
    cd /
    rm -rf "$sfcb_copies"
    on_signal -
}

# Restores the copies. Running sfcbrepos again would not help: after a failed run, it deletes the last good
# repository.
sfcb_restore() {
    on_signal ''
    if sfcb_restore_one stage && sfcb_restore_one registration; then
        complain "SFCB: the previous registration was restored"
        sfcb_discard
    else
        complain "SFCB: the previous registration could not be restored; it is in $sfcb_copies"
        on_signal -
    fi
}

# Restores a directory. If the directory is a link, restores the target of the link.
sfcb_restore_one() { # DIRECTORY
    original=$(readlink -f "$sfcb_base/$1") || return 1
    if [ -e "$original" ]; then
        mv "$original" "$sfcb_copies/failed-$1" || return 1
    fi
    [ ! -e "$sfcb_copies/$1" ] || mv "$sfcb_copies/$1" "$original"
}

# Runs a step that changes the stage, and rebuilds the repository.
sfcb_change() { # STEP
    sfcb_save || return 1
    if "$1" && sfcb_rebuild; then
        sfcb_discard
        return 0
    fi
    [ "$dry_run" = yes ] || sfcb_restore
    return 1
}

# Restarts a running SFCB if --restart is given, because SFCB reads its repository only when it starts.
sfcb_restart() {
    for unit in sblim-sfcb sfcb sfcbd; do
        if has systemctl && systemctl --quiet is-active "$unit" 2>/dev/null; then
            if [ "$restart" = yes ]; then
                run systemctl restart "$unit" || failed "SFCB could not be restarted; it uses the old registration until you restart it"
            else
                report_change "SFCB is running; the change takes effect when it is restarted (systemctl restart $unit)"
            fi
            return
        fi
    done
    report_change "SFCB: if its server is running, the change takes effect when it is restarted"
}

# Prints a value of SFCB's configuration; the last line with the name applies. Fails if the configuration cannot be
# read.
sfcb_setting() { # NAME
    [ -r "$sfcb_config" ] && sed -n "s/^[[:space:]]*$1:[[:space:]]*//p" "$sfcb_config" | tail -n 1
}

# Warns if SFCB might not find the library. SFCB searches the directories that its configuration names. By default,
# these include the directory cmpi below that of SFCB's libraries.
sfcb_check_library() {
    directories=$(sfcb_setting providerDirs) || {
        say "SFCB may not find the library: $sfcb_config cannot be read; its line providerDirs must contain $libraries"
        return
    }
    case " $directories " in
    *" $libraries "*) ;;
    "  ")
        case $libraries in
        /usr/lib*/cmpi | /usr/local/lib*/cmpi) ;;
        *) say "SFCB may not find the library: $sfcb_config has no line providerDirs with $libraries" ;;
        esac
        ;;
    *) say "SFCB will not find the library: add $libraries to the line providerDirs in $sfcb_config" ;;
    esac
}

# Warns if SFCB trims values, as it does by default. SFCB treats the bytes of non-ASCII characters as white space, and
# reports success to clients.
sfcb_check_trimming() {
    sfcb_setting trimWhitespace | grep -qixE 'false([[:space:]].*)?' ||
        say "SFCB trims values, also non-ASCII characters at their ends, unless $sfcb_config has trimWhitespace: false"
}

# Reads stanzas from standard input. Prints class and provider of each.
sfcb_stanzas() {
    awk '/^[ \t]*\[/ { class = $0; gsub(/[][ \t\r]/, "", class) }
         tolower($1) == "provider:" { print class, $2 }'
}

# Prints class and provider of this package's registrations.
sfcb_registered() {
    [ -r "$sfcb_stanza_file" ] || return 0
    sfcb_stanzas <"$sfcb_stanza_file" | while read -r class name; do
        [ -z "$(registration_of "$name")" ] || echo "$class $name"
    done
}

# Sets `others` to whether another agent's provider serves computers. If yes, its staged files are not changed.
sfcb_find_other_computers() {
    others=no
    has_computers && return
    for class in $(classes_of "$computers"); do
        if sfcb_staged_stanzas | grep "^$class " | grep -qv " $computers\$"; then
            others=yes
        fi
    done
}

# Prints class and provider of all staged registrations except this package's former one.
sfcb_staged_stanzas() {
    former_registration=$(sfcb_former_registration)
    for file in "$sfcb_base"/stage/regs/*.reg; do
        [ "${file##*/}" = "$former_registration" ] || cat "$file" 2>/dev/null
    done | sfcb_stanzas
}

sfcb_registered_classes() {
    sfcb_find_directory
    [ -r "$sfcb_stanza_file" ] && sfcb_registered | sed 's/ .*//'
}

register_sfcb() {
    sfcb_tools || return
    choose_library "$(sfcb_registered)" || {
        say "SFCB: not registered before; nothing was changed"
        return
    }
    sfcb_find_other_computers
    if sfcb_change sfcb_register_all; then
        registered_with=$registered_with,sfcb
        report_change "SFCB: registered $library"
        sfcb_check_library
        sfcb_restart
    else
        failed "SFCB: not registered"
    fi
}

unregister_sfcb() {
    sfcb_tools || return
    sfcb_find_other_computers
    if sfcb_change sfcb_unstage_all; then
        report_change "SFCB: unregistered"
        sfcb_restart
    else
        failed "SFCB: not unregistered"
    fi
}

list_sfcb() {
    sfcb_find_directory
    if [ ! -r "$sfcb_stanza_file" ]; then
        failed "SFCB: $sfcb_stanza_file cannot be read; if SFCB uses another directory, name it with --sfcb-directory"
        return
    fi
    lines=$(sfcb_registered | sed 's/^/SFCB: /; s/ \([^ ]*\)$/ by \1/')
    echo "${lines:-SFCB: nothing is registered}"
}
