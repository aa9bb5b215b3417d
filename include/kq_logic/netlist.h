// Look-up tables of netlists, read and compared: is each still the function it was?
//
//     const std::string head = ".model m\n.names a b y\n";
//     kq_logic::Netlist before;
//     kq_logic::Netlist after;
//     std::string fault;
//     if (!before.ReadText(head + "11 1\n.end\n", fault) ||
//         !after.ReadText(head + "01 1\n.end\n", fault))
//         return 1;
//     std::cout << before.NumTables() << ' ' << before.At(0).init << '\n'; // 1 0x8
//     const kq_logic::NetlistComparison comparison = kq_logic::Compare(before, after);
//     std::cout << comparison.isSame << '\n'; // 0
//     std::cout << comparison.differences[0].path << '\n'; // y
//
// A netlist may have a million tables, so it is held packed: At() makes one plain value at a time,
// and a comparison has only what is not the same, not a verdict for each table.
#ifndef KQ_LOGIC_NETLIST_H
#define KQ_LOGIC_NETLIST_H

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include <kq_logic/function.h>

namespace kq_logic {

// One output of a cell that is a look-up table, as the file has it.
struct NetlistTable {
    std::string path;
    std::string type;
    std::string output;              // the net
    std::vector<std::string> inputs; // nets, the most significant pin first; "1'b0" for a constant
    std::string init;                // hexadecimal, over these inputs
};

struct NetlistOptions {
    std::string key;       // an attribute of cells that tables can be matched by
    std::string cellsFile; // more types of cells
    std::string top;       // the module that is the design, where the file does not say so
};

// A value: copies share what nobody changes.
// Fails: std::bad_alloc, and what a watcher throws (watch.h); otherwise as the members say.
// Threads: any, each with netlists of its own.
class KQ_EXPORT Netlist {
  public:
    // Without tables.
    Netlist();

    // Becomes what a file holds: Yosys JSON, BLIF, EDIF 2.0.0, structural Verilog (by the program
    // yosys), also compressed by gzip; "-" is standard input.
    // Fails: false with a text that names the file and a place in it; the netlist is as it was.
    bool Read(const std::string& file, std::string& fault,
              const NetlistOptions& options = NetlistOptions());
    // The same for a text in memory.
    bool ReadText(const std::string& text, std::string& fault,
                  const NetlistOptions& options = NetlistOptions());

    size_t NumTables() const;
    // Requires: table < NumTables().
    NetlistTable At(size_t table) const;

    struct Imp; // internal

  private:
    friend struct NetlistAccess;
    std::shared_ptr<const Imp> m_imp;
};

struct CompareOptions {
    std::vector<std::pair<std::string, std::string>>
        renames;              // a left net, and the right one's name
    bool allowsWires = false; // tables that only pass a net or a constant may be on one side only
};

// A table that differs.
struct TableDifference {
    std::string path; // in the left netlist
    std::string rightPath;
    std::vector<std::pair<std::string, bool>> assignment; // of nets, for which they differ first
    bool left = false;                                    // values there
    bool right = false;
    std::vector<std::pair<std::string, std::string>> causes; // a stable word, and a sentence
    std::string shouldBe; // the right one's init value; empty where it lacks a net
};

struct NetlistComparison {
    bool isSame = false;  // nothing below, but for wires that are allowed
    uint64_t numSame = 0; // tables
    std::vector<TableDifference> differences;
    std::vector<std::string> missing; // paths of tables that only the left netlist has
    std::vector<std::string> added;   // that only the right one has
    std::vector<std::pair<std::string, std::string>> renamed; // nets, throughout
};

// Compares tables that belong together by path, else by output net, else by the key that both
// were read with, as functions of nets.
// Cost: a copy of both, some microseconds a table, a millisecond for one that differs.
KQ_EXPORT NetlistComparison Compare(const Netlist& left, const Netlist& right,
                                    const CompareOptions& options = CompareOptions());

} // namespace kq_logic

#endif
