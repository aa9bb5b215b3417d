// The command 'match': are two functions one up to the order of inputs, or up to inversions.
#include "match.h"

#include <algorithm>
#include <chrono>

#include "answer.h"
#include "commands.h"
#include "init_literal.h"
#include "options.h"
#include "text.h"

namespace booleq {

namespace {

// A, B, C, ... for an init value whose inputs nobody has named.
std::vector<std::string> LetterNames(size_t count)
{
    std::vector<std::string> names;
    for (size_t index = 0; index < count; ++index)
        names.push_back(index < 26 ? std::string(1, static_cast<char>('A' + index))
                                   : "I" + std::to_string(index));
    return names;
}

// The number of inputs of an init value that names none; kMaxFunctionInputs + 1 for another text.
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

// The inputs that --inputs names, or --second-inputs for the second: an init value that is not so
// wide, and one without listed inputs, gets letters. Anything else is read as usual.
bool SetNamed(const Text& text, const Request& request, Output& output, Function& function)
{
    Reading reading(request.reading);
    Kq_BoolEquation equation;
    const size_t width = WidthOf(text.text);
    const bool isFitting = reading.hasInputs && SetFromText(equation, text.text, reading);
    if (width > kMaxFunctionInputs || isFitting)
        return SetFunction(text, request, output, function);
    Request lettered(request);
    lettered.reading.hasInputs = true;
    lettered.reading.inputs = LetterNames(width);
    return SetFunction(text, lettered, output, function);
}

// The same for the second, whose inputs may have names of their own.
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

struct Answer {
    const char* level = nullptr; // null: no match
    Matching matching;
};

// First by order alone, then with inversions; both within the time.
Answer FindMatch(const Function& first, const Function& second, bool orderOnly, double seconds)
{
    const auto start = std::chrono::steady_clock::now();
    Answer answer;
    answer.matching = Match(first, second, false, seconds);
    answer.level = answer.matching.isFound ? "order" : nullptr;
    if (answer.level || orderOnly || !answer.matching.isDecided)
        return answer;
    const std::chrono::duration<double> passed = std::chrono::steady_clock::now() - start;
    const double left = seconds > 0 ? std::max(seconds - passed.count(), 1e-6) : 0;
    answer.matching = Match(first, second, true, left);
    answer.level = answer.matching.isFound ? "inversions" : nullptr;
    return answer;
}

std::string SourceText(const Function& second, const Matching& matching, size_t place)
{
    return (matching.inverted[place] ? "~" : "") + Visible(second.Inputs()[place]);
}

std::vector<std::string> IdleInputs(const Function& function)
{
    std::vector<std::string> idle;
    for (unsigned int input = 0; input < function.NumInputs(); ++input)
        if (!DependsOn(function.GetRows(), input))
            idle.push_back(function.Inputs()[input]);
    return idle;
}

void PutIdle(const char* which, const Function& function, Output& output)
{
    const std::string list = Visible(Join(IdleInputs(function), ", "));
    if (!list.empty())
        output.Put("    without effect in the " + std::string(which) + ": " + list + "\n");
}

void PutText(const Request& request, const Function& first, const Function& second,
             const Answer& answer, Output& output)
{
    if (!answer.matching.isDecided) {
        output.Put("not decided in " + request.Get("--seconds") + " seconds\n");
        return;
    }
    const size_t numFirst = EffectiveInputs(first).size();
    const size_t numSecond = EffectiveInputs(second).size();
    if (!answer.level) {
        output.Put("no match" + (numFirst == numSecond
                                     ? "\n"
                                     : ": " + Count(numFirst, "input") + " with an effect, and " +
                                           std::to_string(numSecond) + "\n"));
        return;
    }
    const bool isOrder = std::string(answer.level) == "order";
    output.Put((isOrder ? "match, by the order of inputs alone\n" : "match, with inversions\n"));
    output.Put("  the second is the first" +
               std::string(answer.matching.isInverted ? " inverted" : "") +
               (numFirst > 0 ? ", where\n" : "\n"));
    // In the order of the first one's inputs.
    for (size_t input = 0; input < first.NumInputs(); ++input)
        for (size_t other = 0; other < second.NumInputs(); ++other)
            if (answer.matching.sources[other] == input)
                output.Put("    " + Visible(first.Inputs()[input]) + " of the first is " +
                           SourceText(second, answer.matching, other) + " of the second\n");
    PutIdle("first", first, output);
    PutIdle("second", second, output);
}

Json ToJson(const Function& first, const Function& second, const Answer& answer)
{
    Json json;
    json["match"] = answer.level ? Json(answer.level) : Json(nullptr);
    json["first_inputs"] = first.Inputs();
    json["second_inputs"] = second.Inputs();
    json["output_inverted"] = answer.level ? Json(answer.matching.isInverted) : Json(nullptr);
    json["mapping"] = Json::array();
    if (answer.level)
        for (size_t other = 0; other < second.NumInputs(); ++other) {
            if (answer.matching.sources[other] == Matching::kIdle)
                continue;
            json["mapping"].push_back(
                {{"first", first.Inputs()[answer.matching.sources[other]]},
                 {"second", second.Inputs()[other]},
                 {"inverted", static_cast<bool>(answer.matching.inverted[other])}});
        }
    json["first_without_effect"] = IdleInputs(first);
    json["second_without_effect"] = IdleInputs(second);
    return json;
}

bool RefuseTooMany(const Text& text, const Request& request, const Function& function,
                   Output& output)
{
    const size_t numInputs = EffectiveInputs(function).size();
    if (numInputs <= kMaxMatchInputs)
        return false;
    Refuse(text, request, output,
           Count(numInputs, "input") + " with an effect: at most " +
               std::to_string(kMaxMatchInputs) + " are matched");
    return true;
}

const char* StatusName(const Answer& answer)
{
    if (!answer.matching.isDecided)
        return "undecided";
    return answer.level ? "yes" : "no";
}

int RunMatch(const Request& request, Output& output)
{
    const double seconds = ParseSeconds(request);
    const Request forSecond = ForSecond(request);
    const Text other{request.operands.back(), 0};
    Function second;
    if (!SetNamed(other, forSecond, output, second) ||
        RefuseTooMany(other, request, second, output))
        return kRefused;
    return ForEachText(request, output, [&](const Text& text) {
        Function first;
        if (!SetNamed(text, request, output, first) || RefuseTooMany(text, request, first, output))
            return kRefused;
        const Answer answer = FindMatch(first, second, request.Has("--order-only"), seconds);
        const int found = answer.level ? kDone : kFindings;
        return Say(text, request, output,
                   {answer.matching.isDecided ? found : kUndecided, StatusName(answer),
                    LineMark::Prefix, [&] { return ToJson(first, second, answer); },
                    [&] { PutText(request, first, second, answer, output); }});
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
        "Tell whether two functions are one but for order and inversions of inputs",
        "First by the order of inputs alone, then also with inversions of inputs and output; the\n"
        "mapping is printed. Inputs without effect have no counterpart and need none. Status 0:\n"
        "they match, 1: they do not, 4: not decided in time. The inputs of an init value are\n"
        "called A, B, C, ... unless --inputs, or --second-inputs for the second, names as many as\n"
        "it has. At most 16 inputs with an effect.\n"
        "With '-' or --file each line is matched with the one that is given.\n",
        {{"--order-only", nullptr, "Inversions do not count as a match"},
         {"--second-inputs", "A,B,C", "The inputs of the second, if they are not --inputs"},
         {"--seconds", "N", "End after N seconds: not decided, status 4"}},
        {"booleq match 0xca 0xe2", "booleq match 'a & b' 'x ~| y'", "booleq match 0xca 0xcaca"},
        RunMatch};
}

} // namespace booleq
