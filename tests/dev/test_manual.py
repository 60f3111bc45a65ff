# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What is made of the client's help: its manual page, and its completion in bash."""

import json
import os
import pathlib
import re
import shlex
import subprocess

import pytest

MANUAL = pathlib.Path(__file__).resolve().parents[2] / "tools/manual.py"
CLIENT = os.environ["BEX_WIFI_CLIENT"]


def printed(*command, **options):
    return subprocess.run(command, check=True, text=True, stdout=subprocess.PIPE,
                          stderr=subprocess.PIPE, timeout=60, **options)


@pytest.fixture(name="methods", scope="module")
def listed_methods():
    return json.loads(printed(CLIENT, "list", "--json").stdout)["methods"]


@pytest.fixture(name="page", scope="module")
def formatted_page():
    """The page as a terminal shows it, without its bold letters; the formatter has no complaint."""
    source = printed(MANUAL, CLIENT, "page").stdout
    formatted = printed("groff", "-man", "-Tascii", "-ww", input=source)
    assert formatted.stderr == ""
    return re.sub(".\b|\x1b\\[[0-9;]*m", "", formatted.stdout)


def test_the_page_has_all_that_the_help_has(page, methods):
    for heading in ("NAME", "DESCRIPTION", "USAGE", "EXIT CODES", "METHODS"):
        assert f"\n{heading}\n" in page
    words = page.split()
    for method in methods:
        assert f"\n   {method['name']}\n" in page
        names = [argument["name"] for argument in method["arguments"]]
        assert " ".join([method["name"], *names]) in " ".join(words)
    assert "--timeout" in words
    assert "unit: Mbit/s; 1, 2, 5.5," in " ".join(words)


@pytest.fixture(name="complete", scope="module")
def completion_of_a_line(tmp_path_factory):
    script = tmp_path_factory.mktemp("completion") / "bex-wifi-client"
    script.write_text(printed(MANUAL, CLIENT, "completion").stdout)

    def complete(*words):
        """What bash offers for the last word."""
        line = " ".join(f"'{word}'" for word in ("bex-wifi-client", *words))
        return printed("bash", "--norc", "-euc", f"""
            source {shlex.quote(str(script))}
            COMP_WORDS=({line}) COMP_CWORD={len(words)}
            _bex_wifi_client
            printf '%s\\n' "${{COMPREPLY[@]}}\"""").stdout.split()

    return complete


def test_a_method_is_completed(complete, methods):
    assert complete("RunTxB") == ["RunTxBGStart"]
    assert {"list", "doctor", *[method["name"] for method in methods]} <= set(complete(""))


@pytest.mark.parametrize("words, offered", [
    (["RunTxNStart", "36", ""], ["20", "40", "80"]),
    (["snifferStart", "36", "1"], ["160"]),
    (["RunTxNStart", "36", "80", "7", "15", ""], ["true", "false"]),
    (["RunTxBGStart", "6", "5"], ["5.5", "54"]),
    (["--json", "--timeout", "5", "RunTxNStart", "36", ""], ["20", "40", "80"]),
    # A channel and a negative power are the caller's own.
    (["RunTxNStart", ""], []),
    (["RunTxNStart", "36", "80", "7", "-20", "t"], ["true"]),
    (["--timeout", ""], []),
    (["RunTxStop", "6", "--j"], ["--json"]),
    (["--v"], ["--version"]),
    (["help", "RunRxS"], ["RunRxStop"]),
    (["RunTxStop", "6", ""], []),
])
def test_an_argument_is_completed(complete, words, offered):
    assert complete(*words) == offered


def test_wrong_usage_is_one_line():
    wrong = subprocess.run([MANUAL, CLIENT], capture_output=True, text=True, check=False,
                           timeout=60)
    assert (wrong.returncode, wrong.stdout) == (1, "")
    assert wrong.stderr == "usage: manual.py CLIENT page|completion\n"
