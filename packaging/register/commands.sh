# Runs the commands of the object managers, with a time limit and a lock.
# shellcheck shell=sh disable=SC2154 # the program that sources this file sets the variables

has() {
    command -v "$1" >/dev/null 2>&1
}

# Runs a query with the time limit, so that it cannot block a package installation.
limited() {
    if has timeout; then
        timeout -k 10 "$limit" "$@" </dev/null
    else
        "$@" </dev/null
    fi
}

# Shows and runs a command that changes something. Prints the command's output only after the command has ended:
# otherwise, a command that cannot write its output could end in the middle of its work.
run() {
    if [ "$dry_run" = yes ]; then
        show "would run: $*"
        return 0
    fi
    show "running: $*"
    ended=0
    output=$(limited "$@" 2>&1 9>&-) || ended=$?
    if [ "$ended" -eq 0 ]; then
        [ -z "$output" ] || show "$output"
        return 0
    fi
    [ -z "$output" ] || show "$output" >&2
    complain "$(failure_of $ended): $*"
    return 1
}

failure_of() { # STATUS
    case $1 in
    124 | 137) echo "this command did not end within $limit seconds" ;;
    *) echo "this command failed with status $1" ;;
    esac
}

# Takes the lock, since concurrent runs would mistake each other's changes for their own. Continues without the lock if
# the lock file is not writable: such a user normally cannot register either. A user who can register in other
# directories must name another lock file or prevent concurrent runs.
lock() {
    [ "$dry_run" = no ] && has flock && (umask 077 && : >>"$lock_file") 2>/dev/null || return 0
    exec 9>>"$lock_file"
    flock -n 9 && return
    say "waiting for another run to end"
    flock -w "$limit" 9 || {
        complain "another run did not end within $limit seconds; nothing was changed"
        exit 1
    }
}

# Sets the reaction to signals: a command, nothing ('') or the default (-).
on_signal() { # ACTION
    # shellcheck disable=SC2064 # expands the action here
    trap "$1" HUP INT QUIT TERM
}

# Ignores SIGPIPE, so that the work continues if the reader of the output ends. The commands inherit this.
ignore_broken_pipes() {
    trap '' PIPE
}
