// Writes programs in short form, from a tree or from a program in which a variable is fixed.
#ifndef KQ_PROGRAMWRITER_H
#define KQ_PROGRAMWRITER_H

#include <cassert>

#include "Program.h"

// A value that the machine holds: a constant, or what the steps from a given start compute;
// complemented or not. One word, because programs are rewritten many times.
class KqValue {
  public:
    static KqValue Computed(uint32_t start) { return KqValue(start << 2); }
    static KqValue Constant(uint32_t start, bool isOne)
    {
        return KqValue(start << 2 | kConstant | (isOne ? 1u : 0u));
    }

    KqValue() : m_word(0) {}

    uint32_t GetStart() const { return m_word >> 2; }
    bool IsConstant() const { return (m_word & kConstant) != 0; }
    // 1 for a complemented value, and for the constant 1.
    uint32_t GetInversion() const { return m_word & 1u; }
    KqValue Invert(uint32_t inversion) const { return KqValue(m_word ^ inversion); }

  private:
    static constexpr uint32_t kConstant = 2;

    explicit KqValue(uint32_t word) : m_word(word) {}

    uint32_t m_word;
};

// Writes a program into a list after 'first' codes, one value after another. Keeps the rules that
// make programs short: they contain no constants, and what a constant decides is removed again.
// The steps of a value leave the machine's stack one higher, whatever they simplify to.
// Requires: room in the list for each step put; fewer than 2^30 of them.
class KqWriter {
  public:
    KqWriter(KqCode* codes, size_t first) : m_codes(codes), m_end(static_cast<uint32_t>(first)) {}

    // The number of codes in the list that are in use.
    size_t GetEnd() const { return m_end; }
    // To be called when the list has moved.
    void SetCodes(KqCode* codes) { m_codes = codes; }

    KqValue PutConstant(bool isOne) { return KqValue::Constant(m_end, isOne); }

    KqValue PutVariable(uint32_t variable)
    {
        m_codes[m_end] = variable << kKqVariableShift | kKqTake;
        return KqValue::Computed(m_end++);
    }

    // Combines the value at hand, which was put last, with a variable as the upper value.
    KqValue PutCombine(KqCode kind, KqValue lower, uint32_t variable)
    {
        const uint32_t isAnd = kind >> 2;
        const uint32_t inverted = isAnd & kind >> 1;
        lower = lower.Invert(isAnd & kind);
        if (lower.IsConstant()) {
            if (isAnd != 0)
                return lower.GetInversion() != 0 ? PutVariable(variable).Invert(inverted) : lower;
            return PutVariable(variable).Invert(lower.GetInversion());
        }
        if (IsVariable(lower, variable)) {
            if (isAnd != 0 && lower.GetInversion() == inverted)
                return lower;
            return Drop(lower, isAnd == 0 && lower.GetInversion() != 0);
        }
        const uint32_t inversions = lower.GetInversion() | inverted << 1;
        m_codes[m_end++] =
            variable << kKqVariableShift | kKqCombine | (isAnd != 0 ? kKqAnd | inversions : kKqXor);
        return KqValue::Computed(lower.GetStart()).Invert(inversions & (isAnd ^ 1u));
    }

    // Combines the value at hand with a constant as the upper value.
    KqValue PutConstantOperand(KqCode kind, KqValue lower, bool isOne)
    {
        const uint32_t isAnd = kind >> 2;
        const uint32_t value = (isOne ? 1u : 0u) ^ (isAnd & kind >> 1);
        if (isAnd == 0)
            return lower.Invert(value);
        return value != 0 ? lower.Invert(kind & 1u) : Drop(lower, false);
    }

    // Combines the value at hand with the one put directly before it, as the upper value.
    KqValue PutUnstack(KqCode kind, KqValue lower, KqValue upper)
    {
        assert(upper.GetStart() <= lower.GetStart());
        const uint32_t isAnd = kind >> 2;
        lower = lower.Invert(isAnd & kind);
        upper = upper.Invert(isAnd & kind >> 1);
        if (lower.IsConstant() || upper.IsConstant()) {
            const KqValue constant = lower.IsConstant() ? lower : upper;
            const KqValue other = lower.IsConstant() ? upper : lower;
            if (isAnd == 0)
                return other.Invert(constant.GetInversion());
            return constant.GetInversion() != 0 ? other : Drop(upper, false);
        }
        if (m_end - lower.GetStart() == 1) {
            // A single variable need not be taken: what it would stack stays at hand instead.
            const uint32_t variable = KqVariableOf(m_codes[--m_end]);
            if (isAnd == 0)
                return PutCombine(kKqXor, upper.Invert(lower.GetInversion()), variable);
            return PutCombine(kKqAnd | lower.GetInversion() << 1, upper, variable);
        }
        const uint32_t inversions = lower.GetInversion() | upper.GetInversion() << 1;
        m_codes[m_end++] = kKqUnstack | (isAnd != 0 ? kKqAnd | inversions : kKqXor);
        const uint32_t parity = lower.GetInversion() ^ upper.GetInversion();
        return KqValue::Computed(upper.GetStart()).Invert(parity & (isAnd ^ 1u));
    }

  private:
    bool IsVariable(KqValue value, uint32_t variable) const
    {
        return m_end - value.GetStart() == 1 &&
               m_codes[value.GetStart()] == (variable << kKqVariableShift | kKqTake);
    }

    KqValue Drop(KqValue value, bool isOne)
    {
        assert(value.GetStart() <= m_end);
        m_end = value.GetStart();
        return KqValue::Constant(m_end, isOne);
    }

    KqCode* m_codes;
    uint32_t m_end;
};

#endif
