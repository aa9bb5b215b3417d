"""Netlists in Python: what the class gives, and that the tool answers the same for random ones."""
import copy
import gzip
import io
import json
import os
import pathlib
import pickle
import subprocess
import sys
from typing import Any, Callable, Dict, List, Optional, Tuple

import booleq
import numpy as np
import pandas as pd
import pytest
import trees
from booleq import Equation, LutArray, Netlist, NetlistError, read_netlist
from hypothesis import given
from hypothesis import strategies as st
from test_interrupts import interrupted
from test_tool import PLAIN, TOOL, collect

MAPPED = """.model top
.inputs a b c s
.outputs y z w
.names s a b y
11- 1
0-1 1
.names a b z
11 1
.names z c s w
11- 1
.end
"""
ROUTED = MAPPED.replace(".names s a b y", ".names a s b y")
Table = Tuple[str, List[int], int, int]  # type, pins from the least significant, rows, place


def read(text: str, **options: Any) -> Netlist:
    return read_netlist(io.StringIO(text), **options)


def write_json(tables: List[Table], names: Dict[int, str], place_of: str = "place") -> str:
    """Yosys JSON; pins -1 and -2 are constants, -3 is x; table k drives net 100 + k."""
    def bit(pin: int) -> Any:
        return pin if pin >= 0 else "01x"[-1 - pin]

    cells: Dict[str, Any] = {}
    for number, (kind, pins, rows, place) in enumerate(tables):
        connections: Dict[str, Any] = {"Y": [100 + number]}
        width = 1 << len(pins)
        connections["A"] = [bit(pin) for pin in pins]
        if kind == "LUT6":
            connections = {f"I{pin}": [bit(net)] for pin, net in enumerate(pins)}
            connections["O"] = [100 + number]
        digits = f"{rows % (1 << width):0{width}b}"
        parameters: Dict[str, Any] = {"LUT": digits, "WIDTH": len(pins)}
        if kind == "LUT6":
            parameters = {"INIT": digits}
        cells[f"u{number}"] = {"type": kind, "parameters": parameters, "connections": connections,
                               "attributes": {place_of: f"X{place}"}}
    nets = {name: {"bits": [net], "hide_name": 0} for net, name in names.items()}
    return json.dumps({"modules": {"m": {"attributes": {"top": 1}, "cells": cells,
                                         "netnames": nets}}})


@st.composite
def designs(draw: st.DrawFn) -> List[Table]:
    tables = []
    for number in range(draw(st.integers(1, 6))):
        kind = draw(st.sampled_from(["$lut", "$lut", "LUT6"]))
        width = 6 if kind == "LUT6" else draw(st.integers(1, 7))
        pins = draw(st.lists(st.integers(-3, 6), min_size=width, max_size=width))
        pins = [pin if pin < 0 else pin + 2 for pin in pins]
        tables.append((kind, pins, draw(st.integers(0, 2 ** (1 << width) - 1)), number))
    return tables


def names_for(tables: List[Table], last: str = "") -> Dict[int, str]:
    names = {net: f"in{net}" for net in range(2, 9)}
    names.update({100 + number: f"out{number}" for number in range(len(tables))})
    if last:
        names[100 + len(tables) - 1] = last
    return names


@st.composite
def pairs(draw: st.DrawFn) -> Tuple[str, str]:
    """A design, and a similar one: with tables changed, missing, or on another net."""
    left = draw(designs())
    right = list(left)
    change = draw(st.sampled_from(["none", "rows", "swap", "gone", "name", "pin"]))
    number = draw(st.integers(0, len(left) - 1))
    kind, pins, rows, place = right[number]
    if change == "rows":
        rows ^= 1 << draw(st.integers(0, (1 << len(pins)) - 1))
    elif change == "swap":
        pins = pins[::-1]
    elif change == "pin":
        pins = [draw(st.integers(2, 8)), *pins[1:]]
    right[number] = (kind, pins, rows, place)
    if change == "gone":
        del right[number]
    last = "elsewhere" if change == "name" else ""
    return write_json(left, names_for(left)), write_json(right, names_for(right, last))


def tool(*arguments: str) -> Any:
    """The tool's JSON: an object, or for 'list' an object for each line."""
    assert TOOL is not None
    done = subprocess.run([TOOL, "netlist", *arguments], env=PLAIN, stdout=subprocess.PIPE,
                          stderr=subprocess.PIPE, timeout=300, check=False)
    assert done.returncode in (0, 1), done.stderr
    lines = [json.loads(line) for line in done.stdout.splitlines()]
    return lines if arguments[0] == "list" else lines[0]


# --- what the class gives


def test_columns() -> None:
    netlist = read(MAPPED)
    assert len(netlist) == 3 and netlist.widths == (2, 3) and netlist.types == (".names",)
    assert netlist.format == "BLIF" and netlist.top == "top"
    assert netlist.file is None and netlist.key is None
    assert netlist.nets[:4] == ("1'b0", "1'b1", "1'bx", "(open)")
    assert netlist.paths == ("y", "z", "w")
    three = netlist.tables(3)
    assert len(three) == 2 and three.places.tolist() == [0, 2] and three.lines.tolist() == [4, 9]
    assert three.luts == LutArray([0xd8, 0x88], 3)
    named = [[netlist.nets[net] for net in row] for row in three.inputs]
    assert named == [["b", "a", "s"], ["s", "c", "z"]]
    assert [netlist.nets[net] for net in three.outputs] == ["y", "w"]
    assert len(netlist.tables(5)) == 0 and netlist.tables(5).inputs.shape == (0, 5)
    assert len(netlist.tables(5).luts) == 0 and netlist.tables(16).words.shape == (0, 1024)
    for width in (-1, 17):
        with pytest.raises(ValueError, match="0 to 16 inputs"):
            netlist.tables(width)


def test_a_table_is_its_equation() -> None:
    table = read(MAPPED)[0]
    equation = Equation(table.init, table.inputs)
    assert equation.equivalent("(s & a) | (~s & b)")
    assert read(MAPPED)[-1].path == "w"
    for place in (3, -4):
        with pytest.raises(IndexError, match="of 3"):
            read(MAPPED)[place]


@pytest.mark.parametrize("width", [0, 1, 7, 8, 16])
def test_all_widths(width: int) -> None:
    rows = (0x123456789abcdef0 << 64 | 0xfedcba9876543211) % (1 << min(1 << width, 128))
    digits = f"{rows:0{1 << width}b}" if width else "1"
    text = json.dumps({"modules": {"m": {"cells": {"u": {
        "type": "$lut", "parameters": {"LUT": digits, "WIDTH": width},
        "connections": {"A": list(range(2, 2 + width)), "Y": [90]}}}}}})
    netlist = read(text)
    group = netlist.tables(width)
    words = group.words[0].tolist()
    assert sum(word << 64 * place for place, word in enumerate(words)) == int(digits, 2)
    assert int(netlist[0].init, 0) == int(digits, 2)
    assert netlist.frame()["init"][0] == netlist[0].init
    if 1 <= width <= 7:
        assert group.luts[0] == netlist[0].init
    else:
        with pytest.raises(ValueError, match=f"these have {width}"):
            group.luts


def test_frame() -> None:
    frame = read(MAPPED).frame()
    assert frame.columns.tolist() == ["path", "type", "output", "inputs", "width", "init", "line"]
    assert frame["inputs"][0] == ("b", "a", "s") and str(frame["type"].dtype) == "category"
    assert frame.groupby("width")["path"].count().to_dict() == {2: 1, 3: 2}
    keyed = read(write_json([("$lut", [2, 3], 8, 5)], {2: "a"}), key="place").frame()
    assert keyed["key"].tolist() == ["X5"] and "line" not in keyed
    assert len(read(".model m\n.end\n").frame()) == 0


def test_values_never_change() -> None:
    netlist = read(MAPPED)
    with pytest.raises(AttributeError, match="never changes"):
        netlist.file = "other"  # type: ignore[misc]
    with pytest.raises(TypeError, match="read_netlist"):
        Netlist()
    with pytest.raises(TypeError, match="pickle"):
        pickle.dumps(netlist)
    assert copy.copy(netlist) is netlist and copy.deepcopy(netlist) is netlist
    different = netlist.diff(read(ROUTED))
    assert hash(different) == hash(netlist.diff(read(ROUTED)))
    assert hash(netlist.stats()) == hash(read(MAPPED).stats())


# --- comparing


def test_diff() -> None:
    found = read(MAPPED).diff(read(ROUTED))
    assert found and (found.same, found.num_different) == (2, 1)
    table, = found.different
    assert table.left == table.right == "y" and table.matched_by == "net"
    assert table.assignment == {"b": 1, "a": 0, "s": 1} and table.values == (0, 1)
    assert table.causes[0][0] == "pins-swapped" and table.should_be == "0xb8"
    assert table.left_equation is not None
    assert Equation(table.left_equation).equivalent("(s & a) | (~s & b)")
    assert not read(MAPPED).diff(read(MAPPED))


def test_renames() -> None:
    renamed = MAPPED.replace(" z", " product")
    found = read(MAPPED).diff(read(renamed))
    assert [tuple(net) for net in found.renamed] == [("z", "product", 2)]
    assert not read(MAPPED).diff(read(renamed), renames={"z": "product"})
    unused = read(MAPPED).diff(read(MAPPED), renames={"no": "such"})
    assert unused.unused_renames == (("no", "such"),) and not unused


def test_keys_and_wires() -> None:
    left = [("$lut", [2, 3], 8, 1), ("$lut", [100, 4], 14, 2)]
    right = [("$lut", [3, 2], 8, 1), ("$lut", [100, 4], 14, 2), ("$lut", [100], 2, 3)]
    one = read(write_json(left, {2: "a", 100: "x"}), key="place")
    other = read(write_json(right, {2: "n1", 100: "n2"}), key="place")
    found = one.diff(other, names="gone")
    assert found.names == "gone" and found.added[0].wire == "only passes n2" and found
    assert not one.diff(other, names="gone", allow_wires=True)
    with pytest.raises(ValueError, match="key="):
        read(MAPPED).diff(other, names="gone")


def test_open_inputs_and_max_described() -> None:
    cell = {"type": "LUT2", "parameters": {"INIT": "1000"},
            "connections": {"I0": [2], "O": [9]}}
    texts = []
    for init in ("0000", "1000"):
        cell["parameters"] = {"INIT": init}
        texts.append(json.dumps({"modules": {"m": {"cells": {"u": cell}, "netnames": {
            "y": {"bits": [9]}, "a": {"bits": [2]}}}}}))
    left, right = map(read, texts)
    assert left.diff(right) and left.diff(right, open_inputs=1)
    assert not left.diff(right, open_inputs=0)
    bounded = left.diff(right, max_described=0)
    assert bounded.num_different == 1 and bounded.different == ()


def test_misuse() -> None:
    netlist = read(MAPPED)
    with pytest.raises(TypeError, match="must be a Netlist, not str"):
        netlist.diff("other")  # type: ignore[arg-type]
    with pytest.raises(ValueError, match="'auto', 'kept' or 'gone'"):
        netlist.diff(netlist, names="any")  # type: ignore[arg-type]
    with pytest.raises(ValueError, match="0, 1 or None"):
        netlist.diff(netlist, open_inputs=2)  # type: ignore[arg-type]
    with pytest.raises(ValueError, match="0 or more"):
        netlist.diff(netlist, max_described=-1)
    with pytest.raises(TypeError):
        read_netlist(5)  # type: ignore[arg-type]


# --- files that are not netlists


def test_files(tmp_path: pathlib.Path) -> None:
    file = tmp_path / "d\udcff\u00e4.blif"
    file.write_text(MAPPED, encoding="ascii")
    assert read_netlist(file).paths == read_netlist(os.fsencode(file)).paths == (  # type: ignore
        "y", "z", "w")
    packed = tmp_path / "d.gz"
    packed.write_bytes(gzip.compress(MAPPED.encode()))
    assert read_netlist(str(packed)).frame().equals(read(MAPPED).frame())
    with packed.open("rb") as stream:
        assert len(read_netlist(stream)) == 3
    with pytest.raises(FileNotFoundError) as missing:
        read_netlist(tmp_path / "none")
    assert missing.value.filename == str(tmp_path / "none")
    with pytest.raises(IsADirectoryError):
        read_netlist(tmp_path)
    packed.write_bytes(packed.read_bytes()[:-9])
    with pytest.raises(NetlistError, match="truncated") as damaged:
        read_netlist(packed)
    assert damaged.value.file == str(packed) and damaged.value.line is None


@pytest.mark.parametrize("text, line, reason", [
    (MAPPED.replace("11 1", "1x 1"), 8, "expected 0, 1 or -, not '1x'"),
    (MAPPED[:-5], 10, "the text ends inside model 'top', without .end"),
    ("hello", None, "it is not a netlist"),
    ("", None, "it is empty"),
    ('{"modules": {"a": {}, "b": {}}}', None, "several modules can be the top"),
])
def test_refusals(tmp_path: pathlib.Path, text: str, line: Optional[int], reason: str) -> None:
    file = tmp_path / "line 3: bad"
    file.write_text(text, encoding="ascii")
    with pytest.raises(NetlistError) as refused:
        read_netlist(file)
    error = refused.value
    assert error.file == str(file) and error.line == line
    assert error.reason.startswith(reason) and str(error).startswith(f"{file}: ")
    again = pickle.loads(pickle.dumps(error))
    assert (again.file, again.line, again.reason, str(again)) == (
        error.file, error.line, error.reason, str(error))


def test_options(tmp_path: pathlib.Path) -> None:
    cells = tmp_path / "my.cells"
    cells.write_text("cell MYLUT\n", encoding="ascii")
    with pytest.raises(NetlistError, match="my.cells") as refused:
        read(MAPPED, cells=cells)
    assert refused.value.reason
    with pytest.raises(FileNotFoundError):
        read(MAPPED, cells=tmp_path / "none")
    two = json.dumps({"modules": {"a": {"cells": {}}, "b": {"cells": {}}}})
    assert read(two, top="b").top == "b"
    with pytest.raises(NetlistError, match="no module 'c'"):
        read(two, top="c")


def test_standard_input() -> None:
    script = "import booleq; print(booleq.read_netlist('-').paths)"
    done = subprocess.run([sys.executable, "-c", script], input=MAPPED, text=True,
                          stdout=subprocess.PIPE, timeout=60, check=True)
    assert done.stdout == "('y', 'z', 'w')\n"


# --- large ones


def large(count: int) -> str:
    rows = "".join(f".names i{k % 97} i{k % 89} i{k % 83} n{k}\n11- 1\n0-1 1\n"
                   for k in range(count))
    return f".model m\n{rows}.end\n"


def test_an_interrupt_ends_it(tmp_path: pathlib.Path) -> None:
    file = tmp_path / "large.blif"
    file.write_text(large(300_000), encoding="ascii")
    interrupted(lambda: [read_netlist(file) for _ in range(100)], before=0.3)
    netlist = read_netlist(file)
    interrupted(lambda: [netlist.diff(netlist) for _ in range(100)], before=0.3)
    interrupted(lambda: [netlist.check() for _ in range(100)], before=0.3)
    interrupted(lambda: [netlist.stats() for _ in range(1000)], before=0.3)
    assert not netlist.diff(netlist) and len(netlist.frame()) == 300_000


def test_a_pipe_that_nobody_writes(tmp_path: pathlib.Path) -> None:
    pipe = tmp_path / "pipe"
    os.mkfifo(pipe)
    with open(os.open(pipe, os.O_RDWR), "wb"):  # it is open, but nothing is written
        interrupted(lambda: read_netlist(pipe))


def test_the_lock_is_given_up(tmp_path: pathlib.Path,
                              longest_pause: Callable[[Callable[[], object]], float]) -> None:
    file = tmp_path / "large.blif"
    file.write_text(large(200_000), encoding="ascii")

    def work() -> None:
        one = read_netlist(file)
        one.diff(read_netlist(file))
        one.stats()

    assert longest_pause(work) < 0.5


# --- the tool


@pytest.mark.skipif(TOOL is None, reason="no tool booleq; BOOLEQ_TOOL names it")
def test_the_tool_says_the_same_of_one(tmp_path: pathlib.Path) -> None:
    file = tmp_path / "d.json"
    for tables in collect(designs(), 25):
        file.write_text(write_json(tables, names_for(tables)), encoding="ascii")
        netlist = read_netlist(file)
        listed = tool("list", "--json", str(file))
        assert [(t["path"], t["type"], t["output"], tuple(t["pins"]), t["init"])
                for t in listed] == [tuple(table)[:5] for table in netlist]
        frame = netlist.frame()
        assert frame[["path", "type", "output", "inputs", "init"]].astype(object).values.tolist() \
            == [[t["path"], t["type"], t["output"], tuple(t["pins"]), t["init"]] for t in listed]
        stats = tool("stats", "--json", str(file))["result"]
        own = netlist.stats()
        for name in ("format", "top", "cells", "tables", "functions", "classes", "wide_functions",
                     "constants", "wires", "inverters", "idle_inputs", "not_read"):
            assert getattr(own, name) == stats[name], name
        for name in ("by_pins", "by_inputs"):
            assert {str(key): count for key, count in getattr(own, name)} == stats[name]
        assert dict(own.findings) == stats["findings"]
        assert [kind._asdict() for kind in own.types] == stats["types"]
        assert [{**function._asdict(), "inputs": list(function.inputs)}
                for function in own.commonest] == stats["commonest"]
        assert [finding._asdict() for finding in netlist.check()] == \
            tool("check", "--json", str(file))["result"]["findings"]


@pytest.mark.skipif(TOOL is None, reason="no tool booleq; BOOLEQ_TOOL names it")
def test_the_tool_says_the_same_of_two(tmp_path: pathlib.Path) -> None:
    files = [tmp_path / "left.json", tmp_path / "right.json"]
    different = 0
    for texts in collect(pairs(), 40):
        for file, text in zip(files, texts):
            file.write_text(text, encoding="ascii")
        answer = tool("diff", "--json", *map(str, files))
        theirs = answer["result"]
        own = read_netlist(files[0]).diff(read_netlist(files[1]))
        assert own.is_same == (answer["status"] == "yes")
        different += bool(own)
        for name in ("same", "same_but_for_names", "num_different", "names", "matched_nets",
                     "compared_by_order"):
            assert getattr(own, name) == theirs[name], name
        for name in ("missing", "added", "renamed"):
            assert [part._asdict() for part in getattr(own, name)] == theirs[name]
        assert [{"left": table.left, "right": table.right, "matched_by": table.matched_by,
                 "net": table.net,
                 "assignment": None if table.assignment is None else dict(table.assignment),
                 "left_value": table.values and table.values[0],
                 "right_value": table.values and table.values[1],
                 "left_equation": table.left_equation, "right_equation": table.right_equation,
                 "should_be": table.should_be,
                 "causes": [{"code": code, "message": text} for code, text in table.causes]}
                for table in own.different] == theirs["different"]
    assert different > 5


@trees.examples(60)
@given(designs())
def test_luts_are_the_tables(tables: List[Table]) -> None:
    """Row by row, as written in the file."""
    netlist = read(write_json(tables, names_for(tables)))
    numbers = {name: net for net, name in names_for(tables).items()}
    for width in netlist.widths:
        group = netlist.tables(width)
        for place, words in zip(group.places.tolist(), group.words):
            _, pins, rows, _ = tables[place]
            assert int(words[0]) | (int(words[1]) << 64 if width == 7 else 0) == rows
            spelled = [numbers.get(name, {"1'b0": -1, "1'b1": -2, "1'bx": -3}.get(name))
                       for name in netlist[place].inputs]
            assert spelled == pins[::-1]
    assert sorted(np.concatenate([netlist.tables(w).places for w in netlist.widths]).tolist()) \
        == list(range(len(tables)))


def test_findings_make_a_frame() -> None:
    frame = pd.DataFrame(read(MAPPED).check())
    assert frame["code"].tolist() == ["idle-input"] and frame["path"].tolist() == ["w"]
    assert frame.columns.tolist() == ["code", "severity", "path", "line", "message"]


def test_names_of_the_class() -> None:
    assert repr(read(MAPPED)) == "<Netlist of 3 tables, BLIF>"
    assert str(booleq.read_netlist.__module__) == "booleq"
