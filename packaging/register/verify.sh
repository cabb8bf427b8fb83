# Checks through the object manager that the classes are served.
# shellcheck shell=sh disable=SC2154 # the program that sources this file sets the variables

# Classes that always have an instance if they are served. For a class without a provider, object managers return
# success without instances.
never_empty="VELKO_OstrelAgent VELKO_AssetIDDetails VELKO_ComputerSystem"

# Splits the URL into the options of clients: scheme, server (host and port), user, password.
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

# Prints the instance paths of a class with the installed client.
ask() {
    "ask_$client" "$1" 2>&1
}

ask_wbemcli() {
    set -- "$url/$namespace:$1"
    [ "$no_verify" = no ] || set -- -noverify "$@"
    limited wbemcli ein "$@"
}

ask_pywbemcli() {
    set -- instance enumerate "$1" --names-only --namespace "$namespace"
    [ -z "$user" ] || set -- --user "$user" --password "$password" "$@"
    [ "$no_verify" = no ] || set -- --no-verify "$@"
    limited pywbemcli --server "$scheme://$server" "$@"
}

# cimcli accepts any certificate. Its default connection, used without --url, is best for a server on this machine.
ask_cimcli() {
    set -- -n "$namespace" "$1"
    [ -z "$user" ] || set -- -u "$user" -p "$password" "$@"
    [ "$scheme" != https ] || set -- -s "$@"
    [ -z "$url_given" ] || set -- -l "$server" "$@"
    limited cimcli ni "$@"
}

# wbemcli reports errors in lines with this prefix.
is_error() {
    printf '%s\n' "$1" | grep -q '^\* wbemcli: '
}

is_local() {
    case $server in
    localhost | localhost:* | 127.* | '[::1]'*) ;;
    *) return 1 ;;
    esac
}

# Prints the classes that are registered on this machine. Fails if they are unknown. If both object managers are
# installed, it is unknown which one responds, so the classes are known only if both have the same classes.
registered_classes() {
    is_local || return 1
    with_sfcb='' with_pegasus=''
    [ "$sfcb" = no ] || with_sfcb=$(sfcb_registered_classes) || return 1
    [ "$pegasus" = no ] || with_pegasus=$(pegasus_registered_classes) || return 1
    case $sfcb$pegasus in
    yesno) echo "$with_sfcb" ;;
    noyes) echo "$with_pegasus" ;;
    yesyes) same_words "$with_sfcb" "$with_pegasus" && echo "$with_sfcb" ;;
    *) return 1 ;;
    esac
}

same_words() { # LINES LINES
    [ "$(printf '%s\n' "$1" | sort -u)" = "$(printf '%s\n' "$2" | sort -u)" ]
}

has_word() { # WORDS WORD
    printf '%s\n' "$1" | grep -qwF -- "$2"
}

verify_class() { # CLASS
    answer=$(ask "$1")
    ended=$?
    if [ $ended -ne 0 ] || is_error "$answer"; then
        case $ended in 124 | 137) answer="${answer:+$answer }$(failure_of $ended): $client" ;; esac
        printf '%s\n' "$answer" | sed "s/^/$1: /" >&2
        failed "$1 is not served"
        return
    fi
    count=$(printf '%s\n' "$answer" | grep -ci "$1\.")
    if [ "$count" -gt 0 ]; then
        echo "$1: served, $count instances"
    elif has_word "$never_empty" "$1"; then
        failed "$1 is not served: the response is empty, but this class always has an instance"
    elif [ "$registered_here" = unknown ]; then
        echo "$1: no instances; it is unknown whether the class is served"
    elif has_word "$registered_here" "$1"; then
        echo "$1: served, 0 instances"
    else
        failed "$1 is not served: the response is empty, and the class is not registered"
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
    registered_here=$(registered_classes) || registered_here=unknown
    for class in $(all_classes); do
        verify_class "$class"
    done
    [ "$sfcb" = no ] || ! is_local || sfcb_check_trimming
    say "to test every operation of the classes, run $data/manager-test URL"
}
