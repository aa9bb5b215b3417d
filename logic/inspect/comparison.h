// Table by table, whether two designs say the same.
// In: two designs; out: which tables differ, which only one design has, which nets are called
// otherwise. What a difference is made of is worked out when somebody asks for it.
// Cost: some microseconds for each table; a millisecond for one that differs and is described.
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
    Auto, // by name, unless pairs by key show that the names are others
    Kept, // by name
    Gone  // by structure alone
};

struct CompareOptions {
    Renames renames;
    NetNames names = NetNames::Auto;
    // Who reads a net that only passes another one, by a table that the other design lacks, reads
    // that one. Wrong where the cell of such a table has a flip-flop, too.
    bool followsWires = false;
    // What an input reads that nothing is connected to: kNetZero, kNetOne, or nothing that is
    // known.
    NetId openInputs = kNetOpen;
    void (*progress)(void* context, uint64_t numDone, uint64_t numTables) = nullptr;
    void* progressContext = nullptr;
};

// Tables that say the same once a net of the left design is taken for one of the right.
struct RenamedNet {
    NetId left;
    NetId right;
    uint64_t numTables; // that have it, of the left design
};

// One pair that differs, for people and programs.
struct Difference {
    std::vector<std::pair<std::string, bool>> assignment; // nets in the order of the left pins
    bool isSameFunction = false;                          // then there is no assignment
    bool left = false;                                    // values there
    bool right = false;
    NetFunction leftFunction; // in common numbers
    NetFunction rightFunction;
    std::vector<Cause> causes;
    std::string expectedInit; // hexadecimal, for the right table's pins; empty where it lacks a net
};

// Designs stay as they are, but for their inputs, which CompareOptions::followsWires and openInputs
// change.
// Invariant: each pair is the same, the same but for renamed nets, or one of 'different'.
class Comparison {
  public:
    // Requires: both designs outlive the comparison.
    Comparison(Design& left, Design& right, const CompareOptions& options);

    // Nothing differs, is called otherwise or is on one side only, but for wires with followsWires.
    bool IsSame() const;
    const Design& Left() const { return m_left; }
    const Design& Right() const { return m_right; }
    const Pairing& Pairs() const { return m_pairing; }
    const NetMap& Nets() const { return m_nets; }
    uint64_t NumSame() const { return m_num_same; }
    uint64_t NumRenamed() const { return m_num_renamed; } // the same but for names of nets
    // The same in some order of inputs that nothing tells apart; among NumSame.
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

// A table that only passes a net, or is constant.
bool IsWire(const Design& design, uint32_t table);
// "only passes NET", "constant 1", or empty for a table that is more.
std::string WireText(const Design& design, uint32_t table);

} // namespace booleq

#endif
