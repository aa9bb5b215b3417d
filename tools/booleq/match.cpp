// The command 'match': whether two functions are one up to the order of inputs or inversions.
#include <algorithm>
#include <cassert>

#include <kq_logic/match.h>

#include "commands.h"
#include "decide.h"
#include "function.h"
#include "init_literal.h"
#include "text.h"

namespace booleq {

namespace {

// A, B, C, ... for an init value whose inputs have no names.
std::vector<std::string> LetterNames(size_t count)
{
    std::vector<std::string> names;
    for (size_t index = 0; index < count; ++index)
        names.push_back(index < 26 ? std::string(1, static_cast<char>('A' + index))
                                   : "I" + std::to_string(index));
    return names;
}

// The number of inputs of an init value without names; kMaxFunctionInputs + 1 for any other text.
size_t WidthOf(const std::string& text)
{
    if (IsSizedLiteral(text)) {
        for (size_t numInputs = 0; numInputs <= kMaxFunctionInputs; ++numInputs)
            if (!ReadInitLiteral(text, numInputs).code)
                return numInputs;
        return kMaxFunctionInputs + 1;
    }
    const InitWidth width = WidthOfInit(text);
    return width.numRows > 0 ? width.numInputs : kMaxFunctionInputs + 1;
}

// Whether the text is an init value over the listed inputs.
bool IsInitOver(const std::string& text, const Reading& reading)
{
    Kq_BoolEquation equation;
    return reading.hasInputs && text.find('\0') == std::string::npos &&
           SetFromText(equation, text, reading) && !equation.IsExpression();
}

// Sets the function over the inputs of --inputs, or of --second-inputs for the second text. An init
// value gets letters when none are listed, or when the list is for the other text. Anything else is
// read as usual.
bool SetNamed(const Text& text, const Request& request, bool isListForOther, Output& output,
              kq_logic::Function& function)
{
    const size_t width = WidthOf(text.text);
    const bool hasNames =
        request.reading.hasInputs && (!isListForOther || IsInitOver(text.text, request.reading));
    if (width > kMaxFunctionInputs || hasNames)
        return SetFunction(text, request, output, function);
    Request lettered(request);
    lettered.reading.hasInputs = true;
    lettered.reading.inputs = LetterNames(width);
    return SetFunction(text, lettered, output, function);
}

// The request for the second text, whose inputs may have their own names.
Request ForSecond(const Request& request)
{
    Request second(request);
    if (!request.Has("--second-inputs"))
        return second;
    second.reading.hasInputs = true;
    second.reading.inputs.clear();
    if (IsBlank(request.Get("--second-inputs")) ||
        !SplitInputs(request.Get("--second-inputs"), second.reading.inputs))
        throw UsageError("--second-inputs needs names: --second-inputs A,B");
    return second;
}

// "order" or "inversions"; null: no match. A match by order alone is found before any other.
const char* LevelOf(const kq_logic::Matching& matching)
{
    if (!matching.isFound)
        return nullptr;
    const bool hasInversion = std::find(matching.inverted.begin(), matching.inverted.end(), true) !=
                              matching.inverted.end();
    return hasInversion || matching.isInverted ? "inversions" : "order";
}

std::string SourceText(const kq_logic::Function& second, const kq_logic::Matching& matching,
                       size_t place)
{
    return (matching.inverted[place] ? "~" : "") + Visible(second.Inputs()[place]);
}

std::vector<std::string> IdleInputs(const kq_logic::Function& function)
{
    std::vector<std::string> idle;
    for (size_t input = 0; input < function.NumInputs(); ++input)
        if (!function.DependsOn(input))
            idle.push_back(function.Inputs()[input]);
    return idle;
}

size_t NumEffective(const kq_logic::Function& function)
{
    return function.NumInputs() - IdleInputs(function).size();
}

void PutIdle(const char* which, const kq_logic::Function& function, Output& output)
{
    const std::string list = Visible(Join(IdleInputs(function), ", "));
    if (!list.empty())
        output.Put("    without effect in the " + std::string(which) + ": " + list + "\n");
}

void PutText(double seconds, const kq_logic::Function& first, const kq_logic::Function& second,
             const kq_logic::Matching& matching, Output& output)
{
    if (!matching.isDecided) {
        output.Put(NotDecidedIn(seconds) + "\n");
        return;
    }
    const char* const level = LevelOf(matching);
    const size_t numFirst = NumEffective(first);
    const size_t numSecond = NumEffective(second);
    if (!level) {
        output.Put("no match" + (numFirst == numSecond
                                     ? "\n"
                                     : ": " + Count(numFirst, "input") + " with an effect, and " +
                                           std::to_string(numSecond) + "\n"));
        return;
    }
    const bool isOrder = std::string(level) == "order";
    output.Put((isOrder ? "match, by the order of inputs alone\n" : "match, with inversions\n"));
    output.Put("  the second is the first" + std::string(matching.isInverted ? " inverted" : "") +
               (numFirst > 0 ? ", where\n" : "\n"));
    // In the order of the first one's inputs.
    for (size_t input = 0; input < first.NumInputs(); ++input)
        for (size_t other = 0; other < second.NumInputs(); ++other)
            if (matching.sources[other] == input)
                output.Put("    " + Visible(first.Inputs()[input]) + " of the first is " +
                           SourceText(second, matching, other) + " of the second\n");
    PutIdle("first", first, output);
    PutIdle("second", second, output);
}

Json ToJson(const kq_logic::Function& first, const kq_logic::Function& second,
            const kq_logic::Matching& matching)
{
    const char* const level = LevelOf(matching);
    Json json;
    json["match"] = level ? Json(level) : Json(nullptr);
    json["first_inputs"] = first.Inputs();
    json["second_inputs"] = second.Inputs();
    json["output_inverted"] = level ? Json(matching.isInverted) : Json(nullptr);
    json["mapping"] = Json::array();
    if (level)
        for (size_t other = 0; other < second.NumInputs(); ++other) {
            if (matching.sources[other] == kq_logic::Matching::kIdle)
                continue;
            json["mapping"].push_back({{"first", first.Inputs()[matching.sources[other]]},
                                       {"second", second.Inputs()[other]},
                                       {"inverted", static_cast<bool>(matching.inverted[other])}});
        }
    json["first_without_effect"] = IdleInputs(first);
    json["second_without_effect"] = IdleInputs(second);
    return json;
}

bool RefuseTooMany(const Text& text, const Request& request, const kq_logic::Function& function,
                   Output& output)
{
    const size_t numInputs = NumEffective(function);
    if (numInputs <= kq_logic::kMaxMatchedInputs)
        return false;
    Refuse(text, request, output,
           Count(numInputs, "input") + " with an effect: at most " +
               std::to_string(kq_logic::kMaxMatchedInputs) + " are matched");
    return true;
}

const char* StatusName(const kq_logic::Matching& matching)
{
    if (!matching.isDecided)
        return "undecided";
    return matching.isFound ? "yes" : "no";
}

int RunMatch(const Request& request, Output& output)
{
    const double seconds = ParseSeconds(request, 0);
    const kq_logic::MatchScope scope = request.Has("--order-only")
                                           ? kq_logic::MatchScope::Order
                                           : kq_logic::MatchScope::OrderAndInversions;
    const Request forSecond = ForSecond(request);
    const Text other{request.operands.back(), 0};
    kq_logic::Function second;
    const bool hasOwnList = request.Has("--second-inputs");
    const bool isForFirst =
        !hasOwnList && (request.hasLines || IsInitOver(request.operands.front(), request.reading));
    const bool isForSecond = !hasOwnList && IsInitOver(other.text, request.reading);
    if (!SetNamed(other, forSecond, isForFirst, output, second) ||
        RefuseTooMany(other, request, second, output))
        return kRefused;
    return ForEachText(request, output, [&](const Text& text) {
        kq_logic::Function first;
        if (!SetNamed(text, request, isForSecond, output, first) ||
            RefuseTooMany(text, request, first, output))
            return kRefused;
        const kq_logic::Matching matching =
            Watched([&] { return kq_logic::Match(first, second, scope, {seconds}); });
        assert(matching.fault.empty());
        const int found = matching.isFound ? kDone : kFindings;
        return Say(text, request, output,
                   {matching.isDecided ? found : kUndecided, StatusName(matching), LineMark::Prefix,
                    [&] { return ToJson(first, second, matching); },
                    [&] { PutText(seconds, first, second, matching, output); }});
    });
}

} // namespace

Command MatchCommand()
{
    return {
        "match",
        "INIT|EQUATION INIT|EQUATION",
        2,
        2,
        "Tell whether two functions differ only by input order and inversions",
        "Tries orders of the inputs alone first, then inversions of inputs and output too, and\n"
        "prints the mapping. Inputs without effect are left out. At most 16 inputs with an\n"
        "effect. The inputs of an init value are called A, B, C, ... unless --inputs\n"
        "(--second-inputs for the second) lists as many as it has. With '-' or --file, each line\n"
        "is matched with the one given. Status 0: they match, 1: they do not, 4: not decided\n"
        "within --seconds.\n",
        {{"--order-only", nullptr, "Do not try inversions"},
         {"--second-inputs", "A,B,C", "The inputs of the second, if they differ"},
         {"--seconds", "N", "Give up after N seconds: not decided, status 4"}},
        {"booleq match 0xca 0xe2", "booleq match 'a & b' 'x ~| y'", "booleq match 0xca 0xcaca"},
        RunMatch};
}

} // namespace booleq
