# shellcheck shell=bash
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# The phones of ./dev: the ones that stay up, and those of each other run, which end with it.

# Where the phones live; a test sets it to a place of its own.
readonly PHONES=${BEX_PHONES:-build/phones}
readonly SERVICE=vendor.korvan.bex.wifi@1.0-service
# The phones of this run, the last of them, and the process that this run waits for.
phones=()
phone=
waiting=

chips() {
    local chip names=()
    for chip in simulator/phones/*; do names+=("$(basename "$chip")"); done
    echo "${names[*]}"
}

need_chip() {
    [ -n "${1-}" ] || die "which chip? One of: $(chips)" 2
    [[ $1 != */* && -f "simulator/phones/$1" ]] || die "no phone for the chip '$1': there is $(chips)" 2
}

# remove_phone FOLDER: ends it, if it is up; also what an interrupt has left of one that was not
# finished, which has a hidden name.
remove_phone() {
    local folder
    for folder in "$1" "${1%/*}/.${1##*/}".*; do
        [ -e "$folder" ] || continue
        simulator/phone down "$folder" 2>/dev/null || true
        rm -rf "$folder"
    done
}

end_phones() {
    # Whoever is impatient must not break this off.
    trap '' INT TERM HUP QUIT
    [ -z "$waiting" ] || kill "$waiting" 2>/dev/null || true
    waiting=
    for phone in "${phones[@]}"; do remove_phone "$phone"; done
    phones=()
    trap on_signal INT TERM HUP QUIT
}

# remove_left_phones: those of runs that were killed. Their names end with the run's process.
remove_left_phones() {
    local folder name
    for folder in "$PHONES"/*-[0-9]* "$PHONES"/.*-[0-9]*; do
        [ -e "$folder" ] || continue
        name=${folder##*/}
        name=${name#.}
        name=${name%%.*}
        [ -d "/proc/${name##*-}" ] || remove_phone "$PHONES/$name"
    done
}

# make_phone NAME CHIP [OPTION]...: a new phone in the folder $phone, which ends with this run.
make_phone() {
    mkdir -p "$PHONES"
    remove_left_phones
    trap end_phones EXIT
    phone=$PHONES/$1
    phones+=("$phone")
    remove_phone "$phone"
    simulator/phone create "$2" "$phone" "${@:3}"
}

# start_phone NAME CHIP [OPTION]...: the same with the programs that were built last, and up.
start_phone() {
    make_phone "$1" "$2" \
        --install "build/host/service/$SERVICE=/vendor/bin/hw/$SERVICE" \
        --install "service/$SERVICE.xml=/vendor/etc/vintf/manifest/$SERVICE.xml" \
        --install "build/host/client/bex-wifi-client=/vendor/bin/bex-wifi-client"
    simulator/phone up "$phone" "${@:3}"
}

# Whether the phone of ./dev phone is up: its pid file is locked as long.
phone_is_up() {
    [ -e "$PHONES/up/pid" ] && ! flock -n "$PHONES/up/pid" true
}

# own_the_phones: one run at a time has the phones that stay up.
own_the_phones() {
    own_file "$PHONES/owner"
    exec {owner}<>"$PHONES/owner"
    flock -n "$owner" || die "a phone is up already: end that one first"
}
