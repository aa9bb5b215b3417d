// Words in, digits out, in pieces that stay in the processor's cache.
// Fails: std::bad_alloc.  Cost: O(digits), of which the host's string takes the larger part.
#include "DigitsText.h"

#include <algorithm>
#include <cassert>
#include <cstring>

namespace {

constexpr char kLowerDigits[] = "0123456789abcdef";
constexpr char kUpperDigits[] = "0123456789ABCDEF";

// Words whose digits go to the string at a time, from a buffer in the processor's cache.
constexpr size_t kPieceWords = 256;

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

// Two digits for each byte. 'letter' is how far the digit that stands for 10 is beyond where the
// others would go on. Written so that the compiler makes it work on many bytes at a time.
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
    constexpr unsigned char kLower = 'a' - '9' - 1;
    constexpr unsigned char kUpper = 'A' - '9' - 1;
    unsigned char bytes[kPieceWords * 8];
    char text[kPieceWords * 64 + 1];
    while (numWords > 0) {
        const size_t size = std::min(numWords, kPieceWords);
        numWords -= size;
        ReverseBytes(words + numWords, size, bytes);
        if (m_base == KQ_HEXADECIMAL)
            WriteHex(bytes, 8 * size, m_upper_case ? kUpper : kLower, text);
        else
            WriteBinary(bytes, 8 * size, text);
        text[size * 64 / m_base] = '\0';
        m_text += text;
    }
}
