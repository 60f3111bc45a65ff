# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The committed command catalogue is what the running code gives."""

import os
import pathlib
import shutil
import subprocess

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]


def check(tree):
    return subprocess.run([tree / "tools/catalogue.py", "--check", os.environ["BEX_EXPLAIN"]],
                          capture_output=True, text=True, check=False, timeout=600)


def test_it_is_up_to_date():
    result = check(ROOT)
    assert (result.returncode, result.stderr) == (0, "")


@pytest.fixture(name="copy")
def copy_of_the_tree(tmp_path):
    for folder in ("chips", "docs", "simulator", "tools"):
        shutil.copytree(ROOT / folder, tmp_path / folder)
    return tmp_path


def test_it_covers_every_method_of_every_phone():
    for phone in (ROOT / "simulator/phones").iterdir():
        page = (ROOT / f"docs/commands/{phone.name}.md").read_text()
        # And the codes.
        assert page.count("\n## ") == 16 + 1, phone.name


def test_what_is_out_of_date_is_named(copy):
    """A changed line, and a page too many and too few."""
    page = copy / "docs/commands/qca.md"
    page.write_text(page.read_text().replace('"sleep 1 "', '"sleep 1"', 1))
    (copy / "docs/commands/broadcom.md").rename(copy / "docs/commands/acme.md")
    (copy / "chips/MethodUseTable.cpp").unlink()
    stale = check(copy)
    assert stale.returncode == 1
    assert stale.stderr == ("out of date, run ./dev catalogue: "
                            "MethodUseTable.cpp, acme.md, broadcom.md, qca.md\n")


def section(family, method):
    page = (ROOT / f"docs/commands/{family}.md").read_text()
    return page.split(f"\n## {method}\n")[1].split("\n## ")[0]


@pytest.mark.parametrize("family, method, surprise", [
    ("qca", "RunTxBGStart", "| power | **ignored** |"),
    ("qca", "RunTxBGStart", "- Its test command is that of a reception."),
    ("qca", "RunTxNStart", "- vht false and true run the same lines with bandwidth 80."),
    ("wcn", "RunTxBGStart", "| antenna | **ignored** |"),
    ("wcn", "RunTxNStart", "| antenna | **ignored** |"),
    ("wcn", "RunRxNStart", "| rate | **ignored** |"),
    ("broadcom", "snifferStart", "- bandwidth 40, 80 and 160 MHz run the same lines."),
    ("qca639x", "RunTxStop", "| channel | `myftm … -I`: a [code](#codes) |"),
    ("wcn6750", "RunTxStop", "| channel | **ignored** |"),
    *[(family, method, f"- {what} nothing: no test command follows what sets the chip up.")
      for family in ("broadcom", "qca", "wcn", "wcn39xx")
      for method, what in (("RunTxAxStart", "Transmits"), ("RunRxAxStart", "Receives"))],
])
def test_a_surprise_is_told(family, method, surprise):
    assert surprise in section(family, method).splitlines()


@pytest.mark.parametrize("family", ["qca639x", "wcn685x", "wcn6750"])
def test_what_transmits_is_not_said_to_be_quiet(family):
    assert "nothing" not in section(family, "RunTxAxStart")


@pytest.mark.parametrize("family, row", [
    ("qca", "| 24 | `10` | `0` |"),
    ("qca", "| 36 to 177 | 5000 + 5 × channel |"),
    ("qca", "| 0 to 13 | 15 + MCS index |"),
    ("qca639x", "| 14 | `1` | `2484` |"),
    ("wcn", "| 5.5 | `11B_LONG_5_5_MBPS` |"),
    ("broadcom", "| 1 to 14 | `2g_rate` | `5g_rate` |"),
    ("broadcom", "| channel | bandwidth (MHz) 20 | bandwidth (MHz) 40, 80, 160, anything else |"),
])
def test_codes(family, row):
    assert row in section(family, "Codes").splitlines()


def test_the_case_of_a_chips_name_counts():
    introduction = (ROOT / "docs/commands/README.md").read_text()
    assert "| `qcom` | `WCN3990` | [wcn](wcn.md) |" in introduction
    assert "| `qcom` | `wcn3990` | [wcn39xx](wcn39xx.md) |" in introduction
