// Columns as values to compute with: what the search for expressions works on.
#ifndef BOOLEQ_COLUMN_BITS_H
#define BOOLEQ_COLUMN_BITS_H

#include <cstdint>
#include <vector>

#include "function.h"

namespace booleq {

// A column over a fixed number of inputs, in the order and with the padding of Function. Taking a
// cofactor keeps the inputs: the result does not depend on the one that was fixed.
class Bits {
  public:
    explicit Bits(const Function& function)
        : m_num_inputs(static_cast<unsigned int>(function.NumInputs())), m_words(function.Words())
    {
    }

    unsigned int NumInputs() const { return m_num_inputs; }
    size_t NumRows() const { return size_t(1) << m_num_inputs; }
    const std::vector<uint64_t>& Words() const { return m_words; }
    bool At(uint64_t row) const { return ValueOfRow(m_words, row); }

    bool IsZero() const;
    bool IsOne() const;
    uint64_t NumOnes() const;
    bool DependsOn(unsigned int input) const;
    // The inputs that matter, ascending.
    std::vector<unsigned int> Support() const;

    Bits Cofactor(unsigned int input, bool value) const;
    Bits operator~() const;
    Bits operator&(const Bits& other) const;
    Bits operator|(const Bits& other) const;
    Bits operator^(const Bits& other) const;
    bool operator==(const Bits& other) const { return m_words == other.m_words; }
    bool operator!=(const Bits& other) const { return m_words != other.m_words; }
    bool operator<(const Bits& other) const { return m_words < other.m_words; }

    // The column of one input.
    static Bits OfInput(unsigned int numInputs, unsigned int input);

  private:
    Bits(unsigned int numInputs, std::vector<uint64_t> words)
        : m_num_inputs(numInputs), m_words(std::move(words))
    {
    }
    uint64_t RowMask() const
    {
        return m_num_inputs >= 6 ? ~uint64_t(0) : (uint64_t(1) << (1u << m_num_inputs)) - 1;
    }

    unsigned int m_num_inputs;
    std::vector<uint64_t> m_words;
};

} // namespace booleq

#endif
