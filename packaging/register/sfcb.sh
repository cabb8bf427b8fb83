# How SFCB is found and told. Its commands work on files: the server may be stopped.
# shellcheck shell=sh disable=SC2154 # the variables are those of the program that sources this file

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
}

sfcb_stage() {
    run sfcbstage ${sfcb_directory:+-s "$sfcb_directory/stage"} "$@"
}

sfcb_unstage() {
    run sfcbunstage ${sfcb_directory:+-s "$sfcb_directory/stage"} "$@"
}

# Makes the repository anew from what is staged. The old one is gone even when that fails.
sfcb_rebuild() {
    run sfcbrepos -f ${sfcb_directory:+-s "$sfcb_directory/stage" -r "$sfcb_directory/registration"}
}

sfcb_unstage_all() {
    for each in $all_registrations; do
        sfcb_unstage -r "$each" || return 1
    done
    # shellcheck disable=SC2046 # one word a class: names of classes have no blanks
    sfcb_unstage $(all_classes | sed 's/$/.mof/')
}

sfcb_stage_chosen() {
    # shellcheck disable=SC2046 # one word a file: installation directories have no blanks
    sfcb_stage -r "$registration" $(class_files) || return 1
    if has_computer_system; then
        sfcb_stage -r "$data/ComputerSystemProvider.reg"
    fi
}

# SFCB reads its repository when it starts, and may be stopped meanwhile.
sfcb_restart() {
    for unit in sblim-sfcb sfcb sfcbd; do
        if has systemctl && systemctl --quiet is-active "$unit" 2>/dev/null; then
            if [ "$restart" = yes ]; then
                run systemctl restart "$unit" || failed "SFCB: restart it by hand: until then it serves what it did"
            else
                say "SFCB is running: it takes effect when it is restarted (systemctl restart $unit)"
            fi
            return
        fi
    done
    say "SFCB: if its server is running, it takes effect when it is restarted"
}

# A library is found by its name alone, in the directories that the configuration lists.
sfcb_look_for_library() {
    [ -r "$sfcb_config" ] || return 0
    directories=$(sed -n 's/^[[:space:]]*providerDirs:[[:space:]]*//p' "$sfcb_config")
    case " $directories " in
    *" $libraries "*) ;;
    *) say "SFCB will not find the library: add $libraries to the line providerDirs in $sfcb_config" ;;
    esac
}

register_sfcb() {
    sfcb_tools || return
    if sfcb_unstage_all && sfcb_stage_chosen && sfcb_rebuild; then
        say "SFCB: registered $library"
        sfcb_look_for_library
        sfcb_restart
    else
        # Whatever was wrong with ours, the classes of others are to be there.
        sfcb_unstage_all && sfcb_rebuild
        failed "SFCB: not registered; what was staged has been taken back"
    fi
}

unregister_sfcb() {
    sfcb_tools || return
    if sfcb_unstage_all && sfcb_rebuild; then
        say "SFCB: unregistered"
        sfcb_restart
    else
        failed "SFCB: not unregistered"
    fi
}

list_sfcb() {
    file=${sfcb_directory:-/var/lib/sfcb}/registration/providerRegister
    if [ ! -r "$file" ]; then
        failed "SFCB: $file cannot be read; is there another --sfcb-directory?"
        return
    fi
    awk -v ours=" LeaseAndWarrantyProvider LeaseAndWarrantyGate ComputerSystemProvider " '
        /^[ \t]*\[/ { class = $0; gsub(/[][ \t]/, "", class) }
        tolower($1) == "provider:" && index(ours, " " $2 " ") { print "SFCB: " class " by " $2; found = 1 }
        END { if (!found) print "SFCB: nothing is registered" }' "$file"
}
