# Functions that set up a temporary machine with stand-ins for the object managers' commands, and check its state.
# Source this file with the variables root, program and data as in register-test; `here` is the directory of this file.
# shellcheck shell=bash disable=SC2034,SC2154 # variables are those of the scripts that source this one

work=$(mktemp -d)
tools=$(mktemp -d)
trap 'rm -rf "$work" "$tools"' EXIT
failures=0

# --- a separate machine per case ------------------------------------------------------------------------------------

# Installed object managers and clients must not be found: only the tools that the program and the stand-ins need are
# in the path.
for tool in awk bash cat cp dirname env find flock grep head ls mkdir mktemp mv readlink rm rmdir sed sh sleep sort tac tail tee \
    timeout touch xargs; do
    ln -s "$(command -v "$tool")" "$tools/"
done

# Sets up a machine with these commands besides the system's.
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
# A new installation of SFCB: with its registrations, and a repository with static instances of other software.
sfcb_installation() { # DIRECTORY
    mkdir -p "$1/stage/regs" "$1/registration/repository"
    printf '[Default]\n   provider: Default\n#\n' | tee "$1/stage/default.reg" >"$1/registration/providerRegister"
    echo "static instance of another provider" >"$1/registration/repository/instances"
}
sfcb=(sfcbstage sfcbunstage sfcbrepos sfcbd)
pegasus=(cimmof cimprovider cimcli cimconfig)

# Runs the program and saves its process id for the stand-ins.
command_itself() { # ARGUMENT...
    # shellcheck disable=SC2016 # sh expands this
    PATH=$work/bin:$tools sh -c 'echo $$ >"$STAND_IN/program" && exec "$@"' - \
        "$work/prefix/sbin/lease-warranty-register" --sfcb-config "$work/sfcb.cfg" "$@"
}
# Runs the program, with both output streams in $work/output and its status in $status.
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
    grep -qF -- "$1" "$work/output" || complain "does not print '$1'"
}
says_nothing_of() {
    ! grep -qF -- "$1" "$work/output" || complain "prints '$1'"
}
called() {
    grep -qxE -- "$1" "$STAND_IN/calls" || complain "did not call '$1'" "$STAND_IN/calls"
}
called_nothing_like() {
    ! grep -qE -- "$1" "$STAND_IN/calls" || complain "called '$1'" "$STAND_IN/calls"
}
in_order() { # PATTERN...: calls in this order, with others between them
    local each line=0
    for each in "$@"; do
        line=$(awk -v from="$line" -v pattern="$each" 'NR > from && $0 ~ pattern { print NR; exit }' "$STAND_IN/calls")
        [ -n "$line" ] || {
            complain "no '$each' in this order" "$STAND_IN/calls"
            return
        }
    done
}
provider_register() { # COUNT PROVIDER: the number of stanzas that name the provider
    local count
    count=$(grep -cx "   provider: $2" "$STAND_IN/sfcb/registration/providerRegister") || true
    [ "$count" -eq "$1" ] || complain "$count stanzas of $2, expected $1" "$STAND_IN/sfcb/registration/providerRegister"
}
# Prints every file below SFCB's directory except backups of earlier runs.
sfcb_files() {
    (cd "$STAND_IN/sfcb" && find . -type f ! -path '*.previous*' | sort | while read -r file; do
        echo "$file:" && cat "$file"
    done)
}
sfcb_is_as_in() { # FILE
    sfcb_files >"$work/now"
    cmp -s "$1" "$work/now" || complain "SFCB's files have changed" "$work/now"
    grep -q "static instance" "$STAND_IN/sfcb/registration/repository/instances" || complain "static instances are lost"
}
# Rebuilds the repository from the stage, like another user of SFCB.
sfcbrepos_of_stage() {
    "$work/bin/sfcbrepos" -f
}
module() { # NAME PROVIDER
    [ "$(cat "$STAND_IN/modules/$1" 2>/dev/null)" = "$2" ] || complain "module $1 is not of $2"
}
