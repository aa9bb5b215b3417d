// An expression as steps over blocks of packed rows. In: an expression, or the rows of a function;
// out: the results of up to 64 words of rows at a time.  Fails: std::bad_alloc only.
// Cost: linear in the operators. Few operands wait for their operator, because the operand that
// needs more room is computed first (Sethi and Ullman, "The Generation of Optimal Code for
// Arithmetic Expressions", J. ACM 17(4), 1970), so depth does not matter.
#ifndef BOOLEQ_PYTHON_WORD_PROGRAM_H
#define BOOLEQ_PYTHON_WORD_PROGRAM_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "expression.h"
#include "rows.h"

namespace booleq_python {

constexpr size_t kBlockWords = 64;
constexpr size_t kBlockRows = 64 * kBlockWords;

// Threads: any number at once, each with its own block.
class WordProgram {
  public:
    // Requires: the expression has a node.
    explicit WordProgram(const booleq::Expression& expression);

    // Words of a block: the inputs' columns first, kBlockWords each, then the working columns.
    size_t BlockSize() const { return kBlockWords * (m_num_inputs + m_num_slots); }
    // Computes the first 'numWords' words of each column. The pointer to the results is into the
    // block.
    const uint64_t* Run(uint64_t* block, size_t numWords) const;

  private:
    struct Step {
        booleq::Operator op;
        uint32_t target; // columns of the block
        uint32_t left;
        uint32_t right;
    };

    size_t m_num_inputs;
    size_t m_num_slots = 0;
    uint32_t m_result = 0;
    std::vector<Step> m_steps;
};

// The function of the rows as an expression, in which each input in turn selects a half of the
// rows.
// Requires: at most kMaxExpandedInputs inputs.
constexpr unsigned int kMaxExpandedInputs = 8;
booleq::Expression Expanded(const booleq::Rows& rows);

} // namespace booleq_python

#endif
