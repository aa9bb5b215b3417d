// The kernel of joins, for vectors of any width; compiled like the column's own kernel, once for
// each kind of processor and with internal linkage only.
#ifndef KQ_JOINKERNEL_H
#define KQ_JOINKERNEL_H

#include "Join.h"
#include "Kernel.h"

#if defined(KQ_HAS_X86_KERNELS)
void KqJoinAvx2(const KqJoin& join, uint64_t* words);
void KqJoinAvx512(const KqJoin& join, uint64_t* words);
#endif

namespace {

// A join's inversions, in registers.
template <class V>
struct Inversions {
    typename V::Value lower;
    typename V::Value upper;
    typename V::Value result;

    explicit Inversions(const KqJoin& join)
        : lower(typename V::Value{} ^ join.lower.inversion),
          upper(typename V::Value{} ^ join.upper.inversion),
          result(typename V::Value{} ^ join.inversion)
    {
    }
};

// Writes one granule.
template <class V, bool kIsXor>
inline __attribute__((always_inline)) void JoinGranule(const Inversions<V>& inversions,
                                                       const uint64_t* lower, const uint64_t* upper,
                                                       uint64_t* words)
{
    for (size_t word = 0; word < kKqGranuleWords; word += V::kWords) {
        typename V::Value a;
        typename V::Value b;
        V::Load(lower + word, a);
        V::Load(upper + word, b);
        if (kIsXor)
            V::Store(a ^ b ^ inversions.result, words + word);
        else
            V::Store(((a ^ inversions.lower) & (b ^ inversions.upper)) ^ inversions.result,
                     words + word);
    }
}

// How far an operand moves when the bits of the granule number below a level wrap around.
inline void SetSteps(const KqJoinOperand& operand, unsigned int firstLevel, unsigned int numLevels,
                     ptrdiff_t* steps)
{
    ptrdiff_t below = 0;
    for (unsigned int level = firstLevel; level < numLevels; ++level) {
        const ptrdiff_t stride = static_cast<ptrdiff_t>(operand.strides[level]);
        steps[level - firstLevel] = stride - below;
        below += stride;
    }
    steps[numLevels - firstLevel] = 0; // after the last one
}

// All granules, 2^kNumInner of them at a time.
template <class V, bool kIsXor, unsigned int kNumInner>
inline __attribute__((always_inline)) void JoinAll(const KqJoin& join, uint64_t* words)
{
    ptrdiff_t lowerSteps[kKqMaxJoinLevels + 1];
    ptrdiff_t upperSteps[kKqMaxJoinLevels + 1];
    SetSteps(join.lower, kNumInner, join.numLevels, lowerSteps);
    SetSteps(join.upper, kNumInner, join.numLevels, upperSteps);
    size_t lowerOffsets[1u << kNumInner] = {};
    size_t upperOffsets[1u << kNumInner] = {};
    for (unsigned int inner = 1; inner < 1u << kNumInner; ++inner) {
        const int level = __builtin_ctz(inner);
        lowerOffsets[inner] = lowerOffsets[inner & (inner - 1)] + join.lower.strides[level];
        upperOffsets[inner] = upperOffsets[inner & (inner - 1)] + join.upper.strides[level];
    }
    const Inversions<V> inversions(join);
    const uint64_t* lower = join.lower.words;
    const uint64_t* upper = join.upper.words;
    const size_t numOuter = size_t(1) << (join.numLevels - kNumInner);
    for (size_t outer = 1; outer <= numOuter; ++outer) {
        for (unsigned int inner = 0; inner < 1u << kNumInner; ++inner) {
            JoinGranule<V, kIsXor>(inversions, lower + lowerOffsets[inner],
                                   upper + upperOffsets[inner], words);
            words += kKqGranuleWords;
        }
        const int level = __builtin_ctzll(outer);
        lower += lowerSteps[level];
        upper += upperSteps[level];
    }
}

template <class V>
inline __attribute__((always_inline)) void JoinValues(const KqJoin& join, uint64_t* words)
{
    if (join.numLevels >= 2)
        join.isXor ? JoinAll<V, true, 2>(join, words) : JoinAll<V, false, 2>(join, words);
    else
        join.isXor ? JoinAll<V, true, 0>(join, words) : JoinAll<V, false, 0>(join, words);
}

} // namespace

#endif
