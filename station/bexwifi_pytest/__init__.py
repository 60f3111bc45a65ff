# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""pytest for a station: tests run on phones, measure, and leave a report.

    pytest -p bexwifi_pytest plan.py --wifi-phone SERIAL --wifi-phone SERIAL -n 2 --wifi-report FOLDER

A test that takes the fixture `phone`, a bexwifi.Phone, runs once on every phone. With -n (pytest-xdist)
the phones go in parallel, and each has one test at a time. The fixture `measure` records a value:

    measure("packets", 948, unit="packets", low=950, high=1000)
    measure("packets", 948, unit="packets", low=950, at={"channel": 6, "rate": 54})

A value is a number, a boolean or a text; a number may have limits, which are good values themselves. The
test goes on after a missed limit, and fails at its end with a line for each. `measure` returns whether the
limits were kept.

A measurement with `at` is a point of a sweep: the page has a chart of each sweep, over the first key of
`at`, with a line for each value of the others.

A failure comes with the command lines that the service ran on the phone in that test. Ctrl-C and SIGTERM
switch every radio off first, and the report tells what has run.

FOLDER gets measurements.csv, junit.xml (measurements as properties) and report.html, one page with
everything in it. A file that cannot be written is told in one line, and pytest ends with 3.
"""

import pathlib
import sys
import tempfile

import pytest

import bexwifi

from . import phones
from .collector import Collector
from .interrupts import Interrupts, Workers
from .measurements import Measurement, MeasurementError, printable
from .servicelog import ServiceLog

MEASUREMENTS = pytest.StashKey()
LOG = pytest.StashKey()
INTERRUPTS = pytest.StashKey()


class LimitsMissed(pytest.fail.Exception):
    """Fails a test that has come to its end."""


def pytest_addoption(parser):
    group = parser.getgroup("wifi", "Wi-Fi radio tests on phones")
    group.addoption("--wifi-phone", action="append", default=[], metavar="SERIAL",
                    help="serial number of a phone, as adb has it; once for each phone")
    group.addoption("--wifi-report", type=pathlib.Path, metavar="FOLDER",
                    help="where measurements.csv, junit.xml and report.html go")


@pytest.hookimpl(hookwrapper=True, tryfirst=True)
def pytest_cmdline_main(config):
    """All tests of one phone go to one worker, whatever way of sharing them out was asked for."""
    options = config.option
    if getattr(options, "numprocesses", None) or getattr(options, "dist", "no") != "no":
        options.dist, options.distload = "loadgroup", False
    yield


def is_worker(config):
    """Whether this is a process of xdist that runs tests for another one, the controller."""
    return hasattr(config, "workerinput")


def pytest_configure(config):
    for name, module in sys.modules.items():
        if name.partition(".")[0] == "bexwifi":
            module.__tracebackhide__ = True  # a failure shows the plan's line, and the kit's words
    if is_worker(config):
        config.option.loadgroup = True  # a worker has its options from the command line alone


@pytest.hookimpl(tryfirst=True)
def pytest_sessionstart(session):
    config, options = session.config, session.config.option
    if options.collectonly:
        return
    config.stash[INTERRUPTS] = Interrupts()
    if is_worker(config):
        return
    phones.check(options.wifi_phone)
    if options.wifi_report:
        try:
            options.wifi_report.mkdir(parents=True, exist_ok=True)
            with tempfile.TemporaryFile(dir=options.wifi_report):
                pass  # told now, not after hours
        except OSError as error:
            raise pytest.UsageError(f"--wifi-report {options.wifi_report}: {error.strerror}") from None
        config.pluginmanager.register(
            Collector(options.wifi_phone, options.wifi_report.absolute(), config))
    if config.pluginmanager.hasplugin("dsession"):
        config.pluginmanager.register(Workers(config.pluginmanager.getplugin("dsession")))


@pytest.hookimpl(tryfirst=True)
def pytest_collection(session):
    if INTERRUPTS in session.config.stash:
        session.config.stash[INTERRUPTS].admit()


@pytest.hookimpl(hookwrapper=True)
def pytest_sessionfinish(session):
    """What ends a run is done to its end."""
    if INTERRUPTS in session.config.stash:
        session.config.stash[INTERRUPTS].ignored = True
    yield


def pytest_unconfigure(config):
    if INTERRUPTS in config.stash:
        config.stash[INTERRUPTS].restore()


@pytest.hookimpl(tryfirst=True)
def pytest_generate_tests(metafunc):
    if "phone" in metafunc.fixturenames:
        phones.parametrize(metafunc, metafunc.config.option.wifi_phone)


def pytest_report_teststatus(report):
    if getattr(report, "wifi_interrupted", False):
        return "interrupted", "I", "INTERRUPTED"
    return None


@pytest.fixture(scope="session")
def phone(request):
    """The bexwifi.Phone that the test runs on."""
    return bexwifi.Phone(request.param)


@pytest.fixture
def measure(request):
    """Records a measurement, see above. Returns whether it is within its limits."""
    item = request.node
    recorded = item.stash.setdefault(MEASUREMENTS, [])

    def record(name, value, unit="", low=None, high=None, at=None):
        try:
            measurement = Measurement.of(name, value, unit, low, high, at)
        except MeasurementError as error:
            raise pytest.fail.Exception(f"measure: {error}", pytrace=False) from None
        recorded.append(measurement)
        item.user_properties.extend(measurement.properties())
        return not measurement.missed

    return record


@pytest.hookimpl(tryfirst=True)
def pytest_runtest_setup(item):
    serial = getattr(item, "callspec", None) and item.callspec.params.get("phone")
    if serial:
        item.user_properties.append(("phone", printable(serial)))
        item.stash[LOG] = ServiceLog(serial)


@pytest.hookimpl(trylast=True)
def pytest_runtest_call(item):
    """After a test that has come to its end."""
    missed = missed_by(item)
    if missed:
        raise LimitsMissed("\n".join(missed), pytrace=False)


def missed_by(item):
    return [each.missed for each in item.stash.get(MEASUREMENTS, []) if each.missed]


@pytest.hookimpl(hookwrapper=True)
def pytest_runtest_makereport(item, call):
    report = (yield).get_result()
    if report.failed:
        missed = missed_by(item)
        if missed and call.when == "call" and not call.excinfo.errisinstance(LimitsMissed):
            report.sections.append(("Limits that were missed", "\n".join(missed)))
        lines = item.stash[LOG].lines() if LOG in item.stash else []
        if lines:
            report.sections.append(("The service's command lines", "\n".join(lines)))
        add_to(report, item, lines)
    else:
        add_to(report, item)


def add_to(report, item, log=(), interrupted=False):
    """What the collector needs besides: plain data, since xdist sends it to the controller."""
    report.wifi_measurements = [vars(each) for each in item.stash.get(MEASUREMENTS, [])]
    report.wifi_log = list(log)
    report.wifi_interrupted = interrupted


@pytest.hookimpl(hookwrapper=True)
def pytest_runtest_protocol(item):
    """pytest makes no report of a test that was interrupted."""
    outcome = yield
    if outcome.excinfo and issubclass(outcome.excinfo[0], KeyboardInterrupt):
        reason = (str(item.path), item.location[1], "Skipped: interrupted")
        report = pytest.TestReport(item.nodeid, item.location, {}, "skipped", reason, "teardown",
                                   user_properties=item.user_properties)
        add_to(report, item, interrupted=True)
        item.ihook.pytest_runtest_logreport(report=report)
