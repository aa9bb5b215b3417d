// Tables over all functions of up to four inputs: the least function that orders and inversions of
// inputs make of each. Tables of more inputs are made of blocks of four.
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
    // Exchanges of inputs (see SwapLutBits in lut_word.h); one that is not needed moves nothing.
    uint64_t movers[kMaxBlockInputs - 1];
    uint64_t inverted[kMaxBlockInputs]; // all ones if this bit of the row number is inverted
    uint8_t distances[kMaxBlockInputs - 1];
};

uint64_t ApplyToBlocks(const BlockTransformation& transformation, uint64_t word);

// For the orders of 'numInputs' inputs, or the orders with inversions of inputs.
// Immutable once made.  Invariants:
// 1. least[f] is the least function that the transformations make of f, and
//    transformations[toLeast[f]] makes it.
// 2. For f the least of its class, the transformations that leave f as it is are
//    transformations[stabilisers[k]] with k from stabiliserBegins[classOf[f]] to before
//    stabiliserBegins[classOf[f] + 1].
struct BlockTables {
    std::vector<BlockTransformation> transformations;
    std::vector<uint16_t> least;
    std::vector<uint16_t> toLeast;
    std::vector<uint16_t> classOf;
    std::vector<uint16_t> stabilisers;
    std::vector<uint32_t> stabiliserBegins;
};

// Requires: at most kMaxBlockInputs inputs.  Threads: any; the first call makes the tables, which
// takes some milliseconds and half a megabyte for four inputs with inversions.
const BlockTables& BlockTablesOf(unsigned int numInputs, CanonicalScope scope);

} // namespace booleq

#endif
