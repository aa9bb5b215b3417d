#include "batch.h"

#include <cassert>
#include <utility>

#include "function.h"
#include "init_literal.h"
#include "listed_inputs.h"
#include "notation_writer.h"
#include "refusal.h"
#include "short_form.h"
#include "text.h"

namespace booleq {

namespace {

// Above, the library's expression of an init value is too long to be of use: 10,000 characters.
constexpr size_t kMaxWrittenInputs = 10;
constexpr size_t kMaxShortInputs = 6; // a short form of more takes too long for a table

BatchResult Fail(BatchOutcome outcome, std::string message)
{
    return {outcome, std::move(message)};
}

BatchResult RefuseText(const char* what, const std::string& text, const Reading& reading)
{
    const RefusalReport report = ExplainRefusal(text, reading);
    std::string message =
        std::string(what) + " refused at " + PlaceName(text, report.offset) + ": " + report.reason;
    if (!report.hint.empty())
        message += "; " + report.hint;
    return Fail(BatchOutcome::kTextRefused, std::move(message));
}

std::string RowText(const Function& function, uint64_t row)
{
    std::vector<bool> values;
    for (size_t index = 0; index < function.NumInputs(); ++index)
        values.push_back(function.InputAt(row, index));
    return ValuesByName(function.Inputs(), values);
}

std::string InitFor(const Function& function)
{
    return function.NumInputs() == 1 ? function.Binary() : function.Hex();
}

// Sets equation and function from the row's equation over its inputs.
BatchResult ReadEquation(const BatchRow& row, const Reading& reading, Function& function)
{
    Kq_BoolEquation equation;
    if (row.equation.find('\0') != std::string::npos ||
        !SetFromText(equation, row.equation, reading))
        return RefuseText("the equation is", row.equation, reading);
    if (reading.hasInputs && equation.GetNumVariables() > reading.inputs.size()) {
        const auto& name = equation.GetVariables()[reading.inputs.size()].first;
        return Fail(BatchOutcome::kDiffers,
                    "the equation has " + Excerpt(ToStd(name)) + ", which is not among the inputs");
    }
    if (!FunctionOf(equation, function))
        return Fail(BatchOutcome::kTextRefused, NoFunctionReason(equation.GetNumVariables()));
    return {};
}

// Sets equation and function from the row's init value over the inputs of 'reading'.
BatchResult ReadInit(const BatchRow& row, const Reading& reading, Kq_BoolEquation& equation)
{
    if (row.init.find('\0') != std::string::npos ||
        WidthOfInit(LibraryText(row.init, reading)).numRows == 0 ||
        !SetFromText(equation, row.init, reading))
        return RefuseText("the init value is", row.init, reading);
    // Read over a name like 'a'+b, an init value has the inputs that its expression has.
    if (equation.GetNumVariables() > reading.inputs.size()) {
        const auto& name = equation.GetVariables()[reading.inputs.size()].first;
        return Fail(BatchOutcome::kDiffers, "the init value has " + Excerpt(ToStd(name)) +
                                                ", which is not among the inputs");
    }
    return {};
}

// A text in the column of init values that is an expression for the library.
BatchResult RefuseNoInit(const std::string& text)
{
    std::string message = "the init value begins neither with 0x or 0b nor with a size";
    const bool isHex =
        !text.empty() && text.find_first_not_of("0123456789abcdefABCDEF") == std::string::npos;
    message += isHex ? "; write 0x" + Excerpt(text) : "; write 0xca or 8'hca";
    return Fail(BatchOutcome::kTextRefused, std::move(message));
}

bool BeginsLikeInit(const std::string& text)
{
    return WidthOfInit(text).numRows > 0 || IsSizedLiteral(text);
}

// Compares the row's init value with the equation's function.
BatchResult CompareInit(const BatchRow& row, const Function& function)
{
    if (!BeginsLikeInit(row.init))
        return RefuseNoInit(row.init);
    Reading reading;
    reading.hasInputs = true;
    reading.inputs = function.Inputs();
    Kq_BoolEquation equation;
    BatchResult result = ReadInit(row, reading, equation);
    Function given;
    if (result.outcome != BatchOutcome::kOk || !FunctionOf(equation, given))
        return result;
    assert(given.Inputs() == function.Inputs());
    const uint64_t different = function.FirstDifference(given);
    if (different == Function::kNoRow)
        return {};
    std::string message = "the equation is " + std::string(function.At(different) ? "1" : "0") +
                          " at row " + std::to_string(different) + " (" +
                          RowText(function, different) + "), the init value " +
                          (given.At(different) ? "1" : "0");
    if (function.NumInputs() <= kMaxWrittenInputs)
        message += "; the equation's is " + InitFor(function);
    return Fail(BatchOutcome::kDiffers, std::move(message));
}

// The short form up to six inputs, otherwise the one that the library reads the init value as.
std::string ShortText(const Kq_BoolEquation& equation)
{
    Function function;
    ShortForm shortForm;
    if (equation.GetNumVariables() <= kMaxShortInputs && FunctionOf(equation, function))
        shortForm = FindShortForm(function);
    return shortForm.isFound ? WriteOwn(shortForm.expression, OwnSyntax::First, Parentheses::Clear)
                             : ToStd(equation.GetEquationAsExpression(true));
}

// The equation of a row that has an init value and inputs only.
BatchResult WriteEquation(BatchRow& row, const Reading& reading)
{
    if (!BeginsLikeInit(row.init))
        return RefuseNoInit(row.init);
    if (reading.inputs.size() > kMaxWrittenInputs)
        return Fail(BatchOutcome::kIncomplete, "no equation is written over more than " +
                                                   std::to_string(kMaxWrittenInputs) + " inputs");
    Kq_BoolEquation equation;
    BatchResult result = ReadInit(row, reading, equation);
    if (result.outcome != BatchOutcome::kOk)
        return result;
    row.equation = ShortText(equation);
    return {BatchOutcome::kFilled, std::string()};
}

BatchResult CheckNames(const std::vector<std::string>& inputs)
{
    const InputCheck check = CheckInputs(inputs);
    if (!check.illegal.empty())
        return Fail(BatchOutcome::kTextRefused,
                    "'" + Excerpt(check.illegal.front()) + "' is not a name of an input");
    if (!check.repeated.empty())
        return Fail(BatchOutcome::kTextRefused,
                    Excerpt(check.repeated.front()) + " stands twice among the inputs");
    return {};
}

} // namespace

const char* OutcomeName(BatchOutcome outcome)
{
    switch (outcome) {
    case BatchOutcome::kOk:
        return "ok";
    case BatchOutcome::kFilled:
        return "filled";
    case BatchOutcome::kDiffers:
        return "differs";
    case BatchOutcome::kIncomplete:
        return "incomplete";
    case BatchOutcome::kTextRefused:
        return "refused";
    }
    return "";
}

BatchResult CompleteRow(BatchRow& row)
{
    Reading reading;
    reading.hasInputs = !row.inputs.empty();
    reading.inputs = row.inputs;
    BatchResult result = CheckNames(row.inputs);
    if (result.outcome != BatchOutcome::kOk)
        return result;
    if (IsBlank(row.equation)) {
        if (IsBlank(row.init))
            return Fail(BatchOutcome::kIncomplete,
                        "there is neither an equation nor an init value");
        if (row.inputs.empty())
            return Fail(BatchOutcome::kIncomplete,
                        "an init value without an equation needs its inputs");
        return WriteEquation(row, reading);
    }
    Function function;
    result = ReadEquation(row, reading, function);
    if (result.outcome != BatchOutcome::kOk)
        return result;
    if (function.NumInputs() == 0)
        return Fail(BatchOutcome::kIncomplete,
                    "the equation has no inputs, so no init value: it is "
                    "always " +
                        std::string(function.At(0) ? "1" : "0"));
    const bool hasInit = !IsBlank(row.init);
    if (hasInit)
        result = CompareInit(row, function);
    if (result.outcome != BatchOutcome::kOk)
        return result;
    if (!hasInit || row.inputs.empty())
        result.outcome = BatchOutcome::kFilled;
    if (!hasInit)
        row.init = InitFor(function);
    row.inputs = function.Inputs();
    return result;
}

} // namespace booleq
