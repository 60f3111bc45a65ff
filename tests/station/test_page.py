# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The station's page in a browser: what it shows, and that it needs nothing and nobody."""

import math
import sys

import lxml.etree
import pytest

from bexwifi_pytest import page
from bexwifi_pytest.charts import Chart
from bexwifi_pytest.measurements import Measurement, printable
from bexwifi_pytest.results import Failure, Result, Results, Run
from support.browser import opened
from support.waiting import wait_for

HOSTILE = "</td><script>document.title='taken'</script><img src=http://example.invalid/>&amp;\"'$\\frac$\u202e"
COMMAND = 'cmd: "wl channel 6" unsuccessful execution'


def results_of(phone, text):
    """A sweep that missed a limit, and a test that failed at a command."""
    sweep = Result(phone, f"plan.py::test_sweep[{text}]", "failed", 1.25, [Failure(text, f"{text}\nall")],
                 measurements=[Measurement.of(text, 900 + 10 * channel + rate, "packets", 950, None,
                                              {"channel": channel, text: rate})
                               for channel in (1, 6, 11) for rate in (6, 54)])
    sweep.log = ["11-22 01:02:03.000 cmd: \"wl up\" successful execution", f"11-22 01:02:04.000 {COMMAND}"]
    mode = Result(phone, "plan.py::test_mode", "passed", 0.5, measurements=[
        Measurement.of("mode", 0, low=0, high=0), Measurement.of("version", text)])
    return [sweep, mode]


@pytest.fixture(scope="module", name="shown")
def shown_fixture(tmp_path_factory):
    folder = tmp_path_factory.mktemp("page")
    run = Run(["R1", HOSTILE, "R3"])
    run.interrupted = True
    run.results += [*results_of("R1", "rate"), *results_of(HOSTILE, printable(HOSTILE)), Result("R3", "plan.py::test_mode")]
    (folder / "report.html").write_text(page.html(run), encoding="utf-8")
    with opened(folder / "report.html", folder) as shown:
        yield shown


def rows(shown, selector):
    return shown.evaluate(f"[...document.querySelectorAll('{selector} tbody tr')].map("
                          "row => [...row.cells].map(cell => cell.innerText.trim()))")


def test_the_phones(shown):
    hostile = f"Phone {HOSTILE}"
    assert rows(shown, "#phones") == [
        ["Phone R1", "fail", "1", "1", "0", "0", "8"],
        [hostile, "fail", "1", "1", "0", "0", "8"],
        ["Phone R3", "incomplete", "0", "0", "0", "1", "0"]]
    assert "The run was interrupted" in shown.evaluate("document.querySelector('header').innerText")


@pytest.mark.parametrize("number, text", [(1, "rate"), (2, printable(HOSTILE))])
def test_the_measurements_of_a_phone(shown, number, text):
    sweep = f"plan.py::test_sweep[{text}]"
    assert rows(shown, f"#phone-{number} .measurements") == [
        [text, f"channel=1, {text}=6", "916", "packets", "950", "", "fail", sweep],
        [text, f"channel=1, {text}=54", "964", "packets", "950", "", "pass", sweep],
        [text, f"channel=6, {text}=6", "966", "packets", "950", "", "pass", sweep],
        [text, f"channel=6, {text}=54", "1014", "packets", "950", "", "pass", sweep],
        [text, f"channel=11, {text}=6", "1016", "packets", "950", "", "pass", sweep],
        [text, f"channel=11, {text}=54", "1064", "packets", "950", "", "pass", sweep],
        ["mode", "", "0", "", "0", "0", "pass", "plan.py::test_mode"],
        ["version", "", text, "", "", "", "", "plan.py::test_mode"]]


def test_the_results_of_a_phone(shown):
    assert rows(shown, "#phone-1 .tests") == [
        ["plan.py::test_sweep[rate]", "failed", "1.25", "rate"],
        ["plan.py::test_mode", "passed", "0.50", ""]]


def test_a_chart_of_each_sweep(shown):
    labels = "[...document.querySelectorAll('figure svg[role=img]')].map(each => each.ariaLabel)"
    assert shown.evaluate(labels) == ["rate over channel, 2 lines", f"{printable(HOSTILE)} over channel, 2 lines"]
    legend = "[...document.querySelectorAll('#phone-1 figure text')].map(each => each.textContent)"
    assert {"rate=6", "rate=54", "limit", "limit missed", "packets"} <= set(shown.evaluate(legend))


def test_a_chart_over_names_shows_them():
    chart = Chart("time", [Measurement.of("time", value, at={"standard": name})
                           for value, name in enumerate(["802.11b", "802.11ax", 7])])
    drawn = [each.text for each in lxml.etree.fromstring(chart.svg("a")).iter("{*}text")]
    assert drawn[:3] == ["802.11b", "802.11ax", "7"]


def test_a_sweep_without_a_number_has_no_chart():
    results = Results([Result("R1", "a", "passed", measurements=[
        Measurement.of("loss", value, at={"channel": 6}) for value in (math.nan, math.inf, "none")])])
    assert page.charts(results, "a") == []


def test_a_station_without_matplotlib_has_a_page(monkeypatch):
    monkeypatch.setitem(sys.modules, "matplotlib", None)
    run = Run(["R1"])
    run.results += results_of("R1", "rate")
    text = page.html(run)
    assert "No chart: python3-matplotlib is not installed." in text
    assert "<svg" not in text


@pytest.mark.filterwarnings("ignore:overflow:RuntimeWarning")
def test_a_sweep_that_cannot_be_drawn_leaves_the_page():
    run = Run(["R1"])
    run.results.append(Result("R1", "a", "passed", measurements=[
        Measurement.of("power", value, at={"channel": 6}) for value in (1e308, -1e308)]))
    text = page.html(run)
    assert "No chart: matplotlib cannot draw it: " in text
    assert "1e+308" in text


def test_the_command_lines_behind_a_failure(shown):
    lines = "[...document.querySelectorAll('#phone-1 .failure li')].map(each => each.textContent)"
    assert [line.partition(" cmd")[1:] for line in shown.evaluate(lines)] == [
        (" cmd", ': "wl up" successful execution'), (" cmd", COMMAND[3:])]
    assert shown.evaluate("document.querySelectorAll('#phone-1 .failure li.failed').length") == 1


def test_text_is_never_markup(shown):
    assert shown.evaluate("document.querySelectorAll('script, img').length") == 0
    assert shown.evaluate("document.title").startswith("fail: Wi-Fi radio tests")


def test_headers_and_ids(shown):
    assert shown.evaluate("document.querySelectorAll('th:not([scope]), table:not(:has(caption))').length") == 0
    ids = shown.evaluate("[...document.querySelectorAll('[id]')].map(each => each.id)")
    assert len(ids) == len(set(ids))
    used = ("[...document.querySelectorAll('use')].filter("
            "each => !document.getElementById(each.href.baseVal.slice(1))).length")
    assert shown.evaluate(used) == 0


def test_the_keyboard_is_enough(shown):
    focus = "document.activeElement.className || document.activeElement.localName"
    shown.press("Tab")
    assert shown.evaluate(focus) == "skip"
    assert shown.evaluate("document.activeElement.getBoundingClientRect().left >= 0")
    shown.press("Enter")
    wait_for(lambda: shown.evaluate("document.activeElement.id") == "results")
    for _ in range(10):
        shown.press("Tab")
        if shown.evaluate(focus) == "summary":
            break
    assert shown.evaluate("getComputedStyle(document.activeElement).outlineStyle") == "solid"
    opened_details = "document.activeElement.parentElement.open"
    assert not shown.evaluate(opened_details)
    shown.press("Enter")
    wait_for(lambda: shown.evaluate(opened_details))


def test_no_complaint_and_no_request(shown):
    assert shown.complaints == []
    assert [url for url in shown.requests if not url.startswith("data:")] == [
        shown.evaluate("document.URL").partition("#")[0]]
