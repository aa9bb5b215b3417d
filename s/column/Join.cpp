// Program in, block of the result column out, by joins of values.
#include "Join.h"

#include <cassert>

#include "Kernel.h"

namespace {

// Intermediate values are kept while they fit in the processor's own cache.
constexpr size_t kMaxWords = size_t(1) << 15;

// What joins may cost, in granules: all but the last one together at most twice the block, and more
// for each stacked value, since trees gain little when their variables are fixed instead.
// Preparing a join costs as much as some granules. Of the sizes tried with bench_column these are
// the best: without joins, trees of 20 to 28 variables take 2 to 8 times as long.
constexpr size_t kMaxFactor = 2;
constexpr size_t kStackedGranules = 64;
constexpr size_t kJoinGranules = 8;

uint32_t AboveGranule(uint32_t variable)
{
    return variable < kKqGranuleLevel ? 0 : 1u << (variable - kKqGranuleLevel);
}

// The strides of a value for each variable of a result.
void SetStrides(uint32_t variables, size_t stride, uint32_t resultVariables, size_t* strides)
{
    for (; resultVariables != 0; resultVariables >>= 1, variables >>= 1) {
        if ((resultVariables & 1u) == 0)
            continue;
        *strides++ = (variables & 1u) != 0 ? stride : 0;
        if ((variables & 1u) != 0)
            stride *= 2;
    }
}

} // namespace

KqJoiner::Value KqJoiner::VariableValue(uint32_t variable)
{
    if (variable < kKqGranuleLevel)
        return {0, kTilePatterns.words[variable], 0};
    return {AboveGranule(variable), kTilePatterns.zerosThenOnes, kKqTileWords};
}

// Adds up what the joins write and cost; 'numWords' becomes the size of all values but the last.
bool KqJoiner::IsWorthwhile(const KqCode* codes, size_t numCodes, unsigned int level,
                            size_t& numWords)
{
    uint32_t stack[kKqMaxStack] = {};
    uint32_t* top = stack;
    uint32_t hand = 0;
    size_t numGranules = 0;
    size_t cost = 0;
    size_t last = 0;
    const size_t numBlockGranules = size_t(1) << (level - kKqGranuleLevel);
    size_t limit = kMaxFactor * numBlockGranules;
    bool isChain = true;
    for (const KqCode* next = codes; next != codes + numCodes; ++next) {
        const KqCode action = KqActionOf(*next);
        if (action < kKqCombine) {
            *top++ = hand;
            hand = AboveGranule(KqVariableOf(*next));
            limit += kStackedGranules;
            isChain = next == codes;
            continue;
        }
        hand |= action >= kKqUnstack ? *--top : AboveGranule(KqVariableOf(*next));
        last = size_t(1) << KqCountBits(hand);
        numGranules += last;
        cost += last + kJoinGranules;
        numWords = (numGranules - last) * kKqGranuleWords;
        if (cost > limit + last || numWords > kMaxWords)
            return false;
    }
    return !isChain; // a chain leaves few different rests when its variables are fixed
}

void KqJoiner::Join(KqCode kind, const Value& lower, const Value& upper, uint32_t variables,
                    bool isInverted, uint64_t* words) const
{
    assert((lower.variables & ~variables) == 0);
    assert((upper.variables & ~variables) == 0);
    const bool isXor = kind == kKqXor;
    KqJoin join;
    join.isXor = isXor;
    join.inversion = uint64_t(0) - (isInverted ? 1u : 0u);
    join.numLevels = KqCountBits(variables);
    join.lower.words = lower.words;
    join.lower.inversion = uint64_t(0) - (!isXor && (kind & kKqInvertLower) != 0 ? 1u : 0u);
    SetStrides(lower.variables, lower.stride, variables, join.lower.strides);
    join.upper.words = upper.words;
    join.upper.inversion = uint64_t(0) - (!isXor && (kind & kKqInvertUpper) != 0 ? 1u : 0u);
    SetStrides(upper.variables, upper.stride, variables, join.upper.strides);
    m_kernel(join, words);
}

bool KqJoiner::Fill(const KqCode* codes, size_t numCodes, bool isInverted, unsigned int level,
                    uint64_t* words)
{
    assert(level >= kKqGranuleLevel);
    size_t numWords = 0;
    if (numCodes < 2 || level > kKqGranuleLevel + kKqMaxJoinLevels ||
        !IsWorthwhile(codes, numCodes, level, numWords))
        return false;
    if (m_num_words < numWords) {
        m_num_words = 0;
        m_words.reset(new uint64_t[numWords]);
        m_num_words = numWords;
    }
    uint64_t* free = m_words.get();
    Value stack[kKqMaxStack];
    Value* top = stack;
    Value hand = {0, nullptr, 0};
    const KqCode* const end = codes + numCodes;
    for (const KqCode* next = codes; next != end; ++next) {
        const KqCode action = KqActionOf(*next);
        if (action < kKqCombine) {
            *top++ = hand;
            hand = VariableValue(KqVariableOf(*next));
            continue;
        }
        const Value upper = action >= kKqUnstack ? *--top : VariableValue(KqVariableOf(*next));
        if (next + 1 == end) {
            Join(KqKindOf(action), hand, upper, (1u << (level - kKqGranuleLevel)) - 1, isInverted,
                 words);
            break;
        }
        const uint32_t variables = hand.variables | upper.variables;
        assert(free + (kKqGranuleWords << KqCountBits(variables)) <= m_words.get() + numWords);
        Join(KqKindOf(action), hand, upper, variables, false, free);
        hand = {variables, free, kKqGranuleWords};
        free += kKqGranuleWords << KqCountBits(variables);
    }
    assert(top == stack + 1); // the first value at hand, which nothing takes
    assert(free == m_words.get() + numWords);
    return true;
}
