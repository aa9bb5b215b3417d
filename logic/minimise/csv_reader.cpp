// Truth tables as comma-separated values. Each line is a row, or several with '-' for either value.
#include <algorithm>
#include <unordered_set>

#include "cube_table.h"
#include "text.h"

namespace booleq {

namespace {

std::string Trimmed(const std::string& text)
{
    const size_t begin = text.find_first_not_of(" \t\r\"");
    const size_t end = text.find_last_not_of(" \t\r\"");
    return begin == std::string::npos ? std::string() : text.substr(begin, end - begin + 1);
}

std::vector<std::string> CellsOf(const std::string& line)
{
    std::vector<std::string> cells;
    size_t begin = 0;
    for (;;) {
        const size_t comma = std::min(line.find(',', begin), line.size());
        cells.push_back(Trimmed(line.substr(begin, comma - begin)));
        if (comma == line.size())
            return cells;
        begin = comma + 1;
    }
}

class CsvReader {
  public:
    CsvReader(const std::string& text, size_t numOutputs, Pla& table, PlaFault& fault)
        : m_text(text), m_num_outputs(numOutputs), m_table(table), m_fault(fault)
    {
    }

    bool Read()
    {
        size_t begin = 0;
        while (begin < m_text.size()) {
            ++m_line;
            const size_t end = std::min(m_text.find('\n', begin), m_text.size());
            const std::string line = m_text.substr(begin, end - begin);
            begin = end + 1;
            if (IsBlank(Trimmed(line)))
                continue;
            if (!(m_num_columns == 0 ? ReadNames(CellsOf(line)) : ReadRow(CellsOf(line))))
                return false;
        }
        if (m_num_columns == 0)
            return Fail("expected a line with the names of the columns",
                        "write, for example, 'a,b,f'");
        return true;
    }

  private:
    bool Fail(const std::string& message, const std::string& hint = "")
    {
        m_fault = {std::max<size_t>(m_line, 1), message, hint};
        return false;
    }

    bool ReadNames(const std::vector<std::string>& cells)
    {
        m_num_columns = cells.size();
        if (m_num_outputs == 0 || m_num_outputs > m_num_columns)
            return Fail(std::to_string(m_num_outputs) + " of " + Count(m_num_columns, "column") +
                        " cannot be outputs");
        std::unordered_set<std::string> seen;
        for (const std::string& name : cells) {
            if (name.empty())
                return Fail("a column without a name", "name each column, the outputs last");
            if (!seen.insert(name).second)
                return Fail("the column '" + Excerpt(name) + "' is named twice");
        }
        const auto middle = cells.end() - static_cast<std::ptrdiff_t>(m_num_outputs);
        m_table = Pla();
        m_table.inputs.assign(cells.begin(), middle);
        m_table.outputs.assign(middle, cells.end());
        if (m_table.inputs.size() > kMaxPlaInputs)
            return Fail("more than " + std::to_string(kMaxPlaInputs) + " inputs");
        m_table.hasInputNames = m_table.hasOutputNames = true;
        m_table.type = PlaType::Fdr;
        m_table.space = CubeSpace(m_table.inputs.size(), m_table.outputs.size());
        m_table.on = m_table.free = m_table.off = CubeList(m_table.space.NumWords());
        return true;
    }

    bool ReadRow(const std::vector<std::string>& cells)
    {
        if (cells.size() != m_num_columns)
            return Fail(Count(cells.size(), "column") + ", but the first line names " +
                        std::to_string(m_num_columns));
        const CubeSpace& space = m_table.space;
        std::vector<uint64_t> sets[3]; // on, free, off
        for (std::vector<uint64_t>& set : sets)
            set.resize(space.NumWords());
        for (size_t column = 0; column < m_num_columns; ++column) {
            const std::string& cell = cells[column];
            const bool isEither = cell == "-" || cell == "x" || cell == "X";
            if (cell != "0" && cell != "1" && !isEither)
                return Fail("'" + Excerpt(cell) + "' in column " + std::to_string(column + 1),
                            "values are 0, 1 and -");
            if (column >= space.NumInputs()) {
                SetBit(sets[isEither      ? 1
                            : cell == "1" ? 0
                                          : 2]
                           .data(),
                       space.OutputBit(column - space.NumInputs()));
                continue;
            }
            for (std::vector<uint64_t>& set : sets) {
                if (cell != "1")
                    SetBit(set.data(), 2 * column);
                if (cell != "0")
                    SetBit(set.data(), 2 * column + 1);
            }
        }
        const auto isUsed = [&](const std::vector<uint64_t>& set) {
            return HasCommonOutput(space, set.data(), set.data());
        };
        if (isUsed(sets[0])) {
            m_table.on.Append(sets[0].data());
            m_table.onLines.push_back(static_cast<uint32_t>(m_line));
        }
        if (isUsed(sets[1]))
            m_table.free.Append(sets[1].data());
        if (isUsed(sets[2])) {
            m_table.off.Append(sets[2].data());
            m_table.offLines.push_back(static_cast<uint32_t>(m_line));
        }
        ++m_table.numRows;
        return true;
    }

    const std::string& m_text;
    size_t m_num_outputs;
    Pla& m_table;
    PlaFault& m_fault;
    size_t m_line = 0;
    size_t m_num_columns = 0;
};

} // namespace

bool ReadCsv(const std::string& text, size_t numOutputs, Pla& table, PlaFault& fault)
{
    fault = PlaFault();
    return CsvReader(text, numOutputs, table, fault).Read();
}

} // namespace booleq
