#!/usr/bin/python3
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Writes the command catalogue, docs/commands/, from the running code: catalogue.py [--check] EXPLAIN.

EXPLAIN is the built explain program. For every simulated phone and every method there is a section
with the command lines of typical calls. With --check nothing is written, and the exit code tells
whether the catalogue is up to date.
"""

import os
import pathlib
import subprocess
import sys
import tempfile

ROOT = pathlib.Path(__file__).resolve().parents[1]
CATALOGUE = ROOT / "docs" / "commands"

# Typical calls: both bands, both standards, each width.
CALLS = [
    ["snifferStart", "6", "20"],
    ["snifferStart", "36", "80"],
    ["snifferStop"],
    ["isSnifferMode"],
    ["getWlanMode"],
    ["isMimoSupport"],
    ["RunTxBGStart", "6", "11", "15", "1"],
    ["RunTxBGStart", "36", "54", "15", "1"],
    ["RunTxNStart", "6", "20", "7", "15", "false", "1"],
    ["RunTxNStart", "36", "40", "7", "15", "false", "2"],
    ["RunTxNStart", "36", "80", "9", "15", "true", "3"],
    ["RunTxAxStart", "36", "80", "11", "15", "0", "3"],
    ["RunTxStop", "36"],
    ["RunTxStStart", "6", "20", "1"],
    ["RunTxStStop", "6"],
    ["RunRxApJoinHoc", "test-ap", "192.168.1.7"],
    ["RunRxBgStart", "6", "11", "1"],
    ["RunRxNStart", "36", "40", "7", "true", "1"],
    ["RunRxAxStart", "36", "80", "11", "3"],
    ["RunRxStop", "36"],
]


def run(*command, root=None):
    environment = {**os.environ, "HIDL_HOST_ROOT": str(root)}
    return subprocess.run(command, env=environment, check=True, stdout=subprocess.PIPE,
                          stderr=subprocess.PIPE, text=True).stdout


def explained(explain, root, call):
    """The command lines of a call. Modules come in the order of their folder, which the file system
    makes up: here they are sorted."""
    lines = run(explain, *call, root=root).splitlines()
    modules = iter(sorted(line for line in lines if "insmod " in line))
    return [next(modules) if "insmod " in line else line for line in lines]


def page(explain, chip, root):
    properties = dict(line.split("=", 1) for line in (root / "vendor/build.prop").read_text()
                      .splitlines() if "=" in line)
    text = [f"# {chip}", "",
            "The command lines that each call runs, in order, on a phone with",
            f"`ro.hardware.wlan.vendor` = `{properties['ro.hardware.wlan.vendor']}` and "
            f"`ro.hardware.wlan.chip` = `{properties['ro.hardware.wlan.chip']}`.",
            "Between quotes, since their blanks count. Written by `./dev catalogue`; do not edit."]
    method = ""
    for call in CALLS:
        if call[0] != method:
            method = call[0]
            text += ["", f"## {method}"]
        text += ["", f"`{' '.join(call)}`", ""]
        lines = explained(explain, root, call)
        text += ["```text", *[f'"{line}"' for line in lines], "```"] if lines else ["No command."]
    return "\n".join(text) + "\n"


def index(chips):
    return "\n".join([
        "# Command catalogue", "",
        "What each call runs, to read beside the manual of the chip's tool. One page per chip family:",
        "", *[f"- [{chip}]({chip}.md)" for chip in chips], "",
        "For other arguments: `./dev explain CHIP METHOD ARGUMENT...`", ""])


def pages(explain):
    chips = sorted(path.name for path in (ROOT / "simulator" / "phones").iterdir())
    found = {"README.md": index(chips)}
    with tempfile.TemporaryDirectory() as folder:
        for chip in chips:
            phone = pathlib.Path(folder) / chip
            run(ROOT / "simulator" / "phone", "create", chip, phone)
            found[f"{chip}.md"] = page(explain, chip, phone / "root")
    return found


def main():
    *options, explain = sys.argv[1:]
    written = {path.name: path.read_text() for path in CATALOGUE.glob("*.md")}
    wanted = pages(explain)
    if options == ["--check"]:
        stale = sorted(name for name in written.keys() | wanted.keys()
                       if written.get(name) != wanted.get(name))
        if stale:
            sys.exit(f"out of date, run ./dev catalogue: {', '.join(stale)}")
        return
    CATALOGUE.mkdir(parents=True, exist_ok=True)
    for name in written.keys() - wanted.keys():
        (CATALOGUE / name).unlink()
    for name, text in wanted.items():
        (CATALOGUE / name).write_text(text)


if __name__ == "__main__":
    main()
