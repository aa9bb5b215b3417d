// Words in, digits out, in pieces that stay in the processor's cache.
// Fails: std::bad_alloc.  Cost: O(digits), of which the host's string takes the larger part.
#include "DigitsText.h"

#include <algorithm>
#include <cassert>
#include <cstring>

namespace {

// Words whose digits go to the string at a time, from a buffer in the processor's cache.
constexpr size_t kPieceWords = 256;
// Up to this many digits go to the string one at a time. The string measures each text it is given,
// and reading back what was just written takes the processor longer than these digits do: 4 of them
// take 19 ns instead of 29, one takes 15 instead of 27.
constexpr unsigned int kFewDigits = 4;

// The binary digits of a byte of the column, the highest row first.
struct ByteDigits {
    char digits[256][8];
};

constexpr ByteDigits MakeByteDigits()
{
    ByteDigits table = {};
    for (unsigned int byte = 0; byte < 256; ++byte) {
        for (unsigned int digit = 0; digit < 8; ++digit)
            table.digits[byte][digit] = (byte >> (7 - digit) & 1u) != 0 ? '1' : '0';
    }
    return table;
}

constexpr ByteDigits kBinaryDigits = MakeByteDigits();

// The bytes of the words, the last word's highest first.
void ReverseBytes(const uint64_t* words, size_t numWords, unsigned char* bytes)
{
    for (size_t word = numWords; word-- > 0; bytes += sizeof(uint64_t)) {
        uint64_t reversed = words[word];
#if __BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__
        reversed = __builtin_bswap64(reversed);
#endif
        std::memcpy(bytes, &reversed, sizeof reversed);
    }
}

// Two digits for each byte. 'letter' is how far the digit for 10 lies beyond where the others would
// go on. Written so that the compiler makes it work on many bytes at a time.
void WriteHex(const unsigned char* bytes, size_t numBytes, unsigned char letter, char* text)
{
    for (size_t byte = 0; byte < numBytes; ++byte) {
        const unsigned char high = bytes[byte] >> 4;
        const unsigned char low = bytes[byte] & 15;
        text[2 * byte] = static_cast<char>(high + '0' + (high > 9 ? letter : 0));
        text[2 * byte + 1] = static_cast<char>(low + '0' + (low > 9 ? letter : 0));
    }
}

void WriteBinary(const unsigned char* bytes, size_t numBytes, char* text)
{
    for (size_t byte = 0; byte < numBytes; ++byte)
        std::memcpy(text + 8 * byte, kBinaryDigits.digits[bytes[byte]], 8);
}

} // namespace

// Writes the digits of up to kPieceWords words and a 0 after them.
inline void KqDigitsText::WriteWords(const uint64_t* words, size_t numWords, char* text) const
{
    constexpr unsigned char kLower = 'a' - '9' - 1;
    constexpr unsigned char kUpper = 'A' - '9' - 1;
    assert(numWords <= kPieceWords);
    unsigned char bytes[kPieceWords * 8];
    ReverseBytes(words, numWords, bytes);
    if (m_base == KQ_HEXADECIMAL)
        WriteHex(bytes, 8 * numWords, m_upper_case ? kUpper : kLower, text);
    else
        WriteBinary(bytes, 8 * numWords, text);
    text[numWords * 64 / m_base] = '\0';
}

inline char KqDigitsText::GetDigit(uint64_t value) const
{
    const char* digits = m_upper_case ? "0123456789ABCDEF" : "0123456789abcdef";
    return digits[value];
}

void KqDigitsText::AppendFewRows(uint64_t word, unsigned int numVariables)
{
    assert(numVariables >= 1);
    assert(numVariables <= 6);
    const unsigned int numRows = 1u << numVariables;
    // One variable has two rows, which are one hexadecimal digit of two bits.
    const unsigned int digitRows = std::min<unsigned int>(m_base, numRows);
    if (numRows <= kFewDigits * digitRows) {
        for (unsigned int row = numRows; row > 0; row -= digitRows)
            m_text += GetDigit(word >> (row - digitRows) & ((1u << digitRows) - 1));
        return;
    }
    // All 64 rows are written, which needs no separate loop, and the last digits are used.
    char text[64 + 1];
    WriteWords(&word, 1, text);
    m_text += text + (64 - numRows) / m_base;
}

void KqDigitsText::AppendWords(const uint64_t* words, size_t numWords)
{
    char text[kPieceWords * 64 + 1];
    while (numWords > 0) {
        const size_t size = std::min(numWords, kPieceWords);
        numWords -= size;
        WriteWords(words + numWords, size, text);
        m_text += text;
    }
}
