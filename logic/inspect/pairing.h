// Which table of one design is which of another one.
// In: both designs, and which nets are the same. Out: pairs, and what is left on each side.
// Cost: some look-ups for each table.
#ifndef BOOLEQ_INSPECT_PAIRING_H
#define BOOLEQ_INSPECT_PAIRING_H

#include <cstdint>
#include <vector>

#include "name_match.h"
#include "net_map.h"

namespace booleq {

enum class PairedBy : uint8_t { Path, Net, Key };
// "path", "net" or "key".
const char* PairedWord(PairedBy by);

struct TablePair {
    uint32_t left; // of Design::tables
    uint32_t right;
    PairedBy by;
};

// Invariant: each table of a design is in one pair, or once among those that are left.
struct Pairing {
    std::vector<TablePair> pairs; // in the order of the left design
    std::vector<uint32_t> onlyLeft;
    std::vector<uint32_t> onlyRight;
    uint64_t numKeysTwice = 0; // cells whose key another cell of their design has, too
};

enum class PairWays { All, Key };

// By path, else by output net, else by key; or by key alone. A path that a program made up
// ("$abc$12") is looked at after the net: two runs give it to different cells.
Pairing PairTables(const Design& left, const Design& right, const NameMatch& match,
                   const NetMap& nets, PairWays ways);

// Pairs what is left by output nets that have become known since; gives back how many pairs came.
size_t PairRest(const Design& left, const Design& right, const NetMap& nets, Pairing& pairing);

} // namespace booleq

#endif
