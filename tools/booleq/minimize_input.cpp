// What 'minimize' reads: a PLA file, a truth table, lines of equations, or equations as words.
#include <algorithm>
#include <cstdio>

#include "lines.h"
#include "minimize.h"
#include "text.h"

namespace booleq {

namespace {

bool IsFile(const std::string& path)
{
    std::FILE* stream = std::fopen(path.c_str(), "rb");
    if (!stream)
        return false;
    const bool canRead = std::fgetc(stream) != EOF || !std::ferror(stream); // false for a folder
    std::fclose(stream);
    return canRead;
}

std::string WholeFile(const std::string& path)
{
    LineReader reader(path);
    std::string text;
    std::string line;
    while (reader.Next(line))
        text += line + "\n";
    return text;
}

// The first line that has something other than blanks and a comment.
std::string FirstLine(const std::string& text)
{
    size_t begin = 0;
    while (begin < text.size()) {
        const size_t end = std::min(text.find('\n', begin), text.size());
        const std::string line = text.substr(begin, end - begin);
        const size_t first = line.find_first_not_of(" \t\r");
        if (first != std::string::npos && line[first] != '#')
            return line.substr(first);
        begin = end + 1;
    }
    return std::string();
}

bool HasDirective(const std::string& text)
{
    for (const char* directive : {".i ", ".o ", ".i\t", ".o\t", ".ilb", ".ob", ".p ", ".type"})
        if (text.compare(0, std::string(directive).size(), directive) == 0 ||
            text.find(std::string("\n") + directive) != std::string::npos)
            return true;
    return false;
}

bool IsOnlyPlaDigits(const std::string& line)
{
    return line.find_first_not_of("01-~2x| \t\r") == std::string::npos &&
           line.find_first_of(" \t|-") != std::string::npos;
}

// The equations of the command line or of a file, one output each.
class EquationReader {
  public:
    EquationReader(const Request& request, Output& output) : m_request(request), m_output(output) {}

    // 'text' is EQUATION, or NAME = EQUATION; NAME.dc = EQUATION says which rows of NAME are free.
    bool Add(const Text& text)
    {
        const size_t equals = text.text.find('=');
        Text equation = text;
        std::string name;
        if (equals != std::string::npos) {
            equation.text = text.text.substr(equals + 1);
            name = Trimmed(text.text.substr(0, equals));
            if (name.empty()) {
                Refuse(text, m_request, m_output,
                       "expected a name before '=': write NAME = EQUATION");
                return false;
            }
        }
        Expression expression;
        if (!Read(equation, expression))
            return false;
        const bool isFree = name.size() > 3 && name.compare(name.size() - 3, 3, ".dc") == 0;
        if (isFree)
            return AddFree(text, name.substr(0, name.size() - 3), expression);
        for (const TableOutput& other : m_outputs) {
            if (!name.empty() && other.name == name) {
                Refuse(text, m_request, m_output,
                       "the output " + Visible(name) + " is named twice");
                return false;
            }
        }
        m_outputs.push_back({name, expression, false, Expression()});
        return true;
    }

    bool AddFreeForAll(const std::string& text)
    {
        Expression expression;
        if (!Read({text, 0}, expression))
            return false;
        for (TableOutput& output : m_outputs) {
            output.hasFree = true;
            output.free = expression;
        }
        return true;
    }

    bool IsEmpty() const { return m_outputs.empty(); }

    // Fails: false, and the refusal has been printed.
    bool MakeTable(Work& work, MinimizeInput& input)
    {
        for (size_t index = 0; index < m_outputs.size(); ++index)
            if (m_outputs[index].name.empty())
                m_outputs[index].name =
                    m_outputs.size() == 1 ? "f" : "f" + std::to_string(index + 1);
        PlaFault fault;
        if (TableOf(m_outputs, InputsOf(m_outputs), input.table, fault, work))
            return true;
        RefuseFault(input, m_request, m_output, fault);
        return false;
    }

  private:
    static std::string Trimmed(const std::string& text)
    {
        const size_t begin = text.find_first_not_of(" \t\r");
        const size_t end = text.find_last_not_of(" \t\r");
        return begin == std::string::npos ? std::string() : text.substr(begin, end - begin + 1);
    }

    bool Read(const Text& text, Expression& expression)
    {
        Kq_BoolEquation equation;
        if (!SetEquation(text, m_request, m_output, equation))
            return false;
        expression = ToExpression(equation);
        return true;
    }

    bool AddFree(const Text& text, const std::string& name, const Expression& expression)
    {
        for (TableOutput& output : m_outputs) {
            if (output.name != name)
                continue;
            output.hasFree = true;
            output.free = expression;
            return true;
        }
        Refuse(text, m_request, m_output,
               "free rows of " + Visible(name) + ", which has no equation before");
        return false;
    }

    const Request& m_request;
    Output& m_output;
    std::vector<TableOutput> m_outputs;
};

size_t ParseOutputs(const Request& request)
{
    const std::string text = request.Get("--outputs");
    if (text.empty())
        return 1;
    if (text.size() > 4 || text.find_first_not_of("0123456789") != std::string::npos || text == "0")
        throw UsageError("--outputs takes a number, not '" + Visible(text) + "'");
    return std::stoul(text);
}

bool ReadText(const std::string& text, const Request& request, Output& output, Work& work,
              MinimizeInput& input)
{
    PlaFault fault;
    const std::string first = FirstLine(text);
    const bool isCsv = first.find(',') != std::string::npos && first.find('=') == std::string::npos;
    input.isPla = !isCsv && (HasDirective(text) || IsOnlyPlaDigits(first));
    if (isCsv || input.isPla) {
        if (request.Has("--dc"))
            throw UsageError("--dc is for equations; a table has its own free rows");
        const bool isRead = isCsv ? ReadCsv(text, ParseOutputs(request), input.table, fault)
                                  : ReadPla(text, input.table, fault);
        if (!isRead)
            RefuseFault(input, request, output, fault);
        return isRead;
    }
    EquationReader reader(request, output);
    size_t begin = 0;
    for (size_t line = 1; begin < text.size(); ++line) {
        const size_t end = std::min(text.find('\n', begin), text.size());
        const std::string equation = text.substr(begin, end - begin);
        begin = end + 1;
        const size_t start = equation.find_first_not_of(" \t\r");
        if (start == std::string::npos || equation[start] == '#')
            continue;
        if (!reader.Add({equation, line}))
            return false;
    }
    if (reader.IsEmpty()) {
        Refuse(input.text, request, output, "the file has nothing to minimise");
        return false;
    }
    if (request.Has("--dc") && !reader.AddFreeForAll(request.Get("--dc")))
        return false;
    return reader.MakeTable(work, input);
}

bool ReadInit(const Request& request, Output& output, MinimizeInput& input)
{
    if (!request.reading.hasInputs)
        throw UsageError("an init value needs --inputs: --inputs A,B");
    std::vector<std::string> inputs = request.reading.inputs;
    if (CheckInputs(inputs).usable != inputs)
        throw UsageError("--inputs lists a name twice, or something that is not a name");
    if (request.reading.reverse)
        std::reverse(inputs.begin(), inputs.end());
    std::string reason;
    if (TableFromInit(input.text.text, inputs, request.reading.lsbFirst, "f", input.table, reason))
        return true;
    Refuse(input.text, request, output, reason);
    return false;
}

} // namespace

bool ReadMinimizeInput(const Request& request, Output& output, Work& work, MinimizeInput& input)
{
    if (request.hasLines || (request.operands.size() == 1 && IsFile(request.operands[0]))) {
        const std::string path = request.hasLines ? request.file : request.operands[0];
        if (request.hasLines && !request.operands.empty())
            throw UsageError("a file and '" + Excerpt(request.operands[0]) + "': give one of them");
        input.text.text = path;
        return ReadText(WholeFile(path), request, output, work, input);
    }
    input.text.text = request.operands[0];
    if (request.operands.size() == 1 && IsInitWithFree(request.operands[0])) {
        if (request.Has("--dc"))
            throw UsageError("give free rows either by --dc or by x digits, not by both");
        return ReadInit(request, output, input);
    }
    EquationReader reader(request, output);
    for (const std::string& equation : request.operands)
        if (!reader.Add({equation, 0}))
            return false;
    if (request.Has("--dc") && !reader.AddFreeForAll(request.Get("--dc")))
        return false;
    return reader.MakeTable(work, input);
}

void RefuseFault(const MinimizeInput& input, const Request& request, Output& output,
                 const PlaFault& fault)
{
    Text text = input.text;
    text.line = fault.line;
    Refuse(text, request, output, fault.message + (fault.hint.empty() ? "" : "; " + fault.hint));
}

} // namespace booleq
