// Init value in, packed results out, and the expression that they stand for.
// Fails: std::bad_alloc.  Cost: O(digits) to read, O(terms * names) for the expression.
#include "Digits.h"

#include <algorithm>
#include <cassert>
#include <cstring>

#include "Tokens.h"
#include "Word.h"

typedef KqDigits::String String;

namespace {

// Bits per digit: 4 for "0x" and "0X", 1 for "0b" and "0B", 0 for any other prefix.
unsigned int BitsPerDigit(const String& text)
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

constexpr uint8_t kNoDigit = 0xff;

struct DigitValues {
    uint8_t of[256];
};

constexpr DigitValues MakeDigitValues()
{
    DigitValues table = {};
    for (uint8_t& value : table.of)
        value = kNoDigit;
    for (unsigned int digit = 0; digit < 10; ++digit)
        table.of['0' + digit] = static_cast<uint8_t>(digit);
    for (unsigned int digit = 10; digit < 16; ++digit) {
        table.of['a' + digit - 10] = static_cast<uint8_t>(digit);
        table.of['A' + digit - 10] = static_cast<uint8_t>(digit);
    }
    return table;
}

constexpr DigitValues kDigitValues = MakeDigitValues();

// The digits as a number, the last one lowest; ors their values into 'seen'.
// Requires: at most 64 bits.
template <unsigned int kDigitBits>
inline uint64_t ReadWord(const char* digits, size_t numDigits, unsigned int& seen)
{
    uint64_t word = 0;
    for (size_t position = 0; position < numDigits; ++position) {
        const unsigned int value = kDigitValues.of[static_cast<unsigned char>(digits[position])];
        seen |= value;
        word = word << kDigitBits | value;
    }
    return word;
}

// Packs the digits, the last one being row 0; false when one is not a digit of its base.
template <unsigned int kDigitBits>
bool ReadWords(const char* digits, size_t numDigits, uint64_t* words)
{
    constexpr size_t kDigitsPerWord = 64 / kDigitBits;
    unsigned int seen = 0;
    const char* end = digits + numDigits;
    for (; static_cast<size_t>(end - digits) >= kDigitsPerWord; end -= kDigitsPerWord)
        *words++ = ReadWord<kDigitBits>(end - kDigitsPerWord, kDigitsPerWord, seen);
    if (end != digits)
        *words = ReadWord<kDigitBits>(digits, static_cast<size_t>(end - digits), seen);
    return seen < 1u << kDigitBits;
}

// How many variables a value of 'numRows' rows has: as many as it takes to number its rows.
unsigned int RequiredVariables(uint64_t numRows)
{
    unsigned int numVariables = 0;
    for (uint64_t highestRow = numRows - 1; highestRow != 0; highestRow >>= 1)
        ++numVariables;
    return numVariables;
}

// Exchanges two bits in all row numbers.  Requires: low < high.
void SwapRowBits(unsigned int low, unsigned int high, std::vector<uint64_t>& words)
{
    assert(low < high);
    if (high < 6) {
        // A row with only the low bit set changes places with the one with only the high bit set.
        const unsigned int distance = (1u << high) - (1u << low);
        const uint64_t movers = kKqRowsWithBit[low] & ~kKqRowsWithBit[high];
        for (uint64_t& word : words) {
            const uint64_t changes = ((word >> distance) ^ word) & movers;
            word ^= changes | changes << distance;
        }
        return;
    }
    const size_t highStep = size_t(1) << (high - 6);
    assert(words.size() % (2 * highStep) == 0);
    for (size_t word = 0; word < words.size(); ++word) {
        if ((word & highStep) != 0)
            continue;
        if (low >= 6) {
            const size_t lowStep = size_t(1) << (low - 6);
            if ((word & lowStep) != 0)
                std::swap(words[word], words[word + highStep - lowStep]);
            continue;
        }
        const unsigned int distance = 1u << low;
        uint64_t& above = words[word + highStep];
        const uint64_t changes = ((words[word] >> distance) ^ above) & ~kKqRowsWithBit[low];
        above ^= changes;
        words[word] ^= changes << distance;
    }
}

// Every bit of the lower half twice.
uint64_t DoubleBits(uint64_t word)
{
    uint64_t bits = word & 0xffffffffu;
    for (unsigned int bit = 5; bit-- > 0;)
        bits = (bits | bits << (1u << bit)) & ~kKqRowsWithBit[bit];
    return bits | bits << 1;
}

// Makes the lowest 2^numVariables rows of a word repeat up to its end.
uint64_t RepeatRows(uint64_t word, size_t numVariables)
{
    for (size_t level = numVariables; level < 6; ++level)
        word |= word << (1u << level);
    return word;
}

} // namespace

KqDigits::KqDigits(const String& text, const Variables& inputs, bool isFirstLowest)
    : m_text(text), m_is_first_lowest(isFirstLowest)
{
    m_names.reserve(inputs.size());
    for (const auto& input : inputs)
        m_names.push_back(input.first);
}

size_t KqDigits::FindBadDigit(const String& text)
{
    const unsigned int bitsPerDigit = BitsPerDigit(text);
    if (bitsPerDigit == 0)
        return 1;
    size_t position = kPrefixLength;
    while (position < text.length() &&
           kDigitValues.of[static_cast<unsigned char>(text.c_str()[position])] < 1u << bitsPerDigit)
        ++position;
    return position;
}

std::unique_ptr<KqDigits> KqDigits::Read(const String& text, const Variables& inputs,
                                         bool isFirstLowest)
{
    const unsigned int bitsPerDigit = BitsPerDigit(text);
    const uint64_t numDigits = uint64_t(text.length() - kPrefixLength) * bitsPerDigit;
    if (bitsPerDigit == 0 || RequiredVariables(numDigits) != inputs.size())
        return nullptr;
    std::unique_ptr<KqDigits> value(new KqDigits(text, inputs, isFirstLowest));
    value->m_num_digits = numDigits;
    if (!value->ReadDigits(bitsPerDigit))
        return nullptr;
    value->ChooseForm();
    value->AddMissingRows();
    if (isFirstLowest)
        value->ReverseRows();
    if (inputs.size() < 6)
        value->m_words[0] = RepeatRows(value->m_words[0], inputs.size());
    assert(value->m_num_terms > 0); // invariant 2
    return value;
}

bool KqDigits::ReadDigits(unsigned int bitsPerDigit)
{
    m_words.resize(m_names.size() <= 6 ? 1 : size_t(1) << (m_names.size() - 6));
    const char* const digits = m_text.c_str() + kPrefixLength;
    const size_t numDigits = m_text.length() - kPrefixLength;
    return bitsPerDigit == 4 ? ReadWords<4>(digits, numDigits, m_words.data())
                             : ReadWords<1>(digits, numDigits, m_words.data());
}

void KqDigits::ChooseForm()
{
    uint64_t numOnes = 0;
    for (const uint64_t word : m_words)
        numOnes += KqCountBits(word);
    const uint64_t numZeros = m_num_digits - numOnes;
    m_is_sum = numOnes != 0 && (numZeros == 0 || numOnes < numZeros);
    m_num_terms = static_cast<size_t>(m_is_sum ? numOnes : numZeros);
}

// Gives the rows without a digit the result that an expression without their terms has.
void KqDigits::AddMissingRows()
{
    const uint64_t numRows = uint64_t(1) << m_names.size();
    if (m_is_sum || m_num_digits == numRows)
        return;
    size_t word = static_cast<size_t>(m_num_digits / 64);
    if (m_num_digits % 64 != 0)
        m_words[word++] |= ~uint64_t(0) << (m_num_digits % 64);
    std::fill(m_words.begin() + static_cast<std::ptrdiff_t>(word), m_words.end(), ~uint64_t(0));
    if (numRows < 64)
        m_words[0] &= (uint64_t(1) << numRows) - 1;
}

// Converts from the order of the digits, whose lowest bit is the first name's, to that of the rows.
void KqDigits::ReverseRows()
{
    const unsigned int numNames = static_cast<unsigned int>(m_names.size());
    for (unsigned int low = 0; low < numNames / 2; ++low)
        SwapRowBits(low, numNames - 1 - low, m_words);
}

uint64_t KqDigits::ReverseBits(uint64_t row) const
{
    uint64_t reversed = 0;
    for (size_t bit = 0; bit < m_names.size(); ++bit, row >>= 1)
        reversed = reversed << 1 | (row & 1u);
    return reversed;
}

bool KqDigits::IsExact() const
{
    // Deliberate: over no names the expression is an empty group, which is 0 whatever the digit.
    return !m_names.empty() && std::all_of(m_names.begin(), m_names.end(), KqIsPlainName);
}

bool KqDigits::HasSymmetricTerms() const
{
    bool areSymmetric = true;
    VisitTerms([&](uint64_t row) { areSymmetric = areSymmetric && ReverseBits(row) == row; });
    return areSymmetric;
}

// Appends one term: every name, those with a "~" negated.
void KqDigits::AppendTerm(uint64_t row, std::string& text) const
{
    text += '(';
    for (size_t index = 0; index < m_names.size(); ++index) {
        if (index > 0)
            text += m_is_sum ? '*' : '+';
        if (IsNegated(row, index))
            text += '~';
        text.append(m_names[index].c_str(), m_names[index].length());
    }
    text += ')';
}

std::string KqDigits::Expand() const
{
    std::string expression;
    VisitTerms([&](uint64_t row) {
        if (!expression.empty())
            expression += m_is_sum ? '+' : '*';
        AppendTerm(row, expression);
    });
    return expression;
}

unsigned int KqDigits::Eval(const Variables& variables) const
{
    assert(variables.size() >= m_names.size());
    uint64_t row = 0;
    for (size_t index = 0; index < m_names.size(); ++index)
        row = row << 1 | variables[index].second;
    assert(row >> m_names.size() == 0);
    return m_words[WordOf(row)] >> (row % 64) & 1u;
}

void KqDigits::Fill(unsigned int numVariables, uint64_t firstWord, size_t numWords,
                    uint64_t* words) const
{
    assert(numVariables >= m_names.size());
    // Variables after the names are the lowest bits of a row, so each result is repeated.
    const unsigned int level = numVariables - static_cast<unsigned int>(m_names.size());
    if (level == 0) {
        assert(firstWord + numWords <= m_words.size());
        std::memcpy(words, m_words.data() + firstWord, numWords * sizeof(uint64_t));
        return;
    }
    for (uint64_t word = firstWord; word < firstWord + numWords; ++word) {
        const uint64_t row = word * 64 >> level;
        uint64_t results = m_words[WordOf(row)] >> (row % 64);
        for (unsigned int doubled = 0; doubled < std::min(level, 6u); ++doubled)
            results = DoubleBits(results);
        *words++ = results;
    }
}
