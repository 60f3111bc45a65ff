#!/usr/bin/python3 -B
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Writes down what the running code does with each call: catalogue.py [--check] EXPLAIN.

EXPLAIN is the built explain program. For every simulated phone there is a page in docs/commands/
with the command lines of typical calls and the use of each argument; what a caller would not expect
also goes into the table of the client's help. With --check nothing is written, and the exit code tells
whether all of that is up to date.
"""

import pathlib
import sys
import tempfile

import argument_use
import code_tables
import explained
import method_use_table
import script

ROOT = pathlib.Path(__file__).resolve().parents[1]
CATALOGUE = ROOT / "docs" / "commands"
TABLE = ROOT / "chips" / "MethodUseTable.cpp"

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

# Names of chips beside those of the simulated phones, for the case of their letters.
OTHER_NAMES = {"wcn": "wcn3990", "qca": "qca6174", "qca639x": "QCA639X", "wcn685x": "WCN685X",
               "wcn6750": "WCN6750"}

INTRODUCTION = """\
# Command catalogue

What the service runs, to read beside the manual of the chip's tool. One page for each chip family,
here with the tool that starts its tests (`iwpriv` passes on the driver's private commands):

{pages}

For other arguments: `./dev explain CHIP METHOD ARGUMENT...`

## How to read a page

Each method has the lines that its arguments reach, a table of what becomes of each argument, and
typical calls with every line that they run, in order. In the lines, all else stands as it is:

- `<power>` is the argument as it was given, unchecked: `15`, `-3` and `loud` all get there. What it
  means, its unit and its range are in the tool's manual.
- `{{channel}}` is a code that the service makes of the argument. The tables under *Codes*, at the
  end of the page, have all of them. `{{bandwidth, vht}}` depends on both.
- An argument that is **ignored** may have any value; nothing in the lines changes.

The service refuses no value and leaves no line out: the tool gets the line and decides. So a wrong
rate or width shows on the air, or as the tool's exit code, which the service answers with -1 or
`failure`. Before a measurement, look here for three things:

1. Is the argument used at all? A power that is ignored leaves the chip at its own.
2. Which code stands for the value, and which one for a value that no table has?
3. Does the method start anything? Where a page says *Transmits nothing* or *Receives nothing*, the
   call succeeds and the air stays quiet.

`bex-wifi-client METHOD --help` tells on a phone what its own family ignores, from the same source.

## Which family a chip belongs to

`ro.hardware.wlan.vendor` names the vendor, and a part of `ro.hardware.wlan.chip` the family. Upper
and lower case differ: `{upper}` and `{lower}` are driven in different ways.

{families}

## How the pages come about

`./dev catalogue` writes them: it has the service's own code make the lines of many calls that
differ in one argument, runs none, and compares. A test fails when a page and the code disagree.
"""


def argument_rows(use):
    """For each argument the places where it appears."""
    found = []
    for argument in use.method.arguments:
        places = []
        for line, place, slot in use.slots():
            if argument.name in slot.arguments:
                where = code_tables.code(code_tables.context(line, place))
                how = "as it stands" if slot.template else "a [code](#codes)"
                places.append(f"{where}: {how}")
        found.append([argument.name, ", ".join(dict.fromkeys(places)) or "**ignored**"])
    return found


def arguments_text(use):
    if not use.method.arguments:
        return []
    text = []
    if use.lines:
        text += ["", "```text", *[" ".join(map(str, line)) for line in use.lines], "```"]
    text += ["", *code_tables.markdown(["argument", "where it gets to"], argument_rows(use))]
    if use.remarks():
        text += ["", *[f"- {remark}" for remark in use.remarks()]]
    return text


def page(chip, phone, uses):
    text = [f"# {chip}", "",
            "The command lines that each call runs, in order, on a phone with",
            f"`ro.hardware.wlan.vendor` = `{phone.value('ro.hardware.wlan.vendor')}` and "
            f"`ro.hardware.wlan.chip` = `{phone.value('ro.hardware.wlan.chip')}`;",
            "[how to read them](README.md). Whole lines stand between quotes: their blanks count.",
            "Written by `./dev catalogue`; do not edit."]
    answers = dict(zip(map(tuple, CALLS), phone.lines(CALLS)))
    tables = code_tables.CodeTables()
    for use in uses:
        tables.add(use)
        text += ["", f"## {use.method.name}", *arguments_text(use)]
        for call, lines in answers.items():
            if call[0] == use.method.name:
                text += ["", f"`{' '.join(call)}`", ""]
                text += (["```text", *[f'"{line}"' for line in lines], "```"] if lines
                         else ["No command."])
    return "\n".join([*text, "", "## Codes", "", *tables.text()]).rstrip("\n") + "\n"


def families(phones):
    """The family of each of some names, also with upper and lower case exchanged."""
    rows = []
    for name, phone in phones.items():
        own = phone.value("ro.hardware.wlan.chip")
        for chip in [own] + [other for key, other in OTHER_NAMES.items() if key == name]:
            vendor = phone.value("ro.hardware.wlan.vendor")
            family = phone.with_chip(chip).family()
            rows.append([f"`{vendor}`", f"`{chip}`", f"[{family}]({family}.md)"])
        phone.with_chip(own)
    return code_tables.markdown(["vendor", "chip", "family"], rows)


def tools(uses):
    return ", ".join(f"`{tool}`" for tool in sorted(set().union(*(use.tools() for use in uses))))


def index(phones, uses):
    own = phones["wcn"].value("ro.hardware.wlan.chip")
    return INTRODUCTION.format(
        pages="\n".join(f"- [{chip}]({chip}.md): {tools(uses[chip])}" for chip in phones),
        families="\n".join(families(phones)), upper=own, lower=OTHER_NAMES["wcn"])


def wanted_files(explain):
    """The text of every file, by its path."""
    with tempfile.TemporaryDirectory() as folder:
        phones = explained.phones(explain, folder)
        methods = explained.methods(explain)
        uses = {name: [argument_use.MethodUse(phone, method) for method in methods]
                for name, phone in phones.items()}
        found = {CATALOGUE / f"{name}.md": page(name, phone, uses[name])
                 for name, phone in phones.items()}
        found[CATALOGUE / "README.md"] = index(phones, uses)
        found[TABLE] = method_use_table.text(uses)
    return found


def main():
    *options, explain = sys.argv[1:]
    wanted = wanted_files(explain)
    written = {path: path.read_text() for path in [*CATALOGUE.glob("*.md"), TABLE]
               if path.exists()}
    if options == ["--check"]:
        stale = sorted(path.name for path in written.keys() | wanted.keys()
                       if written.get(path) != wanted.get(path))
        if stale:
            sys.exit(f"out of date, run ./dev catalogue: {', '.join(stale)}")
        return
    CATALOGUE.mkdir(parents=True, exist_ok=True)
    for path in written.keys() - wanted.keys():
        path.unlink()
    for path, text in wanted.items():
        path.write_text(text)


if __name__ == "__main__":
    script.run(main)
