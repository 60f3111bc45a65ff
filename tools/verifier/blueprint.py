# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Reads Soong's Android.bp files: module types with properties, as far as this project uses them."""

import re

from verifier.checkout import Unreadable

TOKEN = re.compile(r"""(?P<skip>\s+|//[^\n]*|/\*.*?\*/)
                      |(?P<string>"(?:[^"\\]|\\.)*")
                      |(?P<word>[A-Za-z_][\w.-]*)
                      |(?P<mark>[][{}:,])""", re.VERBOSE | re.DOTALL)


class Module:
    """A module: its type, its properties, and the line of each."""

    def __init__(self, path, kind, line, properties):
        self.path = path
        self.kind = kind
        self.line = line
        self._properties = properties

    def get(self, name, default=None):
        return self._properties[name][0] if name in self._properties else default

    def line_of(self, name):
        return self._properties[name][1] if name in self._properties else self.line

    def strings(self, name):
        """The strings of a list, each with its line."""
        return self.get(name, [])

    @property
    def name(self):
        return self.get("name", "")


def read(checkout, path):
    """The modules of one file."""
    return list(_Parser(checkout.text(path), path).modules())


class _Parser:
    def __init__(self, text, path):
        self.path = path
        self.tokens = []
        position, line = 0, 1
        while position < len(text):
            match = TOKEN.match(text, position)
            if not match:
                raise Unreadable(f"{path}:{line}", f"cannot make sense of '{text[position]}'")
            if match.lastgroup != "skip":
                self.tokens.append((match.lastgroup, match[0], line))
            line += match[0].count("\n")
            position = match.end()
        self.end = ("end", "the end", line)

    def modules(self):
        while self.tokens:
            _, kind, line = self._take("word")
            self._take("mark", "{")
            yield Module(self.path, kind, line, self._properties())

    def _properties(self):
        properties = {}
        while not self._accept("}"):
            _, name, line = self._take("word")
            self._take("mark", ":")
            properties[name] = (self._value(), line)
            if not self._accept(","):
                self._take("mark", "}")
                break
        return properties

    def _value(self):
        kind, text, line = self._next()
        if kind == "string":
            return text[1:-1]
        if text in ("true", "false"):
            return text == "true"
        if text == "{":
            return self._properties()
        if text != "[":
            raise Unreadable(f"{self.path}:{line}", f"cannot make sense of '{text}'")
        items = []
        while not self._accept("]"):
            _, item, item_line = self._take("string")
            items.append((item[1:-1], item_line))
            if not self._accept(","):
                self._take("mark", "]")
                break
        return items

    def _next(self):
        return self.tokens.pop(0) if self.tokens else self.end

    def _accept(self, mark):
        if self.tokens and self.tokens[0][1] == mark:
            self.tokens.pop(0)
            return True
        return False

    def _take(self, kind, text=None):
        token = self._next()
        if token[0] != kind or text not in (None, token[1]):
            raise Unreadable(f"{self.path}:{token[2]}",
                             f"'{token[1]}' stands where {text or 'a ' + kind} belongs")
        return token
