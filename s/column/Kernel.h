// The kernel of the result column, for vectors of any width: each source that includes this is
// compiled for one kind of processor. Everything has internal linkage and calls nothing from
// elsewhere, so sources for a narrower kind never share code that was compiled for a wider one.
#ifndef KQ_KERNEL_H
#define KQ_KERNEL_H

#include <cstring>

#include "Column.h"
#include "Word.h"

#if defined(KQ_HAS_X86_KERNELS)
void KqRunAvx2(const KqCode* codes, size_t numCodes, bool isInverted, size_t numWords,
               uint64_t* stack, uint64_t* words);
void KqRunAvx512(const KqCode* codes, size_t numCodes, bool isInverted, size_t numWords,
                 uint64_t* stack, uint64_t* words);
#endif

namespace {

constexpr unsigned int kTileLevel = 12; // a tile has 2^12 rows

// The columns of the variables of a tile; a variable above it is all zeros or all ones there.
struct TilePatterns {
    uint64_t words[kTileLevel][kKqTileWords];
    uint64_t zerosThenOnes[2 * kKqTileWords];
};

constexpr TilePatterns MakeTilePatterns()
{
    TilePatterns patterns = {};
    for (unsigned int variable = 0; variable < kTileLevel; ++variable) {
        for (unsigned int word = 0; word < kKqTileWords; ++word)
            patterns.words[variable][word] = variable < 6
                                                 ? kKqRowsWithBit[variable]
                                                 : uint64_t(0) - (word >> (variable - 6) & 1u);
    }
    for (unsigned int word = 0; word < kKqTileWords; ++word)
        patterns.zerosThenOnes[kKqTileWords + word] = ~uint64_t(0);
    return patterns;
}

alignas(64) constexpr TilePatterns kTilePatterns = MakeTilePatterns();

// A vector of kBytes; in memory it lies at any multiple of eight bytes.
template <unsigned int kBytes>
struct Vectors {
    typedef uint64_t Value __attribute__((vector_size(kBytes)));

    static constexpr unsigned int kWords = kBytes / sizeof(uint64_t);

    // Copied, because not every compiler keeps a type's smaller alignment when the type is an
    // operand. By reference, because without vector registers there is no agreed way to pass a
    // vector.
    static void Load(const uint64_t* words, Value& value) { std::memcpy(&value, words, kBytes); }
    static void Store(const Value& value, uint64_t* words) { std::memcpy(words, &value, kBytes); }
};

// Combines each value with the corresponding vector of the operand.
template <class V, unsigned int kNum, class Combine>
inline __attribute__((always_inline)) void ForEach(const uint64_t* operand,
                                                   typename V::Value* values, Combine combine)
{
    for (unsigned int i = 0; i < kNum; ++i) {
        typename V::Value upper;
        V::Load(operand + i * V::kWords, upper);
        combine(values[i], upper);
    }
}

// Runs all steps for 'kNum' vectors of each operand; the value at hand stays in registers.
template <class V, unsigned int kNum>
inline __attribute__((always_inline)) void
RunStrip(const KqCode* codes, size_t numCodes, bool isInverted, const uint64_t* const* operands,
         size_t offset, uint64_t* stack, uint64_t* words)
{
    typename V::Value value[kNum] = {};
    for (const KqCode* next = codes; next != codes + numCodes; ++next) {
        const KqCode action = *next & ((1u << kKqVariableShift) - 1);
        const uint64_t* operand = operands[*next >> kKqVariableShift] + offset;
        if (action >= kKqUnstack) {
            stack -= kKqTileWords;
            operand = stack;
        }
        switch (action) {
        case kKqTake:
            for (unsigned int i = 0; i < kNum; ++i) {
                V::Store(value[i], stack + i * V::kWords);
                V::Load(operand + i * V::kWords, value[i]);
            }
            stack += kKqTileWords;
            break;
        case kKqCombine | kKqAnd:
        case kKqUnstack | kKqAnd:
            ForEach<V, kNum>(operand, value,
                             [](auto& lower, const auto& upper) { lower &= upper; });
            break;
        case kKqCombine | kKqAnd | kKqInvertLower:
        case kKqUnstack | kKqAnd | kKqInvertLower:
            ForEach<V, kNum>(operand, value,
                             [](auto& lower, const auto& upper) { lower = ~lower & upper; });
            break;
        case kKqCombine | kKqAnd | kKqInvertUpper:
        case kKqUnstack | kKqAnd | kKqInvertUpper:
            ForEach<V, kNum>(operand, value,
                             [](auto& lower, const auto& upper) { lower &= ~upper; });
            break;
        case kKqCombine | kKqAnd | kKqInvertLower | kKqInvertUpper:
        case kKqUnstack | kKqAnd | kKqInvertLower | kKqInvertUpper:
            ForEach<V, kNum>(operand, value,
                             [](auto& lower, const auto& upper) { lower = ~(lower | upper); });
            break;
        default: // XOR
            ForEach<V, kNum>(operand, value,
                             [](auto& lower, const auto& upper) { lower ^= upper; });
            break;
        }
    }
    for (unsigned int i = 0; i < kNum; ++i) {
        const typename V::Value result = isInverted ? ~value[i] : value[i];
        V::Store(result, words + offset + i * V::kWords);
    }
}

// The kernel: tile after tile, each with as many vectors at a time as the registers hold.
template <class V, unsigned int kNum>
inline __attribute__((always_inline)) void RunTiles(const KqCode* codes, size_t numCodes,
                                                    bool isInverted, size_t numWords,
                                                    uint64_t* stack, uint64_t* words)
{
    constexpr size_t kStripWords = kNum * V::kWords;
    static_assert(kKqTileWords % kStripWords == 0, "a tile is a number of strips");
    const uint64_t* operands[kKqMaxColumnVariables];
    for (unsigned int variable = 0; variable < kTileLevel; ++variable)
        operands[variable] = kTilePatterns.words[variable];
    for (size_t tile = 0; tile < numWords / kKqTileWords; ++tile) {
        for (unsigned int variable = kTileLevel; variable < kKqMaxColumnVariables; ++variable)
            operands[variable] =
                kTilePatterns.zerosThenOnes + (tile >> (variable - kTileLevel) & 1u) * kKqTileWords;
        for (size_t offset = 0; offset < kKqTileWords; offset += kStripWords)
            RunStrip<V, kNum>(codes, numCodes, isInverted, operands, offset, stack,
                              words + tile * kKqTileWords);
    }
}

} // namespace

#endif
