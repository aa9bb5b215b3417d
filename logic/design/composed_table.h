// The rows of one output of a cell, over the pins that it depends on: for a plain table, bits of
// its parameter; for a tree of tables, what the tree computes.
// Cost: for a plain table, copying its words; for a tree, rows times steps.
#ifndef BOOLEQ_DESIGN_COMPOSED_TABLE_H
#define BOOLEQ_DESIGN_COMPOSED_TABLE_H

#include <vector>

#include "cell_types.h"
#include "init_digits.h"

namespace booleq {

class ComposedTable {
  public:
    // Requires: type.steps[output] is an output; the type has no vector pin and outlives this
    // object.
    ComposedTable(const CellType& type, size_t output);

    const CellStep& Step() const { return m_type.steps[m_output]; }
    // The pins of the type that the rows are over, the least significant first.
    const std::vector<uint32_t>& Pins() const { return m_pins; }
    // The parameters of the type that the rows depend on.
    const std::vector<uint32_t>& Parameters() const { return m_parameters; }

    // digits[k] is the value of parameter k.  Returns whether any row is unknown. A row of a tree
    // is unknown if any of the bits that it reads is unknown.
    bool Tabulate(const std::vector<InitDigits>& digits, std::vector<uint64_t>& words,
                  std::vector<uint64_t>& unknown) const;

  private:
    bool EvaluateRow(const std::vector<InitDigits>& digits, uint64_t row, bool& isUnknown) const;

    const CellType& m_type;
    size_t m_output;
    bool m_is_plain;
    std::vector<uint32_t> m_pins;
    std::vector<uint32_t> m_parameters;
    std::vector<bool> m_is_used; // by step
};

} // namespace booleq

#endif
