# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Runs commands on a phone by the program `adb`: the one place that quotes, waits and knows adb's errors."""

import dataclasses
import shlex
import subprocess
import time

from bexwifi import signals
from bexwifi.errors import AdbFailed, NoAnswer, Offline, Unauthorised, UnknownPhone

# What adb needs in addition to the command's own deadline, and what it may take for anything else, in
# seconds.
ADB_TIMEOUT = 15
# The seconds in which a new server finds the phones on USB.
USB_TIMEOUT = 5
# How often adb is asked to find a phone that it has lost, and the seconds in between.
CONNECTIONS = 3
PAUSE = 0.5

# What adb prints when it has not run the command, and what to tell.
_NOT_RUN = (
    ("unauthorized", Unauthorised, "unauthorised: allow this machine's key on the phone's screen"),
    ("authorizing", Unauthorised, "unauthorised: allow this machine's key on the phone's screen"),
    ("no permissions", Unauthorised, "this user may not open its USB device; see adb devices -l"),
    ("offline", Offline, "offline: adb sees the phone, but it does not respond"),
    ("not found", UnknownPhone, "adb does not know it: see adb devices -l"),
)


@dataclasses.dataclass(frozen=True)
class Output:
    """What a command left: its exit code, and its output as text; bytes that are not UTF-8 are U+FFFD."""
    code: int
    stdout: str
    stderr: str


@signals.interruptible
def _communicate(process, timeout):
    return process.communicate(timeout=timeout)


class Adb:
    """The program adb for one phone."""

    def __init__(self, serial):
        self.serial = serial

    def shell(self, *words, timeout):
        """Runs a command on the phone; the words arrive there as they are. Returns its Output.

        timeout: seconds that the command takes at most; adb gets some more
        Raises AdbFailed when nothing was run, and NoAnswer when that is not known.
        """
        arguments = ("shell", " ".join(map(shlex.quote, words)))
        output = self.run(*arguments, timeout=timeout + ADB_TIMEOUT)
        failure = self._failure(output)
        for _ in range(CONNECTIONS):
            if not isinstance(failure, (UnknownPhone, Offline)) or not self._finds_again(output):
                break
            output = self.run(*arguments, timeout=timeout + ADB_TIMEOUT)
            failure = self._failure(output)
        if failure is not None:
            raise failure
        return output

    def run(self, *arguments, timeout=ADB_TIMEOUT):
        """Runs `adb -s SERIAL ARGUMENT...` without input and returns its Output. Ctrl-C at the terminal
        does not reach it.

        timeout: seconds after which it is ended
        Raises AdbFailed when it cannot be started, and NoAnswer at the end of the time.
        """
        return self._run("-s", self.serial, *arguments, timeout=timeout)

    @signals.holds
    def _run(self, *arguments, timeout=ADB_TIMEOUT):
        try:
            # pylint: disable-next=consider-using-with
            process = subprocess.Popen(
                ["adb", *arguments], stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                stderr=subprocess.PIPE, start_new_session=True)
        except FileNotFoundError as error:
            raise AdbFailed(self.serial, "there is no program adb: apt-get install adb") from error
        except (OSError, ValueError) as error:
            raise AdbFailed(self.serial, f"adb cannot be run: {error}") from error
        try:
            out, err = _communicate(process, timeout)
        except subprocess.TimeoutExpired as error:
            raise NoAnswer(self.serial, f"adb did not end within {timeout:g} seconds") from error
        finally:
            if process.returncode is None:
                process.kill()
                process.wait()
            process.stdout.close()
            process.stderr.close()
        signals.checkpoint()
        return Output(process.returncode, out.decode(errors="replace"), err.decode(errors="replace"))

    def _failure(self, output):
        """Why adb has not run the command; None when it has, or may have."""
        if output.code == 0 or output.stdout:
            return None
        for line in output.stderr.splitlines():
            if line.startswith(("error: ", "adb: ")):
                for words, kind, advice in _NOT_RUN:
                    if words in line:
                        return kind(self.serial, advice)
                if "cannot connect to daemon" in line:
                    return AdbFailed(self.serial, f"adb's server does not start: {line}")
        return None

    def _finds_again(self, output):
        """Whether adb may find the phone now. A server that was started again has forgotten the phones on
        the network, and needs a moment for those on USB."""
        try:
            if ":" in self.serial:
                self._run("disconnect", self.serial)
                if not self._run("connect", self.serial).stdout.startswith("connected"):
                    time.sleep(PAUSE)
                return True
            if "daemon started" in output.stderr:
                self.run("wait-for-device", timeout=USB_TIMEOUT)
                return True
        except NoAnswer:
            pass
        return False
