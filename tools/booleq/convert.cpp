// The command 'convert': an equation in another notation, proved equal before it is printed.
#include <cassert>

#include <kq_logic/convert.h>
#include <kq_logic/short_form.h>

#include "commands.h"
#include "convert.h"
#include "decide.h"
#include "function.h"
#include "text.h"

namespace booleq {

namespace {

constexpr double kDefaultSeconds = 10; // for each equation

const Target& ParseTarget(const std::string& word)
{
    const std::string known = Join(TargetNames(), ", ");
    if (word.empty())
        throw UsageError("convert needs --to with one of: " + known);
    const Target* const target = FindTarget(word);
    if (!target)
        throw UsageError("--to takes one of " + known + ", not '" + Visible(word) + "'");
    return *target;
}

// A word that every target accepts as the name of the unit around an expression.
std::string ParseUnit(const Request& request, const Target& target)
{
    const std::string name = request.Get("--name");
    if (!request.Has("--unit") && !request.Has("--name"))
        return std::string();
    if (target.wrapping == Wrapping::Never)
        throw UsageError("--unit and --name do not apply: --to " + request.Get("--to") +
                         " has no modules");
    const bool isWord = !name.empty() && name.find_first_not_of("abcdefghijklmnopqrstuvwxyz"
                                                                "ABCDEFGHIJKLMNOPQRSTUVWXYZ"
                                                                "0123456789_") == std::string::npos;
    const bool startsWell = !name.empty() && name[0] != '_' && (name[0] < '0' || name[0] > '9');
    const bool isVhdlName =
        name.find("__") == std::string::npos && (name.empty() || name.back() != '_');
    if (request.Has("--name") && !(isWord && startsWell && isVhdlName))
        throw UsageError(
            "--name takes letters, digits and single '_', beginning with a letter, not '" +
            Visible(name) + "'");
    return name.empty() ? "f" : name;
}

Json ToJson(const Request& request, const kq_logic::Conversion& conversion)
{
    Json json;
    json["to"] = request.Get("--to");
    json["text"] = conversion.text;
    json["unit"] = conversion.unit.empty() ? Json(nullptr) : Json(conversion.unit);
    json["output"] = conversion.output.empty() ? Json(nullptr) : Json(conversion.output);
    json["inputs"] = Json::array();
    for (size_t input = 0; input < conversion.names.size(); ++input)
        json["inputs"].push_back(
            {{"input", conversion.inputs[input]}, {"name", conversion.names[input]}});
    json["compared_all"] = conversion.isProved;
    return json;
}

void PutText(const kq_logic::Conversion& conversion, Output& output)
{
    // A bare expression must stay one, so nothing is added as a comment.
    if (!conversion.saysNames)
        for (const auto& change : ChangedNames(conversion.inputs, conversion.names))
            Complain(output, "note: " + Visible(change.first) + " is written " + change.second);
    if (!conversion.isProved)
        Complain(output, "warning: not decided whether this reads back as the same function: " +
                             conversion.doubt);
    output.Put(conversion.text);
}

// Sets the equation to its short form over the same inputs.  Fails: why there is none.
std::string Shorten(Kq_BoolEquation& equation)
{
    const size_t numInputs = equation.GetNumVariables();
    kq_logic::Function function;
    if (numInputs > kq_logic::kMaxShortFormInputs || !function.Set(equation))
        return Count(numInputs, "input") + ": at most " +
               std::to_string(kq_logic::kMaxShortFormInputs) + " are shortened";
    const kq_logic::ShortForm shortForm = kq_logic::FindShortForm(function);
    if (!shortForm.fault.empty())
        return shortForm.fault;
    Reading reading;
    reading.hasInputs = true;
    reading.inputs = function.Inputs();
    const bool isSet = SetVerbatim(equation, shortForm.text, reading);
    assert(isSet);
    return isSet ? std::string() : "the short form does not read back";
}

int RunConvert(const Request& request, Output& output)
{
    const Target& target = ParseTarget(request.Get("--to"));
    std::string unit = ParseUnit(request, target);
    const double seconds = ParseSeconds(request, kDefaultSeconds);
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        const std::string fault =
            request.Has("--short") ? Watched([&] { return Shorten(equation); }) : std::string();
        if (!fault.empty()) {
            Refuse(text, request, output, fault);
            return kRefused;
        }
        std::string ownUnit = unit;
        if (text.line > 0 && target.wrapping != Wrapping::Never &&
            (!unit.empty() || target.wrapping == Wrapping::Always))
            ownUnit = (unit.empty() ? "f" : unit) + "_" + std::to_string(text.line);
        const kq_logic::Conversion conversion =
            Watched([&] { return kq_logic::Convert(equation, target.name, ownUnit, {seconds}); });
        if (!conversion.fault.empty()) {
            Refuse(text, request, output, conversion.fault);
            return kRefused;
        }
        return Say(text, request, output,
                   {conversion.isProved ? kDone : kUndecided,
                    conversion.isProved ? "done" : "undecided", LineMark::Nothing,
                    [&] { return ToJson(request, conversion); },
                    [&] { PutText(conversion, output); }});
    });
}

} // namespace

Command ConvertCommand()
{
    return {
        "convert",
        "EQUATION",
        1,
        1,
        "Write an equation in another notation, with the parentheses it needs there",
        "Targets: primary (each operator as typed), alt1 (& | ^), alt2 (* + @), alt3 (.AND.),\n"
        "paren (every operation in parentheses), verilog, vhdl, c, python, liberty, and the file\n"
        "formats blif, pla and eqn. Names that the target cannot spell are escaped or changed,\n"
        "and a note says how. Before it is printed, the text is read back and proved to be the\n"
        "same function; if that takes longer than 10 seconds, or --seconds, a warning says so and\n"
        "the status is 4. When several lines are converted, each module's name ends with its line\n"
        "number.\n",
        {{"--to", "TARGET", "What to write"},
         {"--short", nullptr, "Write a short expression instead of the one given"},
         {"--unit", nullptr, "Put a module, entity, function or cell around the expression"},
         {"--name", "NAME", "Name of that unit, or of the model of a BLIF file (f)"},
         SecondsOption()},
        {"booleq convert 'a | b & c' --to verilog",
         "booleq convert \"'A[0]' ~& B\" --to vhdl --unit --name gate",
         "booleq convert --inputs A,B 0x6 --to python"},
        RunConvert};
}

} // namespace booleq
