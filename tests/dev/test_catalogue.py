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
                          capture_output=True, text=True, check=False, timeout=120)


def test_it_is_up_to_date():
    result = check(ROOT)
    assert (result.returncode, result.stderr) == (0, "")


@pytest.fixture(name="copy")
def copy_of_the_tree(tmp_path):
    for folder in ("docs", "simulator", "tools"):
        shutil.copytree(ROOT / folder, tmp_path / folder)
    return tmp_path


def test_it_covers_every_method_of_every_phone():
    for phone in (ROOT / "simulator/phones").iterdir():
        page = (ROOT / f"docs/commands/{phone.name}.md").read_text()
        assert page.count("\n## ") == 16, phone.name


def test_a_changed_line_is_found(copy):
    page = copy / "docs/commands/broadcom.md"
    page.write_text(page.read_text().replace('"wl up "', '"wl up"', 1))
    assert "broadcom.md" in check(copy).stderr


def test_a_page_too_many_or_too_few_is_found(copy):
    (copy / "docs/commands/broadcom.md").rename(copy / "docs/commands/acme.md")
    stale = check(copy)
    assert stale.returncode == 1
    assert "acme.md, broadcom.md" in stale.stderr
