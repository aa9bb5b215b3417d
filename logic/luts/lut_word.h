// Tables as words, so that each kernel is written once: unsigned integers, and two words of 64 bits
// as one of 128.
#ifndef BOOLEQ_LUTS_LUT_WORD_H
#define BOOLEQ_LUTS_LUT_WORD_H

#include <cassert>
#include <cstdint>

#include "lut_array.h"
#include "rows.h"

namespace booleq {

struct TwoWords {
    uint64_t lower;
    uint64_t upper;
};

constexpr TwoWords operator&(TwoWords left, TwoWords right)
{
    return {left.lower & right.lower, left.upper & right.upper};
}
constexpr TwoWords operator|(TwoWords left, TwoWords right)
{
    return {left.lower | right.lower, left.upper | right.upper};
}
constexpr TwoWords operator^(TwoWords left, TwoWords right)
{
    return {left.lower ^ right.lower, left.upper ^ right.upper};
}
constexpr TwoWords operator~(TwoWords word)
{
    return {~word.lower, ~word.upper};
}
constexpr bool operator==(TwoWords left, TwoWords right)
{
    return left.lower == right.lower && left.upper == right.upper;
}
constexpr bool operator!=(TwoWords left, TwoWords right)
{
    return !(left == right);
}
constexpr bool operator<(TwoWords left, TwoWords right)
{
    return left.upper != right.upper ? left.upper < right.upper : left.lower < right.lower;
}
// Requires, for both: distance < 128.
constexpr TwoWords operator>>(TwoWords word, unsigned int distance)
{
    if (distance >= 64)
        return {word.upper >> (distance - 64), 0};
    return {word.lower >> distance | word.upper << 1 << (63 - distance), word.upper >> distance};
}
constexpr TwoWords operator<<(TwoWords word, unsigned int distance)
{
    if (distance >= 64)
        return {0, word.lower << (distance - 64)};
    return {word.lower << distance, word.upper << distance | word.lower >> 1 >> (63 - distance)};
}

// Converts a table between words of 64 bits and a Word.
template <class Word>
struct LutWord {
    static constexpr Word Of(uint64_t lower, uint64_t /*upper*/)
    {
        return static_cast<Word>(lower);
    }
    static constexpr uint64_t Lower(Word word) { return word; }
    static constexpr uint64_t Upper(Word /*word*/) { return 0; }
};
template <>
struct LutWord<TwoWords> {
    static constexpr TwoWords Of(uint64_t lower, uint64_t upper) { return {lower, upper}; }
    static constexpr uint64_t Lower(TwoWords word) { return word.lower; }
    static constexpr uint64_t Upper(TwoWords word) { return word.upper; }
};

// The bits whose number has bit 'bit' set.
template <class Word>
constexpr Word LutPattern(unsigned int bit)
{
    if (bit == 6)
        return LutWord<Word>::Of(0, ~uint64_t(0));
    return LutWord<Word>::Of(BitPattern(bit), BitPattern(bit));
}

// The bits that are rows.
template <class Word>
constexpr Word LutMask(unsigned int numInputs)
{
    return LutWord<Word>::Of(RowMask(numInputs), numInputs > 6 ? ~uint64_t(0) : 0);
}

// Exchanges two inputs of a table; 'low' and 'high' are bits of the row number.
// Requires: low <= high; if they are the same, nothing moves.
template <class Word>
constexpr Word SwapLutBits(Word word, unsigned int low, unsigned int high)
{
    assert(low <= high);
    const unsigned int distance = (1u << high) - (1u << low);
    const auto movers = static_cast<Word>(LutPattern<Word>(low) & ~LutPattern<Word>(high));
    return DeltaSwapped(word, movers, distance);
}

// Inverts an input of a table; 'bit' is its bit of the row number.
template <class Word>
constexpr Word InvertLutBit(Word word, unsigned int bit)
{
    assert(1u << bit < 8 * sizeof(Word));
    const Word upper = LutPattern<Word>(bit);
    return static_cast<Word>((word & upper) >> (1u << bit) | (word << (1u << bit) & upper));
}

// Calls visit(Word()) with the type of an array's tables.
template <class Visit>
void WithLutWord(const LutArray& luts, const Visit& visit)
{
    assert(HasLutShape(luts.numInputs, luts.tableBytes));
    switch (luts.tableBytes) {
    // The branches differ in type alone. NOLINTNEXTLINE(bugprone-branch-clone)
    case 1:
        return visit(uint8_t());
    case 2:
        return visit(uint16_t());
    case 4:
        return visit(uint32_t());
    case 8:
        return visit(uint64_t());
    default:
        return visit(TwoWords());
    }
}

} // namespace booleq

#endif
