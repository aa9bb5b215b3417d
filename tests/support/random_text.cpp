// Texts grow from a budget of tokens; depth is limited only to keep this generator's recursion
// small.
#include "support/random_text.h"

#include <utility>

namespace support {

namespace {

const size_t kMaxDepth = 40;

const std::vector<std::string> kBinary = {
    "&",  "*",      ".AND.", "|",  "+",  ".OR.", "^",     "@",  ".XOR.", "~&", "!&", "~*",
    "!*", ".NAND.", "~|",    "!|", "~+", "!+",   ".NOR.", "~^", "!^",    "~@", "!@", ".NXOR."};
const std::vector<std::string> kNot = {"~", "!", ".NOT."};

} // namespace

std::string RandomText::Blank()
{
    static const std::vector<std::string> kBlanks = {" ", " ", " ", "  ", "\t", "\n", " \n\t"};
    return Chance(60) ? OneOf(kBlanks) : "";
}

// One random choice in each statement, because the operands of '+' are evaluated in no fixed order.
std::string RandomText::Operand(size_t& budget, size_t depth, const std::vector<std::string>& names,
                                bool hasNegatedOperators)
{
    if (budget > 0)
        --budget;
    const size_t kind = Below(100);
    std::string text;
    if (kind < 15 && depth < kMaxDepth) {
        text = OneOf(kNot);
        text += Blank();
        text += Operand(budget, depth + 1, names, hasNegatedOperators);
        return text;
    }
    if (kind < 40 && budget > 2 && depth < kMaxDepth) {
        budget -= 2;
        text = "(";
        text += Blank();
        if (Chance(97))
            text += Chain(budget, depth + 1, names, hasNegatedOperators);
        text += Blank();
        text += ")";
        return text;
    }
    if (kind < 47)
        return Chance(50) ? "0" : "1";
    return OneOf(names);
}

std::string RandomText::Chain(size_t& budget, size_t depth, const std::vector<std::string>& names,
                              bool hasNegatedOperators)
{
    std::string text = Operand(budget, depth, names, hasNegatedOperators);
    size_t numOperators = Below(depth == 0 ? 1 + budget : 4);
    while (budget > 1 && numOperators-- > 0) {
        --budget;
        // No negated operator after a group, whose two child slots are both used.
        const bool isNegated = hasNegatedOperators && text.back() != ')' && Chance(25);
        text += Blank();
        if (isNegated) {
            text += OneOf(kNot);
            text += " ";
        }
        text += OneOf(kBinary);
        text += Blank();
        text += Operand(budget, depth, names, hasNegatedOperators);
    }
    return text;
}

std::string RandomText::WellFormed(size_t numTokens, const std::vector<std::string>& names,
                                   bool hasNegatedOperators)
{
    size_t budget = numTokens;
    std::string text = Blank();
    text += Chain(budget, 0, names, hasNegatedOperators);
    text += Blank();
    return text;
}

std::string RandomText::TokenSoup(size_t numTokens, const std::vector<std::string>& names)
{
    std::string text;
    size_t numOpen = 0;
    for (size_t position = 0; position < numTokens; ++position) {
        switch (Below(8)) {
        case 0:
            text += "(";
            ++numOpen;
            break;
        case 1:
            text += numOpen > 0 ? ")" : "0";
            numOpen -= numOpen > 0;
            break;
        case 2:
            text += OneOf(kNot);
            break;
        case 3:
        case 4:
        case 5:
            text += OneOf(kBinary);
            break;
        default:
            text += OneOf(names);
        }
        text += Chance(80) ? " " : "";
    }
    return Chance(90) ? text + std::string(numOpen, ')') : text;
}

std::string RandomText::Mutated(const std::string& original)
{
    std::string text = original;
    for (size_t numChanges = 1 + Below(3); numChanges > 0 && !text.empty(); --numChanges) {
        const size_t position = Below(text.size());
        switch (Below(4)) {
        case 0:
            text.erase(position, 1 + Below(3));
            break;
        case 1:
            text.insert(position, std::string(text, position, 1 + Below(3)));
            break;
        case 2:
            std::swap(text[position], text[Below(text.size())]);
            break;
        default:
            text[position] = Bytes(1)[0];
        }
    }
    return text;
}

std::string RandomText::Bytes(size_t numBytes)
{
    const std::string common = "AaZz_0123456789()&*|+^@~!.'xXbB \t\n\r";
    std::string text;
    while (text.size() < numBytes)
        text += Chance(90) ? common[Below(common.size())] : static_cast<char>(Below(256));
    return text;
}

std::string RandomText::BinaryInitValue(size_t numDigits)
{
    // All ones and all zeros are separate kinds.
    const size_t percentOnes = std::vector<size_t>{0, 10, 50, 90, 100}[Below(5)];
    std::string text = Chance(80) ? "0b" : "0B";
    while (text.size() < numDigits + 2)
        text += Chance(percentOnes) ? '1' : '0';
    return text;
}

std::string RandomText::HexInitValue(size_t numDigits)
{
    const std::string digits = "0123456789abcdefABCDEF";
    const size_t percentAny = Chance(50) ? 100 : 20;
    const char usual = Chance(50) ? '0' : 'f';
    std::string text = Chance(80) ? "0x" : "0X";
    while (text.size() < numDigits + 2)
        text += Chance(percentAny) ? digits[Below(digits.size())] : usual;
    return text;
}

} // namespace support
