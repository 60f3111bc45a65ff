# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Brings together what all tests have found, in whichever process they ran, and writes the report."""

import pytest

from . import files, page, phones
from .junit import Junit
from .measurements import Measurement, printable
from .results import Failure, Result, Run

UNWRITTEN = 3  # pytest's exit code when the report could not be written


class Collector:
    """A plugin of the process that reports: of the only one, or of xdist's controller.

    problems: why a file of the report could not be written, one line for each
    """

    def __init__(self, serials, folder, config):
        self.serials = serials
        self.folder = folder
        self.run = Run([printable(serial) for serial in serials])
        self.results = {}  # by the test's whole name
        self.problems = []
        self.junit = Junit(folder / "junit.xml", config)
        config.pluginmanager.register(self.junit)

    def pytest_collection_finish(self, session):
        self.expect(item.nodeid for item in session.items)

    @pytest.hookimpl(optionalhook=True)
    def pytest_xdist_node_collection_finished(self, ids):
        self.expect(ids)

    def expect(self, nodeids):
        for nodeid in nodeids:
            self.result(phones.without_group(nodeid))

    def result(self, nodeid):
        if nodeid not in self.results:
            self.results[nodeid] = Result(*map(printable, phones.split(nodeid, self.serials)))
            self.run.results.append(self.results[nodeid])
        return self.results[nodeid]

    def pytest_collectreport(self, report):
        if report.failed:
            fail(self.result(report.nodeid), report)

    @pytest.hookimpl(tryfirst=True)
    def pytest_runtest_logreport(self, report):
        report.nodeid = phones.without_group(report.nodeid)
        result = self.result(report.nodeid)
        result.duration += report.duration
        if hasattr(report, "wifi_measurements"):  # not when the worker that ran it died
            result.measurements = [Measurement(**each) for each in report.wifi_measurements]
            result.log += map(printable, report.wifi_log)
        if report.failed:
            fail(result, report)
        elif report.skipped and result.outcome != "failed":
            result.outcome = "interrupted" if report.wifi_interrupted else "skipped"
            result.reason = printable(getattr(report, "wasxfail", "") or reason_of(report))
        elif report.when == "call":
            result.outcome = "passed"

    @pytest.hookimpl(trylast=True)
    def pytest_sessionfinish(self, session, exitstatus):
        self.run.interrupted = exitstatus == pytest.ExitCode.INTERRUPTED
        self.problems = [self.junit.problem] if self.junit.problem else []
        for name, text in [("measurements.csv", files.measurements_csv), ("report.html", page.html)]:
            path = self.folder / name
            try:
                files.write(path, text(self.run))
            except OSError as error:
                self.problems.append(f"cannot write {path}: {error.strerror}")
        if self.problems:
            session.exitstatus = UNWRITTEN

    def pytest_terminal_summary(self, terminalreporter):
        for problem in self.problems:
            terminalreporter.write_line(f"wifi report: {problem}", red=True)
        if not self.problems:
            terminalreporter.write_line(f"wifi report: {self.folder / 'report.html'}")


def fail(result, report):
    text = printable(report.longrepr).strip()  # longreprtext begins with the worker
    crash = getattr(report.longrepr, "reprcrash", None)
    lines = (printable(crash.message).strip() if crash else text).split("\n")
    # Of a plan that cannot be read the exception comes last.
    line = lines[-1 if report.when == "collect" and not crash else 0]
    result.outcome = "failed"
    result.failures.append(Failure(line, text))


def reason_of(report):
    """Of a skipped test: pytest has it as (file, line, "Skipped: reason")."""
    return report.longrepr[2].partition(": ")[2] if isinstance(report.longrepr, tuple) else ""
