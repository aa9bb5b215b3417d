// A Boolean function over named inputs, to be explained, matched, permuted or shortened.
//
//     kq_logic::Function function;
//     if (!function.Set(Kq_BoolEquation("A & ~B")))
//         return 1;
//     std::cout << function.Inputs().size() << '\n'; // 2
//     std::cout << function.Hex() << '\n'; // 0x4
//     std::cout << function.At(2) << '\n'; // 1
//
// Row k assigns the binary digits of k to the inputs, the first input the highest digit.
#ifndef KQ_LOGIC_FUNCTION_H
#define KQ_LOGIC_FUNCTION_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

namespace kq_logic {

constexpr size_t kMaxFunctionInputs = 30; // 128 MB

// A value; copies share their unchanging data.
// Fails: std::bad_alloc, whatever a watcher throws (watch.h), and as the members say.
// Threads: as with the standard containers, here and in all headers of this library: different
// objects are independent, and const members of one object may run at once.
class KQ_EXPORT Function {
  public:
    // The constant 0 over no inputs.
    Function();

    // Takes the function of an equation over its variables.
    // Fails: false, if the equation is empty or has more than kMaxFunctionInputs variables; the
    // function does not change.  Cost: that of the column.
    bool Set(const Kq_BoolEquation& equation);
    // Takes the function whose row k is bit k % 64 of word k / 64.
    // Fails: false, unless the inputs are all different and there are exactly as many words as the
    // rows need (at least one), with no bit set beyond the last row.
    bool Set(const std::vector<std::string>& inputs, const std::vector<uint64_t>& words);

    // The first one is the most significant bit of a row's number.
    const std::vector<std::string>& Inputs() const;
    size_t NumInputs() const { return Inputs().size(); }        // at most kMaxFunctionInputs
    size_t NumRows() const { return size_t(1) << NumInputs(); } // one without inputs
    // Requires: row < NumRows().
    bool At(uint64_t row) const;
    // The value of input 'input' in row 'row'.
    bool InputAt(uint64_t row, size_t input) const
    {
        return (row >> (NumInputs() - 1 - input) & 1u) != 0;
    }
    // Whether the input changes any value.  Requires: input < NumInputs().
    bool DependsOn(size_t input) const;
    // The packed rows, 64 to a word, zeros beyond the last row; valid while this function lives.
    const uint64_t* Words() const;
    size_t NumWords() const; // at least one

    // Init values over these inputs, "0x..." and "0b...": the highest row first, leading zeros
    // kept.
    std::string Hex() const;
    std::string Binary() const;

    // Same inputs in the same order and the same rows.
    bool operator==(const Function& other) const;
    bool operator!=(const Function& other) const { return !(*this == other); }

    struct Imp; // internal

  private:
    friend struct FunctionAccess;
    std::shared_ptr<const Imp> m_imp;
};

} // namespace kq_logic

#endif
