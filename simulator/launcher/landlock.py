# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Landlock, the kernel's way for a process to give up rights for itself and all that it starts."""

import ctypes
import os
import struct

CREATE_RULESET, ADD_RULE, RESTRICT_SELF = 444, 445, 446  # the same numbers on every architecture
CREATE_RULESET_VERSION = 1
RULE_PATH_BENEATH = 1
PR_SET_NO_NEW_PRIVS = 38  # from <linux/prctl.h>

# From <linux/landlock.h>, by the first version that has them.
WRITE_FILE, REFER, TRUNCATE = 1 << 1, 1 << 13, 1 << 14
REMOVE_AND_MAKE = 0x1FF0
TCP = 0x3
SIGNALS_AND_ABSTRACT_SOCKETS = 0x3

_call = ctypes.CDLL(None, use_errno=True)


def version():
    """What the kernel limits: files from 2 on, their truncation from 3, TCP from 4, signals and
    abstract sockets from 6. 0 when there is no Landlock."""
    return max(0, _call.syscall(CREATE_RULESET, None, 0, CREATE_RULESET_VERSION))


def confine(paths):
    """From now on this process can change only files in `paths` and below, open no TCP connection,
    and reach no process and no abstract socket outside, as far as the kernel can prevent it."""
    has = version()
    if has < 2:  # version 1 refuses each move to another folder
        return
    files = WRITE_FILE | REMOVE_AND_MAKE | REFER | (TRUNCATE if has >= 3 else 0)
    limits = struct.pack("QQQ", files, TCP if has >= 4 else 0,
                         SIGNALS_AND_ABSTRACT_SOCKETS if has >= 6 else 0)
    rules = _checked(CREATE_RULESET, limits, len(limits), 0)
    for path in paths:
        file = os.open(path, os.O_PATH)
        allowed = files if os.path.isdir(path) else files & (WRITE_FILE | TRUNCATE)
        _checked(ADD_RULE, rules, RULE_PATH_BENEATH, struct.pack("=Qi", allowed, file), 0)
    _call.prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0)
    _checked(RESTRICT_SELF, rules, 0)


def _checked(*arguments):
    result = _call.syscall(*arguments)
    if result < 0:
        raise OSError(ctypes.get_errno(), os.strerror(ctypes.get_errno()))
    return result
