// A Boolean function as its packed rows over named inputs; what commands compare and permute.
// Up to 30 inputs: 128 MB.
#ifndef BOOLEQ_COLUMN_FUNCTION_H
#define BOOLEQ_COLUMN_FUNCTION_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

#include "rows.h"

namespace booleq {

constexpr size_t kMaxFunctionInputs = kMaxRowInputs;

// Invariants: as many inputs as the rows have, all different; without inputs there is the one row
// of a constant.
class Function {
  public:
    static constexpr uint64_t kNoRow = Rows::kNoRow;

    // The constant 0 over no inputs.
    Function() = default;
    // Requires: the invariants.
    Function(std::vector<std::string> inputs, Rows rows);

    const std::vector<std::string>& Inputs() const { return m_inputs; }
    const Rows& GetRows() const { return m_rows; }
    size_t NumInputs() const { return m_inputs.size(); }
    size_t NumRows() const { return size_t(1) << m_inputs.size(); } // at most 2^30
    // Requires: row < NumRows().
    bool At(uint64_t row) const { return m_rows.At(row); }
    // The value of input 'index' in row 'row'.
    bool InputAt(uint64_t row, size_t index) const
    {
        return (row >> (m_inputs.size() - 1 - index) & 1u) != 0;
    }

    // "0x..." and "0b...", the highest row first, leading zeros kept; one hexadecimal digit for two
    // or four rows. Without inputs one digit, the value.
    std::string Hex() const;
    std::string Binary() const;

    // The same function over 'inputs', in that order.
    // Requires: every own input is among them; none twice; at most kMaxFunctionInputs.
    // Cost: O(n * 2^n / 64).
    Function Over(const std::vector<std::string>& inputs) const;

    // The first row that differs, kNoRow when none does.
    // Requires: as many inputs; the caller makes sure that they are the same.
    uint64_t FirstDifference(const Function& other) const;
    // Same inputs in the same order and the same rows.
    bool operator==(const Function& other) const;
    bool operator!=(const Function& other) const { return !(*this == other); }

  private:
    std::vector<std::string> m_inputs;
    Rows m_rows;
};

// The init value in a form that the library reads back: hexadecimal, binary over one input.
std::string InitOf(const Rows& rows);

// The names of an equation's variables in their order.
std::vector<std::string> InputNames(const Kq_BoolEquation& equation);
// The rows of a set equation, its first variable being input 0.
// Fails: false without an equation or with more than kMaxFunctionInputs variables.
bool RowsOf(const Kq_BoolEquation& equation, Rows& rows);
// The same with the names of the variables.
bool FunctionOf(const Kq_BoolEquation& equation, Function& function);
// "31 inputs: at most 30 have a truth table".
std::string NoFunctionReason(size_t numInputs);

} // namespace booleq

#endif
