#include "table.h"

#include <algorithm>

#include "core/text.h"

namespace booleq {

namespace {

constexpr size_t kMaxHeaderName = 16;

std::vector<std::string> ColumnNames(const Kq_BoolEquation& equation)
{
    std::vector<std::string> names;
    for (const auto& variable : equation.GetVariables()) {
        const std::string name = ToStd(variable.first);
        const bool fits = name.size() <= kMaxHeaderName && IsPrintable(name);
        names.push_back(fits ? name : "#" + std::to_string(names.size() + 1));
    }
    return names;
}

std::string RightAligned(const std::string& text, size_t width)
{
    return std::string(width - std::min(width, text.size()), ' ') + text;
}

// Results by row number, from whichever source costs less for the rows that are wanted.
class Results {
  public:
    Results(Kq_BoolEquation& equation, uint64_t numRows, uint64_t numWanted) : m_equation(equation)
    {
        // The packed column takes about the work of one evaluation for 64 rows.
        if (numWanted >= numRows / 64) {
            m_hex = equation.GetEquationAsHexInitValue(false);
            return;
        }
        for (const auto& variable : equation.GetVariables())
            m_handles.push_back(equation.GetVariableHandle(variable.first));
    }

    unsigned int At(uint64_t row)
    {
        if (m_hex.length() > 0) {
            const char digit = m_hex.c_str()[m_hex.length() - 1 - row / 4];
            const int value = digit <= '9' ? digit - '0' : digit - 'a' + 10;
            return (static_cast<unsigned int>(value) >> (row % 4)) & 1u;
        }
        for (size_t column = 0; column < m_handles.size(); ++column) // shift: below 30
            m_equation.SetVariable(m_handles[column],
                                   (row >> (m_handles.size() - 1 - column)) & 1u);
        return m_equation.Eval();
    }

  private:
    Kq_BoolEquation& m_equation;
    Port::StringBase<char> m_hex; // digit k from the end holds rows 4k to 4k + 3
    std::vector<Kq_BoolEquation::Handle> m_handles;
};

} // namespace

bool HasNumberedColumn(const Kq_BoolEquation& equation)
{
    const std::vector<std::string> names = ColumnNames(equation);
    return std::any_of(names.begin(), names.end(),
                       [](const std::string& name) { return name[0] == '#'; });
}

void PrintTable(Kq_BoolEquation& equation, uint64_t maxRows, Output& output)
{
    const std::vector<std::string> names = ColumnNames(equation);
    const uint64_t numRows = uint64_t(1) << names.size(); // at most 30 names
    const uint64_t numPrinted = std::min(numRows, maxRows);
    if (numPrinted == 0)
        return;
    const size_t rowWidth = std::max<size_t>(3, std::to_string(numPrinted - 1).size());

    std::string header = "\n  " + RightAligned("row", rowWidth) + " ";
    for (const std::string& name : names)
        header += " " + name;
    output.Put(header + " | result\n");

    Results results(equation, numRows, numPrinted);
    std::string line;
    for (uint64_t row = 0; row < numPrinted; ++row) {
        line = "  " + RightAligned(std::to_string(row), rowWidth) + " ";
        for (size_t column = 0; column < names.size(); ++column) {
            line.append(names[column].size(), ' ');
            line += ((row >> (names.size() - 1 - column)) & 1u) ? '1' : '0';
        }
        line += results.At(row) ? " | 1\n" : " | 0\n";
        output.Put(line);
    }
    if (numPrinted < numRows)
        output.Put("  rows not shown: " + std::to_string(numRows - numPrinted) +
                   "; --rows all prints them all\n");
}

} // namespace booleq
