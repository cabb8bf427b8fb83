# How the classes are asked for through the object manager.
# shellcheck shell=sh disable=SC2154 # the variables are those of the program that sources this file

# Prints the paths of a class's instances as one of the clients does. Only cimcli needs no --url.
ask() {
    case $client in
    wbemcli) wbemcli ein "$url/$namespace:$1" ;;
    pywbemcli) ask_pywbemcli "$1" ;;
    cimcli) cimcli ni -n "$namespace" "$1" ;;
    esac </dev/null 2>&1
}

# This client takes no name and password in the URL.
ask_pywbemcli() {
    server=$(printf '%s\n' "$url" | sed 's|//[^@/]*@|//|')
    credentials=$(printf '%s\n' "$url" | sed -n 's|^[^/]*//\([^@/]*\)@.*|\1|p')
    set -- --server "$server" ${credentials:+--user "${credentials%%:*}" --password "${credentials#*:}"} \
        instance enumerate "$1" --names-only --namespace "$namespace"
    pywbemcli "$@"
}

# wbemcli says what went wrong in lines of its own.
is_error() {
    printf '%s\n' "$1" | grep -q '^\* wbemcli: '
}

verify_class() {
    if answer=$(ask "$1") && ! is_error "$answer"; then
        echo "$1: served, $(printf '%s\n' "$answer" | grep -c "$1\.") instances"
    else
        printf '%s\n' "$answer" | sed "s/^/$1: /" >&2
        failed "$1 is not served"
    fi
}

verify() {
    for client in wbemcli pywbemcli cimcli none; do
        has "$client" && break
    done
    if [ "$client" = none ]; then
        complain "no client is installed to verify with: wbemcli, pywbemcli or cimcli"
        exit 4
    fi
    for class in $(registered_classes); do
        verify_class "$class"
    done
}
