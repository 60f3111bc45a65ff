# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The client's JSON objects as typed Python objects. Members that are not known here are ignored."""

import dataclasses
import datetime
from typing import Dict, Optional, Tuple, Union

SCHEMA_VERSION = 1


@dataclasses.dataclass(frozen=True)
class Argument:
    """One argument of a method: `type` is "string" or "bool"; `unit` may be None."""
    name: str
    type: str
    meaning: str
    unit: Optional[str]
    accepted: str


@dataclasses.dataclass(frozen=True)
class Method:
    """A method of the interface. `result` tells what its answer means."""
    name: str
    summary: str
    arguments: Tuple[Argument, ...]
    result_type: str
    result: str


@dataclasses.dataclass(frozen=True)
class Course:
    """How a call went: what all answers have.

    exit_code: the client's; 0 is success
    error: why it is not 0, in the client's words; None when it is
    stage: "lookup": nothing was called; "call": called, not answered; "done": answered
    radio_may_be_on: True after a start that was called; None where the call does not show it
    started_at: when the search for the service began, UTC by the phone's clock
    duration: seconds on the phone, without the time that adb takes
    client_version: such as "0.2.0"
    """
    method: str
    arguments: Dict[str, Union[str, bool]]
    exit_code: int
    error: Optional[str]
    stage: str
    radio_may_be_on: Optional[bool]
    started_at: datetime.datetime
    duration: float
    client_version: str


@dataclasses.dataclass(frozen=True)
class Answer(Course):
    """The answer of a method.

    value: the number, bool or text that the service answered; None when it did not
    count: the packets that the answer counts; None where it holds no count
    warnings: one line for each argument that no chip knows
    """
    value: Union[int, bool, str, None]
    count: Optional[int]
    warnings: Tuple[str, ...]


@dataclasses.dataclass(frozen=True)
class StopCall:
    """One call that `stop` made, and its answer."""
    method: str
    value: Union[int, str]


@dataclasses.dataclass(frozen=True)
class StopAnswer(Course):
    """The answer of `bex-wifi-client stop`: the calls of its last round, in order."""
    calls: Tuple[StopCall, ...]


@dataclasses.dataclass(frozen=True)
class Check:
    """One line of the doctor: `status` is "ok", "problem" or "unknown"; `remedy` is what to do."""
    name: str
    status: str
    found: str
    remedy: Optional[str]


@dataclasses.dataclass(frozen=True)
class Doctor:
    """The doctor's report; `ok` when it found no problem."""
    ok: bool
    checks: Tuple[Check, ...]


def _picked(kind, members):
    """The dataclass of the members that it has; KeyError when one is missing."""
    return kind(**{field.name: members[field.name] for field in dataclasses.fields(kind)})


def _course(members):
    """The members of a call in the types of Course."""
    started_at = datetime.datetime.strptime(members["started_at"], "%Y-%m-%dT%H:%M:%S.%fZ")
    return {**members, "error": members.get("error"), "duration": members["duration_ms"] / 1000,
            "started_at": started_at.replace(tzinfo=datetime.timezone.utc)}


def exit_code(members):
    """The client's exit code; `list` has none."""
    return _whole(members.get("exit_code", 0))


def _whole(number):
    if type(number) is not int:  # a bool is an int, too
        raise TypeError(f"{number!r} is no whole number")
    return number


def answer(members):
    count = members.get("count")
    return _picked(Answer, {**_course(members), "count": count if count is None else _whole(count),
                            "warnings": tuple(members.get("warnings", ()))})


def stop_answer(members):
    calls = tuple(_picked(StopCall, call) for call in members["calls"])
    return _picked(StopAnswer, {**_course(members), "calls": calls})


def doctor(members):
    return Doctor(members["ok"], tuple(_picked(Check, check) for check in members["checks"]))


def methods(members):
    """The methods by name."""
    return {method["name"]: Method(
        method["name"], method["summary"],
        tuple(_picked(Argument, argument) for argument in method["arguments"]),
        method["result"]["type"], method["result"]["meaning"]) for method in members["methods"]}
