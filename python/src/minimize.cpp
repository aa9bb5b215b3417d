// Smallest sums of products, of an equation with don't-cares and of a PLA file.
#include <algorithm>
#include <memory>
#include <string>

#include "bind.h"
#include "convert.h"
#include "cube_table.h"
#include "errors.h"
#include "lock.h"
#include "sum.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

using namespace pybind11::literals; // "name"_a

// 'seconds' of 0 means no limit.
booleq::SumOptions Options(const py::object& isExact, double seconds)
{
    booleq::SumOptions options;
    options.isExact = RequireFlag(isExact, "exact");
    options.seconds = seconds;
    return options;
}

std::string TextOf(const booleq::PlaFault& fault)
{
    return fault.message + (fault.hint.empty() ? "" : "; " + fault.hint);
}

booleq::Sum Minimised(const booleq::Pla& table, const booleq::SumOptions& options)
{
    booleq::Sum sum(table.space);
    booleq::PlaFault fault;
    booleq::Work work;
    if (!Minimise(table, options, sum, fault, work))
        throw py::value_error(TextOf(fault));
    return sum;
}

struct Smallest {
    booleq::Pla table;
    std::unique_ptr<const booleq::Sum> sum; // over the table's space
    booleq::Conversion conversion;          // as text
};

// 'free' may be null.
std::shared_ptr<const Smallest> FindSmallest(const Content& content, const Content* free,
                                             const booleq::SumOptions& options)
{
    booleq::TableOutput output = {"f", booleq::ToExpression(content.equation), false, {}};
    output.hasFree = free != nullptr;
    if (free)
        output.free = booleq::ToExpression(free->equation);
    const auto found = std::make_shared<Smallest>();
    booleq::Work work;
    booleq::PlaFault fault;
    if (!TableOf({output}, booleq::InputsOf({output}), found->table, fault, work))
        throw py::value_error(TextOf(fault));
    found->sum = std::make_unique<const booleq::Sum>(Minimised(found->table, options));
    found->conversion = Convert(ExpressionOf(found->table, found->sum->cubes, 0, false),
                                *booleq::FindTarget("primary"), "", {10});
    return found;
}

py::object MinimizeEquation(const py::object& self, const py::object& dontCare,
                            const py::object& isExact, double seconds)
{
    const SharedContent content = Own(self).Shared();
    Length length = Own(self).GetLength();
    SharedContent free;
    if (!dontCare.is_none()) {
        const py::object converted = ToEquation(dontCare);
        if (!converted)
            throw py::type_error("dont_care must be an Equation, a text, 0, 1 or None, not " +
                                 TypeName(dontCare));
        free = Own(converted).Shared();
        length = std::max(length, Own(converted).GetLength());
    }
    const booleq::SumOptions options = Options(isExact, seconds);
    const std::shared_ptr<const Smallest> smallest = RunLong(
        length, [content, free, options] { return FindSmallest(*content, free.get(), options); });
    const booleq::Pla& table = smallest->table;
    const booleq::Sum* const sum = smallest->sum.get();
    const booleq::Conversion& conversion = smallest->conversion;
    if (!conversion.fault.empty())
        throw py::value_error(conversion.fault);
    py::list cubes;
    for (size_t index = 0; index < sum->cubes.Size(); ++index)
        cubes.append(
            py::str(CubeText(table.space, sum->cubes.At(index)).substr(0, table.inputs.size())));
    return ResultClass("Minimum")("inputs"_a = DecodeAll(table.inputs),
                                  "expression"_a =
                                      Decode(conversion.text.substr(0, conversion.text.find('\n'))),
                                  "cubes"_a = py::tuple(cubes), "terms"_a = sum->cost.numTerms,
                                  "literals"_a = sum->cost.numLiterals,
                                  "lower_bound"_a = sum->lowerBound, "proved"_a = sum->isProved);
}

py::str MinimizePla(const py::object& text, const py::object& isExact, double seconds)
{
    const std::string bytes = Encode(RequireStr(text, "text"));
    const booleq::SumOptions options = Options(isExact, seconds);
    return Decode(RunLong(LengthOfText(bytes.size()), [bytes, options] {
        booleq::Pla table;
        booleq::PlaFault fault;
        if (!ReadPla(bytes, table, fault))
            throw py::value_error("line " + std::to_string(fault.line) + ": " + TextOf(fault));
        const booleq::Sum sum = Minimised(table, options);
        return WritePla(table, sum.cubes);
    }));
}

} // namespace

void BindMinimize(py::module_& module)
{
    module.def("minimize", &MinimizeEquation);
    module.def("minimize_pla", &MinimizePla);
}

} // namespace booleq_python
