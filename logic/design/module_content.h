// What a reader found in one module, with its own nets and names, before the hierarchy is laid out.
#ifndef BOOLEQ_DESIGN_MODULE_CONTENT_H
#define BOOLEQ_DESIGN_MODULE_CONTENT_H

#include <utility>
#include <vector>

#include "design.h"

namespace booleq {

// A net of a module; those below kNumFixedNets are the same everywhere.
typedef NetId LocalNet;

// A pin or port and its bits, elements of ModuleContent::bits, the least significant first.
struct BitRange {
    NameId name = 0;
    uint32_t first = 0;
    uint32_t count = 0;
};

struct ModulePort {
    BitRange bits;
    PortDirection direction = PortDirection::Both;
};

// A cell whose type may be a module; that is known once all modules are read.
struct PendingCell {
    NameId name = 0;
    NameId type = 0;
    uint32_t firstPin = 0; // of ModuleContent::pins
    uint32_t numPins = 0;
    uint32_t line = 0;
};

struct NetAlias {
    LocalNet net = 0;
    NameId name = 0;
};

// Invariants:
// 1. Nets are below netNames.size(). The first kNumFixedNets elements of netNames name nothing.
// 2. Names of tables, tables of findings, and unread cells are of this module, in scope 0.
struct ModuleContent {
    NameId name = 0;
    bool isTop = false;
    bool isBlackBox = false;
    std::vector<NameId> netNames = std::vector<NameId>(kNumFixedNets, 0);
    std::vector<bool> isHidden = std::vector<bool>(kNumFixedNets, false); // a tool made up its name
    std::vector<NetAlias> aliases;
    std::vector<ModulePort> ports;
    std::vector<BitRange> pins; // of pending cells
    std::vector<LocalNet> bits; // of ports and pins
    std::vector<PendingCell> pending;
    std::vector<DesignTable> tables;
    std::vector<LocalNet> inputs; // of tables
    std::vector<NameId> keys;
    std::vector<UnreadCell> unread;
    std::vector<std::pair<LocalNet, LocalNet>> joins; // two names of one net
    std::vector<ReadFinding> findings;
    std::vector<uint64_t> typeCounts; // by type of the design: cells that are not pending
};

} // namespace booleq

#endif
