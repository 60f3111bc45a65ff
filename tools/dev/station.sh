# shellcheck shell=bash
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# A plan on all the simulated phones at once, by the real adb. For ./dev.

readonly STATION_REPORT=$PWD/build/station
readonly EXAMPLE_PLAN=$PWD/station/example/plan.py
# Seconds that an interrupted plan has to switch its radios off and to write its report.
readonly STATION_PATIENCE=120
# Where adb's server of this run has its socket and its keys, and the locks of its phones.
station_home=
station_locks=()

end_station() {
    trap '' INT TERM HUP QUIT
    if [ -e "$station_home/socket" ]; then adb kill-server 2>/dev/null || true; fi
    # A lock's file stays, for whoever waits for it; but these phones do not come again.
    rm -rf "$station_home" "${station_locks[@]}"
    end_phones
}

# start_adb: a server of this run's own, so that the user's server and phones are left alone.
start_adb() {
    station_home=$(mktemp -d /tmp/bex-station.XXXXXX)
    trap end_station EXIT
    export ADB_SERVER_SOCKET=localfilesystem:$station_home/socket ADB_VENDOR_KEYS=$station_home
    # It looks for emulators up to this port, from 5555 on.
    export ADB_LOCAL_TRANSPORT_MAX_PORT=5553
    HOME=$station_home TMPDIR=$station_home adb start-server 2>"$station_home/complaints" ||
        die "adb's server does not start: $(tail -n 1 "$station_home/complaints")"
}

# Debian's Python has the packages. It runs where the user is, so that relative paths are theirs.
#
# run_station [PLAN] [PYTEST-OPTION]...
run_station() {
    local plan=$EXAMPLE_PLAN chip serial options=() failed=0
    if [[ ${1-} == *.py ]]; then
        plan=$1
        (cd "$OLDPWD" && [ -f "$plan" ]) || die "there is no plan $1" 2
        shift
    fi
    need station
    build_phone_programs
    for chip in $(chips); do
        start_phone "station-$chip-$$" "$chip" --adb >/dev/null
        # shellcheck disable=SC2154  # phones.sh sets it
        serial=$(<"$phone/adb")
        say "the $chip phone is up: $serial"
        options+=(--wifi-phone "$serial")
        station_locks+=("/tmp/bex-$serial.lock")
    done
    start_adb
    PYTHONPATH=$PWD/station${PYTHONPATH:+:$PYTHONPATH} \
        env -C "$OLDPWD" "$PWD/tools/dev/supervise.py" --clean-up "$STATION_PATIENCE" \
        /usr/bin/python3 -B -u -m pytest -p bexwifi_pytest -p no:cacheprovider "$plan" "${options[@]}" \
        -n "${#station_locks[@]}" --wifi-report "$STATION_REPORT" "$@" || failed=$?
    return "$failed"
}
