"""Equations in notebooks."""
import os
import stat
from pathlib import Path
from xml.etree import ElementTree

import pytest

from booleq import Equation


class TestHtml:
    def test_table(self) -> None:
        text = Equation("A & ~B")._repr_html_()
        table = ElementTree.fromstring(text[text.index("<table>"):])
        rows = [[cell.text for cell in row] for row in table]
        assert rows == [["A", "B", "result"], ["0", "0", "0"], ["0", "1", "0"], ["1", "0", "1"],
                        ["1", "1", "0"]]
        assert "<code>A &amp; ~B</code>" in text and "not shown" not in text

    def test_sixty_four_rows(self) -> None:
        text = Equation("&".join(f"x{k}" for k in range(8)))._repr_html_()
        assert text.count("<tr>") == 65 and "rows not shown: 192" in text
        assert "not shown" not in Equation("&".join("ABCDEF"))._repr_html_()

    def test_names_are_escaped(self) -> None:
        text = Equation("'<b>\"&' | '\udcff\u00fc'")._repr_html_()
        assert "<b>" not in text
        assert "<th>&#x27;&lt;b&gt;&quot;&amp;&#x27;</th>" in text and "'\ufffd\u00fc'" in \
            text.replace("&#x27;", "'")
        text.encode("utf-8")

    def test_without_inputs(self) -> None:
        assert "<tr><td>1</td></tr>" in Equation("1")._repr_html_()

    def test_many_inputs(self) -> None:
        text = "|".join(f"x{k}" for k in range(31))
        assert Equation(text)._repr_html_() == f"<code>{text}</code>"
        assert "rows not shown: 1073741760" in Equation(text[:-4])._repr_html_()

    def test_values_stay(self) -> None:
        equation = Equation("A & B")
        equation["A"] = 1
        equation._repr_html_()
        assert dict(equation) == {"A": 1, "B": 0}


class TestSvg:
    def test_picture(self) -> None:
        text = Equation("A & '<\u00fc>'")._repr_svg_()
        assert text is not None
        root = ElementTree.fromstring(text)
        assert root.tag.endswith("svg")
        labels = [element.text for element in root.iter() if element.tag.endswith("}text")]
        assert "A" in labels and "'<\\xc3\\xbc>'" in labels

    def test_too_large_to_look_at(self) -> None:
        assert Equation("|".join(f"x{k}" for k in range(200)))._repr_svg_() is None
        assert Equation(20000 * "~" + "A")._repr_svg_() is None
        assert Equation.from_init(2 ** 2 ** 19, [f"x{k}" for k in range(20)])._repr_svg_() is None

    def test_without_graphviz(self, monkeypatch: pytest.MonkeyPatch, tmp_path: Path) -> None:
        monkeypatch.setenv("PATH", str(tmp_path))
        assert Equation("A")._repr_svg_() is None

    @pytest.mark.parametrize("script", ["exit 1", "kill -9 $$", None])
    def test_graphviz_fails(self, monkeypatch: pytest.MonkeyPatch, tmp_path: Path,
                            script: str) -> None:
        program = tmp_path / "dot"
        program.write_text(f"#!/bin/sh\n{script}\n" if script else "no program",
                           encoding="ascii")
        program.chmod(program.stat().st_mode | stat.S_IXUSR)
        monkeypatch.setenv("PATH", str(tmp_path), prepend=os.pathsep)
        assert Equation("A")._repr_svg_() is None
