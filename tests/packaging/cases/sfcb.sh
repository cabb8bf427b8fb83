# SFCB. Sourced by register-test.
# shellcheck shell=bash disable=SC2034,SC2154 # the variables are those of machine.sh

begin "SFCB: registers the gate and the computers, and rebuilds the repository last"
machine "${sfcb[@]}"
register register
ends_with 0
says "SFCB: registered LeaseAndWarrantyGate"
says "running: sfcbrepos -f"
says "takes effect when it is restarted"
in_order '^sfcbunstage' '^sfcbstage -r .*/gate/LeaseAndWarrantyGate.reg .*/VELKO_Lease.mof .*/VELKO_AssetIDDetails.mof' \
    '^sfcbstage -r .*/OstrelComputerSystemProvider.reg' '^sfcbrepos -f$'
provider_register 6 LeaseAndWarrantyGate
provider_register 1 OstrelComputerSystemProvider
[ "$(find "$STAND_IN/sfcb/stage/mofs" -name 'VELKO_*.mof' | wc -l)" -eq 7 ] || complain "not every class is staged"

begin "SFCB: the bare provider replaces the gate"
register --provider bare register
ends_with 0
provider_register 6 LeaseAndWarrantyProvider
provider_register 0 LeaseAndWarrantyGate

begin "SFCB: without an option keeps the registered provider"
register register
ends_with 0
provider_register 6 LeaseAndWarrantyProvider

begin "SFCB: registering again changes nothing"
cp "$STAND_IN/sfcb/registration/providerRegister" "$work/before"
register register --provider bare
ends_with 0
cmp "$work/before" "$STAND_IN/sfcb/registration/providerRegister" || complain "the registration has changed"

begin "SFCB: lists the registrations"
register list
ends_with 0
says "SFCB: VELKO_Lease by LeaseAndWarrantyProvider"
says "SFCB: VELKO_ComputerSystem by OstrelComputerSystemProvider"

begin "SFCB: unregistering removes everything, and can be repeated"
register unregister
ends_with 0
says "SFCB: unregistered"
provider_register 0 LeaseAndWarrantyProvider
[ "$(find "$STAND_IN/sfcb/stage" -type f)" = "$STAND_IN/sfcb/stage/default.reg" ] || complain "something is still staged"
[ -z "$(find "$STAND_IN/sfcb" -name 'before-*')" ] || complain "copies are left"
register unregister
ends_with 0
register list
says "SFCB: nothing is registered"

begin "SFCB: passes another directory to the commands"
sfcb_installation "$work/elsewhere"
register --sfcb-directory "$work/elsewhere" register
ends_with 0
called "sfcbrepos -f -s $work/elsewhere/stage -r $work/elsewhere/registration"
grep -q LeaseAndWarrantyGate "$work/elsewhere/registration/providerRegister" || complain "not registered there"

begin "SFCB: restores all files if staging or compiling fails, including static instances and the old registration"
for obstacle in staging compiling; do
    machine "${sfcb[@]}"
    printf '[Other]\n   provider: Other\n#\n' >"$STAND_IN/sfcb/stage/regs/Other.reg"
    register register --provider bare
    ends_with 0
    case $obstacle in
    staging) echo 0 >"$STAND_IN/fail/sfcbstage" ;;
    compiling) echo "broken" >"$STAND_IN/sfcb/stage/mofs/root/cimv2/Other.mof" ;;
    esac
    sfcb_files >"$work/before"
    for command in "register --provider gate" unregister; do
        [ "$obstacle $command" != "staging unregister" ] || continue
        # shellcheck disable=SC2086 # several words
        register $command
        ends_with 1
        says "SFCB: not ${command%% *}ed"
        says "the previous registration was restored"
        sfcb_is_as_in "$work/before"
        [ -z "$(find "$STAND_IN/sfcb" -name 'before-*')" ] || complain "copies are left"
    done
    provider_register 6 LeaseAndWarrantyProvider
done

begin "SFCB: directories that are links stay links when they are restored"
machine "${sfcb[@]}"
mkdir "$work/elsewhere"
for directory in stage registration; do
    mv "$STAND_IN/sfcb/$directory" "$work/elsewhere/"
    ln -s "../../elsewhere/$directory" "$STAND_IN/sfcb/$directory"
done
mkdir "$work/elsewhere/stage/mofs"
echo "broken" >"$work/elsewhere/stage/mofs/Other.mof"
cp -R "$work/elsewhere" "$work/before"
register register
ends_with 1
says "the previous registration was restored"
diff -r "$work/before" "$work/elsewhere" >"$work/output" || complain "the directories are not as they were"
for directory in stage registration; do
    [ "$(readlink "$STAND_IN/sfcb/$directory")" = "../../elsewhere/$directory" ] || complain "$directory is not a link anymore"
done
[ -z "$(find "$STAND_IN/sfcb" -name 'before-*')" ] || complain "copies are left"

begin "SFCB: reports the location of files that cannot be restored"
machine "${sfcb[@]}" mv
echo "broken" >"$STAND_IN/sfcb/stage/Other.mof"
mkdir -p "$STAND_IN/sfcb/stage/mofs"
echo "broken" >"$STAND_IN/sfcb/stage/mofs/Other.mof"
echo 1 >"$STAND_IN/fail/mv"
register register
ends_with 1
says "could not be restored; it is in $STAND_IN/sfcb/before-"
says_nothing_of "was restored"
grep -q "static instance" "$STAND_IN"/sfcb/before-*/registration/repository/instances || complain "the copy is missing"

begin "SFCB: changes nothing if the copies cannot be made"
machine "${sfcb[@]}" cp
echo 0 >"$STAND_IN/fail/cp"
sfcb_files >"$work/before"
register register
ends_with 1
says "nothing was changed"
called_nothing_like '^sfcb'
sfcb_is_as_in "$work/before"

begin "SFCB: a signal before the end restores all files"
for command in cp sfcbunstage sfcbstage sfcbrepos "sfcbstage QUIT" "sfcbstage INT" "sfcbstage HUP"; do
    signal=${command#* }
    command=${command% *}
    machine "${sfcb[@]}" cp
    register register --provider bare
    sfcb_files >"$work/before"
    [ "$signal" != "$command" ] || signal=TERM
    echo "$signal" >"$STAND_IN/end/$command"
    register register --provider gate
    ends_with 1
    called "$command .*"
    if [ "$command" = cp ]; then says "nothing was changed"; else says "was restored"; fi
    sfcb_is_as_in "$work/before"
    [ -z "$(find "$STAND_IN/sfcb" -name 'before-*')" ] || complain "copies are left"
done

begin "SFCB: a signal does not interrupt restoring or deleting the copies"
machine "${sfcb[@]}" mv
register register --provider bare
mkdir -p "$STAND_IN/sfcb/stage/mofs"
echo "broken" >"$STAND_IN/sfcb/stage/mofs/Other.mof"
sfcb_files >"$work/before"
echo TERM >"$STAND_IN/end/mv"
register register --provider gate
ends_with 1
says "was restored"
sfcb_is_as_in "$work/before"
machine "${sfcb[@]}" rm
echo TERM >"$STAND_IN/end/rm"
register register
ends_with 0
provider_register 6 LeaseAndWarrantyGate
[ -z "$(find "$STAND_IN/sfcb" -name 'before-*')" ] || complain "copies are left"

begin "SFCB: terminates a command that hangs, and restores all files"
machine "${sfcb[@]}" timeout
register register --provider bare
sfcb_files >"$work/before"
touch "$STAND_IN/hang/sfcbrepos"
register --time-limit 90 --provider gate register
ends_with 1
called 'timeout -k 10 90 sfcbrepos -f'
says "did not end within 90 seconds: sfcbrepos -f"
says "was restored"
sfcb_is_as_in "$work/before"

begin "SFCB: reports a staged file that its command does not delete in spite of success"
machine "${sfcb[@]}"
mkdir -p "$STAND_IN/sfcb/stage/regs/LeaseAndWarrantyProvider.reg/entry"
register register
ends_with 1
says "stage/regs/LeaseAndWarrantyProvider.reg could not be deleted"

begin "SFCB: names a missing command"
machine sfcbrepos sfcbstage
register register
ends_with 1
says "without the required command sfcbunstage"
called_nothing_like .

begin "SFCB: renewing registers only if registered before, and keeps the provider"
machine "${sfcb[@]}"
register --only-registered register
ends_with 0
says "not registered before"
called_nothing_like .
register --provider bare register
rm "$STAND_IN/sfcb/stage/mofs/root/cimv2/VELKO_Lease.mof"
register --only-registered register
ends_with 0
provider_register 6 LeaseAndWarrantyProvider
[ -e "$STAND_IN/sfcb/stage/mofs/root/cimv2/VELKO_Lease.mof" ] || complain "the classes are not renewed"

begin "SFCB: restarts a running server on request, and otherwise names its unit"
machine "${sfcb[@]}" systemctl
echo sblim-sfcb >"$STAND_IN/unit"
register register
ends_with 0
says "systemctl restart sblim-sfcb"
called_nothing_like '^systemctl restart'
register register --restart
ends_with 0
called "systemctl restart sblim-sfcb"

begin "SFCB: warns if the configuration does not contain the library's directory"
echo "providerDirs: /usr/lib /elsewhere" >"$work/sfcb.cfg"
register register
ends_with 0
says "add $work/prefix/lib to the line providerDirs in $work/sfcb.cfg"
echo "providerDirs: /usr/lib $work/prefix/lib" >"$work/sfcb.cfg"
register register
says_nothing_of "providerDirs"

begin "SFCB: warns if the configuration cannot be read"
rm "$work/sfcb.cfg"
register register
ends_with 0
says "$work/sfcb.cfg cannot be read; its line providerDirs must contain $work/prefix/lib"

begin "SFCB: warns if the configuration names no directories and the library is outside of the default directories"
echo "httpPort: 5988" >"$work/sfcb.cfg"
register register
ends_with 0
says "has no line providerDirs with $work/prefix/lib"
# shellcheck disable=SC2016 # the command expands it
sed -i 's|^libraries=\$(readlink.*|libraries=/usr/lib/x86_64-linux-gnu/cmpi|' "$work/prefix/sbin/lease-warranty-register"
register register
ends_with 0
says_nothing_of "providerDirs"

begin "SFCB: does not change computers that another agent's provider serves"
machine "${sfcb[@]}" wbemcli
rm "$work/prefix/lib/libOstrelComputerSystemProvider.so"
mkdir -p "$STAND_IN/sfcb/stage/mofs/root/cimv2"
printf '[VELKO_ComputerSystem]\n   provider: Other\n#\n' >"$STAND_IN/sfcb/stage/regs/Other.reg"
echo "// of another agent" >"$STAND_IN/sfcb/stage/mofs/root/cimv2/VELKO_ComputerSystem.mof"
register register
ends_with 0
provider_register 0 OstrelComputerSystemProvider
provider_register 6 LeaseAndWarrantyGate
register verify
ends_with 0
says "VELKO_Lease: served"
says "VELKO_ComputerSystem: served"
echo VELKO_ComputerSystem >"$STAND_IN/broken"
register verify
ends_with 1
says "VELKO_ComputerSystem is not served"
register unregister
ends_with 0
called_nothing_like 'ComputerSystem'
grep -q "another agent" "$STAND_IN/sfcb/stage/mofs/root/cimv2/VELKO_ComputerSystem.mof" || complain "its class was deleted"
provider_register 1 Other

begin "SFCB: declares the class of computers, which associations refer to, even if no provider serves it"
rm "$STAND_IN/sfcb/stage/regs/Other.reg"
register register
ends_with 0
grep -q "^class VELKO_ComputerSystem" "$STAND_IN/sfcb/stage/mofs/root/cimv2/VELKO_ComputerSystem.mof" ||
    complain "the class is not staged"
provider_register 0 OstrelComputerSystemProvider

begin "SFCB: unregisters the computers of a removed agent"
machine "${sfcb[@]}"
register register
provider_register 1 OstrelComputerSystemProvider
rm "$work/prefix/lib/libOstrelComputerSystemProvider.so"
register --only-registered register
ends_with 0
provider_register 0 OstrelComputerSystemProvider
provider_register 6 LeaseAndWarrantyGate

# Stages the registration of an earlier version; other software may have a registration with that name.
former_computers() { # GROUP
    mkdir -p "$STAND_IN/sfcb/stage/regs"
    sed "s/OstrelComputerSystemProvider/ComputerSystemProvider/; s/group: .*/group: $1/" \
        "$work/prefix/$data/OstrelComputerSystemProvider.reg" >"$STAND_IN/sfcb/stage/regs/ComputerSystemProvider.reg"
}

begin "SFCB: unregisters computers under their former name"
for command in register unregister; do
    for library in libOstrelComputerSystemProvider.so none; do
        machine "${sfcb[@]}"
        [ $library != none ] || rm "$work"/prefix/lib/libOstrelComputerSystemProvider.so
        former_computers LeaseAndWarranty
        sfcbrepos_of_stage
        provider_register 1 ComputerSystemProvider
        register --dry-run $command
        says "would run: sfcbunstage -r ComputerSystemProvider.reg"
        register $command
        ends_with 0
        provider_register 0 ComputerSystemProvider
        [ "$command $library" = "register none" ] || [ $command = unregister ] ||
            provider_register 1 OstrelComputerSystemProvider
        [ $command = unregister ] || [ -e "$STAND_IN/sfcb/stage/mofs/root/cimv2/VELKO_ComputerSystem.mof" ] ||
            complain "the class is not staged"
    done
done

begin "SFCB: keeps a registration of other software with that name"
machine "${sfcb[@]}"
former_computers Other
for command in register unregister; do
    register $command
    ends_with 0
    provider_register 1 ComputerSystemProvider
    called_nothing_like ' ComputerSystemProvider.reg'
done
