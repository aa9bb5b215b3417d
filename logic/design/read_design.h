// Reads a netlist file into a design: Yosys JSON, BLIF, EDIF 2.0.0, structural Verilog (by the
// program yosys), each also compressed by gzip. The content decides the format, not the name.
// Fails: false with a message that names the file and a line or a path; the design is then empty.
// Threads: calls Watch() every few milliseconds. If Watch() throws, the design is empty, too.
#ifndef BOOLEQ_DESIGN_READ_DESIGN_H
#define BOOLEQ_DESIGN_READ_DESIGN_H

#include <string>
#include <string_view>

#include "cell_types.h"
#include "design.h"

namespace booleq {

struct ReadOptions {
    const CellTypes* cellTypes = nullptr; // null: the types that the library knows
    std::string keyAttribute;             // a cell attribute, for Design::keys; empty: none
    std::string top;                      // the top module; empty: the file decides
    // Called from time to time while the file is read; may be null.
    void (*progress)(void* context, uint64_t numBytesDone, uint64_t numBytes) = nullptr;
    void* progressContext = nullptr;
    double yosysSeconds = 600; // the time after which yosys is killed
    // Limit on tables, nets and instances in the flattened hierarchy: a small file can ask for any
    // number of them.
    uint64_t maxItems = uint64_t(1) << 26;
};

// 'file' may be "-" for standard input.
bool ReadDesign(const std::string& file, const ReadOptions& options, Design& design,
                std::string& fault);

// Reads a text in memory; messages show 'name' as the file. Verilog goes to yosys here, too.
bool ReadDesignText(std::string_view text, const std::string& name, const ReadOptions& options,
                    Design& design, std::string& fault);

} // namespace booleq

#endif
