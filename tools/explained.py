# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The command lines of calls, as the explain program prints them; it runs none of them.

    for phone in phones(explain, folder):
        phone.lines([("RunTxStop", "6")])    # [["myftm -t 0 ", ...]]
"""

import dataclasses
import json
import os
import pathlib
import re
import subprocess

SIMULATOR = pathlib.Path(__file__).resolve().parents[1] / "simulator"


def run(*command, root=None, asked=""):
    environment = {**os.environ, "HIDL_HOST_ROOT": str(root)}
    return subprocess.run(command, env=environment, check=True, input=asked,
                          stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True).stdout


@dataclasses.dataclass(frozen=True)
class Argument:
    """An argument of a method, from the client's table."""
    name: str
    # "string" or "bool".
    type: str
    meaning: str
    # None where there is none.
    unit: str
    accepted: str

    def accepted_numbers(self):
        """The numbers among the accepted forms: ["20", "40", "80"]."""
        return re.findall(r"\d+(?:\.\d+)?", self.accepted)

    def choices(self):
        """All accepted forms where they are a few: ["true", "false"]; else none."""
        if self.type == "bool":
            return ["true", "false"]
        return self.accepted_numbers() if re.fullmatch(r"[\d., ]+or [\d.]+", self.accepted) else []


@dataclasses.dataclass(frozen=True)
class Method:
    name: str
    arguments: tuple


def methods(explain):
    """The interface's methods, in its order."""
    return read_methods(run(explain, "methods"))


def read_methods(listed):
    """The methods in what the client's `list --json` prints."""
    listed = json.loads(listed)["methods"]
    return [Method(method["name"], tuple(Argument(**each) for each in method["arguments"]))
            for method in listed]


@dataclasses.dataclass(frozen=True)
class Phone:
    """A simulated phone that is switched off."""
    explain: pathlib.Path
    root: pathlib.Path

    @classmethod
    def create(cls, explain, name, folder):
        run(SIMULATOR / "phone", "create", name, folder)
        return cls(explain, pathlib.Path(folder) / "root")

    def value(self, name):
        return re.search(rf"^{re.escape(name)}=(.*)$", self._properties().read_text(), re.M)[1]

    def with_chip(self, name):
        """Gives the phone's chip another name."""
        text = re.sub(r"^(ro\.hardware\.wlan\.chip)=.*$", rf"\1={name}",
                      self._properties().read_text(), flags=re.M)
        self._properties().write_text(text)
        return self

    def family(self):
        return run(self.explain, "family", root=self.root).strip()

    def lines(self, calls):
        """The command lines of each call. Modules come in the order of their folder, which the file
        system makes up: here they are sorted."""
        asked = "".join("\t".join(call) + "\n" for call in calls)
        answers = iter(run(self.explain, "-", root=self.root, asked=asked).split("\n"))
        return [sorted_modules(list(iter(lambda: next(answers), ""))) for _ in calls]

    def _properties(self):
        return self.root / "vendor/build.prop"


def sorted_modules(lines):
    modules = iter(sorted(line for line in lines if "insmod " in line))
    return [next(modules) if "insmod " in line else line for line in lines]


def phones(explain, folder):
    """A phone of each family by its name, made in the folder."""
    names = sorted(path.name for path in (SIMULATOR / "phones").iterdir())
    return {name: Phone.create(explain, name, pathlib.Path(folder) / name) for name in names}
