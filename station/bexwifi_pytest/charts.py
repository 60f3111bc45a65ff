# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The chart of a sweep, as SVG for an HTML page."""

import io
import math
import xml.etree.ElementTree as ET

from .measurements import number, shown

SVG = "http://www.w3.org/2000/svg"
LINK = "{http://www.w3.org/1999/xlink}href"
SIZE = (7.5, 3.6)  # inches
BAD = "#b00020"


def clipped(text, most=40):
    """A text that leaves room for the chart."""
    return text if len(text) <= most else f"{text[:most - 1]}…"


class Chart:
    """Of the measurements of one name: over the first key of `at`, a line for each value of the others."""

    def __init__(self, name, measurements):
        self.name = name
        self.unit = measurements[0].unit
        self.across = next(iter(measurements[0].at))
        self.lines = {}
        for each in measurements:
            others = {key: value for key, value in each.at.items() if key != self.across}
            label = ", ".join(f"{key}={shown(value)}" for key, value in others.items())
            if number(each.value) is not None and math.isfinite(each.value):
                self.lines.setdefault(label, []).append((each.at.get(self.across, ""), each))

    @property
    def title(self):
        lines = f", {len(self.lines)} lines" if len(self.lines) > 1 else ""
        return f"{self.name} over {self.across}{lines}"

    def svg(self, prefix):
        """The element as text. Its ids begin with the prefix, since a page has several charts."""
        # Takes a second, so only where there is a sweep. Without pyplot: no window, no global state.
        from matplotlib import rc_context  # pylint: disable=import-outside-toplevel
        from matplotlib.backends.backend_svg import FigureCanvasSVG  # pylint: disable=import-outside-toplevel
        from matplotlib.figure import Figure  # pylint: disable=import-outside-toplevel

        out = io.BytesIO()
        with rc_context({"svg.fonttype": "none", "svg.hashsalt": "bexwifi", "text.parse_math": False}):
            figure = Figure(figsize=SIZE)
            FigureCanvasSVG(figure)
            self._draw(figure.add_subplot())
            figure.savefig(out, format="svg", bbox_inches="tight", metadata={
                "Date": None, "Creator": None, "Format": None, "Type": None})
        return self._element(ET.fromstring(out.getvalue()), prefix)

    def _draw(self, axes):
        places = dict.fromkeys(place for points in self.lines.values() for place, _ in points)
        if all(number(place) is not None for place in places):
            places = {place: place for place in places}
        else:  # texts stand side by side
            places = {place: index for index, place in enumerate(places)}
            axes.set_xticks(range(len(places)), [clipped(shown(place)) for place in places])
        for index, (label, points) in enumerate(self.lines.items()):
            points = sorted(points, key=lambda point: places[point[0]])
            x = [places[place] for place, _ in points]
            measurements = [each for _, each in points]
            colour = f"C{index % 10}"
            axes.plot(x, [each.value for each in measurements], "o-", color=colour, markersize=4,
                      label=clipped(label) or None)
            missed = [(place, each.value) for place, each in zip(x, measurements) if each.missed]
            axes.plot(*zip(*missed) if missed else ([], []), "X", color=BAD, markersize=10)
            for limits in ([each.low for each in measurements], [each.high for each in measurements]):
                if any(limit is not None for limit in limits):
                    axes.plot(x, [math.nan if limit is None else limit for limit in limits], "_--",
                              color=BAD, linewidth=1, markersize=12)
        if any(each.verdict for points in self.lines.values() for _, each in points):
            axes.plot([], [], "--", color=BAD, label="limit")
            axes.plot([], [], "X", color=BAD, linestyle="none", label="limit missed")
        axes.set_xlabel(clipped(self.across))
        axes.set_ylabel(clipped(self.unit))
        axes.grid(alpha=0.3)
        if axes.get_legend_handles_labels()[1]:
            axes.legend(fontsize="small", loc="center left", bbox_to_anchor=(1, 0.5))

    def _element(self, root, prefix):
        for element in root.iter():
            for name, value in list(element.attrib.items()):
                if name == "id":
                    element.set(name, prefix + value)
                elif name == LINK:
                    element.set(name, value.replace("#", f"#{prefix}", 1))
                elif "url(#" in value:
                    element.set(name, value.replace("url(#", f"url(#{prefix}"))
        for metadata in root.findall(f"{{{SVG}}}metadata"):
            root.remove(metadata)
        for name in ("width", "height"):  # the page's width decides, by viewBox
            root.attrib.pop(name, None)
        root.set("role", "img")
        root.set("aria-label", self.title)
        ET.register_namespace("", SVG)
        ET.register_namespace("xlink", LINK[1:].partition("}")[0])
        return ET.tostring(root, encoding="unicode")
