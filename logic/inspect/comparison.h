// Compares two designs table by table. In: two designs; out: which tables differ, which only one
// design has, and which nets have another name. The details of a difference are worked out on
// demand.
// Cost: some microseconds for each table; a millisecond to describe a difference.
#ifndef BOOLEQ_INSPECT_COMPARISON_H
#define BOOLEQ_INSPECT_COMPARISON_H

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "cause.h"
#include "net_map.h"
#include "pairing.h"

namespace booleq {

enum class NetNames {
    Auto, // by name, unless pairs by key show that the names were changed
    Kept, // by name
    Gone  // by key and structure only
};

struct CompareOptions {
    Renames renames;
    NetNames names = NetNames::Auto;
    // If a table that the other design lacks only passes a net, readers of its output count as
    // readers of that net. Wrong if the cell of such a table also has a flip-flop.
    bool followsWires = false;
    // The value of an input that is not connected: kNetZero, kNetOne, or kNetOpen for unknown.
    NetId openInputs = kNetOpen;
    void (*progress)(void* context, uint64_t numDone, uint64_t numTables) = nullptr;
    void* progressContext = nullptr;
};

// A net of the left design that makes tables equal once it is identified with one of the right.
struct RenamedNet {
    NetId left;
    NetId right;
    uint64_t numTables; // of the left design, that have the net
};

// One pair that differs, for people and programs.
struct Difference {
    std::vector<std::pair<std::string, bool>> assignment; // nets, in the order of the left pins
    bool isSameFunction = false;                          // if true, there is no assignment
    bool left = false;                                    // the values for that assignment
    bool right = false;
    NetFunction leftFunction; // over common numbers
    NetFunction rightFunction;
    std::vector<Cause> causes;
    std::string expectedInit; // hexadecimal, for the right table's pins; empty if it lacks a net
};

// Compares two designs, of which only the table inputs change, by followsWires and openInputs.
// Invariant: each pair is the same, or the same except for renamed nets, or in Different().
class Comparison {
  public:
    // Requires: both designs outlive the comparison.
    Comparison(Design& left, Design& right, const CompareOptions& options);

    // Whether nothing differs, is renamed or is in one design only; wires are ignored with
    // followsWires.
    bool IsSame() const;
    const Design& Left() const { return m_left; }
    const Design& Right() const { return m_right; }
    const Pairing& Pairs() const { return m_pairing; }
    const NetMap& Nets() const { return m_nets; }
    uint64_t NumSame() const { return m_num_same; }
    uint64_t NumRenamed() const { return m_num_renamed; } // the same except for names of nets
    // Pairs that are the same in some order of indistinguishable inputs; included in NumSame.
    uint64_t NumByOrder() const { return m_num_by_order; }
    const std::vector<TablePair>& Different() const { return m_different; }
    const std::vector<RenamedNet>& RenamedNets() const { return m_renamed; }
    bool AreNamesGone() const { return m_are_names_gone; }
    const Renames& UnusedRenames() const { return m_unused_renames; }

    Difference Describe(const TablePair& pair) const;
    std::string NameOf(NetId number) const;

  private:
    enum class Verdict : uint8_t { Same, SameByOrder, Renamed, Different };

    void Match(const CompareOptions& options);
    void CompareAll(const CompareOptions& options);
    bool HasOnlyWires(const Design& design, const std::vector<uint32_t>& tables) const;
    Verdict Compare(const TablePair& pair) const;
    Verdict CompareOutputs(const TablePair& pair) const;
    bool HasRenamed(const TablePair& pair) const;
    void Count(const TablePair& pair, Verdict verdict, std::vector<uint64_t>& counts);
    void CountRenamed(const TablePair& pair, std::vector<uint64_t>& counts) const;

    Design& m_left;
    Design& m_right;
    NameMatch m_match;
    NetMap m_nets;
    Pairing m_pairing;
    Renames m_unused_renames;
    bool m_are_names_gone = false;
    bool m_follows_wires;
    std::vector<bool> m_is_renamed; // by left net
    std::vector<RenamedNet> m_renamed;
    std::vector<TablePair> m_different;
    uint64_t m_num_same = 0;
    uint64_t m_num_renamed = 0;
    uint64_t m_num_by_order = 0;
};

// Whether a table only passes a net or is constant.
bool IsWire(const Design& design, uint32_t table);
// "only passes NET", "constant 1", or empty for any other table.
std::string WireText(const Design& design, uint32_t table);

} // namespace booleq

#endif
