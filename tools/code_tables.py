# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Tables of codes in Markdown: which code a command line has for each value of an argument."""

import itertools

import argument_use

# The arguments whose values are numbers in a row.
NUMBERED = ("channel", "MCS index")
# The arguments of which the service knows some values, and treats all others alike.
LISTED = ("rate (Mbit/s)", "bandwidth (MHz)")


def title(argument):
    """The argument as a head of a table: "bandwidth (MHz)"."""
    if argument.name == "rate" and not argument.unit:
        return "MCS index"
    return f"{argument.name} ({argument.unit})" if argument.unit else argument.name


def code(text):
    return f"`{text}`" if text else "nothing"


def slope(first, second, texts):
    """How a numeric code grows between two values; None where either is no number."""
    try:
        return (int(texts[second]) - int(texts[first])) / (int(second) - int(first))
    except ValueError:
        return None


def straight(name, values, texts):
    """The formula that gives the codes of the values; None where they lie on no straight line."""
    slopes = {slope(a, b, texts) for a, b in itertools.pairwise(values)}
    if len(values) < 4 or len(slopes) != 1:
        return None
    grade = slopes.pop()
    if grade is None or grade != int(grade) or grade == 0:
        return None
    offset = int(texts[values[0]]) - int(grade) * int(values[0])
    factor = "" if grade == 1 else f"{int(grade)} × "
    return (f"{offset} + " if offset else "") + factor + name


def cell(name, values, texts):
    """What stands for the values in one column; None where nothing short does."""
    if len({texts[value] for value in values}) == 1:
        return code(texts[values[0]])
    return straight(name, values, texts)


def row_name(name, values):
    if name in NUMBERED and len(values) > 2:
        return f"{values[0]} to {values[-1]}"
    return ", ".join(values)


def rows(name, values, columns):
    """The rows of a table: as many values in each as one entry in every column can stand for."""
    found = []
    numbered = [value for value in values if value != argument_use.OTHER]
    while numbered:
        for size in range(len(numbered), 0, -1):
            cells = [cell(name, numbered[:size], texts) for texts in columns]
            if None not in cells:
                break
        found.append([row_name(name, numbered[:size]), *cells])
        numbered = numbered[size:]
    if argument_use.OTHER in values:
        other = argument_use.OTHER
        found.append([shown(name, other), *[code(texts[other]) for texts in columns]])
    return found


def markdown(heads, table):
    return ["| " + " | ".join(heads) + " |", "|---" * len(heads) + "|",
            *["| " + " | ".join(row) + " |" for row in table]]


def shown(name, value):
    if value != argument_use.OTHER:
        return value
    return "anything else" if name in LISTED else "no number"


def choices_name(names, choices):
    """The other arguments' values that share a column: "vht true: bandwidth (MHz) 20, 160"."""
    found = []
    for last, group in itertools.groupby(choices, key=lambda values: values[1:]):
        values = ", ".join(shown(names[0], first) for first, *_ in group)
        found.append("".join(f"{name} {value}: " for name, value in zip(names[1:], last)) +
                     f"{names[0]} {values}")
    return "; ".join(found)


def by_choice(codes, place):
    """The codes by the values of the argument at the place, one for each choice of the other
    arguments; choices that give the same codes stand together: [(choices, {value: code})]."""
    choices = {}
    for values, text in codes.items():
        choices.setdefault(values[:place] + values[place + 1:], {})[values[place]] = text
    groups = {}
    for choice, texts in choices.items():
        groups.setdefault(tuple(texts.items()), []).append(choice)
    # By the last argument, so that a column's name has each of its values once.
    return [(sorted(group, key=lambda values: values[1:]), dict(texts))
            for texts, group in groups.items()]


def context(line, place):
    """The words before a place in a line, shortened: "myftm … -f"."""
    words = [str(part) for part in line[:place]]
    option = any(text.startswith("-") for text in line[place].texts.values())
    if option and not words[-1].startswith("-"):
        return f"{words[0]} …"
    if words[-1].startswith("-") and len(words) > 2:
        return f"{words[0]} … {words[-1]}"
    return " ".join(words)


class CodeTables:
    """The tables of one family. Places with the same codes share one, places that one argument
    alone decides share the rows."""

    def __init__(self):
        # {(the arguments' titles, the codes): the places}, in the order of the methods.
        self.found = {}

    def add(self, use):
        titles = {argument.name: title(argument) for argument in use.method.arguments}
        for line, place, slot in use.slots():
            if slot.template:
                continue
            key = (tuple(titles[name] for name in slot.arguments), tuple(use.codes(slot).items()))
            places = self.found.setdefault(key, [])
            if context(line, place) not in places:
                places.append(context(line, place))

    def text(self):
        alone = {}
        together = []
        for (titles, codes), places in self.found.items():
            if len(titles) == 1:
                alone.setdefault(titles[0], []).append((places, dict(codes)))
            else:
                together += self._together(titles, dict(codes), places)
        return [line for name, columns in alone.items()
                for line in self._alone(name, columns)] + together

    def _alone(self, name, columns):
        texts = [{value: text for (value,), text in codes.items()} for _, codes in columns]
        heads = [name, *[", ".join(map(code, places)) for places, _ in columns]]
        return [f"### {name}", "", *markdown(heads, rows(name, list(texts[0]), texts)), ""]

    def _together(self, titles, codes, places):
        sizes = [len({values[i] for values in codes}) for i in range(len(titles))]
        place = sizes.index(max(sizes))
        others = [*titles[:place], *titles[place + 1:]]
        columns = by_choice(codes, place)
        texts = [column for _, column in columns]
        heads = [titles[place], *[choices_name(others, choices) for choices, _ in columns]]
        return [f"### {', '.join(titles)}: {', '.join(map(code, places))}", "",
                *markdown(heads, rows(titles[place], list(texts[0]), texts)), ""]
