// How equations are made, written, compared and copied.
#include <string>

#include "bind.h"
#include "errors.h"
#include "function.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

typedef Port::StringBase<char> String;

struct Syntax {
    const char* name;
    String (Kq_BoolEquation::*render)(bool spaces) const;
};

constexpr Syntax kSyntaxes[] = {
    {"primary", &Kq_BoolEquation::GetEquation},
    {"alt1", &Kq_BoolEquation::GetEquationAlt1},
    {"alt2", &Kq_BoolEquation::GetEquationAlt2},
    {"alt3", &Kq_BoolEquation::GetEquationAlt3},
    {"expression", &Kq_BoolEquation::GetEquationAsExpression},
};

py::str Render(const Equation& equation, const py::object& syntax, const py::object& spaces)
{
    const bool hasBlanks = RequireFlag(spaces, "spaces");
    const std::string name = Encode(RequireStr(syntax, "syntax"));
    for (const Syntax& known : kSyntaxes)
        if (name == known.name)
            return Decode(booleq::ToStd((equation.Get().*known.render)(hasBlanks)));
    throw py::value_error("there is no syntax '" + booleq::Excerpt(name) +
                          "'; there are primary, alt1, alt2, alt3, expression");
}

template <String (Kq_BoolEquation::*render)(bool) const>
py::str RenderWithBlanks(const Equation& equation)
{
    return Decode(booleq::ToStd((equation.Get().*render)(true)));
}

// An int as the binary digits of all rows.
py::str BinaryDigits(const py::object& value, const py::tuple& inputs)
{
    const size_t numInputs = inputs.size();
    if (numInputs == 0)
        throw py::value_error("an equation without inputs has no init value");
    if (numInputs > booleq::kMaxFunctionInputs)
        throw py::value_error(booleq::NoFunctionReason(numInputs));
    const size_t numRows = size_t(1) << numInputs;
    const py::int_ zero(0);
    if (value < zero || value.attr("bit_length")().cast<size_t>() > numRows)
        throw py::value_error("an init value over " + booleq::Count(numInputs, "input") + " has " +
                              std::to_string(numRows) + " bits: 0 <= value < 2**" +
                              std::to_string(numRows));
    const py::object format = py::module_::import("builtins").attr("format");
    return py::str("0b") + py::str(format(value, "0" + std::to_string(numRows) + "b"));
}

py::object FromInit(const py::object& type, const py::object& value, const py::object& inputs,
                    const py::object& lsbFirst)
{
    const py::tuple names = RequireNames(inputs);
    py::object text = value;
    if (!PyUnicode_Check(value.ptr())) {
        const auto number = py::reinterpret_steal<py::object>(PyNumber_Index(value.ptr()));
        if (!number) {
            PyErr_Clear();
            throw py::type_error("value must be a str or an int, not " +
                                 std::string(Py_TYPE(value.ptr())->tp_name));
        }
        text = BinaryDigits(number, names);
    }
    py::object made = type(text, names, lsbFirst);
    if (made.cast<const Equation&>().Get().IsExpression()) {
        booleq::RefusalReport report;
        report.code = "init-digit";
        report.length = 1;
        report.reason = "an init value begins with 0x or 0b";
        RaiseParseError(RequireStr(text, "value"), report);
    }
    return made;
}

kq_logic::Function FunctionWithRows(const Equation& equation)
{
    if (equation.NumInputs() == 0)
        throw py::value_error("an equation without inputs has no init value");
    return FunctionOf(equation);
}

std::string Repr(const Equation& equation)
{
    std::string text = "Equation(" + std::string(py::repr(equation.Text()));
    if (!equation.GivenInputs().is_none())
        text += ", inputs=" + std::string(py::repr(py::list(equation.GivenInputs())));
    return text + (equation.IsLsbFirst() ? ", lsb_first=True)" : ")");
}

// What Equation, called again, and the values of the inputs need.
py::tuple Reduce(const Equation& equation)
{
    py::list ones;
    for (size_t input = 0; input < equation.NumInputs(); ++input)
        if (equation.GetValue(input) != 0)
            ones.append(equation.Inputs()[input]);
    return py::make_tuple(ResultClass("restore"),
                          py::make_tuple(equation.Text(), equation.GivenInputs(),
                                         equation.IsLsbFirst(), py::tuple(ones)));
}

void BindConstruction(EquationClass& type)
{
    type.def(py::init(&MakeEquation<py::object, py::object, py::object>), py::arg("text"),
             py::arg("inputs") = py::none(), py::arg("lsb_first") = false,
             "__init__($record, self, text, inputs=None, lsb_first=False)\n--\n\nSee the class.");
    const py::cpp_function fromInit(&FromInit, py::name("from_init"), py::scope(type),
                                    py::arg("cls"), py::arg("value"), py::arg("inputs"),
                                    py::arg("lsb_first") = false,
                                    R"doc(from_init($record, cls, value, inputs, lsb_first=False)
--

The equation of an init value: a text "0x..." or "0b...", or an int.

Bit k of the value is the result of row k. A text that is no init value over so many inputs is a
ParseError, an int that does not fit a ValueError.

>>> from booleq import Equation
>>> Equation.from_init(0b0100, ["A", "B"]).alt1
'( A & ~ B )'
>>> Equation.from_init("0x2", ["A", "B"], lsb_first=True).hex_init
'0x4'
)doc");
    type.attr("from_init") = py::reinterpret_steal<py::object>(PyClassMethod_New(fromInit.ptr()));
}

void BindRenderings(EquationClass& type)
{
    type.def_property_readonly("text", &Equation::Text, "The text as it was given.");
    type.def_property_readonly("lsb_first", &Equation::IsLsbFirst, "The flag as it was given.");
    type.def_property_readonly("given_inputs", &Equation::GivenInputs,
                               "The inputs as they were listed, None without a list.");
    type.def_property_readonly("inputs", &Equation::Inputs,
                               "All inputs in their order, the most significant first.");
    type.def_property_readonly("primary", &RenderWithBlanks<&Kq_BoolEquation::GetEquation>,
                               "The equation with its operators as they were typed; an init value "
                               "as it was given.");
    type.def_property_readonly("alt1", &RenderWithBlanks<&Kq_BoolEquation::GetEquationAlt1>,
                               "The equation written with & | ^ ~.");
    type.def_property_readonly("alt2", &RenderWithBlanks<&Kq_BoolEquation::GetEquationAlt2>,
                               "The equation written with * + @ ~.");
    type.def_property_readonly("alt3", &RenderWithBlanks<&Kq_BoolEquation::GetEquationAlt3>,
                               "The equation written with .AND. .OR. .XOR. ~.");
    type.def_property_readonly("expression",
                               &RenderWithBlanks<&Kq_BoolEquation::GetEquationAsExpression>,
                               "primary, but alt1 for an init value: never \"0x...\".");
    type.def("render", &Render, py::arg("syntax") = "primary", py::arg("spaces") = true,
             R"doc(render($record, self, syntax="primary", spaces=True)
--

The equation as text: "primary", "alt1", "alt2", "alt3" or "expression", as the properties.

spaces=False leaves out the blanks between tokens; "~ |" may then close up to "~|", which is
another operator.

>>> from booleq import Equation
>>> Equation("A & ~B").render("alt3", spaces=False)
'A.AND.~B'
)doc");
    type.def_property_readonly(
        "hex_init",
        [](const Equation& equation) { return py::str(FunctionWithRows(equation).Hex()); },
        "The results as one hexadecimal number, bit k being row k, leading zeros kept. ValueError\n"
        "without inputs or with more than 30.\n\n"
        ">>> from booleq import Equation\n>>> Equation(\"A & ~B\").hex_init\n'0x4'\n");
    type.def_property_readonly(
        "binary_init",
        [](const Equation& equation) { return py::str(FunctionWithRows(equation).Binary()); },
        "The results as one binary number, the highest row first. ValueError as for hex_init.\n\n"
        ">>> from booleq import Equation\n>>> Equation(\"A & ~B\").binary_init\n'0b0100'\n");
}

void BindEquality(EquationClass& type)
{
    type.def(
        "__eq__",
        [](const Equation& self, const py::object& other) -> py::object {
            if (!py::isinstance<Equation>(other))
                return py::reinterpret_borrow<py::object>(Py_NotImplemented);
            return py::bool_(self.Get() == other.cast<const Equation&>().Get());
        },
        R"doc(__eq__($record, self, other, /)
--

True for the same operators, groups and names in the same places, however they are spelled. Values
do not count. Whether two equations are one function is equivalent()'s matter.

>>> from booleq import Equation
>>> Equation("A & B") == Equation("A .AND. B"), Equation("A & B") == Equation("B & A")
(True, False)
)doc");
    type.def("__hash__", &Equation::Hash,
             "__hash__($record, self, /)\n--\n\nAgrees with ==; values do not count.");
}

void BindCopies(EquationClass& type)
{
    type.def(
        "__copy__", &MakeEquation<Equation>,
        "__copy__($record, self, /)\n--\n\nAn equal equation with the same values, which are its "
        "own.");
    type.def(
        "__deepcopy__", [](const Equation& self, const py::object&) { return MakeEquation(self); },
        py::arg("memo"), "__deepcopy__($record, self, memo, /)\n--\n\nThe same as a copy.");
    type.def("__reduce__", &Reduce,
             "__reduce__($record, self, /)\n--\n\nFor pickle: text, inputs, flag and values.");
    type.def(
        "__repr__", &Repr,
        "__repr__($record, self, /)\n--\n\nA text that makes an equal equation, values apart.");
    type.def("__str__", &RenderWithBlanks<&Kq_BoolEquation::GetEquation>,
             "__str__($record, self, /)\n--\n\nThe same as primary.");
}

} // namespace

void BindTexts(EquationClass& type)
{
    BindConstruction(type);
    BindRenderings(type);
    BindEquality(type);
    BindCopies(type);
}

} // namespace booleq_python
