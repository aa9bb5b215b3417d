"""Completed tables of functions: booleq.batch against the tool's command; what tables may be."""
import json
import random
import subprocess
from typing import Any, Dict, List, Optional

import booleq
import numpy as np
import pandas as pd
import pytest
from booleq import Equation
from test_tool import PLAIN, TOOL

MEMBERS = ("inputs", "equation", "init")


def random_rows(number: int) -> List[Dict[str, Any]]:
    generator = random.Random(1)
    rows: List[Dict[str, Any]] = []
    for _ in range(number):
        names = generator.sample(["a", "b", "c", "'d[0]'", "e"], generator.randrange(1, 5))
        text = " ".join(f"{generator.choice(names)} {generator.choice(['&', '|', '~^'])}"
                        for _ in range(4)) + " " + names[0]
        init = Equation(text, names).hex_init()
        if generator.random() < 0.2:
            init = "0x" + "".join(generator.choice("012345678g") for _ in init[2:])
        row: Dict[str, Any] = {"inputs": ",".join(names), "equation": text, "init": init}
        if generator.random() < 0.1:
            row["equation"] = text + generator.choice([" &&", " | z", " 'q"])
        for member in MEMBERS:
            if generator.random() < 0.3:
                row[member] = None
        rows.append(row)
    return rows


@pytest.mark.skipif(TOOL is None, reason="no tool booleq; BOOLEQ_TOOL names it")
def test_it_is_what_the_tool_does() -> None:
    assert TOOL is not None
    rows = random_rows(3000)
    lines = "".join(json.dumps({name: row[name] for name in MEMBERS if row[name] is not None}) + "\n"
                    for row in rows)
    done = subprocess.run([TOOL, "batch", "--json", "-"], input=lines.encode(), env=PLAIN,
                          stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, timeout=300, check=False)
    answers = [json.loads(line)["result"] for line in done.stdout.splitlines()]
    table = booleq.batch({name: [row[name] for row in rows] for name in MEMBERS})
    assert len(answers) == len(rows) == len(table["result"])
    for place, answer in enumerate(answers):
        assert table["result"][place] == answer["outcome"], rows[place]
        assert table["message"][place] == answer["message"]
        assert (table["inputs"][place] or "") == ",".join(answer["inputs"])
        for member in ("equation", "init"):
            assert (table[member][place] or "") == answer[member]
    assert len(set(table["result"])) == 5


def test_a_frame_keeps_what_it_has() -> None:
    frame = pd.DataFrame({"cell": ["u1", "u2"], "equation": ["A & B", np.nan],
                          "inputs": [None, ["S", "A", "B"]], "init": [pd.NA, 0xca]}, index=[7, 3])
    done = booleq.batch(frame)
    assert list(done.columns) == ["cell", "equation", "inputs", "init", "result", "message"]
    assert list(done.index) == [7, 3] and "result" not in frame.columns
    assert done["inputs"].tolist() == ["A,B", ["S", "A", "B"]]
    assert done["equation"].tolist() == ["A & B", "(S & A) | (~S & B)"]
    assert done["init"].tolist() == ["0x8", 0xca] and done["message"].tolist() == [None, None]
    assert pd.isna(frame["init"][7])
    assert booleq.batch(done)["result"].tolist() == ["ok", "ok"]
    assert booleq.batch(frame[:0])["result"].tolist() == []


@pytest.mark.parametrize("inputs, value, init", [("A", 2, "0b10"), (["A"], np.uint8(1), "0b01"),
                                                 ("A,B", 0x6, "0x6"), ("A,B,C", 0x0a, "0x0a")])
def test_ints(inputs: Any, value: Any, init: str) -> None:
    done = booleq.batch({"inputs": [inputs], "init": [value]})
    names = inputs.split(",") if isinstance(inputs, str) else inputs
    assert done["result"] == ["filled"]
    assert Equation(done["equation"][0], names).equivalent(Equation.from_init(init, names))


@pytest.mark.parametrize("table, error, message", [
    ("a", TypeError, "table must be"), (None, TypeError, "table must be"),
    ({"a": []}, ValueError, "none of the columns"),
    ({"equation": "a"}, TypeError, "column equation must be a sequence"),
    ({"equation": ["a"], "init": []}, ValueError, "of one length, not 0, 1"),
    ({"equation": [3]}, TypeError, r"equation\[0\] must be a str, not int"),
    ({"inputs": [3]}, TypeError, r"inputs\[0\] must be a text or a list of names, not int"),
    ({"inputs": [["A", 3]]}, TypeError, r"inputs\[0\] must be a str, not int"),
    ({"init": [8]}, ValueError, r"init\[0\] is an int, which takes 1 to 30 listed inputs"),
    ({"inputs": ["A,B"], "init": [16]}, ValueError, r"init\[0\]: 0 <= value < 2\*\*4"),
    ({"inputs": ["A,B"], "init": [-1]}, ValueError, r"init\[0\]: 0 <= value < 2\*\*4"),
    ({"equation": ["a\0b"]}, ValueError, r"equation\[0\] has a NUL character"),
    (pd.DataFrame([["a", "b"]], columns=["init", "init"]), ValueError, "two columns 'init'"),
])
def test_what_is_no_table(table: Any, error: Any, message: str) -> None:
    with pytest.raises(error, match=message):
        booleq.batch(table)


@pytest.mark.parametrize("row, outcome, message", [
    ({"inputs": "A,'b"}, "refused", "a single quote is not closed among the inputs"),
    ({"inputs": "A,B"}, "incomplete", None), ({"equation": "1"}, "incomplete", None),
    ({"inputs": "A,A", "equation": "A"}, "refused", None)])
def test_rows_that_are_not_completed(row: Dict[str, str], outcome: str,
                                     message: Optional[str]) -> None:
    done = booleq.batch({name: [value] for name, value in row.items()})
    assert done["result"] == [outcome] and done["message"][0]
    assert message is None or done["message"] == [message]
    assert all(done[name] == [value] for name, value in row.items())
