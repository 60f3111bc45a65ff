# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Uses of the radio as `with` blocks, and how the kit makes sure that it is off afterwards."""

import dataclasses
import re
import sys
import time
import warnings

from bexwifi import signals
from bexwifi.errors import (
    AdbFailed, BexWifiError, CommandFailed, NoCount, RadioMayBeOn, WrongClient, WrongUsage)

# How often `stop` is tried, and the seconds in between.
STOPS = 3
PAUSE = 1


class EndedByStop(UserWarning):
    """A block's own stop failed, and `bex-wifi-client stop` then proved that the radio is off."""


@dataclasses.dataclass(frozen=True)
class Kind:
    """A use of the radio: what starts it, what ends it, and what proves with the answer 0 that it has
    ended (None: only `stop` can)."""
    name: str
    starts: str
    end: str
    proof: str


# What starts is told by the name, so that the client's list is the only one.
KINDS = (
    Kind("tone", r"RunTxStStart", "RunTxStStop", "RunTxStStop"),
    Kind("transmission", r"RunTx\w+Start", "RunTxStop", "RunTxStop"),
    Kind("reception", r"RunRx\w+Start", "RunRxStop", None),
    Kind("monitor mode", r"snifferStart", "snifferStop", "snifferStop"),
)


def kind_of(method):
    """What use of the radio a method starts; None when it starts none."""
    return next((kind for kind in KINDS if re.fullmatch(kind.starts, method)), None)


def stop(phone):
    """Calls `stop` once, for who holds the lock."""
    phone.lock.started = phone.lock.started or "stop"  # its calls go on when it is interrupted
    answer = phone.client.stop()
    phone.lock.started = ""
    return answer


@signals.undisturbed
def switch_off(phone):
    """Runs `stop` until the radio is proven off; waits for a phone that has gone. Otherwise raises
    RadioMayBeOn."""
    deadline = time.monotonic() + phone.timeout
    stops = STOPS
    while True:
        try:
            stop(phone)
            return
        except AdbFailed as error:  # nothing was called
            last, more = error, time.monotonic() < deadline
        except BexWifiError as error:
            stops -= 1
            last, more = error, stops > 0
        if not more:
            failure = RadioMayBeOn(phone.serial, f"THE RADIO MAY BE ON: {last.words}", last.answer)
            if sys.stderr is not None:
                print(f"bexwifi: {failure}", file=sys.stderr, flush=True)
            raise failure from last
        time.sleep(PAUSE)


@signals.undisturbed
def switch_off_after(phone, error):
    """Does so after an exception, if any; tells whether the radio is off. An exception that ends the
    program, such as KeyboardInterrupt, is not replaced by RadioMayBeOn, whose words are on stderr then."""
    try:
        switch_off(phone)
    except RadioMayBeOn:
        if error is None or isinstance(error, Exception):
            raise
        return False
    return True


def call(phone, method, arguments):
    """Calls a method that starts nothing, for who holds the lock."""
    lock = phone.lock
    try:
        answer = phone.client.call(method, arguments)
    except BaseException as error:
        if not isinstance(error, BexWifiError) or error.may_go_on:
            lock.started = method  # only `stop` waits for its end
        raise
    kind = kind_of(lock.started)
    if kind and kind.proof == method:
        lock.started = ""
    return answer


@signals.holds
def start(phone, method, arguments):
    """Calls a method that starts something, for who holds the lock. What may be on before is ended first,
    and what a failed start has begun afterwards."""
    lock = phone.lock
    if lock.user:
        raise WrongUsage(phone.serial, f"{method} inside the `with` block of {lock.user}: leave it first")
    if lock.started:
        switch_off(phone)
    lock.started = method
    try:
        return phone.client.call(method, arguments)
    except BaseException as error:
        if isinstance(error, BexWifiError) and not error.radio_may_be_on:
            lock.started = ""
        elif switch_off_after(phone, error) and isinstance(error, BexWifiError):
            error.words += "; it was switched off"
        raise


class Use:
    """A use of the radio, for one `with` statement. It holds the phone's lock meanwhile.

    started: the Answer of the start
    ended: the Answer of the method that ended it; None when that failed and `stop` did it
    """

    def __init__(self, phone, kind, method, arguments):
        self._phone = phone
        self._kind = kind_of(method)
        if self._kind is None or self._kind.name != kind:
            fitting = [name for name in phone.methods if kind_of(name) and kind_of(name).name == kind]
            raise WrongUsage(phone.serial, f"{method} starts no {kind}; there are {', '.join(fitting)}")
        self._method = method
        self._arguments = arguments
        self._end_arguments = self._arguments_of(self._kind.end)
        self.started = None
        self.ended = None

    def _arguments_of(self, end):
        """The start's arguments that the end takes, too."""
        try:
            return {each.name: self._arguments[each.name] for each in self._phone.methods[end].arguments}
        except KeyError as error:
            words = f"{self._method} cannot be ended by {end}: there is no {error}"
            raise WrongClient(self._phone.serial, words) from None

    @signals.holds
    def __enter__(self):
        lock = self._phone.lock.__enter__()
        self.started = self.ended = None
        try:
            self.started = start(self._phone, self._method, self._arguments)
            lock.user = self._method
            signals.checkpoint()
            return self
        except BaseException as error:
            self._leave(error)
            raise

    @signals.undisturbed
    def __exit__(self, kind, error, trace):
        self._leave(error)
        signals.leave(sys._getframe(1))  # pylint: disable=protected-access

    @signals.undisturbed
    def _leave(self, error):
        lock = self._phone.lock
        try:
            if self.started is not None:
                lock.user = None
                if lock.started:  # else the block has called phone.stop()
                    self._end(error)
        finally:
            lock.__exit__()

    def _end(self, error):
        """Ends the use. `error` is what the block raised."""
        problem = None
        try:
            self.ended = self._phone.client.call(self._kind.end, self._end_arguments)
        except BexWifiError as failure:
            problem = failure
        if problem is None and self._kind.proof and self._phone.lock.started == self._method:
            self._phone.lock.started = ""
            return
        if not switch_off_after(self._phone, error) or problem is None:
            return
        if error is None and not isinstance(problem, CommandFailed):
            raise problem
        warnings.warn(f"{problem}; the radio is off: `bex-wifi-client stop` ended it", EndedByStop)


class Reception(Use):
    """A reception, which counts packets."""

    @property
    def packets(self):
        """The packets received in the block, after it. Where the chip's counter goes on from an earlier
        reception, that part is subtracted. Raises NoCount when the answers do not say it."""
        if self.ended is None:
            raise NoCount(self._phone.serial, "the reception has no count: it has not ended, or not well")
        first = 0 if self.started.value == "ok" else self.started.count
        last = self.ended.count
        if first is None or last is None or last < first:
            raise NoCount(self._phone.serial, f"the answers hold no count: {self.started.value!r} at the "
                                              f"start, {self.ended.value!r} at the end")
        return last - first
