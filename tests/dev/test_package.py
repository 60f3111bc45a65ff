# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The Debian package works from wherever it is unpacked."""

import pathlib
import subprocess

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]


def printed(*command):
    return subprocess.run(command, check=True, text=True, stdout=subprocess.PIPE, timeout=300,
                          stdin=subprocess.DEVNULL).stdout


@pytest.fixture(name="package", scope="module")
def built_package():
    path = printed(ROOT / "dev", "package").strip()
    assert path.endswith(".deb")
    return path


@pytest.fixture(name="usr", scope="module")
def unpacked(package, tmp_path_factory):
    folder = tmp_path_factory.mktemp("unpacked")
    printed("dpkg-deb", "-x", package, folder)
    return folder / "usr"


def test_it_names_what_it_needs(package):
    needed = printed("dpkg-deb", "-f", package, "Depends")
    for name in ("python3", "mksh", "busybox | busybox-static", "bubblewrap", "proot",
                 "android-libbase", "libstdc++6"):
        assert name in needed


def test_its_version_is_the_clients(package, usr):
    version = printed("dpkg-deb", "-f", package, "Version").strip()
    assert printed(usr / "bin/bex-wifi-client", "--version").startswith(
        f"bex-wifi-client {version}\n")


def test_what_belongs_to_the_client_is_there(usr):
    assert (usr / "share/man/man1/bex-wifi-client.1.gz").is_file()
    assert (usr / "share/bash-completion/completions/bex-wifi-client").is_file()
    assert "RunTxStop" in printed(usr / "bin/bex-wifi-client", "list")


def test_no_litter(usr):
    names = {path.name for path in usr.rglob("*")}
    assert not {name for name in names if name.startswith(".")} | names & {"__pycache__"}


def test_a_phone_with_the_service(usr, tmp_path):
    phone = usr / "bin/bex-wifi-phone"
    folder = tmp_path / "phone"
    printed(phone, "create", "broadcom", folder)
    printed(phone, "up", folder)
    try:
        assert printed(phone, "run", folder, "bex-wifi-client", "isSnifferMode") == "false\n"
    finally:
        printed(phone, "down", folder)
