// The command 'match': are two functions one up to the order of inputs, or up to inversions.
#include "match.h"

#include "answer.h"
#include "commands.h"
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

// An init value without listed inputs gets letters for its width; anything else is read as usual.
bool SetNamed(const Text& text, const Request& request, Output& output, Function& function)
{
    if (request.reading.hasInputs)
        return SetFunction(text, request, output, function);
    const InitText init = ReadInitText(text.text, 0);
    if (init.fault != InitFault::kWidth || init.numInputs > kMaxMatchInputs)
        return SetFunction(text, request, output, function);
    return FunctionFromInit(text.text, LetterNames(init.numInputs), false, function).fault ==
           InitFault::kNone;
}

struct Answer {
    const char* level = nullptr; // null: no match
    Matching matching;
};

Answer FindMatch(const Function& first, const Function& second, bool orderOnly)
{
    Answer answer;
    if (first.NumInputs() != second.NumInputs())
        return answer;
    answer.matching = Match(first, second, false);
    answer.level = "order";
    if (!answer.matching.isFound && !orderOnly) {
        answer.matching = Match(first, second, true);
        answer.level = "inversions";
    }
    // What is printed is proved, not what the search meant.
    if (!answer.matching.isFound || Apply(answer.matching, first, second.Inputs()) != second)
        answer.level = nullptr;
    return answer;
}

std::string SourceText(const Function& second, const Matching& matching, size_t place)
{
    return (matching.inverted[place] ? "~" : "") + Visible(second.Inputs()[place]);
}

void PutText(const Text& text, const Function& first, const Function& second, const Answer& answer,
             Output& output)
{
    const std::string place = text.line > 0 ? "line " + std::to_string(text.line) + ": " : "";
    if (!answer.level) {
        const bool sameCount = first.NumInputs() == second.NumInputs();
        output.Put(place + "no match" +
                   (sameCount ? "\n"
                              : ": " + Count(first.NumInputs(), "input") + " and " +
                                    std::to_string(second.NumInputs()) + "\n"));
        return;
    }
    const bool isOrder = std::string(answer.level) == "order";
    output.Put(place +
               (isOrder ? "match, by the order of inputs alone\n" : "match, with inversions\n"));
    output.Put("  the second is the first" +
               std::string(answer.matching.isInverted ? " inverted" : "") +
               (first.NumInputs() > 0 ? ", where\n" : "\n"));
    // In the order of the first one's inputs.
    for (size_t input = 0; input < first.NumInputs(); ++input)
        for (size_t other = 0; other < second.NumInputs(); ++other)
            if (answer.matching.sources[other] == input)
                output.Put("    " + Visible(first.Inputs()[input]) + " of the first is " +
                           SourceText(second, answer.matching, other) + " of the second\n");
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
        for (size_t other = 0; other < second.NumInputs(); ++other)
            json["mapping"].push_back(
                {{"first", first.Inputs()[answer.matching.sources[other]]},
                 {"second", second.Inputs()[other]},
                 {"inverted", static_cast<bool>(answer.matching.inverted[other])}});
    return json;
}

bool RefuseTooMany(const Text& text, const Request& request, const Function& function,
                   Output& output)
{
    if (function.NumInputs() <= kMaxMatchInputs)
        return false;
    Refuse(text, request, output,
           Count(function.NumInputs(), "input") + ": at most " + std::to_string(kMaxMatchInputs) +
               " are matched");
    return true;
}

int RunMatch(const Request& request, Output& output)
{
    const Text other{request.operands.back(), 0};
    Function second;
    if (!SetNamed(other, request, output, second) || RefuseTooMany(other, request, second, output))
        return kRefused;
    return ForEachText(request, output, [&](const Text& text) {
        Function first;
        if (!SetNamed(text, request, output, first) || RefuseTooMany(text, request, first, output))
            return kRefused;
        const Answer answer = FindMatch(first, second, request.Has("--order-only"));
        if (request.json)
            PutJson(text, request, answer.level ? "yes" : "no", ToJson(first, second, answer),
                    output);
        else
            PutText(text, first, second, answer, output);
        return answer.level ? kDone : kFindings;
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
        "mapping is printed. Status 0: they match, 1: they do not. The inputs of an init value\n"
        "are called A, B, C, ... unless --inputs names them. At most 16 inputs.\n"
        "With '-' or --file each line is matched with the one that is given.\n",
        {{"--order-only", nullptr, "Inversions do not count as a match"}},
        {"booleq match 0xca 0xe2", "booleq match 'a & b' 'x ~| y'"},
        RunMatch};
}

} // namespace booleq
