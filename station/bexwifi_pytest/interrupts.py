# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Ctrl-C, SIGTERM and SIGHUP end a run in good order: every radio off, and what has run in the report.

The first signal interrupts the test that runs; its `with` blocks switch the radio off. Further ones do
nothing, so that they do not interrupt that, nor the report: Ctrl-C at a terminal reaches xdist's workers
twice, from the terminal and from the controller.
"""

import queue
import signal
import time

import pytest

from bexwifi import signals

# Seconds that xdist's workers get to switch their radios off; the kit gives up earlier.
PATIENCE = 600


class Interrupts:
    """Handles the signals of this process until restore(). They wait for admit(), and so they do in
    xdist's workers, which the controller starts meanwhile: Python cannot start with a KeyboardInterrupt
    in the middle, and before that pytest makes no report.

    ignored: whether they do nothing from here on
    """

    def __init__(self):
        self.ignored = False
        self.before = {}
        signal.pthread_sigmask(signal.SIG_BLOCK, signals.NUMBERS)
        for number in signals.NUMBERS:
            if signal.getsignal(number) != signal.SIG_IGN:  # as under nohup
                self.before[number] = signal.signal(number, self._interrupt)

    def _interrupt(self, _number, _frame):
        if not self.ignored:
            self.ignored = True
            raise KeyboardInterrupt

    @staticmethod
    def admit():
        signal.pthread_sigmask(signal.SIG_UNBLOCK, signals.NUMBERS)

    def restore(self):
        self.admit()
        for number, handler in self.before.items():
            signal.signal(number, handler)


class Workers:
    """A plugin of xdist's controller. When the run ends early, it interrupts what the workers do, and
    takes their reports until the last one has ended. By itself the controller would take no more
    reports, and kill a worker that needs more than some seconds."""

    def __init__(self, dsession):
        self.dsession = dsession
        self.running = set()

    @pytest.hookimpl(hookwrapper=True, optionalhook=True)
    def pytest_xdist_newgateway(self):
        """With -v xdist first asks a new worker about its Python, and the tests may then run outside the
        worker's main thread, where the kit cannot see a signal."""
        options = self.dsession.config.option
        verbose, options.verbose = options.verbose, 0
        yield
        options.verbose = verbose

    @pytest.hookimpl(optionalhook=True)
    def pytest_testnodeready(self, node):
        self.running.add(node)

    @pytest.hookimpl(optionalhook=True)
    def pytest_testnodedown(self, node):
        self.running.discard(node)

    @pytest.hookimpl(tryfirst=True)
    def pytest_sessionfinish(self):
        for node in self.running:
            node.gateway._io.popen.send_signal(signal.SIGINT)  # execnet has no other way to tell
        deadline = time.monotonic() + PATIENCE
        while self.running and time.monotonic() < deadline:
            try:
                name, event = self.dsession.queue.get(timeout=1)
            except queue.Empty:
                # The signal may have come just when the controller had taken a worker's last word.
                self.running = {node for node in self.running if not node.channel.isclosed()}
                continue
            if name == "testreport":
                self.dsession.worker_testreport(**event)
            elif name in ("workerfinished", "errordown"):
                self.running.discard(event["node"])
