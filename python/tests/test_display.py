"""Equations in notebooks."""
import os
import shutil
import stat
from pathlib import Path
from typing import Any
from xml.etree import ElementTree

import pytest

from booleq import Equation, LutArray


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
        assert Equation(text)._repr_html_() == f"<code>{text}</code><p>31 inputs</p>"
        twenty_four = "|".join(f"x{k}" for k in range(24))
        assert "rows not shown: 16,777,152" in Equation(twenty_four)._repr_html_()
        assert len(Equation("&".join(f"x{k}" for k in range(100000)))._repr_html_()) < 2000

    @pytest.mark.parametrize("make", [
        lambda eq: eq.equivalent("a"), lambda eq: eq.satisfiable(), lambda eq: eq.match("x & y"),
        lambda eq: eq.convert("verilog", name="gate"), lambda eq: eq.kmap(), lambda eq: eq.lint(),
        lambda eq: eq.explain(), lambda eq: eq.minimize(), lambda eq: LutArray([8, 6], 2)])
    def test_every_report_has_a_form(self, make: Any) -> None:
        text = make(Equation("a & '<b>'"))._repr_html_()
        ElementTree.fromstring("<p>" + text.replace("<br>", "<br/>") + "</p>")
        assert "<table>" in text and "<b>" not in text

    def test_reports_of_large_equations_are_short(self) -> None:
        large = Equation(" & ".join(f"x{k}" for k in range(3000)))
        reports: Any = (large, large.lint(), large.satisfiable(), large.equivalent("x0"),
                       large.convert("verilog"))
        for report in reports:
            assert len(repr(report)) < 4000
            assert len(report._repr_html_()) < 40000


class TestSvg:
    @pytest.mark.skipif(shutil.which("dot") is None, reason="there is no Graphviz")
    def test_picture(self) -> None:
        text = Equation("A & '<\u00fc>'").tree_svg()
        assert text is not None
        root = ElementTree.fromstring(text)
        assert root.tag.endswith("svg")
        labels = [element.text for element in root.iter() if element.tag.endswith("}text")]
        assert "A" in labels and "'<\u00fc>'" in labels

    def test_only_who_asks_gets_one(self) -> None:
        assert not hasattr(Equation("A"), "_repr_svg_")

    def test_without_graphviz(self, monkeypatch: pytest.MonkeyPatch, tmp_path: Path) -> None:
        monkeypatch.setenv("PATH", str(tmp_path))
        assert Equation("A").tree_svg() is None

    @pytest.mark.parametrize("script", ["exit 1", "kill -9 $$", None])
    def test_graphviz_fails(self, monkeypatch: pytest.MonkeyPatch, tmp_path: Path,
                            script: str) -> None:
        program = tmp_path / "dot"
        program.write_text(f"#!/bin/sh\n{script}\n" if script else "no program",
                           encoding="ascii")
        program.chmod(program.stat().st_mode | stat.S_IXUSR)
        monkeypatch.setenv("PATH", str(tmp_path), prepend=os.pathsep)
        assert Equation("A").tree_svg() is None
