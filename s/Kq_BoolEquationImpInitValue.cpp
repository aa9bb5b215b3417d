// The result column as an init value, hexadecimal or binary, the highest row first; and the
// equation that lists an init value's inputs.
// Fails: std::bad_alloc.  Cost: O(nodes * 2^n / 64) for the column, O(2^n) for the text.
#include <Kq_BoolEquationImp.h>

#include <algorithm>
#include <cstring>

#include "Kq_BoolEquationImpInitText.h"
#include "Kq_BoolEquationImpResults.h"
#include "Kq_BoolEquationImpStore.h"

typedef Kq_BoolEquationImp::Store Store;
typedef Port::StringBase<char> String;

namespace {

// Words of the column that are turned into text at a time: 2^17 rows.
constexpr size_t kPieceWords = 2048;

enum BASE : unsigned int { BINARY = 1, HEXADECIMAL = 4 }; // bits per digit

// The digits of a byte of the column, the highest row first.
template <size_t kNumDigits>
struct ByteDigits {
    char digits[256][kNumDigits];
};

template <unsigned int kDigitBits>
constexpr ByteDigits<8 / kDigitBits> MakeByteDigits(const char* characters)
{
    ByteDigits<8 / kDigitBits> table = {};
    for (unsigned int byte = 0; byte < 256; ++byte) {
        for (unsigned int digit = 0; digit < 8 / kDigitBits; ++digit)
            table.digits[byte][digit] =
                characters[byte >> (8 - kDigitBits * (digit + 1)) & ((1u << kDigitBits) - 1)];
    }
    return table;
}

constexpr char kLowerDigits[] = "0123456789abcdef";
constexpr char kUpperDigits[] = "0123456789ABCDEF";

constexpr ByteDigits<2> kLowerHex = MakeByteDigits<HEXADECIMAL>(kLowerDigits);
constexpr ByteDigits<2> kUpperHex = MakeByteDigits<HEXADECIMAL>(kUpperDigits);
constexpr ByteDigits<8> kBits = MakeByteDigits<BINARY>(kLowerDigits);

// Writes the digits of the words, the last word's highest row first, and returns the text's end.
template <size_t kNumDigits>
char* WriteWords(const uint64_t* words, size_t numWords, const ByteDigits<kNumDigits>& table,
                 char* text)
{
    for (size_t word = numWords; word-- > 0;) {
        for (unsigned int byte = 8; byte-- > 0; text += kNumDigits)
            std::memcpy(text, table.digits[words[word] >> (8 * byte) & 0xffu], kNumDigits);
    }
    return text;
}

// Appends the digits of a column of up to six variables.
void AppendFewRows(uint64_t word, unsigned int numVariables, BASE base, bool upperCase,
                   String& text)
{
    // One variable has two rows, which are one hexadecimal digit of two bits.
    const unsigned int numRows = 1u << numVariables;
    const unsigned int digitBits = std::min<unsigned int>(base, numRows);
    const char* digits = upperCase ? kUpperDigits : kLowerDigits;
    char buffer[64 + 1];
    char* end = buffer;
    for (unsigned int bit = numRows; bit > 0; bit -= digitBits)
        *end++ = digits[word >> (bit - digitBits) & ((1u << digitBits) - 1)];
    *end = '\0';
    text += buffer;
}

// Appends the digits of the words, the last word's highest row first.
void AppendWords(const uint64_t* words, size_t numWords, BASE base, bool upperCase,
                 std::vector<char>& buffer, String& text)
{
    buffer.resize(numWords * 64 / base + 1);
    char* end = nullptr;
    if (base == BINARY)
        end = WriteWords(words, numWords, kBits, buffer.data());
    else
        end = WriteWords(words, numWords, upperCase ? kUpperHex : kLowerHex, buffer.data());
    *end = '\0';
    text += buffer.data();
}

// Packs the results of all rows, which were evaluated one by one.
std::vector<uint64_t> PackRows(const std::vector<Kq_BoolEquationImp::TruthTable::Row>& rows)
{
    std::vector<uint64_t> words((rows.size() + 63) / 64);
    for (size_t row = 0; row < rows.size(); ++row)
        words[row / 64] |= uint64_t(rows[row].GetResultValue() ? 1 : 0) << (row % 64);
    return words;
}

// Appends the column of more than six variables in pieces, from the highest row to the lowest.
void AppendColumn(KqResults results, BASE base, bool upperCase, String& text)
{
    std::vector<uint64_t> words(std::min<uint64_t>(kPieceWords, results.GetNumWords()));
    std::vector<char> buffer;
    for (uint64_t end = results.GetNumWords(); end > 0; end -= words.size()) {
        results.Fill(end - words.size(), words.size(), words.data());
        AppendWords(words.data(), words.size(), base, upperCase, buffer, text);
    }
}

// Appends the init value's digits; nothing when the equation has no truth table.
void AppendDigits(const Kq_BoolEquationImp& equation, Store& store, BASE base, bool upperCase,
                  String& text)
{
    const unsigned int numVariables = equation.GetNumVariables();
    if (!equation || numVariables == 0 || numVariables > kKqMaxColumnVariables)
        return;
    if (Kq_BoolEquationImp::GetInternalDebugMode()) {
        // The table evaluates node by node, because there the trace is output.
        const std::vector<uint64_t> words = PackRows(equation.GetTruthTable().GetRows());
        std::vector<char> buffer;
        if (numVariables <= 6)
            AppendFewRows(words[0], numVariables, base, upperCase, text);
        else
            AppendWords(words.data(), words.size(), base, upperCase, buffer, text);
    } else if (numVariables <= 6) {
        AppendFewRows(store.GetWord(numVariables), numVariables, base, upperCase, text);
    } else {
        AppendColumn(KqResults(store, numVariables), base, upperCase, text);
    }
}

// Whether 'initValue', null for none, starts with a 0 and the given character in either case.
bool HasPrefix(const String* initValue, char lowerCase, char upperCase)
{
    return initValue && initValue->length() >= KqInitText::kPrefixLength &&
           initValue->c_str()[0] == '0' &&
           (initValue->c_str()[1] == lowerCase || initValue->c_str()[1] == upperCase);
}

} // namespace

bool Kq_BoolEquationImp::IsHexInitValue() const
{
    return HasPrefix(m_store->GetInitValue(), 'x', 'X');
}

bool Kq_BoolEquationImp::IsBinaryInitValue() const
{
    return HasPrefix(m_store->GetInitValue(), 'b', 'B');
}

String Kq_BoolEquationImp::GetEquationAsHexInitValue(bool upperCase) const
{
    String text = "0x";
    AppendDigits(*this, *m_store, HEXADECIMAL, upperCase, text);
    // Deliberate: without a truth table one digit 0 is written, for the constant 1 as well.
    if (text.length() == KqInitText::kPrefixLength)
        text += '0';
    return text;
}

String Kq_BoolEquationImp::GetEquationAsBinaryInitValue() const
{
    // Deliberate: without a truth table no digit is written, unlike in the hexadecimal form.
    String text = "0b";
    AppendDigits(*this, *m_store, BINARY, false, text);
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
