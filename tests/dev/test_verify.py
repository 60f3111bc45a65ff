# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The verifier passes the checkout as it is, and tells the file and line of each disagreement."""

import pathlib
import re
import shutil
import subprocess

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]
HAL = "interface/1.0/IWifiService.hal"
RC = "service/vendor.korvan.bex.wifi@1.0-service.rc"
XML = "service/vendor.korvan.bex.wifi@1.0-service.xml"
MATRIX = "service/compatibility_matrix.xml"
HWSERVICE = "service/sepolicy/hwservice_contexts"
FILES = "service/sepolicy/file_contexts"
SANDBOX = "simulator/launcher/sandbox.py"


@pytest.fixture(name="copy")
def copy_of_checkout(tmp_path):
    skip = shutil.ignore_patterns("build", ".git")
    return shutil.copytree(ROOT, tmp_path / "checkout", ignore=skip)


def verify(root=ROOT):
    return subprocess.run([ROOT / "tools/verify", root], capture_output=True, text=True,
                          check=False, timeout=60)


def line_of(path, text):
    lines = path.read_text().splitlines()
    return 1 + next(number for number, line in enumerate(lines) if text in line)


def test_this_checkout_agrees():
    verified = verify()
    assert (verified.returncode, verified.stderr) == (0, "")


# File, what stands there, what stands there instead, and what is told of that line.
DISAGREEMENTS = [
    (HAL, "package vendor.korvan.bex.wifi@1.0", "package vendor.korvan.bex.wifi@1.1",
     "vendor.korvan.bex.wifi@1.1 lies in interface/1.1/IWifiService.hal"),
    ("interface/current.txt", "14fe6273", "14fe6274", "the definition's line is '14fe6273"),
    ("interface/Android.bp", 'name: "vendor.korvan.bex.wifi"', 'name: "vendor.korvan.bex"',
     "name is not 'vendor.korvan.bex.wifi'"),
    ("interface/Android.bp", "use_current: true", "use_current: false", "use_current is not 'True'"),
    ("interface/Android.bp", "use_current", 'path: "vendor/korvan/bex/wifi/interface",\n    use_current',
     "'path' ties the checkout to one place"),
    ("interface/1.0/Android.bp", "wifi@1.0", "wifi@1.1", "name is not 'vendor.korvan.bex.wifi@1.0'"),
    ("interface/1.0/Android.bp", "IWifiService.hal", "types.hal", "srcs is not IWifiService.hal"),
    ("service/CMakeLists.txt", "1.0-service)", "1.0-servant)", "program is not called"),
    ("service/Android.bp", 'path: "hw"', 'path: "lw"', "relative_install_path is not 'hw'"),
    ("service/Android.bp", "service.rc", "service.src", "there is no service/vendor.korvan"),
    ("service/Android.bp", 'vintf_fragments: ["v', 'vintf_fragments: ["w',
     "vintf_fragments is not vendor.korvan.bex.wifi@1.0-service.xml alone"),
    (RC, "service vendor.bex_wifi /vendor/bin/hw/vendor", "service vendor.bex_wifi /vendor/bin/vendor",
     "starts /vendor/bin/vendor.korvan.bex.wifi@1.0-service, not"),
    (RC, "service vendor.bex_wifi", "service bex_wifi", "does not begin with 'vendor.'"),
    (RC, "1.0::IWifiService default", "1.0::IWifiService first", "is not the service's own interface"),
    (RC, "    class hal", "    interface android.hidl.base@1.0::IBase default\n    class hal",
     "is not the service's own interface"),
    (SANDBOX, "/vendor/bin:/vendor/xbin", "/vendor/xbin:/vendor/bin", "PATH is not '/vendor/bin:"),
    ("client/doctor/PhoneChecks.cpp", 'Folders[] = {"/vendor/bin/"', 'Folders[] = {"/odm/bin/"',
     "the folders are not '/vendor/bin:"),
    (XML, "<name>vendor.korvan.bex.wifi<", "<name>vendor.korvan.wifi<", "not 'vendor.korvan.bex.wifi'"),
    (XML, "<version>1.0<", "<version>1.1<", "version is '1.1', not '1.0'"),
    (XML, "<name>IWifiService<", "<name>IWifi<", "interface/name is 'IWifi', not 'IWifiService'"),
    (XML, "<instance>default<", "<instance>first<", "instance is 'first', not 'default'"),
    (XML, ">hwbinder<", ">passthrough<", "transport is 'passthrough', not 'hwbinder'"),
    (XML, 'type="device"', 'type="framework"', "is no manifest of"),
    (MATRIX, "<instance>default<", "<instance>first<", "instance is 'first', not 'default'"),
    (MATRIX, ' optional="true"', "", "the HAL is not optional"),
    (HWSERVICE, "wifi::IWifiService", "wifi@1.0::IWifiService", "not vendor.korvan.bex.wifi::IWifi"),
    (HWSERVICE, "bex_wifi_hwservice", "bex_hwservice", "declares no service 'bex_hwservice'"),
    (FILES, r"wifi@1\.0-service", r"wifi@1.0-service", "is not labelled bex_wifi_exec"),
    (FILES, "bex_wifi_exec", "vendor_file", "is not labelled bex_wifi_exec"),
    ("service/product.mk", "1.0-service", "1.1-service", "has a module 'vendor.korvan.bex.wifi@1.1"),
    ("service/board.mk", "# Copyright", "DEVICE_FRAMEWORK_COMPATIBILITY_MATRIX_FILE := x\n#",
     "there is no x"),
    ("service/board.mk", "# Copyright", "BOARD_SEPOLICY_DIRS += x\n#", "a user build gets something"),
    ("shell/Android.bp", '"Command.cpp"', '"Commands.cpp"', "there is no shell/Commands.cpp"),
    ("shell/CMakeLists.txt", "Command.cpp", "Commands.cpp", "there is no shell/Commands.cpp"),
    ("sniffer/Android.bp", '"bex-wifi-shell"', '"bex-wifi-shells"', "no module 'bex-wifi-shells'"),
    ("tests/target/Android.bp", '"libutils"', '"libhidl_gtest_helper"',
     "'libhidl_gtest_helper' is not known to be there for vendor modules"),
    ("chips/ChipFamily.cpp", '{"qca", "qcom"', '{"qcb", "qcom"', "there is no simulator/phones/qcb"),
    ("chips/ChipFamily.cpp", '{"wcn", "qcom"', '{"wcm", "qcom"', "ChipChoice.cpp has no row for 'wcm'"),
    ("chips/ChipFamily.cpp", '{"wcn", "qcom"', '{"wcm", "qcom"', "families.py has no row for 'wcm'"),
    ("tests/unit/Android.bp", ":bex-wifi-recorder", ":bex-recorder", "no module 'bex-recorder'"),
]


@pytest.mark.parametrize("path, old, new, told", DISAGREEMENTS)
def test_a_disagreement_is_told_with_its_line(copy, path, old, new, told):
    file = copy / path
    line = line_of(file, old)
    file.write_text(file.read_text().replace(old, new, 1))
    verified = verify(copy)
    assert verified.returncode == 1, verified.stderr
    assert [text for text in verified.stderr.splitlines()
            if text.startswith(f"{path}:{line}: ") and told in text], verified.stderr


@pytest.mark.parametrize("tool", ["busybox", "ping", "wl"])
def test_a_tool_without_a_label(copy, tool):
    file = copy / FILES
    file.write_text(re.sub(rf"\b{tool}\b(\||\))", r"x\1", file.read_text()))
    assert f"{FILES}:1: does not label {tool}, which docs/commands/" in verify(copy).stderr


@pytest.mark.parametrize("old, new, told", [
    ("BEX_WIFI_SERVICE :=", "BEX_WIFI_SERVICE =", "there is no /dev/sepolicy"),
    ("/sepolicy", "/policy", "there is no service/policy"),
    ("compatibility_matrix", "matrix", "does not add service/compatibility_matrix.xml"),
    ("BEX_WIFI_SERVICE :=", "BEX_WIFI_SERVICE := x#", "does not add service/sepolicy"),
])
def test_what_the_board_includes(copy, old, new, told):
    file = copy / "service/board.mk"
    file.write_text(file.read_text().replace(old, new))
    assert told in verify(copy).stderr


@pytest.mark.parametrize("path", ["tests/fuzz/Operations.cpp", "benchmarks/TextBench.cpp"])
def test_a_suite_that_a_list_lacks(copy, path):
    file = copy / path
    file.write_text(file.read_text().replace("Wcn6750TestSuit", "Wcn6751TestSuit"))
    assert f"suites/Wcn6750TestSuit.h:1: {path} has no row for Wcn6750TestSuit" in verify(copy).stderr


def test_a_phone_of_no_family(copy):
    (copy / "simulator/phones/acme").write_text("")
    assert "simulator/phones/acme:1: chips/ChipFamily.cpp has no such family" in verify(copy).stderr


def test_a_source_that_soong_lacks(copy):
    file = copy / "shell/Android.bp"
    file.write_text(file.read_text().replace('        "CommandTable.cpp",\n', ""))
    told = verify(copy).stderr
    assert "shell/CommandTable.cpp:1: is in no module of shell/Android.bp" in told
    assert "shell/CMakeLists.txt:1: Soong does not build shell/CommandTable.cpp" in told


def test_a_source_that_cmake_lacks(copy):
    file = copy / "sniffer/CMakeLists.txt"
    file.write_text(file.read_text().replace("SnifferTool.cpp Wcn", "Wcn"))
    line = line_of(copy / "sniffer/Android.bp", '"SnifferTool.cpp"')
    assert verify(copy).stderr == (
        f"sniffer/Android.bp:{line}: CMake does not build sniffer/SnifferTool.cpp\n")


@pytest.mark.parametrize("path, text, told", [
    ("hidl/ServiceManagement.h", "#include <android/hidl/manager/1.0/IServiceManager.h>",
     "does not bring android/hidl/manager/1.0/IServiceManager.h"),
    ("hidl/HidlPassthroughSupport.h", "#include <hwbinder/Parcel.h>", "does not bring hwbinder/Parcel.h"),
    ("hwbinder/IBinder.h", "#include <vector>", "does not bring vector"),
    ("hidl/ServiceManagement.h", "struct IServiceManager : public IBase {", "only declares IServiceManager"),
    ("hidl/HidlString.h", "#pragma once", "has no header of this name"),
])
def test_a_generous_header(copy, path, text, told):
    header = copy / "host/include" / path
    header.write_text(f"{text}\n{header.read_text() if header.exists() else ''}")
    assert f"host/include/{path}:1: Android 11" in verify(copy).stderr
    assert told in verify(copy).stderr


def test_a_source_in_two_modules(copy):
    file = copy / "service/Android.bp"
    file.write_text(file.read_text().replace('["main.cpp"]', '["*.cpp"]'))
    told = verify(copy).stderr
    assert "service/WifiService.cpp is in 'bex-wifi-service' as well" in told


@pytest.mark.parametrize("path, text, told", [
    (RC, "", f"{RC}:1: holds nothing like"),
    (XML, "<manifest>", f"{XML}:1: "),
    ("shell/Android.bp", "cc_library_static { name: ", "shell/Android.bp:1: cannot make sense of"),
    ("shell/Android.bp", "cc_library_static {\n  srcs: [a]", "shell/Android.bp:2: 'a' stands where"),
    (HWSERVICE, "IWifiService\n", f"{HWSERVICE}:1: is not NAME"),
])
def test_what_cannot_be_read_is_one_line(copy, path, text, told):
    (copy / path).write_text(text)
    verified = verify(copy)
    assert verified.returncode == 2
    assert verified.stderr.startswith(told)
    assert verified.stderr.count("\n") == 1


def test_a_missing_file_is_one_line(copy):
    (copy / MATRIX).unlink()
    assert verify(copy).stderr == f"{MATRIX}: cannot be read: No such file or directory\n"
