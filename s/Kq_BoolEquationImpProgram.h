// An equation as a program: the tree without its groups and constants, operands before operators.
// Evaluation runs it for one assignment; the result column fixes its variables one after another.
#ifndef KQ_BOOLEQUATIONIMPPROGRAM_H
#define KQ_BOOLEQUATIONIMPPROGRAM_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

// One code of a program, for a machine with a stack of bits: a variable pushes its value, an
// operator replaces the two values on top. Inversions are part of the AND that takes the value, so
// four forms of AND and one XOR are all there is; what is left of an inversion at the very end is
// the program's own. The low bits are the kind, the others a variable's number.
typedef uint32_t KqCode;

constexpr unsigned int kKqKindBits = 3;
constexpr KqCode kKqXor = 0;
constexpr KqCode kKqVariable = 1;
constexpr KqCode kKqAnd = 4;         // plus the two flags
constexpr KqCode kKqInvertLower = 1; // AND takes the complement of the value below the top
constexpr KqCode kKqInvertUpper = 2; // AND takes the complement of the value on top

inline KqCode KqKindOf(KqCode code)
{
    return code & ((1u << kKqKindBits) - 1);
}

inline uint32_t KqVariableOf(KqCode code)
{
    return code >> kKqKindBits;
}

inline KqCode KqCodeOf(uint32_t variable)
{
    return variable << kKqKindBits | kKqVariable;
}

// A value that the machine holds: a constant, or what the codes from a start on compute;
// complemented or not. One word, as programs are rewritten many times.
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

// Writes a program into a list behind 'first' codes, one operand after another. Keeps the rules
// that make programs short: no constant stands in them, and what a constant decides is taken out
// again.
// Requires: room in the list for each code put; fewer than 2^30 codes.
class KqWriter {
  public:
    KqWriter(KqCode* codes, size_t first) : m_codes(codes), m_end(static_cast<uint32_t>(first)) {}

    // The number of codes in the list that are in use.
    size_t GetEnd() const { return m_end; }
    // The list has moved.
    void SetCodes(KqCode* codes) { m_codes = codes; }

    KqValue PutConstant(bool isOne) { return KqValue::Constant(m_end, isOne); }

    // 'code' is a variable's.
    KqValue PutVariable(KqCode code)
    {
        m_codes[m_end] = code;
        return KqValue::Computed(m_end++);
    }

    // Requires: 'upper' was put right behind 'lower', and nothing behind 'upper'.
    KqValue PutOperator(KqCode kind, KqValue lower, KqValue upper)
    {
        const uint32_t isAnd = kind >> 2;
        lower = lower.Invert(isAnd & kind);
        upper = upper.Invert(isAnd & kind >> 1);
        if (lower.IsConstant() || upper.IsConstant())
            return PutConstantOperand(isAnd != 0, lower, upper);
        if (m_end - lower.GetStart() == 2 && m_codes[m_end - 2] == m_codes[m_end - 1])
            return PutSameVariable(isAnd != 0, lower, upper);
        const uint32_t inversions = lower.GetInversion() | upper.GetInversion() << 1;
        m_codes[m_end++] = isAnd != 0 ? kKqAnd | inversions : kKqXor;
        const uint32_t parity = lower.GetInversion() ^ upper.GetInversion();
        return KqValue::Computed(lower.GetStart()).Invert(parity & (isAnd ^ 1u));
    }

  private:
    KqValue PutConstantOperand(bool isAnd, KqValue lower, KqValue upper)
    {
        const KqValue constant = lower.IsConstant() ? lower : upper;
        const KqValue other = lower.IsConstant() ? upper : lower;
        if (!isAnd)
            return other.Invert(constant.GetInversion());
        return constant.GetInversion() != 0 ? other : Drop(lower, false);
    }

    KqValue PutSameVariable(bool isAnd, KqValue lower, KqValue upper)
    {
        const bool isSame = lower.GetInversion() == upper.GetInversion();
        if (!isAnd || !isSame)
            return Drop(lower, !isAnd && !isSame);
        --m_end;
        return lower;
    }

    KqValue Drop(KqValue lower, bool isOne)
    {
        m_end = lower.GetStart();
        return KqValue::Constant(m_end, isOne);
    }

    KqCode* m_codes;
    uint32_t m_end;
};

// A whole program: the first codes of a list, none for a constant, and whether it is complemented.
struct KqProgram {
    std::vector<KqCode> codes;
    size_t numCodes = 0;
    bool isInverted = false;
};

// How many values the machine ever stacks, at most. Operands are written as they stand while that
// is enough, and otherwise the one that needs more first: then n operands need log2(n) + 1 values.
constexpr size_t kKqMaxStack = 48;

// Compiles the tree at 'root', null counting as 0. A variable's number is its index or, when
// 'isReversed', numVariables-1 less its index. An ID whose index is not below 'numVariables' is 0.
// Requires: a checked tree of fewer than 2^30 nodes, numVariables < 2^29.
// Fails: std::bad_alloc.  Cost: O(nodes).
KqProgram KqCompile(const Kq_BoolEquationImp::Node* root, uint32_t numVariables, bool isReversed);

// A program for a machine that keeps the last value at hand. TAKE stacks that value and takes a
// variable's; COMBINE makes a new one of it, as the lower value, and a variable, as the upper one;
// UNSTACK makes it of it, as the lower value, and one off the stack, as the upper one.
struct KqStep {
    uint32_t variable;
    uint8_t action; // kKqTake, or kKqCombine or kKqUnstack and the operator's kind
    uint8_t table;  // the operator's result for lower and upper value, bit lower + 2 * upper
};

constexpr uint8_t kKqTake = 0;
constexpr uint8_t kKqCombine = 8;
constexpr uint8_t kKqUnstack = 16;

// Replaces 'steps' by those of 'codes', at most as many, and returns how many values they stack.
// Requires: the codes of a program that is no constant.  Fails: std::bad_alloc.
size_t KqMakeSteps(const KqCode* codes, size_t numCodes, std::vector<KqStep>& steps);

// What a store keeps of its tree for evaluation: the column of up to six variables as a word, or
// steps for more. Made when it pays: the word at once, steps at the second evaluation.
class KqCompiled {
  public:
    typedef std::vector<std::pair<Port::StringBase<char>, unsigned int>> Variables;

    // The value of the tree at 'root' for a table of values 0 or 1.
    // Fails: std::bad_alloc.  Cost: O(variables) for up to six, else O(nodes).
    unsigned int Eval(const Kq_BoolEquationImp::Node& root, const Variables& variables)
    {
        if (variables.size() != m_num_word_variables)
            return EvalOther(root, variables);
        unsigned int row = 0;
        for (const auto& variable : variables)
            row = row << 1 | variable.second;
        return m_word >> row & 1u;
    }

    // The column of up to six variables, repeated up to the word's end.
    uint64_t GetWord(const Kq_BoolEquationImp::Node& root, unsigned int numVariables);

    void Drop() noexcept;

  private:
    unsigned int EvalOther(const Kq_BoolEquationImp::Node& root, const Variables& variables);
    unsigned int RunSteps(const Variables& variables) const;

    static constexpr size_t kNoWord = SIZE_MAX;

    uint64_t m_word = 0;
    size_t m_num_word_variables = kNoWord; // what m_word is for
    unsigned int m_num_evaluations = 0;
    uint32_t m_num_steps_variables = 0; // what m_steps is for
    bool m_is_inverted = false;
    std::vector<KqStep> m_steps;
};

#endif
