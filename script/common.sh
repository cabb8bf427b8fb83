# Functions that the scripts share. Source this file; it changes to the project's directory.
# shellcheck shell=bash

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
cd "$root" || exit 1

heading() {
    printf '\n=== %s\n' "$*"
}

fail() {
    printf '%s: %s\n' "${0##*/}" "$*" >&2
    exit 1
}

# Prints the comment at the head of the running script, which is its description.
usage() {
    sed -n '2,/^[^#]/{s/^# \{0,1\}//p}' "$0"
}

# For scripts without arguments: prints the help, or refuses the arguments.
refuse_arguments() {
    [ $# -eq 0 ] && return
    case $1 in
    -h | --help)
        usage
        exit 0
        ;;
    esac
    printf '%s: unknown argument: %s\nTry %s --help.\n' "${0##*/}" "$1" "$0" >&2
    exit 2
}

# missing_packages STAGE...: prints the packages of the stages that are not installed, one per line.
missing_packages() {
    local stage package
    for stage in "$@"; do
        awk -v stage="$stage" '$1 !~ /^#/ && $2 == stage { print $1 }' "$root/script/packages"
    done | sort -u | while read -r package; do
        dpkg-query -W -f='${db:Status-Status}\n' "$package" 2>/dev/null | grep -qx installed || echo "$package"
    done
}

as_root() {
    if [ "$(id -u)" -eq 0 ]; then
        "$@"
    elif command -v sudo >/dev/null && { [ -t 0 ] || sudo -n true 2>/dev/null; }; then
        sudo "$@"
    else
        return 1
    fi
}

# install_packages STAGE...: installs the missing packages of the stages. Needs root only if a package is missing.
install_packages() {
    local packages
    command -v dpkg-query >/dev/null || fail "this system has no dpkg; script/packages lists what the build needs"
    mapfile -t packages < <(missing_packages "$@")
    [ "${#packages[@]}" -gt 0 ] || return 0
    heading "Installing ${packages[*]}"
    if ! as_root true; then
        fail "packages are missing, and installing them needs root or sudo. Install them by hand:
    apt-get install --no-install-recommends ${packages[*]}"
    fi
    as_root apt-get update -qq
    as_root env DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends "${packages[@]}"
}

# build PRESET [TARGET...]: configures a preset with the options in `build_options`, and builds the targets, by default
# all.
build_options=()
build() {
    local preset=$1
    shift
    heading "Building preset $preset"
    cmake --preset "$preset" "${build_options[@]}"
    cmake --build --preset "$preset" --parallel "$(nproc)" ${1:+--target "$@"}
}

# Prints the paths of the project's C and C++ files, each terminated by a null character.
source_files() {
    git ls-files -z -- '*.h' '*.hpp' '*.c' '*.cpp'
}

# Prints the paths of the project's shell scripts in the same form.
shell_scripts() {
    # git grep skips links to folders, which awk cannot read.
    git grep -lzE '^#!.*sh$|shellcheck shell=' | xargs -0 awk '
        (FNR == 1 && /^#!.*sh$/) || (FNR == 2 && /shellcheck shell=/) { printf "%s%c", FILENAME, 0 }
        FNR == 2 { nextfile }'
}

# test_programs PRESET [WRAPPER...]: runs the test programs of a built preset under the wrapper. A program with many tests
# is divided into shards, one process each. script/test uses a process per test, which takes too long if processes start
# slowly.
test_programs() {
    local preset=$1 directory=build/programs-$1
    shift
    mkdir -p "$directory"
    ctest --preset "$preset" --show-only=json-v1 | python3 -c '
import collections, json, sys

build, wrapper = sys.argv[1], sys.argv[2:]
programs = collections.Counter()
for test in json.load(sys.stdin)["tests"]:
    command = tuple(word for word in test["command"] if not word.startswith("--gtest"))
    if build in command[0]:
        programs[command] += 1
for number, (command, tests) in enumerate(programs.most_common(), 1):
    name = command[0].rsplit("/", 1)[1]
    words = " ".join(f"[==[{word}]==]" for word in [*wrapper, *command])
    shards = 1 + tests // 50
    for shard in range(shards):
        print(f"add_test({name}.{number}.{shard} {words})")
        print(f"set_tests_properties({name}.{number}.{shard} PROPERTIES TIMEOUT 3600",
              f"ENVIRONMENT [==[GTEST_TOTAL_SHARDS={shards};GTEST_SHARD_INDEX={shard}]==])")
' "/build/$preset/" "$@" >"$directory/CTestTestfile.cmake"
    ctest --test-dir "$directory" --parallel "$(nproc)" --output-on-failure --no-tests=error
}
