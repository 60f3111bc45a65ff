# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""README.md names every folder."""

import pathlib

ROOT = pathlib.Path(__file__).resolve().parents[2]


def folders(parent):
    return [path.name for path in parent.iterdir()
            if path.is_dir() and path.name[0] not in "._" and path != ROOT / "build"]


def test_every_folder_has_its_place():
    rows = [line for line in (ROOT / "README.md").read_text().splitlines() if line.startswith("| `")]
    assert set(folders(ROOT)) <= {row.split("`")[1].split("/")[0] for row in rows}
    tests, = [row for row in rows if row.startswith("| `tests/`")]
    assert {name for name in folders(ROOT / "tests") if f"`{name}/`" not in tests} == set()
