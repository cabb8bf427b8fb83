# How the classes are asked for through the object manager.
# shellcheck shell=sh disable=SC2154 # the variables are those of the program that sources this file

# Sets the parts of the URL that clients take as options: scheme, server (host and port), user, password.
split_url() {
    scheme=${url%%://*} server=${url#*://} user='' password=''
    case $server in
    *@*)
        user=${server%@*} server=${server##*@}
        case $user in
        *:*) password=${user#*:} user=${user%%:*} ;;
        esac
        ;;
    esac
}

# Prints the paths of a class's instances as one of the clients does.
ask() {
    "ask_$client" "$1" </dev/null 2>&1
}

ask_wbemcli() {
    set -- "$url/$namespace:$1"
    [ "$no_verify" = no ] || set -- -noverify "$@"
    wbemcli ein "$@"
}

ask_pywbemcli() {
    set -- instance enumerate "$1" --names-only --namespace "$namespace"
    [ -z "$user" ] || set -- --user "$user" --password "$password" "$@"
    [ "$no_verify" = no ] || set -- --no-verify "$@"
    pywbemcli --server "$scheme://$server" "$@"
}

# This client takes any certificate, and finds a server of this machine best when it is told nothing.
ask_cimcli() {
    set -- -n "$namespace" "$1"
    [ -z "$user" ] || set -- -u "$user" -p "$password" "$@"
    [ "$scheme" != https ] || set -- -s "$@"
    [ -z "$url_given" ] || set -- -l "$server" "$@"
    cimcli ni "$@"
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
    split_url
    for class in $(all_classes); do
        verify_class "$class"
    done
}
