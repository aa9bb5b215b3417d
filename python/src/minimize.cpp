// Smallest sums of products: of an equation with free rows, and of a PLA file.
#include <string>

#include "bind.h"
#include "convert.h"
#include "cube_table.h"
#include "errors.h"
#include "sum.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

using namespace pybind11::literals; // "name"_a

booleq::SumOptions Options(bool isExact, const py::object& seconds)
{
    booleq::SumOptions options;
    options.isExact = isExact;
    if (seconds.is_none())
        return options;
    options.seconds = seconds.cast<double>();
    if (!(options.seconds > 0))
        throw py::value_error("seconds must be above 0");
    return options;
}

booleq::Sum Minimised(const booleq::Pla& table, const booleq::SumOptions& options)
{
    booleq::Sum sum(table.space);
    booleq::PlaFault fault;
    booleq::Work work;
    if (!Minimise(table, options, sum, fault, work))
        throw py::value_error(fault.message);
    return sum;
}

py::object MinimizeEquation(const Equation& equation, const py::object& dontCare, bool isExact,
                            const py::object& seconds)
{
    booleq::TableOutput output = {"f", booleq::ToExpression(equation.Get()), false, {}};
    if (output.on.nodes.empty())
        throw py::value_error("the equation is not set");
    if (!dontCare.is_none()) {
        if (!py::isinstance<Equation>(dontCare))
            throw py::type_error("dont_care must be an Equation or None, not " +
                                 std::string(Py_TYPE(dontCare.ptr())->tp_name));
        output.hasFree = true;
        output.free = booleq::ToExpression(dontCare.cast<const Equation&>().Get());
    }
    booleq::Work work;
    const booleq::Pla table = booleq::TableOf({output}, booleq::InputsOf({output}), work);
    const booleq::Sum sum = Minimised(table, Options(isExact, seconds));
    const booleq::Conversion conversion =
        Convert(ExpressionOf(table, sum.cubes, 0, false), *booleq::FindTarget("primary"), "", {10});
    if (!conversion.fault.empty())
        throw py::value_error(conversion.fault);
    py::list cubes;
    for (size_t index = 0; index < sum.cubes.Size(); ++index)
        cubes.append(
            py::str(CubeText(table.space, sum.cubes.At(index)).substr(0, table.inputs.size())));
    return ResultClass("Minimum")("inputs"_a = DecodeAll(table.inputs),
                                  "expression"_a =
                                      Decode(conversion.text.substr(0, conversion.text.find('\n'))),
                                  "cubes"_a = py::tuple(cubes), "terms"_a = sum.cost.numTerms,
                                  "literals"_a = sum.cost.numLiterals,
                                  "lower_bound"_a = sum.lowerBound, "proved"_a = sum.isProved);
}

py::str MinimizePla(const py::str& text, bool isExact, const py::object& seconds)
{
    booleq::Pla table;
    booleq::PlaFault fault;
    if (!ReadPla(Encode(text), table, fault))
        throw py::value_error("line " + std::to_string(fault.line) + ": " + fault.message +
                              (fault.hint.empty() ? "" : "; " + fault.hint));
    const booleq::Sum sum = Minimised(table, Options(isExact, seconds));
    return Decode(WritePla(table, sum.cubes));
}

} // namespace

void BindMinimize(py::module_& module, EquationClass& type)
{
    type.def("minimize", &MinimizeEquation, py::kw_only(), py::arg("dont_care") = py::none(),
             py::arg("exact") = false, py::arg("seconds") = py::none(),
             R"doc(minimize($record, self, *, dont_care=None, exact=False, seconds=None)
--

A smallest sum of products, proved to be the same function before it is returned. In rows in which
dont_care is 1 it may be either. exact searches until nothing smaller can be, or for so many seconds.

>>> from booleq import Equation
>>> Equation("a ^ b").minimize(dont_care=Equation("a & b")).expression
'b | a'
)doc");
    module.def("minimize_pla", &MinimizePla, py::arg("text"), py::kw_only(),
               py::arg("exact") = false, py::arg("seconds") = py::none(),
               R"doc(minimize_pla($module, text, *, exact=False, seconds=None)
--

The text of a PLA file minimised, as one of type f. A fault is a ValueError that names its line.

>>> import booleq
>>> print(booleq.minimize_pla(".i 2\n.o 1\n01 1\n11 1\n"), end="")
.i 2
.o 1
.type f
.p 1
-1 1
.e
)doc");
}

} // namespace booleq_python
