# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What can go wrong: one exception for each exit code of bex-wifi-client, and those of adb."""


class BexWifiError(Exception):
    """Anything that keeps a call from success. Its text is one line: the phone's serial number and the
    client's own words, or adb's.

    serial: the serial number
    words: the text without the serial number
    answer: what the client answered nevertheless (Answer, StopAnswer), or None
    radio_may_be_on: after a start, whether it may have started something
    may_go_on: whether the service's commands may still run
    """

    # Whether the call may have begun on the phone, where no answer says it.
    _may_have_begun = True

    def __init__(self, serial, words, answer=None):
        super().__init__(serial, words, answer)
        self.serial = serial
        # A phone's own output reaches the station's terminal and log.
        self.words = "".join(each if each.isprintable() else " " for each in str(words)).strip()
        self.answer = answer

    def __str__(self):
        return f"phone {self.serial}: {self.words}"

    @property
    def radio_may_be_on(self):
        return self._may_have_begun if self.answer is None else bool(self.answer.radio_may_be_on)

    @property
    def may_go_on(self):
        return self._may_have_begun if self.answer is None else self.answer.stage == "call"


class CommandFailed(BexWifiError):
    """Exit code 1: a command failed on the phone, the others ran. The service's log says which."""


class WrongUsage(BexWifiError):
    """Exit code 2: no such method, or wrong arguments. Nothing was called."""
    _may_have_begun = False


class NoService(BexWifiError):
    """Exit code 3: the service cannot be found. Nothing was called. `Phone.doctor` says why."""
    _may_have_begun = False


class NoClient(NoService):
    """There is no bex-wifi-client on the phone that could be run. Nothing was called."""


class TransportFailed(BexWifiError):
    """Exit code 4: the call broke off, usually because the service died."""


class DeadlinePassed(BexWifiError):
    """Exit code 5: no answer within the phone's timeout. The service's commands may still run."""


class NotWritten(BexWifiError):
    """Exit code 6: the client could not write its result."""


class NoCount(BexWifiError):
    """Exit code 7, and a reception whose answers hold no count of packets."""


class Interrupted(BexWifiError):
    """Exit codes 130 and 143: a signal ended the client on the phone."""


class NoAnswer(BexWifiError):
    """The connection ended before the answer came. Nobody knows what the phone has done; calls that had
    begun go on."""


class AdbFailed(BexWifiError):
    """adb cannot be run, or cannot talk to the phone. Nothing was called."""
    _may_have_begun = False


class UnknownPhone(AdbFailed):
    """adb knows no phone with this serial number: unplugged, or misspelt."""


class Offline(AdbFailed):
    """adb knows the phone, but it does not respond."""


class Unauthorised(AdbFailed):
    """The phone's user has not allowed this machine to use adb."""


class WrongClient(BexWifiError):
    """The phone's client is of another version, whose answers this kit does not understand."""


class NoLock(BexWifiError):
    """The phone's lock cannot be taken: its file cannot be opened. Nothing was called."""
    _may_have_begun = False


class RadioMayBeOn(BexWifiError):
    """The radio could not be switched off, or nothing proves that it is. The same words are on stderr.
    Restart the phone or take it away from the station."""


OF_EXIT_CODE = {
    1: CommandFailed, 2: WrongUsage, 3: NoService, 4: TransportFailed, 5: DeadlinePassed,
    6: NotWritten, 7: NoCount, 130: Interrupted, 143: Interrupted}
