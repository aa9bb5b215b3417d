// The questions of the public headers about functions. Limits are checked here, because the rooms
// below require them.
#include <cassert>
#include <utility>

#include <kq_logic/explain.h>
#include <kq_logic/match.h>
#include <kq_logic/permute.h>
#include <kq_logic/short_form.h>
#include <kq_logic/watch.h>

#include "deadline.h"
#include "function_access.h"
#include "kind.h"
#include "match.h"
#include "notation_writer.h"
#include "permute.h"
#include "short_form.h"
#include "text.h"
#include "watch.h"

namespace kq_logic {

namespace {

static_assert(kMaxFunctionInputs == booleq::kMaxFunctionInputs);
static_assert(kMaxExplainedInputs == booleq::kMaxKindInputs);
static_assert(kMaxShortFormInputs == booleq::kMaxShortFormInputs);
static_assert(kMaxMatchedInputs == booleq::kMaxMatchInputs);

// "17 inputs: at most 16 are matched"; empty if there are no more.
std::string TooMany(size_t numInputs, size_t maxInputs, const char* done)
{
    if (numInputs <= maxInputs)
        return std::string();
    return booleq::Count(numInputs, "input") + ": at most " + std::to_string(maxInputs) + " are " +
           done;
}

booleq::Matching ToRoom(const Matching& matching)
{
    booleq::Matching same;
    same.isFound = matching.isFound;
    same.sources = matching.sources;
    same.inverted = matching.inverted;
    same.isInverted = matching.isInverted;
    return same;
}

} // namespace

Explanation Explain(const Function& function)
{
    Explanation explanation;
    explanation.fault = TooMany(function.NumInputs(), kMaxExplainedInputs, "explained");
    if (!explanation.fault.empty())
        return explanation;
    booleq::FunctionKind kind = booleq::FindKind(FunctionAccess::Of(function));
    assert(kind.mattering.size() + kind.idle.size() == function.NumInputs());
    explanation.mattering = std::move(kind.mattering);
    explanation.idle = std::move(kind.idle);
    explanation.kind = std::move(kind.kind);
    explanation.text = std::move(kind.text);
    return explanation;
}

ShortForm FindShortForm(const Function& function)
{
    ShortForm result;
    result.fault = TooMany(function.NumInputs(), kMaxShortFormInputs, "explained");
    if (!result.fault.empty())
        return result;
    const booleq::ShortForm found = booleq::FindShortForm(FunctionAccess::Of(function));
    if (!found.isFound) {
        result.fault = "no expression short enough was found";
        return result;
    }
    result.text =
        booleq::WriteOwn(found.expression, booleq::OwnSyntax::First, booleq::Parentheses::Clear);
    result.numOperands = found.numLiterals;
    result.isMinimal = found.isMinimal;
    return result;
}

Matching Match(const Function& first, const Function& second, MatchScope scope,
               const Limits& limits)
{
    static_assert(Matching::kIdle == booleq::Matching::kIdle);
    const booleq::Function& own = FunctionAccess::Of(first);
    const booleq::Function& other = FunctionAccess::Of(second);
    Matching matching;
    for (const booleq::Function* function : {&own, &other})
        if (matching.fault.empty())
            matching.fault =
                TooMany(booleq::EffectiveInputs(*function).size(), kMaxMatchedInputs, "matched");
    if (!matching.fault.empty())
        return matching;
    const booleq::Deadline deadline({limits.seconds});
    for (const bool allowInversions : {false, true}) {
        if (allowInversions && scope == MatchScope::Order)
            break;
        const booleq::Matching found =
            booleq::Match(own, other, allowInversions, limits.seconds > 0 ? deadline.Left() : 0);
        matching.isDecided = found.isDecided;
        if (!found.isDecided)
            break;
        if (!found.isFound)
            continue;
        matching.sources = found.sources;
        matching.inverted = found.inverted;
        matching.isInverted = found.isInverted;
        // This proves what is returned, not what the search meant.
        matching.isFound = Apply(matching, first, second.Inputs()) == second;
        assert(matching.isFound);
        break;
    }
    return matching;
}

Function Apply(const Matching& matching, const Function& first,
               const std::vector<std::string>& inputs)
{
    return FunctionAccess::Make(booleq::Apply(ToRoom(matching), FunctionAccess::Of(first), inputs));
}

std::string Permute(const Function& function, const std::vector<std::string>& inputs,
                    Function& permuted)
{
    std::string fault = booleq::OrderFault(inputs);
    if (!fault.empty())
        return fault;
    const std::string unlisted = booleq::FirstUnlisted(function.Inputs(), inputs);
    if (!unlisted.empty())
        return booleq::Excerpt(unlisted) + " is not listed";
    if (inputs.size() > kMaxFunctionInputs)
        return booleq::NoFunctionReason(inputs.size());
    FunctionAccess::Set(FunctionAccess::Of(function).Over(inputs), permuted);
    return std::string();
}

void SetWatch(Watcher watcher)
{
    booleq::SetWatch(watcher);
}

} // namespace kq_logic
