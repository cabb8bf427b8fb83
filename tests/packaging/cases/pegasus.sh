# OpenPegasus. Sourced by register-test.
# shellcheck shell=bash disable=SC2034,SC2154 # the variables are those of machine.sh

begin "OpenPegasus: registers classes before providers"
machine "${pegasus[@]}"
register register
ends_with 0
says "OpenPegasus: registered LeaseAndWarrantyGate; it takes effect at once"
in_order '^cimmof -uc -n root/cimv2 [^ ]*/VELKO_ComputerSystem.mof$' \
    '^cimmof -uc -n root/cimv2 [^ ]*/VELKO_AssetIDDetails.mof$' '^cimmof -n root/PG_InterOp .*/pegasus/LeaseAndWarrantyGate.mof' \
    '^cimmof -n root/PG_InterOp .*/pegasus/OstrelComputerSystemProvider.mof'
called_nothing_like '^cimprovider -r'
module LeaseAndWarranty LeaseAndWarrantyGate
module OstrelComputerSystem OstrelComputerSystemProvider

begin "OpenPegasus: removes an old registration before loading a new one"
register --provider bare register
ends_with 0
in_order '^cimprovider -r -m LeaseAndWarranty$' '^cimmof -n root/PG_InterOp .*/pegasus/LeaseAndWarrantyProvider.mof'
module LeaseAndWarranty LeaseAndWarrantyProvider

begin "OpenPegasus: replaces a registration of computers under their former name"
for result in 0 1; do
    machine "${pegasus[@]}"
    register register
    echo ComputerSystemProvider >"$STAND_IN/modules/OstrelComputerSystem"
        [ $result = 0 ] || touch "$STAND_IN/refused/LeaseAndWarrantyProvider"
    register register --provider bare
    ends_with $result
    module OstrelComputerSystem OstrelComputerSystemProvider
done
machine "${pegasus[@]}"
register register
register --provider bare register

begin "OpenPegasus: lists the registrations"
register list
ends_with 0
says "OpenPegasus: module LeaseAndWarranty, provider LeaseAndWarrantyProvider"

begin "OpenPegasus: unregistering removes modules, then classes in the order of their references, and can be repeated"
register unregister
ends_with 0
in_order '^cimprovider -r -m LeaseAndWarranty$' '^cimcli dc -n root/cimv2 VELKO_LeaseSetting' \
    '^cimcli dc -n root/cimv2 VELKO_Lease$'
register unregister
ends_with 0
called_nothing_like '^cimprovider -r|^cimcli dc'
register list
says "OpenPegasus: nothing is registered"

begin "OpenPegasus: keeps the classes without cimcli"
machine cimmof cimprovider
register register
register unregister
ends_with 0
says "the class definitions are kept"

begin "OpenPegasus: reports that the server is stopped"
machine "${pegasus[@]}"
touch "$STAND_IN/stopped"
for command in register unregister list; do
    register $command
    ends_with 1
    says "start cimserver"
done

begin "OpenPegasus: declares the standard qualifiers on request"
machine "${pegasus[@]}"
register --with-qualifiers register
in_order '^cimmof -uc -n root/cimv2 [^ ]*/velko-qualifiers.mof$' '^cimmof -uc -n root/cimv2 [^ ]*/VELKO_ComputerSystem.mof$'

begin "OpenPegasus: keeps the registration if any class is refused"
classes=$(sed -n 's/^#pragma include ("\(.*\).mof")$/\1/p' "$root/$data/classes.mof")
[ "$(wc -w <<<"$classes")" -gt 5 ] || complain "no classes were found"
for class in $classes; do
    machine "${pegasus[@]}"
    register register
    touch "$STAND_IN/refused/$class"
    register register --provider bare
    ends_with 1
    says "OpenPegasus: not registered"
    says "module LeaseAndWarranty, provider LeaseAndWarrantyGate"
    module LeaseAndWarranty LeaseAndWarrantyGate
    called_nothing_like '^cimprovider -r'
done

begin "OpenPegasus: restores the former provider if the new one is refused"
machine "${pegasus[@]}"
register register
touch "$STAND_IN/refused/LeaseAndWarrantyProvider"
register register --provider bare
ends_with 1
says "trying to register LeaseAndWarrantyGate again"
says "module LeaseAndWarranty, provider LeaseAndWarrantyGate"
says "module OstrelComputerSystem, provider OstrelComputerSystemProvider"
module LeaseAndWarranty LeaseAndWarrantyGate

begin "OpenPegasus: restores removed modules if another module cannot be removed"
machine "${pegasus[@]}"
register register
mkdir "$STAND_IN/kept"
touch "$STAND_IN/kept/OstrelComputerSystem"
register register --provider bare
ends_with 1
says "OpenPegasus: not registered"
in_order '^cimprovider -r -m LeaseAndWarranty$' '^cimmof -n root/PG_InterOp .*/LeaseAndWarrantyGate.mof$'
called_nothing_like '^cimmof .*PG_InterOp .*ComputerSystem'
module LeaseAndWarranty LeaseAndWarrantyGate
module OstrelComputerSystem OstrelComputerSystemProvider

begin "OpenPegasus: restores computers that were registered without the other classes"
machine "${pegasus[@]}"
register register
rm "$STAND_IN/modules/LeaseAndWarranty"
touch "$STAND_IN/refused/LeaseAndWarrantyGate"
register register
ends_with 1
module OstrelComputerSystem OstrelComputerSystemProvider

begin "OpenPegasus: lists the registrations after a partial failure"
machine "${pegasus[@]}"
touch "$STAND_IN/refused/OstrelComputerSystemProvider"
register register
ends_with 1
says "not registered completely"
says "module LeaseAndWarranty, provider LeaseAndWarrantyGate"
says_nothing_of "module OstrelComputerSystem"

begin "OpenPegasus: reports a module that cannot be removed because it serves requests"
machine "${pegasus[@]}"
register register --provider bare
touch "$STAND_IN/busy"
for command in "register --provider gate" unregister; do
    # shellcheck disable=SC2086 # several words
    register $command
    ends_with 1
    says "OpenPegasus: clients use LeaseAndWarranty; stop them and try again"
    module LeaseAndWarranty LeaseAndWarrantyProvider
done
rm "$STAND_IN/busy"
register register --provider gate
ends_with 0
says_nothing_of "clients use"
module LeaseAndWarranty LeaseAndWarrantyGate

begin "OpenPegasus: does not load a provider whose module could not be removed"
for calls in 4 5; do # to list them again, to remove one
    machine "${pegasus[@]}"
    register register
    echo $calls >"$STAND_IN/fail/cimprovider"
    register register --provider bare
    ends_with 1
    says "OpenPegasus: not registered"
    called_nothing_like '^cimmof .*PG_InterOp'
done

begin "OpenPegasus: without an option keeps the registered provider, and renewing registers nothing new"
machine "${pegasus[@]}"
register --only-registered register
ends_with 0
says "not registered before"
called_nothing_like '^cimmof|^cimprovider -r'
register --provider bare register
for option in --restart --only-registered; do
    register register $option
    ends_with 0
    called 'cimmof .*/pegasus/LeaseAndWarrantyProvider.mof'
    module LeaseAndWarranty LeaseAndWarrantyProvider
done

begin "OpenPegasus: changes nothing if the registrations cannot be listed, and reports that"
machine "${pegasus[@]}"
register register --provider bare
for calls in 1 2 3; do # listing calls: the first lists the modules, the others the provider of each
    for option in "" --only-registered; do
        echo $calls >"$STAND_IN/fail/cimprovider"
        # shellcheck disable=SC2086 # none or one word
        register register $option
        ends_with 1
        says "OpenPegasus: the server does not list its registrations"
        called_nothing_like '^cimmof|^cimprovider -r'
        module LeaseAndWarranty LeaseAndWarrantyProvider
    done
    echo $calls >"$STAND_IN/fail/cimprovider"
    register list
    ends_with 1
    says "OpenPegasus: the server does not list its registrations"
    says_nothing_of "nothing is registered"
done
rm "$STAND_IN/fail/cimprovider"

begin "OpenPegasus: does not change computers that another agent's provider serves"
machine "${pegasus[@]}"
rm "$work/prefix/lib/libOstrelComputerSystemProvider.so"
mkdir -p "$STAND_IN/classes"
echo "of another agent" >"$STAND_IN/classes/VELKO_ComputerSystem"
echo VELKO_ComputerSystem >"$STAND_IN/served-by-others"
register register
ends_with 0
module LeaseAndWarranty LeaseAndWarrantyGate
called_nothing_like '^cimmof.*ComputerSystem'
register unregister
ends_with 0
called_nothing_like '^cimcli dc .*ComputerSystem'
called 'cimcli dc -n root/cimv2 VELKO_Lease'

begin "OpenPegasus: does not change an existing class of computers without cimcli"
machine cimmof cimprovider
rm "$work/prefix/lib/libOstrelComputerSystemProvider.so"
mkdir -p "$STAND_IN/classes"
echo "of another agent" >"$STAND_IN/classes/VELKO_ComputerSystem"
register register
ends_with 0
says "VELKO_ComputerSystem may be declared already"
grep -q "another agent" "$STAND_IN/classes/VELKO_ComputerSystem" || complain "the class was changed"
module LeaseAndWarranty LeaseAndWarrantyGate

begin "OpenPegasus: declares and deletes the class of computers, which associations refer to, even if no provider serves it"
for client in cimcli none; do
    machine cimmof cimprovider $client
    rm "$work/prefix/lib/libOstrelComputerSystemProvider.so"
    register register
    ends_with 0
    says_nothing_of "may be declared already"
    [ -e "$STAND_IN/classes/VELKO_ComputerSystem" ] || complain "the class is not declared"
    register unregister
    ends_with 0
    [ $client = none ] || [ -z "$(ls "$STAND_IN/classes")" ] || complain "$(ls "$STAND_IN/classes") stays"
done

begin "OpenPegasus: unregisters the computers of a removed agent"
machine "${pegasus[@]}"
register register
rm "$work/prefix/lib/libOstrelComputerSystemProvider.so"
register --only-registered register
ends_with 0
[ "$(ls "$STAND_IN/modules")" = LeaseAndWarranty ] || complain "$(ls "$STAND_IN/modules") are registered"
register unregister
ends_with 0
[ -z "$(ls "$STAND_IN/classes")" ] || complain "$(ls "$STAND_IN/classes") stays"

begin "OpenPegasus: finds the namespace of registrations and creates none"
for place in root/interop interop; do
    machine "${pegasus[@]}"
    echo $place >"$STAND_IN/interop"
    register register
    ends_with 0
    called "cimmof -n $place .*/pegasus/LeaseAndWarrantyGate.mof"
    module OstrelComputerSystem OstrelComputerSystemProvider
    [ ! -e "$STAND_IN/namespaces" ] || complain "a namespace was created" "$STAND_IN/namespaces"
done

begin "OpenPegasus: uses the named namespace of registrations"
echo root/elsewhere >"$STAND_IN/interop"
for option in "" "--interop root/mistyped"; do
    # shellcheck disable=SC2086 # two words
    register register $option
    ends_with 1
    says "has the class PG_ProviderModule"
    called_nothing_like '^cimmof|^cimprovider -r'
done
register register --interop root/elsewhere
ends_with 0
called 'cimmof -n root/elsewhere .*/pegasus/LeaseAndWarrantyGate.mof'
machine cimmof cimprovider
echo root/interop >"$STAND_IN/interop"
register register --interop root/interop
ends_with 0
module LeaseAndWarranty LeaseAndWarrantyGate

begin "OpenPegasus: a signal does not interrupt the change"
for signal in TERM INT HUP QUIT; do
    machine "${pegasus[@]}"
    register register --provider bare
    for command in "cimprovider -r" cimmof "cimcli dc"; do
        echo $signal >"$STAND_IN/end/$command"
    done
    register register --provider gate
    ends_with 0
    module LeaseAndWarranty LeaseAndWarrantyGate
    module OstrelComputerSystem OstrelComputerSystemProvider
    register unregister
    ends_with 0
    [ -z "$(find "$STAND_IN/modules" "$STAND_IN/classes" -type f)" ] || complain "something is still registered"
done

begin "OpenPegasus: terminates a command that hangs"
machine "${pegasus[@]}" timeout
touch "$STAND_IN/hang/cimprovider"
for command in register unregister list; do
    register $command
    ends_with 1
    says "the server does not respond"
done
rm "$STAND_IN/hang/cimprovider"
register register --provider bare
touch "$STAND_IN/hang/cimmof"
register register --provider gate
ends_with 1
called 'timeout -k 10 120 cimmof .*'
says "did not end within 120 seconds: cimmof"
module LeaseAndWarranty LeaseAndWarrantyProvider

begin "OpenPegasus: warns if the provider directories do not contain the library's"
machine "${pegasus[@]}"
register register
says "add $work/prefix/lib to providerDir, with absolute names"
echo "$work/prefix/lib" >"$STAND_IN/providerDir"
register register
says_nothing_of "providerDir"
