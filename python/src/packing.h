// Packs values of a byte or more each into bits, and back. Bit r of a packed word is row r of its
// 64 rows, on every machine.
#ifndef BOOLEQ_PYTHON_PACKING_H
#define BOOLEQ_PYTHON_PACKING_H

#include <cstddef>
#include <cstdint>

namespace booleq_python {

// The format of a value in memory, in this machine's byte order.
enum class ItemKind : uint8_t { Byte, Word16, Word32, Word64, Float32, Float64 };

// The values of one input, each 0 or 1; they need not be aligned.
struct ValueColumn {
    const uint8_t* data;
    std::ptrdiff_t stride; // in bytes
    ItemKind kind;
};

// Packs rows 'first' to first + numRows - 1; bits of the last word beyond these rows are 0.
// Fails: false for a value other than 0 and 1; the words are then meaningless.
bool PackColumn(const ValueColumn& column, size_t first, size_t numRows, uint64_t* words);

// Whether the value in row 'row' is neither 0 nor 1.
bool IsFault(const ValueColumn& column, size_t row);

// Bytes stored row by row, the columns of a row side by side.
struct ByteRows {
    const uint8_t* data;
    size_t numRows; // of the whole array: nothing after them is read
    size_t numColumns;
    std::ptrdiff_t rowStride; // in bytes, numColumns or more
};

// The same for all columns: word w of column k goes to words[k * wordStride + w].
bool PackRows(const ByteRows& rows, size_t first, size_t numRows, uint64_t* words,
              size_t wordStride);

// Writes 'numBits' bits as bytes 0 and 1, bit 0 of the first word first.
void UnpackBits(const uint64_t* words, size_t numBits, uint8_t* bytes);

} // namespace booleq_python

#endif
