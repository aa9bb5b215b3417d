// Kernels over tables of any word. Ones are counted by adding neighbouring fields of more and more
// bits (H. S. Warren, Hacker's Delight, 2nd edition, section 5-1): a compiler can vectorise that
// where the processor has no instruction for it.
#include "lut_kernels.h"

#include <algorithm>
#include <cassert>

#include "lut_word.h"
#include "parallel.h"

namespace booleq {

namespace {

constexpr size_t kPartSize = 65536; // tables in a millisecond or less

// results[k] = make(table k), for tables of any word.  'make' is called with a word and its place.
template <class Result, class Make>
void ForEachLut(const LutArray& luts, Result* results, const LutWork& work, const Make& make)
{
    WithLutWord(luts, [&](auto zero) {
        typedef decltype(zero) Word;
        const auto* const tables = static_cast<const Word*>(luts.tables);
        RunInParts(luts.count, kPartSize, work, [&](size_t begin, size_t end) {
            for (size_t place = begin; place < end; ++place)
                results[place] = make(tables[place], place);
        });
    });
}

// The same for results that have the tables' word.
template <class Make>
void MapLuts(const LutArray& luts, void* results, const LutWork& work, const Make& make)
{
    WithLutWord(luts, [&](auto zero) {
        typedef decltype(zero) Word;
        const auto* const tables = static_cast<const Word*>(luts.tables);
        auto* const words = static_cast<Word*>(results);
        RunInParts(luts.count, kPartSize, work, [&](size_t begin, size_t end) {
            std::transform(tables + begin, tables + end, words + begin, make);
        });
    });
}

// The bit of the row number that an input is.
unsigned int BitOf(const LutArray& luts, unsigned int input)
{
    assert(input < luts.numInputs);
    return luts.numInputs - 1 - input;
}

uint8_t ValueAt(uint64_t word, unsigned int row)
{
    return static_cast<uint8_t>(word >> row & 1u);
}

uint8_t ValueAt(TwoWords word, unsigned int row)
{
    return ValueAt(row < 64 ? word.lower : word.upper, row % 64);
}

uint8_t NumOnes(uint64_t word)
{
    constexpr uint64_t kPairs = 0x5555555555555555;
    constexpr uint64_t kFours = 0x3333333333333333;
    constexpr uint64_t kBytes = 0x0f0f0f0f0f0f0f0f;
    word -= word >> 1 & kPairs;
    word = (word & kFours) + (word >> 2 & kFours);
    word = (word + (word >> 4)) & kBytes;
    word += word >> 8;
    word += word >> 16;
    word += word >> 32;
    return static_cast<uint8_t>(word & 127u); // at most 64
}

uint8_t NumOnes(TwoWords word)
{
    return static_cast<uint8_t>(NumOnes(word.lower) + NumOnes(word.upper));
}

// The half of a word in which bit 'bit' of the row number is 'value', moved to the rows where that
// bit is 0; the other bits of the result are undefined.
template <class Word>
Word Selected(Word word, unsigned int bit, bool value)
{
    return value ? static_cast<Word>(word >> (1u << bit)) : word;
}

// The rows where bit 'bit' of the number is 0, packed together: each step joins blocks of twice as
// many rows (Hacker's Delight, section 7-4).
uint64_t Compress(uint64_t word, unsigned int bit)
{
    word &= ~BitPattern(bit);
    for (unsigned int step = bit; step < 5; ++step) {
        // Blocks of 2^step rows lie at every second place; the odd-numbered ones move down.
        const uint64_t odd = word & BitPattern(step + 1);
        word = (word ^ odd) | odd >> (1u << step);
    }
    return word;
}

uint64_t Compress(TwoWords word, unsigned int bit)
{
    if (bit == 6)
        return word.lower;
    return Compress(word.lower, bit) | Compress(word.upper, bit) << 32;
}

} // namespace

void EvaluateLuts(const LutArray& luts, uint8_t row, uint8_t* values, const LutWork& work)
{
    assert(row < 1u << luts.numInputs);
    ForEachLut(luts, values, work, [row](auto word, size_t) { return ValueAt(word, row); });
}

void EvaluateLutsEach(const LutArray& luts, const uint8_t* rows, uint8_t* values,
                      const LutWork& work)
{
    ForEachLut(luts, values, work, [rows, &luts](auto word, size_t place) {
        assert(rows[place] < 1u << luts.numInputs);
        (void)luts;
        return ValueAt(word, rows[place]);
    });
}

void InvertLuts(const LutArray& luts, void* results, const LutWork& work)
{
    const unsigned int numInputs = luts.numInputs;
    MapLuts(luts, results, work, [numInputs](auto word) {
        typedef decltype(word) Word;
        return static_cast<Word>(~word & LutMask<Word>(numInputs));
    });
}

void FixLutInput(const LutArray& luts, unsigned int input, bool value, void* results,
                 unsigned int resultBytes, const LutWork& work)
{
    const unsigned int bit = BitOf(luts, input);
    const LutArray shape = {results, luts.count, luts.numInputs - 1, resultBytes};
    WithLutWord(shape, [&](auto zero) {
        typedef decltype(zero) Result;
        ForEachLut(luts, static_cast<Result*>(results), work, [bit, value](auto word, size_t) {
            return LutWord<Result>::Of(Compress(Selected(word, bit, value), bit), 0);
        });
    });
}

void FindLutSupports(const LutArray& luts, uint8_t* inputs, const LutWork& work)
{
    const unsigned int numInputs = luts.numInputs;
    ForEachLut(luts, inputs, work, [numInputs](auto word, size_t) {
        typedef decltype(word) Word;
        unsigned int found = 0;
        for (unsigned int input = 0; input < numInputs; ++input) {
            const unsigned int bit = numInputs - 1 - input;
            const Word lower = ~LutPattern<Word>(bit) & LutMask<Word>(numInputs);
            const bool matters = ((word ^ (word >> (1u << bit))) & lower) != Word();
            found |= static_cast<unsigned int>(matters) << input;
        }
        return static_cast<uint8_t>(found);
    });
}

void CountLutOnes(const LutArray& luts, uint8_t* counts, const LutWork& work)
{
    ForEachLut(luts, counts, work, [](auto word, size_t) { return NumOnes(word); });
}

} // namespace booleq
