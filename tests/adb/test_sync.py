# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""adb push and pull, which reach the phone's files and nothing else."""

import os
import stat
import struct

import pytest

from support.adbpeer import Peer, message
from support.waiting import wait_for

TMP = "data/local/tmp"


@pytest.fixture(name="inside")
def inside_fixture(phone):
    """The phone's folder for temporary files, as the machine sees it."""
    return phone.root / TMP


def push(phone, source, destination):
    done = phone.do("push", source, destination)
    assert done.returncode == 0, done
    return done


def ask(peer, request):
    """The first piece of the answer to a request."""
    stream = peer.greet().open(b"sync:\0")
    peer.sendall(message(b"WRTE", 1, stream, request))
    assert peer.answer()[0] == b"OKAY"
    name, _, _, data = peer.answer()
    assert name == b"WRTE"
    peer.sendall(message(b"OKAY", 1, stream))
    return data


def refused(phone, *arguments):
    done = phone.do(*arguments)
    assert done.returncode == 1, done
    return (done.stdout + done.stderr).decode()


def test_a_file_goes_in_and_comes_out_unchanged(phone, inside, tmp_path):
    source = tmp_path / "big"
    source.write_bytes(os.urandom(3_000_001))
    source.chmod(0o750)
    os.utime(source, (1_600_000_000, 1_600_000_000))
    push(phone, source, f"/{TMP}/")
    assert (inside / "big").read_bytes() == source.read_bytes()
    assert stat.S_IMODE((inside / "big").stat().st_mode) == 0o750
    assert (inside / "big").stat().st_mtime == 1_600_000_000
    back = tmp_path / "back"
    assert phone.do("pull", "-a", f"/{TMP}/big", back).returncode == 0
    assert back.read_bytes() == source.read_bytes()
    assert back.stat().st_mtime == 1_600_000_000


def test_a_file_is_replaced_whole(phone, inside, tmp_path):
    (tmp_path / "short").write_text("short")
    (tmp_path / "none").write_text("")
    (inside / "file").write_text("much longer")
    push(phone, tmp_path / "short", f"/{TMP}/file")
    assert (inside / "file").read_text() == "short"
    push(phone, tmp_path / "none", f"/{TMP}/file")
    assert (inside / "file").read_text() == ""


def test_folders(phone, inside, tmp_path):
    tree = tmp_path / "tree"
    (tree / "in").mkdir(parents=True)
    (tree / "one").write_text("1")
    (tree / "in/two").write_text("2")
    (tree / "link").symlink_to("one")
    push(phone, tree, f"/{TMP}/new/deep")
    assert (inside / "new/deep/in/two").read_text() == "2"
    assert os.readlink(inside / "new/deep/link") == "one"
    back = tmp_path / "back"
    assert phone.do("pull", f"/{TMP}/new/deep", back).returncode == 0
    assert {path.name: path.read_text() for path in back.rglob("*") if path.is_file()} \
        == {"one": "1", "two": "2", "link": "1"}


def test_what_was_pushed_is_there_for_the_phone(phone, tmp_path):
    (tmp_path / "script").write_text("echo ran\n")
    push(phone, tmp_path / "script", f"/{TMP}/script")
    assert phone.shell(f"sh /{TMP}/script; echo made >/{TMP}/made") == (0, b"ran\n", b"")
    assert phone.do("pull", f"/{TMP}/made", tmp_path / "made").returncode == 0
    assert (tmp_path / "made").read_text() == "made\n"


def test_links_are_followed_inside_the_phone(phone, inside, tmp_path):
    """An absolute link begins at the phone's root, and no link leads above it."""
    victim = tmp_path / "victim"
    victim.write_text("the machine's")
    (tmp_path / "new").write_text("new")
    (inside / "absolute").symlink_to(victim)
    (inside / "climbing").symlink_to(f"{'../' * 40}{victim}")
    (inside / "folder").symlink_to(tmp_path)
    (inside / "inner").symlink_to(f"/{TMP}/target")
    for name in ("absolute", "climbing", "folder/victim"):
        assert "No such file" in refused(phone, "pull", f"/{TMP}/{name}", tmp_path / "stolen")
        push(phone, tmp_path / "new", f"/{TMP}/{name}")
        assert victim.read_text() == "the machine's"
        # The same path in the phone.
        assert (phone.root / str(victim).lstrip("/")).read_text() == "new"
        (phone.root / str(victim).lstrip("/")).unlink()
    push(phone, tmp_path / "new", f"/{TMP}/inner")
    assert (inside / "target").read_text() == "new"
    assert phone.do("pull", f"/{TMP}/../../..{victim}", tmp_path / "stolen").returncode == 1
    assert not (tmp_path / "stolen").exists()


def test_links_in_a_ring(phone, inside, tmp_path):
    (inside / "ring").symlink_to("ring")
    assert "Too many levels" in refused(phone, "pull", f"/{TMP}/ring", tmp_path / "ring")


def test_what_may_never_end_is_refused(phone, inside, tmp_path):
    os.mkfifo(inside / "pipe")
    path = f"/{TMP}/pipe"
    with Peer(phone) as peer:
        assert ask(peer, struct.pack("<4sI", b"RECV", len(path)) + path.encode()).startswith(b"FAIL")
    (tmp_path / "new").write_text("new")
    assert "not a regular file" in refused(phone, "push", tmp_path / "new", path)


def test_missing_files_are_one_line(phone, tmp_path):
    assert "No such file or directory" in refused(phone, "pull", "/nonesuch", tmp_path / "x")
    (tmp_path / "new").write_text("new")
    assert "Not a directory" in refused(phone, "push", tmp_path / "new", "/vendor/build.prop/new")
    assert not (tmp_path / "x").exists()


def test_half_a_push_leaves_nothing(phone, inside):
    before = set(os.listdir(inside))
    with Peer(phone) as peer:
        stream = peer.greet().open(b"sync:\0")
        request = f"/{TMP}/half,33188".encode()
        peer.sendall(message(b"WRTE", 1, stream, struct.pack("<4sI", b"SEND", len(request)) + request
                             + struct.pack("<4sI", b"DATA", 9000) + b"some"))
        assert peer.answer()[0] == b"OKAY"
        wait_for(lambda: len(os.listdir(inside)) > len(before))
    wait_for(lambda: set(os.listdir(inside)) == before)


@pytest.mark.parametrize("request_", [
    struct.pack("<4sI", b"RECV", 0xffffffff), struct.pack("<4sI", b"NONE", 1) + b"x",
    struct.pack("<4sI", b"SEND", 5) + b"/file", b"\xff" * 8,
    struct.pack("<4sI", b"SEND", 12) + b"/phone/x,420" + struct.pack("<4sI", b"DATA", 1 << 30)])
def test_a_request_that_is_none_ends_the_service(phone, request_):
    with Peer(phone) as peer:
        assert ask(peer, request_).startswith(b"FAIL")
        assert peer.answer()[0] == b"CLSE"
    assert not (phone.root / "phone/x").exists()
