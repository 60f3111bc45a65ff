# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The service has the same names in every file that declares it to the platform.

The names come from the interface's definition, from main() (the instance) and from Soong (the
binary); everything else is compared with these.
"""

import os
import subprocess
import tempfile

from lxml import etree

from verifier import blueprint
from verifier.checkout import Unreadable

MAIN = "service/main.cpp"
CURRENT = "interface/current.txt"
MATRIX = "service/compatibility_matrix.xml"
POLICY = "service/sepolicy"
PRODUCT = "service/product.mk"
BOARD = "service/board.mk"
CMAKE = "service/CMakeLists.txt"


class Names:
    """What the service is called."""

    def __init__(self, checkout):
        definitions = checkout.paths("interface", "*/*.hal")
        if len(definitions) != 1:
            raise Unreadable("interface", f"holds {len(definitions)} definitions where one belongs")
        self.definition = definitions[0]
        package, self.package_line = checkout.find(self.definition, r"^package (.+)@(.+);")
        interface, _ = checkout.find(self.definition, r"^interface (\w+)")
        instance, _ = checkout.find(MAIN, r'registerAsService\("(.+)"\)')
        self.package, self.version = package.groups()
        self.interface = interface[1]
        self.instance = instance[1]
        self.versioned = f"{self.package}@{self.version}"
        self.service = service_module(checkout)


def service_module(checkout):
    modules = blueprint.read(checkout, "service/Android.bp")
    services = [module for module in modules if module.kind == "cc_binary"]
    if len(services) != 1:
        raise Unreadable("service/Android.bp:1", f"has {len(services)} binaries where one belongs")
    return services[0]


def verify(checkout):
    names = Names(checkout)
    if not in_its_place(checkout, names):
        return  # hidl-gen would not find it
    for check in (frozen_hash, hidl_modules, service, init_script, vintf_fragment,
                  compatibility_matrix, hwservice_context, file_context, makefiles):
        check(checkout, names)


def in_its_place(checkout, names):
    place = f"interface/{names.version}/{names.interface}.hal"
    if names.definition != place:
        checkout.report(names.definition, names.package_line, f"{names.versioned} lies in {place}")
    return names.definition == place


def frozen_hash(checkout, names):
    with tempfile.TemporaryDirectory() as unfrozen:
        # Without the current.txt beside it: with it, a changed definition would print no hash at all.
        os.symlink((checkout.root / "interface" / names.version).resolve(),
                   os.path.join(unfrozen, names.version))
        printed = subprocess.run(
            ["hidl-gen", "-L", "hash", "-r", f"{names.package}:{unfrozen}",
             "-r", f"android.hidl:{checkout.root}/host/hidl", names.versioned],
            capture_output=True, text=True, check=False)
    expected = printed.stdout.strip()
    if not expected:
        problem = printed.stderr.strip().splitlines() or ["hidl-gen prints no hash"]
        raise Unreadable(names.definition, problem[0])
    entries = list(checkout.lines(CURRENT))
    for number, line in entries:
        if line != expected:
            checkout.report(CURRENT, number, f"the definition's line is '{expected}'")
    if not entries:
        checkout.report(CURRENT, 1, f"lacks the line '{expected}'")


def hidl_modules(checkout, names):
    root, = blueprint.read(checkout, "interface/Android.bp")
    expect(checkout, root, "name", names.package)
    expect(checkout, root, "use_current", True)
    if root.get("path") is not None:
        checkout.report(root.path, root.line_of("path"),
                        "'path' ties the checkout to one place; without it Soong takes the folder")
    interface, = blueprint.read(checkout, f"interface/{names.version}/Android.bp")
    expect(checkout, interface, "name", names.versioned)
    expect(checkout, interface, "root", names.package)
    if [item for item, _ in interface.strings("srcs")] != [f"{names.interface}.hal"]:
        checkout.report(interface.path, interface.line_of("srcs"),
                        f"srcs is not {names.interface}.hal alone")


def expect(checkout, module, name, value):
    if module.get(name) != value:
        checkout.report(module.path, module.line_of(name), f"{name} is not '{value}'")


def service(checkout, names):
    binary = f"{names.versioned}-service"
    expect(checkout, names.service, "name", binary)
    expect(checkout, names.service, "relative_install_path", "hw")
    for kind, suffix in (("init_rc", "rc"), ("vintf_fragments", "xml")):
        if [item for item, _ in names.service.strings(kind)] != [f"{binary}.{suffix}"]:
            checkout.report(names.service.path, names.service.line_of(kind),
                            f"{kind} is not {binary}.{suffix} alone")
    output, line = checkout.find(CMAKE, r"OUTPUT_NAME (\S+?)\)")
    if output[1] != binary:
        checkout.report(CMAKE, line, f"the service's program is not called '{binary}'")


def init_script(checkout, names):
    path = f"service/{names.versioned}-service.rc"
    started, line = checkout.find(path, r"^service (\S+) (\S+)$")
    if started[2] != f"/vendor/bin/hw/{names.service.name}":
        checkout.report(path, line, f"starts {started[2]}, not {names.service.name} of Soong")
    if not started[1].startswith("vendor."):
        checkout.report(path, line, f"the name '{started[1]}' does not begin with 'vendor.'")
    # Without the base interface: of two services that claim it, init refuses one.
    expected = f"interface {names.versioned}::{names.interface} {names.instance}"
    options = [(number, " ".join(text.split())) for number, text in checkout.lines(path)]
    for number, option in options:
        if option.startswith("interface ") and option != expected:
            checkout.report(path, number, f"'{option}' is not the service's own interface")
    if expected not in [option for _, option in options]:
        checkout.report(path, line, f"lacks '{expected}'")
    given = {option.split()[0] for _, option in options}
    for option in ("class", "user", "group", "capabilities"):
        if option not in given:
            checkout.report(path, line, f"lacks '{option}'")


def vintf_fragment(checkout, names):
    path = f"service/{names.versioned}-service.xml"
    hal = declared_hal(checkout, path, names, ("manifest", {"type": "device"}))
    expect_text(checkout, path, hal, "transport", "hwbinder")


def compatibility_matrix(checkout, names):
    hal = declared_hal(checkout, MATRIX, names, ("compatibility-matrix", {"type": "framework"}))
    # A phone without the service would not pass otherwise.
    if hal.get("optional") != "true":
        checkout.report(MATRIX, hal.sourceline, "the HAL is not optional")


def declared_hal(checkout, path, names, expected):
    try:
        root = etree.fromstring(checkout.text(path).encode())
    except etree.XMLSyntaxError as error:
        raise Unreadable(f"{path}:{error.lineno}", error.msg) from None
    kind, attributes = expected
    if root.tag != kind or {name: root.get(name) for name in attributes} != attributes:
        checkout.report(path, root.sourceline, f"is no {kind} of {attributes}")
    hal = root.find("hal")
    if hal is None or len(root.findall("hal")) != 1:
        raise Unreadable(f"{path}:{root.sourceline}", "does not hold one hal")
    if hal.get("format") != "hidl":
        checkout.report(path, hal.sourceline, "the HAL's format is not hidl")
    for tag, value in (("name", names.package), ("version", names.version),
                       ("interface/name", names.interface),
                       ("interface/instance", names.instance)):
        expect_text(checkout, path, hal, tag, value)
    return hal


def expect_text(checkout, path, hal, tag, value):
    found = hal.findall(tag)
    for element in found:
        if element.text != value:
            checkout.report(path, element.sourceline, f"{tag} is '{element.text}', not '{value}'")
    if len(found) != 1:
        checkout.report(path, hal.sourceline, f"has {len(found)} times {tag}")


def contexts(checkout, name):
    """The entries of a file of contexts: line, what is labelled, and the label's type."""
    path = f"{POLICY}/{name}"
    for number, line in checkout.lines(path):
        words = line.split()
        label = words[-1].split(":")
        if len(words) != 2 or len(label) != 4:
            raise Unreadable(f"{path}:{number}", "is not NAME u:object_r:TYPE:s0")
        yield number, words[0], label[2]


def hwservice_context(checkout, names):
    """Without the version: the policy is the same for all versions."""
    path = f"{POLICY}/hwservice_contexts"
    entries = list(contexts(checkout, "hwservice_contexts"))
    name = f"{names.package}::{names.interface}"
    for number, labelled, label in entries:
        if labelled != name:
            checkout.report(path, number, f"labels {labelled}, not {name}")
        if f"type {label}, hwservice_manager_type" not in checkout.text(f"{POLICY}/hwservice.te"):
            checkout.report(path, number, f"hwservice.te declares no service '{label}'")
    if not entries:
        checkout.report(path, 1, f"lacks {name}")


def file_context(checkout, names):
    path = f"{POLICY}/file_contexts"
    escaped = names.service.name.replace(".", r"\.")
    expected = f"/(vendor|system/vendor)/bin/hw/{escaped}"
    entries = list(contexts(checkout, "file_contexts"))
    domain, _ = checkout.find(f"{POLICY}/bex_wifi.te", r"^init_daemon_domain\((\w+)\)")
    for number, labelled, label in entries:
        if "/hw/" in labelled and (labelled, label) != (expected, f"{domain[1]}_exec"):
            checkout.report(path, number, f"'{expected}' is not labelled {domain[1]}_exec")
    if not any("/hw/" in labelled for _, labelled, _ in entries):
        checkout.report(path, 1, f"lacks '{expected}'")


def makefiles(checkout, names):
    """The modules and files that the device's makefiles name exist."""
    known = {module.name for path in checkout.blueprints()
             for module in blueprint.read(checkout, path)}
    packages = [(number, word) for number, line in checkout.lines(PRODUCT)
                for word in line.split() if word not in ("PRODUCT_PACKAGES_DEBUG", "+=", "\\")]
    for number, package in packages:
        if package not in known:
            checkout.report(PRODUCT, number, f"no Android.bp has a module '{package}'")
    if names.service.name not in [package for _, package in packages]:
        checkout.report(PRODUCT, 1, f"lacks '{names.service.name}'")
    for path in board_files(checkout):
        if not (checkout.root / path).exists():
            checkout.report(BOARD, 1, f"there is no {path}")
    for path in (POLICY, MATRIX):
        if path not in board_files(checkout):
            checkout.report(BOARD, 1, f"does not add {path}")
    if board_files(checkout, "user"):
        checkout.report(BOARD, 1, "a user build gets something of it")


def board_files(checkout, variant="userdebug"):
    """What the device gets when another makefile includes the file."""
    board_config = f"""
BOARD_SEPOLICY_DIRS =
include {BOARD}
include /dev/null
print: ; @echo $(BOARD_SEPOLICY_DIRS) $(DEVICE_FRAMEWORK_COMPATIBILITY_MATRIX_FILE)
"""
    made = subprocess.run(["make", "-sf", "-", f"TARGET_BUILD_VARIANT={variant}"], cwd=checkout.root,
                          input=board_config, capture_output=True, text=True, check=False)
    if made.returncode != 0:
        raise Unreadable(f"{BOARD}:1", (made.stderr.splitlines() or ["make fails"])[0])
    return made.stdout.split()
