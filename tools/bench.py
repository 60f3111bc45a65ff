#!/usr/bin/env python3
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Runs the benchmarks and prints each figure beside its floor; docs/performance.md explains them.

usage: bench.py BUILD [--short | --smoke | --write]
"""

import argparse
import datetime
import json
import math
import os
import pathlib
import platform
import re
import subprocess
import sys
import tempfile

import script

ROOT = pathlib.Path(__file__).resolve().parents[1]
DOCUMENT = ROOT / "docs/performance.md"
MIB = 1024 * 1024
# Linked into the service besides the generated stubs and the host layer.
OWN_OBJECTS = ("service/CMakeFiles", "suites/CMakeFiles", "sniffer/CMakeFiles", "shell/CMakeFiles")


class Failure(Exception):
    """What is printed on one line."""


def run(command, **options):
    done = subprocess.run(command, stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True,
                          check=False, **options)
    if done.returncode != 0:
        last = (done.stderr.strip() or "no message").splitlines()[-1]
        raise Failure(f"{pathlib.Path(str(command[0])).name}: {last}")
    return done.stdout


class Medians:
    """The medians of a program's benchmarks, by their names."""

    def __init__(self, found):
        self._found = found

    def __call__(self, name, key="real_time"):
        return self._found[name][key]

    def cases(self, kind):
        """The second parts of the names that begin with `kind`, as in kind/case/1."""
        names = [name.split("/") for name in self._found]
        return list(dict.fromkeys(parts[1] for parts in names if parts[0] == kind))


def medians(program, repetitions, min_time, only=".", wrapper=()):
    """Runs a program's benchmarks, interleaved, as often as told."""
    with tempfile.NamedTemporaryFile(suffix=".json") as out:
        run([*wrapper, program, f"--benchmark_filter={only}", f"--benchmark_repetitions={repetitions}", f"--benchmark_min_time={min_time}",
             "--benchmark_enable_random_interleaving=true", "--benchmark_report_aggregates_only=true",
             f"--benchmark_out={out.name}", "--benchmark_out_format=json"])
        results = json.load(open(out.name, encoding="utf-8"))["benchmarks"]
    for result in results:
        if result.get("error_occurred"):
            raise Failure(f"{result['name']}: {result['error_message']}")
    return Medians({
        re.sub(r"/(manual_time|real_time|iterations:\d+)", "", result["run_name"]): result
        for result in results if result.get("aggregate_name") == "median"})


def counts(build):
    """Callgrind's instruction counts: {(kind, name...): count}."""
    with tempfile.TemporaryDirectory() as folder:
        run(["valgrind", "-q", "--tool=callgrind", "--collect-atstart=no",
             f"--callgrind-out-file={folder}/out", build / "benchmarks/instructions"],
            env={"LD_BIND_NOW": "1"})
        found = {}
        for dump in pathlib.Path(folder).iterdir():
            text = dump.read_text(encoding="utf-8")
            name = re.search(r"^desc: Trigger: Client Request: (.+)$", text, re.M)
            total = re.search(r"^(?:totals|summary): (\d+)$", text, re.M)
            if name and total:
                found[tuple(name[1].split())] = int(total[1])
    return found


class Table:
    """The figures, and whether all limits are kept."""

    def __init__(self):
        self.rows = []
        self.missed = False

    def at_most(self, figure, floor, limit, measured, unit=""):
        self._add(figure, floor, f"at most {limit:,g}{unit}", measured, unit, measured <= limit)

    def at_least(self, figure, floor, limit, measured):
        self._add(figure, floor, f"at least {limit:g}", measured, "", measured >= limit)

    def recorded(self, figure, floor, text):
        self.rows.append((figure, floor, "recorded", text, ""))

    def _add(self, figure, floor, limit, measured, unit, reached):
        text = (f"{measured:,.0f}" if measured >= 100 else
                f"{measured:.2f}" if measured >= 0.1 else f"{measured:.4f}")
        self.rows.append((figure, floor, limit, text + unit, "" if reached else "MISSED"))
        self.missed = self.missed or not reached

    def __str__(self):
        head = ("figure", "floor", "to reach", "measured", "")
        lines = [head, ("---",) * 5, *self.rows]
        return "\n".join("| " + " | ".join(line) + " |" for line in lines)


def instructions(table, found):
    switches = found["switches", "1"]
    worst = {}
    for name, count in found.items():
        if name[0] == "lines":
            lines = int(name[3])
            worst[name[1]] = max(worst.get(name[1], (0, "")), (count / lines - switches, name[2]))
    for chip, (count, method) in worst.items():
        table.recorded(f"own instructions per command line, {chip}: worst is {method}", "-",
                       f"{count:,.0f}")


def growth(table, found):
    """What growing outputs cost, in instructions: repeatable, so a check for CI."""
    table.at_most("instructions to read 1 MB of output", "the bare loop", 1.1,
                  found["output", "runCommand", "1024"] / found["output", "floor", "1024"])
    for name, count in found.items():
        if name[0] in ("packets", "replace") and name[2] == "1024":
            table.at_most(f"instructions, {name[0]} {name[1]}, 1 MB", "the same with 256 KB", 5,
                          count / found[name[0], name[1], "256"])


def shell(table, build, repetitions, min_time):
    time = medians(build / "benchmarks/shell-bench", repetitions, min_time)
    for form in time.cases("own"):
        table.at_most(f"own work for a line, {form}", "a bare loop's line that does nothing", 0.01,
                      time(f"own/{form}", "p50"))
    table.at_most("a line that does nothing", "a bare popen, fgets, pclose loop", 1.02,
                  time("nothing", "p50"))
    table.at_most("a tool that prints 100 MB", "the same loop into a string", 1.10,
                  time("output/service") / time("output/floor"))
    table.at_most("an operation of 20 lines that do nothing", "20 bare loops", 1.03,
                  time("operation", "p50"))
    table.at_most("peak memory with 100 MB", "the output", 2.1, time("peak", "outputs"))


def texts(table, build, repetitions, min_time):
    time = medians(build / "benchmarks/text-bench", repetitions, min_time)

    def cpu(name):
        return time(name, "cpu_time")

    table.at_most("newlines replaced in 16 MB", "1 MB", 20, cpu("replace/16") / cpu("replace/1"))
    for chip in time.cases("packets"):
        for place in ("start", "end"):
            name = f"packets/{chip}/{place}"
            table.at_most(f"packet count from 16 MB, {chip}, label at the {place}", "a copy", 10,
                          cpu(f"{name}/16") / cpu("copy/16"))
            table.at_most(f"the same, beside 1 MB, {chip}, {place}", "1 MB", 20,
                          cpu(f"{name}/16") / cpu(f"{name}/1"))


def calls(table, build, repetitions, min_time):
    program = build / "benchmarks/call-bench"
    # On one processor: otherwise the result would depend on where the scheduler puts the two processes.
    one = str(min(os.sched_getaffinity(0)))
    value = medians(program, repetitions, min_time, "latency", ("taskset", "-c", one))
    for key, limit in (("p50", 1.4), ("p99", 2)):
        table.at_most(f"a call that runs no command, {key}", "a bare ping-pong", limit,
                      value("latency", key))
    value = medians(program, repetitions, min_time, "clients")
    for clients in (2, 64):
        table.at_least(f"throughput, {clients} clients", "the ping-pong's with as many", 0.6,
                       value(f"clients/service/{clients}", "items_per_second") /
                       value(f"clients/floor/{clients}", "items_per_second"))


def start(table, build, repetitions, min_time):
    value = medians(build / "benchmarks/start-bench", repetitions, min_time)
    table.at_most("start to first answered call", "an empty program and one ping-pong", 1.5,
                  value("start/service") / value("start/floor"))
    extra = value("start/service", "resident") - value("start/floor", "resident")
    table.at_most("resident memory of the idle service", "beyond the empty program's", 1,
                  extra / MIB, " MiB")


def station(table, build, repetitions, min_time):
    calls_of_each = repetitions * math.ceil(min_time / 0.02)
    found = json.loads(run(["/usr/bin/python3", "-B", ROOT / "benchmarks/station.py", build,
                            str(calls_of_each), str(min(7, calls_of_each))]))
    table.at_most("a call through the station kit", "the same adb shell line", 1.1,
                  found["call"] / found["by hand"])
    table.recorded(f"the kit's share of the station's processor time, {found['phones']} phones",
                   "the kit, adb and its server", f"{found['share']:.0%}")


def size(table, folder):
    """Code and data of the service's own objects, which are what can grow."""
    objects = [path for part in OWN_OBJECTS for path in (folder / part).rglob("*.o")]
    if not objects:
        table.recorded("service for arm64 without stubs", "-", "not built: no build/arm64")
        return
    lines = run(["aarch64-linux-gnu-size", "-t", *objects]).splitlines()
    text, data, bss = lines[-1].split()[:3]
    table.recorded("service for arm64 without stubs", "-", f"{int(text) + int(data) + int(bss):,} bytes")


def machine():
    cpu = re.search(r"model name\s*: (.+)", pathlib.Path("/proc/cpuinfo").read_text("utf-8"))
    system = re.search(r'PRETTY_NAME="(.+)"', pathlib.Path("/etc/os-release").read_text("utf-8"))
    return (f"{os.cpu_count()} x {cpu[1] if cpu else platform.machine()}, Linux "
            f"{platform.release()}, {system[1]}; load {os.getloadavg()[2]:.1f} before the run, "
            f"{datetime.date.today()}.")


def write(table, before):
    """Puts the run into the document, between its marks."""
    text = DOCUMENT.read_text("utf-8")
    begin, end = "<!-- a run -->\n", "<!-- end of the run -->\n"
    head, rest = text.split(begin)
    DOCUMENT.write_text(f"{head}{begin}{before}\n\n{table}\n{end}{rest.split(end)[1]}", "utf-8")


def main():
    parser = argparse.ArgumentParser(usage=__doc__.split("usage: ")[1].strip())
    parser.add_argument("build", type=pathlib.Path)
    parser.add_argument("--short", action="store_true")
    parser.add_argument("--smoke", action="store_true")
    parser.add_argument("--write", action="store_true")
    arguments = parser.parse_args()
    build = arguments.build.resolve()
    before = machine()
    table = Table()
    if not arguments.smoke:
        found = counts(build)
        instructions(table, found)
        growth(table, found)
    if not arguments.short:
        for part, repetitions, min_time in ((shell, 9, 0.2), (texts, 5, 0.02), (calls, 9, 0.2),
                                            (start, 9, 0.2), (station, 9, 0.2)):
            if arguments.smoke:
                repetitions, min_time = 2, 0.001
            part(table, build, repetitions, min_time)
        size(table, build.parent / "arm64")
    print(table)
    if arguments.write:
        write(table, before)
    # A smoke run proves that the programs run; its figures mean nothing.
    return 1 if table.missed and not arguments.smoke else 0


if __name__ == "__main__":
    try:
        script.run(main)
    except (Failure, OSError, KeyError) as problem:
        print(f"bench: {problem}", file=sys.stderr)
        sys.exit(2)
