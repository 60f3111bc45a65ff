# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the tests of the station kit share."""

import pytest

TRANSMISSION = ("RunTxBGStart", 6, 11, 20, 1)


def raises(kind, words, function, *arguments):
    """Asserts that the call raises exactly this exception, with one line that holds the words."""
    with pytest.raises(kind) as raised:
        function(*arguments)
    text = str(raised.value)
    assert type(raised.value) is kind
    assert words in text
    assert text.startswith(f"phone {raised.value.serial}: ")
    assert len(text.splitlines()) == 1
    return raised.value


def is_marked(phone):
    """Whether the radio may be on, as far as the kit knows."""
    with phone.lock:
        return phone.lock.started != ""
