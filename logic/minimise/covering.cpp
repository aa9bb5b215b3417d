// Reductions of covering tables.
#include "covering.h"

#include <algorithm>
#include <cassert>

namespace booleq {

namespace {

// A hash of a set such that a subset's hash has a subset of the bits.
uint64_t SignatureOf(const std::vector<uint32_t>& elements)
{
    uint64_t signature = 0;
    for (const uint32_t element : elements)
        signature |= uint64_t(1) << ((element * 2654435761u) >> 26);
    return signature;
}

bool IsSubset(const std::vector<uint32_t>& part, const std::vector<uint32_t>& whole)
{
    return std::includes(whole.begin(), whole.end(), part.begin(), part.end());
}

class Reduction {
  public:
    Reduction(CoveringTable& table, std::vector<uint32_t>& forced, Work& work)
        : m_table(table), m_forced(forced), m_work(work)
    {
    }

    void Run()
    {
        do {
            Begin();
            ForceSingles();
            Apply();
            DropRows();
            Apply();
            DropColumns();
            Apply();
        } while (m_is_changed);
    }

  private:
    void Begin()
    {
        m_is_changed = false;
        m_is_row.assign(m_table.rows.size(), 1);
        m_is_column.assign(m_table.columns.size(), 1);
    }

    void Apply()
    {
        if (std::count(m_is_row.begin(), m_is_row.end(), 0) == 0 &&
            std::count(m_is_column.begin(), m_is_column.end(), 0) == 0)
            return;
        KeepInTable(m_table, m_is_row, m_is_column);
        m_is_row.assign(m_table.rows.size(), 1);
        m_is_column.assign(m_table.columns.size(), 1);
        m_is_changed = true;
    }

    void ForceSingles()
    {
        for (size_t row = 0; row < m_table.rows.size(); ++row) {
            if (m_is_row[row] == 0 || m_table.rows[row].size() != 1)
                continue;
            const uint32_t column = m_table.rows[row][0];
            m_forced.push_back(m_table.ids[column]);
            m_is_column[column] = 0;
            for (const uint32_t covered : m_table.columns[column])
                m_is_row[covered] = 0;
        }
    }

    // Drops a row if another row's columns all cover it.
    void DropRows()
    {
        std::vector<uint64_t> signatures;
        for (const std::vector<uint32_t>& row : m_table.rows)
            signatures.push_back(SignatureOf(row));
        for (size_t row = 0; row < m_table.rows.size(); ++row) {
            if (m_is_row[row] == 0)
                continue;
            const uint32_t rarest = Rarest(m_table.rows[row], m_table.columns);
            m_work.Spend(m_table.columns[rarest].size());
            for (const uint32_t other : m_table.columns[rarest]) {
                if (other == row || m_is_row[other] == 0 ||
                    (signatures[row] & ~signatures[other]) != 0 ||
                    m_table.rows[row].size() > m_table.rows[other].size())
                    continue;
                m_work.Spend(m_table.rows[other].size());
                if (IsSubset(m_table.rows[row], m_table.rows[other]))
                    m_is_row[other] = 0;
            }
        }
    }

    // Drops a column if another one that costs no more covers all of its rows.
    void DropColumns()
    {
        std::vector<uint64_t> signatures;
        for (const std::vector<uint32_t>& column : m_table.columns)
            signatures.push_back(SignatureOf(column));
        for (size_t column = 0; column < m_table.columns.size(); ++column) {
            const std::vector<uint32_t>& rows = m_table.columns[column];
            const uint32_t rarest = Rarest(rows, m_table.rows);
            m_work.Spend(m_table.rows[rarest].size());
            for (const uint32_t other : m_table.rows[rarest]) {
                if (other == column || m_is_column[other] == 0 ||
                    (signatures[column] & ~signatures[other]) != 0 ||
                    rows.size() > m_table.columns[other].size() ||
                    m_table.costs[other] > m_table.costs[column])
                    continue;
                m_work.Spend(m_table.columns[other].size());
                if (IsSubset(rows, m_table.columns[other])) {
                    m_is_column[column] = 0;
                    break;
                }
            }
        }
    }

    static uint32_t Rarest(const std::vector<uint32_t>& elements,
                           const std::vector<std::vector<uint32_t>>& lists)
    {
        assert(!elements.empty());
        return *std::min_element(elements.begin(), elements.end(),
                                 [&](uint32_t left, uint32_t right) {
                                     return lists[left].size() < lists[right].size();
                                 });
    }

    CoveringTable& m_table;
    std::vector<uint32_t>& m_forced;
    Work& m_work;
    std::vector<uint8_t> m_is_row;
    std::vector<uint8_t> m_is_column;
    bool m_is_changed = false;
};

// Fills table.columns from table.rows.
void FillColumns(CoveringTable& table)
{
    table.columns.assign(table.costs.size(), {});
    for (size_t row = 0; row < table.rows.size(); ++row)
        for (const uint32_t column : table.rows[row])
            table.columns[column].push_back(static_cast<uint32_t>(row));
}

} // namespace

void ReduceCovering(CoveringTable& table, std::vector<uint32_t>& forced, Work& work)
{
    Reduction(table, forced, work).Run();
}

void KeepInTable(CoveringTable& table, const std::vector<uint8_t>& isRowKept,
                 const std::vector<uint8_t>& isColumnKept)
{
    std::vector<uint8_t> isUsed(table.costs.size(), 0);
    for (size_t row = 0; row < table.rows.size(); ++row)
        if (isRowKept[row] != 0)
            for (const uint32_t column : table.rows[row])
                isUsed[column] = isColumnKept[column];
    std::vector<uint32_t> newNumbers(table.costs.size());
    uint32_t numColumns = 0;
    for (size_t column = 0; column < isUsed.size(); ++column) {
        if (isUsed[column] == 0)
            continue;
        newNumbers[column] = numColumns;
        table.costs[numColumns] = table.costs[column];
        table.ids[numColumns++] = table.ids[column];
    }
    table.costs.resize(numColumns);
    table.ids.resize(numColumns);
    size_t numRows = 0;
    for (size_t row = 0; row < table.rows.size(); ++row) {
        if (isRowKept[row] == 0)
            continue;
        std::vector<uint32_t> columns;
        for (const uint32_t column : table.rows[row])
            if (isUsed[column] != 0)
                columns.push_back(newNumbers[column]);
        assert(!columns.empty());
        table.rows[numRows] = std::move(columns);
        table.multipliers[numRows++] = table.multipliers[row];
    }
    table.rows.resize(numRows);
    table.multipliers.resize(numRows);
    FillColumns(table);
    assert(table.columns.size() == table.costs.size());
}

std::vector<CoveringTable> SplitTable(const CoveringTable& table)
{
    std::vector<CoveringTable> parts;
    std::vector<uint8_t> isRowSeen(table.rows.size(), 0);
    std::vector<uint32_t> newNumbers(table.costs.size(), UINT32_MAX);
    for (size_t first = 0; first < table.rows.size(); ++first) {
        if (isRowSeen[first] != 0)
            continue;
        CoveringTable part;
        std::vector<uint32_t> members(1, static_cast<uint32_t>(first)); // rows; grows in the loop
        isRowSeen[first] = 1;
        for (size_t place = 0; place < members.size(); ++place) {
            for (const uint32_t column : table.rows[members[place]]) {
                if (newNumbers[column] != UINT32_MAX)
                    continue;
                newNumbers[column] = static_cast<uint32_t>(part.costs.size());
                part.costs.push_back(table.costs[column]);
                part.ids.push_back(table.ids[column]);
                for (const uint32_t next : table.columns[column])
                    if (isRowSeen[next] == 0) {
                        isRowSeen[next] = 1;
                        members.push_back(next);
                    }
            }
        }
        for (const uint32_t row : members) {
            std::vector<uint32_t> columns;
            for (const uint32_t column : table.rows[row])
                columns.push_back(newNumbers[column]);
            std::sort(columns.begin(), columns.end());
            part.rows.push_back(std::move(columns));
            part.multipliers.push_back(table.multipliers[row]);
        }
        FillColumns(part);
        assert(part.columns.size() == part.ids.size());
        parts.push_back(std::move(part));
    }
    return parts;
}

} // namespace booleq
