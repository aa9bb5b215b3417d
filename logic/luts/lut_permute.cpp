// An order of inputs is applied as exchanges of two bits in all row numbers, at most one fewer than
// there are inputs; each exchange is one SwapLutBits.
#include <algorithm>
#include <array>
#include <cassert>
#include <utility>

#include "lut_kernels.h"
#include "lut_word.h"
#include "parallel.h"

namespace booleq {

namespace {

constexpr size_t kPartSize = 32768;
constexpr size_t kBlockSize = 512; // tables that stay in the fastest cache between two exchanges

// Bits of the row number, low <= high; if they are equal, nothing is exchanged.
struct BitSwap {
    unsigned int low;
    unsigned int high;
};

// Calls exchange(BitSwap) once for each place except the last, without branching on the order.
// Requires: order is a permutation.
template <class Exchange>
void ForEachSwap(const uint8_t* order, unsigned int numInputs, const Exchange& exchange)
{
    // Four bits for each: the table's input that is now at a place, and the place of an input.
    uint32_t inputAt = 0x76543210;
    uint32_t placeOf = 0x76543210;
    for (unsigned int place = 0; place + 1 < numInputs; ++place) {
        const unsigned int input = order[place];
        const unsigned int leaving = inputAt >> (4 * place) & 7u;
        const unsigned int from = placeOf >> (4 * input) & 7u;
        assert(place <= from && from < numInputs);
        inputAt ^= (leaving ^ input) << (4 * from);
        placeOf ^= (place ^ from) << (4 * leaving);
        exchange(BitSwap{numInputs - 1 - from, numInputs - 1 - place});
    }
    // Settled places are never read again, so they are not written.
    assert(numInputs == 0 || (inputAt >> (4 * (numInputs - 1)) & 7u) == order[numInputs - 1]);
}

template <class Word>
void PermutePart(const Word* tables, Word* results, size_t count, unsigned int numInputs,
                 const uint8_t* order)
{
    for (size_t begin = 0; begin < count; begin += kBlockSize) {
        const size_t end = std::min(begin + kBlockSize, count);
        if (results != tables)
            std::copy(tables + begin, tables + end, results + begin);
        ForEachSwap(order, numInputs, [&](BitSwap bits) {
            if (bits.low == bits.high)
                return;
            for (size_t place = begin; place < end; ++place)
                results[place] = SwapLutBits(results[place], bits.low, bits.high);
        });
    }
}

} // namespace

void PermuteLuts(const LutArray& luts, const uint8_t* order, void* results, const LutWork& work)
{
    WithLutWord(luts, [&](auto zero) {
        typedef decltype(zero) Word;
        const auto* const tables = static_cast<const Word*>(luts.tables);
        auto* const words = static_cast<Word*>(results);
        RunInParts(luts.count, kPartSize, work, [&](size_t begin, size_t end) {
            PermutePart(tables + begin, words + begin, end - begin, luts.numInputs, order);
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
                Word word = tables[place];
                ForEachSwap(orders + place * numInputs, numInputs, [&word](BitSwap bits) {
                    word = SwapLutBits(word, bits.low, bits.high);
                });
                words[place] = word;
            }
        });
    });
}

size_t FirstBadOrder(const uint8_t* orders, size_t count, unsigned int numInputs,
                     const LutWork& work)
{
    assert(numInputs <= kMaxLutInputs);
    const auto isOrder = [orders, numInputs](size_t place) {
        unsigned int seen = 0;
        for (unsigned int input = 0; input < numInputs; ++input) {
            const uint8_t source = orders[place * numInputs + input];
            seen |= source < numInputs ? 1u << source : 0u;
        }
        return seen == AllLutInputs(numInputs);
    };
    return FindFirstInParts(count, kPartSize, work, [&](size_t begin, size_t end) {
        while (begin < end && isOrder(begin))
            ++begin;
        return begin;
    });
}

} // namespace booleq
