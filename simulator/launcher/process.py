# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Runs the sandboxes: starts them, passes signals on, ends them.

    launcher    what the user started; waits for the holder and passes signals on to it
    holder      leads a session; the parent of the sandbox and of all that is orphaned in it
    sandbox     bwrap or proot, in another session
    inside      under bwrap in one more, under proot in the sandbox's

So no process group has members both inside and outside, and what runs inside has no controlling
terminal that it could type into. The holder ends all its children. Children that the launcher's
caller may have left to the launcher are not among them. The keeper of a phone that is on is also a
holder.
"""

import ctypes
import os
import select
import signal
import termios

from launcher import landlock
from launcher.errors import PhoneError
from launcher.sandbox import ENVIRONMENT, KINDS, command_line, writable

PR_SET_PDEATHSIG, PR_SET_CHILD_SUBREAPER = 1, 36  # from <linux/prctl.h>
QUIT_SECONDS = 5
INTERRUPTED = [128 + number for number in (signal.SIGHUP, signal.SIGINT, signal.SIGTERM)]

# The shell reports what cannot be run as adb's does: 127 not found, 126 not executable. proot takes
# death by a signal for success, so there the shell stays to turn it into 128 + n, whatever signal
# the group gets.
ENTRY = {"bwrap": 'exec "$@"', "proot": 'trap : HUP INT TERM; "$@"; exit $?'}


def run(kind, folder, command, streams=()):
    """The exit code of a command that runs inside a phone, 128 + n for signal n. `streams` replace
    the standard streams, standard input first."""
    sandbox = Sandbox(kind, folder, command, streams)
    terminal = _Terminal()
    launcher = os.getpid()
    block_signals()
    holder = os.fork()
    if holder == 0:
        _hold(launcher, sandbox)
    for number in Sandbox.HANDLERS:
        if signal.getsignal(number) != signal.SIG_IGN:  # what the caller ignores stays ignored
            signal.signal(number, lambda number, _frame: _pass_on(holder, number))
    unblock_signals()
    os.waitid(os.P_PID, holder, os.WEXITED | os.WNOWAIT)
    block_signals()  # pass on no signal once the next line has freed the holder's number
    status = os.waitpid(holder, 0)[1]
    terminal.restore()
    return _code(status)


def _hold(launcher, sandbox):
    """The holder: never returns, and ends with the launcher."""
    status = 125
    try:
        _prctl(PR_SET_PDEATHSIG, signal.SIGTERM)
        if os.getppid() == launcher:
            status = sandbox.hold()
    finally:
        os._exit(status)


def _pass_on(holder, number):
    os.kill(holder, number)
    if number == signal.SIGTSTP:
        os.kill(os.getpid(), signal.SIGSTOP)


def choose(folder):
    """Finds the sandbox that works here for the phone in `folder`."""
    refusals = []
    nothing = os.open(os.devnull, os.O_RDWR)
    for kind in KINDS:
        try:
            code = run(kind, folder, ["/system/bin/true"], [nothing] * 3)
            if code in INTERRUPTED:
                raise KeyboardInterrupt
            if code == 0:
                return kind
            refusals.append(f"{kind} is refused here")
        except PhoneError as error:
            refusals.append(str(error))
    raise PhoneError("no sandbox: " + "; ".join(refusals))


class _Terminal:
    """The modes of the terminal that the command gets, if it gets one: it may change them, and be
    killed before it can change them back."""

    def __init__(self):
        self.stream = next((stream for stream in range(3) if os.isatty(stream)), None)
        self.modes = None if self.stream is None else termios.tcgetattr(self.stream)

    def restore(self):
        """Does nothing if the terminal has gone, or belongs to another job by now."""
        try:
            if self.modes and os.tcgetpgrp(self.stream) == os.getpgrp():
                termios.tcsetattr(self.stream, termios.TCSANOW, self.modes)
        except (OSError, termios.error):
            pass


class Sandbox:
    """One command inside a phone, held by a process that has no other children."""

    def __init__(self, kind, folder, command, streams=()):
        self.kind = kind
        self.folder = folder
        self.line = command_line(kind, folder) + [
            "/system/bin/sh", "-c", ENTRY[kind], "sh", *command]
        self.streams = streams
        self.pid = 0
        self.ended_by = 0

    def hold(self, stop=None):
        """Runs the command and returns its exit code, 128 + n for signal n, once no process is
        left. What can be read from the descriptor `stop` ends it."""
        block_signals()
        os.setsid()
        _prctl(PR_SET_CHILD_SUBREAPER, 1)
        signal.signal(signal.SIGALRM, lambda _number, _frame: os.kill(self.pid, signal.SIGKILL))
        for number, handler in self.HANDLERS.items():
            signal.signal(number, lambda number, _frame, handler=handler: handler(self, number))
        self.pid = os.fork()
        if self.pid == 0:
            self._become()
        unblock_signals()
        self._wait(stop)
        block_signals()  # the next line frees the number
        status = os.waitpid(self.pid, 0)[1]
        _end_orphans()
        if os.WIFSIGNALED(status) and self.kind == "proot":
            for name in os.listdir("/tmp"):  # processes that a killed proot has left
                if name.startswith(f"prooted-{self.pid}-"):
                    os.remove(f"/tmp/{name}")
        return 128 + self.ended_by if self.ended_by else _code(status)

    def _become(self):
        """In the forked child: turns into the sandbox. Nothing of the caller is inherited except the
        three standard streams."""
        try:
            os.setsid()
            for number in signal.valid_signals() - {signal.SIGKILL, signal.SIGSTOP}:
                signal.signal(number, signal.SIG_DFL)
            unblock_signals()
            for number, stream in enumerate(self.streams):
                os.dup2(stream, number)
            if self.kind == "proot":
                landlock.confine(writable(self.folder))
                _stay_on_one_processor()
            os.closerange(3, os.sysconf("SC_OPEN_MAX"))
            os.execve(self.line[0], self.line, ENVIRONMENT)
        except OSError as error:
            os.write(2, f"phone: {self.line[0]}: {error.strerror}\n".encode())
        finally:
            os._exit(125)

    def _wait(self, stop):
        """Returns when the sandbox has ended; does not reap it."""
        ended = os.pidfd_open(self.pid)
        waiting = select.poll()
        waiting.register(ended, select.POLLIN)
        if stop is not None:
            waiting.register(stop, select.POLLIN)
        while ended not in dict(waiting.poll()):
            waiting.unregister(stop)
            self._end(signal.SIGTERM)
        os.close(ended)

    def _end(self, number):
        """Ends every process of the sandbox."""
        self.ended_by = number
        # proot ends what it traces on SIGQUIT only; bwrap's processes die with bwrap.
        os.kill(self.pid, signal.SIGQUIT if self.kind == "proot" else signal.SIGKILL)
        os.kill(self.pid, signal.SIGCONT)
        signal.alarm(QUIT_SECONDS)  # then SIGKILL

    def _signal(self, number):
        """Sends a signal to the process group in which the command was started."""
        if self.kind == "proot":
            os.killpg(self.pid, number)  # proot itself ignores what a terminal sends
            return
        # A child of bwrap leads it, whose number is its own for as long as bwrap cannot reap it.
        os.kill(self.pid, signal.SIGSTOP)
        state = os.waitid(os.P_PID, self.pid, os.WSTOPPED | os.WEXITED | os.WNOWAIT)
        if state.si_code != os.CLD_STOPPED:
            return  # the command has ended
        reached = False
        for child in _children(self.pid):
            try:
                os.killpg(child, number)
                reached = True
            except ProcessLookupError:
                pass  # it does not lead a session yet
        os.kill(self.pid, signal.SIGCONT)
        if not reached and number in (signal.SIGINT, signal.SIGQUIT):
            self._end(number)

    def _suspend(self, _number):
        self._signal(signal.SIGSTOP)

    HANDLERS = {
        signal.SIGINT: _signal,
        signal.SIGQUIT: _signal,
        signal.SIGTERM: _end,
        signal.SIGHUP: _end,
        signal.SIGTSTP: _suspend,
        signal.SIGCONT: _signal,
    }


def block_signals():
    signal.pthread_sigmask(signal.SIG_BLOCK, signal.valid_signals())


def unblock_signals():
    signal.pthread_sigmask(signal.SIG_SETMASK, ())


def _prctl(option, value):
    ctypes.CDLL(None).prctl(option, value, 0, 0, 0)


def _stay_on_one_processor():
    """proot and what it traces wait for each other at each system call. On one processor they wake each
    other several times as fast."""
    allowed = sorted(os.sched_getaffinity(0))
    os.sched_setaffinity(0, {allowed[os.getpid() % len(allowed)]})


def _children(process):
    with open(f"/proc/{process}/task/{process}/children", encoding="ascii") as children:
        return [int(child) for child in children.read().split()]


def _end_orphans():
    """Kills all children, and theirs in turn, and returns when they are gone."""
    while True:
        for child in _children(os.getpid()):
            os.kill(child, signal.SIGKILL)
        try:
            os.wait()
        except ChildProcessError:
            return


def _code(status):
    return os.waitstatus_to_exitcode(status) if os.WIFEXITED(status) else 128 + status % 128
