// Values that lie a byte each, or wider, in an array, packed into bits and back.
#ifndef BOOLEQ_PYTHON_PACKING_H
#define BOOLEQ_PYTHON_PACKING_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace booleq_python {

// A table of integers, each 0 or 1: as many rows as there are assignments, a column for each input.
struct Table {
    const uint8_t* data;
    size_t numRows;
    size_t numColumns;
    std::ptrdiff_t rowStride; // in bytes
    std::ptrdiff_t columnStride;
    size_t itemSize; // 1, 2, 4 or 8 bytes, in this machine's order
};

// Where a table has another value than 0 and 1.
struct TableFault {
    size_t row = 0;
    size_t column = 0;
};

// Packs the rows of a table block by block. Groups of eight columns become a byte: the first column
// of the group is its highest bit, columns that the last group lacks are 0.
class RowPacker {
  public:
    static constexpr size_t kBlockRows = 64;

    explicit RowPacker(const Table& table);

    // Packs rows firstRow to firstRow + 63, as many as there are.
    // Fails: false, and Fault() says where.
    bool Pack(size_t firstRow);
    size_t NumRows() const { return m_num_rows; }
    const TableFault& Fault() const { return m_fault; }

    // Column k's values as a word, bit r being row r of the block.
    void ToWords(std::vector<uint64_t>& words) const;
    // All columns of row r of the block as a number, the first column its highest bit.
    // Requires: at most 32 columns.
    uint64_t RowNumber(size_t row) const;
    bool At(size_t row, size_t column) const;

  private:
    bool PackBytes(const uint8_t* rows, std::ptrdiff_t rowStride, const uint8_t* end);
    void FindFault(const uint8_t* rows, std::ptrdiff_t rowStride);
    template <class Integer>
    const uint8_t* Narrow(size_t firstRow);

    Table m_table;
    size_t m_num_groups;
    size_t m_num_rows = 0;
    std::vector<uint8_t> m_groups; // byte r of group g is element kBlockRows * g + r
    std::vector<uint8_t> m_bytes;  // rows of a table that has other items than bytes
    TableFault m_fault;
};

// Writes 'numBits' bits as bytes 0 and 1, bit 0 first.
void UnpackBits(uint64_t bits, size_t numBits, uint8_t* bytes);

} // namespace booleq_python

#endif
