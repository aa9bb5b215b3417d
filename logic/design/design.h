// A design in memory: every look-up table of a netlist with its nets, as written in the file, in
// arrays without a heap block for each cell. Readers fill it (read_design.h); nothing is folded or
// renamed. A million six-input tables take some 250 MB with their names.
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

// Nets that are not wires. Two unknown pins are not the same net; nor are two open pins.
constexpr NetId kNetZero = 0;
constexpr NetId kNetOne = 1;
constexpr NetId kNetUnknown = 2; // a pin that the file ties to x or z
constexpr NetId kNetOpen = 3;    // a pin that the file does not connect
constexpr NetId kNumFixedNets = 4;

// A scope of names: the design itself (scope 0) or an instance of a module. A path is the names of
// the scopes and then the object's own, joined by '.'; scope 0 has no name.
struct DesignScope {
    ScopeId parent = 0;
    NameId name = 0;
};

// A name in a scope.
struct ScopedName {
    ScopeId scope = 0;
    NameId name = 0;
};

// An init value, kept once for all tables that have it. Bit k is the output when the pins, the
// first being the least significant bit, have the value k.
struct InitValue {
    uint32_t firstWord = 0; // of Design::words; NumWords(numInputs) of them
    uint8_t numInputs = 0;
    bool hasUnknown = false; // as many words follow: 1 for each bit that is x or z (0 before)
};

// One output of a cell that is a look-up table. A cell with two outputs (a fractured table) gives
// two consecutive tables that share name, scope, type and key.
//
// Deliberate: pins count from the least significant, as cell libraries count them, whereas input 0
// of Rows is the most significant. TableRows and FoldTable (fold.h) reverse them.
struct DesignTable {
    ScopedName name;         // the instance; for a BLIF table without one, its output net
    uint32_t type = 0;       // of Design::types
    InitId init = 0;         // of Design::inits
    uint32_t firstInput = 0; // of Design::inputs; their number is the init value's
    NetId output = kNetOpen;
    uint32_t line = 0;     // of the file if the format has lines, else 0
    uint8_t outputPin = 0; // of the cell type's outputs
    bool isNamedByOutput = false;
};

enum class CellRole {
    Table,    // every such cell is in Design::tables or in Design::unread
    Constant, // drives nets with 0 or 1, which become kNetZero and kNetOne
    Unread,   // holds a table but is more than logic: a shift register, a memory, a carry
    Module,   // its cells are in the design, below the path of the instance
    Other     // flip-flops, gates, buffers, pads
};

// A cell type that occurs in the file, with the pin names of cells.txt.
struct DesignType {
    NameId name = 0;
    CellRole role = CellRole::Other;
    uint64_t numCells = 0;
    std::vector<std::string>
        inputPins; // for a table, least significant first; none for $lut, .names
    std::vector<std::string> outputPins;
    std::string note; // why it, or a cell of it, is not read
};

enum class PortDirection { Input, Output, Both };

// One bit of a port of the design.
struct DesignPort {
    NameId name = 0; // "a[3]" for a port of several bits
    NetId net = kNetOpen;
    PortDirection direction = PortDirection::Input;
};

// A cell that may hold a table but is not read, because of its type, its parameters or its pins.
struct UnreadCell {
    ScopedName name;
    uint32_t type = 0;
};

enum class FindingCode {
    InitShort,      // fewer digits than rows; leading zeros are added
    InitLong,       // more digits than rows; the first ones are dropped
    InitUnknown,    // x or z digits; they count as 0, and the mask marks them
    InitMissing,    // no parameter; the cell type's default is used
    InitIllegible,  // not a number; the cell is not read
    WidthMismatch,  // a width parameter that is not the number of inputs
    PinOpen,        // an input that is not connected
    PinUnknown,     // an input that is tied to x or z
    PinStrange,     // a pin that the cell type does not have; the cell is not read
    PinTwice,       // a pin connected twice; the first one counts
    TooWide,        // more than kMaxTableInputs inputs; the cell is not read
    ModeUnread,     // a parameter makes the cell more than logic; it is not read
    CoverMixed,     // rows of 0 and rows of 1 in one table; the cell is not read
    Buffer,         // a BLIF table that only joins two nets; not counted as a table
    ConstantNet,    // a BLIF table without inputs; not counted as a table
    NameTwice,      // two cells with the same name
    DriverTwice,    // a net with a second driver
    ModuleUnused,   // a module with tables that is not below the top; not read
    PortStrange,    // an instance connects a port that its module does not have
    PortWidth,      // an instance connects more or fewer bits than the port has
    NumFindingCodes // not a code
};

// Something odd in a file that could be read.
struct ReadFinding {
    FindingCode code;
    uint32_t line = 0; // 0: only the name says where
    uint32_t table = kNoTable;
    ScopedName name;  // of the cell, net or module
    std::string text; // details that the code alone does not give

    static constexpr uint32_t kNoTable = UINT32_MAX;
};

// A stable word for reports ("init-short"), and a sentence for people.
const char* CodeWord(FindingCode code);
const char* CodeSentence(FindingCode code);

// Invariants:
// 1. Every name is in 'names'; every type, init value and input of a table is in its array.
// 2. No two InitValues have the same number of inputs, the same bits and the same unknown bits.
// 3. Nets are below nets.size(); the first kNumFixedNets have no name.
// 4. 'keys' is empty, or has an element for each table.
struct Design {
    std::string file;      // as given to the reader
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
        nets; // the name to show: of the highest scope, a public one if there is one
    // Other names of nets, with the net first; constants may have some, too.
    std::vector<std::pair<NetId, ScopedName>> aliases;
    std::vector<DesignPort> ports; // in the order of the file
    std::vector<NameId> keys;      // value of ReadOptions::keyAttribute; 0 without it
    std::vector<UnreadCell> unread;
    std::vector<ReadFinding> findings;
    uint64_t numCells = 0; // of all types except modules
    NameId top = 0;        // the module that is the design

    unsigned int NumInputs(const DesignTable& table) const { return inits[table.init].numInputs; }
    const uint64_t* Words(const InitValue& init) const { return words.data() + init.firstWord; }
    const NetId* Inputs(const DesignTable& table) const { return inputs.data() + table.firstInput; }
};

std::string Path(const Design& design, const ScopedName& name);
// A table's name in the file: its path, followed by the output pin if the cell has several.
std::string TableName(const Design& design, uint32_t table);
// The name to show; "1'b0", "1'b1", "1'bx" or "(open)" for a net that is not a wire.
std::string NetName(const Design& design, NetId net);

} // namespace booleq

#endif
