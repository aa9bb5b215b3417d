// The last digit is row 0. Fewer ones than zeros, or only ones, give a sum of products; everything
// else gives a product of sums.
#include "reference/init_text.h"

namespace reference {

namespace {

std::string HexDigit(unsigned int digit, bool upperCase)
{
    return std::string(1, (upperCase ? "0123456789ABCDEF" : "0123456789abcdef")[digit]);
}

// "0x8" to "0b1000"; empty for a character that is not a digit.
std::string HexToBinary(const std::string& text)
{
    const std::string lower = "0123456789abcdef";
    const std::string upper = "0123456789ABCDEF";
    std::string binary = "0b";
    for (char c : text.substr(2)) {
        size_t digit = lower.find(c);
        if (digit == std::string::npos)
            digit = upper.find(c);
        if (digit == std::string::npos)
            return "";
        for (size_t bit : {8u, 4u, 2u, 1u})
            binary += digit & bit ? '1' : '0';
    }
    return binary;
}

size_t RequiredVariables(size_t numDigits)
{
    size_t numVariables = 0;
    for (size_t highestRow = numDigits - 1; highestRow != 0; highestRow /= 2)
        ++numVariables;
    return numVariables;
}

std::string Term(size_t row, const std::vector<std::string>& names, bool firstIsLowest,
                 bool isProduct)
{
    std::string term = "(";
    for (size_t position = 0; position < names.size(); ++position) {
        const size_t bit = firstIsLowest ? position : names.size() - 1 - position;
        const bool isSet = ((row >> bit) & 1) != 0;
        if (position != 0)
            term += isProduct ? "*" : "+";
        if (isSet != isProduct)
            term += "~";
        term += names[position];
    }
    return term + ")";
}

std::string ReadBinary(const std::string& text, const std::vector<std::string>& names,
                       bool firstIsLowest)
{
    if (text.size() < 3)
        return "";
    const std::string digits = text.substr(2);
    if (names.size() != RequiredVariables(digits.size()))
        return "";
    size_t numOnes = 0;
    size_t numZeros = 0;
    for (char c : digits) {
        if (c != '0' && c != '1')
            return "";
        numOnes += c == '1';
        numZeros += c == '0';
    }
    const bool fromZeros = numOnes == 0 || (numZeros != 0 && numOnes >= numZeros);
    std::string equation;
    for (size_t row = 0; row < digits.size(); ++row) {
        const char digit = digits[digits.size() - 1 - row];
        if (digit != (fromZeros ? '0' : '1'))
            continue;
        if (!equation.empty())
            equation += fromZeros ? "*" : "+";
        equation += Term(row, names, firstIsLowest, !fromZeros);
    }
    return equation;
}

} // namespace

std::string HexInitValue(const std::vector<unsigned int>& column, bool upperCase)
{
    std::string text = "0x";
    unsigned int digit = 0;
    size_t numRows = 0;
    for (size_t row = column.size(); row-- > 0;) {
        if (numRows != 0 && numRows % 4 == 0) {
            text += HexDigit(digit, upperCase);
            digit = 0;
            numRows = 0;
        }
        digit = digit * 2 + (column[row] != 0 ? 1 : 0);
        ++numRows;
    }
    return text + HexDigit(digit, upperCase);
}

std::string BinaryInitValue(const std::vector<unsigned int>& column)
{
    std::string text = "0b";
    for (size_t row = column.size(); row-- > 0;)
        text += column[row] != 0 ? "1" : "0";
    return text;
}

std::string ReadInitValue(const std::string& text, const std::vector<std::string>& names,
                          bool firstIsLowest)
{
    if (text.size() < 3 || text[0] != '0')
        return "";
    if (text[1] == 'x' || text[1] == 'X')
        return ReadBinary(HexToBinary(text), names, firstIsLowest);
    if (text[1] == 'b' || text[1] == 'B')
        return ReadBinary(text, names, firstIsLowest);
    return "";
}

} // namespace reference
