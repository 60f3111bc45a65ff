# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""A measurement: a value, its unit, and the limits that it must keep.

    Measurement.of("packets", 948, unit="packets", low=950, at={"channel": 6}).missed
    # "packets at channel=6: 948 packets is below 950"
"""

import dataclasses
import decimal
import math
import numbers


class MeasurementError(ValueError):
    """What is no measurement, such as limits the wrong way round. One line."""


def printable(text):
    """The text with every character that no report can hold, such as NUL, as an escape."""
    return "".join(
        each if each.isprintable() or each in "\n\t" else each.encode("unicode_escape").decode()
        for each in str(text))


def number(value):
    """The same number as int or float, whatever type it had; None when it is no number."""
    if isinstance(value, bool) or not isinstance(value, (numbers.Real, decimal.Decimal)):
        return None
    try:
        known = float(value)
    except OverflowError:
        return None
    return int(value) if isinstance(value, numbers.Integral) else known


def shown(value):
    """A value as reports show it: 948, 0.25, true, text as it is."""
    if isinstance(value, bool):
        return "true" if value else "false"
    return f"{value:.10g}" if isinstance(value, float) else str(value)


@dataclasses.dataclass(frozen=True)
class Measurement:
    """Made by `of`, which checks it."""
    name: str
    # A number, a boolean or a text. Only a number can have limits.
    value: object
    unit: str = ""
    # The limits themselves are good; None where there is none.
    low: float = None
    high: float = None
    # Where in a sweep it was taken: {"channel": 6, "rate": 54}; empty outside a sweep.
    at: dict = dataclasses.field(default_factory=dict)

    @classmethod
    def of(cls, name, value, unit="", low=None, high=None, at=None):
        """Raises MeasurementError."""
        name = printable(name)
        limits = []
        for limit in (low, high):
            if limit is not None and (number(limit) is None or math.isnan(limit)):
                raise MeasurementError(f"{name}: the limit {limit!r} is no number")
            limits.append(number(limit))
        low, high = limits
        if low is not None and high is not None and low > high:
            raise MeasurementError(
                f"{name}: the limits are the wrong way round: low={shown(low)} is above"
                f" high={shown(high)}")
        return cls(name, _value(name, value, limited=limits != [None, None]), printable(unit),
                   low, high, {printable(key): _place(each) for key, each in (at or {}).items()})

    @property
    def place(self):
        """channel=6, rate=54"""
        return ", ".join(f"{key}={shown(value)}" for key, value in self.at.items())

    @property
    def full_name(self):
        """packets at channel=6, rate=54"""
        return f"{self.name} at {self.place}" if self.at else self.name

    @property
    def missed(self):
        """Which limit was missed and by what; empty when it passed."""
        if self.low is None and self.high is None:
            return ""
        what = f"{self.full_name}: {shown(self.value)}{self.unit and ' ' + self.unit}"
        if math.isnan(self.value):
            return f"{what} is within no limits"
        if self.low is not None and self.value < self.low:
            return f"{what} is below {shown(self.low)}"
        if self.high is not None and self.value > self.high:
            return f"{what} is above {shown(self.high)}"
        return ""

    @property
    def verdict(self):
        """pass, fail, or empty where there is no limit."""
        if self.low is None and self.high is None:
            return ""
        return "fail" if self.missed else "pass"

    def properties(self):
        """(name, value) pairs for JUnit: the value under its own name, then what belongs to it."""
        name = f"{self.name}[{self.place}]" if self.at else self.name
        parts = [("unit", self.unit or None), ("low", self.low), ("high", self.high),
                 ("verdict", self.verdict or None)]
        return [(name, shown(self.value)),
                *((f"{name}.{part}", shown(value)) for part, value in parts if value is not None)]


def _value(name, value, limited):
    known = value if isinstance(value, bool) else number(value)
    if known is None and isinstance(value, str):
        known = printable(value)
    if known is None:
        raise MeasurementError(f"{name}: {value!r} is neither a number nor a text")
    if limited and number(known) is None:
        raise MeasurementError(f"{name}: {value!r} has limits but is no number")
    return known


def _place(value):
    known = number(value)
    return printable(shown(value)) if known is None else known
