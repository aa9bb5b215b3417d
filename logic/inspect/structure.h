// Finds nets that are the same because the tables around them are, for nets whose names differ or
// are missing. In: pairs of tables. Out: nets joined.  Fails: never; nets that it cannot decide
// stay unknown.
// Cost: in each round, one visit to each pair with an unknown net; at most kMaxRounds rounds.
#ifndef BOOLEQ_INSPECT_STRUCTURE_H
#define BOOLEQ_INSPECT_STRUCTURE_H

#include <utility>
#include <vector>

#include "net_function.h"
#include "net_map.h"
#include "pairing.h"

namespace booleq {

// A table's function in the common numbers.
NetFunction LeftFunction(const Design& left, uint32_t table);
NetFunction RightFunction(const Design& right, uint32_t table, const NetMap& nets);

// How many ways there are to identify the unknown nets of one function with those of the other so
// that the functions are equal, and the first of these ways.
struct Assignments {
    static constexpr unsigned int kMaxNets = 5;     // more have too many orders for every round
    static constexpr unsigned int kMaxNetsOnce = 7; // and more have too many to try at all

    unsigned int number = 0;                    // 2 means two or more
    std::vector<std::pair<NetId, NetId>> first; // common numbers, left and right
    bool isTried = true;                        // false: too many nets
};
Assignments FindAssignments(const NetFunction& left, const NetFunction& right, const NetMap& nets,
                            unsigned int maxNets = Assignments::kMaxNets);
// Whether both functions have unknown nets alone.
bool IsAllUnknown(const NetFunction& left, const NetFunction& right, const NetMap& nets);

// Joins the outputs of pairs, then, round by round, the inputs that leave only one possibility, by
// a vote of all pairs. A net for which tables vote for different nets stays unknown unless one of
// them has more votes. 'doubtful' nets have a common name, so joining them otherwise takes at least
// two votes. Returns the left and right nets that were joined.
typedef std::vector<std::pair<NetId, NetId>> NetPairs;
NetPairs JoinByStructure(const Design& left, const Design& right, const Pairing& pairing,
                         const NetPairs& doubtful, NetMap& nets);
// Joins doubtful nets by name if nothing else is known about them.
void JoinDoubtful(const NetPairs& doubtful, NetMap& nets);

// Bypasses those of 'tables' that only pass a net or are constant: inputs that read their output
// now read the net itself.
void FollowWires(Design& design, const std::vector<uint32_t>& tables);

} // namespace booleq

#endif
