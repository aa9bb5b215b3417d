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

// With more inputs the library's expression of an init value is too long to be useful: 10,000
// characters.
constexpr size_t kMaxWrittenInputs = 10;
constexpr size_t kMaxShortInputs = 6; // a short form of more takes too long for a table

typedef RowCompleter::Listed Listed;

bool Set(Kq_BoolEquation& equation, const std::string& text, const Listed& listed)
{
    return listed.reading.hasInputs ? SetOverTerms(equation, text, listed.reading, listed.terms)
                                    : SetFromText(equation, text, listed.reading);
}

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

// The first variable that is not listed; null if all are. Listed variables come first.
const Port::StringBase<char>* Unlisted(const Kq_BoolEquation& equation, const Reading& reading)
{
    const size_t numListed = reading.inputs.size();
    return equation.GetNumVariables() > numListed ? &equation.GetVariables()[numListed].first
                                                  : nullptr;
}

// Sets 'equation' and 'rows' from the row's equation over its inputs.
BatchResult ReadEquation(const BatchRow& row, const Listed& listed, Kq_BoolEquation& equation,
                         Rows& rows)
{
    if (row.equation.find('\0') != std::string::npos || !Set(equation, row.equation, listed))
        return RefuseText("the equation is", row.equation, listed.reading);
    if (listed.reading.hasInputs)
        if (const auto* const name = Unlisted(equation, listed.reading))
            return Fail(BatchOutcome::kDiffers, "the equation has " + Excerpt(ToStd(*name)) +
                                                    ", which is not among the inputs");
    if (!RowsOf(equation, rows))
        return Fail(BatchOutcome::kTextRefused, NoFunctionReason(equation.GetNumVariables()));
    return {};
}

// Sets 'equation' from the row's init value over the listed inputs.
BatchResult ReadInit(const BatchRow& row, const Listed& listed, Kq_BoolEquation& equation)
{
    if (row.init.find('\0') != std::string::npos ||
        WidthOfInit(LibraryText(row.init, listed.reading)).numRows == 0 ||
        !Set(equation, row.init, listed))
        return RefuseText("the init value is", row.init, listed.reading);
    // Over a name like 'a'+b, an init value has the inputs of the expression that it stands for.
    if (const auto* const name = Unlisted(equation, listed.reading))
        return Fail(BatchOutcome::kDiffers, "the init value has " + Excerpt(ToStd(*name)) +
                                                ", which is not among the inputs");
    return {};
}

// Refuses a text in the column of init values that the library would read as an expression.
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

// Compares the row's init value with the rows of its equation, over the same inputs.
BatchResult CompareInit(const BatchRow& row, const Listed& listed, const Rows& rows)
{
    if (listed.splitName.empty() && row.init == InitOf(rows))
        return {}; // it reads back, so there is nothing to read
    if (!BeginsLikeInit(row.init))
        return RefuseNoInit(row.init);
    Kq_BoolEquation equation;
    BatchResult result = ReadInit(row, listed, equation);
    Rows given;
    if (result.outcome != BatchOutcome::kOk || !RowsOf(equation, given))
        return result;
    assert(given.NumInputs() == rows.NumInputs());
    const uint64_t different = FirstDifference(rows, given);
    if (different == Rows::kNoRow)
        return {};
    const Function function(listed.reading.inputs, rows);
    std::string message = "the equation is " + std::string(rows.At(different) ? "1" : "0") +
                          " at row " + std::to_string(different) + " (" +
                          RowText(function, different) + "), the init value " +
                          (given.At(different) ? "1" : "0");
    if (rows.NumInputs() <= kMaxWrittenInputs)
        message += "; the equation's is " + InitOf(rows);
    return Fail(BatchOutcome::kDiffers, std::move(message));
}

// The short form up to six inputs; otherwise the expression that the library reads the init value
// as.
std::string ShortText(const Kq_BoolEquation& equation)
{
    Function function;
    ShortForm shortForm;
    if (equation.GetNumVariables() <= kMaxShortInputs && FunctionOf(equation, function))
        shortForm = FindShortForm(function);
    return shortForm.isFound ? WriteOwn(shortForm.expression, OwnSyntax::First, Parentheses::Clear)
                             : ToStd(equation.GetEquationAsExpression(true));
}

// Writes the equation of a row that has only an init value and inputs.
BatchResult WriteEquation(BatchRow& row, const Listed& listed)
{
    if (!BeginsLikeInit(row.init))
        return RefuseNoInit(row.init);
    if (listed.reading.inputs.size() > kMaxWrittenInputs)
        return Fail(BatchOutcome::kIncomplete, "no equation is written over more than " +
                                                   std::to_string(kMaxWrittenInputs) + " inputs");
    Kq_BoolEquation equation;
    BatchResult result = ReadInit(row, listed, equation);
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
                    Excerpt(check.repeated.front()) + " is listed twice among the inputs");
    return {};
}

Listed ListedOf(const std::vector<std::string>& inputs)
{
    Listed listed;
    listed.reading.inputs = inputs;
    listed.reading.hasInputs = !inputs.empty();
    listed.terms = TermsOf(listed.reading);
    listed.fault = CheckNames(inputs);
    if (listed.fault.outcome == BatchOutcome::kOk)
        listed.splitName = FirstSplitName(inputs);
    return listed;
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

BatchResult RowCompleter::Complete(BatchRow& row)
{
    const Listed& listed = m_listed.Get(row.inputs, ListedOf);
    if (listed.fault.outcome != BatchOutcome::kOk)
        return listed.fault;
    if (IsBlank(row.equation)) {
        if (IsBlank(row.init))
            return Fail(BatchOutcome::kIncomplete,
                        "neither an equation nor an init value is given");
        if (row.inputs.empty())
            return Fail(BatchOutcome::kIncomplete, "an init value needs its inputs");
        return WriteEquation(row, listed);
    }
    Kq_BoolEquation equation;
    Rows rows;
    BatchResult result = ReadEquation(row, listed, equation, rows);
    if (result.outcome != BatchOutcome::kOk)
        return result;
    if (rows.NumInputs() == 0)
        return Fail(BatchOutcome::kIncomplete,
                    "the equation has no inputs, so no init value: it is "
                    "always " +
                        std::string(rows.At(0) ? "1" : "0"));
    const bool hasInit = !IsBlank(row.init);
    if (!hasInit && !listed.splitName.empty())
        return Fail(BatchOutcome::kIncomplete, SplitNameReason(listed.splitName));
    if (hasInit && listed.reading.hasInputs) {
        result = CompareInit(row, listed, rows);
    } else if (hasInit) {
        result = CompareInit(row, m_listed.Get(InputNames(equation), ListedOf), rows);
    }
    if (result.outcome != BatchOutcome::kOk)
        return result;
    if (!hasInit || row.inputs.empty())
        result.outcome = BatchOutcome::kFilled;
    if (row.inputs.empty())
        row.inputs = InputNames(equation);
    assert(row.inputs.size() == rows.NumInputs());
    if (!hasInit)
        row.init = InitOf(rows);
    return result;
}

} // namespace booleq
