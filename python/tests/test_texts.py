"""Making, refusing, writing, comparing and copying equations."""
import copy
import pickle
from typing import Any, List, Optional

import numpy as np
import pytest

from booleq import Equation, ParseError


def refusal(text: str, inputs: Optional[List[str]] = None) -> ParseError:
    with pytest.raises(ParseError) as caught:
        Equation(text, inputs)
    return caught.value


class TestConstruction:
    def test_keeps_what_was_given(self) -> None:
        equation = Equation("A&~B", inputs=(name for name in ["B", "A"]), lsb_first=True)
        assert equation.text == "A&~B"
        assert equation.given_inputs == ("B", "A")
        assert equation.inputs == ("B", "A")
        assert equation.lsb_first is True

    def test_without_a_list_inputs_are_those_of_the_text(self) -> None:
        equation = Equation("c | a & 'b b'")
        assert equation.given_inputs is None
        assert equation.inputs == ("c", "a", "'b b'")
        assert equation.lsb_first is False

    def test_names_of_the_text_follow_the_listed_ones(self) -> None:
        assert Equation("A & C", ["B"]).inputs == ("B", "A", "C")

    def test_an_empty_list_is_a_list(self) -> None:
        equation = Equation("1", [])
        assert equation.given_inputs == ()
        assert equation.inputs == ()

    def test_an_init_value_needs_a_list(self) -> None:
        assert Equation("0x8", ["A", "B"])(A=1, B=1) == 1
        error = refusal("0x8")
        assert "inputs=" in error.hint and "--" not in error.hint

    def test_an_init_value_may_have_a_size(self) -> None:
        inputs = ["S", "A", "B"]
        assert Equation("8'hca", inputs) == Equation("0xca", inputs)
        assert Equation.from_init("8'b1100_1010", inputs).hex_init() == "0xca"
        assert Equation("0x2", ["A"])(A=1) == 1
        assert Equation("2'h1", ["A"])(A=1) == 0
        with pytest.raises(ParseError) as caught:
            Equation("16'hca", inputs)
        assert (caught.value.offset, caught.value.length, caught.value.code) == (0, 2, "init-width")
        assert caught.value.hint == "write 8'hca, or list 4 inputs"

    def test_lsb_first_turns_the_bits(self) -> None:
        assert Equation("0x2", ["A", "B"]).hex_init() == "0x2"
        assert Equation("0x2", ["A", "B"], lsb_first=True).hex_init() == "0x4"
        assert Equation("0x2", ["A", "B"], True).lsb_first is True

    @pytest.mark.parametrize("text", [b"A", None, 1, ["A"]])
    def test_text_must_be_a_str(self, text: Any) -> None:
        with pytest.raises(TypeError, match="^text must be a str, not "):
            Equation(text)

    def test_a_str_is_no_list_of_inputs(self) -> None:
        with pytest.raises(TypeError, match="letter by letter"):
            Equation("A", "A")

    def test_inputs_must_be_iterable_names(self) -> None:
        with pytest.raises(TypeError, match="inputs must be an iterable of names, not int"):
            Equation("A", 3)  # type: ignore[arg-type]
        with pytest.raises(TypeError, match="a name in inputs must be a str, not bytes"):
            Equation("A", [b"A"])  # type: ignore[list-item]

    def test_what_an_iterable_raises_passes(self) -> None:
        with pytest.raises(ZeroDivisionError):
            Equation("A", (str(1 // 0) for _ in range(1)))

    @pytest.mark.parametrize("name, shown", [
        ("", "''"), ("3B", "'3B'"), ("A B", "'A B'"), ("A\0", r"'A\x00'"), ("&", "'&'")])
    def test_an_illegal_name_is_named(self, name: str, shown: str) -> None:
        with pytest.raises(ValueError) as caught:
            Equation("A", ["A", name])
        assert str(caught.value) == f"inputs: {shown} is not a name"

    def test_a_repeated_name_is_named(self) -> None:
        with pytest.raises(ValueError, match="^inputs: B is listed twice$"):
            Equation("A", ["B", "A", "B"])

    def test_flags_must_be_bools(self) -> None:
        for value in "yes", 1, None:
            message = f"must be False or True, not {type(value).__name__}$"
            with pytest.raises(TypeError, match=f"^lsb_first {message}"):
                Equation("A", None, value)  # type: ignore[arg-type]
            with pytest.raises(TypeError, match=f"^lsb_first {message}"):
                Equation.from_init(1, ["A"], value)  # type: ignore[arg-type]
            with pytest.raises(TypeError, match=f"^spaces {message}"):
                Equation("A").render("alt1", value)  # type: ignore[arg-type]
        assert Equation("0x2", ["A", "B"], np.bool_(True)).lsb_first is True  # type: ignore[arg-type]

    def test_arguments_are_checked(self) -> None:
        with pytest.raises(TypeError):
            Equation()  # type: ignore[call-arg]
        with pytest.raises(TypeError):
            Equation("A", terms=["A"])  # type: ignore[call-arg]

    def test_there_are_no_derived_classes(self) -> None:
        with pytest.raises(TypeError):
            type("Derived", (Equation,), {})

    def test_attributes_are_fixed(self) -> None:
        equation = Equation("A")
        with pytest.raises(AttributeError):
            equation.text = "B"  # type: ignore[misc]
        with pytest.raises(AttributeError):
            equation.other = 1  # type: ignore[attr-defined]

    def test_a_second_init_changes_nothing(self) -> None:
        equation = Equation("A & B")
        equation.__init__("C")  # type: ignore[misc]
        assert equation.inputs == ("A", "B")


@pytest.mark.usefixtures("nothing_printed")
class TestRefusals:
    def test_members(self) -> None:
        error = refusal("A && B")
        assert isinstance(error, ValueError)
        assert error.text == "A && B"
        assert (error.offset, error.length) == (2, 1)
        assert error.code == "no-right-operand"
        assert error.reason == "the operator '&' has no operand on its right"
        assert error.hint == "write '&' instead of '&&'"
        assert str(error) == ("refused at character 3: the operator '&' has no operand on its "
                              "right; write '&' instead of '&&'")

    @pytest.mark.parametrize("text, inputs, code, offset, length", [
        ("", None, "empty", 0, 0),
        ("  \t", None, "empty", 0, 3),
        ("A [ B", None, "character", 2, 1),
        ("A .XNOR. B", None, "word", 2, 6),
        ("A' | B", None, "quote", 1, 1),
        ("A & (B", None, "parenthesis", 4, 1),
        ("A B", None, "operand", 2, 1),
        ("| A", None, "no-left-operand", 0, 1),
        ("A &", None, "no-right-operand", 2, 1),
        ("~", None, "no-operand", 0, 1),
        ("(A & B) & ~ | C", None, "negated-operator", 10, 1),
        ("0xg0", ["A", "B", "C"], "init-digit", 2, 1),
        ("0x88", ["A", "B"], "init-width", 2, 2),
        ("A\0B", None, "nul-byte", 1, 1),
    ])
    def test_every_code(self, text: str, inputs: Optional[List[str]], code: str, offset: int,
                        length: int) -> None:
        error = refusal(text, inputs)
        assert (error.code, error.offset, error.length) == (code, offset, length)
        assert str(error).startswith("refused: " if length == 0 else
                                     f"refused at character {offset + 1}: ")
        assert error.reason in str(error) and str(error).endswith(error.hint)

    def test_a_name_that_makes_another_text(self) -> None:
        assert refusal("0x8", ["'a'+", "B"]).code == "init-name"

    def test_places_are_counted_in_characters(self) -> None:
        error = refusal("'\u00fc\u20ac\U0001f600\udcff' && B")
        assert (error.offset, error.length) == (7, 1)
        assert str(error).startswith("refused at character 8: ")
        error = refusal("A & \u20ac")
        assert (error.offset, error.length) == (4, 1)

    def test_places_in_several_lines(self) -> None:
        error = refusal("'\u00fc' &\n \u00fc")
        assert error.offset == 7
        assert str(error).startswith("refused at line 2, character 2: ")

    def test_a_refused_list_of_inputs_is_no_parse_error(self) -> None:
        with pytest.raises(ValueError) as caught:
            Equation("&", ["A", "A"])
        assert not isinstance(caught.value, ParseError)

    def test_pickles(self) -> None:
        error = refusal("A && B")
        again = pickle.loads(pickle.dumps(error))
        assert type(again) is ParseError
        assert (str(again), vars(again)) == (str(error), vars(error))

    def test_structurally_wrong_texts_print_nothing(self) -> None:
        for text in ["A B", "A & (B", ")", "~ | A", "A ~"]:
            refusal(text)


class TestText:
    @pytest.mark.parametrize("name", ["'\u00fc'", "'\u20ac \U0001f600'", "'\udc80\udcff'"])
    def test_any_text_is_a_name(self, name: str) -> None:
        equation = Equation(f"A & {name}")
        assert equation.inputs == ("A", name)
        assert equation.primary == f"A & {name}"
        assert equation({name: 1}, A=1) == 1
        assert Equation("0x8", ["A", name]).inputs == ("A", name)
        assert equation.tree()[2].token == name
        assert eval(repr(equation)) == equation

    def test_strs_of_the_same_bytes_are_one_name(self) -> None:
        """Two escaped bytes that together are valid UTF-8 come back as the character."""
        equation = Equation("A & '\udcc3\udcbc'")
        assert equation.inputs == ("A", "'\u00fc'")
        for name in equation.inputs[1], "'\udcc3\udcbc'":
            assert equation({name: 1}, A=1) == 1
        for name in "'\udcc3'", "'\udcbc\udcc3'", "'\ud800'":
            with pytest.raises(TypeError, match="there is no input"):
                equation({name: 1}, A=1)

    def test_a_surrogate_that_stands_for_no_byte(self) -> None:
        with pytest.raises(UnicodeEncodeError):
            Equation("'\ud800'")
        with pytest.raises(UnicodeEncodeError):
            Equation("A", ["'\ud800'"])


class TestFromInit:
    def test_of_a_text(self) -> None:
        equation = Equation.from_init("0xca", ["S", "A", "B"])
        assert type(equation) is Equation
        assert equation.text == "0xca"
        assert equation == Equation("0xca", ["S", "A", "B"])
        assert Equation.from_init("0x2", ["A", "B"], lsb_first=True).hex_init() == "0x4"

    @pytest.mark.parametrize("value, inputs, text", [
        (0b0100, ["A", "B"], "0x4"), (0, ["A"], "0b00"), (3, ["A"], "0b11"),
        (True, ["A"], "0b01"), (np.uint8(8), ["A", "B"], "0x8"),
        (2 ** 128 - 1, list("ABCDEFG"), "0x" + 32 * "f")])
    def test_of_an_int(self, value: int, inputs: List[str], text: str) -> None:
        equation = Equation.from_init(value, inputs)
        assert equation.text == text
        assert int(equation.binary_init(), 2) == value

    def test_every_function_of_two_inputs(self) -> None:
        for value in range(16):
            equation = Equation.from_init(value, ["A", "B"])
            assert int(equation.packed_column()[0]) == value
            assert [equation(A=row >> 1, B=row & 1) for row in range(4)] == \
                [value >> row & 1 for row in range(4)]

    @pytest.mark.parametrize("value", [-1, 16, 2 ** 100])
    def test_an_int_must_fit(self, value: int) -> None:
        with pytest.raises(ValueError, match=r"2 inputs has 4 bits: 0 <= value < 2\*\*4"):
            Equation.from_init(value, ["A", "B"])

    def test_an_int_needs_inputs_and_few(self) -> None:
        with pytest.raises(ValueError, match="^an equation without inputs has no init value$"):
            Equation.from_init(1, [])
        with pytest.raises(ValueError, match="^31 inputs: at most 30 have a truth table$"):
            Equation.from_init(1, [f"x{k}" for k in range(31)])

    @pytest.mark.parametrize("value", [1.0, None, b"0x8", [1]])
    def test_other_kinds(self, value: Any) -> None:
        with pytest.raises(TypeError, match="^value must be a str or an int, not "):
            Equation.from_init(value, ["A", "B"])

    def test_inputs_are_names(self) -> None:
        with pytest.raises(TypeError, match="letter by letter"):
            Equation.from_init(8, "AB")
        with pytest.raises(ValueError, match="^inputs: A is listed twice$"):
            Equation.from_init(8, ["A", "A"])

    @pytest.mark.parametrize("text", ["A & B", "1", "(0x8)", "x", "\u00fc"])
    def test_a_text_that_is_no_init_value(self, text: str) -> None:
        with pytest.raises(ParseError):
            Equation.from_init(text, ["A", "B"])

    def test_an_expression_is_refused_where_it_begins(self) -> None:
        with pytest.raises(ParseError) as caught:
            Equation.from_init("A & B", ["A", "B"])
        assert (caught.value.code, caught.value.offset, caught.value.length) == ("init-digit", 0, 1)
        assert str(caught.value) == "refused at character 1: an init value begins with 0x or 0b, " \
            "or is a sized literal such as 8'hca"

    def test_a_wrong_width(self) -> None:
        with pytest.raises(ParseError) as caught:
            Equation.from_init("0x88", ["A", "B"])
        assert caught.value.code == "init-width"


class TestRenderings:
    TEXT = "A & !B .OR. (C@~D)"
    FORMS = {
        "primary": ("A & ! B .OR. ( C @ ~ D )", "A&!B.OR.(C@~D)"),
        "alt1": ("A & ~ B | ( C ^ ~ D )", "A&~B|(C^~D)"),
        "alt2": ("A * ~ B + ( C @ ~ D )", "A*~B+(C@~D)"),
        "alt3": ("A .AND. ~ B .OR. ( C .XOR. ~ D )", "A.AND.~B.OR.(C.XOR.~D)"),
        "expression": ("A & ! B .OR. ( C @ ~ D )", "A&!B.OR.(C@~D)"),
    }

    @pytest.mark.parametrize("syntax", FORMS)
    def test_of_an_expression(self, syntax: Any) -> None:
        equation = Equation(self.TEXT)
        with_blanks, without = self.FORMS[syntax]
        assert getattr(equation, syntax) == with_blanks
        assert equation.render(syntax) == with_blanks
        assert equation.render(syntax, spaces=False) == without
        assert equation.render(syntax, False) == without

    def test_of_an_init_value(self) -> None:
        equation = Equation("0x4", ["A", "B"])
        assert equation.primary == "0x4"
        assert equation.expression == equation.alt1 == "( A & ~ B )"
        assert equation.alt3 == "( A .AND. ~ B )"

    def test_primary_is_the_default(self) -> None:
        equation = Equation(self.TEXT)
        assert equation.render() == equation.primary

    def test_str_reads_back(self) -> None:
        for text in (self.TEXT, "P & X ~ | Y & Q", "0x6"):
            equation = Equation(text, ["C", "D"] if text == "0x6" else None)
            again = Equation(str(equation), equation.inputs)
            assert again.inputs == equation.inputs and again.equivalent(equation), text

    def test_unknown_syntaxes(self) -> None:
        with pytest.raises(ValueError, match="there is no syntax 'alt4'; there are primary, alt1"):
            Equation("A").render("alt4")  # type: ignore[arg-type]
        with pytest.raises(TypeError, match="syntax must be a str, not int"):
            Equation("A").render(1)  # type: ignore[arg-type]


class TestInitValues:
    @pytest.mark.parametrize("text, hexadecimal, binary", [
        ("A", "0x2", "0b10"), ("~A", "0x1", "0b01"), ("A & ~B", "0x4", "0b0100"),
        ("a | b & c", "0xa8", "0b10101000")])
    def test_digits(self, text: str, hexadecimal: str, binary: str) -> None:
        assert Equation(text).hex_init() == hexadecimal
        assert Equation(text).binary_init() == binary

    def test_zeros_lead(self) -> None:
        equation = Equation("A & B & C & ~D & E & F & ~G & H & J")
        assert len(equation.hex_init()) == 2 + 128 and len(equation.binary_init()) == 2 + 512
        assert int(equation.hex_init(), 16) == int(equation.binary_init(), 2)

    def test_without_inputs(self) -> None:
        for text in ["0", "1", "()"]:
            with pytest.raises(ValueError, match="without inputs has no init value"):
                Equation(text).hex_init()
            with pytest.raises(ValueError, match="without inputs has no init value"):
                Equation(text).binary_init()

    def test_with_many_inputs(self) -> None:
        equation = Equation("|".join(f"x{k}" for k in range(31)))
        with pytest.raises(ValueError, match="^31 inputs: at most 30 have a truth table$"):
            equation.hex_init()
        with pytest.raises(ValueError, match="^31 inputs: at most 30 have a truth table$"):
            equation.binary_init()


class TestEquality:
    def test_spelling_does_not_count(self) -> None:
        one, other = Equation("A & ~B | C"), Equation("A .AND. !B+C", ["A", "B", "C"])
        assert one == other and not one != other
        assert hash(one) == hash(other)
        assert len({one, other}) == 1

    @pytest.mark.parametrize("text", ["B & A", "A | B", "(A & B)", "A & C", "A & ~B", "(0 & A)"])
    def test_inputs_count(self, text: str) -> None:
        """Equal equations have equal init values, so a cache may use one answer for both."""
        assert Equation(text, ["A", "B", "C"]) != Equation(text, ["C", "B", "A"])
        assert Equation(text, ["A", "B", "C"]) != Equation(text, ["A", "B", "C", "D"])

    @pytest.mark.parametrize("text", ["B & A", "A | B", "(A & B)", "A & C", "A & ~B", "0 & A"])
    def test_structure_counts(self, text: str) -> None:
        assert Equation("A & B") != Equation(text)
        assert not Equation("A & B") == Equation(text)

    def test_hashes_differ(self) -> None:
        texts = ["A", "B", "~A", "A & B", "B & A", "A | B", "A & (B | C)", "(A & B) | C", "0", "1"]
        assert len({hash(Equation(text)) for text in texts}) == len(texts)

    def test_init_values(self) -> None:
        one = Equation("0x6", ["A", "B"])
        assert one == Equation("0x6", ["A", "B"], lsb_first=True)  # a symmetric function
        assert hash(one) == hash(Equation("0x6", ["A", "B"], lsb_first=True))
        assert one != Equation("0x6", ["B", "A"])
        assert one == Equation("0b0110", ["A", "B"]) == Equation.from_init(6, ["A", "B"])
        assert one == Equation("4'h6", ["A", "B"]) and hash(one) == hash(Equation("4'h6", ["A", "B"]))
        assert one != Equation(one.expression)

    def test_other_kinds(self) -> None:
        equation = Equation("A")
        assert equation != "A" and not equation == {"A": 0} and equation != None  # noqa: E711
        assert equation.__eq__("A") is NotImplemented


class TestCopies:
    EQUATIONS = [
        Equation("A & ~B"), Equation("0xca", ["S", "A", "B"], lsb_first=True), Equation("1"),
        Equation("A & C", ["B", "A"]), Equation("0b1", []), Equation("'\udcff' | '\u20ac'")]

    @pytest.mark.parametrize("equation", EQUATIONS, ids=repr)
    def test_repr_makes_it_again(self, equation: Equation) -> None:
        again = eval(repr(equation))
        assert again == equation
        assert (again.text, again.given_inputs, again.lsb_first) == \
            (equation.text, equation.given_inputs, equation.lsb_first)

    def test_repr(self) -> None:
        assert repr(Equation("A & ~B")) == "Equation('A & ~B')"
        assert repr(Equation("0x8", ["A", "B"], lsb_first=True)) == \
            "Equation('0x8', inputs=['A', 'B'], lsb_first=True)"
        text = " | ".join(f"x{k}" for k in range(1000))
        assert repr(Equation(text)) == f"<Equation of {len(text):,} characters over 1,000 inputs: " \
            f"{text[:60]!r}...>"

    @pytest.mark.parametrize("equation", EQUATIONS, ids=repr)
    @pytest.mark.parametrize("way", ["copy", "deepcopy", *range(pickle.HIGHEST_PROTOCOL + 1)])
    def test_copies_are_equal(self, equation: Equation, way: Any) -> None:
        if way in ("copy", "deepcopy"):
            assert getattr(copy, way)(equation) is equation, "a value that never changes"
            return
        again = pickle.loads(pickle.dumps(equation, way))
        assert again is not equation and again == equation
        assert (again.text, again.inputs, again.given_inputs, again.lsb_first) == \
            (equation.text, equation.inputs, equation.given_inputs, equation.lsb_first)

    def test_one_copy_lives_on_without_the_other(self) -> None:
        first = Equation("A & B")
        second = copy.copy(first)
        del first
        assert second(A=1, B=1) == 1


@pytest.mark.parametrize("text, shown", [
    ("\u00e9 & a", "'\u00e9' is not"), ("a \u20ac", "'\u20ac' is not"),
    ("a & \U0001f600", "'\U0001f600' is not"),
    ("a & \udcff", r"'\\xff' is not"), ("a & \udcc3b", r"'\\xc3' is not")])
def test_characters_are_shown_whole(text: str, shown: str) -> None:
    with pytest.raises(ParseError, match=shown):
        Equation(text)
