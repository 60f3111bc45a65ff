# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Peers that adb is not: whatever they send, they lose their own connection at most, and leave nothing
running."""

import contextlib
import socket
import struct

import pytest

from support.adb import processes_of
from support.adbpeer import GREETING, Peer, message
from support.waiting import wait_for

SLEEP = b"shell,v2,raw:trap '' HUP; sleep 1000\0"


@pytest.fixture(name="peer")
def peer_fixture(phone):
    """A peer; when it has gone, the phone is as before."""
    with Peer(phone) as peer:
        yield peer
    wait_for(lambda: processes_of(phone) == [])
    assert phone.shell("echo well") == (0, b"well\n", b"")
    assert (phone.folder / "adb.log").read_text() == ""


@pytest.mark.parametrize("greeting", [
    b"GET / HTTP/1.1\r\nHost: localhost\r\n\r\n",
    message(*GREETING, magic=0),
    message(*GREETING, length=0xffffffff),
    message(b"OPEN", 1, 0, b"shell:\0"),
    message(b"AUTH", 2, 0),
])
def test_who_does_not_greet_is_cut_off(peer, greeting):
    peer.sendall(greeting)
    assert peer.is_cut()


@pytest.mark.parametrize("broken", [
    message(b"WRTE", 1, 1, length=0x7fffffff), message(b"OKAY", 1, 1, magic=1), b"\0" * 24])
def test_a_broken_message_ends_the_connection_and_what_it_started(phone, peer, broken):
    peer.greet().open(SLEEP)
    wait_for(lambda: processes_of(phone) != [])
    peer.sendall(broken)
    assert peer.is_cut()


@pytest.mark.parametrize("packet", [
    struct.pack("<BI", 3, 1) + b"\0", struct.pack("<BI", 99, 0), struct.pack("<BI", 5, 1 << 30)])
def test_a_packet_that_is_no_input_ends_the_connection(peer, packet):
    stream = peer.greet().open(SLEEP)
    peer.sendall(message(b"WRTE", 1, stream, packet))
    assert peer.is_cut()


def test_data_before_the_okay_ends_the_connection(peer):
    stream = peer.greet().open(SLEEP)
    peer.sendall(message(b"WRTE", 1, stream, bytes(5)) * 9)
    assert peer.is_cut()


@pytest.mark.parametrize("service", [b"", b"\0", b":", b"tcp:22\0", b"jdwp:1\0", b"Shell:ls\0", b"\xff" * 99])
def test_what_the_phone_does_not_serve_is_closed(peer, service):
    peer.greet().sendall(message(b"OPEN", 7, 0, service))
    assert peer.answer() == (b"CLSE", 0, 7, b"")


def test_messages_for_streams_that_are_not_there_are_ignored(peer):
    peer.greet()
    for name in (b"WRTE", b"OKAY", b"CLSE"):
        peer.sendall(message(name, 1, 99))
    assert peer.open(b"shell,v2,raw:true\0") > 0


def test_half_a_message_keeps_nobody_else_waiting(phone, peer):
    peer.greet().sendall(message(b"OPEN", 1, 0, SLEEP)[:30])
    assert phone.shell("echo others") == (0, b"others\n", b"")


def test_a_peer_that_takes_nothing_keeps_nobody_else_waiting(phone, peer):
    """Without an OKAY one message is all that comes."""
    stream = peer.greet().open(b"shell,v2,raw:busybox yes\0")
    assert peer.answer()[:3] == (b"WRTE", stream, 1)
    assert phone.shell("echo others") == (0, b"others\n", b"")
    peer.settimeout(0.2)
    with pytest.raises(socket.timeout):
        peer.answer()


def test_a_stream_left_in_the_middle_of_its_output_spoils_no_later_one(phone, peer):
    peer.greet()
    for number in range(1, 9, 2):
        left = peer.open(b"shell,v2,raw:busybox yes\0", number)
        assert peer.answer()[:3] == (b"WRTE", left, number)
        peer.sendall(message(b"CLSE", number, left))
        wait_for(lambda: processes_of(phone) == [])
        later = peer.open(b"shell,v2,raw:echo out; exit 3\0", number + 1)
        packets = b""
        while (answer := peer.answer())[0] == b"WRTE":
            packets += answer[3]
            peer.sendall(message(b"OKAY", number + 1, later))
        assert packets == struct.pack("<BI", 1, 4) + b"out\n" + struct.pack("<BI", 3, 1) + b"\3"


def test_a_packet_may_come_in_pieces(peer):
    stream = peer.greet().open(b"shell,v2,raw:cat\0")
    for piece in (b"\0", b"\3\0\0", b"\0a", b"bc\4\0\0\0", b"\0"):
        peer.sendall(message(b"WRTE", 1, stream, piece))
        answer = peer.answer()
        while answer[0] != b"OKAY":
            assert answer == (b"WRTE", stream, 1, struct.pack("<BI", 1, 3) + b"abc")
            peer.sendall(message(b"OKAY", 1, stream))
            answer = peer.answer()


def test_the_streams_and_connections_of_a_peer_are_limited(phone, peer):
    peer.greet()
    count = 0
    while True:
        count += 1
        peer.sendall(message(b"OPEN", count, 0, b"sync:\0"))
        if peer.answer()[0] == b"CLSE":
            break
    assert 16 <= count <= 100
    with contextlib.ExitStack() as others:
        peers = [others.enter_context(Peer(phone)) for _ in range(40)]
        for other in peers[20:]:
            assert other.is_cut()
    wait_for(lambda: phone.shell("echo others") == (0, b"others\n", b""))
