"""Equations and reports in notebooks: tables, shortened if they are long, and on demand a picture
of the tree, made by Graphviz."""
from __future__ import annotations

import html as _html
import shutil
import subprocess
from dataclasses import fields, is_dataclass
from typing import TYPE_CHECKING, Any, Iterable, List, Optional

import numpy as np

if TYPE_CHECKING:
    from ._equation import Equation
    from ._luts import LutArray
    from ._results import KarnaughMap, Report

MAX_ROWS = 64
MAX_COLUMNS = 24  # inputs; a wider table is not shown
MAX_TEXT = 500
MAX_ITEMS = 40
MAX_DEPTH = 4
DOT_SECONDS = 10


def _escape(text: str) -> str:
    """Escapes a text for HTML; bytes that are not UTF-8 become U+FFFD."""
    shown = text if len(text) <= MAX_TEXT else f"{text[:MAX_TEXT]}... ({len(text):,} characters)"
    return _html.escape(shown.encode("utf-8", "surrogateescape").decode("utf-8", "replace"))


def _row(tag: str, cells: Iterable[str]) -> str:
    return "<tr>" + "".join(f"<{tag}>{cell}</{tag}>" for cell in cells) + "</tr>"


def equation_html(equation: Equation) -> str:
    """The text and the truth table, at most 64 rows."""
    text = f"<code>{_escape(equation.text)}</code>"
    inputs = equation.inputs
    if len(inputs) > MAX_COLUMNS:
        return f"{text}<p>{len(inputs):,} inputs</p>"
    num_rows = 2 ** len(inputs)
    assignments = [[row >> bit & 1 for bit in reversed(range(len(inputs)))]
                   for row in range(min(num_rows, MAX_ROWS))]
    shape = (len(assignments), len(inputs))
    results = equation.eval_many(np.array(assignments, dtype=np.uint8).reshape(shape))
    lines = [text, "<table>", _row("th", [_escape(name) for name in inputs] + ["result"])]
    for values, result in zip(assignments, results):
        lines.append(_row("td", [str(value) for value in values] + [str(result)]))
    lines.append("</table>")
    if num_rows > MAX_ROWS:
        lines.append(f"<p>rows not shown: {num_rows - MAX_ROWS:,}</p>")
    return "\n".join(lines)


def map_html(map_: KarnaughMap) -> str:
    """A Karnaugh map as a table."""
    corner = f"{_escape(' '.join(map_.row_inputs))} \\ {_escape(' '.join(map_.column_inputs))}"
    lines = ["<table>", _row("th", [corner, *map_.column_labels])]
    for label, values in zip(map_.row_labels, map_.cells):
        lines.append("<tr><th>" + label + "</th>" +
                     "".join(f"<td>{value}</td>" for value in values) + "</tr>")
    return "\n".join([*lines, "</table>"])


def _value_html(value: Any, depth: int) -> str:
    if value is None:
        return ""
    if isinstance(value, str):
        return f"<code>{_escape(value)}</code>"
    if isinstance(value, tuple) and depth < MAX_DEPTH:
        shown = [_value_html(item, depth + 1) for item in value[:MAX_ITEMS]]
        if len(value) > MAX_ITEMS:
            shown.append(f"... ({len(value):,})")
        return ("<br>" if any(is_dataclass(item) for item in value) else ", ").join(shown)
    if is_dataclass(value) and depth < MAX_DEPTH:
        return _fields_html(value, depth + 1)
    return _escape(repr(value))


def _fields_html(report: Any, depth: int) -> str:
    lines: List[str] = ["<table>"]
    for field in fields(report):
        value = _value_html(getattr(report, field.name), depth)
        lines.append(f"<tr><th>{_escape(field.name.replace('_', ' '))}</th><td>{value}</td></tr>")
    return "\n".join([*lines, "</table>"])


def report_html(report: Report) -> str:
    """Any report as a table of its fields."""
    return _fields_html(report, 0)


def luts_html(luts: LutArray) -> str:
    """The first tables of an array, with the number of rows in which each is 1."""
    head = luts[:MAX_ITEMS]
    lines = ["<table>", _row("th", ["place", "init value", "ones"])]
    for place, ones in enumerate(head.count_ones()):
        lines.append(_row("td", [str(place), f"<code>{head[place]}</code>", str(ones)]))
    lines.append("</table>")
    if len(luts) > MAX_ITEMS:
        lines.append(f"<p>tables not shown: {len(luts) - MAX_ITEMS:,}</p>")
    return "\n".join(lines)


def svg(dot: str) -> Optional[str]:
    """The graph as a picture; None without Graphviz, or if it takes too long."""
    program = shutil.which("dot")
    if program is None:
        return None
    try:
        done = subprocess.run([program, "-Tsvg"], input=dot.encode("utf-8", "replace"), check=True,
                              stdout=subprocess.PIPE, stderr=subprocess.DEVNULL,
                              timeout=DOT_SECONDS)
    except (OSError, subprocess.SubprocessError):
        return None
    return done.stdout.decode("utf-8")
