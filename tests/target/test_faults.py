# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""That the target test finds faults: it runs against services with one fault each.

BEX_TARGET_TEST names the program, BEX_FAULTY_SERVICE the services. Each test has an empty phone of
its own, in which the service is declared. Nothing here reaches a radio, so nothing is disrupted.
"""

import os
import pathlib
import re
import shutil
import subprocess
import tempfile

import pytest

TARGET_TEST = os.environ["BEX_TARGET_TEST"]
FAULTY_SERVICE = os.environ["BEX_FAULTY_SERVICE"]
ROOT = pathlib.Path(__file__).resolve().parents[2]
PROGRAM = "vendor.korvan.bex.wifi@1.0-disruptive-target-test: "

# Each fault with the only tests that may find it, and must.
FOUND_BY = {
    "started": {"AnswersEveryMethod", "AnswersEmptyArguments", "AnswersArgumentsThatAreNoNumbers",
                "AnswersNumbersAtTheEdges", "AFailureLeavesTheNextCallAlone",
                "TellsOneModeByBothMethods", "AnswersTwoClientsAtOnce"},
    "ax-started": {"AnswersEveryMethod", "AnswersEmptyArguments", "AnswersNumbersAtTheEdges",
                   "AnswersArgumentsThatAreNoNumbers"},
    "mode": {"AnswersEveryMethod", "TellsOneModeByBothMethods", "EntersAndLeavesMonitorMode",
             "AnswersMoreClientsThanItHasThreads"},
    "mimo": {"AlwaysSaysTheSameOfMimo", "AnswersAShortCallBesideALongOne"},
    "sniffer": {"TellsOneModeByBothMethods", "EntersAndLeavesMonitorMode"},
    "never-monitor": {"EntersAndLeavesMonitorMode"},
    "always-monitor": {"EntersAndLeavesMonitorMode"},
    "stays-broken": {"AFailureLeavesTheNextCallAlone"},
    "not-frozen": {"ServesAFrozenInterface"},
    "no-chain": {"IsTheInterfaceThatItSays"},
}

# Faults that a call of most tests meets, with a test that must find them and what it says.
SHOWN_BY = {
    "status": ("AnswersMoreClientsThanItHasThreads",
               r'RunTxStop\("36"\) answered "1", not 0 or -1'),
    "received": ("AnswersEveryMethod", r'RunRxStop\("6"\) answered "Rx: 5\n", not'),
    "count": ("AnswersEveryMethod", r'RunRxStop\("6"\) answered "5 packets", not'),
    "silent": ("AnswersEveryMethod", r'RunRxNStart\("149", "40", "7", false, "2"\)$'),
    "dies": ("AnswersEveryMethod", r"DEAD_OBJECT"),
    "dies-of-empty": ("AnswersEmptyArguments", r"DEAD_OBJECT"),
    "dies-of-text": ("AnswersArgumentsThatAreNoNumbers", r"DEAD_OBJECT"),
    "dies-of-1000": ("AnswersNumbersAtTheEdges", r"DEAD_OBJECT"),
}


@pytest.fixture(name="phone", autouse=True)
def phone_fixture(monkeypatch):
    # pytest's own folders have names too long for a socket's path.
    with tempfile.TemporaryDirectory() as folder:
        root = pathlib.Path(folder)
        (root / "dev/socket").mkdir(parents=True)
        manifests = root / "vendor/etc/vintf/manifest"
        manifests.mkdir(parents=True)
        shutil.copy(ROOT / "service/vendor.korvan.bex.wifi@1.0-service.xml", manifests)
        monkeypatch.setenv("HIDL_HOST_ROOT", folder)
        yield root


@pytest.fixture(name="serve")
def serve_fixture():
    """Starts the service with a fault."""
    started = []

    def serve(fault):
        process = subprocess.Popen([FAULTY_SERVICE, fault], stdout=subprocess.PIPE)
        started.append(process)
        assert process.stdout.readline() == b"ready\n"

    yield serve
    for process in started:
        process.kill()
        process.communicate()


def run(*options):
    done = subprocess.run([TARGET_TEST, *options], stdin=subprocess.DEVNULL, capture_output=True,
                          check=False, timeout=60)
    done.stdout, done.stderr = done.stdout.decode(), done.stderr.decode()
    return done


def run_test(test):
    return run("--disrupts-wifi", f"--gtest_filter=*.{test}/*")


def failed_tests(done):
    return set(re.findall(r"^\[  FAILED  \] PerInstance/DisruptiveWifiTest\.(\w+)/0_default",
                          done.stdout, re.MULTILINE))


def only_line(done):
    """The one line on stderr, without the program's name."""
    lines = done.stderr.splitlines()
    assert len(lines) == 1 and lines[0].startswith(PROGRAM)
    return lines[0][len(PROGRAM):]


@pytest.mark.parametrize("healthy", ["none", "counts", "broken-radio"])
def test_a_service_without_faults(serve, healthy):
    serve(healthy)
    done = run("--disrupts-wifi")
    assert done.returncode == 0, done.stdout
    assert "DISRUPTS WI-FI" in done.stderr


@pytest.mark.parametrize("fault", FOUND_BY)
def test_a_fault_is_found(serve, fault):
    serve(fault)
    done = run("--disrupts-wifi")
    assert done.returncode == 1
    assert failed_tests(done) == FOUND_BY[fault]


@pytest.mark.parametrize("fault", SHOWN_BY)
def test_a_fault_is_shown(serve, fault):
    serve(fault)
    test, text = SHOWN_BY[fault]
    done = run_test(test)
    assert done.returncode == 1
    assert failed_tests(done) == {test}
    assert re.search(text, done.stdout, re.MULTILINE), done.stdout


def test_a_hanging_call_ends_the_program(serve):
    serve("hangs")
    done = run("--disrupts-wifi", "--deadline=1")
    assert done.returncode == 1
    assert done.stderr.splitlines()[-1] == \
        PROGRAM + 'gave up: RunTxStop("6") has not answered for 1 s'


def test_a_declared_service_that_does_not_run():
    done = run("--disrupts-wifi", "--deadline=1")
    assert done.returncode == 1
    # The runtime tells of its wait at about the same moment.
    assert [line for line in done.stderr.splitlines()
            if line.startswith(PROGRAM + 'gave up: getService("default")')]


def test_an_undeclared_service_fails(serve, phone):
    serve("none")
    shutil.rmtree(phone / "vendor/etc/vintf")
    done = run("--disrupts-wifi")
    assert (done.returncode, done.stdout) == (1, "")
    assert only_line(done) == "the VINTF manifest declares no instance of " \
        "vendor.korvan.bex.wifi@1.0::IWifiService"


def test_it_does_not_run_by_accident(serve):
    serve("dies")
    done = run()
    assert (done.returncode, done.stdout) == (2, "")
    assert "runs only with --disrupts-wifi" in only_line(done)


def test_without_consent_it_tells_what_it_would_run():
    listed = run("--gtest_list_tests")
    assert (listed.returncode, listed.stderr) == (0, "")
    assert "AnswersEveryMethod/0_default" in listed.stdout
    helped = run("--help")
    assert (helped.returncode, helped.stderr) == (0, "")
    assert "--disrupts-wifi" in helped.stdout


@pytest.mark.parametrize("option", ["--disrupt-wifi", "now", "--deadline=", "--deadline=0",
                                    "--deadline=-1", "--deadline=1.5", "--deadline=1000000"])
def test_wrong_usage(serve, option):
    serve("dies")
    done = run("--disrupts-wifi", option)
    assert (done.returncode, done.stdout) == (2, "")
    assert option in only_line(done)
