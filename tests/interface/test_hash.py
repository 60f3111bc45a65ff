# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""current.txt freezes the interface: it holds the hash of the definition as it stands."""

import pathlib
import shutil
import subprocess

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]
PACKAGE = "vendor.korvan.bex.wifi@1.0"


def hidl_gen(language, interface, output):
    return subprocess.run(
        ["hidl-gen", "-L", language, "-o", output, "-r", f"vendor.korvan.bex.wifi:{interface}",
         "-r", f"android.hidl:{ROOT}/host/hidl", PACKAGE],
        capture_output=True, text=True, check=False)


@pytest.fixture(name="copy")
def copy_of_interface(tmp_path):
    return shutil.copytree(ROOT / "interface", tmp_path / "interface")


def test_current_txt_holds_the_hash_of_the_definition(tmp_path):
    line = hidl_gen("hash", ROOT / "interface", tmp_path).stdout.strip()
    assert line.endswith(f" {PACKAGE}::IWifiService")
    assert line in (ROOT / "interface/current.txt").read_text().splitlines()


def test_a_changed_definition_is_refused(copy, tmp_path):
    definition = copy / "1.0/IWifiService.hal"
    definition.write_text(definition.read_text().replace("string ssid", "string name"))
    generated = hidl_gen("c++-headers", copy, tmp_path / "out")
    assert generated.returncode != 0
    assert "IWifiService has hash" in generated.stderr


def test_the_stub_carries_the_hash(tmp_path):
    assert hidl_gen("c++-sources", ROOT / "interface", tmp_path).returncode == 0
    frozen = (ROOT / "interface/current.txt").read_text().split()[-2]
    source = tmp_path / "vendor/korvan/bex/wifi/1.0/WifiServiceAll.cpp"
    assert f"/* {frozen} */" in source.read_text()
