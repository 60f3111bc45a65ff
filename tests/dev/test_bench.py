# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The benchmarks run and end, and the table has every figure. What they measure is no test's."""

import os
import pathlib
import subprocess

ROOT = pathlib.Path(__file__).resolve().parents[2]


def bench(*arguments):
    return subprocess.run([ROOT / "tools/bench.py", *arguments], capture_output=True, text=True,
                          check=False, timeout=600)


def test_the_table():
    done = bench(os.environ["BEX_BUILD"], "--smoke")
    assert done.returncode == 0, done.stderr
    head, line, *rows = [row.strip("| ").split(" | ") for row in done.stdout.splitlines()]
    assert head[:4] == ["figure", "floor", "to reach", "measured"]
    assert set(line) == {"---"}
    figures = [row[0] for row in rows]
    for part in ("own work for a line, table", "own work for a line, logged", "does nothing", "100 MB", "20 lines", "peak memory", "newlines", "broadcom",
                 "wcn6750", "p50", "p99", "2 clients", "64 clients", "first answered", "resident",
                 "station kit", "the kit's share", "arm64"):
        assert [figure for figure in figures if part in figure], part


def test_a_missing_program_is_told_on_one_line(tmp_path):
    done = bench(tmp_path, "--smoke")
    assert done.returncode == 2
    assert done.stderr.startswith("bench: ")
    assert done.stderr.count("\n") == 1
