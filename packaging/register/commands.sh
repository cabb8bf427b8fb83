# How the commands of the object managers are run: for a limited time, by one run of this program at a time, to the end.
# shellcheck shell=sh disable=SC2154 # the variables are those of the program that sources this file

has() {
    command -v "$1" >/dev/null 2>&1
}

# Runs a command that asks, for no longer than the limit: whoever installs packages waits for it.
limited() {
    if has timeout; then
        timeout -k 10 "$limit" "$@" </dev/null
    else
        "$@" </dev/null
    fi
}

# Runs a command that changes something, and shows it. What it says is taken here and passed on when it has ended: a
# command that wrote to where nobody reads would end in the middle of its work, or fail.
run() {
    if [ "$dry_run" = yes ]; then
        show "would run: $*"
        return 0
    fi
    show "running: $*"
    ended=0
    told=$(limited "$@" 2>&1 9>&-) || ended=$?
    if [ "$ended" -eq 0 ]; then
        [ -z "$told" ] || show "$told"
        return 0
    fi
    [ -z "$told" ] || show "$told" >&2
    complain "$(what_ended $ended): $*"
    return 1
}

what_ended() { # STATUS
    case $1 in
    124 | 137) echo "this command did not end within $limit seconds" ;;
    *) echo "this command failed with status $1" ;;
    esac
}

# Two runs at a time would take each other's changes for their own. Who may not write the lock mostly may not register
# either; who may, with directories of his own, names another lock or sees to it himself.
lock() {
    [ "$dry_run" = no ] && has flock && (umask 077 && : >>"$lock_file") 2>/dev/null || return 0
    exec 9>>"$lock_file"
    flock -n 9 && return
    say "waiting for another run to end"
    flock -w "$limit" 9 || {
        complain "nothing is done, since another run has not ended within $limit seconds"
        exit 1
    }
}

# What is to happen at a signal: a command, nothing ('') or the usual (-).
on_signal() { # ACTION
    # shellcheck disable=SC2064 # it is meant to be taken as it is
    trap "$1" HUP INT QUIT TERM
}

# Who listens no more does not end the work, neither here nor in the commands, which ignore that signal too then.
go_on_unheard() {
    trap '' PIPE
}
