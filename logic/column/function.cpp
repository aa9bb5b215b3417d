#include "function.h"

#include <algorithm>
#include <cassert>
#include <utility>

#include "text.h"
#include "watch.h"

namespace booleq {

namespace {

// Bits of a word whose row number has bit k set.
constexpr uint64_t kRowBit[6] = {0xaaaaaaaaaaaaaaaa, 0xcccccccccccccccc, 0xf0f0f0f0f0f0f0f0,
                                 0xff00ff00ff00ff00, 0xffff0000ffff0000, 0xffffffff00000000};

size_t NumWordsFor(size_t numInputs)
{
    return numInputs <= 6 ? 1 : size_t(1) << (numInputs - 6);
}

// The bits of the one word that are rows.
uint64_t RowMask(size_t numInputs)
{
    return numInputs >= 6 ? ~uint64_t(0) : (uint64_t(1) << (1u << numInputs)) - 1;
}

// Makes every row trade places with the one whose number has bits 'low' and 'high' exchanged.
void SwapRowBits(std::vector<uint64_t>& words, size_t low, size_t high)
{
    if (low > high)
        std::swap(low, high);
    if (low == high)
        return;
    if (high < 6) {
        const unsigned int distance = (1u << high) - (1u << low);
        const uint64_t movers = kRowBit[low] & ~kRowBit[high];
        for (uint64_t& word : words) {
            const uint64_t change = (word ^ (word >> distance)) & movers;
            word ^= change ^ (change << distance);
        }
        return;
    }
    const size_t highStep = size_t(1) << (high - 6);
    for (size_t base = 0; base < words.size(); base += 2 * highStep) {
        for (size_t word = base; word < base + highStep; ++word) {
            if (low >= 6) {
                const size_t lowStep = size_t(1) << (low - 6);
                if ((word & lowStep) != 0)
                    std::swap(words[word], words[word + highStep - lowStep]);
                continue;
            }
            uint64_t& lower = words[word];
            uint64_t& upper = words[word + highStep];
            const unsigned int distance = 1u << low;
            const uint64_t change = ((lower >> distance) ^ upper) & ~kRowBit[low];
            upper ^= change;
            lower ^= change << distance;
        }
    }
}

// Repeats the rows for one more input that does not matter, the most significant one.
void Double(std::vector<uint64_t>& words, size_t numInputs)
{
    if (numInputs < 6) {
        words[0] |= words[0] << (1u << numInputs);
        return;
    }
    const size_t numWords = words.size();
    words.resize(2 * numWords);
    std::copy_n(words.begin(), numWords, words.begin() + static_cast<std::ptrdiff_t>(numWords));
}

std::string Digits(const Function& function, const char* prefix, unsigned int bitsPerDigit)
{
    static constexpr char kDigits[] = "0123456789abcdef";
    const size_t numRows = function.NumRows();
    const size_t rowsPerDigit = std::min<size_t>(bitsPerDigit, numRows);
    std::string text = prefix;
    text.reserve(text.size() + numRows / rowsPerDigit);
    for (size_t row = numRows; row > 0;) {
        row -= rowsPerDigit;
        const uint64_t rows = function.Words()[row / 64] >> (row % 64);
        text += kDigits[rows & ((1u << rowsPerDigit) - 1)];
    }
    return text;
}

// 16 for no digit.
unsigned int DigitValue(char digit)
{
    if (digit >= '0' && digit <= '9')
        return static_cast<unsigned int>(digit - '0');
    const char lower = static_cast<char>(digit | 0x20);
    return lower >= 'a' && lower <= 'f' ? static_cast<unsigned int>(lower - 'a') + 10 : 16;
}

// Inputs that number as many rows.  Requires: numRows > 0.
size_t NumInputsFor(uint64_t numRows)
{
    size_t numInputs = 0;
    for (uint64_t highestRow = numRows - 1; highestRow > 0; highestRow /= 2)
        ++numInputs;
    return numInputs;
}

// Sets the rows from 'firstRow' on to 1.  Requires: firstRow <= 64 * words.size().
void FillFrom(std::vector<uint64_t>& words, uint64_t firstRow, size_t numInputs)
{
    const auto firstWord = static_cast<size_t>(firstRow / 64);
    if (firstWord < words.size())
        words[firstWord] |= ~uint64_t(0) << (firstRow % 64);
    for (size_t word = firstWord + 1; word < words.size(); ++word)
        words[word] = ~uint64_t(0);
    words.back() &= RowMask(numInputs);
}

} // namespace

Function::Function(std::vector<std::string> inputs, std::vector<uint64_t> words)
    : m_inputs(std::move(inputs)), m_words(std::move(words))
{
    assert(m_inputs.size() <= kMaxFunctionInputs);
    assert(m_words.size() == NumWordsFor(m_inputs.size()));
}

uint64_t Function::NumOnes() const
{
    uint64_t count = 0;
    for (const uint64_t word : m_words)
        count += static_cast<uint64_t>(__builtin_popcountll(word));
    return count;
}

bool Function::DependsOn(size_t index) const
{
    const size_t bit = m_inputs.size() - 1 - index;
    if (bit < 6) {
        const auto differs = [bit, this](uint64_t word) {
            return ((word ^ (word >> (1u << bit))) & ~kRowBit[bit] & RowMask(m_inputs.size())) != 0;
        };
        return std::any_of(m_words.begin(), m_words.end(), differs);
    }
    const size_t step = size_t(1) << (bit - 6);
    for (size_t word = 0; word < m_words.size(); ++word)
        if ((word & step) == 0 && m_words[word] != m_words[word + step])
            return true;
    return false;
}

std::string Function::Hex() const
{
    return Digits(*this, "0x", 4);
}

std::string Function::Binary() const
{
    return Digits(*this, "0b", 1);
}

Function Function::Over(const std::vector<std::string>& inputs) const
{
    Function result(*this);
    std::vector<std::string>& order = result.m_inputs;
    for (const std::string& input : inputs) {
        if (std::find(order.begin(), order.end(), input) != order.end())
            continue;
        Double(result.m_words, order.size());
        order.insert(order.begin(), input);
    }
    assert(order.size() == inputs.size());
    for (size_t place = 0; place < order.size(); ++place) {
        Watch();
        const auto found = std::find(order.begin(), order.end(), inputs[place]);
        const size_t from = static_cast<size_t>(found - order.begin());
        SwapRowBits(result.m_words, order.size() - 1 - place, order.size() - 1 - from);
        std::swap(order[place], order[from]);
    }
    return result;
}

Function Function::Reversed() const
{
    Function result = Over(std::vector<std::string>(m_inputs.rbegin(), m_inputs.rend()));
    result.m_inputs = m_inputs;
    return result;
}

uint64_t Function::FirstDifference(const Function& other) const
{
    const auto difference = std::mismatch(m_words.begin(), m_words.end(), other.m_words.begin());
    if (difference.first == m_words.end())
        return kNoRow;
    const auto word = static_cast<uint64_t>(difference.first - m_words.begin());
    const uint64_t change = *difference.first ^ *difference.second;
    return 64 * word + static_cast<uint64_t>(__builtin_ctzll(change));
}

bool Function::operator==(const Function& other) const
{
    return m_inputs == other.m_inputs && m_words == other.m_words;
}

bool FunctionOf(const Kq_BoolEquation& equation, Function& function)
{
    std::vector<uint64_t> words;
    if (!equation.GetColumn(words, WatchAndGoOn, nullptr))
        return false;
    std::vector<std::string> inputs;
    for (const auto& variable : equation.GetVariables())
        inputs.push_back(ToStd(variable.first));
    function = Function(std::move(inputs), std::move(words));
    return true;
}

std::string NoFunctionReason(size_t numInputs)
{
    return Count(numInputs, "input") + ": at most " + std::to_string(kMaxFunctionInputs) +
           " have a truth table";
}

InitText ReadInitText(const std::string& text, size_t numInputs)
{
    InitText init;
    const char kind = text.size() > 2 && text[0] == '0' ? static_cast<char>(text[1] | 0x20) : '\0';
    if (kind != 'x' && kind != 'b') {
        init.fault = InitFault::kPrefix;
        return init;
    }
    const size_t rowsPerDigit = kind == 'x' ? 4 : 1;
    for (size_t position = 2; position < text.size(); ++position) {
        if (DigitValue(text[position]) < 1u << rowsPerDigit)
            continue;
        init.fault = InitFault::kDigit;
        init.faultPosition = position;
        return init;
    }
    const size_t numDigits = text.size() - 2;
    init.numGivenRows = uint64_t(rowsPerDigit) * numDigits;
    init.numInputs = NumInputsFor(init.numGivenRows);
    if (init.numInputs != numInputs) {
        init.fault = InitFault::kWidth;
        return init;
    }
    init.words.resize(NumWordsFor(numInputs));
    uint64_t numOnes = 0;
    for (size_t digit = 0; digit < numDigits; ++digit) {
        const uint64_t value = DigitValue(text[text.size() - 1 - digit]);
        const size_t row = digit * rowsPerDigit;
        init.words[row / 64] |= value << (row % 64);
        numOnes += static_cast<uint64_t>(__builtin_popcountll(value));
    }
    const uint64_t numZeros = init.numGivenRows - numOnes;
    init.missingRows = numZeros != 0 && (numOnes == 0 || numOnes >= numZeros);
    if (init.missingRows && init.numGivenRows < uint64_t(1) << numInputs)
        FillFrom(init.words, init.numGivenRows, numInputs);
    return init;
}

InitText FunctionFromInit(const std::string& text, const std::vector<std::string>& inputs,
                          bool lsbFirst, Function& function)
{
    InitText init = ReadInitText(text, inputs.size());
    if (init.fault != InitFault::kNone)
        return init;
    const Function read(inputs, init.words);
    function = lsbFirst ? read.Reversed() : read;
    return init;
}

} // namespace booleq
