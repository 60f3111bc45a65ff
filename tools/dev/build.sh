# shellcheck shell=bash
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# How ./dev configures and builds.

# Characters that the build's own languages take for their own, also when they are quoted.
require_usable_path() {
    local character
    for character in '"' ';' '#' '[' \\ $'\n'; do
        [[ $PWD != *"$character"* ]] || die "the path of this folder has a ${character@Q}, with which it \
cannot be built"
    done
}

# configured PRESET: whether its folder was made for this checkout, in this place.
configured() {
    [ -f "build/$1/build.ninja" ] &&
        grep -qxF "CMAKE_HOME_DIRECTORY:INTERNAL=$PWD" "build/$1/CMakeCache.txt"
}

configure_and_build() {
    # Once there, ninja itself calls cmake again when it must.
    configured "$1" || { rm -rf "build/$1" && cmake --preset "$1"; } || return
    cmake --build "build/$1" -- "${@:2}"
}

# build PRESET [TARGET]...: builds the targets, or everything, as CMakePresets.json has it, in
# build/PRESET; the log's end is shown when that fails.
build() {
    local log=build/$1.log
    require_usable_path
    own_file "$log"
    take_turn "build/$1.lock" "another ./dev builds in build/$1"
    if ! logged "$log" configure_and_build "$@"; then
        tail -n 40 "$log" >&2
        die "the build failed: see $log"
    fi
    end_turn
}
