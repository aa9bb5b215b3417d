// Two netlists compared: is every look-up table still the function it was?
//
//     const std::string head = ".model m\n.names a b y\n";
//     kq_logic::Netlist before;
//     kq_logic::Netlist after;
//     std::string fault;
//     if (!before.ReadText(head + "11 1\n.end\n", fault) ||
//         !after.ReadText(head + "01 1\n.end\n", fault))
//         return 1;
//     const kq_logic::NetlistComparison comparison = kq_logic::Compare(before, after);
//     std::cout << comparison.isSame << '\n'; // 0
//     std::cout << comparison.differences[0].path << '\n'; // y
//
// A comparison lists only what differs, not a verdict for each of a million tables.
#ifndef KQ_LOGIC_NETLIST_COMPARE_H
#define KQ_LOGIC_NETLIST_COMPARE_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include <kq_logic/netlist.h>

namespace kq_logic {

// Whether nets of one name are the same net.
enum class NetlistNames {
    Auto, // decided from the tables that are matched by key
    Kept, // yes
    Gone  // no: only the key matches tables, so both netlists must be read with one
};

// How two netlists are compared.
struct CompareOptions {
    // Pairs of a net's left name and its right name.
    std::vector<std::pair<std::string, std::string>> renames;
    bool allowsWires = false;                // tables that only pass a net may be on one side only
    NetlistNames names = NetlistNames::Auto; // whether names count
    int openInputs = -1;                     // what an unconnected input reads; -1: not known
    size_t maxDescribed = SIZE_MAX;          // further differences are only counted
};

// A table that differs.
struct TableDifference {
    std::string path;                                     // in the left netlist
    std::string rightPath;                                // in the right netlist
    std::string matchedBy;                                // "path", "net" or "key"
    std::string output;                                   // the net that the left one drives
    std::vector<std::pair<std::string, bool>> assignment; // of nets: the first that differs
    bool isSameFunction = false; // only the outputs differ; there is no assignment then
    bool left = false;           // value of the left table for the assignment
    bool right = false;          // value of the right table
    std::string leftEquation;    // empty: none was short enough
    std::string rightEquation;   // the same of the right table
    std::vector<std::pair<std::string, std::string>> causes; // a code and a sentence each
    std::string shouldBe; // init value that would make the right table right; may be empty
};

// A table that only one netlist has.
struct LoneTable {
    std::string path;   // of the table
    std::string output; // the net it drives
    std::string wire;   // "only passes NET" or "constant 1"; empty: it does more
};

// A net with another name throughout.
struct RenamedNet {
    std::string left;       // its name in the left netlist
    std::string right;      // its name in the right netlist
    uint64_t numTables = 0; // that read or drive it
};

// What differs between two netlists, and how they were matched.
struct NetlistComparison {
    bool isSame = false;     // nothing differs, is missing, added or renamed (allowed wires apart)
    uint64_t numSame = 0;    // tables that are the same
    uint64_t numRenamed = 0; // tables that are the same but for names of nets
    uint64_t numDifferent = 0;                // tables that differ, described or not
    std::vector<TableDifference> differences; // those described
    std::vector<LoneTable> missing;           // tables that only the left netlist has
    std::vector<LoneTable> added;             // tables that only the right netlist has
    std::vector<RenamedNet> renamed;          // nets
    bool areNamesGone = false;                // names of nets were ignored
    uint64_t numMatchedNets = 0;              // nets known to be the same
    uint64_t numByOrder = 0;   // of numSame: compared up to an order of inputs that nothing decides
    uint64_t numKeysTwice = 0; // cells that share a key with another cell
    std::vector<std::pair<std::string, std::string>> unusedRenames; // of the options
};

// Matches tables by path, else by output net, else by the key that both were read with, and
// compares them as functions of nets.
// Cost: a copy of both netlists, some microseconds a table, a millisecond for one that differs.
KQ_EXPORT NetlistComparison Compare(const Netlist& left, const Netlist& right,
                                    const CompareOptions& options = CompareOptions());

} // namespace kq_logic

#endif
