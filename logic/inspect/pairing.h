// Which table of one design corresponds to which of another. In: both designs, and which nets are
// the same. Out: pairs, and the tables left over on each side.
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

// Invariant: each table of a design is either in exactly one pair or once in onlyLeft or onlyRight.
struct Pairing {
    std::vector<TablePair> pairs; // in the order of the left design
    std::vector<uint32_t> onlyLeft;
    std::vector<uint32_t> onlyRight;
    uint64_t numKeysTwice = 0; // right tables with the key of an earlier cell
};

enum class PairWays { All, Key };

// Pairs by path, else by output net, else by key; or by key alone. A path that a program made up
// ("$abc$12") is tried after the net, because two runs give it to different cells.
Pairing PairTables(const Design& left, const Design& right, const NameMatch& match,
                   const NetMap& nets, PairWays ways);

// Pairs left-over tables by output nets that have become known since. Returns the number of new
// pairs.
size_t PairRest(const Design& left, const Design& right, const NetMap& nets, Pairing& pairing);

} // namespace booleq

#endif
