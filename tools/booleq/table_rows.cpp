#include "table_rows.h"

#include <algorithm>

#include "function.h"
#include "progress.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kMaxHeaderName = 16;

std::string RightAligned(const std::string& text, size_t width)
{
    return std::string(width - std::min(width, text.size()), ' ') + text;
}

std::string ShownName(const std::vector<std::string>& names, size_t index)
{
    const std::string& name = names[index];
    const bool fits = Width(name) <= kMaxHeaderName && Visible(name) == name;
    return fits ? name : "#" + std::to_string(index + 1);
}

// In Markdown a bar would end the cell.
std::string MarkdownCell(const std::string& name)
{
    std::string cell;
    for (const char character : Visible(name))
        cell += character == '|' ? std::string("\\|") : std::string(1, character);
    return cell;
}

// A row of the format: fixed text around one digit for each input and one for the result.
struct RowShape {
    std::string header;
    std::string row;            // every digit a '0'
    std::vector<size_t> digits; // places of the digits of the inputs, then of the result
    size_t numberWidth = 0;     // of the row number, right-aligned in front of the row
};

RowShape ShapeOf(const std::vector<std::string>& names, uint64_t numPrinted, RowFormat format)
{
    RowShape shape;
    const auto addDigit = [&shape] {
        shape.digits.push_back(shape.row.size());
        shape.row += '0';
    };
    const auto addDigits = [&](const char* between) {
        for (size_t index = 0; index <= names.size(); ++index) {
            shape.row += index == 0 ? "" : between;
            addDigit();
        }
    };
    switch (format) {
    case RowFormat::kText:
        shape.numberWidth = std::max<size_t>(3, std::to_string(numPrinted - 1).size());
        shape.header = "  " + RightAligned("row", shape.numberWidth) + " ";
        shape.row = " ";
        for (size_t index = 0; index < names.size(); ++index) {
            const std::string name = ShownName(names, index);
            shape.header += " " + name;
            shape.row.append(Width(name), ' ');
            addDigit();
        }
        shape.header += " | result\n";
        shape.row += " | ";
        addDigit();
        shape.row += "\n";
        break;
    case RowFormat::kMarkdown:
        for (const std::string& name : names)
            shape.header += "| " + MarkdownCell(name) + " ";
        shape.header += "| result |\n";
        for (size_t index = 0; index <= names.size(); ++index)
            shape.header += "|---";
        shape.header += "|\n";
        shape.row = "| ";
        addDigits(" | ");
        shape.row += " |\n";
        break;
    case RowFormat::kCsv:
        for (const std::string& name : names)
            shape.header += CsvField(name) + ",";
        shape.header += "result\n";
        addDigits(",");
        shape.row += "\n";
        break;
    case RowFormat::kJson:
        shape.row = "[";
        addDigits(",");
        shape.row += "]";
        break;
    }
    return shape;
}

uint64_t NumPrinted(const std::vector<std::string>& names, uint64_t maxRows)
{
    return std::min(uint64_t(1) << names.size(), maxRows);
}

} // namespace

bool HasNumberedColumn(const std::vector<std::string>& names)
{
    for (size_t index = 0; index < names.size(); ++index)
        if (ShownName(names, index)[0] == '#')
            return true;
    return false;
}

uint64_t EstimateBytes(const std::vector<std::string>& names, uint64_t maxRows, RowFormat format)
{
    const uint64_t numPrinted = NumPrinted(names, maxRows);
    const RowShape shape = ShapeOf(names, numPrinted, format);
    const size_t numberBytes = shape.numberWidth > 0 ? shape.numberWidth + 2 : 0;
    return shape.header.size() + numPrinted * (shape.row.size() + numberBytes);
}

void PrintRows(const std::vector<std::string>& names, uint64_t maxRows, RowFormat format,
               const std::function<bool(uint64_t)>& valueAt, Output& output)
{
    const uint64_t numPrinted = NumPrinted(names, maxRows);
    if (numPrinted == 0)
        return;
    RowShape shape = ShapeOf(names, numPrinted, format);
    output.Put(shape.header);
    Progress progress("rows", numPrinted);
    for (uint64_t row = 0; row < numPrinted; ++row) {
        for (size_t index = 0; index < names.size(); ++index)
            shape.row[shape.digits[index]] = (row >> (names.size() - 1 - index) & 1u) ? '1' : '0';
        shape.row[shape.digits.back()] = valueAt(row) ? '1' : '0';
        if (shape.numberWidth > 0)
            output.Put("  " + RightAligned(std::to_string(row), shape.numberWidth));
        if (format == RowFormat::kJson && row > 0)
            output.Put(",", 1);
        output.Put(shape.row);
        progress.Show(row);
    }
    const uint64_t numRows = uint64_t(1) << names.size();
    if (format == RowFormat::kText && numPrinted < numRows)
        output.Put("  rows not shown: " + std::to_string(numRows - numPrinted) +
                   "; --rows all prints them all\n");
}

void PrintTable(Kq_BoolEquation& equation, uint64_t maxRows, Output& output)
{
    const std::vector<std::string> names = InputNames(equation);
    const uint64_t numPrinted = NumPrinted(names, maxRows);
    if (numPrinted == 0)
        return;
    output.Put("\n");
    // Filling the packed column costs about as much as one evaluation per 64 rows.
    Rows rows;
    if (numPrinted >= (uint64_t(1) << names.size()) / 64 && RowsOf(equation, rows)) {
        const auto valueAt = [&rows](uint64_t row) { return rows.At(row); };
        PrintRows(names, maxRows, RowFormat::kText, valueAt, output);
        return;
    }
    std::vector<Kq_BoolEquation::Handle> handles;
    for (const auto& variable : equation.GetVariables())
        handles.push_back(equation.GetVariableHandle(variable.first));
    const auto valueAt = [&](uint64_t row) {
        for (size_t column = 0; column < handles.size(); ++column) // the shift is below 30
            equation.SetVariable(handles[column], (row >> (handles.size() - 1 - column)) & 1u);
        return equation.Eval() != 0;
    };
    PrintRows(names, maxRows, RowFormat::kText, valueAt, output);
}

std::string CsvField(const std::string& text)
{
    std::string field;
    AppendCsvField(text, field);
    return field;
}

void AppendCsvField(const std::string& text, std::string& line)
{
    bool isSpecial = false; // no branch before the end, so that many are compared at once
    for (const char character : text)
        isSpecial |= character == ',' || character == '"' || character == '\r' || character == '\n';
    if (!isSpecial) {
        line += text;
        return;
    }
    line += '"';
    for (size_t start = 0; start < text.size();) {
        const size_t quote = std::min(text.find('"', start), text.size());
        line.append(text, start, quote - start);
        if (quote < text.size())
            line += "\"\"";
        start = quote + 1;
    }
    line += '"';
}

} // namespace booleq
