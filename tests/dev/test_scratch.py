# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""./dev in a copy of the checkout, with stand-ins for the package manager and CMake: what it does when
something is missing, in the way, moved, busy or broken off."""

import contextlib
import os
import pathlib
import pty
import shutil
import signal
import subprocess
import sys

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]

# What the stand-ins find in their environment: the folder for their files.
PRESENT = "echo 'installed '"
MISSING = "exit 1"
CMAKE = """\
echo "cmake $*" >>"$STANDINS/calls"
case $1 in
    --preset)
        mkdir -p "build/$2"
        touch "build/$2/build.ninja"
        echo "CMAKE_HOME_DIRECTORY:INTERNAL=$PWD" >"build/$2/CMakeCache.txt" ;;
    --build)
        if [ -p "$STANDINS/go" ]; then echo built >"$STANDINS/started"; read -r _ <"$STANDINS/go"; fi
        echo "no rule to make this"
        exit 1 ;;
esac
"""


class Scratch:
    """A copy of what ./dev itself consists of, and programs that stand in for the machine's."""

    def __init__(self, folder, name="checkout"):
        self.standins = folder / "standins"
        self.standins.mkdir(exist_ok=True)
        self.checkout = folder / name
        shutil.copytree(ROOT / "tools/dev", self.checkout / "tools/dev")
        shutil.copy(ROOT / "dev", self.checkout)
        for table in ("simulator/phones", "tests/fuzz/corpus"):
            shutil.copytree(ROOT / table, self.checkout / table)
        self.program("dpkg-query", PRESENT)
        self.program("cmake", CMAKE)
        self.environment = {**os.environ, "PATH": f"{self.standins}:{os.environ['PATH']}",
                            "STANDINS": str(self.standins)}

    def program(self, name, script):
        path = self.standins / name
        path.write_text(f"#!/bin/bash\n{script}\n")
        path.chmod(0o755)

    def fifos(self):
        for name in ("started", "go"):
            os.mkfifo(self.standins / name)

    def await_start(self):
        return (self.standins / "started").read_text()

    def go(self):
        (self.standins / "go").write_text("go\n")

    def calls(self):
        with contextlib.suppress(FileNotFoundError):
            return (self.standins / "calls").read_text().splitlines()
        return []

    def start(self, *arguments, **options):
        return subprocess.Popen([self.checkout / "dev", *arguments], env=self.environment, text=True,
                                **{"stdin": subprocess.DEVNULL, "stdout": subprocess.PIPE,
                                   "stderr": subprocess.PIPE, **options})

    def __call__(self, *arguments):
        with self.start(*arguments) as dev:
            out, err = dev.communicate(timeout=120)
        return dev.returncode, out, err


@pytest.fixture(name="scratch")
def scratch_fixture(tmp_path):
    return Scratch(tmp_path)


EXPLAIN = ("explain", "broadcom", "RunTxStop", "6")


def test_a_failed_build_ends_the_command_with_the_logs_end(scratch):
    code, out, err = scratch(*EXPLAIN)
    assert (code, out) == (1, "")
    assert err.endswith("no rule to make this\ndev: the build failed: see build/host.log\n")


def test_a_log_that_cannot_be_written_ends_the_command(scratch):
    (scratch.checkout / "build/host.log").mkdir(parents=True)
    assert scratch(*EXPLAIN)[::2] == (
        1, "dev: building, which takes a minute the first time\ndev: cannot write build/host.log\n")
    assert scratch.calls() == []


def test_a_moved_checkout_is_configured_anew(scratch):
    scratch(*EXPLAIN)
    scratch(*EXPLAIN)
    assert [call.split()[1] for call in scratch.calls()] == ["--preset", "--build", "--build"]
    scratch.checkout = scratch.checkout.rename(scratch.checkout.with_name("moved"))
    (scratch.checkout / "build/host/stale").touch()
    scratch(*EXPLAIN)
    assert [call.split()[1] for call in scratch.calls()[3:]] == ["--preset", "--build"]
    assert not (scratch.checkout / "build/host/stale").exists()


def test_the_second_build_waits_for_the_first(scratch):
    scratch.fifos()
    with scratch.start(*EXPLAIN) as first:
        scratch.await_start()
        with scratch.start(*EXPLAIN) as second:
            lines = iter(second.stderr.readline, "")
            assert any("another ./dev builds in build/host: waiting" in line for line in lines)
            assert len(scratch.calls()) == 2  # the first one's
            scratch.go()
            first.communicate(timeout=120)
            scratch.await_start()
            scratch.go()
            second.communicate(timeout=120)
    assert (first.returncode, second.returncode) == (1, 1)


@pytest.mark.parametrize("character, shown", [
    ('"', "'\"'"), (";", "';'"), ("#", "'#'"), ("[", "'['"), ("\\", "'\\'"), ("\n", "$'\\n'")])
def test_a_path_that_cannot_be_built_in(tmp_path, character, shown):
    code, out, err = Scratch(tmp_path, f"a{character}b")("catalogue")
    assert (code, out) == (1, "")
    assert err.splitlines()[-1] == \
        f"dev: the path of this folder has a {shown}, with which it cannot be built"


@pytest.mark.parametrize("name", ["a folder", "it's", "$HOME", "newline-at-the-end\n"[:-1]])
def test_other_paths_reach_the_build(tmp_path, name):
    scratch = Scratch(tmp_path, name)
    scratch(*EXPLAIN)
    assert len(scratch.calls()) == 2


@pytest.mark.skipif(not shutil.which("aarch64-linux-gnu-g++"), reason="./dev test --arch arm64 installs it")
@pytest.mark.parametrize("name", ["a folder", "it's", "$HOME"])
def test_the_cross_compiler_links_in_other_paths(tmp_path, name):
    checkout = tmp_path / name
    shutil.copytree(ROOT / "cmake", checkout / "cmake")
    (checkout / "CMakeLists.txt").write_text("cmake_minimum_required(VERSION 3.25)\nproject(tiny LANGUAGES CXX)\n")
    done = subprocess.run(["cmake", "-G", "Ninja", "--toolchain", "cmake/Arm64.cmake", "-B", "build/arm64"],
                          cwd=checkout, check=False, capture_output=True, text=True)
    assert done.returncode == 0, done.stderr


def test_neither_root_nor_sudo(scratch):
    scratch.program("dpkg-query", MISSING)
    scratch.program("id", "echo 1000")
    scratch.program("sudo", "exit 1")
    code, out, err = scratch("format")
    assert (code, out) == (1, "")
    line, = err.splitlines()
    assert line.startswith("dev: packages are missing, and sudo wants a password that it cannot ask for")
    assert line.endswith(
        "; as root: apt-get install --no-install-recommends blueprint-tools clang-format git")


def test_ctrl_c_lets_the_package_manager_finish_and_goes_no_further(scratch):
    scratch.program("dpkg-query", MISSING)
    scratch.program("id", "echo 0")
    scratch.program("apt-get", """\
echo "$*" >>"$STANDINS/calls"
echo started >"$STANDINS/started"
read -r _ <"$STANDINS/go"
echo finished >>"$STANDINS/calls"
""")
    scratch.fifos()
    keyboard, terminal = pty.openpty()
    dev = scratch.start(*EXPLAIN, stdin=terminal, stdout=terminal, stderr=terminal,
                        start_new_session=True, preexec_fn=claim_the_terminal)
    os.close(terminal)
    try:
        scratch.await_start()
        os.write(keyboard, b"\x03")
        seen = b""
        while b"ending as soon as the package manager has finished" not in seen:
            seen += os.read(keyboard, 4096)
        scratch.go()
        assert dev.wait(120) == 130
    finally:
        dev.kill()
        os.close(keyboard)
    assert scratch.calls() == ["update", "finished"]


def claim_the_terminal():
    import fcntl  # pylint: disable=import-outside-toplevel  (in the child)
    import termios  # pylint: disable=import-outside-toplevel
    fcntl.ioctl(0, termios.TIOCSCTTY, 0)


def test_an_interrupt_ends_what_a_test_has_started_anywhere(tmp_path):
    os.mkfifo(tmp_path / "pid")
    # In a session of its own, with its parent gone.
    script = f"trap 'exit 1' INT; (setsid sleep 3600 & echo $! >'{tmp_path}/pid'); sleep 3600"
    with subprocess.Popen([sys.executable, "-B", ROOT / "tools/dev/supervise.py", "bash", "-c", script],
                          start_new_session=True) as supervisor:
        astray = int((tmp_path / "pid").read_text())
        supervisor.send_signal(signal.SIGINT)
        assert supervisor.wait(120) == 130
    assert not pathlib.Path(f"/proc/{astray}").exists()


def test_the_supervised_commands_own_exit_code():
    def code_of(script):
        return subprocess.run([ROOT / "tools/dev/supervise.py", "bash", "-c", script], check=False,
                              timeout=120).returncode

    assert code_of("exit 7") == 7
    assert code_of("kill -KILL $$") == 137


def test_an_orphan_that_has_ended_is_gone():
    # The shell waits for a process whose parent has ended.
    script = 'orphan=$(sleep 1 >/dev/null & echo $!); while [ -e "/proc/$orphan" ]; do sleep 0.05; done'
    supervised = subprocess.run([ROOT / "tools/dev/supervise.py", "bash", "-c", script], check=False,
                                timeout=60)
    assert supervised.returncode == 0
