// Orders of inputs as exchanges of two bits of all row numbers, at most one less than there are
// inputs; each is the delta swap of H. S. Warren, Hacker's Delight, 2nd edition, section 7-1.
#include <algorithm>
#include <array>
#include <atomic>
#include <cassert>
#include <utility>

#include "lut_kernels.h"
#include "lut_word.h"
#include "parallel.h"

namespace booleq {

namespace {

constexpr size_t kPartSize = 32768;
constexpr size_t kBlockSize = 512; // tables that stay in the fastest cache between two exchanges

struct BitSwap {
    uint8_t low; // bits of the row number
    uint8_t high;
};

struct SwapProgram {
    std::array<BitSwap, kMaxLutInputs> swaps;
    unsigned int size = 0;
};

// Requires: order is a permutation.
SwapProgram ProgramOf(const uint8_t* order, unsigned int numInputs)
{
    // at[k]: which input of the table stands at place k so far
    std::array<uint8_t, kMaxLutInputs> at = {0, 1, 2, 3, 4, 5, 6};
    SwapProgram program;
    for (unsigned int place = 0; place < numInputs; ++place) {
        unsigned int from = place;
        while (from < numInputs && at[from] != order[place])
            ++from;
        assert(from < numInputs);
        if (from == place)
            continue;
        std::swap(at[from], at[place]);
        program.swaps[program.size++] = {static_cast<uint8_t>(numInputs - 1 - from),
                                         static_cast<uint8_t>(numInputs - 1 - place)};
    }
    assert(std::equal(order, order + numInputs, at.begin()));
    return program;
}

template <class Word>
Word SwapBits(Word word, BitSwap bits, Word movers)
{
    const unsigned int distance = (1u << bits.high) - (1u << bits.low);
    const Word change = static_cast<Word>((word ^ (word >> distance)) & movers);
    return static_cast<Word>(word ^ change ^ (change << distance));
}

template <class Word>
Word MoversOf(BitSwap bits)
{
    return static_cast<Word>(LutPattern<Word>(bits.low) & ~LutPattern<Word>(bits.high));
}

template <class Word>
void PermutePart(const Word* tables, Word* results, size_t count, const SwapProgram& program)
{
    for (size_t begin = 0; begin < count; begin += kBlockSize) {
        const size_t end = std::min(begin + kBlockSize, count);
        if (results != tables)
            std::copy(tables + begin, tables + end, results + begin);
        for (unsigned int step = 0; step < program.size; ++step) {
            const BitSwap bits = program.swaps[step];
            const Word movers = MoversOf<Word>(bits);
            for (size_t place = begin; place < end; ++place)
                results[place] = SwapBits(results[place], bits, movers);
        }
    }
}

} // namespace

void PermuteLuts(const LutArray& luts, const uint8_t* order, void* results, const LutWork& work)
{
    const SwapProgram program = ProgramOf(order, luts.numInputs);
    WithLutWord(luts, [&](auto zero) {
        typedef decltype(zero) Word;
        const auto* const tables = static_cast<const Word*>(luts.tables);
        auto* const words = static_cast<Word*>(results);
        RunInParts(luts.count, kPartSize, work, [&](size_t begin, size_t end) {
            PermutePart(tables + begin, words + begin, end - begin, program);
        });
    });
}

void PermuteLutsEach(const LutArray& luts, const uint8_t* orders, void* results,
                     const LutWork& work)
{
    const unsigned int numInputs = luts.numInputs;
    WithLutWord(luts, [&](auto zero) {
        typedef decltype(zero) Word;
        const auto* const tables = static_cast<const Word*>(luts.tables);
        auto* const words = static_cast<Word*>(results);
        RunInParts(luts.count, kPartSize, work, [&](size_t begin, size_t end) {
            for (size_t place = begin; place < end; ++place) {
                const SwapProgram program = ProgramOf(orders + place * numInputs, numInputs);
                Word word = tables[place];
                for (unsigned int step = 0; step < program.size; ++step)
                    word = SwapBits(word, program.swaps[step], MoversOf<Word>(program.swaps[step]));
                words[place] = word;
            }
        });
    });
}

size_t FirstBadOrder(const uint8_t* orders, size_t count, unsigned int numInputs,
                     const LutWork& work)
{
    assert(numInputs <= kMaxLutInputs);
    std::atomic<size_t> first{kNoLut};
    RunInParts(count, kPartSize, work, [&](size_t begin, size_t end) {
        for (size_t place = begin; place < end; ++place) {
            unsigned int seen = 0;
            for (unsigned int input = 0; input < numInputs; ++input) {
                const uint8_t source = orders[place * numInputs + input];
                seen |= source < numInputs ? 1u << source : 0u;
            }
            if (seen == AllLutInputs(numInputs))
                continue;
            size_t known = first;
            while (place < known && !first.compare_exchange_weak(known, place))
                ;
            return;
        }
    });
    return first;
}

} // namespace booleq
