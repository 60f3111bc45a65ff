# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""report.html: one page with everything in it, without a script; it asks for nothing from anywhere."""

import pathlib

import jinja2

from .charts import Chart
from .measurements import shown

TEMPLATE = "page.html.j2"


def html(run):
    """The text of the page. Everything that came from a plan or a phone is escaped."""
    environment = jinja2.Environment(
        autoescape=True, undefined=jinja2.StrictUndefined, trim_blocks=True, lstrip_blocks=True,
        loader=jinja2.FileSystemLoader(pathlib.Path(__file__).parent))
    environment.filters["shown"] = lambda value: "" if value is None else shown(value)
    return environment.get_template(TEMPLATE).render(run=run, charts=charts)


def charts(results, prefix):
    """(title, SVG, why there is none) of each sweep that has a number to show."""
    drawn = [Chart(name, measurements) for name, measurements in results.sweeps.items()]
    return [(chart.title, *svg_of(chart, f"{prefix}-{index}-"))
            for index, chart in enumerate(drawn) if chart.lines]


def svg_of(chart, prefix):
    """Whatever matplotlib cannot draw, the rest of the report is worth having."""
    try:
        return chart.svg(prefix), ""
    except ImportError:
        return "", "python3-matplotlib is not installed"
    except Exception as error:  # pylint: disable=broad-exception-caught
        return "", f"matplotlib cannot draw it: {error}"
