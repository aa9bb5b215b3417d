// A Boolean function as its result column over ordered inputs; what commands compare and permute.
// The first input is the most significant bit of the row number; row k is bit k % 64 of word k
// / 64. Bits beyond the last row are 0. Up to 30 inputs: 128 MB, never a row in memory.
#ifndef BOOLEQ_COLUMN_FUNCTION_H
#define BOOLEQ_COLUMN_FUNCTION_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

namespace booleq {

constexpr size_t kMaxFunctionInputs = 30; // the library has no column above

// The value of a row of a packed column.
// Requires: the column holds that row, so its word has an index on a 32-bit machine too.
inline bool ValueOfRow(const std::vector<uint64_t>& words, uint64_t row)
{
    return (words[static_cast<size_t>(row / 64)] >> (row % 64) & 1u) != 0;
}

// Invariants: as many words as the rows need, at least one; at most kMaxFunctionInputs inputs, all
// different; without inputs there is the one row of a constant.
class Function {
  public:
    static constexpr uint64_t kNoRow = UINT64_MAX;

    // The constant 0 over no inputs.
    Function() : m_words(1) {}
    // Requires: the invariants.
    Function(std::vector<std::string> inputs, std::vector<uint64_t> words);

    const std::vector<std::string>& Inputs() const { return m_inputs; }
    const std::vector<uint64_t>& Words() const { return m_words; }
    size_t NumInputs() const { return m_inputs.size(); }
    size_t NumRows() const { return size_t(1) << m_inputs.size(); } // at most 2^30
    // Requires: row < NumRows().
    bool At(uint64_t row) const { return ValueOfRow(m_words, row); }
    // The value of input 'index' in row 'row'.
    bool InputAt(uint64_t row, size_t index) const
    {
        return (row >> (m_inputs.size() - 1 - index) & 1u) != 0;
    }
    uint64_t NumOnes() const;
    // Whether any row changes its value when only this input changes.
    // Cost: O(2^n / 64).
    bool DependsOn(size_t index) const;

    // "0x..." and "0b...", the highest row first, leading zeros kept; one hexadecimal digit for two
    // or four rows. Without inputs one digit, the value.
    std::string Hex() const;
    std::string Binary() const;

    // The same function over 'inputs', in that order.
    // Requires: every own input is among them; none twice; at most kMaxFunctionInputs.
    // Cost: O(n * 2^n / 64).
    Function Over(const std::vector<std::string>& inputs) const;
    // The same function with its inputs in opposite order: how somebody reads it who takes the
    // first input for bit 0 of the row number.
    Function Reversed() const;

    // The first row that differs, kNoRow when none does.
    // Requires: as many inputs; that they are the same is the caller's matter.
    uint64_t FirstDifference(const Function& other) const;
    // Same inputs in the same order and the same rows.
    bool operator==(const Function& other) const;
    bool operator!=(const Function& other) const { return !(*this == other); }

  private:
    std::vector<std::string> m_inputs;
    std::vector<uint64_t> m_words;
};

// The function of a set equation over its variables.
// Fails: false without an equation or with more than kMaxFunctionInputs variables.
bool FunctionOf(const Kq_BoolEquation& equation, Function& function);
// "31 inputs: at most 30 have a truth table".
std::string NoFunctionReason(size_t numInputs);

enum class InitFault { kNone, kPrefix, kDigit, kWidth };

// What an init value says, and what the library makes of the rows that it leaves out.
struct InitText {
    InitFault fault = InitFault::kNone;
    size_t faultPosition = 0;  // of the byte that is no digit
    uint64_t numGivenRows = 0; // rows that have a digit
    size_t numInputs = 0;      // that so many rows are read over
    bool missingRows = false;  // the value of the rows without a digit, if there are any
    std::vector<uint64_t> words;
};

// Reads "0x..." or "0b..." for 'numInputs' inputs as the library does, without the expression that
// the library makes of it: 30 inputs take a quarter of a GB.
// Deliberate: missing rows are 0 when all digits are ones, or some are but fewer than zeros;
// otherwise they are 1. That is what the library reads, and no padding.
InitText ReadInitText(const std::string& text, size_t numInputs);

// 'function' becomes the init value over 'inputs'; 'lsbFirst' takes the first input for bit 0 of
// the row number, and the function is then turned so that the first input is the most significant.
// Fails: the fault of the text; 'function' is as it was.
// Requires: inputs all different, at most kMaxFunctionInputs.
InitText FunctionFromInit(const std::string& text, const std::vector<std::string>& inputs,
                          bool lsbFirst, Function& function);

} // namespace booleq

#endif
