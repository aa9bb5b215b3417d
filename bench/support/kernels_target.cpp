// Hand-written column kernels: each formula as one C++ expression over words of 64 rows, in blocks
// that stay in the cache. Compiled once for each instruction set, with BENCH_TARGET as its
// namespace.
// Nothing of the standard library is called here: otherwise the linker might keep, for all
// processors, an inline function that was compiled for the newest one.
#include "kernels.h"

namespace {

constexpr uint64_t kPatterns[6] = {0xaaaaaaaaaaaaaaaau, 0xccccccccccccccccu, 0xf0f0f0f0f0f0f0f0u,
                                   0xff00ff00ff00ff00u, 0xffff0000ffff0000u, 0xffffffff00000000u};

constexpr unsigned int kMaxBlockBits = 6;

// Columns of the variables that change from word to word inside a block.
struct BlockMasks {
    alignas(64) uint64_t words[kMaxBlockBits][1u << kMaxBlockBits];
    constexpr BlockMasks() : words()
    {
        for (unsigned int bit = 0; bit < kMaxBlockBits; ++bit)
            for (uint64_t word = 0; word < 1u << kMaxBlockBits; ++word)
                words[bit][word] = uint64_t(0) - (word >> bit & 1u);
    }
};
constexpr BlockMasks kBlockMasks;

// Where an expression finds its variables: bit 'kBit' of the row number.
template <unsigned int kBlockBits>
struct Operands {
    const uint64_t* leading; // columns of the variables that stay the same throughout the block
    uint64_t word;

    template <unsigned int kBit>
    uint64_t Get() const
    {
        if constexpr (kBit < 6)
            return kPatterns[kBit];
        else if constexpr (kBit < 6 + kBlockBits)
            return kBlockMasks.words[kBit - 6][word];
        else
            return leading[kBit];
    }
};

template <class Expression, unsigned int kWantedBlockBits>
void FillColumn(uint64_t* __restrict words)
{
    constexpr unsigned int kWordBits = Expression::kNumVariables - 6;
    constexpr unsigned int kBlockBits = kWantedBlockBits < kWordBits ? kWantedBlockBits : kWordBits;
    uint64_t leading[32] = {};
    for (uint64_t first = 0; first < uint64_t(1) << kWordBits; first += 1u << kBlockBits) {
        for (unsigned int bit = 6 + kBlockBits; bit < Expression::kNumVariables; ++bit)
            leading[bit] = uint64_t(0) - (first >> (bit - 6) & 1u);
        for (uint64_t word = 0; word < 1u << kBlockBits; ++word)
            words[first + word] = Expression::Get(Operands<kBlockBits>{leading, word});
    }
}

template <size_t kIndex>
struct Expression;

#define X(variable) operands.template Get<kNumVariables - 1 - (variable)>()
#define COLUMN_FORMULA(index, numVariables, words)                                                 \
    template <>                                                                                    \
    struct Expression<index> {                                                                     \
        static constexpr unsigned int kNumVariables = numVariables;                                \
        template <class O>                                                                         \
        static uint64_t Get(const O& operands)                                                     \
        {                                                                                          \
            return words;                                                                          \
        }                                                                                          \
    };
#include "column_formulas.inc"
#undef COLUMN_FORMULA

} // namespace

#define COLUMN_FORMULA(index, numVariables, words)                                                 \
    {FillColumn<Expression<index>, 4>, FillColumn<Expression<index>, 5>,                           \
     FillColumn<Expression<index>, 6>},
const bench::KernelRow bench::BENCH_TARGET::kKernels[] = {
#include "column_formulas.inc"
};
