# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The program bex-wifi-client on a phone: its objects or exceptions for its output. Takes no lock."""

import json
import logging

from bexwifi import answers
from bexwifi.adb import Adb
from bexwifi.errors import OF_EXIT_CODE, BexWifiError, NoAnswer, NoClient, WrongClient

LOG = logging.getLogger("bexwifi")
PROGRAM = "bex-wifi-client"
# The least time for `stop`, in seconds: it waits for calls that still run.
STOP_TIMEOUT = 60


class Client:
    """The client of one phone; every run takes `timeout` seconds at most."""

    def __init__(self, serial, timeout):
        self.serial = serial
        self.timeout = timeout
        self.adb = Adb(serial)

    def list(self):
        """The methods by name."""
        return self._run(answers.methods, "list")

    def call(self, method, arguments):
        """The Answer of a method; the arguments are texts by name, in order."""
        return self._run(answers.answer, method, "--", *arguments.values())

    def stop(self):
        """The StopAnswer after which the radio is off."""
        return self._run(answers.stop_answer, "stop", timeout=max(self.timeout, STOP_TIMEOUT))

    def doctor(self):
        """The Doctor's report, whatever it found."""
        return self._run(answers.doctor, "doctor", accepted=(0, 1))

    def _run(self, read, *words, timeout=None, accepted=(0,)):
        """What `read` makes of the object that the client prints."""
        timeout = timeout or self.timeout
        output = self.adb.shell(PROGRAM, "--json", "--timeout", f"{timeout:.3f}", *words, timeout=timeout)
        try:
            members = json.loads(output.stdout)
        except (ValueError, RecursionError):
            raise self._silence(output, words) from None
        try:
            if members["schema_version"] != answers.SCHEMA_VERSION:
                raise ValueError(f"schema version {members['schema_version']}")
            code = answers.exit_code(members)
            answer = read(members)
        except (AttributeError, KeyError, OverflowError, TypeError, ValueError) as error:
            raise self._wrong_client(f"{words[0]}: {error}") from error
        LOG.debug("phone %s: %s: exit code %d", self.serial, " ".join(words), code)
        if code in accepted:
            return answer
        kind = OF_EXIT_CODE.get(code, BexWifiError)
        raise kind(self.serial, members.get("error", f"exit code {code}"), answer)

    def _silence(self, output, words):
        """The exception for a run without an object."""
        said = output.stderr.strip().splitlines() or [""]
        if output.code in (126, 127):
            return NoClient(self.serial, f"{PROGRAM} cannot be run: {said[-1]}")
        own = [line.partition(": ")[2] for line in said if line.startswith(f"{PROGRAM}: ")]
        if own and output.code == 2 and words[0] in ("list", "stop", "doctor"):
            return self._wrong_client(own[-1])
        if own and output.code in OF_EXIT_CODE:
            return OF_EXIT_CODE[output.code](self.serial, own[-1])
        printed = "what is not JSON" if output.stdout else "nothing"
        reason = said[-1] or f"adb ended with {output.code} and printed {printed}"
        return NoAnswer(self.serial, f"no answer: {reason}")

    def _wrong_client(self, why):
        return WrongClient(self.serial, f"its {PROGRAM} is of another version than this kit: {why}")
