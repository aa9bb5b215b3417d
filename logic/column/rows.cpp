// Operations on packed rows. Inputs are moved by the exchange of two bits of all row numbers, which
// within a word is the delta swap of H. S. Warren, Hacker's Delight, 2nd edition, section 7-1.
#include "rows.h"

#include <algorithm>
#include <cassert>
#include <utility>

#include "watch.h"

namespace booleq {

namespace {

[[maybe_unused]] bool HasCleanPadding(const Rows& rows) // in assertions
{
    return (rows.Words()[rows.Size() - 1] & ~RowMask(rows.NumInputs())) == 0;
}

// The bit of the row number that belongs to an input.
unsigned int BitOf(const Rows& rows, unsigned int input)
{
    assert(input < rows.NumInputs());
    return rows.NumInputs() - 1 - input;
}

// Every row trades places with the one whose number has bits 'low' and 'high' exchanged.
// Requires: low < high.
void SwapRowBits(Rows& rows, unsigned int low, unsigned int high)
{
    uint64_t* const words = rows.Words();
    const size_t numWords = rows.Size();
    if (high < 6) {
        const unsigned int distance = (1u << high) - (1u << low);
        const uint64_t movers = BitPattern(low) & ~BitPattern(high);
        for (size_t word = 0; word < numWords; ++word)
            words[word] = DeltaSwapped(words[word], movers, distance);
        return;
    }
    const size_t highStep = size_t(1) << (high - 6);
    for (size_t base = 0; base < numWords; base += 2 * highStep) {
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
            const uint64_t change = ((lower >> distance) ^ upper) & ~BitPattern(low);
            upper ^= change;
            lower ^= change << distance;
        }
    }
}

template <class Operation>
Rows Combine(Rows left, const Rows& right, const Operation& operation)
{
    assert(left.NumInputs() == right.NumInputs());
    uint64_t* const words = left.Words();
    const uint64_t* const others = right.Words();
    const size_t numWords = left.Size();
    for (size_t word = 0; word < numWords; ++word)
        words[word] = operation(words[word], others[word]);
    assert(HasCleanPadding(left));
    return left;
}

} // namespace

Rows::Rows(unsigned int numInputs)
    : m_num_inputs(numInputs), m_words(numInputs <= 6 ? 0 : NumWords(numInputs))
{
    assert(numInputs <= kMaxRowInputs);
}

Rows::Rows(unsigned int numInputs, std::vector<uint64_t> words) : m_num_inputs(numInputs)
{
    assert(numInputs <= kMaxRowInputs);
    assert(words.size() == NumWords(numInputs));
    m_word = words[0];
    if (numInputs > 6)
        m_words = std::move(words);
    assert(HasCleanPadding(*this));
}

Rows Rows::OfWord(unsigned int numInputs, uint64_t word)
{
    assert(numInputs <= 6);
    Rows rows(numInputs);
    rows.m_word = word;
    assert(HasCleanPadding(rows));
    return rows;
}

void Rows::Set(uint64_t row, bool value)
{
    assert(row < NumRows());
    const uint64_t bit = uint64_t(1) << (row % 64);
    uint64_t& word = Words()[static_cast<size_t>(row / 64)];
    word = value ? word | bit : word & ~bit;
    assert(At(row) == value);
}

bool operator==(const Rows& left, const Rows& right)
{
    return left.NumInputs() == right.NumInputs() &&
           std::equal(left.Words(), left.Words() + left.Size(), right.Words());
}

bool operator<(const Rows& left, const Rows& right)
{
    if (left.NumInputs() != right.NumInputs())
        return left.NumInputs() < right.NumInputs();
    return std::lexicographical_compare(left.Words(), left.Words() + left.Size(), right.Words(),
                                        right.Words() + right.Size());
}

Rows operator&(Rows left, const Rows& right)
{
    return Combine(std::move(left), right,
                   [](uint64_t own, uint64_t other) { return own & other; });
}

Rows operator|(Rows left, const Rows& right)
{
    return Combine(std::move(left), right,
                   [](uint64_t own, uint64_t other) { return own | other; });
}

Rows operator^(Rows left, const Rows& right)
{
    return Combine(std::move(left), right,
                   [](uint64_t own, uint64_t other) { return own ^ other; });
}

Rows AndNot(Rows left, const Rows& right)
{
    return Combine(std::move(left), right,
                   [](uint64_t own, uint64_t other) { return own & ~other; });
}

Rows operator~(Rows rows)
{
    const uint64_t ones = RowMask(rows.NumInputs());
    uint64_t* const words = rows.Words();
    const size_t numWords = rows.Size();
    for (size_t word = 0; word < numWords; ++word)
        words[word] = ~words[word] & ones;
    assert(HasCleanPadding(rows));
    return rows;
}

uint64_t FirstDifference(const Rows& left, const Rows& right)
{
    assert(left.NumInputs() == right.NumInputs());
    const uint64_t* const end = left.Words() + left.Size();
    const auto difference = std::mismatch(left.Words(), end, right.Words());
    if (difference.first == end)
        return Rows::kNoRow;
    const auto word = static_cast<uint64_t>(difference.first - left.Words());
    const uint64_t change = *difference.first ^ *difference.second;
    const uint64_t row = 64 * word + static_cast<uint64_t>(__builtin_ctzll(change));
    assert(left.At(row) != right.At(row));
    return row;
}

bool IsZero(const Rows& rows)
{
    return std::all_of(rows.Words(), rows.Words() + rows.Size(),
                       [](uint64_t word) { return word == 0; });
}

bool IsOne(const Rows& rows)
{
    const uint64_t ones = RowMask(rows.NumInputs());
    return std::all_of(rows.Words(), rows.Words() + rows.Size(),
                       [ones](uint64_t word) { return word == ones; });
}

uint64_t NumOnes(const Rows& rows)
{
    uint64_t count = 0;
    for (size_t word = 0; word < rows.Size(); ++word)
        count += static_cast<uint64_t>(__builtin_popcountll(rows.Words()[word]));
    assert(count <= rows.NumRows());
    return count;
}

Rows ConstantRows(unsigned int numInputs, bool value)
{
    Rows rows(numInputs);
    if (value)
        std::fill_n(rows.Words(), rows.Size(), RowMask(numInputs));
    assert(value ? IsOne(rows) : IsZero(rows));
    return rows;
}

Rows InputRows(unsigned int numInputs, unsigned int input)
{
    assert(input < numInputs);
    Rows rows(numInputs);
    for (size_t word = 0; word < rows.Size(); ++word)
        rows.Words()[word] = InputWord(numInputs, input, word) & RowMask(numInputs);
    assert(2 * NumOnes(rows) == rows.NumRows());
    return rows;
}

Rows Cofactor(Rows rows, unsigned int input, bool value)
{
    const unsigned int bit = BitOf(rows, input);
    uint64_t* const words = rows.Words();
    const size_t numWords = rows.Size();
    if (bit < 6) {
        const uint64_t kept = value ? BitPattern(bit) : ~BitPattern(bit);
        const unsigned int distance = 1u << bit;
        for (size_t word = 0; word < numWords; ++word) {
            const uint64_t half = words[word] & kept;
            words[word] = value ? half | half >> distance : half | half << distance;
        }
    } else {
        const size_t step = size_t(1) << (bit - 6);
        for (size_t base = 0; base < numWords; base += 2 * step)
            std::copy_n(words + base + (value ? step : 0), step, words + base + (value ? 0 : step));
    }
    assert(HasCleanPadding(rows));
    assert(!DependsOn(rows, input));
    return rows;
}

bool DependsOn(const Rows& rows, unsigned int input)
{
    const unsigned int bit = BitOf(rows, input);
    const uint64_t* const words = rows.Words();
    if (bit < 6) {
        // A shift brings in only zeros from beyond the last row.
        const uint64_t lower = ~BitPattern(bit) & RowMask(rows.NumInputs());
        return std::any_of(words, words + rows.Size(), [bit, lower](uint64_t word) {
            return ((word ^ (word >> (1u << bit))) & lower) != 0;
        });
    }
    const size_t step = size_t(1) << (bit - 6);
    for (size_t base = 0; base < rows.Size(); base += 2 * step)
        if (!std::equal(words + base, words + base + step, words + base + step))
            return true;
    return false;
}

std::vector<unsigned int> Support(const Rows& rows)
{
    std::vector<unsigned int> support;
    for (unsigned int input = 0; input < rows.NumInputs(); ++input)
        if (DependsOn(rows, input))
            support.push_back(input);
    return support;
}

Rows Half(const Rows& rows, bool isUpper)
{
    assert(rows.NumInputs() > 0);
    const unsigned int numInputs = rows.NumInputs() - 1;
    if (numInputs < 6) {
        const unsigned int numRows = 1u << numInputs;
        const uint64_t word = isUpper ? rows.Words()[0] >> numRows : rows.Words()[0];
        return Rows::OfWord(numInputs, word & RowMask(numInputs));
    }
    Rows half(numInputs);
    std::copy_n(rows.Words() + (isUpper ? half.Size() : 0), half.Size(), half.Words());
    return half;
}

Rows JoinHalves(const Rows& lower, const Rows& upper)
{
    assert(lower.NumInputs() == upper.NumInputs());
    Rows rows(lower.NumInputs() + 1);
    if (lower.NumInputs() < 6) {
        rows.Words()[0] = lower.Words()[0] | upper.Words()[0] << (1u << lower.NumInputs());
    } else {
        std::copy_n(lower.Words(), lower.Size(), rows.Words());
        std::copy_n(upper.Words(), upper.Size(), rows.Words() + lower.Size());
    }
    assert(HasCleanPadding(rows));
    return rows;
}

Rows Widen(const Rows& rows)
{
    Rows wide = JoinHalves(rows, rows);
    assert(!DependsOn(wide, 0));
    return wide;
}

Rows SwapInputs(Rows rows, unsigned int first, unsigned int second)
{
    const unsigned int firstBit = BitOf(rows, first);
    const unsigned int secondBit = BitOf(rows, second);
    if (firstBit != secondBit)
        SwapRowBits(rows, std::min(firstBit, secondBit), std::max(firstBit, secondBit));
    assert(HasCleanPadding(rows));
    return rows;
}

Rows InvertInput(Rows rows, unsigned int input)
{
    const unsigned int bit = BitOf(rows, input);
    uint64_t* const words = rows.Words();
    const size_t numWords = rows.Size();
    if (bit < 6) {
        const unsigned int distance = 1u << bit;
        const uint64_t upper = BitPattern(bit);
        for (size_t word = 0; word < numWords; ++word)
            words[word] = (words[word] & upper) >> distance | (words[word] & ~upper) << distance;
    } else {
        const size_t step = size_t(1) << (bit - 6);
        for (size_t base = 0; base < numWords; base += 2 * step)
            std::swap_ranges(words + base, words + base + step, words + base + step);
    }
    assert(HasCleanPadding(rows));
    return rows;
}

Rows PermuteInputs(Rows rows, const std::vector<unsigned int>& order)
{
    assert(order.size() == rows.NumInputs());
    // Place by place: the input that is there moves to where the wanted one comes from.
    std::vector<unsigned int> present(order.size());
    for (unsigned int place = 0; place < present.size(); ++place)
        present[place] = place;
    for (unsigned int place = 0; place < order.size(); ++place) {
        if (rows.Size() >= kWatchedWords)
            Watch();
        const auto found = std::find(present.begin() + place, present.end(), order[place]);
        assert(found != present.end());
        const auto from = static_cast<unsigned int>(found - present.begin());
        rows = SwapInputs(std::move(rows), place, from);
        std::swap(present[place], present[from]);
    }
    assert(present == order);
    return rows;
}

Rows ReverseInputs(Rows rows)
{
    const unsigned int numInputs = rows.NumInputs();
    for (unsigned int input = 0; input < numInputs / 2; ++input) {
        if (rows.Size() >= kWatchedWords)
            Watch();
        rows = SwapInputs(std::move(rows), input, numInputs - 1 - input);
    }
    return rows;
}

Rows Restrict(Rows rows, const std::vector<unsigned int>& inputs)
{
    assert(std::is_sorted(inputs.begin(), inputs.end()));
    assert(inputs.size() <= rows.NumInputs());
    // The other inputs go to the front, where they choose between equal blocks.
    std::vector<unsigned int> order;
    for (unsigned int input = 0; input < rows.NumInputs(); ++input)
        if (!std::binary_search(inputs.begin(), inputs.end(), input))
            order.push_back(input);
    order.insert(order.end(), inputs.begin(), inputs.end());
    const Rows ordered = PermuteInputs(std::move(rows), order);
    Rows restricted(static_cast<unsigned int>(inputs.size()));
    const uint64_t mask = RowMask(restricted.NumInputs());
    for (size_t word = 0; word < restricted.Size(); ++word)
        restricted.Words()[word] = ordered.Words()[word] & mask;
    assert(NumOnes(ordered) == NumOnes(restricted) << (order.size() - inputs.size()));
    return restricted;
}

} // namespace booleq
