// Tables of a design as rows over nets.
#ifndef BOOLEQ_DESIGN_FOLD_H
#define BOOLEQ_DESIGN_FOLD_H

#include "design.h"

namespace booleq {

// The rows of an init value over its pins: input 0 of the rows is the last pin.
// Cost: one copy of the words.
Rows TableRows(const Design& design, const InitValue& init);

// A table of up to six inputs after folding. nets[k] is input k of the rows, the first one the most
// significant bit of the row's number; a net stands once, kNetOpen and kNetUnknown as often as
// pins.
struct FoldedWord {
    uint64_t word = 0; // bits above the last row are 0
    unsigned int numInputs = 0;
    NetId nets[6] = {};
};

// A table without its inputs that are constants or repeat a net; inputs without effect stay.
// Requires: at most six inputs.  Cost: some operations on the word for each input, no allocation.
FoldedWord FoldSmallTable(const Design& design, const DesignTable& table);

struct FoldedRows {
    Rows rows;
    std::vector<NetId> nets;
};

// The same for any number of inputs.
FoldedRows FoldTable(const Design& design, const DesignTable& table);

} // namespace booleq

#endif
