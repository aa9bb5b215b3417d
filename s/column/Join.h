// A block of the result column from values of different sizes: a value takes as many rows as the
// variables below it tell apart, and two values are joined into one over the variables of both.
// For trees, whose operands share few variables, nearly all of the work is the last join.
#ifndef KQ_JOIN_H
#define KQ_JOIN_H

#include <cstddef>
#include <cstdint>
#include <memory>

#include "Program.h"

// The variables below this one tell the rows of a granule apart; every value has at least one
// granule.
constexpr unsigned int kKqGranuleLevel = 9;
constexpr size_t kKqGranuleWords = size_t(1) << (kKqGranuleLevel - 6);

// Variables above the granule, at most.
constexpr unsigned int kKqMaxJoinLevels = 20;

// One operand of a join: where its granules are. 'strides' are the distances, in words, from a
// granule to the one whose number has one more bit set; 0 where the value lacks that bit's
// variable.
struct KqJoinOperand {
    const uint64_t* words;
    uint64_t inversion; // all ones when the complement is taken, else 0
    size_t strides[kKqMaxJoinLevels];
};

// The words of 2^numLevels granules, one after another: the AND of both operands or, for 'isXor',
// their exclusive or; complemented when 'inversion' is all ones.
struct KqJoin {
    bool isXor;
    uint64_t inversion;
    unsigned int numLevels;
    KqJoinOperand lower;
    KqJoinOperand upper;
};

typedef void (*KqJoinKernel)(const KqJoin& join, uint64_t* words);

class KqJoiner {
  public:
    explicit KqJoiner(KqJoinKernel kernel) : m_kernel(kernel) {}

    // Writes the block of 2^level rows of a program whose variables are numbered by the bit of the
    // row number that is their value. False, with nothing written, when the values are so large
    // that other ways cost less.
    // Requires: a step; variables below 'level'; kKqGranuleLevel <= level.
    // Fails: std::bad_alloc.  Cost: O(steps) to refuse; to write, a few times the block, and more
    // for each stacked value.
    bool Fill(const KqCode* codes, size_t numCodes, bool isInverted, unsigned int level,
              uint64_t* words);

  private:
    // A value: the variables it is over, the lowest one being bit 0, and its granules in order.
    struct Value {
        uint32_t variables; // of those above the granule
        const uint64_t* words;
        size_t stride; // of the lowest variable
    };

    static bool IsWorthwhile(const KqCode* codes, size_t numCodes, unsigned int level,
                             size_t& numWords);
    void Join(KqCode kind, const Value& lower, const Value& upper, uint32_t variables,
              bool isInverted, uint64_t* words) const;
    static Value VariableValue(uint32_t variable);

    KqJoinKernel m_kernel;
    std::unique_ptr<uint64_t[]> m_words; // of the intermediate values, unset at first
    size_t m_num_words = 0;
};

#endif
