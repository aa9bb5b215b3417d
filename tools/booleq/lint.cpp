// The command 'lint': which tools read the text as another function, and where the library
// surprises.
#include "lint.h"

#include "commands.h"
#include "decide.h"
#include "text.h"

namespace booleq {

namespace {

constexpr double kDefaultSeconds = 10; // for each reader

// A difference as lines; notations that read the text alike share them.
std::string DifferenceText(const LintReport& report, const ForeignReading& reading)
{
    const auto line = [](const std::string& label, const std::string& value) {
        return "  " + label + std::string(14 - label.size(), ' ') + Visible(value) + "\n";
    };
    std::string text =
        reading.decision.IsDifferent()
            ? line(reading.decision.isFirstRow ? "first at" : "differs at",
                   AssignmentText(report.inputs, reading.decision.assignment) + ": " +
                       (reading.decision.left ? "1 here, 0 there" : "0 here, 1 there"))
            : line("not decided", "the groupings differ: " + reading.decision.reason);
    text += line("here", report.grouping);
    text += line("there", reading.grouping);
    text += line("because", reading.reason);
    text += line("write there", reading.textThere);
    if (!reading.textHere.empty())
        text += line("or here", reading.textHere + ", if that is meant");
    return text;
}

void PutDifferences(const LintReport& report, Output& output)
{
    std::vector<std::pair<std::string, std::string>> groups; // notations and their lines
    for (const ForeignReading& reading : report.readings) {
        if (!reading.isRead || reading.decision.IsEqual())
            continue;
        const std::string text = DifferenceText(report, reading);
        bool isKnown = false;
        for (auto& group : groups) {
            if (group.second != text)
                continue;
            group.first += std::string(", ") + reading.notation;
            isKnown = true;
        }
        if (!isKnown)
            groups.emplace_back(reading.notation, text);
    }
    for (const auto& group : groups)
        output.Put(group.second.rfind("  not decided", 0) == 0
                       ? "perhaps another function in " + group.first + "\n" + group.second
                       : "another function in " + group.first + "\n" + group.second);
}

void PutFindings(const LintReport& report, Output& output)
{
    for (const Finding& finding : report.findings) {
        output.Put(Visible(finding.message) + "\n");
        for (const auto& detail : finding.details)
            output.Put("  " + detail.first +
                       std::string(detail.first.size() < 16 ? 16 - detail.first.size() : 1, ' ') +
                       Visible(detail.second) + "\n");
    }
}

void PutOthers(const LintReport& report, Output& output)
{
    std::string same;
    for (const ForeignReading& reading : report.readings)
        if (reading.isRead && reading.decision.IsEqual())
            same += std::string(same.empty() ? "" : ", ") + reading.notation;
    if (!same.empty())
        PutField(output, "the same in", same);
    for (const ForeignReading& reading : report.readings)
        if (!reading.isRead)
            PutField(output, "refused by",
                     std::string(reading.notation) + ": " + Visible(reading.fault));
}

Json DifferenceJson(const ForeignReading& reading)
{
    Json json;
    const bool isKnown = reading.decision.IsDifferent();
    json["assignment"] =
        isKnown ? AssignmentJson(reading.decision.inputs, reading.decision.assignment) : Json();
    json["here"] = isKnown ? Json(reading.decision.left ? 1 : 0) : Json();
    json["grouping"] = reading.grouping;
    json["reason"] = reading.reason;
    json["write_there"] = reading.textThere;
    json["write_here"] = reading.textHere.empty() ? Json(nullptr) : Json(reading.textHere);
    return json;
}

Json ToJson(const LintReport& report)
{
    Json json;
    json["inputs"] = report.inputs;
    json["grouping"] = report.grouping;
    json["readers"] = Json::array();
    for (const ForeignReading& reading : report.readings) {
        Json reader;
        reader["notation"] = reading.notation;
        reader["reads"] = reading.isRead;
        reader["refusal"] = reading.isRead ? Json(nullptr) : Json(reading.fault);
        const bool isDecided = reading.decision.verdict != Verdict::Undecided;
        reader["same"] = isDecided ? Json(reading.decision.IsEqual()) : Json(nullptr);
        reader["compared_all"] = reading.isRead ? Json(isDecided) : Json(nullptr);
        reader["hex"] = reading.hex.empty() ? Json(nullptr) : Json(reading.hex);
        reader["difference"] =
            reading.isRead && !reading.decision.IsEqual() ? DifferenceJson(reading) : Json(nullptr);
        json["readers"].push_back(reader);
    }
    json["findings"] = Json::array();
    for (const Finding& finding : report.findings) {
        Json details = Json::object();
        for (const auto& detail : finding.details)
            details[detail.first] = detail.second;
        json["findings"].push_back(
            {{"code", finding.code}, {"message", finding.message}, {"details", details}});
    }
    return json;
}

int RunLint(const Request& request, Output& output)
{
    const Limits limits = {ParseSeconds(request, kDefaultSeconds)};
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        const LintReport report =
            Watched([&] { return Lint(text.text, equation, request.reading, limits); });
        const int status = report.IsClean() ? kDone : kFindings;
        const auto putText = [&] {
            if (status == kDone)
                output.Put("no findings\n");
            PutDifferences(report, output);
            PutFindings(report, output);
            PutOthers(report, output);
        };
        return Say(text, request, output,
                   {status, status == kDone ? "done" : "findings", LineMark::Block,
                    [&] { return ToJson(report); }, putText});
    });
}

} // namespace

Command LintCommand()
{
    return {
        "lint",
        "EQUATION",
        1,
        1,
        "Find what other readers take differently, and other surprises",
        "Reads the text as Verilog, C, Liberty, VHDL and Python would, with inputs that are\n"
        "single bits (0 or 1), and compares the functions. For each reader that differs it prints\n"
        "the first assignment, both groupings, and the text to write there, or here if the other\n"
        "reading was meant. It also finds blanks inside negated operators, renderings that do not\n"
        "read back, a text that begins with 0, listed inputs that are skipped or missing, and\n"
        "init values that are too short. A comparison that takes longer than 10 seconds, or\n"
        "--seconds, is a finding too. Status 0: no findings, 1: findings.\n",
        {SecondsOption()},
        {"booleq lint 'a | b & c'", "booleq lint 'P & X ~ | Y'",
         "booleq lint --inputs A,B 'A & C'"},
        RunLint};
}

} // namespace booleq
