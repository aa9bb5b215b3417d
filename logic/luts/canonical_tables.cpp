#include "canonical_tables.h"

#include <algorithm>
#include <array>
#include <cassert>
#include <mutex>
#include <numeric>

#include "rows.h"

namespace booleq {

namespace {

BlockTransformation Prepare(const LutTransformation& meaning, unsigned int numInputs)
{
    BlockTransformation prepared = {};
    prepared.meaning = meaning;
    std::array<uint8_t, kMaxBlockInputs> at = {0, 1, 2, 3};
    for (unsigned int place = 0; place < kMaxBlockInputs - 1; ++place) {
        const auto from = static_cast<unsigned int>(
            std::find(at.begin(), at.end(), meaning.order[place]) - at.begin());
        prepared.distances[place] = 1; // of an exchange that moves nothing
        if (from == place)
            continue;
        assert(place < from && from < numInputs);
        std::swap(at[from], at[place]);
        const unsigned int low = numInputs - 1 - from;
        const unsigned int high = numInputs - 1 - place;
        prepared.distances[place] = static_cast<uint8_t>((1u << high) - (1u << low));
        prepared.movers[place] = BitPattern(low) & ~BitPattern(high);
    }
    for (unsigned int bit = 0; bit < numInputs; ++bit)
        if ((meaning.invertedInputs >> (numInputs - 1 - bit) & 1u) != 0)
            prepared.inverted[bit] = ~uint64_t(0);
    return prepared;
}

std::vector<BlockTransformation> AllTransformations(unsigned int numInputs, CanonicalScope scope)
{
    const unsigned int numInversions = scope == CanonicalScope::Order ? 1u : 1u << numInputs;
    std::vector<BlockTransformation> all;
    LutTransformation meaning;
    // Not meaning.order itself: gcc 12 for aarch64 warns that permuting its bytes writes beyond
    // them.
    std::vector<unsigned int> order(numInputs);
    std::iota(order.begin(), order.end(), 0u);
    do {
        for (unsigned int place = 0; place < numInputs; ++place)
            meaning.order[place] = static_cast<uint8_t>(order[place]);
        for (unsigned int inverted = 0; inverted < numInversions; ++inverted) {
            meaning.invertedInputs = static_cast<uint8_t>(inverted);
            all.push_back(Prepare(meaning, numInputs));
        }
    } while (std::next_permutation(order.begin(), order.end()));
    return all;
}

// Goes through the functions in ascending order. One that no lesser function becomes is the least
// of its class, and the class is all that the transformations make of it.
BlockTables MakeTables(unsigned int numInputs, CanonicalScope scope)
{
    const size_t numFunctions = size_t(1) << (1u << numInputs);
    BlockTables tables;
    tables.transformations = AllTransformations(numInputs, scope);
    tables.least.resize(numFunctions);
    tables.toLeast.resize(numFunctions);
    tables.classOf.resize(numFunctions);
    std::vector<bool> isKnown(numFunctions);
    for (size_t least = 0; least < numFunctions; ++least) {
        if (isKnown[least])
            continue;
        const auto classIndex = static_cast<uint16_t>(tables.stabiliserBegins.size());
        tables.stabiliserBegins.push_back(static_cast<uint32_t>(tables.stabilisers.size()));
        for (size_t index = 0; index < tables.transformations.size(); ++index) {
            const auto function = static_cast<size_t>(
                TransformBack(tables.transformations[index].meaning, least, numInputs));
            assert(function >= least);
            if (function == least)
                tables.stabilisers.push_back(static_cast<uint16_t>(index));
            if (isKnown[function])
                continue;
            isKnown[function] = true;
            tables.least[function] = static_cast<uint16_t>(least);
            tables.toLeast[function] = static_cast<uint16_t>(index);
            tables.classOf[function] = classIndex;
        }
    }
    tables.stabiliserBegins.push_back(static_cast<uint32_t>(tables.stabilisers.size()));
    return tables;
}

} // namespace

uint64_t ApplyToBlocks(const BlockTransformation& transformation, uint64_t word)
{
    for (unsigned int step = 0; step < kMaxBlockInputs - 1; ++step) {
        const unsigned int distance = transformation.distances[step];
        const uint64_t change = (word ^ word >> distance) & transformation.movers[step];
        word ^= change ^ change << distance;
    }
    for (unsigned int bit = 0; bit < kMaxBlockInputs; ++bit) {
        const uint64_t upper = BitPattern(bit);
        const uint64_t inverted = (word & upper) >> (1u << bit) | (word << (1u << bit) & upper);
        word ^= (word ^ inverted) & transformation.inverted[bit];
    }
    return word;
}

const BlockTables& BlockTablesOf(unsigned int numInputs, CanonicalScope scope)
{
    assert(numInputs <= kMaxBlockInputs);
    struct Made {
        std::once_flag once;
        BlockTables tables;
    };
    static std::array<Made, size_t(2) * (kMaxBlockInputs + 1)> all;
    const size_t index = 2 * size_t(numInputs) + (scope == CanonicalScope::Order ? 0 : 1);
    Made& made = all[index];
    std::call_once(made.once, [&] { made.tables = MakeTables(numInputs, scope); });
    return made.tables;
}

} // namespace booleq
