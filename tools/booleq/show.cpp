#include "show.h"

#include "refusal.h"
#include "table.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kLabelWidth = 16;
constexpr unsigned int kMaxShownInitInputs = 10; // 256 hexadecimal and 1024 binary digits

void PutField(Output& output, const std::string& label, const std::string& value)
{
    output.Put(label + std::string(kLabelWidth - label.size(), ' ') + value + "\n");
}

bool IsInitValue(const Kq_BoolEquation& equation)
{
    return equation.IsHexInitValue() || equation.IsBinaryInitValue();
}

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
    std::string names = std::to_string(numInputs) + ": " + InputName(equation, 0);
    for (size_t index = 1; index < numInputs; ++index)
        names += ", " + InputName(equation, index);
    PutField(output, "inputs", names);
    const std::string rows = "row k is bit k of the init value";
    if (numInputs == 1)
        PutField(output, "bit order", "one input only; " + rows);
    else
        PutField(output, "bit order",
                 InputName(equation, 0) + " is the most significant input, " +
                     InputName(equation, numInputs - 1) + " the least; " + rows);
}

// An equation that has no table has no init value either; the reason is the same.
void PutMissingTable(const Kq_BoolEquation& equation, Output& output)
{
    const unsigned int numInputs = equation.GetNumVariables();
    std::string reason;
    if (numInputs == 0) {
        PutField(output, "value", std::to_string(equation.Eval()));
        reason = "none: there are no inputs";
    } else {
        reason = "none: " + std::to_string(numInputs) + " inputs, more than " +
                 std::to_string(kMaxTableInputs);
    }
    PutField(output, "init value", reason);
    PutField(output, "term equation",
             numInputs == 0 ? "none" : Visible(ToStd(equation.GetInitValueTermEquation())));
    PutField(output, "truth table", reason);
}

// Straight from the library's text: with 30 inputs these are 256 MB and 1 GB.
void PutDigits(Output& output, const std::string& label, const Port::StringBase<char>& digits)
{
    output.Put(label + std::string(kLabelWidth - label.size(), ' '));
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

// What a given init value leaves open, and where the printed one counts in another way.
void NoteInitValue(Kq_BoolEquation& equation, const Reading& reading, Output& output)
{
    if (equation.GetNumVariables() == 0) {
        PutField(output, "note", "an init value over no inputs is an empty group, which is 0");
        return;
    }
    const size_t numDigits = equation.GetEquation(false).length() - 2;
    const uint64_t numGiven = uint64_t(numDigits) * (equation.IsHexInitValue() ? 4 : 1);
    const unsigned int numInputs = equation.GetNumVariables();
    if (numInputs <= kMaxTableInputs && numGiven < uint64_t(1) << numInputs)
        PutField(output, "note",
                 "the value given has " + std::to_string(numGiven) +
                     " rows, the table more: the others read as " +
                     std::to_string(HighestRow(equation)));
    if (reading.lsbFirst && numInputs > 1)
        PutField(output, "note",
                 "what is printed takes the first input as the most significant; that init value "
                 "reads back without --lsb-first");
}

// Renderings write no parentheses of their own, so some trees cannot be read back from them.
bool ReadsBack(const Kq_BoolEquation& equation, const Reading& reading)
{
    Kq_BoolEquation again;
    return SetFromText(again, ToStd(equation.GetEquationAlt1(true)), reading) && again == equation;
}

void NoteExpression(const Kq_BoolEquation& equation, const Reading& reading, Output& output)
{
    if (reading.lsbFirst || reading.reverse)
        PutField(output, "note",
                 "--lsb-first and --reverse say how an init value is read; this is an expression");
    const size_t numListed = reading.hasInputs ? CheckInputs(reading.inputs).numUsable : 0;
    if (reading.hasInputs && equation.GetNumVariables() > numListed) {
        std::string names = InputName(equation, numListed);
        for (size_t index = numListed + 1; index < equation.GetNumVariables(); ++index)
            names += ", " + InputName(equation, index);
        PutField(output, "note", "not in --inputs, so behind them: " + names);
    }
    if (!ReadsBack(equation, reading))
        PutField(output, "note",
                 "read again, the texts above do not give this equation: keep the one you have");
}

void NoteNames(const Kq_BoolEquation& equation, bool hasTable, Output& output)
{
    if (!IsPrintable(ToStd(equation.GetInitValueTermEquation())))
        PutField(output, "note", "bytes that are not printable ASCII are shown as \\xNN");
    if (hasTable && HasNumberedColumn(equation))
        PutField(output, "note", "column #k of the table is the k-th input");
}

void ShowEquation(Kq_BoolEquation& equation, const Options& options, Output& output)
{
    const Reading& reading = options.reading;
    PutRenderings(equation, reading, output);
    PutInputs(equation, output);
    const unsigned int numInputs = equation.GetNumVariables();
    const bool hasTable = numInputs >= 1 && numInputs <= kMaxTableInputs;
    if (hasTable) {
        PutInitValues(equation, options.wholeInit, output);
        PutField(output, "truth table", std::to_string(uint64_t(1) << numInputs) + " rows");
    } else {
        PutMissingTable(equation, output);
    }
    if (IsInitValue(equation))
        NoteInitValue(equation, reading, output);
    else
        NoteExpression(equation, reading, output);
    if (numInputs == 1)
        PutField(output, "note", "over one input only the binary init value reads back");
    NoteNames(equation, hasTable, output);
    if (hasTable)
        PrintTable(equation, options.maxRows, output);
}

// Empty when the equation is set, otherwise the text and the reason.
std::string SetOrExplain(Kq_BoolEquation& equation, const std::string& text, const Reading& reading)
{
    // The library takes a NUL byte for the end of the text and would answer for what precedes it.
    const size_t nul = text.find('\0');
    if (nul != std::string::npos)
        return Excerpt(text) + "\n  a NUL byte at character " + std::to_string(nul + 1) +
               "; this is no plain text";
    if (SetFromText(equation, text, reading))
        return std::string();
    if (IsBlank(text))
        return "an empty equation";
    return Excerpt(text) + "\n  " + ExplainRefusal(text, reading);
}

} // namespace

bool ShowText(const std::string& text, size_t lineNumber, const Options& options, Output& output)
{
    Kq_BoolEquation equation;
    const std::string refusal = SetOrExplain(equation, text, options.reading);
    if (!refusal.empty()) {
        const std::string place =
            lineNumber > 0 ? "line " + std::to_string(lineNumber) + ": " : std::string();
        Complain(output, place + "refused: " + refusal);
        return false;
    }
    if (lineNumber > 0)
        PutField(output, "line", std::to_string(lineNumber));
    ShowEquation(equation, options, output);
    if (lineNumber > 0)
        output.Put("\n");
    return true;
}

} // namespace booleq
