// Words in, digits out, eight at a time in one machine word.
// Fails: std::bad_alloc.  Cost: O(digits), of which the host's string takes the larger part.
#include "DigitsText.h"

#include <algorithm>
#include <cassert>
#include <cstring>

namespace {

constexpr char kLowerDigits[] = "0123456789abcdef";
constexpr char kUpperDigits[] = "0123456789ABCDEF";

// Words whose digits go to the string at a time, from a buffer in the processor's cache.
constexpr size_t kPieceWords = 64;

constexpr uint64_t kEachByte = 0x0101010101010101u;

// Writes the lowest byte of 'bytes' last.
void StoreReversed(uint64_t bytes, char* text)
{
#if __BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__
    bytes = __builtin_bswap64(bytes);
#endif
    std::memcpy(text, &bytes, sizeof bytes);
}

// The hexadecimal digits of 32 rows, lowest digit in the lowest byte. 'letter' is the distance from
// the digit after 9 to the one that stands for 10.
uint64_t HexDigits(uint32_t rows, uint64_t letter)
{
    uint64_t nibbles = rows;
    nibbles = (nibbles | nibbles << 16) & 0x0000ffff0000ffffu;
    nibbles = (nibbles | nibbles << 8) & 0x00ff00ff00ff00ffu;
    nibbles = (nibbles | nibbles << 4) & 0x0f0f0f0f0f0f0f0fu;
    const uint64_t isLetter = (nibbles + 6 * kEachByte) >> 4 & kEachByte;
    return nibbles + '0' * kEachByte + isLetter * letter;
}

// The binary digits of 8 rows, lowest row in the lowest byte.
uint64_t BinaryDigits(uint64_t rows)
{
    // Each byte keeps the bit of its own number, which then makes it 1 or 0.
    const uint64_t kept = rows * kEachByte & 0x8040201008040201u;
    return ((kept + 0x7f * kEachByte) >> 7 & kEachByte) + '0' * kEachByte;
}

} // namespace

void KqDigitsText::AppendFewRows(uint64_t word, unsigned int numVariables)
{
    assert(numVariables >= 1 && numVariables <= 6);
    const unsigned int numRows = 1u << numVariables;
    const unsigned int digitBits = std::min<unsigned int>(m_base, numRows);
    const char* const digits = m_upper_case ? kUpperDigits : kLowerDigits;
    char buffer[64 + 1];
    char* end = buffer;
    for (unsigned int bit = numRows; bit > 0; bit -= digitBits)
        *end++ = digits[word >> (bit - digitBits) & ((1u << digitBits) - 1)];
    *end = '\0';
    m_text += buffer;
}

void KqDigitsText::AppendWords(const uint64_t* words, size_t numWords)
{
    constexpr uint64_t kLower = 'a' - '9' - 1;
    constexpr uint64_t kUpper = 'A' - '9' - 1;
    const uint64_t letter = m_upper_case ? kUpper : kLower;
    char buffer[kPieceWords * 64 + 1];
    while (numWords > 0) {
        char* end = buffer;
        for (size_t left = std::min(numWords, kPieceWords); left > 0; --left) {
            const uint64_t word = words[--numWords];
            if (m_base == KQ_HEXADECIMAL) {
                StoreReversed(HexDigits(static_cast<uint32_t>(word >> 32), letter), end);
                StoreReversed(HexDigits(static_cast<uint32_t>(word), letter), end + 8);
                end += 16;
                continue;
            }
            for (unsigned int byte = 8; byte-- > 0; end += 8)
                StoreReversed(BinaryDigits(word >> (8 * byte) & 0xffu), end);
        }
        *end = '\0';
        m_text += buffer;
    }
}
