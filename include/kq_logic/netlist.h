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
// Arrays() all of a width, and a comparison has only what is not the same, not a verdict for each
// table. What 'booleq netlist' answers is what these answer.
#ifndef KQ_LOGIC_NETLIST_H
#define KQ_LOGIC_NETLIST_H

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include <kq_logic/function.h>

namespace kq_logic {

// One output of a cell that is a look-up table, as the file has it.
struct NetlistTable {
    std::string path; // of a cell with several outputs also the pin, "u1 (O5)"
    std::string type;
    std::string output;              // the net
    std::vector<std::string> inputs; // nets, the most significant pin first; "1'b0" for a constant
    std::string init;                // hexadecimal, over these inputs
    std::string key;                 // the attribute NetlistOptions::key; empty without
    uint32_t line = 0;               // in the file; 0 where the format does not tell
};

// All tables of one width, an element or a row for each.
struct NetlistArrays {
    std::vector<uint32_t> tables;  // their places, ascending
    std::vector<uint64_t> words;   // rows, 64 to a word: row k is bit k % 64 of word k / 64
    std::vector<uint32_t> inputs;  // nets by number, the most significant pin first
    std::vector<uint32_t> outputs; // the same
    std::vector<uint32_t> types;   // places in Netlist::Types
    std::vector<uint32_t> lines;   // in the file; 0 where the format does not tell
};

struct NetlistStats {
    struct CellCount {
        std::string type;
        std::string role; // "table", "constant", "not read", "module" or "other"
        std::string note; // why it is not read
        uint64_t numCells = 0;
    };
    struct FunctionCount {
        Function function;      // over inputs A, B, C and so on
        std::string kind;       // "multiplexer"; empty without a name
        std::string meaning;    // "multiplexer, select S: A for S=1; B for S=0"
        std::string expression; // empty where none is short
        uint64_t numTables = 0;
    };
    uint64_t numCells = 0;
    uint64_t numTables = 0;
    std::vector<uint64_t> byPins;   // how many tables have so many pins
    std::vector<uint64_t> byInputs; // inputs that matter
    uint64_t numFunctions = 0;      // different ones
    uint64_t numClasses = 0;        // up to order and inversions, of up to six inputs
    uint64_t numWide = 0;           // functions of more inputs
    uint64_t numConstant = 0;       // tables of each kind
    uint64_t numWires = 0;
    uint64_t numInverters = 0;
    uint64_t numIdle = 0;   // tables with an input that has no effect
    uint64_t numUnread = 0; // cells that may hold tables
    std::vector<std::pair<std::string, uint64_t>> findings; // of reading, by code
    std::vector<CellCount> types;                           // the commonest first
    std::vector<FunctionCount> commonest;                   // ten at most
};

struct NetlistFinding {
    std::string code;     // "idle-input"
    std::string severity; // "error", "warning" or "note"
    std::string path;     // of a cell or a net
    std::string text;
    uint32_t line = 0; // in the file; 0: not known
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
    // Fails: false with a text that names the file, then "line 7:" where a line is known, or a path
    // in the netlist; the netlist is as it was.
    bool Read(const std::string& file, std::string& fault,
              const NetlistOptions& options = NetlistOptions());
    // The same for a text in memory, which messages call "text".
    bool ReadText(const std::string& text, std::string& fault,
                  const NetlistOptions& options = NetlistOptions());

    std::string Format() const; // "Yosys JSON", "BLIF", "EDIF" or "Verilog"
    std::string Top() const;    // the module that is the design
    size_t NumTables() const;
    // Requires: table < NumTables().
    NetlistTable At(size_t table) const;

    // Ascending, up to 16.
    std::vector<unsigned int> Widths() const;
    // Cost: a copy of the tables of that width.
    NetlistArrays Arrays(unsigned int width) const;
    // The members of At alone.
    std::string PathAt(size_t table) const;
    std::string KeyAt(size_t table) const;
    // Nets by number. Below 4 stand "1'b0", "1'b1", "1'bx" and "(open)", nothing being connected.
    size_t NumNets() const;
    std::string NetAt(size_t net) const;
    const std::vector<std::string>& Types() const;

    NetlistStats Stats() const;
    // Calls 'take' for each finding until it gives back false; gives back how often it was called.
    uint64_t Check(const std::function<bool(const NetlistFinding&)>& take) const;

    struct Imp; // internal

  private:
    friend struct NetlistAccess;
    std::shared_ptr<const Imp> m_imp;
};

enum class NetlistNames { Auto, Kept, Gone }; // nets of one name are one: as pairs show, yes, no

struct CompareOptions {
    std::vector<std::pair<std::string, std::string>>
        renames;              // a left net, and the right one's name
    bool allowsWires = false; // tables that only pass a net or a constant may be on one side only
    NetlistNames names = NetlistNames::Auto; // Gone needs netlists that were read with a key
    int openInputs = -1;                     // 0 or 1: what an input reads that is not connected
    size_t maxDescribed = SIZE_MAX;          // more differences are counted only
};

// A table that differs.
struct TableDifference {
    std::string path; // in the left netlist
    std::string rightPath;
    std::string matchedBy;                                // "path", "net" or "key"
    std::string output;                                   // the left one's net
    std::vector<std::pair<std::string, bool>> assignment; // of nets, for which they differ first
    bool isSameFunction = false;                          // that drives another net
    bool left = false;                                    // values there
    bool right = false;
    std::string leftEquation; // empty where none is short
    std::string rightEquation;
    std::vector<std::pair<std::string, std::string>> causes; // a stable word, and a sentence
    std::string shouldBe; // the right one's init value; empty where it lacks a net
};

// A table of one netlist only.
struct LoneTable {
    std::string path;
    std::string output;
    std::string wire; // "only passes NET", "constant 1"; empty for a table that is more
};

struct RenamedNet {
    std::string left;
    std::string right;
    uint64_t numTables = 0;
};

struct NetlistComparison {
    bool isSame = false;       // nothing below, but for wires that are allowed
    uint64_t numSame = 0;      // tables
    uint64_t numRenamed = 0;   // the same but for names of nets
    uint64_t numDifferent = 0; // also those that are not described
    std::vector<TableDifference> differences;
    std::vector<LoneTable> missing; // that only the left netlist has
    std::vector<LoneTable> added;   // that only the right one has
    std::vector<RenamedNet> renamed;
    bool areNamesGone = false;   // names of nets were not looked at
    uint64_t numMatchedNets = 0; // that are known to be the same
    uint64_t numByOrder = 0;     // of numSame: in some order of inputs that nothing tells apart
    uint64_t numKeysTwice = 0;   // cells with the key of another one
    std::vector<std::pair<std::string, std::string>> unusedRenames;
};

// Compares tables that belong together by path, else by output net, else by the key that both
// were read with, as functions of nets.
// Cost: a copy of both, some microseconds a table, a millisecond for one that differs.
KQ_EXPORT NetlistComparison Compare(const Netlist& left, const Netlist& right,
                                    const CompareOptions& options = CompareOptions());

} // namespace kq_logic

#endif
