# shellcheck shell=bash
# Functions that the scripts share. They source this file right after `set -euo pipefail`.

cd "$(dirname "${BASH_SOURCE[0]}")/.." || exit
# Where ccache is installed, what was compiled before is not compiled again, in whichever folder.
if command -v ccache >/dev/null; then
    export CMAKE_C_COMPILER_LAUNCHER=ccache CMAKE_CXX_COMPILER_LAUNCHER=ccache
    export CCACHE_BASEDIR=$PWD CCACHE_NOHASHDIR=1
fi
export CMAKE_BUILD_PARALLEL_LEVEL=${CMAKE_BUILD_PARALLEL_LEVEL:-$(nproc)}

# Runs a command and prints its output only if it fails.
quietly() {
    local log
    log=$(mktemp)
    if "$@" >"$log" 2>&1; then
        rm -f "$log"
    else
        local status=$?
        cat "$log" >&2
        rm -f "$log"
        echo "failed (exit status $status): $*" >&2
        return "$status"
    fi
}

# Runs a command as root, without questions.
as_root() {
    if ((EUID == 0)); then
        env DEBIAN_FRONTEND=noninteractive "$@"
    elif command -v sudo >/dev/null; then
        sudo env DEBIAN_FRONTEND=noninteractive "$@"
    else
        echo "installing packages needs root or sudo: $*" >&2
        return 1
    fi
}

# Configures and builds the preset named.
build() {
    # ccache does not look into the list of what a sanitizer leaves out.
    if [[ $1 == ubsan-clang ]]; then
        local -x CCACHE_EXTRAFILES=$PWD/cmake/ubsan-ignore.txt
    fi
    quietly cmake --preset "$1" && quietly cmake --build --preset "$1"
}

# Builds the preset named, runs its tests and prints their summary.
build_and_test() {
    build "$1" || return
    local log=build/$1/ctest.log
    if ! ctest --preset "$1" -j "$CMAKE_BUILD_PARALLEL_LEVEL" >"$log" 2>&1; then
        cat "$log" >&2
        return 1
    fi
    grep 'tests passed' "$log"
}
