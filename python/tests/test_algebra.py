"""Equations made from equations, and exact questions, against columns of all rows and SymPy."""
import functools
import itertools
import operator
from typing import Any, Dict, List

import numpy as np
import pytest
import sympy as sympy_module
import trees
from booleq import Assignment, Equation, ParseError
from hypothesis import given, reject
from hypothesis import strategies as st
from trees import examples


sympy: Any = sympy_module


@st.composite
def equations(draw: st.DrawFn, max_inputs: int = 4) -> Equation:
    """From a text, or an init value over some names."""
    if draw(st.booleans()):
        return Equation(draw(trees.texts(draw(trees.trees(max_inputs=max_inputs)))))
    names = draw(st.lists(st.sampled_from(trees.NAMES), min_size=1, max_size=max_inputs,
                          unique=True))
    return Equation.from_init(draw(st.integers(0, 2 ** 2 ** len(names) - 1)), names)


def rows_of(names: List[str]) -> List[Dict[str, int]]:
    return [dict(zip(names, values)) for values in itertools.product((0, 1), repeat=len(names))]


def value(equation: Equation, row: Dict[str, int]) -> int:
    return equation({name: row[name] for name in equation.inputs})


def merged(*parts: Equation) -> List[str]:
    return list(dict.fromkeys(name for part in parts for name in part.inputs))


@examples(150)
@given(equations(), equations())
def test_operators(left: Equation, right: Equation) -> None:
    names = merged(left, right)
    cases: Any = [(left & right, operator.and_), (left | right, operator.or_),
                  (left ^ right, operator.xor)]
    for result, function in cases:
        assert list(result.inputs) == names
        for row in rows_of(names):
            assert value(result, row) == function(value(left, row), value(right, row))
        again = Equation(str(result), result.inputs)
        assert again.equivalent(result)
    inverted = ~left
    assert inverted.inputs == left.inputs
    assert (1 - inverted.column()).tolist() == left.column().tolist()
    assert (~inverted).equivalent(left)


@pytest.mark.parametrize("other", [0, 1, "B | C", True, np.uint8(1), np.bool_(False)])
def test_reflected_operators(other: Any) -> None:
    equation = Equation("A")
    for result, same in [(other & equation, equation & other), (other | equation, equation | other),
                         (other ^ equation, equation ^ other)]:
        assert isinstance(result, Equation) and result.equivalent(same)
    assert ("B | C" & equation).inputs == ("B", "C", "A")


def test_parentheses_where_they_are_needed() -> None:
    assert str(Equation("a | b") & "c | d") == "(a | b) & (c | d)"
    assert str(functools.reduce(lambda a, b: a & b, [Equation(name) for name in "abc"])) == \
        "a & b & c"
    assert str(Equation("0xca", ["S", "A", "B"]) & "C") == "((S & A) | (~S & B)) & C"
    assert repr(Equation("0x8", ["A", "B"]) ^ 1) == "Equation('0x7', inputs=['A', 'B'])"


def test_other_operands() -> None:
    others: Any = (None, 1.5, [], 2, b"A")
    for other in others:
        with pytest.raises(TypeError, match="unsupported operand"):
            Equation("A") & other
    with pytest.raises(ParseError):
        Equation("A") & "B &"


def test_str_reads_back() -> None:
    equation = Equation("P & X ~ | Y & Q")
    assert equation.text == "P & X ~ | Y & Q"
    assert Equation(str(equation)).equivalent(equation)
    assert not Equation(equation.primary).equivalent(equation)


@examples(100)
@given(st.data())
def test_compose_cofactor_rename(data: st.DataObject) -> None:
    equation = data.draw(equations())
    chosen = data.draw(st.lists(st.sampled_from(equation.inputs), unique=True)) \
        if equation.inputs else []
    others = {name: data.draw(equations(max_inputs=2)) for name in chosen}
    composed = equation.compose(others)
    names = merged(*(others.get(name, Equation(name)) for name in equation.inputs))
    assert list(composed.inputs) == names
    for row in rows_of(names):
        inner = {name: value(others[name], row) if name in others else row[name]
                 for name in equation.inputs}
        assert value(composed, row) == equation(inner)

    values = {name: data.draw(st.integers(0, 1)) for name in chosen}
    cofactor = equation.cofactor(values)
    assert cofactor.inputs == tuple(name for name in equation.inputs if name not in values)
    for row in rows_of(list(cofactor.inputs)):
        assert value(cofactor, row) == equation({**row, **values})

    new_names = {name: f"'new {place}'" for place, name in enumerate(chosen)}
    renamed = equation.rename(new_names)
    assert renamed.inputs == tuple(new_names.get(name, name) for name in equation.inputs)
    assert np.array_equal(renamed.column(), equation.column())
    assert renamed.rename({new: old for old, new in new_names.items()}).equivalent(equation)


#: Legal names that a text reads as a name and more, so they occur only in lists of inputs.
split_names = st.builds("'{}'{}".format, st.sampled_from(["a", "b", "x y"]),
                        st.text("+~&|^()b' 1", min_size=1, max_size=4)) \
    .filter(lambda name: not name[1:].endswith("'") or name.count("'") != 2)


@st.composite
def equations_over_split_names(draw: st.DrawFn) -> Equation:
    """From a text, or an init value whose split names stand for expressions."""
    names = draw(st.permutations(["A", "b", "'a'"]))[:draw(st.integers(0, 3))]
    names += draw(st.lists(split_names, min_size=1, max_size=2, unique=True))
    names = draw(st.permutations(names))
    try:
        if draw(st.booleans()):
            return Equation(draw(st.sampled_from(["A & b", "A", "1", "b ^ 'a' | A", "~'a'"])), names)
        return Equation.from_init(draw(st.integers(0, 2 ** 2 ** len(names) - 1)), names)
    except ParseError:
        reject() # the expression that it stands for is refused: 'a'~ & b


@examples(200)
@given(equations_over_split_names(), equations_over_split_names() | equations(), st.data())
def test_names_that_no_text_holds(left: Equation, right: Equation, data: st.DataObject) -> None:
    names = merged(left, right)
    cases: Any = [(left & right, operator.and_), (left | right, operator.or_),
                  (right ^ left, operator.xor), (left & ~right, lambda a, b: a & (1 - b))]
    for result, function in cases:
        assert set(result.inputs) == set(names)
        for row in rows_of(names):
            assert value(result, row) == function(value(left, row), value(right, row))
    order = data.draw(st.permutations([*names, "new", "'n'&w"]))
    permuted = left.permute(order)
    assert list(permuted.inputs) == order and permuted.equivalent(left)

    name = data.draw(st.sampled_from(left.inputs))
    composed = left.compose({name: right})
    for row in rows_of(merged(left, right)):
        assert value(composed, row) == left(
            {other: value(right, row) if other == name else row[other] for other in left.inputs})
    for bit in (0, 1):
        cofactor = left.cofactor({name: bit})
        assert cofactor.inputs == tuple(other for other in left.inputs if other != name)
        for row in rows_of(list(cofactor.inputs)):
            assert value(cofactor, row) == left({**row, name: bit})

    new_name = data.draw(split_names.filter(lambda other: other not in left.inputs))
    try:
        renamed = left.rename({name: new_name})
    except ValueError as error:
        assert "no expression or init value can hold the name" in str(error)
        assert "choose another" in str(error)
        assert name in left.expression
    else:
        assert np.array_equal(renamed.column(), left.column())
        assert name not in left.support
    for result in (permuted, composed, left & right, ~left):
        again = Equation(result.text, result.given_inputs)
        assert again == result and again.equivalent(result)


def test_init_value_over_more_names_than_an_expression_is_written_for() -> None:
    names = [f"n{number}" for number in range(17)]
    equation = Equation.from_init(1 << 131071, names)
    with pytest.raises(ValueError, match="can hold the name 'a'\\+b: .* choose another"):
        equation.permute([*names, "'a'+b"])
    wide = Equation(" & ".join(names)).permute([*names[::-1], "'a'+b"])
    assert wide.inputs == (*names[::-1], "'a'+b") and wide.equivalent(equation)


def test_faults_of_compose_cofactor_rename() -> None:
    equation = Equation("A & B")
    questions: Any = (equation.compose, equation.cofactor)
    for question in questions:
        with pytest.raises(TypeError, match="there is no input C; the inputs are A, B"):
            question(C=1)
        with pytest.raises(TypeError, match="the value of A is given twice"):
            question({"A": 1}, A=1)
        with pytest.raises(TypeError, match="values must be a mapping"):
            question("A")
    with pytest.raises(ValueError, match="the value of A must be 0 or 1, not 2"):
        equation.cofactor(A=2)
    with pytest.raises(TypeError, match="in place of A comes"):
        equation.compose(A=None)  # type: ignore[arg-type]
    with pytest.raises(ValueError, match="B is listed twice"):
        equation.rename({"A": "B"})
    with pytest.raises(ValueError, match="is not a name"):
        equation.rename({"A": "?"})
    assert equation.compose(A="B", B="A") == Equation("B & A"), "all at once"


@examples(100)
@given(equations())
def test_questions(equation: Equation) -> None:
    column = equation.column()
    assert equation.count_ones() == int(column.sum())
    shaped = column.reshape((2,) * len(equation.inputs))
    assert equation.support == tuple(
        name for axis, name in enumerate(equation.inputs)
        if not np.array_equal(np.take(shaped, 0, axis), np.take(shaped, 1, axis)))
    found = equation.satisfiable()
    assert bool(found) == bool(column.any())
    if found:
        assert found.assignment is not None and equation(found.assignment) == 1
    assert equation.is_tautology() == bool(column.all())


def test_questions_about_many_inputs() -> None:
    names = [f"x{k}" for k in range(60)]
    parity = Equation(" ^ ".join(names))
    assert parity.support == tuple(names)
    assert (parity ^ " ^ ".join(reversed(names))).satisfiable().assignment is None
    assert (parity | ~parity).is_tautology()
    assert Equation("x3 & x4", names).count_ones() == 2 ** 58
    with pytest.raises(ValueError, match="at most 30"):
        parity.count_ones()
    different = parity.equivalent(parity ^ "x0 & x1 & x2")
    assert different.counterexample is not None
    assert parity(different.counterexample) == different.values[0]  # type: ignore[index]


def test_limits_of_time() -> None:
    pigeons, holes = range(13), range(12)
    everyone = " & ".join("(" + " | ".join(f"p{p}_{h}" for h in holes) + ")" for p in pigeons)
    alone = " & ".join(f"~(p{p}_{h} & p{q}_{h})" for h in holes for p in pigeons for q in range(p))
    hard = Equation(f"{everyone} & {alone}")
    questions: Any = (hard.satisfiable, lambda seconds: hard.equivalent(0, seconds))
    for question in questions:
        with pytest.raises(TimeoutError, match="not decided"):
            question(seconds=0.2)
    with pytest.raises(ValueError, match="seconds must be above 0"):
        hard.satisfiable(seconds=0)


@examples(60)
@given(equations(max_inputs=3), st.data())
def test_match(equation: Equation, data: st.DataObject) -> None:
    order = data.draw(st.permutations(equation.inputs))
    other = equation.permute(order) if equation.inputs else equation
    found = equation.match(other, order_only=True)
    assert found and found.level == "order" and not found.output_inverted
    assert equation.match(~other)
    if equation.support:
        assert not equation.match("0")


@examples(60)
@given(equations(max_inputs=4))
def test_sympy_and_back(equation: Equation) -> None:
    expression: Any = equation.to_sympy()
    again = Equation.from_sympy(expression)
    assert again.equivalent(equation)
    for row in rows_of(list(equation.inputs)):
        symbols = {sympy.Symbol(name): bool(bit) for name, bit in row.items()}
        assert bool(expression.subs(symbols)) == bool(equation(row))


def test_other_operators_of_sympy() -> None:
    a, b, c = sympy.symbols("a b c")
    expressions: Any = (sympy.Implies(a, b), sympy.Equivalent(a, b, c), sympy.ITE(a, b, c),
                       sympy.Nand(a, b), sympy.Nor(a, b, c), sympy.true, sympy.Xor(a, b, c))
    for expression in expressions:
        equation = Equation.from_sympy(expression)
        for row in rows_of(["a", "b", "c"]):
            there = expression.subs({sympy.Symbol(name): bool(bit) for name, bit in row.items()})
            assert bool(there) == bool(value(equation, row))
    with pytest.raises(TypeError, match="is not a Boolean operator"):
        Equation.from_sympy(a + b)


@examples(100)
@given(equations(), equations())
def test_order(left: Equation, right: Equation) -> None:
    assert (left < right) + (left == right) + (left > right) == 1
    assert (left <= right) == (not left > right) and (left >= right) == (not left < right)
    assert sorted([left, right]) == sorted([right, left])
    with pytest.raises(TypeError):
        left < "A"  # type: ignore[operator]


@pytest.mark.parametrize("target", ["verilog", "vhdl", "python", "liberty"])
@examples(40)
@given(st.data())
def test_notations_there_and_back(target: Any, data: st.DataObject) -> None:
    tree = data.draw(trees.trees(names=("a", "b", "c", "d2")))
    equation = Equation(data.draw(trees.texts(tree)))
    conversion = equation.convert(target)
    assert conversion.proved and str(conversion) == conversion.text == f"{equation:{target}}"
    again = getattr(Equation, f"from_{target}")(conversion.text, equation.inputs)
    assert again.equivalent(equation) and again.inputs == equation.inputs


def test_formats() -> None:
    equation = Equation("a | b & ~c")
    assert f"{equation}" == str(equation) and f"{equation:alt3}" == "a .OR. b .AND. .NOT. c" or \
        Equation(f"{equation:alt3}").equivalent(equation)
    assert (f"{equation:hex}", f"{equation:sized}") == ("0x54", "8'h54")
    with pytest.raises(ValueError, match="there is no syntax 'html'; there are primary, "):
        f"{equation:html}"
    unit = equation.convert("verilog", name="gate")
    assert unit.unit == "gate" and "module gate" in unit.text
    assert Equation("a & b | (a & c)").convert("verilog", short=True).text == "a & (b | c)"
    with pytest.raises(ParseError, match="Verilog does not read it"):
        Equation.from_verilog("a +")
    assert Equation.from_init("64'hFFFF0000FFFF0000", list("abcdef")).support == ("b",)
    assert equation.hex_init(lsb_first=True) == Equation("a | b & ~c", ["c", "b", "a"]).hex_init()


def test_assignments_never_change() -> None:
    assignment = Assignment({"a": 1})
    with pytest.raises(AttributeError):
        assignment.other = 1
    with pytest.raises(TypeError):
        assignment["a"] = 0  # type: ignore[index]
    assert hash(assignment) == hash(Assignment({"a": 1})) and assignment == {"a": 1}


def test_kmap() -> None:
    found = Equation("A & B | C").kmap()
    assert found.cells == ((0, 1, 1, 0), (0, 1, 1, 1))
    assert (found.row_inputs, found.column_inputs) == (("A",), ("B", "C"))
    for text in ("1", "&".join("abcdefg")):
        with pytest.raises(ValueError, match="a map has 1 to 6"):
            Equation(text).kmap()
