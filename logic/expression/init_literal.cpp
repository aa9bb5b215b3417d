#include "init_literal.h"

#include <algorithm>
#include <cassert>

#include "function.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kMaxSizeDigits = 12;
constexpr char kBlanks[] = " \t\n";

bool IsDigit(char character)
{
    return character >= '0' && character <= '9';
}

// The value of a hexadecimal digit; 16 for any other character.
unsigned int HexDigit(char character)
{
    if (IsDigit(character))
        return static_cast<unsigned int>(character - '0');
    const char lower = static_cast<char>(character | 0x20);
    return lower >= 'a' && lower <= 'f' ? static_cast<unsigned int>(lower - 'a') + 10 : 16;
}

// Where the parts of a sized literal are; quote is npos if the text is not one.
struct Parts {
    size_t start = 0;
    size_t quote = std::string::npos;
    size_t end = 0; // after the last digit
};

Parts FindParts(const std::string& text)
{
    Parts parts;
    parts.start = text.find_first_not_of(kBlanks);
    if (parts.start == std::string::npos)
        return parts;
    parts.end = text.find_last_not_of(kBlanks) + 1;
    size_t position = parts.start;
    while (position < parts.end && IsDigit(text[position]))
        ++position;
    const bool isSized = position > parts.start && position < parts.end && text[position] == '\'' &&
                         position + 1 < parts.end && text[position + 1] != '\'';
    // A second quote would make it a quoted name.
    if (isSized && text.find('\'', position + 1) == std::string::npos)
        parts.quote = position;
    return parts;
}

InitLiteral Refused(const char* code, size_t offset, size_t length, std::string reason,
                    std::string hint)
{
    InitLiteral literal;
    literal.code = code;
    literal.offset = offset;
    literal.length = length;
    literal.reason = std::move(reason);
    literal.hint = std::move(hint);
    return literal;
}

// The digits in the base, without separators and with the zeros that were left out.
InitLiteral ReadDigits(const std::string& text, const Parts& parts, uint64_t numRows)
{
    const bool isHex = (text[parts.quote + 1] | 0x20) == 'h';
    const uint64_t rowsPerDigit = isHex ? 4 : 1;
    const auto numDigits = static_cast<size_t>((numRows + rowsPerDigit - 1) / rowsPerDigit);
    std::string digits;
    for (size_t position = parts.quote + 2; position < parts.end; ++position) {
        if (text[position] == '_')
            continue;
        if (HexDigit(text[position]) >= (isHex ? 16u : 2u))
            return Refused("init-digit", position, 1,
                           "'" + Visible(text.substr(position, 1)) + "' is not a " +
                               (isHex ? "hexadecimal" : "binary") + " digit",
                           "");
        if (digits.empty() && text[position] == '0')
            continue;
        digits += text[position];
    }
    const bool isTooLong = digits.size() > numDigits;
    const bool isTooLarge =
        isHex && numRows < 4 && digits.size() == 1 && HexDigit(digits[0]) >= 1u << numRows;
    if (isTooLong || isTooLarge)
        return Refused("init-width", parts.quote + 2, parts.end - parts.quote - 2,
                       "the digits do not fit into " + Count(numRows, "bit"), "");
    InitLiteral literal;
    literal.text = (isHex ? "0x" : "0b") + std::string(numDigits - digits.size(), '0') + digits;
    return literal;
}

// Suggests the same digits with the size of the listed inputs, or the inputs for the size.
std::string SizeHint(const std::string& text, const Parts& parts, uint64_t numRows)
{
    const std::string size = text.substr(parts.start, parts.quote - parts.start);
    std::string hint;
    if (numRows != 0 && !ReadDigits(text, parts, numRows).code)
        hint = "write " +
               Excerpt(std::to_string(numRows) + text.substr(parts.quote, parts.end - parts.quote));
    for (size_t numInputs = 1; numInputs <= kMaxFunctionInputs; ++numInputs)
        if (size == std::to_string(uint64_t(1) << numInputs))
            hint += (hint.empty() ? "list " : ", or list ") + Count(numInputs, "input");
    return hint;
}

InitLiteral ReadSized(const std::string& text, const Parts& parts, size_t numInputs)
{
    const char base = static_cast<char>(text[parts.quote + 1] | 0x20);
    if (base != 'h' && base != 'b')
        return Refused("init-digit", parts.quote + 1, 1,
                       "a sized init value is hexadecimal ('h) or binary ('b)", "");
    if (text.find_first_not_of('_', parts.quote + 2) >= parts.end)
        return Refused("init-digit", parts.quote + 1, 1, "no digits follow the base", "");
    const std::string size = text.substr(parts.start, parts.quote - parts.start);
    const uint64_t numRows = numInputs < 60 ? uint64_t(1) << numInputs : 0;
    if (size.size() > kMaxSizeDigits || numRows == 0 || std::stoull(size) != numRows)
        return Refused(
            "init-width", parts.start, size.size(),
            "a size of " + Excerpt(size) + " does not fit " + Count(numInputs, "listed input") +
                (numRows != 0 ? ", which " + std::string(numInputs == 1 ? "has " : "have ") +
                                    Count(numRows, "row")
                              : ""),
            SizeHint(text, parts, numRows));
    return ReadDigits(text, parts, numRows);
}

} // namespace

InitLiteral ReadInitLiteral(const std::string& text, size_t numInputs)
{
    const Parts parts = FindParts(text);
    InitLiteral literal;
    literal.text = text;
    if (parts.quote != std::string::npos)
        literal = ReadSized(text, parts, numInputs);
    // The library reads a hexadecimal digit as four rows, and one input has two.
    const bool isLoneDigit = numInputs == 1 && literal.text.size() == 3 && literal.text[0] == '0' &&
                             (literal.text[1] | 0x20) == 'x' && HexDigit(literal.text[2]) < 4;
    if (isLoneDigit && !literal.code) {
        const unsigned int rows = HexDigit(literal.text[2]);
        literal.text = std::string("0b") + (rows >> 1 != 0 ? '1' : '0') + (rows & 1u ? '1' : '0');
    }
    assert(literal.code || !literal.text.empty() || text.empty());
    return literal;
}

bool IsSizedLiteral(const std::string& text)
{
    return FindParts(text).quote != std::string::npos;
}

} // namespace booleq
