# What tries lease-warranty-register on stand-ins of the object managers' commands: machines that have them, and what is
# expected of it. Sourced, with root, program and data as register-test has them, and here, the directory of this file.
# shellcheck shell=bash disable=SC2034,SC2154 # variables are those of the scripts that source this one

work=$(mktemp -d)
tools=$(mktemp -d)
trap 'rm -rf "$work" "$tools"' EXIT
failures=0

# --- a machine of its own for each case ----------------------------------------------------------------------------

# Object managers and clients that are installed here are not to be found: of the system, there is what the command
# and the stand-ins need.
for tool in awk bash cat cp dirname env find flock grep head ls mkdir mktemp mv readlink rm rmdir sed sh sleep sort tac tail tee \
    timeout touch xargs; do
    ln -s "$(command -v "$tool")" "$tools/"
done

# The commands that a case has besides those of the system.
machine() { # COMMAND...
    rm -rf "${work:?}"/*
    mkdir -p "$work/bin" "$work/stand-in/fail" "$work"/stand-in/{end,hang,refused} "$work/prefix/sbin" "$work/prefix/lib" "$work/prefix/$data"
    sed '/^PATH=/d' "$root/$program" >"$work/prefix/sbin/lease-warranty-register"
    chmod +x "$work/prefix/sbin/lease-warranty-register"
    cp -R "$root/$data/." "$work/prefix/$data/"
    touch "$work/prefix/lib/libLeaseAndWarrantyProvider.so" "$work/prefix/lib/libOstrelComputerSystemProvider.so"
    export STAND_IN=$work/stand-in LEASE_WARRANTY_LOCK=$work/lock
    sfcb_installation "$STAND_IN/sfcb"
    local each
    for each in "$@"; do
        ln -s "$here/stand-ins/stand-in" "$work/bin/$each"
    done
}
# As SFCB is installed: with the registrations that it brings, and a repository with somebody's static instances.
sfcb_installation() { # DIRECTORY
    mkdir -p "$1/stage/regs" "$1/registration/repository"
    printf '[Default]\n   provider: Default\n#\n' | tee "$1/stage/default.reg" >"$1/registration/providerRegister"
    echo "static instance of somebody" >"$1/registration/repository/instances"
}
sfcb=(sfcbstage sfcbunstage sfcbrepos sfcbd)
pegasus=(cimmof cimprovider cimcli cimconfig)

# The command as it is given here; stand-ins know its process.
command_itself() { # ARGUMENT...
    # shellcheck disable=SC2016 # sh expands this
    PATH=$work/bin:$tools sh -c 'echo $$ >"$STAND_IN/program" && exec "$@"' - \
        "$work/prefix/sbin/lease-warranty-register" --sfcb-config "$work/sfcb.cfg" "$@"
}
# Runs the command; its output, both streams, is in $work/output and its status in $status.
register() {
    : >"$STAND_IN/calls"
    status=0
    command_itself "$@" >"$work/output" 2>&1 || status=$?
}

# --- expectations --------------------------------------------------------------------------------------------------

case_name=
begin() {
    case_name=$1
}
complain() {
    printf '%s: %s\n' "$case_name" "$1"
    sed 's/^/    /' "${2:-$work/output}"
    failures=$((failures + 1))
}
ends_with() {
    [ "$status" -eq "$1" ] || complain "status $status, expected $1"
}
says() {
    grep -qF -- "$1" "$work/output" || complain "does not say '$1'"
}
says_nothing_of() {
    ! grep -qF -- "$1" "$work/output" || complain "says '$1'"
}
called() {
    grep -qxE -- "$1" "$STAND_IN/calls" || complain "did not call '$1'" "$STAND_IN/calls"
}
called_nothing_like() {
    ! grep -qE -- "$1" "$STAND_IN/calls" || complain "called '$1'" "$STAND_IN/calls"
}
in_order() { # PATTERN...: calls that follow each other, others between them
    local each line=0
    for each in "$@"; do
        line=$(awk -v from="$line" -v pattern="$each" 'NR > from && $0 ~ pattern { print NR; exit }' "$STAND_IN/calls")
        [ -n "$line" ] || {
            complain "no '$each' in its turn" "$STAND_IN/calls"
            return
        }
    done
}
provider_register() { # COUNT PROVIDER: how many stanzas name the provider
    local count
    count=$(grep -cx "   provider: $2" "$STAND_IN/sfcb/registration/providerRegister") || true
    [ "$count" -eq "$1" ] || complain "$count stanzas of $2, expected $1" "$STAND_IN/sfcb/registration/providerRegister"
}
# Everything below SFCB's directory, but what only tells of runs before.
sfcb_files() {
    (cd "$STAND_IN/sfcb" && find . -type f ! -path '*.previous*' | sort | while read -r file; do
        echo "$file:" && cat "$file"
    done)
}
sfcb_is_as_in() { # FILE
    sfcb_files >"$work/now"
    cmp -s "$1" "$work/now" || complain "SFCB's files are not as they were" "$work/now"
    grep -q "static instance" "$STAND_IN/sfcb/registration/repository/instances" || complain "static instances are lost"
}
# Takes what is staged into effect, as somebody else may do it.
sfcbrepos_of_stage() {
    "$work/bin/sfcbrepos" -f
}
module() { # NAME PROVIDER
    [ "$(cat "$STAND_IN/modules/$1" 2>/dev/null)" = "$2" ] || complain "module $1 is not of $2"
}
