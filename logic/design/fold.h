// Tables of a design as rows over nets.
#ifndef BOOLEQ_DESIGN_FOLD_H
#define BOOLEQ_DESIGN_FOLD_H

#include "design.h"

namespace booleq {

// The rows of an init value over its pins: input 0 of the rows is the last pin.
// Cost: one copy of the words.
Rows TableRows(const Design& design, const InitValue& init);

// A table after folding. nets[k] is input k of the rows. A net occurs once; kNetOpen and
// kNetUnknown occur once for each such pin.
struct FoldedRows {
    Rows rows;
    std::vector<NetId> nets;
};

// A table without the inputs that are constant or repeat a net. Inputs without effect stay.
FoldedRows FoldTable(const Design& design, const DesignTable& table);

} // namespace booleq

#endif
