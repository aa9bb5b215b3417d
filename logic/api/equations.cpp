// The questions of the public headers about equations: decisions, and their spelling in other
// notations.
#include <kq_logic/convert.h>
#include <kq_logic/decide.h>

#include <cassert>
#include <utility>

#include "convert.h"
#include "equality.h"
#include "expression.h"
#include "text.h"

namespace kq_logic {

namespace {

static_assert(kMaxFunctionInputs == booleq::kMaxFirstRowInputs);

Decision FromRoom(booleq::Decision decided)
{
    Decision decision;
    switch (decided.verdict) {
    case booleq::Verdict::Equal:
        decision.verdict = Verdict::Equal;
        break;
    case booleq::Verdict::Different:
        decision.verdict = Verdict::Different;
        break;
    case booleq::Verdict::Undecided:
        break;
    }
    decision.reason = std::move(decided.reason);
    decision.isTimeOver = decided.isTimeOver;
    decision.inputs = std::move(decided.inputs);
    decision.assignment = std::move(decided.assignment);
    decision.isFirstRow = decided.isFirstRow;
    decision.left = decided.left;
    decision.right = decided.right;
    assert(
        decision.verdict != Verdict::Different ||
        (decision.left != decision.right && decision.assignment.size() == decision.inputs.size()));
    return decision;
}

Decision NoEquation()
{
    Decision decision;
    decision.reason = "there is no equation";
    return decision;
}

} // namespace

Decision DecideEqual(const Kq_BoolEquation& left, const Kq_BoolEquation& right,
                     const Limits& limits)
{
    if (!left || !right)
        return NoEquation();
    return FromRoom(booleq::DecideEquations(left, right, {limits.seconds}));
}

Decision DecideConstant(const Kq_BoolEquation& equation, bool value, const Limits& limits)
{
    if (!equation)
        return NoEquation();
    return FromRoom(booleq::DecideValue(equation, value, {limits.seconds}));
}

std::vector<std::string> ConversionTargets()
{
    return booleq::TargetNames();
}

Conversion Convert(const Kq_BoolEquation& equation, const std::string& target,
                   const std::string& unit, const Limits& limits)
{
    Conversion conversion;
    const booleq::Target* const found = booleq::FindTarget(target);
    if (!found) {
        conversion.fault = "no target '" + booleq::Excerpt(target) + "'; there are " +
                           booleq::Join(booleq::TargetNames(), ", ");
        return conversion;
    }
    if (!equation) {
        conversion.fault = "there is no equation";
        return conversion;
    }
    const booleq::Expression expression = booleq::ToExpression(equation);
    booleq::Conversion written = booleq::Convert(expression, *found, unit, {limits.seconds});
    conversion.fault = std::move(written.fault);
    conversion.text = std::move(written.text);
    conversion.unit = std::move(written.unit);
    conversion.output = std::move(written.output);
    conversion.inputs = expression.names;
    conversion.names = std::move(written.names);
    conversion.saysNames = written.saysNames;
    conversion.isProved = written.isProved;
    conversion.doubt = std::move(written.doubt);
    return conversion;
}

} // namespace kq_logic
