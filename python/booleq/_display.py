"""Equations in notebooks: a table, and a picture by Graphviz."""
import html as _html
import shutil
import subprocess
from typing import List, Optional

import numpy as np

from ._booleq import Equation

MAX_ROWS = 64
MAX_INPUTS = 30  # no truth table above
DOT_SECONDS = 10


def _escape(text: str) -> str:
    """For HTML; bytes that are no UTF-8 become U+FFFD."""
    return _html.escape(text.encode("utf-8", "surrogateescape").decode("utf-8", "replace"))


def _row(tag: str, cells: List[str]) -> str:
    return "<tr>" + "".join(f"<{tag}>{cell}</{tag}>" for cell in cells) + "</tr>"


def html(equation: Equation) -> str:
    text = f"<code>{_escape(equation.text)}</code>"
    inputs = equation.inputs
    if len(inputs) > MAX_INPUTS:
        return text
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
        lines.append(f"<p>rows not shown: {num_rows - MAX_ROWS}</p>")
    return "\n".join(lines)


def svg(dot: str) -> Optional[str]:
    program = shutil.which("dot")
    if program is None:
        return None
    try:
        done = subprocess.run([program, "-Tsvg"], input=dot.encode("ascii"), check=True,
                              stdout=subprocess.PIPE, stderr=subprocess.DEVNULL,
                              timeout=DOT_SECONDS)
    except (OSError, subprocess.SubprocessError):
        return None
    return done.stdout.decode("utf-8")
