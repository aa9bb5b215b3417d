// A design in memory: every look-up table of a netlist with its nets, as a file says it, in arrays
// without a heap block for a cell. Readers fill it (read_design.h); nothing is folded or renamed.
// A million six-input tables take some 250 MB with their names.
#ifndef BOOLEQ_DESIGN_DESIGN_H
#define BOOLEQ_DESIGN_DESIGN_H

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "name_arena.h"
#include "rows.h"

namespace booleq {

typedef uint32_t NetId;
typedef uint32_t InitId;
typedef uint32_t ScopeId;

constexpr unsigned int kMaxTableInputs = 16; // a wider table is reported as not read

// Nets that are not wires. An unknown or an open pin is not the same net as another one.
constexpr NetId kNetZero = 0;
constexpr NetId kNetOne = 1;
constexpr NetId kNetUnknown = 2; // a pin that the file ties to x or z
constexpr NetId kNetOpen = 3;    // a pin that the file leaves out
constexpr NetId kNumFixedNets = 4;

// What holds names: the design itself, scope 0, or an instance of a module. The path of a thing is
// the names of its scopes and its own with '.' between them; scope 0 has none.
struct DesignScope {
    ScopeId parent = 0;
    NameId name = 0;
};

// A name that stands in a scope.
struct ScopedName {
    ScopeId scope = 0;
    NameId name = 0;
};

// An init value, kept once for all tables that have it: bit k is the output where the pins, the
// first of them the least significant bit, have the value k.
struct InitValue {
    uint32_t firstWord = 0; // of Design::words; NumWords(numInputs) of them
    uint8_t numInputs = 0;
    bool hasUnknown = false; // as many words follow, a 1 for each bit that is x or z (and 0 before)
};

// One output of a cell that is a look-up table. A cell with two outputs (a fractured table) is two
// that follow one another and share name, scope, type and key.
//
// Deliberate: pins are counted as the makers of cells do, from the least significant, whereas input
// 0 of Rows is the most significant. TableRows and FoldTable (fold.h) turn them round.
struct DesignTable {
    ScopedName name;         // the instance; of a BLIF table without one, its output net
    uint32_t type = 0;       // of Design::types
    InitId init = 0;         // of Design::inits
    uint32_t firstInput = 0; // of Design::inputs, as many as the init value has
    NetId output = kNetOpen;
    uint32_t line = 0;     // in the file, where the format tells; else 0
    uint8_t outputPin = 0; // of the cell type's outputs
    bool isNamedByOutput = false;
};

enum class CellRole {
    Table,    // every cell of it is in Design::tables, or in Design::unread
    Constant, // drives nets with 0 or 1; those nets are kNetZero and kNetOne
    Unread,   // holds a table and is more than logic: a shift register, a memory, a carry
    Module,   // its cells are in the design, below the path of the instance
    Other     // flip-flops, gates, buffers, pads
};

// A type of cells that the file has, with the pins as the table of cell types calls them.
struct DesignType {
    NameId name = 0;
    CellRole role = CellRole::Other;
    uint64_t numCells = 0;
    std::vector<std::string>
        inputPins; // of a table, from the least significant; none for $lut, .names
    std::vector<std::string> outputPins;
    std::string note; // why it is not read
};

enum class PortDirection { Input, Output, Both };

// One bit of a port of the design.
struct DesignPort {
    NameId name = 0; // "a[3]" of a port of several bits
    NetId net = kNetOpen;
    PortDirection direction = PortDirection::Input;
};

// A cell that may hold a table and is not read, because of its type or of its parameters.
struct UnreadCell {
    ScopedName name;
    uint32_t type = 0;
};

enum class FindingCode {
    InitShort,      // fewer digits than rows; zeros are put before them
    InitLong,       // more digits; those that are too many are dropped
    InitUnknown,    // x or z digits; they count as 0, the mask tells
    InitMissing,    // no parameter; the cell type's default counts
    InitIllegible,  // not a number; the cell is not read
    WidthMismatch,  // a width parameter that is not the number of inputs
    PinOpen,        // an input that nothing is connected to
    PinUnknown,     // an input that is tied to x or z
    PinStrange,     // a pin that the cell type does not have; the cell is not read
    PinTwice,       // a pin connected twice; the first one counts
    TooWide,        // more than kMaxTableInputs inputs; the cell is not read
    ModeUnread,     // a parameter makes the cell more than logic; it is not read
    CoverMixed,     // rows of 0 and of 1 in one table; the cell is not read
    Buffer,         // a table of BLIF that joins two nets; not among the tables
    ConstantNet,    // a table of BLIF without inputs; not among the tables
    NameTwice,      // two cells of one name
    DriverTwice,    // a net with a second driver
    ModuleUnused,   // a module with tables that is not below the top; not read
    PortStrange,    // an instance connects a port that its module does not have
    PortWidth,      // an instance connects more or fewer bits than the port has
    NumFindingCodes // not a code
};

// What a reader has to say about a file that it could read.
struct ReadFinding {
    FindingCode code;
    uint32_t line = 0; // 0: the name tells where
    uint32_t table = kNoTable;
    ScopedName name;  // of the cell, net or module
    std::string text; // what is wrong, where the code alone does not say it

    static constexpr uint32_t kNoTable = UINT32_MAX;
};

// "init-short" and so on: stable words for reports, and a sentence for people.
const char* CodeWord(FindingCode code);
const char* CodeSentence(FindingCode code);

// Invariants:
// 1. Names are of 'names', tables' types, inits and inputs of the arrays that they point into.
// 2. No two InitValues are the same function with as many inputs and the same unknown bits.
// 3. Nets are below nets.size(); the first kNumFixedNets have no name.
// 4. 'keys' is empty, or has an element for each table.
struct Design {
    std::string file;      // as the reader was asked
    std::string format;    // "Yosys JSON", "BLIF", "EDIF", "Verilog"
    uint64_t numBytes = 0; // of the text that was read
    NameArena names;
    std::vector<DesignScope> scopes = {DesignScope()};
    std::vector<DesignType> types;
    std::vector<DesignTable> tables; // in the order of the file
    std::vector<NetId> inputs;
    std::vector<InitValue> inits;
    std::vector<uint64_t> words;
    std::vector<ScopedName>
        nets; // the name to show: of the highest scope, a public one where there is
    // Other names of nets, by net; constants have some, too.
    std::vector<std::pair<NetId, ScopedName>> aliases;
    std::vector<DesignPort> ports; // in the order of the file
    std::vector<NameId> keys;      // value of ReadOptions::keyAttribute, 0 without
    std::vector<UnreadCell> unread;
    std::vector<ReadFinding> findings;
    uint64_t numCells = 0; // of all types but modules
    NameId top = 0;        // the module that is the design

    unsigned int NumInputs(const DesignTable& table) const { return inits[table.init].numInputs; }
    const uint64_t* Words(const InitValue& init) const { return words.data() + init.firstWord; }
    const NetId* Inputs(const DesignTable& table) const { return inputs.data() + table.firstInput; }
};

std::string Path(const Design& design, const ScopedName& name);
// A table as the file calls it: the path, of a cell with several outputs with the pin.
std::string TableName(const Design& design, uint32_t table);
// The name to show; "1'b0", "1'b1", "1'bx" and "(open)" for those that are not wires.
std::string NetName(const Design& design, NetId net);

} // namespace booleq

#endif
