#include "function.h"

#include <algorithm>
#include <cassert>
#include <utility>

#include "text.h"
#include "watch.h"

namespace booleq {

namespace {

std::string Digits(const Rows& rows, const char* prefix, unsigned int bitsPerDigit)
{
    static constexpr char kDigits[] = "0123456789abcdef";
    const size_t numRows = size_t(1) << rows.NumInputs();
    const size_t rowsPerDigit = std::min<size_t>(bitsPerDigit, numRows);
    std::string text = prefix;
    text.reserve(text.size() + numRows / rowsPerDigit);
    for (size_t row = numRows; row > 0;) {
        row -= rowsPerDigit;
        const uint64_t bits = rows.Words()[row / 64] >> (row % 64);
        text += kDigits[bits & ((1u << rowsPerDigit) - 1)];
    }
    return text;
}

} // namespace

Function::Function(std::vector<std::string> inputs, Rows rows)
    : m_inputs(std::move(inputs)), m_rows(std::move(rows))
{
    assert(m_inputs.size() == m_rows.NumInputs());
}

std::string Function::Hex() const
{
    return Digits(m_rows, "0x", 4);
}

std::string Function::Binary() const
{
    return Digits(m_rows, "0b", 1);
}

std::string InitOf(const Rows& rows)
{
    return rows.NumInputs() == 1 ? Digits(rows, "0b", 1) : Digits(rows, "0x", 4);
}

Function Function::Over(const std::vector<std::string>& inputs) const
{
    std::vector<std::string> present = m_inputs;
    Rows rows = m_rows;
    for (const std::string& input : inputs) {
        if (std::find(present.begin(), present.end(), input) != present.end())
            continue;
        rows = Widen(rows);
        present.insert(present.begin(), input);
    }
    assert(present.size() == inputs.size());
    std::vector<unsigned int> order;
    for (const std::string& input : inputs) {
        const auto found = std::find(present.begin(), present.end(), input);
        order.push_back(static_cast<unsigned int>(found - present.begin()));
    }
    return {inputs, PermuteInputs(std::move(rows), order)};
}

uint64_t Function::FirstDifference(const Function& other) const
{
    return booleq::FirstDifference(m_rows, other.m_rows);
}

bool Function::operator==(const Function& other) const
{
    return m_inputs == other.m_inputs && m_rows == other.m_rows;
}

bool RowsOf(const Kq_BoolEquation& equation, Rows& rows)
{
    std::vector<uint64_t> words;
    if (!equation.GetColumn(words, WatchAndGoOn, nullptr))
        return false;
    rows = Rows(equation.GetNumVariables(), std::move(words));
    return true;
}

std::vector<std::string> InputNames(const Kq_BoolEquation& equation)
{
    std::vector<std::string> names;
    for (const auto& variable : equation.GetVariables())
        names.push_back(ToStd(variable.first));
    return names;
}

bool FunctionOf(const Kq_BoolEquation& equation, Function& function)
{
    Rows rows;
    if (!RowsOf(equation, rows))
        return false;
    function = Function(InputNames(equation), std::move(rows));
    return true;
}

std::string NoFunctionReason(size_t numInputs)
{
    return Count(numInputs, "input") + ": at most " + std::to_string(kMaxFunctionInputs) +
           " have a truth table";
}

} // namespace booleq
