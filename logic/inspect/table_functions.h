// The distinct functions of a design's tables, each numbered once: constant and repeated inputs are
// folded, idle ones are left out, the rest stay in the order of the pins.
// Cost: a look-up for each table; tables whose pins are all different nets are folded only once for
// each init value.
#ifndef BOOLEQ_INSPECT_TABLE_FUNCTIONS_H
#define BOOLEQ_INSPECT_TABLE_FUNCTIONS_H

#include <cstdint>
#include <map>
#include <unordered_map>
#include <vector>

#include "design.h"
#include "rows.h"

namespace booleq {

constexpr unsigned int kMaxWordInputs = 6; // of a function that fits in one word

class TableFunctions {
  public:
    struct Found {
        uint32_t function = 0;   // of Functions()
        std::vector<NetId> nets; // of its inputs
        std::vector<NetId> idle; // nets without effect
    };

    explicit TableFunctions(const Design& design);

    // Fills 'found', which keeps its memory from one call to the next.
    void Find(const DesignTable& table, Found& found);
    const std::vector<Rows>& Functions() const { return m_functions; }

  private:
    // A folded init value: its function, and which inputs of the rows the function has.
    struct Folded {
        uint32_t function = UINT32_MAX;
        uint32_t support = 0; // bit k: input k of the rows matters
    };

    uint32_t Number(const Rows& rows);
    Folded Fold(const Rows& rows);

    const Design& m_design;
    std::vector<Folded> m_inits; // by init value
    std::vector<Rows> m_functions;
    std::unordered_map<uint64_t, uint32_t> m_words[kMaxWordInputs + 1]; // by number of inputs
    std::map<Rows, uint32_t> m_wide;
};

} // namespace booleq

#endif
