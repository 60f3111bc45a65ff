# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""docs/adding-a-chip.md is true: with its rows and the files of acme/, a copy of this checkout builds,
explains, verifies, has its catalogue written and serves all methods on the new phone.

Only what the rows change is compiled: the copy takes this build along, and is built where this checkout
lies, in a sandbox that shows the copy there.
"""

import os
import pathlib
import re
import shutil
import subprocess
import sys

ROOT = pathlib.Path(__file__).resolve().parents[2]
ACME = pathlib.Path(__file__).resolve().parent / "acme"
BUILD = pathlib.Path("build/host")
PROGRAMS = {
    "BEX_SERVICE": "service/vendor.korvan.bex.wifi@1.0-service",
    "BEX_CLIENT": "client/bex-wifi-client",
    "BEX_EXPLAIN": "explain/bex-wifi-explain",
}
# What the rows of the tests are compiled into.
TABLES = ["fuzz-operations-parts", "text-bench"]
FILES = {
    "AcmeTestSuit.h": "suites/AcmeTestSuit.h",
    "AcmeTestSuit.cpp": "suites/AcmeTestSuit.cpp",
    "phone": "simulator/phones/acme",
    "acmerf": "simulator/tools/acmerf",
}
# The line after which the page's row goes; without one it goes to the end of the file.
PLACES = {
    "chips/ChipFamily.cpp": "kFamilies = {",
    "service/ChipChoice.cpp": "kChoices[] = {",
    "tests/support/families.py": "FAMILIES = {",
    "tests/fuzz/Operations.cpp": "kSuites[] = {",
    "tools/argument_use.py": "TEST_COMMANDS = [",
    "benchmarks/TextBench.cpp": 'BENCHMARK(replaceNewlines)->Name("replace")',
}
BLOCK = re.compile(r"^```\w+ (\S+)\n(.*?)^```$", re.MULTILINE | re.DOTALL)


def insert(file, place, rows):
    lines = file.read_text().splitlines()
    at = len(lines) if place is None else 1 + next(
        number for number, line in enumerate(lines) if place in line)
    file.write_text("\n".join(lines[:at] + rows + lines[at:]) + "\n")


def follow_the_page(copy):
    for path, block in BLOCK.findall((ROOT / "docs/adding-a-chip.md").read_text()):
        lines = block.splitlines()
        insert(copy / path, PLACES.get(path), [line for line in lines if line[:1] != "#"])
        for include in (line for line in lines if line[:1] == "#"):
            insert(copy / path, '#include "suites/BrcmTestSuit.h"', [include])
    for source, target in FILES.items():
        shutil.copy2(ACME / source, copy / target)


def run(*command, **options):
    done = subprocess.run(command, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True,
                          check=False, timeout=600, **options)
    assert done.returncode == 0, done.stdout
    return done.stdout


def sandbox(copy):
    """The command that runs another one with the copy in this checkout's place."""
    if shutil.which("bwrap"):
        command = ["bwrap", "--dev-bind", "/", "/", "--bind", copy, ROOT, "--chdir", ROOT]
        probe = subprocess.run([*command, "true"], stderr=subprocess.DEVNULL, check=False)
        if probe.returncode == 0:
            return command
    return ["proot", "-b", f"{copy}:{ROOT}", "-w", ROOT]


def test_the_page(tmp_path):
    copy = tmp_path / "checkout"
    shutil.copytree(ROOT, copy, ignore=shutil.ignore_patterns("build", ".git"), symlinks=True)
    shutil.copytree(ROOT / BUILD, copy / BUILD, symlinks=True,
                    ignore=shutil.ignore_patterns("tests", "benchmarks", "Testing", "pytest"))
    built = {name: str(copy / BUILD / path) for name, path in PROGRAMS.items()}
    make = [*sandbox(copy), "cmake", "--build", BUILD, "--target"]

    follow_the_page(copy)
    run(copy / "tools/verify")

    run(*make, "bex-wifi-explain")
    run(copy / "tools/catalogue.py", built["BEX_EXPLAIN"])
    page = (copy / "docs/commands/acme.md").read_text()
    assert '"acmerf tx bg 6 11 15 1 "' in page
    assert "acme1" in page
    assert "nothing: no test command" not in page

    run(*make, "wifi-service", "bex-wifi-client", *TABLES)
    run(sys.executable, "-B", "-m", "pytest", "-q", "-p", "no:cacheprovider", "-k", "acme",
        copy / "tests/phone/test_every_phone.py", cwd=copy, env={**os.environ, **built})
