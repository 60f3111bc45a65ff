# shellcheck shell=bash
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# CTest passes over options that it does not know: ./dev test refuses them instead.

readonly CTEST_FLAGS=(-F -N --show-only --show-only=human --show-only=json-v1 -Q --quiet -U --union -V
    --verbose -VV --extra-verbose --debug --no-tests=error --no-tests=ignore --no-label-summary --no-subproject-summary
    --output-on-failure --print-labels --progress --rerun-failed --schedule-random --stop-on-failure)
readonly CTEST_WITH_VALUE=(-E --exclude-regex -FA --fixture-exclude-any -FC --fixture-exclude-cleanup
    -FS --fixture-exclude-setup -I --tests-information -L --label-regex -LE --label-exclude -O
    --output-log -R --tests-regex -j --parallel --max-width --output-junit --repeat
    --repeat-until-fail --stop-time --test-load --test-output-size-failed
    --test-output-size-passed --test-output-truncation --timeout)

is_one_of() {
    local word
    for word in "${@:2}"; do [ "$word" != "$1" ] || return 0; done
    return 1
}

# require_ctest_options WORD...: ends the command when a word is no option of CTest's, or lacks its value.
require_ctest_options() {
    while [ $# -gt 0 ]; do
        if is_one_of "$1" "${CTEST_WITH_VALUE[@]}"; then
            [ $# -ge 2 ] || die "$1 takes a value: see ./dev test --help" 2
            shift 2
        elif is_one_of "$1" "${CTEST_FLAGS[@]}" || [[ $1 =~ ^-j[0-9]+$ ]]; then
            shift
        else
            die "test takes no '$1': see ./dev test --help" 2
        fi
    done
}
