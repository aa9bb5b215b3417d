// Nets that are the same because the tables around them are: what tells nets apart that have other
// names, or none.
// In: pairs of tables. Out: nets joined. It fails on nothing; what it cannot tell stays unknown.
// Cost: a look at each pair in which a net is unknown, for each round; at most kMaxRounds.
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

// How many ways there are to take the unknown nets of one function for those of the other one so
// that they are equal, and the first of them.
struct Assignments {
    static constexpr unsigned int kMaxNets = 5; // more have too many orders

    unsigned int number = 0;                    // 2 stands for more
    std::vector<std::pair<NetId, NetId>> first; // common numbers, left and right
    bool isTried = true;                        // false: too many nets
};
Assignments FindAssignments(const NetFunction& left, const NetFunction& right, const NetMap& nets);

// Left and right nets that are the same.
// Joins the outputs of pairs, then, again and again, the inputs that can be nothing else, by the
// vote of all pairs. A net that two tables want to join with different ones stays unknown unless
// more want one of them; of 'doubtful' nets, which a name speaks for, two tables at least must want
// it.
typedef std::vector<std::pair<NetId, NetId>> NetPairs;
NetPairs JoinByStructure(const Design& left, const Design& right, const Pairing& pairing,
                         const NetPairs& doubtful, NetMap& nets);
// Joins those of which nothing else is known as their names say.
void JoinDoubtful(const NetPairs& doubtful, NetMap& nets);

// Tables of 'tables' that only pass a net, or are constant: whoever reads their output reads the
// net itself from now on.
void FollowWires(Design& design, const std::vector<uint32_t>& tables);

} // namespace booleq

#endif
