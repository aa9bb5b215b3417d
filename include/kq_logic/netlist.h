// Look-up tables of a netlist: read, counted, checked, as arrays. netlist_compare.h compares two.
//
//     kq_logic::Netlist netlist;
//     std::string fault;
//     if (!netlist.ReadText(".model m\n.names a b y\n11 1\n.end\n", fault))
//         return 1;
//     std::cout << netlist.NumTables() << ' ' << netlist.At(0).output << '\n'; // 1 y
//     std::cout << netlist.At(0).init << '\n'; // 0x8
//     std::cout << netlist.Stats().commonest[0].meaning << '\n'; // AND of A, B
//
// A netlist may have a million tables, so it is stored packed: At() makes a plain value of one
// table, Arrays() gives all tables of one width.
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
    std::string path;                // a cell with several outputs also has the pin, "u1 (O5)"
    std::string type;                // of the cell
    std::string output;              // the net it drives
    std::vector<std::string> inputs; // nets, the most significant pin first; "1'b0" for a constant
    std::string init;                // hexadecimal, over these inputs
    std::string key;                 // value of the attribute NetlistOptions::key
    uint32_t line = 0;               // in the file; 0 if the format has no lines
};

// All tables of one width, with an element or a row for each.
struct NetlistArrays {
    std::vector<uint32_t> tables;  // their numbers, ascending
    std::vector<uint64_t> words;   // rows, 64 to a word: row k is bit k % 64 of word k / 64
    std::vector<uint32_t> inputs;  // numbers of nets, the most significant pin first
    std::vector<uint32_t> outputs; // numbers of nets
    std::vector<uint32_t> types;   // indices into Netlist::Types()
    std::vector<uint32_t> lines;   // in the file; 0 if the format has no lines
};

// How many cells of one type a netlist has.
struct NetlistCellCount {
    std::string type;      // of the cells
    std::string role;      // "table", "constant", "not read", "module" or "other"
    std::string note;      // why such cells are not read
    uint64_t numCells = 0; // of this type
};

// How many tables are one function.
struct NetlistFunctionCount {
    Function function;      // over inputs A, B, C and so on
    std::string kind;       // "multiplexer"; empty: no common name
    std::string meaning;    // "multiplexer, select S: A for S=1; B for S=0"
    std::string expression; // a short one; empty: none was short enough
    uint64_t numTables = 0; // with this function
};

// The tables of a netlist in numbers. Functions are counted without idle, constant and repeated
// inputs.
struct NetlistStats {
    uint64_t numCells = 0;          // of all types
    uint64_t numTables = 0;         // outputs of look-up tables
    std::vector<uint64_t> byPins;   // element n: tables with n pins
    std::vector<uint64_t> byInputs; // element n: n inputs with an effect
    uint64_t numFunctions = 0;      // distinct functions
    uint64_t numClasses = 0;        // up to order and inversions, to 6 inputs
    uint64_t numWide = 0;           // distinct functions of more inputs
    uint64_t numConstant = 0;       // constant tables
    uint64_t numWires = 0;          // tables that only pass a net
    uint64_t numInverters = 0;      // tables that only invert a net
    uint64_t numIdle = 0;           // tables with an input without effect
    uint64_t numUnread = 0;         // cells that may hold tables
    std::vector<std::pair<std::string, uint64_t>> findings; // of reading, by code
    std::vector<NetlistCellCount> types;                    // the commonest first
    std::vector<NetlistFunctionCount> commonest;            // at most ten functions
};

// A fault or oddity of one table, cell or net.
struct NetlistFinding {
    std::string code;     // "idle-input" and so on: never reworded
    std::string severity; // "error", "warning" or "note"
    std::string path;     // of a cell or a net
    std::string text;     // a sentence
    uint32_t line = 0;    // in the file; 0: not known
};

// How a netlist is read.
struct NetlistOptions {
    std::string key;       // an attribute of cells, by which tables can be matched
    std::string cellsFile; // a file with further types of look-up-table cells
    std::string top;       // the top module, if the file does not say
};

// A value; copies share their unchanging data.
// Fails: std::bad_alloc, whatever a watcher throws (watch.h), and as the members say.
// Threads: different netlists are independent, and const members of one may run at once.
class KQ_EXPORT Netlist {
  public:
    // Without tables.
    Netlist();

    // Reads a file: Yosys JSON, BLIF, EDIF 2.0.0 or structural Verilog (by the program yosys),
    // plain or gzip-compressed; "-" is standard input. Fails: false and a text that names the file,
    // then "line 7:" or a path in the netlist; the netlist does not change.
    bool Read(const std::string& file, std::string& fault,
              const NetlistOptions& options = NetlistOptions());
    // Reads a text in memory, which messages call "text".
    bool ReadText(const std::string& text, std::string& fault,
                  const NetlistOptions& options = NetlistOptions());

    std::string Format() const; // "Yosys JSON", "BLIF", "EDIF" or "Verilog"
    std::string Top() const;    // the top module
    size_t NumTables() const;   // in the whole hierarchy
    // One table.  Requires: table < NumTables().
    NetlistTable At(size_t table) const;

    // The widths that tables have, ascending, at most 16.
    std::vector<unsigned int> Widths() const;
    // All tables of one width.  Cost: a copy of them.
    NetlistArrays Arrays(unsigned int width) const;
    std::string PathAt(size_t table) const; // At(table).path
    std::string KeyAt(size_t table) const;  // At(table).key
    // How many nets are numbered. The first four numbers are "1'b0", "1'b1", "1'bx" and "(open)",
    // for unconnected pins.
    size_t NumNets() const;
    std::string NetAt(size_t net) const;           // a net's name
    const std::vector<std::string>& Types() const; // of cells

    // Counts the tables, their functions and their oddities.
    NetlistStats Stats() const;
    // Calls 'take' for each finding until it returns false. Returns the number of calls.
    uint64_t Check(const std::function<bool(const NetlistFinding&)>& take) const;

    struct Imp; // internal

  private:
    friend struct NetlistAccess;
    std::shared_ptr<const Imp> m_imp;
};

} // namespace kq_logic

#endif
