# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The report's files: each is there as a whole or as it was before."""

import contextlib
import csv
import io
import os
import pathlib

from .measurements import shown


@contextlib.contextmanager
def whole(path):
    """The path of a new file that takes the place of `path` at the end of the block. After an exception
    it is gone, and `path` is as it was."""
    new = pathlib.Path(f"{path}.new")
    try:
        yield new
        with open(new, "rb+") as file:
            os.fsync(file.fileno())  # a full disk may show only now
        os.replace(new, path)
    except BaseException:
        with contextlib.suppress(OSError):
            new.unlink()
        raise


def write(path, text):
    """Raises OSError."""
    with whole(path) as new:
        # Nothing that a phone printed keeps a report from being written.
        new.write_text(text, encoding="utf-8", errors="backslashreplace", newline="")


COLUMNS = ["phone", "test", "name", "at", "value", "unit", "low", "high", "verdict"]


def measurements_csv(run):
    """The text of measurements.csv: a row for each measurement, by RFC 4180."""
    out = io.StringIO()
    rows = csv.writer(out)
    rows.writerow(COLUMNS)
    for result, each in run.results.measurements:
        rows.writerow([_text(result.phone), _text(result.name), _text(each.name), _text(each.place),
                       _cell(each.value), _text(each.unit), _cell(each.low), _cell(each.high),
                       each.verdict])
    return out.getvalue()


def _cell(value):
    if value is None:
        return ""
    return _text(value) if isinstance(value, str) else shown(value)


def _text(value):
    """A spreadsheet would take some text as a formula: an apostrophe in front keeps it a text."""
    return f"'{value}" if value[:1] in tuple("=+-@\t\r") else value
