// Decisions, counts and matches.
#include <algorithm>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

#include <kq_logic/decide.h>
#include <kq_logic/match.h>

#include "bind.h"
#include "equality.h"
#include "errors.h"
#include "lock.h"
#include "substitute.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

kq_logic::Limits LimitsOf(double seconds)
{
    kq_logic::Limits limits;
    limits.seconds = seconds;
    return limits;
}

[[noreturn]] void RaiseUndecided(const std::string& reason, bool isTimeOver)
{
    PyErr_SetString(isTimeOver ? PyExc_TimeoutError : PyExc_RuntimeError,
                    ("not decided: " + reason).c_str());
    throw py::error_already_set();
}

// None, or an assignment of the inputs for which the sides differ, and the values of both sides.
py::object Differing(const kq_logic::Decision& decision)
{
    if (decision.verdict == kq_logic::Verdict::Undecided)
        RaiseUndecided(decision.reason, decision.isTimeOver);
    if (decision.verdict == kq_logic::Verdict::Equal)
        return py::none();
    py::dict assignment;
    for (size_t input = 0; input < decision.inputs.size(); ++input)
        assignment[Decode(decision.inputs[input])] = py::int_(decision.assignment[input] ? 1 : 0);
    return py::make_tuple(assignment, decision.left ? 1 : 0, decision.right ? 1 : 0);
}

py::object FindDifference(const py::object& self, const py::object& other, double seconds)
{
    const py::object converted = ToEquation(other);
    if (!converted)
        throw py::type_error("other must be an Equation, a text, 0 or 1, not " + TypeName(other));
    const SharedContent left = Own(self).Shared();
    const SharedContent right = Own(converted).Shared();
    const Length length = std::max(Own(self).GetLength(), Own(converted).GetLength());
    return Differing(RunLong(length, [left, right, seconds] {
        return kq_logic::DecideEqual(left->equation, right->equation, LimitsOf(seconds));
    }));
}

// An assignment for which the equation does not have this value.
py::object FindOther(const py::object& self, bool value, double seconds)
{
    const SharedContent content = Own(self).Shared();
    return Differing(RunLong(Own(self).GetLength(), [content, value, seconds] {
        return kq_logic::DecideConstant(content->equation, value, LimitsOf(seconds));
    }));
}

booleq::Expression Fixed(const booleq::Expression& expression, size_t fixed, bool value)
{
    booleq::Expression constant;
    booleq::AddConstant(constant, value);
    std::vector<booleq::Substitute> substitutes(expression.names.size());
    for (size_t input = 0; input < substitutes.size(); ++input)
        substitutes[input].places = {static_cast<uint32_t>(input)};
    substitutes[fixed].expression = &constant;
    return Folded(Substituted(expression, substitutes, expression.names));
}

std::vector<std::string> SupportOf(const Content& content)
{
    std::vector<std::string> support;
    booleq::Function function;
    if (content.NumInputs() <= booleq::kMaxFunctionInputs &&
        booleq::FunctionOf(content.equation, function)) {
        for (const unsigned int input : booleq::Support(function.GetRows()))
            support.push_back(function.Inputs()[input]);
        return support;
    }
    const booleq::Expression expression = booleq::ToExpression(content.equation);
    const std::vector<std::string> named = NamesInText(expression);
    const std::set<std::string> isNamed(named.begin(), named.end());
    for (size_t input = 0; input < expression.names.size(); ++input) {
        if (isNamed.count(expression.names[input]) == 0)
            continue;
        const booleq::Decision decision = DecideEqual(
            Fixed(expression, input, false), Fixed(expression, input, true), booleq::Limits());
        if (decision.verdict == booleq::Verdict::Undecided)
            throw std::runtime_error("not decided: " + decision.reason);
        if (decision.IsDifferent())
            support.push_back(expression.names[input]);
    }
    return support;
}

py::tuple Support(const py::object& self)
{
    const SharedContent content = Own(self).Shared();
    return DecodeAll(Run(Own(self).GetLength(), [content] { return SupportOf(*content); }));
}

struct Counted {
    uint64_t numOnes = 0; // over the inputs in the text
    size_t numIdle = 0;   // the other inputs
};

Counted CountOnesOf(const Content& content)
{
    Counted counted;
    if (content.NumInputs() <= booleq::kMaxFunctionInputs) {
        booleq::Rows rows;
        booleq::RowsOf(content.equation, rows);
        counted.numOnes = booleq::NumOnes(rows);
        return counted;
    }
    booleq::Expression expression = booleq::ToExpression(content.equation);
    std::vector<std::string> named = NamesInText(expression);
    counted.numIdle = expression.names.size() - named.size();
    if (named.size() > booleq::kMaxFunctionInputs)
        throw py::value_error(booleq::NoFunctionReason(named.size()));
    std::vector<booleq::Substitute> substitutes(expression.names.size());
    const std::vector<uint32_t> places = booleq::Merge(expression.names, named);
    for (size_t input = 0; input < substitutes.size(); ++input)
        substitutes[input].places = {places[input]};
    named.resize(named.size() - counted.numIdle);
    counted.numOnes =
        booleq::NumOnes(ToFunction(Substituted(expression, substitutes, named)).GetRows());
    return counted;
}

py::tuple CountOnes(const py::object& self)
{
    const SharedContent content = Own(self).Shared();
    const Counted counted = Run(Own(self).GetLength(), [content] { return CountOnesOf(*content); });
    return py::make_tuple(counted.numOnes, counted.numIdle);
}

// None without a match; otherwise whether it needs inversions, the pairs, and whether the output is
// inverted.
py::object Match(const py::object& self, const py::object& other, const py::object& hasOrderOnly,
                 double seconds)
{
    const bool orderOnly = RequireFlag(hasOrderOnly, "order_only");
    const py::object converted = ToEquation(other);
    if (!converted)
        throw py::type_error("other must be an Equation, a text, 0 or 1, not " + TypeName(other));
    const kq_logic::Function first = FunctionOf(Own(self));
    const kq_logic::Function second = FunctionOf(Own(converted));
    const auto scope =
        orderOnly ? kq_logic::MatchScope::Order : kq_logic::MatchScope::OrderAndInversions;
    const kq_logic::Matching matching =
        Freely([&] { return kq_logic::Match(first, second, scope, LimitsOf(seconds)); });
    if (!matching.fault.empty())
        throw py::value_error(matching.fault);
    if (!matching.isDecided)
        RaiseUndecided("out of time", true);
    if (!matching.isFound)
        return py::none();
    bool hasInversions = matching.isInverted;
    py::list pairs;
    for (size_t input = 0; input < matching.sources.size(); ++input) {
        if (matching.sources[input] == kq_logic::Matching::kIdle)
            continue;
        hasInversions = hasInversions || matching.inverted[input];
        pairs.append(py::make_tuple(Decode(first.Inputs()[matching.sources[input]]),
                                    Decode(second.Inputs()[input]),
                                    static_cast<bool>(matching.inverted[input])));
    }
    return py::make_tuple(hasInversions, py::tuple(pairs), matching.isInverted);
}

} // namespace

void BindQuestions(py::module_& module)
{
    module.def("find_difference", &FindDifference);
    module.def("find_other", &FindOther);
    module.def("support", &Support);
    module.def("count_ones", &CountOnes);
    module.def("match", &Match);
}

} // namespace booleq_python
