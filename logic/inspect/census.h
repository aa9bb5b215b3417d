// What a design consists of: its tables by width and type, its distinct functions and how often
// each occurs. Functions are taken after folding, without idle inputs, in the order of the pins.
// Cost: some hundred nanoseconds for each table; a canonical form for each distinct function.
#ifndef BOOLEQ_INSPECT_CENSUS_H
#define BOOLEQ_INSPECT_CENSUS_H

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "design.h"
#include "rows.h"

namespace booleq {

constexpr size_t kMaxCommonest = 10; // how many of the commonest functions reports name

struct CountedFunction {
    Rows rows;
    uint64_t numTables = 0;
    uint32_t classNumber = 0; // functions with the same number are equal up to order and inversions
};

struct TypeCount {
    std::string name;
    CellRole role;
    uint64_t numCells;
    std::string note;
};

struct Census {
    uint64_t numTables = 0;
    uint64_t numCells = 0;
    std::vector<uint64_t> byWidth;          // by number of pins
    std::vector<uint64_t> byInputs;         // by number of inputs that matter
    std::vector<TypeCount> types;           // the commonest first
    std::vector<CountedFunction> functions; // the commonest first
    uint32_t numClasses = 0;  // of functions of up to six inputs, up to order and inversions
    uint64_t numWide = 0;     // distinct functions of more inputs, which have no class
    uint64_t numConstant = 0; // tables
    uint64_t numWires = 0;
    uint64_t numInverters = 0;
    uint64_t numIdle = 0;   // tables with an input that has no effect
    uint64_t numUnread = 0; // cells
    std::vector<std::pair<FindingCode, uint64_t>> findings; // the reader's, by code
};

// "table", "constant", "not read", "module" or "other".
const char* RoleWord(CellRole role);

Census TakeCensus(const Design& design);

} // namespace booleq

#endif
