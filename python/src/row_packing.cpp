// Packs bytes stored row by row, 64 rows at a time: first each row to bits, 8 columns to a byte,
// then the bytes of 64 rows to a word for each column. Four adjacent columns are transposed as
// bytes instead.
#include "packing.h"

#include <algorithm>
#include <cassert>
#include <cstring>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace booleq_python {

#ifdef __SSE2__

namespace {

constexpr size_t kWordRows = 64;
constexpr size_t kMaxLoad = 16; // bytes read from a row at once

__m128i Load(const uint8_t* bytes)
{
    return _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes));
}

// The lowest bits of 16 bytes.
unsigned int LowBits(__m128i bytes)
{
    return static_cast<unsigned int>(_mm_movemask_epi8(_mm_slli_epi16(bytes, 7)));
}

// Bit c of byte r is the value of column c in row r, for 64 rows.
struct alignas(16) RowBits {
    uint8_t bytes[kWordRows];
};

// The word of each of the first 'numColumns' columns, at most 8.
void TakeColumns(const RowBits& bits, size_t numColumns, uint64_t* words, size_t wordStride)
{
    __m128i rows[4];
    for (size_t part = 0; part < 4; ++part)
        rows[part] = Load(bits.bytes + 16 * part);
    for (size_t column = 8; column-- > 0;) {
        if (column < numColumns) {
            uint64_t word = 0;
            for (size_t part = 4; part-- > 0;)
                word = word << 16 | static_cast<unsigned int>(_mm_movemask_epi8(rows[part]));
            words[column * wordStride] = word;
        }
        for (__m128i& part : rows) // bits that come in from the byte below never reach the top
            part = _mm_slli_epi16(part, 1);
    }
}

// Packs 64 rows of up to 16 columns; 16 bytes of each row must be readable.
void PackWide(const uint8_t* rows, std::ptrdiff_t stride, size_t numColumns, uint64_t* words,
              size_t wordStride, __m128i& seen)
{
    RowBits lower;
    RowBits upper;
    for (size_t row = 0; row < kWordRows; ++row, rows += stride) {
        const __m128i values = Load(rows);
        seen = _mm_or_si128(seen, values);
        const unsigned int bits = LowBits(values);
        lower.bytes[row] = static_cast<uint8_t>(bits);
        upper.bytes[row] = static_cast<uint8_t>(bits >> 8);
    }
    TakeColumns(lower, 8, words, wordStride);
    TakeColumns(upper, numColumns - 8, words + 8 * wordStride, wordStride);
}

// Packs 64 rows of up to 8 columns; 8 bytes of each row must be readable.
void PackNarrow(const uint8_t* rows, std::ptrdiff_t stride, size_t numColumns, uint64_t* words,
                size_t wordStride, __m128i& seen)
{
    RowBits bits;
    for (size_t row = 0; row < kWordRows; row += 2, rows += 2 * stride) {
        const __m128i first = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(rows));
        const __m128i second = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(rows + stride));
        const __m128i values = _mm_unpacklo_epi64(first, second);
        seen = _mm_or_si128(seen, _mm_or_si128(first, second));
        const unsigned int both = LowBits(values);
        bits.bytes[row] = static_cast<uint8_t>(both);
        bits.bytes[row + 1] = static_cast<uint8_t>(both >> 8);
    }
    TakeColumns(bits, numColumns, words, wordStride);
}

// Packs 64 rows of 4 columns without gaps.
void PackFour(const uint8_t* rows, uint64_t* words, size_t wordStride, __m128i& seen)
{
    uint64_t packed[4] = {0, 0, 0, 0};
    for (size_t part = 0; part < 4; ++part, rows += 64) {
        __m128i bytes[4] = {Load(rows), Load(rows + 16), Load(rows + 32), Load(rows + 48)};
        seen = _mm_or_si128(
            seen, _mm_or_si128(_mm_or_si128(bytes[0], bytes[1]), _mm_or_si128(bytes[2], bytes[3])));
        // The number of a byte consists of four bits of its row and two of its column. Each step
        // moves the highest bit to the end, so that finally the column's bits come first.
        for (unsigned int step = 0; step < 4; ++step) {
            const __m128i next[4] = {
                _mm_unpacklo_epi8(bytes[0], bytes[2]), _mm_unpackhi_epi8(bytes[0], bytes[2]),
                _mm_unpacklo_epi8(bytes[1], bytes[3]), _mm_unpackhi_epi8(bytes[1], bytes[3])};
            std::copy(next, next + 4, bytes);
        }
        for (size_t column = 0; column < 4; ++column)
            packed[column] |= static_cast<uint64_t>(LowBits(bytes[column])) << (16 * part);
    }
    for (size_t column = 0; column < 4; ++column)
        words[column * wordStride] = packed[column];
}

// Whether the first 'numColumns' bytes are only 0 and 1.
bool AreBits(__m128i seen, size_t numColumns)
{
    uint8_t bytes[16];
    _mm_storeu_si128(reinterpret_cast<__m128i*>(bytes), seen);
    return std::all_of(bytes, bytes + numColumns, [](uint8_t byte) { return byte <= 1; });
}

} // namespace

bool PackRows(const ByteRows& rows, size_t first, size_t numRows, uint64_t* words,
              size_t wordStride)
{
    assert(rows.rowStride >= static_cast<std::ptrdiff_t>(rows.numColumns));
    const uint8_t* const end = rows.data +
                               (static_cast<std::ptrdiff_t>(rows.numRows) - 1) * rows.rowStride +
                               static_cast<std::ptrdiff_t>(rows.numColumns);
    const bool areFour = rows.numColumns == 4 && rows.rowStride == 4;
    bool isFine = true;
    for (size_t column = 0; column < rows.numColumns; column += kMaxLoad) {
        const size_t numColumns = std::min(kMaxLoad, rows.numColumns - column);
        __m128i seen = _mm_setzero_si128();
        for (size_t row = 0; row < numRows; row += kWordRows) {
            const uint8_t* source =
                rows.data + static_cast<std::ptrdiff_t>(first + row) * rows.rowStride + column;
            std::ptrdiff_t stride = rows.rowStride;
            uint64_t* const target = words + column * wordStride + row / kWordRows;
            uint8_t copy[kWordRows * kMaxLoad];
            const size_t count = std::min(kWordRows, numRows - row);
            if (areFour && count == kWordRows) {
                PackFour(source, target, wordStride, seen);
                continue;
            }
            if (count < kWordRows ||
                end - source < static_cast<std::ptrdiff_t>(kMaxLoad) + 63 * stride) {
                std::memset(copy, 0, sizeof copy);
                for (size_t index = 0; index < count; ++index)
                    std::memcpy(copy + kMaxLoad * index,
                                source + static_cast<std::ptrdiff_t>(index) * stride, numColumns);
                source = copy;
                stride = static_cast<std::ptrdiff_t>(kMaxLoad);
            }
            if (numColumns > 8)
                PackWide(source, stride, numColumns, target, wordStride, seen);
            else
                PackNarrow(source, stride, numColumns, target, wordStride, seen);
        }
        isFine = isFine && AreBits(seen, areFour ? 16 : numColumns);
    }
    return isFine;
}

#else

bool PackRows(const ByteRows& rows, size_t first, size_t numRows, uint64_t* words,
              size_t wordStride)
{
    bool isFine = true;
    for (size_t column = 0; column < rows.numColumns; ++column)
        isFine = PackColumn({rows.data + column, rows.rowStride, ItemKind::Byte}, first, numRows,
                            words + column * wordStride) &&
                 isFine;
    return isFine;
}

#endif

} // namespace booleq_python
