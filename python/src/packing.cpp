#include "packing.h"

#include <algorithm>
#include <cstring>

namespace booleq_python {

namespace {

constexpr uint64_t kLowBits = 0x0101010101010101;

// Byte k of the memory is bits 8k to 8k+7 of the word, on every machine.
uint64_t LoadBytes(const uint8_t* bytes)
{
    uint64_t word = 0;
    for (unsigned int index = 0; index < 8; ++index)
        word |= static_cast<uint64_t>(bytes[index]) << (8 * index);
    return word;
}

uint64_t LoadSome(const uint8_t* bytes, size_t count)
{
    uint64_t word = 0;
    for (size_t index = 0; index < count; ++index)
        word |= static_cast<uint64_t>(bytes[index]) << (8 * index);
    return word;
}

void StoreBytes(uint64_t word, uint8_t* bytes)
{
    for (unsigned int index = 0; index < 8; ++index)
        bytes[index] = static_cast<uint8_t>(word >> (8 * index));
}

// Bytes 0 and 1 as bits; byte 0 the highest. The partial products do not meet, so nothing carries.
uint8_t HighFirst(uint64_t bytes)
{
    return static_cast<uint8_t>((bytes * 0x8040201008040201) >> 56);
}

// The same; byte 0 the lowest.
uint8_t LowFirst(uint64_t bytes)
{
    return static_cast<uint8_t>((bytes * 0x0102040810204080) >> 56);
}

// Byte k is bit k.
uint64_t Spread(uint8_t bits)
{
    const uint64_t marked = (bits * kLowBits) & 0x8040201008040201;
    return ((marked + 0x7f7f7f7f7f7f7f7f) >> 7) & kLowBits;
}

} // namespace

RowPacker::RowPacker(const Table& table)
    : m_table(table), m_num_groups((table.numColumns + 7) / 8), m_groups(kBlockRows * m_num_groups)
{
}

bool RowPacker::Pack(size_t firstRow)
{
    m_num_rows = std::min(kBlockRows, m_table.numRows - firstRow);
    m_fault.row = firstRow;
    const size_t numColumns = m_table.numColumns;
    if (m_table.itemSize == 1 && m_table.columnStride == 1) {
        const uint8_t* const rows =
            m_table.data + static_cast<std::ptrdiff_t>(firstRow) * m_table.rowStride;
        // What lies behind a row may only be read where another row follows.
        const bool isDense = m_table.rowStride == static_cast<std::ptrdiff_t>(numColumns);
        const uint8_t* const end = isDense ? m_table.data + m_table.numRows * numColumns : nullptr;
        return PackBytes(rows, m_table.rowStride, end);
    }
    m_bytes.resize(kBlockRows * numColumns);
    const uint8_t* rows = nullptr;
    switch (m_table.itemSize) {
    case 1:
        rows = Narrow<uint8_t>(firstRow);
        break;
    case 2:
        rows = Narrow<uint16_t>(firstRow);
        break;
    case 4:
        rows = Narrow<uint32_t>(firstRow);
        break;
    default:
        rows = Narrow<uint64_t>(firstRow);
        break;
    }
    return PackBytes(rows, static_cast<std::ptrdiff_t>(numColumns), rows + m_bytes.size());
}

// The rows as bytes; 2 stands for every value that is neither 0 nor 1.
template <class Integer>
const uint8_t* RowPacker::Narrow(size_t firstRow)
{
    uint8_t* byte = m_bytes.data();
    for (size_t row = firstRow; row < firstRow + m_num_rows; ++row) {
        const uint8_t* item = m_table.data + static_cast<std::ptrdiff_t>(row) * m_table.rowStride;
        for (size_t column = 0; column < m_table.numColumns; ++column) {
            Integer value;
            std::memcpy(&value, item, sizeof value); // arrays need not be aligned
            *byte++ = static_cast<uint8_t>(value <= 1 ? value : 2);
            item += m_table.columnStride;
        }
    }
    return m_bytes.data();
}

// 'end' is where the memory ends that may be read; null: nothing beyond each row.
bool RowPacker::PackBytes(const uint8_t* rows, std::ptrdiff_t rowStride, const uint8_t* end)
{
    uint64_t bad = 0; // bits that neither 0 nor 1 has, of all rows
    for (size_t group = 0; group < m_num_groups; ++group) {
        const size_t numLeft = std::min<size_t>(8, m_table.numColumns - 8 * group);
        const uint64_t mask = ~uint64_t(0) >> (64 - 8 * numLeft);
        const uint8_t* bytes = rows + 8 * group;
        uint8_t* const packed = &m_groups[kBlockRows * group];
        for (size_t row = 0; row < m_num_rows; ++row, bytes += rowStride) {
            const bool isWhole = numLeft == 8 || (end && end - bytes >= 8);
            const uint64_t word = isWhole ? LoadBytes(bytes) & mask : LoadSome(bytes, numLeft);
            bad |= word & ~kLowBits;
            packed[row] = HighFirst(word);
        }
    }
    if (bad != 0)
        FindFault(rows, rowStride);
    return bad == 0;
}

// Requires: there is one.
void RowPacker::FindFault(const uint8_t* rows, std::ptrdiff_t rowStride)
{
    for (size_t row = 0; row < m_num_rows; ++row, rows += rowStride) {
        const uint8_t* const found =
            std::find_if(rows, rows + m_table.numColumns, [](uint8_t value) { return value > 1; });
        if (found != rows + m_table.numColumns) {
            m_fault = {m_fault.row + row, static_cast<size_t>(found - rows)};
            return;
        }
    }
}

void RowPacker::ToWords(std::vector<uint64_t>& words) const
{
    words.assign(m_table.numColumns, 0);
    for (size_t group = 0; group < m_num_groups; ++group) {
        const size_t first = 8 * group;
        const size_t count = std::min<size_t>(8, m_table.numColumns - first);
        for (size_t row = 0; row < m_num_rows; row += 8) { // bytes behind the last row do not count
            const uint64_t rows = LoadBytes(&m_groups[kBlockRows * group + row]);
            for (size_t column = 0; column < count; ++column)
                words[first + column] |=
                    static_cast<uint64_t>(LowFirst((rows >> (7 - column)) & kLowBits)) << row;
        }
    }
}

uint64_t RowPacker::RowNumber(size_t row) const
{
    uint64_t number = 0;
    for (size_t group = 0; group < m_num_groups; ++group)
        number = number << 8 | m_groups[kBlockRows * group + row];
    return number >> (8 * m_num_groups - m_table.numColumns);
}

bool RowPacker::At(size_t row, size_t column) const
{
    return (m_groups[kBlockRows * (column / 8) + row] >> (7 - column % 8) & 1u) != 0;
}

void UnpackBits(uint64_t bits, size_t numBits, uint8_t* bytes)
{
    size_t done = 0;
    for (; done + 8 <= numBits; done += 8)
        StoreBytes(Spread(static_cast<uint8_t>(bits >> done)), bytes + done);
    for (; done < numBits; ++done)
        bytes[done] = static_cast<uint8_t>(bits >> done & 1u);
}

} // namespace booleq_python
