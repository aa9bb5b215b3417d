// An equation as a program: the tree without its groups and constants, as steps of a machine.
// Evaluation runs it for one assignment; the result column fixes its variables one after another.
#ifndef KQ_BOOLEQUATIONIMPPROGRAM_H
#define KQ_BOOLEQUATIONIMPPROGRAM_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

// One step of a machine that keeps the last value at hand. TAKE stacks that value and takes a
// variable's; COMBINE makes a new one of it, as the lower value, and a variable, as the upper one;
// UNSTACK makes it of it, as the lower value, and one off the stack, as the upper one. Inversions
// are part of the AND that takes the value, so four forms of AND and one XOR are all there is;
// what is left of an inversion at the very end is the program's own.
// The lowest three bits are the operator's kind, the next two the action, the others a variable.
typedef uint32_t KqCode;

constexpr KqCode kKqXor = 0;
constexpr KqCode kKqAnd = 4;         // plus the two flags
constexpr KqCode kKqInvertLower = 1; // AND takes the complement of the lower value
constexpr KqCode kKqInvertUpper = 2; // AND takes the complement of the upper value

constexpr KqCode kKqTake = 0;
constexpr KqCode kKqCombine = 8;
constexpr KqCode kKqUnstack = 16;

constexpr unsigned int kKqVariableShift = 5;

// What the step does, without the variable.
inline KqCode KqActionOf(KqCode code)
{
    return code & ((1u << kKqVariableShift) - 1);
}

inline KqCode KqKindOf(KqCode code)
{
    return code & (kKqCombine - 1);
}

inline uint32_t KqVariableOf(KqCode code)
{
    return code >> kKqVariableShift;
}

// A value that the machine holds: a constant, or what the steps from a start on compute;
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

// Writes a program into a list behind 'first' codes, one value after another. Keeps the rules that
// make programs short: no constant stands in them, and what a constant decides is taken out again.
// The steps of a value leave the machine's stack one higher, whatever they simplify to.
// Requires: room in the list for each step put; fewer than 2^30 of them.
class KqWriter {
  public:
    KqWriter(KqCode* codes, size_t first) : m_codes(codes), m_end(static_cast<uint32_t>(first)) {}

    // The number of codes in the list that are in use.
    size_t GetEnd() const { return m_end; }
    // The list has moved.
    void SetCodes(KqCode* codes) { m_codes = codes; }

    KqValue PutConstant(bool isOne) { return KqValue::Constant(m_end, isOne); }

    KqValue PutVariable(uint32_t variable)
    {
        m_codes[m_end] = variable << kKqVariableShift | kKqTake;
        return KqValue::Computed(m_end++);
    }

    // The value at hand, put last, with a variable as the upper value.
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

    // The value at hand with a constant as the upper value.
    KqValue PutConstantOperand(KqCode kind, KqValue lower, bool isOne)
    {
        const uint32_t isAnd = kind >> 2;
        const uint32_t value = (isOne ? 1u : 0u) ^ (isAnd & kind >> 1);
        if (isAnd == 0)
            return lower.Invert(value);
        return value != 0 ? lower.Invert(kind & 1u) : Drop(lower, false);
    }

    // The value at hand with the one that was put right before it as the upper value.
    KqValue PutUnstack(KqCode kind, KqValue lower, KqValue upper)
    {
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
            // A variable alone need not be taken: the value stacked is at hand instead.
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
        m_end = value.GetStart();
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
// Requires: a checked tree of fewer than 2^30 nodes, numVariables <= kKqMaxVariables.
// Fails: std::bad_alloc.  Cost: O(nodes).
constexpr uint32_t kKqMaxVariables = 1u << (32 - kKqVariableShift);
KqProgram KqCompile(const Kq_BoolEquationImp::Node* root, uint32_t numVariables, bool isReversed);

// What a store keeps of its tree for evaluation: the column of up to six variables as a word, or
// a program for more. Made when it pays: the word at once, a program at the second evaluation.
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
    unsigned int RunProgram(const Variables& variables) const;

    static constexpr size_t kNoWord = SIZE_MAX;

    uint64_t m_word = 0;
    size_t m_num_word_variables = kNoWord; // what m_word is for
    KqProgram m_program;
    size_t m_num_program_variables = 0; // what m_program is for
    bool m_is_evaluated = false;        // at least once, for more than six variables
};

#endif
