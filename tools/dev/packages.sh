# shellcheck shell=bash
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# The Debian packages of each command, and how the missing ones are installed. For ./dev.

readonly BUILD_PACKAGES=(g++ cmake ninja-build hidl-gen android-libbase-dev android-libcutils-dev
    android-liblog-dev android-libutils-dev libtinyxml2-dev libgtest-dev libgmock-dev libbenchmark-dev)
readonly PHONE_PACKAGES=(busybox python3 mksh bubblewrap proot)
readonly PACKAGE_PACKAGES=(python3 groff-base dpkg-dev file)
readonly STATION_PACKAGES=(adb python3-pytest python3-pytest-xdist python3-matplotlib python3-jinja2)
readonly TEST_PACKAGES=("${PACKAGE_PACKAGES[@]}" "${STATION_PACKAGES[@]}" git make python3-lxml
    python3-jsonschema chromium checkpolicy m4 valgrind)
readonly BENCH_PACKAGES=("${PHONE_PACKAGES[@]}" "${STATION_PACKAGES[@]}" valgrind)
readonly FORMAT_PACKAGES=(git clang-format blueprint-tools)
readonly CHECK_PACKAGES=("${FORMAT_PACKAGES[@]}" clang clang-tidy shellcheck make python3
    python3-lxml libc++-dev libc++abi-dev googletest)
readonly ARM64_PACKAGES=(g++-aarch64-linux-gnu qemu-user mmdebstrap)
readonly FUZZ_PACKAGES=(clang libclang-rt-dev llvm)

# packages_of COMMAND: what a command installs.
packages_of() {
    case $1 in
        demo | phone | client | explain | catalogue) echo "${BUILD_PACKAGES[*]} ${PHONE_PACKAGES[*]}" ;;
        station) echo "${BUILD_PACKAGES[*]} ${PHONE_PACKAGES[*]} ${STATION_PACKAGES[*]}" ;;
        package) echo "${BUILD_PACKAGES[*]} ${PACKAGE_PACKAGES[*]}" ;;
        test | soak) echo "${BUILD_PACKAGES[*]} ${PHONE_PACKAGES[*]} ${TEST_PACKAGES[*]}" ;;
        arm64) echo "$(packages_of test) ${ARM64_PACKAGES[*]}" ;;
        check) echo "${BUILD_PACKAGES[*]} ${CHECK_PACKAGES[*]}" ;;
        format) echo "${FORMAT_PACKAGES[*]}" ;;
        fuzz) echo "${BUILD_PACKAGES[*]} ${FUZZ_PACKAGES[*]}" ;;
        bench) echo "${BUILD_PACKAGES[*]} ${BENCH_PACKAGES[*]}" ;;
        install) echo "$(packages_of arm64) $(packages_of check) $(packages_of fuzz) $(packages_of bench)" ;;
    esac
}

# missing_of PACKAGE...: the ones that are not installed, each once.
missing_of() {
    local package status
    for package; do
        # Debian has busybox in two packages that exclude each other; either will do.
        if [ "$package" = busybox ] && command -v busybox >/dev/null; then continue; fi
        status=$(dpkg-query -W -f '${db:Status-Status} ' "$package" 2>/dev/null) || true
        [[ " $status" == *" installed "* ]] || echo "$package"
    done | sort -u
}

# need COMMAND: installs what is missing for it, in one go.
need() {
    local packages missing root=() by_hand
    # Debian recommends 200 more with them, which no command needs.
    local -ra install=(apt-get install --no-install-recommends)
    read -ra packages < <(packages_of "$1")
    mapfile -t missing < <(missing_of "${packages[@]}")
    [ ${#missing[@]} -gt 0 ] || return 0
    by_hand="as root: ${install[*]} ${missing[*]}"
    if [ "$(id -u)" -ne 0 ]; then
        command -v sudo >/dev/null || die "packages are missing, and this is neither root nor sudo; $by_hand"
        root=(sudo)
        # With a terminal, sudo asks for the password now: afterwards nothing may read from it.
        sudo -n true 2>/dev/null || { [ -t 0 ] && sudo -v; } ||
            die "packages are missing, and sudo wants a password that it cannot ask for here; $by_hand"
    fi
    say "installing ${missing[*]}"
    own_file build/install.log
    # Two at a time would only meet the package manager's own lock.
    take_turn build/install.lock "another ./dev installs packages"
    if ! undisturbed logged build/install.log "${root[@]}" apt-get update ||
        ! undisturbed logged build/install.log "${root[@]}" env DEBIAN_FRONTEND=noninteractive \
            "${install[@]}" -o DPkg::Lock::Timeout=600 -y "${missing[@]}"; then
        tail -n 20 build/install.log >&2
        die "installing failed: see build/install.log; $by_hand"
    fi
    end_turn
}
