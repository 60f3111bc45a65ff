# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Soong and CMake build the same sources.

A folder's Android.bp and its CMakeLists.txt name the same files, each file that is named exists, and
each source of a folder that goes on a phone is in exactly one Soong module.
"""

import collections
import pathlib
import re

from verifier import blueprint

# Whose sources all go on a phone. In the other folders a host program may have files of its own.
PHONE_FOLDERS = ("chips", "client", "client/base", "client/doctor", "recorder", "service", "shell",
                 "sniffer", "suites", "tests/unit")
FILE_LISTS = ("srcs", "init_rc", "vintf_fragments", "corpus", "data")
MODULE_LISTS = ("defaults", "static_libs", "header_libs")
OURS = "bex-wifi-"


def verify(checkout):
    modules = [module for path in checkout.blueprints()
               for module in blueprint.read(checkout, path)]
    for check in (named_files, named_modules, one_module_each):
        check(checkout, modules)
    for folder in sorted({str(pathlib.Path(module.path).parent) for module in modules}):
        same_as_cmake(checkout, folder, modules)


def named_files(checkout, modules):
    for module in modules:
        folder = pathlib.Path(module.path).parent
        for kind in FILE_LISTS:
            for name, line in module.strings(kind):
                if not name.startswith(":") and not checkout.paths(folder, name):
                    checkout.report(module.path, line, f"there is no {folder / name}")


def named_modules(checkout, modules):
    known = {module.name for module in modules}
    for module in modules:
        for kind in MODULE_LISTS:
            for name, line in module.strings(kind):
                if name.startswith(OURS) and name not in known:
                    checkout.report(module.path, line, f"there is no module '{name}'")
        for name, line in module.strings("srcs"):
            if name.startswith(":") and name[1:] not in known:
                checkout.report(module.path, line, f"there is no module '{name[1:]}'")


def one_module_each(checkout, modules):
    homes = collections.defaultdict(list)
    for module in modules:
        for path, line in soong_sources(checkout, module):
            homes[path].append((module, line))
    for path, found in homes.items():
        for module, line in found[1:]:
            checkout.report(module.path, line, f"{path} is in '{found[0][0].name}' as well")
    for folder in PHONE_FOLDERS:
        for path in checkout.paths(folder, "*.cpp"):
            if path not in homes:
                checkout.report(path, 1, f"is in no module of {folder}/Android.bp")


def same_as_cmake(checkout, folder, modules):
    soong = {}
    for module in modules:
        if str(pathlib.Path(module.path).parent) == folder:
            soong.update(soong_sources(checkout, module))
    soong = {path: line for path, line in soong.items() if path.endswith(".cpp")}
    if not soong:
        return
    cmake = cmake_sources(checkout, folder)
    for path, line in soong.items():
        if path not in cmake:
            checkout.report(f"{folder}/Android.bp", line, f"CMake does not build {path}")
    for path, line in cmake.items():
        if path not in soong and folder in PHONE_FOLDERS:
            checkout.report(f"{folder}/CMakeLists.txt", line, f"Soong does not build {path}")


def soong_sources(checkout, module):
    folder = pathlib.Path(module.path).parent
    return [(path, line) for name, line in module.strings("srcs") if not name.startswith(":")
            for path in checkout.paths(folder, name)]


def cmake_sources(checkout, folder):
    """The .cpp files that a CMakeLists.txt names, wildcards spelled out, each with its line."""
    path = f"{folder}/CMakeLists.txt"
    found = {}
    for number, line in checkout.lines(path):
        for word in re.findall(r"[^\s()\"]+\.cpp\b", line):
            sources = checkout.paths(folder, word)
            if not sources:
                checkout.report(path, number, f"there is no {folder}/{word}")
            found.update(dict.fromkeys(sources, number))
    return found
