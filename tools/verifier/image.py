# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What Android 11's vendor image requires of modules, labels and paths. No compiler here checks that."""

import pathlib
import re

from verifier import blueprint
from verifier.declarations import POLICY, contexts
from verifier.sources import MODULE_LISTS

# What a vendor module of Android 11 may link, of what this project needs: vendor_available in the
# Android.bp of the folder, or there for vendors by itself.
VENDOR_AVAILABLE = {
    "libbase": "system/core/base",
    "libcutils": "system/core/libcutils",
    "libgmock": "external/googletest/googlemock",
    "libgtest": "external/googletest/googletest",
    "libhidlbase": "system/libhidl",
    "liblog": "system/core/liblog",
    "libutils": "system/core/libutils",
}
LIBRARY_LISTS = [name for name in MODULE_LISTS if name != "defaults"] + [
    "shared_libs", "whole_static_libs"]

# Run as vendor_toolbox_exec: the links that Android 11 has in /vendor/bin to toybox_vendor
# (external/toybox) and toolbox_vendor (system/core/toolbox). ping is in the former, without a link.
PLATFORM_TOOLS = {"cat", "ifconfig", "insmod", "rmmod", "sleep", "setprop", "start", "stop"}
SHELL_BUILTINS = {"echo"}

SANDBOX = "simulator/launcher/sandbox.py"


def verify(checkout):
    vendor_libraries(checkout)
    labelled_tools(checkout)
    search_path(checkout)


def vendor_libraries(checkout):
    """Soong links a vendor module only with modules that have a variant for vendors."""
    modules = [module for path in checkout.blueprints()
               for module in blueprint.read(checkout, path)]
    own = {module.name for module in modules}
    for module in modules:
        for kind in LIBRARY_LISTS:
            for name, line in module.strings(kind):
                if name not in own and name not in VENDOR_AVAILABLE:
                    checkout.report(module.path, line,
                                    f"'{name}' is not known to be there for vendor modules")


def labelled_tools(checkout):
    """The policy lets the service execute files with the platform's label for tools, or with its own."""
    path = f"{POLICY}/file_contexts"
    patterns = [pattern for _, pattern, label in contexts(checkout, "file_contexts")
                if label == "bex_wifi_tool_exec"]
    for tool, (place, line) in sorted(tools(checkout).items()):
        if tool in PLATFORM_TOOLS | SHELL_BUILTINS:
            continue
        if not any(re.fullmatch(pattern, f"/vendor/bin/{tool}") for pattern in patterns):
            checkout.report(path, 1, f"does not label {tool}, which {place}:{line} runs")


def tools(checkout):
    """Every program of the catalogue's command lines, with the first place that names it."""
    found = {}
    for path in checkout.paths("docs/commands", "*.md"):
        for number, line in enumerate(checkout.text(path).splitlines(), 1):
            if line.startswith('"'):
                for command in re.sub("'[^']*'", "", line.strip('"')).split("|"):
                    found.setdefault(pathlib.Path(command.split()[0]).name, (path, number))
    return found


def search_path(checkout):
    """The service's shell, its shell in the simulated phone, and the doctor look in the same places."""
    script, = checkout.paths("service", "*.rc")
    expected = checkout.find(script, r"^ +setenv PATH (\S+)$")[0][1]
    simulated, line = checkout.find(SANDBOX, r'^ +"PATH": "(.+)"')
    if simulated[1] != expected:
        checkout.report(SANDBOX, line, f"PATH is not '{expected}', as in {script}")
    doctor, = checkout.paths("client", "**/PhoneChecks.cpp")
    vendor, line = checkout.find(doctor, r"kVendorFolders\[\] = \{([^}]*)\}")
    others, _ = checkout.find(doctor, r"kOtherFolders\[\] = \{([^}]*)\}")
    folders = re.findall(r'"([^"]*)/"', vendor[1] + others[1])
    if ":".join(folders) != expected:
        checkout.report(doctor, line, f"the folders are not '{expected}', as in {script}")
