# shellcheck shell=bash
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# How ./dev speaks, ends, waits its turn and shows that something goes on.

# A mistake of the user gets one line.
die() {
    echo "dev: $1" >&2
    exit "${2:-1}"
}

# say TEXT: progress goes to stderr, so that stdout holds a command's result alone.
say() {
    echo "dev: $1" >&2
}

# The process group of a step that must not be broken off.
undisturbed_group=

on_signal() {
    trap '' INT TERM HUP QUIT
    if [ -n "$undisturbed_group" ]; then
        say "ending as soon as the package manager has finished"
        wait "$undisturbed_group" || true
    fi
    exit 130
}

# undisturbed COMMAND...: in a process group of its own, which a terminal's Ctrl-C does not reach.
undisturbed() {
    local code=0
    set -m
    "$@" &
    undisturbed_group=$!
    set +m
    wait "$undisturbed_group" || code=$?
    undisturbed_group=
    return "$code"
}

# own_file FILE: ends the command unless the file can be written.
own_file() {
    if ! mkdir -p "$(dirname "$1")" 2>/dev/null || ! { : >>"$1"; } 2>/dev/null; then
        die "cannot write $1"
    fi
}

# show_latest: of the lines on stdin, the latest one is on view, in the place of the one before.
show_latest() {
    local line
    while IFS= read -r line; do printf '\r\e[K%.*s' 79 "$line"; done
    printf '\r\e[K'
}

# logged FILE COMMAND...: the command's output goes to the file, and on a terminal shows what goes on.
logged() {
    if [ -t 2 ]; then
        "${@:2}" </dev/null 2>&1 | tee "$1" | show_latest >&2
    else
        "${@:2}" </dev/null >"$1" 2>&1
    fi
}

# take_turn FILE TEXT: waits, and says why, until nobody else has taken the file's turn. One at a time.
take_turn() {
    own_file "$1"
    exec {turn}<>"$1"
    flock -n "$turn" && return
    say "$2: waiting for it to end"
    flock "$turn"
}

end_turn() {
    exec {turn}>&-
}
