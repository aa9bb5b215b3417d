// The command 'show': everything the library answers about one equation.
#include "answer.h"
#include "commands.h"
#include "function.h"
#include "options.h"
#include "table_rows.h"
#include "text.h"

namespace booleq {

namespace {

typedef std::vector<std::string> Notes;

constexpr unsigned int kMaxShownInitInputs = 10; // 256 hexadecimal and 1024 binary digits

std::string InputName(const Kq_BoolEquation& equation, size_t index)
{
    return Visible(ToStd(equation.GetVariables()[index].first));
}

std::string Kind(const Kq_BoolEquation& equation, const Reading& reading)
{
    if (!IsInitValue(equation))
        return "expression";
    std::string kind = equation.IsHexInitValue() ? "hexadecimal" : "binary";
    kind += " init value";
    if (reading.lsbFirst)
        kind += ", its first input is bit 0 of the row number (--lsb-first)";
    if (reading.reverse)
        kind += ", inputs taken from the last to the first (--reverse)";
    return kind;
}

void PutRenderings(const Kq_BoolEquation& equation, const Reading& reading, Output& output)
{
    PutField(output, "equation", Visible(ToStd(equation.GetEquation(true))));
    PutField(output, "read as", Kind(equation, reading));
    PutField(output, "syntax 1", Visible(ToStd(equation.GetEquationAlt1(true))));
    PutField(output, "syntax 2", Visible(ToStd(equation.GetEquationAlt2(true))));
    PutField(output, "syntax 3", Visible(ToStd(equation.GetEquationAlt3(true))));
}

void PutInputs(const Kq_BoolEquation& equation, Output& output)
{
    const unsigned int numInputs = equation.GetNumVariables();
    if (numInputs == 0) {
        PutField(output, "inputs", "none");
        return;
    }
    PutField(output, "inputs",
             std::to_string(numInputs) + ": " + Visible(Join(InputNames(equation), ", ")));
    const std::string rows = "row k is bit k of the init value";
    if (numInputs == 1)
        PutField(output, "bit order", "one input only; " + rows);
    else
        PutField(output, "bit order",
                 InputName(equation, 0) + " is the most significant input, " +
                     InputName(equation, numInputs - 1) + " the least; " + rows);
}

// An equation without a table has no init value either, for the same reason.
void PutMissingTable(const Kq_BoolEquation& equation, Output& output)
{
    const unsigned int numInputs = equation.GetNumVariables();
    std::string reason;
    if (numInputs == 0) {
        PutField(output, "value", std::to_string(equation.Eval()));
        reason = "none: there are no inputs";
    } else {
        reason = "none: " + std::to_string(numInputs) + " inputs, more than " +
                 std::to_string(kMaxFunctionInputs);
    }
    PutField(output, "init value", reason);
    PutField(output, "term equation",
             numInputs == 0 ? "none" : Visible(ToStd(equation.GetInitValueTermEquation())));
    PutField(output, "truth table", reason);
}

// Straight from the library's text: with 30 inputs it is 256 MB or 1 GB.
void PutDigits(Output& output, const std::string& label, const Port::StringBase<char>& digits)
{
    PutLabel(output, label);
    output.Put(digits.c_str(), digits.length());
    output.Put("\n");
}

void PutInitValues(const Kq_BoolEquation& equation, bool whole, Output& output)
{
    const unsigned int numInputs = equation.GetNumVariables();
    if (numInputs <= kMaxShownInitInputs || whole) {
        PutDigits(output, "init value hex", equation.GetEquationAsHexInitValue(false));
        PutDigits(output, "init value bin", equation.GetEquationAsBinaryInitValue());
    } else {
        const uint64_t numRows = uint64_t(1) << numInputs; // at most 30 inputs here
        PutField(output, "init value",
                 std::to_string(numRows / 4) + " hexadecimal or " + std::to_string(numRows) +
                     " binary digits; --whole prints them");
    }
    PutField(output, "term equation", Visible(ToStd(equation.GetInitValueTermEquation())));
}

// The value of the highest row, where every input is 1. Changes the inputs' values.
unsigned int HighestRow(Kq_BoolEquation& equation)
{
    for (const auto& variable : equation.GetVariables())
        equation.SetVariable(variable.first, 1);
    return equation.Eval();
}

// Notes what a given init value leaves open, and where the printed one counts differently.
void NoteInitValue(Kq_BoolEquation& equation, const Reading& reading, Notes& notes)
{
    if (equation.GetNumVariables() == 0) {
        notes.push_back("an init value over no inputs is an empty group, which is 0");
        return;
    }
    const uint64_t numGiven = WidthOfInit(ToStd(equation.GetEquation(false))).numRows;
    const unsigned int numInputs = equation.GetNumVariables();
    if (numInputs <= kMaxFunctionInputs && numGiven < uint64_t(1) << numInputs)
        notes.push_back("the value given has " + std::to_string(numGiven) +
                        " rows, the table more: the others read as " +
                        std::to_string(HighestRow(equation)));
    if (reading.lsbFirst && numInputs > 1)
        notes.push_back("the output has the first input most significant; that init value "
                        "reads back without --lsb-first");
}

// Renderings add no parentheses, so some trees cannot be read back from them.
bool ReadsBack(const Kq_BoolEquation& equation, const Reading& reading)
{
    Kq_BoolEquation again;
    return SetFromText(again, ToStd(equation.GetEquationAlt1(true)), reading) && again == equation;
}

void NoteExpression(const Kq_BoolEquation& equation, const Reading& reading, Notes& notes)
{
    if (reading.lsbFirst || reading.reverse)
        notes.push_back(
            "--lsb-first and --reverse say how an init value is read; this is an expression");
    const size_t numListed = reading.hasInputs ? CheckInputs(reading.inputs).usable.size() : 0;
    if (reading.hasInputs && equation.GetNumVariables() > numListed) {
        const std::vector<std::string> names = InputNames(equation);
        const std::vector<std::string> others(names.begin() + static_cast<long>(numListed),
                                              names.end());
        notes.push_back("not in --inputs, so they follow: " + Visible(Join(others, ", ")));
    }
    if (!ReadsBack(equation, reading))
        notes.push_back("the texts above do not read back as this equation; keep the original");
}

void NoteNames(const Kq_BoolEquation& equation, bool hasTable, Notes& notes)
{
    const std::string names = ToStd(equation.GetInitValueTermEquation());
    if (Visible(names) != names)
        notes.push_back("bytes that are not printable ASCII are shown as \\xNN");
    if (hasTable && HasNumberedColumn(InputNames(equation)))
        notes.push_back("column #k of the table is the k-th input");
}

Notes NotesFor(Kq_BoolEquation& equation, const Reading& reading, bool hasTable)
{
    Notes notes;
    if (IsInitValue(equation))
        NoteInitValue(equation, reading, notes);
    else
        NoteExpression(equation, reading, notes);
    if (equation.GetNumVariables() == 1)
        notes.push_back("over one input the library reads the binary init value only");
    NoteNames(equation, hasTable, notes);
    return notes;
}

void ShowEquation(Kq_BoolEquation& equation, const Request& request, uint64_t maxRows,
                  Output& output)
{
    PutRenderings(equation, request.reading, output);
    PutInputs(equation, output);
    const unsigned int numInputs = equation.GetNumVariables();
    const bool hasTable = numInputs >= 1 && numInputs <= kMaxFunctionInputs;
    if (hasTable) {
        PutInitValues(equation, request.Has("--whole"), output);
        PutField(output, "truth table", std::to_string(uint64_t(1) << numInputs) + " rows");
    } else {
        PutMissingTable(equation, output);
    }
    for (const std::string& note : NotesFor(equation, request.reading, hasTable))
        PutField(output, "note", note);
    if (hasTable)
        PrintTable(equation, maxRows, output);
}

// Init values are null where the text answer omits them.
Json ShowAsJson(Kq_BoolEquation& equation, const Request& request)
{
    const unsigned int numInputs = equation.GetNumVariables();
    const bool hasTable = numInputs >= 1 && numInputs <= kMaxFunctionInputs;
    Json json;
    json["equation"] = ToStd(equation.GetEquation(true));
    json["kind"] = !IsInitValue(equation)      ? "expression"
                   : equation.IsHexInitValue() ? "hexadecimal init value"
                                               : "binary init value";
    json["syntax1"] = ToStd(equation.GetEquationAlt1(true));
    json["syntax2"] = ToStd(equation.GetEquationAlt2(true));
    json["syntax3"] = ToStd(equation.GetEquationAlt3(true));
    json["inputs"] = Json::array();
    for (const auto& variable : equation.GetVariables())
        json["inputs"].push_back(ToStd(variable.first));
    json["rows"] = hasTable ? uint64_t(1) << numInputs : 0;
    json["hex"] = nullptr;
    json["binary"] = nullptr;
    if (hasTable && (numInputs <= kMaxShownInitInputs || request.Has("--whole"))) {
        json["hex"] = ToStd(equation.GetEquationAsHexInitValue(false));
        json["binary"] = ToStd(equation.GetEquationAsBinaryInitValue());
    }
    if (numInputs == 0)
        json["value"] = equation.Eval();
    json["notes"] = NotesFor(equation, request.reading, hasTable);
    return json;
}

int RunShow(const Request& request, Output& output)
{
    const uint64_t maxRows = request.Has("--rows") ? ParseRows(request.Get("--rows")) : 64;
    return ForEachText(request, output, [&](const Text& text) {
        Kq_BoolEquation equation;
        if (!SetEquation(text, request, output, equation))
            return kRefused;
        return Say(text, request, output,
                   {kDone, "done", LineMark::Block, [&] { return ShowAsJson(equation, request); },
                    [&] { ShowEquation(equation, request, maxRows, output); }});
    });
}

} // namespace

Command ShowCommand()
{
    return {
        "show",
        "EQUATION",
        1,
        1,
        "Show renderings, inputs, init values and truth table",
        "Prints everything the library answers about one equation or init value. When several\n"
        "lines are read, each answer begins with its line number and ends with an empty line.\n",
        {{"--rows", "N|all", "Truth-table rows to print (64)"},
         {"--whole", nullptr, "Print init values whole, also over 10 inputs"}},
        {"booleq 'A & ~B'", "booleq --inputs A,B,D 'A & B'", "booleq --inputs A,B 0x8",
         "booleq - < equations.txt"},
        RunShow};
}

} // namespace booleq
