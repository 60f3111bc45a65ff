# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What a chip family does with each argument of a method, found out by varying them one by one.

    use = MethodUse(phone, method)
    use.ignored()    # ("power",)
    use.remarks()    # ["Transmits nothing: ...", ...]
    use.lines        # the command lines that an argument reaches, each as words and Slots
"""

import dataclasses
import itertools
import re

# A value that no chip knows: it shows what any other text leads to.
OTHER = "x"

CHANNELS = [str(channel) for channel in
            (*range(1, 15), *range(36, 65, 4), *range(100, 145, 4), *range(149, 178, 4))]

# All values that may make a difference, and the few that show whether an argument is used at all.
# Rates depend on the method, so they are further below.
VALUES = {
    "channel": [*CHANNELS, OTHER],
    "bandwidth": ["20", "40", "80", "160", OTHER],
    "vht": ["false", "true"],
    "power": ["15", "-3", OTHER],
    "guardInterval": ["0", "400", OTHER],
    "antenna": ["1", "2", "3", "4", OTHER],
    "ssid": ["test-ap", OTHER],
    "address": ["192.168.1.7", OTHER],
}
SAMPLES = {"channel": ["6", "1", "14", "36", "149", OTHER]}
# The starting values of all arguments: the effect of one may depend on the others.
BASES = {"channel": ["6", "36"], "vht": ["false", "true"], "bandwidth": ["20", "80"]}
# The arguments of which every combination is tried.
CHOICES = ("bandwidth", "vht")
MCS_INDICES = [str(index) for index in range(14)]

# The lines that transmit, or count what is received.
TEST_COMMANDS = [
    ("transmission", r"myftm .*-t 3 |wl pkteng_start \S+ tx |iwpriv wlan0 tx 1 "),
    ("tone", r"myftm .*-t 1 |wl fqacurcy [^0]|iwpriv wlan0 tx_cw_rf_gen 1 "),
    ("reception", r"myftm .*-x 1 |wl pkteng_start \S+ rx |iwpriv wlan0 rx 1 "),
]


def values(argument):
    if argument.name == "rate":
        known = argument.accepted_numbers() if argument.unit else MCS_INDICES
        return [*known, OTHER]
    return VALUES[argument.name]


@dataclasses.dataclass
class Slot:
    """A place in a command line whose text depends on arguments."""
    # The names of the arguments, in the interface's order.
    arguments: tuple
    # The text by the call's arguments, a tuple.
    texts: dict
    # Such as "<channel>/<bandwidth>", where the arguments stand there unchanged; else None.
    template: str = None

    def __str__(self):
        return self.template or "{" + ", ".join(self.arguments) + "}"


def split_gap(variants):
    """The slots of a piece of line that stands between the same words in every variant."""
    lengths = {len(words) for words in variants}
    if lengths == {0}:
        return []
    if len(lengths) == 1:
        return [list(column) for column in zip(*variants)]
    if 0 not in lengths and not any(words[0].startswith("-") for words in variants):
        return [[words[0] for words in variants], *split_gap([words[1:] for words in variants])]
    return [[" ".join(words) for words in variants]]


def columns_of(variants):
    """Lines as columns: the texts that stand for one another, one a line."""
    if len({len(words) for words in variants}) == 1:
        return [list(column) for column in zip(*variants)]
    # What stands once in every line, in the same order, is the same place: the options.
    common = [word for word in variants[0] if all(words.count(word) == 1 for words in variants)]
    assert all([word for word in words if word in common] == common for words in variants)
    columns, ends = [], [0] * len(variants)
    for word in [*common, None]:
        begins = [len(words) if word is None else words.index(word) for words in variants]
        columns += split_gap([words[end:begin]
                              for words, begin, end in zip(variants, begins, ends)])
        if word is not None:
            columns.append([word] * len(variants))
            ends = [begin + 1 for begin in begins]
    return columns


class MethodUse:
    """What a phone's family does with a method's arguments."""

    def __init__(self, phone, method):
        self.phone = phone
        self.method = method
        self.names = [argument.name for argument in method.arguments]
        self.domains = {argument.name: values(argument) for argument in method.arguments}
        self.answers = {}
        self.lines = []
        self._ask(self._samples())
        # Then the whole table of codes of what was found.
        self._ask({call for _, _, slot in self.slots() if not slot.template
                   for call in self._every(slot.arguments)})

    def slots(self):
        """Every slot: the line, the slot's place among its parts, and the slot."""
        return [(line, place, part) for line in self.lines for place, part in enumerate(line)
                if isinstance(part, Slot)]

    def ignored(self):
        used = {name for _, _, slot in self.slots() for name in slot.arguments}
        return tuple(name for name in self.names if name not in used)

    def starts(self):
        """What the calls start: "transmission", "tone", "reception"; None for nothing."""
        return next((kind for kind, _ in self._test_commands()), None)

    def tools(self):
        """The programs that start it."""
        return {line.split(" ")[0] for _, line in self._test_commands()}

    def _test_commands(self):
        return ((kind, line) for kind, pattern in TEST_COMMANDS
                for lines in self.answers.values() for line in lines if re.search(pattern, line))

    def remarks(self):
        """What else a caller would not expect, besides ignored arguments, one sentence each."""
        return [*self._start_remarks(), *self._same_lines()]

    def codes(self, slot):
        """The text of a slot by the values of the arguments that it depends on."""
        return {tuple(call[self.names.index(name)] for name in slot.arguments): slot.texts[call]
                for call in self._every(slot.arguments)}

    def _start_remarks(self):
        expected = {"RunTx": "Transmits", "RunRx": "Receives"}.get(self.method.name[:5])
        if not expected or not self.method.name.endswith("Start"):
            return []
        started = self.starts()
        if started is None:
            return [f"{expected} nothing: no test command follows what sets the chip up."]
        if expected == "Transmits" and started == "reception":
            return ["Its test command is that of a reception."]
        return []

    def _same_lines(self):
        """The accepted widths and standards that cannot be told apart."""
        choices = [name for name in self.names if name in CHOICES]
        found = []
        for name in choices:
            if name in self.ignored():
                continue
            others = [other for other in choices if other != name]
            for combination in itertools.product(*map(self._accepted, others)):
                fixed = dict(zip(others, combination))
                groups = {}
                for value in self._accepted(name):
                    lines = [self.answers[call]
                             for call in self._at_channels({**fixed, name: value})]
                    groups.setdefault(str(lines), []).append(value)
                found += [same_text(self._argument(name), same, fixed)
                          for same in groups.values() if len(same) > 1]
        return found

    def _argument(self, name):
        return next(argument for argument in self.method.arguments if argument.name == name)

    def _accepted(self, name):
        argument = self._argument(name)
        return self.domains[name] if argument.type == "bool" else argument.accepted_numbers()

    def _call(self, chosen):
        return tuple(chosen.get(name, self.domains[name][0]) for name in self.names)

    def _at_channels(self, chosen):
        return [self._call({**chosen, "channel": channel}) for channel in SAMPLES["channel"]]

    def _bases(self):
        varied = [name for name in self.names if name in BASES]
        for combination in itertools.product(*(BASES[name] for name in varied)):
            yield dict(zip(varied, combination))

    def _samples(self):
        calls = {self._call({})}
        for base in self._bases():
            for name in self.names:
                calls |= {self._call({**base, name: value})
                          for value in SAMPLES.get(name, self.domains[name])}
        choices = [name for name in self.names if name in CHOICES]
        for combination in itertools.product(*(self.domains[name] for name in choices)):
            calls |= set(self._at_channels(dict(zip(choices, combination))))
        return calls

    def _every(self, names):
        return [self._call(dict(zip(names, combination)))
                for combination in itertools.product(*(self.domains[name] for name in names))]

    def _ask(self, calls):
        new = sorted(calls - self.answers.keys())
        asked = self.phone.lines([(self.method.name, *call) for call in new])
        self.answers.update(zip(new, asked))
        lengths = {len(lines) for lines in self.answers.values()}
        assert len(lengths) == 1, f"{self.method.name}: the number of lines differs"
        self.lines = [line for line in map(self._line, range(lengths.pop()))
                      if any(isinstance(part, Slot) for part in line)]

    def _line(self, number):
        lines = {call: answer[number] for call, answer in self.answers.items()}
        distinct = sorted(set(lines.values()))
        columns = columns_of([line.rstrip(" ").split(" ") for line in distinct])
        return self._joined([
            column[0] if len(set(column)) == 1
            else self._slot({call: column[distinct.index(line)] for call, line in lines.items()})
            for column in columns])

    def _joined(self, parts):
        """Options are one slot if one choice sets them all, even if the first is sometimes missing."""
        for i, (first, word, last) in enumerate(zip(parts, parts[1:], parts[2:])):
            if not (isinstance(first, Slot) and isinstance(last, Slot)):
                continue
            if "" in first.texts.values() and first.arguments == last.arguments:
                together = {call: f"{text} {word} {last.texts[call]}".strip()
                            for call, text in first.texts.items()}
                return self._joined([*parts[:i], self._slot(together), *parts[i + 3:]])
        return parts

    def _slot(self, texts):
        found = []
        for place, name in enumerate(self.names):
            groups = {}
            for call, text in texts.items():
                groups.setdefault(call[:place] + call[place + 1:], set()).add(text)
            if any(len(group) > 1 for group in groups.values()):
                found.append(name)
        return Slot(tuple(found), texts, self._template(found, texts))

    def _template(self, names, texts):
        for call, text in sorted(texts.items()):
            template = text
            for name in names:
                template = template.replace(call[self.names.index(name)], f"<{name}>", 1)
            if template.count("<") == len(names) and "vht" not in names and all(
                    self._filled(template, other) == shown for other, shown in texts.items()):
                return template
        return None

    def _filled(self, template, call):
        for name, value in zip(self.names, call):
            template = template.replace(f"<{name}>", value)
        return template


def same_text(argument, same, fixed):
    unit = f" {argument.unit}" if argument.unit else ""
    named = argument.name + " " + ", ".join(same[:-1]) + f" and {same[-1]}{unit}"
    where = "".join(f" with {name} {value}" for name, value in fixed.items())
    return f"{named} run the same lines{where}."
