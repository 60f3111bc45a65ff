# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The example policy compiles against a cut-down platform, and forbids what it says it forbids."""

import pathlib
import re
import subprocess

import pytest

HERE = pathlib.Path(__file__).resolve().parent
POLICY = HERE.parents[1] / "service/sepolicy"
RULES = [POLICY / "attributes", *sorted(POLICY.glob("*.te"))]
# What a policy ends with: who may be what, and the labels of the kernel's own files.
END = """
role r;
role r types domain;
user u roles r level s0 range s0 - s0:c0;
sid kernel u:r:kernel:s0
"""


@pytest.fixture(name="compile_policy")
def compile_policy_with(tmp_path):
    def run(more=""):
        rules = "".join(file.read_text() for file in RULES) + more
        text = (HERE / "platform.m4").read_text() + rules + END
        text += (POLICY / "genfs_contexts").read_text()
        expanded = subprocess.run(["m4"], input=text, capture_output=True, text=True, check=True)
        (tmp_path / "policy.conf").write_text(expanded.stdout)
        return subprocess.run(
            ["checkpolicy", "-M", "-c", "30", "-o", tmp_path / "policy", tmp_path / "policy.conf"],
            capture_output=True, text=True, check=False)

    return run


def test_it_compiles(compile_policy):
    compiled = compile_policy()
    assert compiled.returncode == 0, compiled.stderr


def test_the_example_of_a_client_may_call(compile_policy):
    document = (HERE.parents[1] / "docs/on-device.md").read_text()
    example = re.search(r"^```te\n(.*?)^```", document, re.MULTILINE | re.DOTALL)[1]
    compiled = compile_policy(example)
    assert compiled.returncode == 0, compiled.stderr
    for rule in ("bex_wifi_hwservice:hwservice_manager find", "bex_wifi:binder call",
                 "vendor_default_prop:file read"):
        forbidden = compile_policy(f"{example}neverallow my_factory_test {rule};\n")
        assert "neverallow" in forbidden.stderr, rule


@pytest.mark.parametrize("rule", [
    "allow shell bex_wifi_hwservice:hwservice_manager find;",
    "allow system_server bex_wifi_hwservice:hwservice_manager find;",
    "allow untrusted_app bex_wifi_hwservice:hwservice_manager find;",
    "allow shell bex_wifi_hwservice:hwservice_manager add;",
    "allow shell bex_wifi:binder call;",
    *(f"typeattribute {domain} bex_wifi_client;" for domain in (
        "untrusted_app", "platform_app", "priv_app", "system_app", "system_server", "shell")),
])
def test_nobody_else_may(compile_policy, rule):
    compiled = compile_policy(rule + "\n")
    assert compiled.returncode != 0
    assert "neverallow" in compiled.stderr


@pytest.mark.parametrize("rule", [
    "vendor_init bex_wifi_capture_prop:property_service set;",
    "bex_wifi system_lib_file:system module_load;",
    "bex_wifi vendor_file:system module_load;",
])
def test_this_is_allowed(compile_policy, rule):
    """To forbid it makes the compiler name the rule that allows it."""
    compiled = compile_policy(f"neverallow {rule}\n")
    assert compiled.returncode != 0
    assert "neverallow" in compiled.stderr


@pytest.mark.parametrize("name", ["file_contexts", "hwservice_contexts", "property_contexts"])
def test_labels_are_declared(name):
    declared = set(re.findall(r"^(?:type |vendor_internal_prop\()(\w+)",
                              "".join(file.read_text() for file in RULES), re.MULTILINE))
    used = set(re.findall(r"u:object_r:(\w+):s0", (POLICY / name).read_text()))
    assert used
    assert used <= declared


@pytest.mark.parametrize("path, label", [
    ("/vendor/bin/hw/vendor.korvan.bex.wifi@1.0-service", "bex_wifi_exec"),
    ("/system/vendor/bin/hw/vendor.korvan.bex.wifi@1.0-service", "bex_wifi_exec"),
    ("/vendor/bin/hw/vendor_korvan_bex_wifi@1_0-service", None),
    ("/vendor/bin/myftm", "bex_wifi_tool_exec"),
    ("/vendor/bin/ping", "bex_wifi_tool_exec"),
    ("/vendor/bin/wlx", None),
])
def test_files_are_labelled(path, label):
    """By whole paths, as the platform matches its expressions."""
    lines = [line.split() for line in (POLICY / "file_contexts").read_text().splitlines()
             if line and not line.startswith("#")]
    labels = [context.split(":")[2] for pattern, context in lines if re.fullmatch(pattern, path)]
    assert labels == ([label] if label else [])
