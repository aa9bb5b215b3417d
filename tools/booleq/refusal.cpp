#include "refusal.h"

#include <algorithm>
#include <cstring>

#include "core/text.h"

namespace booleq {

namespace {

std::string At(size_t position)
{
    return " at character " + std::to_string(position + 1);
}

// Inputs that a binary init value of this many digits is read over.
size_t NumInputsForDigits(size_t numDigits)
{
    size_t numInputs = 0;
    for (size_t highestRow = numDigits - 1; highestRow > 0; highestRow /= 2)
        ++numInputs;
    return numInputs;
}

// An init value begins with 0x or 0b; with listed inputs nothing else may begin with 0.
bool IsTakenForInitValue(const std::string& text, const Reading& reading)
{
    if (text.size() < 3 || text[0] != '0')
        return false;
    return reading.hasInputs || std::strchr("xXbB", text[1]);
}

// Empty when nothing is wrong with the digits and their number.
std::string ExplainInitValue(const std::string& text, const Reading& reading)
{
    if (!std::strchr("xXbB", text[1]))
        return "with --inputs a text that begins with 0 is read as an init value (0x... or "
               "0b...): put an expression that begins so in parentheses";
    const bool isHex = text[1] == 'x' || text[1] == 'X';
    const char* kind = isHex ? "hexadecimal" : "binary";
    const char* digits = isHex ? "0123456789abcdefABCDEF" : "01";
    const size_t noDigit = text.find_first_not_of(digits, 2);
    if (noDigit != std::string::npos)
        return "'" + Visible(text.substr(noDigit, 1)) + "'" + At(noDigit) + " is no " + kind +
               " digit";
    const size_t numDigits = text.size() - 2;
    const size_t numNeeded = NumInputsForDigits(isHex ? 4 * numDigits : numDigits);
    const std::string needs =
        std::to_string(numDigits) + " " + kind + (numDigits == 1 ? " digit is" : " digits are") +
        " read over exactly " + std::to_string(numNeeded) + (numNeeded == 1 ? " input" : " inputs");
    if (!reading.hasInputs)
        return needs + ": name them with --inputs, the most significant first";
    const size_t numUsable = CheckInputs(reading.inputs).usable.size();
    if (numUsable == numNeeded)
        return std::string();
    return needs + ", --inputs gives " + std::to_string(numUsable);
}

bool IsOperatorWord(const std::string& word)
{
    static const char* const kWords[] = {".AND.",  ".NAND.", ".NOR.", ".NOT.",
                                         ".NXOR.", ".OR.",   ".XOR."};
    const auto equals = [&word](const char* known) { return word == known; };
    return std::any_of(std::begin(kWords), std::end(kWords), equals);
}

std::string ExplainCharacter(char character, size_t position)
{
    if (character == '\r')
        return "the carriage return" + At(position) +
               " is no blank: remove it (DOS line ends: tr -d '\\r')";
    const std::string shown = "'" + Visible(std::string(1, character)) + "'" + At(position);
    if (character >= '2' && character <= '9')
        return shown + " is no constant (0 and 1 are), and a name that begins with a digit needs "
                       "single quotes";
    return shown + " is not part of the syntax; a name with such a character needs single quotes";
}

bool IsNameStart(char character)
{
    return (character >= 'A' && character <= 'Z') || (character >= 'a' && character <= 'z') ||
           character == '_';
}

size_t NameEnd(const std::string& text, size_t position)
{
    while (position < text.size() &&
           (IsNameStart(text[position]) || (text[position] >= '0' && text[position] <= '9')))
        ++position;
    return position;
}

// A quoted name or a word between dots that starts at 'position', which moves behind it.
// The answer is what is wrong with it, empty when nothing is.
std::string SkipDelimited(const std::string& text, size_t& position)
{
    const size_t start = position;
    const bool isQuote = text[start] == '\'';
    const size_t end = text.find(text[start], start + 1);
    if (end == std::string::npos)
        return isQuote ? "the quote" + At(start) + " is not closed; not-A is written ~A, not A'"
                       : "the '.'" + At(start) + " has no second '.': words like .AND. have two";
    position = end + 1;
    const std::string word = text.substr(start, position - start);
    if (isQuote || IsOperatorWord(word))
        return std::string();
    return Excerpt(word) + At(start) +
           " is no operator; the words are .AND. .OR. .XOR. .NOT. .NAND. .NOR. .NXOR.";
}

bool IsDoubledOperator(const std::string& text, size_t position)
{
    return std::strchr("&*|+^@", text[position]) && text.size() > position + 1 &&
           text[position + 1] == text[position];
}

// "~ |", which negates the result of the operator and binds tightly, where "~|" may be meant.
bool HasSplitNegation(const std::string& text)
{
    size_t position = text.find_first_of("~!");
    while (position != std::string::npos) {
        const size_t next = text.find_first_not_of(" \t\n", position + 1);
        if (next == std::string::npos)
            return false;
        if (next > position + 1 && std::strchr("&*|+^@", text[next]))
            return true;
        position = text.find_first_of("~!", position + 1);
    }
    return false;
}

// The first fault that shows without knowing which operator takes which operand: quotes, operator
// words, parentheses, characters that stand for nothing. Empty when there is none.
std::string FindPlainFault(const std::string& text)
{
    size_t numOpen = 0;
    for (size_t position = 0; position < text.size();) {
        const char character = text[position];
        if (IsNameStart(character)) {
            position = NameEnd(text, position);
            continue;
        }
        if (character == '\'' || character == '.') {
            std::string fault = SkipDelimited(text, position);
            if (!fault.empty())
                return fault;
            continue;
        }
        if (!std::strchr("()&*|+^@~!01 \t\n", character))
            return ExplainCharacter(character, position);
        if (IsDoubledOperator(text, position))
            return "'" + text.substr(position, 2) + "'" + At(position) +
                   " is two operators in a row: write '" + character + "'";
        if (character == '(')
            ++numOpen;
        if (character == ')' && numOpen-- == 0)
            return "the ')'" + At(position) + " closes no '('";
        ++position;
    }
    return numOpen == 0 ? std::string() : std::to_string(numOpen) + " '(' without a ')'";
}

} // namespace

std::string ExplainRefusal(const std::string& text, const Reading& reading)
{
    std::string reason;
    if (IsTakenForInitValue(text, reading))
        reason = ExplainInitValue(text, reading);
    if (reason.empty())
        reason = FindPlainFault(text);
    if (!reason.empty())
        return reason;
    reason = "operators and operands do not fit together: a binary operator needs an operand on "
             "each side, '~' one behind it, and two operands an operator between them";
    if (HasSplitNegation(text))
        reason += "; '~ |' with a blank is not the operator '~|'";
    return reason;
}

} // namespace booleq
