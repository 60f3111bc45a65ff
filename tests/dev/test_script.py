# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""How the programs in tools/ end."""

import pathlib
import subprocess
import sys

TOOLS = pathlib.Path(__file__).resolve().parents[2] / "tools"


def run(body):
    text = f"import script\ndef main():\n    {body}\nscript.run(main)\n"
    done = subprocess.run([sys.executable, "-B", "-c", text], cwd=TOOLS, capture_output=True,
                          text=True, check=False, timeout=60)
    return done.returncode, done.stderr


def test_ctrl_c_leaves_no_trace():
    assert run("raise KeyboardInterrupt") == (130, "")


def test_the_exit_code_is_mains():
    assert run("pass") == (0, "")
    assert run("return 2") == (2, "")


def test_every_program_ends_like_that():
    programs = [path for path in TOOLS.iterdir() if path.is_file()
                and "python3" in path.read_text().partition("\n")[0]]
    assert len(programs) > 3
    assert [path.name for path in programs if "script.run(main" not in path.read_text()] == []
