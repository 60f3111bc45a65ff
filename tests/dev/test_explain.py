# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The explain program by itself: many calls at once, and what it knows without a call."""

import json
import os
import subprocess

import pytest


@pytest.fixture(name="explain")
def explain_on_a_phone(tmp_path):
    (tmp_path / "vendor").mkdir()

    def run(*arguments, asked="", vendor="broadcom", chip="bcm4375"):
        (tmp_path / "vendor/build.prop").write_text(
            f"ro.hardware.wlan.vendor={vendor}\nro.hardware.wlan.chip={chip}\n")
        return subprocess.run([os.environ["BEX_EXPLAIN"], *arguments], input=asked, text=True,
                              capture_output=True, check=False, timeout=60,
                              env={**os.environ, "HIDL_HOST_ROOT": str(tmp_path)})

    return run


def test_an_empty_line_ends_the_answer_to_each_call(explain):
    done = explain("-", asked="RunTxStStart\t6\t\t1 2\nisMimoSupport\nRunTxStStop\t6\n")
    assert (done.returncode, done.stderr) == (0, "")
    lines = done.stdout.split("\n")
    assert lines[4:9] == ["wl txchain 1 2 ", "wl out ", "wl fqacurcy 6 ", "", ""]
    assert lines[9:] == ["wl fqacurcy 0 ", "ifconfig wlan0 down ", lines[11], "", ""]


def test_a_wrong_call_is_told_with_its_line(explain):
    done = explain("-", asked="RunTxStop\t6\nRunTxStop\n")
    assert done.returncode == 2
    assert done.stderr == "explain: line 2: RunTxStop takes 1 argument (channel), not 0\n"


def test_the_family(explain):
    assert explain("family").stdout == "broadcom\n"
    assert explain("family", vendor="qcom", chip="WCN3990").stdout == "wcn\n"
    unknown = explain("family", vendor="acme")
    assert (unknown.returncode, unknown.stdout) == (1, "")
    assert unknown.stderr == "explain: the property ro.hardware.wlan.vendor names no known vendor\n"


def test_the_methods(explain):
    methods = json.loads(explain("methods").stdout)["methods"]
    assert [argument["name"] for argument in methods[0]["arguments"]] == ["channel", "bandwidth"]
