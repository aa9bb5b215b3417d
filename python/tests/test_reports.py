"""Trees, comparison, permutation, explain and lint."""
import dataclasses
import pickle
from typing import Any, Dict, List

import pytest

import booleq
from booleq import (Assignment, Difference, Equation, Equivalence, Explanation, Finding, LintReport, Node,
                    Reading)


class TestTree:
    def test_nodes(self) -> None:
        assert Equation("a | (b & ~1)").tree() == [
            Node(0, "OR", "|", None, 1, 2),
            Node(1, "ID", "a", 0, None, None),
            Node(2, "GROUP", "( )", 0, 3, None),
            Node(3, "AND", "&", 2, 4, 5),
            Node(4, "ID", "b", 3, None, None),
            Node(5, "NOT", "~", 3, 6, None),
            Node(6, "1", "1", 5, None, None)]

    def test_of_an_init_value(self) -> None:
        tokens = [node.token for node in Equation("0x8", ["A", "B"]).tree()]
        assert tokens[0] == "0x8" and tokens[-2:] == ["A", "B"]

    def test_deep_texts(self) -> None:
        nodes = Equation(100000 * "~" + "A").tree()
        assert len(nodes) == 100001 and nodes[-1].parent == 99999

    def test_dot(self) -> None:
        assert Equation("~'\u00fc'").tree_dot() == (
            'digraph equation {\n  node [shape=box, fontname="monospace"];\n'
            '  n0 [label="NOT  ~"];\n'
            "  n1 [label=\"'\u00fc'\", shape=ellipse];\n  n0 -> n1;\n}\n")


class TestEquivalent:
    def test_equal(self) -> None:
        result = Equation("~(A & B)").equivalent(Equation("~B | ~A"))
        assert result == Equivalence(True, None, None) and bool(result) is True

    def test_different(self) -> None:
        result = Equation("a | b & c").equivalent(Equation("a | (b & c)"))
        assert not result and result.equal is False
        assert result.counterexample == {"a": 1, "b": 0, "c": 0}
        assert result.values == (0, 1)

    def test_inputs_go_by_name(self) -> None:
        assert Equation("A & ~B", ["B", "A"]).equivalent(Equation("0x4", ["A", "B"]))
        assert Equation("A").equivalent(Equation("A | (B & ~B)"))
        result = Equation("A").equivalent(Equation("B"))
        assert result.counterexample == {"A": 0, "B": 1} and result.values == (0, 1)

    def test_constants(self) -> None:
        assert Equation("1").equivalent(Equation("A | ~A"))
        assert Equation("1").equivalent(Equation("0")) == Equivalence(False, Assignment({}), (1, 0))

    def test_many_inputs(self) -> None:
        first = Equation("|".join(f"x{k}" for k in range(200)))
        assert first.equivalent(Equation("|".join(f"x{k}" for k in reversed(range(200)))))
        result = first.equivalent(Equation("|".join(f"x{k}" for k in range(199))))
        assert result.counterexample is not None and len(result.counterexample) == 200
        assert result.counterexample == {f"x{k}": int(k == 199) for k in range(200)}
        assert result.values == (1, 0)

    def test_of_what(self) -> None:
        assert Equation("A").equivalent("A") and Equation("A | ~A").equivalent(1)
        with pytest.raises(TypeError, match="^other must be an Equation, a text, 0 or 1, not list$"):
            Equation("A").equivalent([])  # type: ignore[arg-type]

    def test_answers_are_keys(self) -> None:
        first, second = (Equation("A").equivalent("B") for _ in range(2))
        assert first == second and len({first, second, first.counterexample}) == 2


class TestPermute:
    def test_order(self) -> None:
        permuted = Equation("0xca", ["S", "A", "B"]).permute(["A", "B", "S"])
        assert repr(permuted) == "Equation('0xe4', inputs=['A', 'B', 'S'])"
        assert permuted.equivalent(Equation("0xca", ["S", "A", "B"]))

    def test_widens(self) -> None:
        assert Equation("A & ~B").permute(iter(["A", "B", "D"])).hex_init() == "0x30"

    def test_one_input_and_none(self) -> None:
        assert repr(Equation("~A").permute(["A"])) == "Equation('0x1', inputs=['A'])"
        assert repr(Equation("1").permute(["A", "B"])) == "Equation('0xf', inputs=['A', 'B'])"
        assert Equation("1").permute([])() == 1 and Equation("0").permute([])() == 0

    @pytest.mark.parametrize("inputs, message", [
        (["A"], "inputs does not list B"), (["A", "B", "A"], "inputs: A is listed twice"),
        (["A", "B", "3"], "inputs: '3' is not a name"),
        (["A", "B"] + [f"x{k}" for k in range(23)], "inputs has 25 inputs: at most 24")])
    def test_faults(self, inputs: List[str], message: str) -> None:
        with pytest.raises(ValueError) as caught:
            Equation("A & B").permute(inputs)
        assert str(caught.value) == message

    def test_a_str_is_no_order(self) -> None:
        with pytest.raises(TypeError, match="letter by letter"):
            Equation("A & B").permute("BA")

    def test_a_nul_ends_no_name(self) -> None:
        with pytest.raises(ValueError, match=r"^inputs: 'A\\x00' is not a name$"):
            Equation("A").permute(["A\0"])


class TestExplain:
    def test_multiplexer(self) -> None:
        assert Equation("0xca", ["S", "A", "B"]).explain() == Explanation(
            inputs=("S", "A", "B"), hex="0xca", binary="0b11001010", without_effect=(),
            kind="multiplexer", function="multiplexer, select S: A for S=1; B for S=0",
            expression="(S & A) | (~S & B)", operands=4, minimal=True)

    def test_idle_inputs(self) -> None:
        explanation = Equation("0xf0", ["A", "B", "C"]).explain()
        assert explanation.without_effect == ("B", "C") and explanation.expression == "A"

    def test_without_a_name(self) -> None:
        explanation = Equation("0xd2a1", ["A", "B", "C", "D"]).explain()
        assert explanation.kind is None and explanation.function is None

    def test_a_constant(self) -> None:
        explanation = Equation("1").explain()
        assert explanation.expression == "1" and explanation.operands == 0

    def test_limit(self) -> None:
        Equation("&".join(f"x{k}" for k in range(16))).explain()
        with pytest.raises(ValueError, match="^17 inputs: at most 16 are explained$"):
            Equation("&".join(f"x{k}" for k in range(17))).explain()
        with pytest.raises(ValueError, match="^31 inputs: "):
            Equation("&".join(f"x{k}" for k in range(31))).explain()


class TestLint:
    def test_another_function(self) -> None:
        report = Equation("a | b & c").lint()
        assert not report.is_clean
        assert report.inputs == ("a", "b", "c") and report.grouping == "((a | b) & c)"
        verilog, *_, vhdl, python = report.readers
        assert verilog == Reading(
            "Verilog", True, None, False, True, "0xf8",
            Difference(Assignment({"a": 1, "b": 0, "c": 0}), 0, "(a | (b & c))",
                       '"&" binds tighter than "|" there',
                       "(a | b) & c", "a | (b & c)"))
        assert vhdl.reads is False and vhdl.same is None and vhdl.compared_all is None
        assert vhdl.difference is None and vhdl.hex is None and "VHDL" == vhdl.notation
        assert vhdl.refusal is not None and "does not join" in vhdl.refusal
        assert python.notation == "Python"
        assert report.findings == ()

    def test_clean(self) -> None:
        report = Equation("(a | b) & c").lint()
        assert report.is_clean and all(reader.difference is None for reader in report.readers)

    @pytest.mark.parametrize("text, inputs, code", [
        ("P & X ~ | Y & Q", None, "blank"), ("P & X ~ | Y & Q", None, "rendering"),
        ("A & C", ["A", "B"], "unlisted-input"), ("0b10110", ["A", "B", "C"], "short-init")])
    def test_findings(self, text: str, inputs: Any, code: str) -> None:
        report = Equation(text, inputs).lint()
        found = [finding for finding in report.findings if finding.code == code]
        assert len(found) == 1 and not report.is_clean
        assert isinstance(found[0], Finding) and found[0].message
        assert all(isinstance(text, str) for pair in found[0].details for text in pair)

    def test_many_inputs(self) -> None:
        report = Equation(" & ".join(f"x{k}" for k in range(60))).lint()
        assert report.readers[0].compared_all is True and report.readers[0].hex is None


class TestValues:
    VALUES = [Equation("a | b & c").lint(), Equation("a | b & c").explain(),
              Equation("a").equivalent(Equation("b")), Equation("a").tree()[0],
              *Equation("P & X ~ | Y & Q").lint().findings]

    @pytest.mark.parametrize("value", VALUES, ids=lambda value: type(value).__name__)
    def test_are_frozen_and_pickle(self, value: Any) -> None:
        assert pickle.loads(pickle.dumps(value)) == value
        assert type(value).__module__ == "booleq"
        names = value._fields if isinstance(value, Node) else \
            [field.name for field in dataclasses.fields(value)]
        for name in names:
            with pytest.raises(AttributeError):
                setattr(value, name, None)

    def test_members_are_those_of_the_documentation(self) -> None:
        def members(kind: Any) -> List[str]:
            return [field.name for field in dataclasses.fields(kind)]

        expected: Dict[Any, str] = {
            Explanation: "inputs hex binary without_effect kind function expression operands "
                         "minimal",
            LintReport: "inputs grouping readers findings is_clean",
            Reading: "notation reads refusal same compared_all hex difference",
            Difference: "assignment here grouping reason write_there write_here",
            Finding: "code message details",
            Equivalence: "equal counterexample values",
        }
        for kind, names in expected.items():
            assert members(kind) == names.split()
        assert Node._fields == ("id", "type", "token", "parent", "left", "right")
        assert set(booleq.__all__) >= {kind.__name__ for kind in expected} | {"Node"}
