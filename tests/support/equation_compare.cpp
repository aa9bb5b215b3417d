// Comparisons return at the first difference; without one they build no report.
#include "support/equation_compare.h"

#include <algorithm>

namespace support {

namespace {

std::string Differs(const char* what, const std::string& expected, const std::string& actual)
{
    return std::string(what) + " should be \"" + Printable(expected) + "\" but is \"" +
           Printable(actual) + "\"";
}

std::string CompareNumbers(const char* what, unsigned int expected, unsigned int actual)
{
    return expected == actual ? ""
                              : Differs(what, std::to_string(expected), std::to_string(actual));
}

std::string CompareTexts(const char* what, const std::string& expected,
                         const Port::StringBase<char>& actual)
{
    const std::string actualText = ToStd(actual);
    return expected == actualText ? "" : Differs(what, expected, actualText);
}

std::string CompareRenderings(const reference::Equation& model, const Kq_BoolEquationImp& library)
{
    std::string difference;
    for (bool spaces : {false, true}) {
        difference =
            CompareTexts("GetEquation", model.GetEquation(spaces), library.GetEquation(spaces));
        if (difference.empty())
            difference = CompareTexts("GetEquationAlt1", model.GetEquationAlt1(spaces),
                                      library.GetEquationAlt1(spaces));
        if (difference.empty())
            difference = CompareTexts("GetEquationAlt2", model.GetEquationAlt2(spaces),
                                      library.GetEquationAlt2(spaces));
        if (difference.empty())
            difference = CompareTexts("GetEquationAlt3", model.GetEquationAlt3(spaces),
                                      library.GetEquationAlt3(spaces));
        if (difference.empty())
            difference =
                CompareTexts("GetEquationAsExpression", model.GetEquationAsExpression(spaces),
                             library.GetEquationAsExpression(spaces));
        if (!difference.empty())
            return difference;
    }
    return CompareTexts("GetInitValueTermEquation", model.GetInitValueTermEquation(),
                        library.GetInitValueTermEquation());
}

std::string CompareVariables(const reference::Equation& model, const Kq_BoolEquationImp& library)
{
    std::string difference =
        CompareNumbers("GetNumVariables", model.GetNumVariables(), library.GetNumVariables());
    if (!difference.empty())
        return difference;
    for (size_t index = 0; index < model.GetVariables().size(); ++index) {
        const std::string& name = model.GetVariables()[index].first;
        difference = CompareTexts("name", name, library.GetVariables()[index].first);
        if (difference.empty())
            difference = CompareNumbers("value", model.GetVariables()[index].second,
                                        library.GetVariables()[index].second);
        if (!difference.empty())
            return difference;
        const reference::Handle expected = model.GetVariableHandle(name);
        const Kq_BoolEquation::Handle actual = library.GetVariableHandle(ToPort(name));
        if (!std::equal(expected.begin(), expected.end(), actual.begin(), actual.end()))
            return "handle of \"" + Printable(name) + "\" differs";
    }
    return "";
}

std::string CompareTables(const reference::Equation& model, const Kq_BoolEquationImp& library)
{
    const reference::TruthTable expected = model.GetTruthTable();
    const Kq_BoolEquationImp::TruthTable actual = library.GetTruthTable();
    if (expected.GetRows().size() != actual.GetRows().size() || !expected != !actual ||
        expected.GetVariableNames().size() != actual.GetVariableNames().size())
        return "truth table has another size";
    for (size_t column = 0; column < expected.GetVariableNames().size(); ++column) {
        if (expected.GetVariableNames()[column] != ToStd(actual.GetVariableNames()[column]))
            return "truth table has another name in column " + std::to_string(column);
    }
    for (size_t row = 0; row < expected.GetRows().size(); ++row) {
        const reference::Row& expectedRow = expected.GetRows()[row];
        const Kq_BoolEquationImp::TruthTable::Row& actualRow = actual.GetRows()[row];
        if (expectedRow.GetResultValue() != actualRow.GetResultValue() ||
            expectedRow.GetVariableValues() != actualRow.GetVariableValues())
            return "truth table differs in row " + std::to_string(row);
    }
    return "";
}

} // namespace

std::string CompareState(const reference::Equation& model, const Kq_BoolEquationImp& library)
{
    std::string difference = CompareNumbers("operator!", !model, !library);
    if (difference.empty())
        difference =
            CompareNumbers("pointer test", !!model, static_cast<Kq_PtrTester*>(library) != nullptr);
    if (difference.empty())
        difference = CompareNumbers("IsExpression", model.IsExpression(), library.IsExpression());
    if (difference.empty())
        difference =
            CompareNumbers("IsHexInitValue", model.IsHexInitValue(), library.IsHexInitValue());
    if (difference.empty())
        difference = CompareNumbers("IsBinaryInitValue", model.IsBinaryInitValue(),
                                    library.IsBinaryInitValue());
    if (difference.empty())
        difference = CompareTrees(reference::Flatten(model.GetStore()), Flatten(library.GetRoot()));
    if (difference.empty())
        difference = CompareRenderings(model, library);
    if (difference.empty())
        difference = CompareVariables(model, library);
    return difference;
}

std::string CompareResults(reference::Equation& model, Kq_BoolEquationImp& library)
{
    const unsigned int numVariables = model.GetNumVariables();
    if (numVariables > kMaxTabulated)
        return CompareNumbers("Eval", model.Eval(), library.Eval());
    for (unsigned int row = 0; row < (1u << numVariables); ++row) {
        for (unsigned int index = 0; index < numVariables; ++index) {
            const std::string name = model.GetVariables()[index].first;
            model.SetVariable(name, row >> index & 1);
            library.SetVariable(library.GetVariables()[index].first, row >> index & 1);
        }
        const std::string difference = CompareNumbers("Eval", model.Eval(), library.Eval());
        if (!difference.empty())
            return difference;
    }
    std::string difference;
    for (bool upperCase : {false, true}) {
        if (difference.empty())
            difference = CompareTexts("hex init value", model.GetEquationAsHexInitValue(upperCase),
                                      library.GetEquationAsHexInitValue(upperCase));
    }
    if (difference.empty())
        difference = CompareTexts("binary init value", model.GetEquationAsBinaryInitValue(),
                                  library.GetEquationAsBinaryInitValue());
    if (difference.empty())
        difference = CompareTables(model, library);
    return difference;
}

std::string CompareAndForgetMessages(Capture& capture)
{
    std::string difference = CompareMessages(reference::Log(), capture.messages);
    reference::Log().clear();
    capture.messages.clear();
    return difference;
}

std::string CompareSet(const std::string& text, reference::Equation& model,
                       Kq_BoolEquationImp& library, Capture& capture)
{
    reference::Log().clear();
    capture.messages.clear();
    const bool expected = model.SetEquation(text);
    std::string difference =
        CompareNumbers("SetEquation", expected, library.SetEquation(ToPort(text)));
    if (difference.empty())
        difference = CompareAndForgetMessages(capture);
    if (difference.empty())
        difference = CompareState(model, library);
    if (difference.empty() && expected)
        difference = CompareResults(model, library);
    if (difference.empty())
        difference = CompareAndForgetMessages(capture);
    return difference;
}

} // namespace support
