// The rows of one output of a cell, over the pins that it depends on: of a plain table bits of its
// parameter, of a tree of tables what the tree says.
// Cost: of a plain table that of its words, of a tree rows times steps.
#ifndef BOOLEQ_DESIGN_COMPOSED_TABLE_H
#define BOOLEQ_DESIGN_COMPOSED_TABLE_H

#include <vector>

#include "cell_types.h"
#include "init_digits.h"

namespace booleq {

class ComposedTable {
  public:
    // Requires: type.steps[output] is an output, of a type without a vector pin; the type outlives
    // this.
    ComposedTable(const CellType& type, size_t output);

    const CellStep& Step() const { return m_type.steps[m_output]; }
    // Of the type, from the least significant; the rows are over these.
    const std::vector<uint32_t>& Pins() const { return m_pins; }
    // Of the type; those that the rows depend on.
    const std::vector<uint32_t>& Parameters() const { return m_parameters; }

    // digits[k] is the value of parameter k.  False: no bit is unknown. Bits of a tree are known
    // only where all its parameters are.
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
