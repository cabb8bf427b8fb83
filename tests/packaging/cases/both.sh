# Both object managers, no object manager, and common options. Sourced by register-test.
# shellcheck shell=bash disable=SC2034,SC2154 # the variables are those of machine.sh

begin "Registers with both object managers, or with a chosen one"
machine "${sfcb[@]}" "${pegasus[@]}"
register register
ends_with 0
provider_register 6 LeaseAndWarrantyGate
module LeaseAndWarranty LeaseAndWarrantyGate
says "run only one of the two object managers"
register --manager pegasus register
says_nothing_of "run only one"
register --manager pegasus unregister
ends_with 0
called_nothing_like '^sfcb'

begin "A failing object manager does not prevent unregistering with the other"
touch "$STAND_IN/stopped"
register unregister
ends_with 1
says "SFCB: unregistered"

begin "Computers under their former name stay registered until the agent is upgraded, and are then replaced"
machine "${sfcb[@]}" "${pegasus[@]}"
former_computers() {
    register register
    mv "$work/prefix/lib/libOstrelComputerSystemProvider.so" "$work/prefix/lib/libComputerSystemProvider.so"
    echo ComputerSystemProvider >"$STAND_IN/modules/OstrelComputerSystem"
    rm "$STAND_IN/sfcb/stage/regs/OstrelComputerSystemProvider.reg"
    sed 's/OstrelComputer/Computer/' "$root/$data/OstrelComputerSystemProvider.reg" \
        >"$STAND_IN/sfcb/stage/regs/ComputerSystemProvider.reg"
    sfcbrepos_of_stage
}
former_computers
register --only-registered register
ends_with 0
says "the agent is an older version"
provider_register 1 ComputerSystemProvider
provider_register 6 LeaseAndWarrantyGate
module OstrelComputerSystem ComputerSystemProvider
module LeaseAndWarranty LeaseAndWarrantyGate
touch "$STAND_IN/refused/LeaseAndWarrantyProvider"
register --manager pegasus --provider bare register
ends_with 1
module OstrelComputerSystem ComputerSystemProvider
module LeaseAndWarranty LeaseAndWarrantyGate
mv "$work/prefix/lib/libComputerSystemProvider.so" "$work/prefix/lib/libOstrelComputerSystemProvider.so"
register --only-registered register
ends_with 0
says_nothing_of "older version"
provider_register 0 ComputerSystemProvider
provider_register 1 OstrelComputerSystemProvider
module OstrelComputerSystem OstrelComputerSystemProvider
former_computers
register unregister
ends_with 0
provider_register 0 ComputerSystemProvider
[ -z "$(ls "$STAND_IN/modules")" ] || complain "a module is still registered"

begin "Fails with status 3 without an object manager"
machine
register register
ends_with 3
says "no object manager is installed"
machine "${sfcb[@]}"
register --manager pegasus register
ends_with 3

begin "Works in any directory: with MOF files, deleted or unreadable"
for directory in "with MOF files" deleted unreadable; do
    machine "${sfcb[@]}" "${pegasus[@]}" wbemcli
    mkdir "$work/directory"
    cd "$work/directory" || exit
    case $directory in
    "with MOF files") cp "$root/$data"/*.mof . && touch qualifiers.mof ;;
    deleted) rmdir "$work/directory" ;;
    unreadable) chmod 0 "$work/directory" ;;
    esac
    for command in register verify list unregister; do
        register $command
        ends_with 0
    done
    cd "$here" || exit
done

begin "Relative paths in options are relative to the caller's directory"
machine "${sfcb[@]}"
sfcb_installation "$work/elsewhere/sfcb"
echo "providerDirs: $work/prefix/lib" >"$work/elsewhere/sfcb.cfg"
cd "$work/elsewhere" || exit
LEASE_WARRANTY_LOCK=lock register --sfcb-directory sfcb --sfcb-config sfcb.cfg register
cd "$here" || exit
ends_with 0
says_nothing_of "providerDirs"
[ -e "$work/elsewhere/lock" ] || complain "the lock is elsewhere"
called "sfcbrepos -f -s $work/elsewhere/sfcb/stage -r $work/elsewhere/sfcb/registration"
grep -q LeaseAndWarrantyGate "$work/elsewhere/sfcb/registration/providerRegister" || complain "not registered there"

begin "A dry run shows the commands and runs none"
machine "${sfcb[@]}" "${pegasus[@]}"
for command in register unregister; do
    sfcb_files >"$work/before"
    register --dry-run $command
    ends_with 0
    says "would run: sfcbrepos -f"
    says_nothing_of "registered"
    says_nothing_of "takes effect"
    says_nothing_of "run only one"
    called_nothing_like '^sfcb|^cimmof|-r |^cimcli dc'
    sfcb_is_as_in "$work/before"
    register register
done
register --dry-run register
says "would run: cimmof -n root/PG_InterOp"

begin "Two runs cannot change registrations concurrently"
machine "${sfcb[@]}"
exec 3>"$LEASE_WARRANTY_LOCK"
flock 3
register --time-limit 0.1 register
ends_with 1
says "waiting for another run to end"
says "nothing was changed"
called_nothing_like .
register list
ends_with 0
says_nothing_of "waiting"
register --dry-run register
ends_with 0
flock -u 3
register register
ends_with 0
says_nothing_of "waiting"
exec 3>&-
provider_register 6 LeaseAndWarrantyGate
ln -sf /nowhere/lock "$LEASE_WARRANTY_LOCK"
register register
ends_with 0

begin "Closing the output does not interrupt the work, neither of the program nor of the object managers' commands"
for streams in output both; do
    machine "${sfcb[@]}" "${pegasus[@]}"
    register register --provider bare
    touch "$STAND_IN/talkative"
    for command in "register --dry-run" "register --provider gate" unregister; do
        exec 3> >(exit 0)
        wait $!
        if [ $streams = both ]; then exec 4>&3; else exec 4>"$work/output"; fi
        status=0
        # shellcheck disable=SC2086 # several words
        command_itself $command >&3 2>&4 || status=$?
        exec 3>&- 4>&-
        [ $streams = output ] || echo "no output" >"$work/output"
        ends_with 0
        says_nothing_of "error"
        [ "$command" != "register --dry-run" ] || continue
        provider_register 0 LeaseAndWarrantyProvider
        if [ "$command" = unregister ]; then
            provider_register 0 LeaseAndWarrantyGate
            [ -z "$(ls "$STAND_IN/modules")" ] || complain "a module is still registered"
        else
            provider_register 6 LeaseAndWarrantyGate
            module LeaseAndWarranty LeaseAndWarrantyGate
        fi
        [ -z "$(find "$STAND_IN/sfcb" -name 'before-*')" ] || complain "copies are left"
    done
done

begin "Prints the output of the commands, that of a failed command on the error output"
machine "${sfcb[@]}"
touch "$STAND_IN/talkative"
command_itself register >"$work/output" 2>"$work/errors" || complain "fails"
says "sfcbstage: going on"
says "sfcbrepos: warning"
echo broken >"$work/prefix/$data/VELKO_Lease.mof"
if command_itself register >"$work/output" 2>"$work/errors"; then complain "does not fail"; fi
cp "$work/errors" "$work/output"
says "Failed compiling the MOF files."
says_nothing_of "sfcbstage: going on"

begin "Refuses wrong usage without a change"
for arguments in "" "frobnicate" "register list" "--provider best register" "--provider" "--manager owner list" \
    "--time-limit soon list" "--time-limit 0 list" "--time-limit 0.0 list"; do
    # shellcheck disable=SC2086 # several words
    register $arguments
    ends_with 2
    says "--help"
    called_nothing_like .
done
register --help
ends_with 0
says "Exit status"
register --version
ends_with 0
