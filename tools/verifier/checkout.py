# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The files that are compared, and the problems found."""

import re


class Unreadable(Exception):
    """A file that is missing, or not in the form that its reader needs."""

    def __init__(self, place, text):
        super().__init__(text)
        self.place = place


class Checkout:
    """A checkout's files by their paths from its root."""

    def __init__(self, root):
        self.root = root
        self.problems = []

    def report(self, path, line, text):
        self.problems.append(f"{path}:{line}: {text}")

    def text(self, path):
        try:
            return (self.root / path).read_text(encoding="utf-8")
        except (OSError, UnicodeDecodeError) as error:
            reason = getattr(error, "strerror", None) or "not UTF-8"
            raise Unreadable(path, f"cannot be read: {reason}") from None

    def lines(self, path):
        """Each line that says something, with its number: neither blank nor a comment."""
        for number, line in enumerate(self.text(path).splitlines(), 1):
            words = line.split("#")[0].strip()
            if words:
                yield number, words

    def find(self, path, pattern):
        """The first match of a regular expression and its line."""
        text = self.text(path)
        match = re.search(pattern, text, re.MULTILINE)
        if not match:
            raise Unreadable(f"{path}:1", f"holds nothing like '{pattern}'")
        return match, text.count("\n", 0, match.start()) + 1

    def paths(self, folder, pattern):
        """The files of a folder, not of those below it, that match a pattern."""
        found = sorted((self.root / folder).glob(pattern))
        return [str(path.relative_to(self.root)) for path in found if path.is_file()]

    def blueprints(self):
        """Every Android.bp of the checkout: none lies deeper."""
        found = [path for depth in ("", "*/", "*/*/") for path in self.paths("", f"{depth}Android.bp")]
        return [path for path in found if not path.startswith("build/")]
