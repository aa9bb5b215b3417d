// The result column as an init value, hexadecimal or binary, the highest row first; and the
// equation that lists an init value's inputs.
// Fails: std::bad_alloc.  Cost: O(nodes * 2^n / 64) for the column, O(2^n) for the text.
#include <Kq_BoolEquationImp.h>

#include <algorithm>

#include "Kq_BoolEquationImpColumn.h"
#include "Kq_BoolEquationImpInitText.h"
#include "Kq_BoolEquationImpStore.h"

typedef Port::StringBase<char> String;

namespace {

// Deliberate: the limit of the truth table, whose column an init value is.
constexpr unsigned int kMaxVariables = 30;

constexpr size_t kWords = 64;

// Appends the digits of the words given, the last word's first. Each digit shows 'digitBits' bits
// of a word's lowest 'wordBits'; 'digits' are the characters for the values.
void AppendDigits(const uint64_t* words, size_t numWords, unsigned int wordBits,
                  unsigned int digitBits, const char* digits, String& text)
{
    char piece[kWords * 64 + 1];
    size_t length = 0;
    for (size_t word = numWords; word-- > 0;) {
        for (unsigned int bit = wordBits; bit > 0; bit -= digitBits)
            piece[length++] = digits[words[word] >> (bit - digitBits) & ((1u << digitBits) - 1)];
    }
    piece[length] = '\0';
    text += piece;
}

// Appends the column of 'numVariables' variables, from the highest row to the lowest, in pieces
// that fill(firstWord, numWords, words) computes.
template <class Fill>
void AppendColumn(unsigned int numVariables, unsigned int digitBits, const char* digits, Fill fill,
                  String& text)
{
    const uint64_t numRows = uint64_t(1) << numVariables;
    const unsigned int wordBits = static_cast<unsigned int>(std::min<uint64_t>(numRows, 64));
    uint64_t words[kWords];
    for (uint64_t end = (numRows + 63) / 64; end > 0;) {
        const size_t numWords = std::min<uint64_t>(kWords, end);
        end -= numWords;
        fill(end, numWords, words);
        // One variable has two rows, which are one hexadecimal digit of two bits.
        AppendDigits(words, numWords, wordBits, std::min(digitBits, wordBits), digits, text);
    }
}

// Packs the results of rows that were evaluated one by one.
void PackRows(const std::vector<Kq_BoolEquationImp::TruthTable::Row>& rows, uint64_t firstWord,
              size_t numWords, uint64_t* words)
{
    std::fill_n(words, numWords, uint64_t(0));
    const uint64_t firstRow = firstWord * 64;
    const uint64_t endRow = std::min<uint64_t>(rows.size(), firstRow + numWords * 64);
    for (uint64_t row = firstRow; row < endRow; ++row) {
        if (rows[row].GetResultValue())
            words[(row - firstRow) / 64] |= uint64_t(1) << (row % 64);
    }
}

// Appends the init value's digits; nothing when the equation has no truth table.
void AppendInitValue(const Kq_BoolEquationImp& equation, unsigned int digitBits, const char* digits,
                     String& text)
{
    const unsigned int numVariables = equation.GetNumVariables();
    if (!equation || numVariables == 0 || numVariables > kMaxVariables)
        return;
    if (Kq_BoolEquationImp::GetInternalDebugMode()) {
        // The table evaluates node by node, because there the trace is output.
        const Kq_BoolEquationImp::TruthTable table = equation.GetTruthTable();
        AppendColumn(
            numVariables, digitBits, digits,
            [&](uint64_t firstWord, size_t numWords, uint64_t* words) {
                PackRows(table.GetRows(), firstWord, numWords, words);
            },
            text);
        return;
    }
    KqColumn column(equation.GetRoot(), numVariables);
    AppendColumn(
        numVariables, digitBits, digits,
        [&](uint64_t firstWord, size_t numWords, uint64_t* words) {
            column.Fill(firstWord, numWords, words);
        },
        text);
}

} // namespace

bool Kq_BoolEquationImp::HasInitValuePrefix(char lowerCase, char upperCase) const
{
    if (!HasTruthTableRoot())
        return false;
    const String& token = m_store->m_root->GetToken();
    return token.length() >= KqInitText::kPrefixLength && token.c_str()[0] == '0' &&
           (token.c_str()[1] == lowerCase || token.c_str()[1] == upperCase);
}

bool Kq_BoolEquationImp::IsHexInitValue() const
{
    return HasInitValuePrefix('x', 'X');
}

bool Kq_BoolEquationImp::IsBinaryInitValue() const
{
    return HasInitValuePrefix('b', 'B');
}

String Kq_BoolEquationImp::GetEquationAsHexInitValue(bool upperCase) const
{
    String text = "0x";
    AppendInitValue(*this, 4, upperCase ? "0123456789ABCDEF" : "0123456789abcdef", text);
    // Deliberate: without a truth table one digit 0 is written, for the constant 1 as well.
    if (text.length() == KqInitText::kPrefixLength)
        text += '0';
    return text;
}

String Kq_BoolEquationImp::GetEquationAsBinaryInitValue() const
{
    // Deliberate: without a truth table no digit is written, unlike in the hexadecimal form.
    String text = "0b";
    AppendInitValue(*this, 1, "01", text);
    return text;
}

String Kq_BoolEquationImp::GetInitValueTermEquation() const
{
    String text;
    for (size_t index = m_variables.size(); index-- > 0;) {
        text += m_variables[index].first;
        if (index > 0)
            text += '+';
    }
    return text;
}
