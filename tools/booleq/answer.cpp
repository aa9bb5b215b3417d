#include "answer.h"

#include <algorithm>
#include <utility>

#include "function.h"
#include "lines.h"
#include "progress.h"
#include "refusal.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kLabelWidth = 16;

Json Envelope(const Text& text, const Request& request, const char* status)
{
    Json json;
    json["command"] = request.command->name;
    if (text.line > 0)
        json["line"] = text.line;
    json["text"] = text.text;
    json["status"] = status;
    return json;
}

void SayRefusal(const Text& text, const Request& request, Output& output,
                const RefusalReport& report)
{
    if (request.json) {
        Json json = Envelope(text, request, "refused");
        json["refusal"] = RefusalAsJson(report);
        output.Put(JsonLine(json) + "\n");
        return;
    }
    const std::string line = text.line > 0 ? "line " + std::to_string(text.line) + ": " : "";
    if (report.length == 0) {
        Complain(output, line + "refused: " + report.reason +
                             (IsBlank(text.text) ? "" : "\n  " + Excerpt(text.text)));
        return;
    }
    std::string message = line + "refused at " + PlaceName(text.text, report.offset) + ": " +
                          report.reason + "\n" +
                          MarkPlace(text.text, report.offset, report.length, "  ");
    if (report.hint.empty())
        message.pop_back(); // Complain writes the line end
    else
        message += "  " + report.hint;
    Complain(output, message);
}

// No text begins with this character.
bool IsComment(const std::string& line)
{
    const size_t first = line.find_first_not_of(" \t");
    return first != std::string::npos && line[first] == '#';
}

} // namespace

int ForEachText(const Request& request, Output& output,
                const std::function<int(const Text&)>& answer)
{
    if (!request.hasLines)
        return answer({request.operands.front(), 0});
    LineReader reader(request.file);
    Progress progress("reading", reader.GetSize());
    Text text;
    size_t numTexts = 0;
    int status = kDone;
    while (reader.Next(text.text)) {
        if (++text.line == 1)
            DropByteOrderMark(text.text);
        DropCarriageReturn(text.text);
        if (IsBlank(text.text) || IsComment(text.text))
            continue;
        ++numTexts;
        status = std::max(status, answer(text));
        if (request.Has("--line-buffered"))
            output.Flush();
        progress.Show(reader.GetPosition());
    }
    if (numTexts == 0)
        Complain(output,
                 "warning: no equation " +
                     (request.file == "-" ? "on standard input" : "in " + Visible(request.file)));
    return status;
}

bool SetEquation(const Text& text, const Request& request, Output& output,
                 Kq_BoolEquation& equation)
{
    if (text.text.find('\0') == std::string::npos &&
        SetFromText(equation, text.text, request.reading))
        return true;
    SayRefusal(text, request, output, ExplainRefusal(text.text, request.reading));
    return false;
}

bool SetFunction(const Text& text, const Request& request, Output& output,
                 kq_logic::Function& function)
{
    Kq_BoolEquation equation;
    if (!SetEquation(text, request, output, equation))
        return false;
    if (function.Set(equation))
        return true;
    Refuse(text, request, output, NoFunctionReason(equation.GetNumVariables()));
    return false;
}

void RefuseTwoFormats(const Request& request, const std::string& option)
{
    if (request.json && request.Has(option))
        throw UsageError("--json and " + option + " are two formats; give only one");
}

void Refuse(const Text& text, const Request& request, Output& output, const std::string& reason)
{
    RefusalReport report;
    report.code = "unsuitable";
    report.reason = reason;
    SayRefusal(text, request, output, report);
}

Json RefusalAsJson(const RefusalReport& report)
{
    Json json;
    json["code"] = report.code;
    json["offset"] = report.offset;
    json["length"] = report.length;
    json["reason"] = report.reason;
    json["hint"] = report.hint.empty() ? Json() : Json(report.hint);
    return json;
}

void PutJson(const Text& text, const Request& request, const char* status, const Json& result,
             Output& output)
{
    output.Put(EnvelopeLine(text, request, status, result));
}

std::string EnvelopeLine(const Text& text, const Request& request, const char* status,
                         const Json& result)
{
    Json json = Envelope(text, request, status);
    json["result"] = result;
    return JsonLine(json) + "\n";
}

int Say(const Text& text, const Request& request, Output& output, const Reply& reply)
{
    if (request.json) {
        PutJson(text, request, reply.word, reply.toJson(), output);
        return reply.status;
    }
    const LineMark mark = text.line > 0 ? reply.mark : LineMark::Nothing;
    switch (mark) {
    case LineMark::Nothing:
        break;
    case LineMark::Prefix:
        output.Put("line " + std::to_string(text.line) + ": ");
        break;
    case LineMark::Heading:
        output.Put("line " + std::to_string(text.line) + "\n");
        break;
    case LineMark::Block:
        PutField(output, "line", std::to_string(text.line));
        break;
    }
    reply.putText();
    if (mark == LineMark::Block)
        output.Put("\n");
    return reply.status;
}

std::pair<std::string, std::string> JsonAroundArray(const Text& text, const Request& request,
                                                    const char* status, const Json& result)
{
    Json json = Envelope(text, request, status);
    json["result"] = result;
    const std::string line = JsonLine(json) + "\n";
    // Only the ends of the two objects come after the array.
    const size_t middle = line.rfind("[]") + 1;
    return {line.substr(0, middle), line.substr(middle)};
}

std::string JsonLine(const Json& json)
{
    return json.dump(-1, ' ', false, Json::error_handler_t::replace);
}

void PutMember(Json& object, const std::string& name, const Json& value)
{
    const std::string written = Json::parse(JsonLine(Json(name))).get<std::string>();
    std::string key = written;
    for (size_t number = 2; object.contains(key); ++number)
        key = written + "#" + std::to_string(number);
    object[key] = value;
}

void PutLabel(Output& output, const std::string& label)
{
    output.Put(label +
               std::string(label.size() < kLabelWidth ? kLabelWidth - label.size() : 1, ' '));
}

void PutField(Output& output, const std::string& label, const std::string& value)
{
    PutLabel(output, label);
    output.Put(value + "\n");
}

} // namespace booleq
