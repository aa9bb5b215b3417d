#include "packing.h"

#include <algorithm>
#include <cstring>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace booleq_python {

namespace {

constexpr uint64_t kLowBits = 0x0101010101010101;
constexpr size_t kWordRows = 64;

// Byte k of the memory is bits 8k to 8k+7 of the word, on every machine.
[[maybe_unused]] uint64_t LoadBytes(const uint8_t* bytes)
{
    uint64_t word = 0;
    for (unsigned int index = 0; index < 8; ++index)
        word |= static_cast<uint64_t>(bytes[index]) << (8 * index);
    return word;
}

// Packs 64 bytes, each 0 or 1, into a word; sets bit 1 of 'seen' if any byte is above 1.
#ifdef __SSE2__
uint64_t PackBytes(const uint8_t* bytes, uint8_t& seen)
{
    uint64_t word = 0;
    __m128i all = _mm_setzero_si128();
    for (size_t part = 0; part < 4; ++part) {
        const __m128i values = _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + 16 * part));
        all = _mm_or_si128(all, values);
        const auto bits = static_cast<uint32_t>(_mm_movemask_epi8(_mm_slli_epi16(values, 7)));
        word |= static_cast<uint64_t>(bits) << (16 * part);
    }
    const __m128i above =
        _mm_cmpeq_epi8(_mm_andnot_si128(_mm_set1_epi8(1), all), _mm_setzero_si128());
    seen = static_cast<uint8_t>(seen | (_mm_movemask_epi8(above) == 0xffff ? 0 : 2));
    return word;
}
#else
uint64_t PackBytes(const uint8_t* bytes, uint8_t& seen)
{
    uint64_t word = 0;
    uint64_t all = 0;
    for (unsigned int part = 0; part < 8; ++part) {
        const uint64_t values = LoadBytes(bytes + 8 * part);
        all |= values;
        // Byte k goes to bit k; the partial products do not overlap, so nothing carries.
        word |= ((values & kLowBits) * 0x0102040810204080 >> 56) << (8 * part);
    }
    seen = static_cast<uint8_t>(seen | ((all & ~kLowBits) != 0 ? 2 : 0));
    return word;
}
#endif

template <class Value>
Value Load(const uint8_t* item)
{
    Value value;
    std::memcpy(&value, item, sizeof value); // arrays need not be aligned
    return value;
}

// The values as bytes, with 2 for every value that is neither 0 nor 1.
template <class Value>
void Narrow(const uint8_t* item, std::ptrdiff_t stride, size_t numRows, uint8_t* bytes)
{
    const auto narrowed = [](Value value) {
        return static_cast<uint8_t>(value == Value(0) ? 0 : (value == Value(1) ? 1 : 2));
    };
    if (stride == sizeof(Value)) { // the compiler can vectorise this loop
        for (size_t row = 0; row < numRows; ++row)
            bytes[row] = narrowed(Load<Value>(item + row * sizeof(Value)));
        return;
    }
    for (size_t row = 0; row < numRows; ++row, item += stride)
        bytes[row] = narrowed(Load<Value>(item));
}

void Narrow(const ValueColumn& column, size_t first, size_t numRows, uint8_t* bytes)
{
    const uint8_t* const item = column.data + static_cast<std::ptrdiff_t>(first) * column.stride;
    switch (column.kind) {
    case ItemKind::Byte:
        for (size_t row = 0; row < numRows; ++row)
            bytes[row] = item[static_cast<std::ptrdiff_t>(row) * column.stride];
        return;
    case ItemKind::Word16:
        return Narrow<uint16_t>(item, column.stride, numRows, bytes);
    case ItemKind::Word32:
        return Narrow<uint32_t>(item, column.stride, numRows, bytes);
    case ItemKind::Word64:
        return Narrow<uint64_t>(item, column.stride, numRows, bytes);
    case ItemKind::Float32:
        return Narrow<float>(item, column.stride, numRows, bytes);
    case ItemKind::Float64:
        return Narrow<double>(item, column.stride, numRows, bytes);
    }
}

} // namespace

bool PackColumn(const ValueColumn& column, size_t first, size_t numRows, uint64_t* words)
{
    const bool isDense = column.kind == ItemKind::Byte && column.stride == 1;
    uint8_t seen = 0;
    for (size_t row = 0; row < numRows; row += kWordRows) {
        const size_t count = std::min(kWordRows, numRows - row);
        if (isDense && count == kWordRows) {
            *words++ = PackBytes(column.data + first + row, seen);
            continue;
        }
        uint8_t bytes[kWordRows];
        if (count < kWordRows)
            std::memset(bytes, 0, sizeof bytes);
        Narrow(column, first + row, count, bytes);
        *words++ = PackBytes(bytes, seen);
    }
    return seen == 0;
}

bool IsFault(const ValueColumn& column, size_t row)
{
    uint8_t byte = 0;
    Narrow(column, row, 1, &byte);
    return byte > 1;
}

void UnpackBits(const uint64_t* words, size_t numBits, uint8_t* bytes)
{
    for (size_t done = 0; done < numBits; done += 8) {
        const uint64_t bits = words[done / kWordRows] >> (done % kWordRows) & 0xff;
        const uint64_t marked = (bits * kLowBits) & 0x8040201008040201;
        const uint64_t spread = ((marked + 0x7f7f7f7f7f7f7f7f) >> 7) & kLowBits;
        uint8_t eight[8];
        for (unsigned int index = 0; index < 8; ++index)
            eight[index] = static_cast<uint8_t>(spread >> (8 * index));
        std::memcpy(bytes + done, eight, std::min<size_t>(8, numBits - done));
    }
}

} // namespace booleq_python
