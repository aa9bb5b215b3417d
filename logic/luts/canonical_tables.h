// What is known beforehand of all functions of up to four inputs: the least that order and
// inversions of inputs make of each. Tables of more inputs are blocks of these.
#ifndef BOOLEQ_LUTS_CANONICAL_TABLES_H
#define BOOLEQ_LUTS_CANONICAL_TABLES_H

#include <cstdint>
#include <vector>

#include "canonical.h"

namespace booleq {

constexpr unsigned int kMaxBlockInputs = 4;

// A transformation of the inputs of a block, for all blocks of a word at once, without branches.
struct BlockTransformation {
    LutTransformation meaning; // over the block's inputs
    // Exchanges of inputs, see SwapLutBits (lut_word.h); one that is not needed moves nothing.
    uint64_t movers[kMaxBlockInputs - 1];
    uint64_t inverted[kMaxBlockInputs]; // all ones where this bit of the row number is inverted
    uint8_t distances[kMaxBlockInputs - 1];
};

uint64_t ApplyToBlocks(const BlockTransformation& transformation, uint64_t word);

// Orders, or orders with inversions of inputs, of 'numInputs' inputs.
// Immutable once made.  Invariants:
// 1. least[f] is the least of what the transformations make of f, which is what
//    transformations[toLeast[f]] makes.
// 2. Those of transformations[stabilisers[k]] that leave f as it is, for the least functions f
//    alone, are at stabiliserBegins[classOf[f]] to stabiliserBegins[classOf[f] + 1].
struct BlockTables {
    std::vector<BlockTransformation> transformations;
    std::vector<uint16_t> least;
    std::vector<uint16_t> toLeast;
    std::vector<uint16_t> classOf;
    std::vector<uint16_t> stabilisers;
    std::vector<uint32_t> stabiliserBegins;
};

// Requires: at most kMaxBlockInputs inputs.  Threads: any; the first call makes the tables, for
// four inputs and inversions in some milliseconds, half a megabyte.
const BlockTables& BlockTablesOf(unsigned int numInputs, CanonicalScope scope);

} // namespace booleq

#endif
