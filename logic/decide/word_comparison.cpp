#include "word_comparison.h"

#include <algorithm>
#include <random>

#include "watch.h"

namespace booleq {

namespace {

constexpr uint64_t kMaxOperations = uint64_t(1) << 28; // about a second
constexpr uint64_t kMaxSampleWords = 4096;
constexpr uint64_t kMinSampleWords = 16;
constexpr unsigned int kMaxExhaustiveInputs = 30;

} // namespace

Comparison CompareWords(const WordFunction& left, const WordFunction& right, unsigned int numInputs,
                        uint64_t cost)
{
    Comparison result;
    uint64_t numWords = kMaxSampleWords;
    if (numInputs <= kMaxExhaustiveInputs)
        numWords = numInputs > 6 ? uint64_t(1) << (numInputs - 6) : 1;
    result.isExhaustive = numInputs <= kMaxExhaustiveInputs &&
                          numWords <= kMaxOperations / std::max<uint64_t>(cost, 1);
    if (!result.isExhaustive)
        numWords = std::min(numWords, std::clamp(kMaxOperations / std::max<uint64_t>(cost, 1),
                                                 kMinSampleWords, kMaxSampleWords));
    const uint64_t rowsPerWord = numInputs < 6 ? uint64_t(1) << numInputs : 64;
    std::mt19937_64 random(1);
    std::vector<uint64_t> inputs(numInputs);
    for (uint64_t word = 0; word < numWords; ++word) {
        if (word % kWatchedWords == 0)
            Watch();
        for (unsigned int input = 0; input < numInputs; ++input)
            inputs[input] = result.isExhaustive ? InputWord(numInputs, input, word) : random();
        uint64_t change = left(inputs) ^ right(inputs);
        if (rowsPerWord < 64)
            change &= (uint64_t(1) << rowsPerWord) - 1;
        result.numAssignments += rowsPerWord;
        if (change == 0)
            continue;
        result.isEqual = false;
        const auto bit = static_cast<unsigned int>(__builtin_ctzll(change));
        for (const uint64_t values : inputs)
            result.first.push_back((values >> bit & 1u) != 0);
        break;
    }
    return result;
}

} // namespace booleq
