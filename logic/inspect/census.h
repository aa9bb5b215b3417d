// What a design is made of: its tables by width and type, its different functions and how often
// each stands there. Functions are those after folding, without idle inputs, in the order of pins.
// Cost: some hundred nanoseconds for each table; a canonical form for each different function.
#ifndef BOOLEQ_INSPECT_CENSUS_H
#define BOOLEQ_INSPECT_CENSUS_H

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "design.h"
#include "rows.h"

namespace booleq {

constexpr size_t kMaxCommonest = 10; // of the commonest functions, what reports name

struct CountedFunction {
    Rows rows;
    uint64_t numTables = 0;
    uint32_t classNumber = 0; // those with one number are alike up to order and inversions
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
    uint32_t numClasses = 0;  // up to order and inversions, of functions of up to six inputs
    uint64_t numWide = 0;     // different functions of more, which are in no class
    uint64_t numConstant = 0; // tables of that kind
    uint64_t numWires = 0;
    uint64_t numInverters = 0;
    uint64_t numIdle = 0;   // tables with an input that has no effect
    uint64_t numUnread = 0; // cells
    std::vector<std::pair<FindingCode, uint64_t>> findings; // of the reader, by code
};

// "table", "constant", "not read", "module" or "other".
const char* RoleWord(CellRole role);

Census TakeCensus(const Design& design);

} // namespace booleq

#endif
