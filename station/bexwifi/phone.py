# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""A phone, and the calls to its service."""

import numbers

from bexwifi import radio
from bexwifi.client import Client
from bexwifi.errors import WrongUsage
from bexwifi.lock import PhoneLock

# In seconds. The client takes no more, and the kit gives it three decimals.
LEAST_TIMEOUT = 0.001
MOST_TIMEOUT = 1_000_000


class Phone:
    """A phone on adb.

    serial: as `adb devices` shows it
    timeout: seconds that a call takes at most, up to 1,000,000. The wait for the phone's lock does not count.
    lock: a context manager that keeps other programs away. Every call takes it; take it yourself where
        nobody may come between several calls.
    client: the same calls without lock and care; client.adb runs other commands

    All methods raise BexWifiError.
    """

    def __init__(self, serial, timeout=60):
        if not serial or not isinstance(serial, str):
            raise ValueError(f"a serial number is a text such as adb devices shows, not {serial!r}")
        self.serial = serial
        self.lock = PhoneLock.of(serial)
        self.client = Client(serial, _checked(timeout))
        self._methods = None

    @property
    def timeout(self):
        return self.client.timeout

    @timeout.setter
    def timeout(self, seconds):
        self.client.timeout = _checked(seconds)

    def __repr__(self):
        return f"Phone({self.serial!r})"

    @property
    def methods(self):
        """The methods of the interface by name (dict of Method), as the client lists them. Read once."""
        if self._methods is None:
            self._methods = self.client.list()
        return self._methods

    def call(self, method, *values, **named):
        """Calls a method and returns its Answer.

        Arguments are in the interface's order or have its names; numbers and bool become text.

            phone.call("RunTxStop", 6)
            phone.call("RunTxStop", channel=6)

        Leave starts to transmit(), tone(), receive() and monitor(), which also end them. A start that was
        called here goes on after the program's end, unless it failed: then the radio is switched off.
        """
        arguments = self._arguments(method, values, named)
        with self.lock:
            if radio.kind_of(method):
                return radio.start(self, method, arguments)
            return radio.call(self, method, arguments)

    def stop(self):
        """Ends whatever the radio does and returns a StopAnswer: the radio is proven off. Waits for calls
        that still run. CommandFailed: it is not proven."""
        with self.lock:
            return radio.stop(self)

    def doctor(self):
        """What keeps the service from working: a Doctor. Changes nothing."""
        with self.lock:
            return self.client.doctor()

    def transmit(self, method, *values, **named):
        """A Use of the radio for a `with` block: it transmits. The method is RunTxBGStart, RunTxNStart or
        RunTxAxStart, with its arguments."""
        return radio.Use(self, "transmission", method, self._arguments(method, values, named))

    def tone(self, *values, **named):
        """A Use of the radio for a `with` block: it sends a single tone. Arguments: of RunTxStStart."""
        arguments = self._arguments("RunTxStStart", values, named)
        return radio.Use(self, "tone", "RunTxStStart", arguments)

    def receive(self, method, *values, **named):
        """A Reception for a `with` block. The method is RunRxBgStart, RunRxNStart or RunRxAxStart, with
        its arguments. After the block it has the number of packets."""
        return radio.Reception(self, "reception", method, self._arguments(method, values, named))

    def monitor(self, *values, **named):
        """A Use of the radio for a `with` block: it is in monitor mode. Arguments: of snifferStart."""
        arguments = self._arguments("snifferStart", values, named)
        return radio.Use(self, "monitor mode", "snifferStart", arguments)

    def _arguments(self, method, values, named):
        """The texts of a method's arguments by name, in the interface's order."""
        if method not in self.methods:
            known = ", ".join(self.methods)
            raise WrongUsage(self.serial, f"there is no method {method}; there are {known}")
        names = [argument.name for argument in self.methods[method].arguments]
        given = dict(zip(names, values))
        if len(values) > len(names) or given.keys() & named.keys() or {*given, *named} != {*names}:
            raise WrongUsage(self.serial, f"{method} takes ({', '.join(names)}), each once")
        given.update(named)
        texts = {name: str(given[name]) for name in names}
        return {name: text.lower() if isinstance(given[name], bool) else text
                for name, text in texts.items()}


def _checked(timeout):
    if not isinstance(timeout, numbers.Real) or not LEAST_TIMEOUT <= timeout <= MOST_TIMEOUT:
        raise ValueError(f"a timeout is a number of seconds from {LEAST_TIMEOUT} to {MOST_TIMEOUT},"
                         f" not {timeout!r}")
    return float(timeout)
