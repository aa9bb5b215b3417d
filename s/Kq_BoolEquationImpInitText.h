// Init values as pure text: what counts as one, and the expression that one stands for.
// Knows names and digits only; no nodes, no engine object.
#ifndef KQ_BOOLEQUATIONIMPINITTEXT_H
#define KQ_BOOLEQUATIONIMPINITTEXT_H

#include <cstdint>
#include <string>
#include <vector>

#include <port/Port_StringBase.h>

namespace KqInitText {

typedef Port::StringBase<char> String;

constexpr size_t kPrefixLength = 2;

// Whether a text is to be read as an init value: at least three characters, the first a 0.
inline bool IsCandidate(const String& text)
{
    return text.length() > kPrefixLength && text.c_str()[0] == '0';
}

// Bits per digit: 4 for "0x" and "0X", 1 for "0b" and "0B", 0 for any other prefix.
// Requires: at least two characters.
inline unsigned int BitsPerDigit(const String& text)
{
    switch (text.c_str()[1]) {
    case 'x':
    case 'X':
        return 4;
    case 'b':
    case 'B':
        return 1;
    default:
        return 0;
    }
}

// The value of a hexadecimal digit, 16 for any other character.
inline unsigned int DigitValue(char digit)
{
    if (digit >= '0' && digit <= '9')
        return static_cast<unsigned int>(digit - '0');
    if (digit >= 'a' && digit <= 'f')
        return static_cast<unsigned int>(digit - 'a') + 10;
    if (digit >= 'A' && digit <= 'F')
        return static_cast<unsigned int>(digit - 'A') + 10;
    return 16;
}

// The digits of an init value as '0' and '1', the highest row first; empty when a character is no
// digit of its base or the prefix is unknown.
inline std::string ReadBits(const String& text)
{
    const unsigned int bitsPerDigit = BitsPerDigit(text);
    if (bitsPerDigit == 0)
        return std::string();
    const char* const digits = text.c_str() + kPrefixLength;
    const size_t numDigits = text.length() - kPrefixLength;
    std::string bits;
    bits.reserve(numDigits * bitsPerDigit);
    for (size_t position = 0; position < numDigits; ++position) {
        const unsigned int value = DigitValue(digits[position]);
        if (value >= 1u << bitsPerDigit)
            return std::string();
        for (unsigned int bit = bitsPerDigit; bit-- > 0;)
            bits += (value >> bit & 1u) != 0 ? '1' : '0';
    }
    return bits;
}

// How many variables a value of 'numBits' rows is read over: as many as number its rows.
inline unsigned int RequiredVariables(size_t numBits)
{
    unsigned int numVariables = 0;
    for (size_t highestRow = numBits - 1; highestRow != 0; highestRow >>= 1)
        ++numVariables;
    return numVariables;
}

// Appends the term of row 'row': every name, joined with 'operation', with a "~" in front where
// the row's bit is not 'plainBit'.
inline void AppendTerm(uint64_t row, const std::vector<String>& names, bool isFirstLowest,
                       char operation, unsigned int plainBit, std::string& text)
{
    text += '(';
    for (size_t index = 0; index < names.size(); ++index) {
        const size_t bit = isFirstLowest ? index : names.size() - 1 - index;
        if (index > 0)
            text += operation;
        if ((row >> bit & 1u) != plainBit)
            text += '~';
        text.append(names[index].c_str(), names[index].length());
    }
    text += ')';
}

// The expression that the init value 'text' stands for over 'names'; empty when it is none: a bad
// digit, or digits for another number of names. 'isFirstLowest' gives the first name the lowest
// bit of the row number instead of the highest.
// Fewer ones than zeros, or only ones, give a sum of products over the rows of result 1; otherwise
// a product of sums over the rows of result 0.
// Deliberate: a value with fewer digits than rows is not padded. Its missing high rows have no
// term, so they are 0 in a sum of products and 1 in a product of sums.
// Requires: IsCandidate(text).
inline std::string Expand(const String& text, const std::vector<String>& names, bool isFirstLowest)
{
    const std::string bits = ReadBits(text);
    if (bits.empty() || names.size() != RequiredVariables(bits.size()))
        return std::string();
    size_t numOnes = 0;
    for (const char bit : bits)
        numOnes += bit == '1' ? 1u : 0u;
    const size_t numZeros = bits.size() - numOnes;
    const bool isSum = numOnes != 0 && (numZeros == 0 || numOnes < numZeros);
    std::string expression;
    for (size_t row = 0; row < bits.size(); ++row) {
        if ((bits[bits.size() - 1 - row] == '1') != isSum)
            continue;
        if (!expression.empty())
            expression += isSum ? '+' : '*';
        AppendTerm(row, names, isFirstLowest, isSum ? '*' : '+', isSum ? 1u : 0u, expression);
    }
    return expression;
}

} // namespace KqInitText

#endif
