"""The module and the tool booleq give the same answers: many texts, each command once for all.

The tool is BOOLEQ_TOOL, the one built with the module, or booleq on the PATH; without one the tests
are skipped.
"""
import json
import os
import pathlib
import pickle
import re
import shutil
import subprocess
from typing import Any, Callable, Dict, List, Mapping, Optional, Sequence, Tuple, TypeVar

import booleq
import pytest
import trees
from booleq import Equation, ParseError
from hypothesis import given
from hypothesis import strategies as st

BUILT = pathlib.Path(booleq.__file__).absolute().parents[2] / "tools/booleq/booleq"
TOOL = os.environ.get("BOOLEQ_TOOL") or shutil.which(str(BUILT)) or shutil.which("booleq")
# The locale in which the tool shows bytes outside ASCII as characters, as the module does.
PLAIN = {**os.environ, "LC_ALL": "C.UTF-8"}
LISTED = ["S", "A", "'a,b'", "b"]
# What a mutation inserts into a text: pieces of tokens, characters of one to four bytes, stray
# bytes.
PIECES = ["&", "&&", "|", "~", "!", "^", "(", ")", "()", "'", "''", ".", ".XNOR.", ".and.", ".NOT.",
          "0", "1", "2", "0x", "A", " ", "\t", "\r", "[0]", "=", "$", "\u00e4", "\u20ac",
          "\U0001f600", "\udcff", "\udcc3", "\x7f", "\x00", ";", "\ufeff"]
Item = TypeVar("Item")

pytestmark = pytest.mark.skipif(TOOL is None, reason="no tool booleq; BOOLEQ_TOOL names it")


def collect(strategy: st.SearchStrategy[Item], count: int) -> List[Item]:
    """So many examples, for one call with all of them."""
    found: List[Item] = []

    @trees.examples(count)
    @given(strategy)
    def draw(item: Item) -> None:
        found.append(item)

    draw()
    return found


def is_line(text: str) -> bool:
    """Whether a file can hold the text as it is: no comment, byte order mark, foreign line end."""
    return bool(text.strip()) and not text.endswith("\r") and text.lstrip()[0] not in "#\ufeff"


def ask(path: pathlib.Path, texts: Sequence[str], command: str,
        *arguments: str) -> List[Dict[str, Any]]:
    """The tool's object for each text; each text is a line of one file."""
    assert TOOL is not None
    path.write_bytes(b"".join(text.encode("utf-8", "surrogateescape") + b"\n" for text in texts))
    done = subprocess.run([TOOL, command, "--json", "--file", str(path), *arguments],
                          env=PLAIN, stdout=subprocess.PIPE, stderr=subprocess.PIPE, timeout=300,
                          check=False)
    assert done.returncode in (0, 1, 3), done.stderr
    answers = [json.loads(line) for line in done.stdout.splitlines()]
    assert [answer["line"] for answer in answers] == list(range(1, len(texts) + 1))
    return answers


def shown(text: str) -> str:
    """The text as in JSON, where bytes that are not UTF-8 are replaced."""
    return text.encode("utf-8", "surrogateescape").decode("utf-8", "replace")


def as_bytes(text: str) -> bytes:
    """The text without escapes: Python and the C library disagree about what is printable."""
    return re.sub(rb"\\x([0-9a-f]{2})", lambda found: bytes.fromhex(found[1].decode()),
                  text.encode("utf-8", "surrogateescape"))


def all_shown(value: Any) -> Any:
    if isinstance(value, str):
        return shown(value)
    if isinstance(value, Mapping):
        return {shown(key): all_shown(item) for key, item in value.items()}
    if isinstance(value, (list, tuple)):
        return [all_shown(item) for item in value]
    if hasattr(value, "__dataclass_fields__"):
        return {name: all_shown(dict(getattr(value, name)) if name == "details"
                                else getattr(value, name)) for name in value.__dataclass_fields__}
    return value


def in_characters(text: str, offset: int, length: int) -> Tuple[int, int]:
    """Converts a place in bytes to one in characters."""
    data = text.encode("utf-8", "surrogateescape")
    starts = [len(text[:place].encode("utf-8", "surrogateescape")) for place in range(len(text))]
    start = sum(begin < offset for begin in starts)
    assert offset == len(data) or starts[start] == offset, "no place is within a character"
    return start, sum(offset <= begin < offset + length for begin in starts)


def check_refusal(text: str, error: ParseError, refusal: Dict[str, Any]) -> None:
    assert (error.offset, error.length) == in_characters(text, refusal["offset"],
                                                         refusal["length"])
    assert error.text == text and error.code == refusal["code"]
    assert as_bytes(error.reason) == as_bytes(refusal["reason"])
    assert as_bytes(error.hint) == as_bytes(refusal["hint"] or "")
    words = f"refused at character {error.offset + 1}: {error.reason}"
    assert str(error) == words + (f"; {error.hint}" if error.hint else "")
    again = pickle.loads(pickle.dumps(error))
    assert (str(again), again.__dict__) == (str(error), error.__dict__)


Check = Callable[[Equation, Dict[str, Any]], None]


def compare(path: pathlib.Path, texts: Sequence[str], command: str, check: Check, *arguments: str,
            inputs: Optional[Sequence[str]] = None, lsb_first: bool = False) -> int:
    """Checks every answer to a text that is read, and every refusal; returns how many are read."""
    if inputs is not None:
        arguments += ("--inputs", ",".join(inputs))
    if lsb_first:
        arguments += ("--lsb-first",)
    num_read = 0
    for text, answer in zip(texts, ask(path, texts, command, *arguments)):
        assert answer["text"] == shown(text)
        try:
            equation = Equation(text, inputs, lsb_first)
        except ParseError as error:
            assert answer["status"] == "refused", text
            refusal = dict(answer["refusal"])
            if refusal["hint"]:
                refusal["hint"] = refusal["hint"].replace("--inputs", "inputs=")
            refusal["reason"] = refusal["reason"].replace("--inputs", "inputs=")
            check_refusal(text, error, refusal)
            continue
        assert answer["status"] != "refused", text
        num_read += 1
        check(equation, answer)
    return num_read


@st.composite
def good_texts(draw: st.DrawFn) -> str:
    tree = draw(trees.trees())
    return draw(trees.texts(tree)).replace("\n", " ")


@st.composite
def bad_texts(draw: st.DrawFn) -> str:
    """A text with one to three changes; many of them are refused."""
    text = draw(good_texts())
    for _ in range(draw(st.integers(1, 3))):
        place = draw(st.integers(0, len(text)))
        length = draw(st.sampled_from((0, 0, 1, 1, 3)))
        text = text[:place] + draw(st.sampled_from(PIECES)) + text[place + length:]
    return text


@st.composite
def init_texts(draw: st.DrawFn) -> str:
    """Init values over LISTED, valid or nearly: too short, too long, with wrong digits."""
    base = draw(st.sampled_from(("0x", "0X", "0b", "0B")))
    digits = "01" if base in ("0b", "0B") else "0123456789abcdefABCDEF"
    lengths = (16, 16, 16, 9, 15, 1, 17, 0) if digits == "01" else (4, 4, 4, 3, 1, 5, 0)
    length = draw(st.sampled_from(lengths))
    text = base + draw(st.text(digits, min_size=length, max_size=length))
    if draw(st.integers(0, 4)) == 0:
        place = draw(st.integers(0, len(text)))
        text = text[:place] + draw(st.sampled_from(PIECES)) + text[place:]
    return text


def check_show(equation: Equation, answer: Dict[str, Any]) -> None:
    result = answer["result"]
    assert result["inputs"] == all_shown(equation.inputs)
    assert [result[name] for name in ("equation", "syntax1", "syntax2", "syntax3")] == \
        all_shown([equation.primary, equation.alt1, equation.alt2, equation.alt3])
    if equation.inputs:
        assert (result["hex"], result["binary"]) == (equation.hex_init(), equation.binary_init())
    else:
        assert result["value"] == equation()


def check_table(equation: Equation, answer: Dict[str, Any]) -> None:
    assert answer["result"]["inputs"] == all_shown(equation.inputs)
    assert answer["result"]["rows"] == equation.truth_table().tolist()


def check_tree(equation: Equation, answer: Dict[str, Any]) -> None:
    assert answer["result"]["nodes"] == [all_shown(node._asdict()) for node in equation.tree()]


def check_lint(equation: Equation, answer: Dict[str, Any]) -> None:
    report = equation.lint()
    found = all_shown(report)
    assert found.pop("is_clean") is (answer["status"] == "done")
    assert found == answer["result"]


def check_explain(equation: Equation, answer: Dict[str, Any]) -> None:
    result = dict(answer["result"])
    lsb_first = result.pop("lsb_first")
    assert all_shown(equation.explain()) == result
    if 0 < len(equation.inputs) < 12:
        turned = equation.permute(equation.inputs[::-1])
        assert lsb_first == {"hex": turned.hex_init(), "binary": turned.binary_init()}


def check_nothing(_equation: Equation, _answer: Dict[str, Any]) -> None:
    pass


CHECKS: Dict[str, Check] = {"show": check_show, "table": check_table, "tree": check_tree,
                            "lint": check_lint, "explain": check_explain}


@pytest.mark.parametrize("command", CHECKS)
def test_texts_that_are_read(command: str, tmp_path: pathlib.Path) -> None:
    texts = collect(good_texts(), 250)
    assert compare(tmp_path / "texts", texts, command, CHECKS[command]) == len(texts)


def test_texts_that_are_refused(tmp_path: pathlib.Path) -> None:
    texts = [text for text in collect(bad_texts(), 1200) if is_line(text)]
    num_read = compare(tmp_path / "texts", texts, "show", check_nothing)
    assert len(texts) / 3 < len(texts) - num_read < len(texts), num_read


@pytest.mark.parametrize("lsb_first", [False, True])
@pytest.mark.parametrize("command", ["show", "table", "lint"])
def test_texts_over_listed_inputs(command: str, lsb_first: bool, tmp_path: pathlib.Path) -> None:
    texts = collect(st.one_of(init_texts(), init_texts(), bad_texts()), 300)
    texts = [text for text in texts if is_line(text)]
    num_read = compare(tmp_path / "texts", texts, command, CHECKS[command], inputs=LISTED,
                       lsb_first=lsb_first)
    assert 60 < num_read < len(texts)


def test_equivalence(tmp_path: pathlib.Path) -> None:
    texts = collect(good_texts(), 200)
    other = "A ^ (b | 'a b')"

    def check(equation: Equation, answer: Dict[str, Any]) -> None:
        found = equation.equivalent(Equation(other))
        first = answer["result"]["first_difference"]
        assert found.equal is answer["result"]["equal"] is (answer["status"] == "yes")
        assert all_shown(found.counterexample) == (first and first["assignment"])
        assert all_shown(found.values) == (first and first["values"])

    assert compare(tmp_path / "texts", texts, "equal", check, other) == len(texts)


@pytest.mark.parametrize("order", [["b", "'a,b'", "A", "S"], ["A", "S", "b", "'a,b'"],
                                   ["x", "b", "S", "'a,b'", "A", "y"]])
def test_permute(order: List[str], tmp_path: pathlib.Path) -> None:
    texts = collect(st.integers(0, 65535).map("0x{:04x}".format), 100)
    answers = ask(tmp_path / "texts", texts, "permute", "--from", ",".join(LISTED), "--to",
                  ",".join(order))
    for text, answer in zip(texts, answers):
        permuted = Equation.from_init(text, LISTED).permute(order)
        assert list(permuted.inputs) == answer["result"]["inputs"] == order
        assert permuted.hex_init() == answer["result"]["hex"]
        assert permuted.binary_init() == answer["result"]["binary"]


def test_tree_dot() -> None:
    assert TOOL is not None
    for text in collect(good_texts(), 25):
        done = subprocess.run([os.fsencode(TOOL), b"tree", b"--dot", b"--",
                               text.encode("utf-8", "surrogateescape")],
                              env=PLAIN, stdout=subprocess.PIPE, timeout=60, check=True)
        assert Equation(text).tree_dot() == done.stdout.decode("utf-8", "surrogateescape")
