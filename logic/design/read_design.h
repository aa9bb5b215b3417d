// Reads a netlist file into a design: Yosys JSON, BLIF, EDIF 2.0.0, structural Verilog (by the
// program yosys), each also compressed by gzip. The content tells which one it is, not the name.
// Fails: false with a message that names the file and a line or a path; the design is then empty.
// Threads: Watch() is called every few milliseconds and may throw; nothing is left half done then.
#ifndef BOOLEQ_DESIGN_READ_DESIGN_H
#define BOOLEQ_DESIGN_READ_DESIGN_H

#include <string>
#include <string_view>

#include "cell_types.h"
#include "design.h"

namespace booleq {

struct ReadOptions {
    const CellTypes* cellTypes = nullptr; // null: those that the library knows
    std::string keyAttribute;             // of cells, for Design::keys; empty: none
    std::string top;                      // the module that is the design; empty: the file tells
    // Called now and then while the file is read; null: nobody asks.
    void (*progress)(void* context, uint64_t numBytesDone, uint64_t numBytes) = nullptr;
    void* progressContext = nullptr;
    double yosysSeconds = 600; // after which yosys is ended
    // Tables, nets and instances with the hierarchy laid out; a small file can ask for any number.
    uint64_t maxItems = uint64_t(1) << 26;
};

// 'file' may be "-", which is standard input.
bool ReadDesign(const std::string& file, const ReadOptions& options, Design& design,
                std::string& fault);

// A text that is in memory; 'name' stands for the file in messages. Verilog goes to yosys, too.
bool ReadDesignText(std::string_view text, const std::string& name, const ReadOptions& options,
                    Design& design, std::string& fault);

} // namespace booleq

#endif
