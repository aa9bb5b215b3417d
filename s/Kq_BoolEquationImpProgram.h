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
constexpr KqCode kKqVariable = 0;
constexpr KqCode kKqXor = 1;
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

// A program that is being written, one operand after another. Keeps the rules that make it short:
// no constant stands in it, and what a constant decides is taken out again.
// A code array of 'capacity' is the caller's; no more codes come out than went in.
class KqWriter {
  public:
    explicit KqWriter(KqCode* codes) : m_codes(codes), m_end(codes) {}

    // A value on the stack: a constant, or the codes from 'start' on; complemented or not.
    struct Value {
        KqCode* start;
        bool isConstant;
        bool isInverted; // of a constant: it is 1
    };

    Value PutConstant(bool isOne) { return Value{m_end, true, isOne}; }

    Value PutVariable(uint32_t variable)
    {
        KqCode* start = m_end;
        *m_end++ = variable << kKqKindBits | kKqVariable;
        return Value{start, false, false};
    }

    // Requires: 'upper' was put right behind 'lower', and nothing behind 'upper'.
    Value PutAnd(const Value& lower, const Value& upper)
    {
        if (lower.isConstant)
            return lower.isInverted ? upper : Drop(lower.start, false);
        if (upper.isConstant)
            return upper.isInverted ? lower : Drop(lower.start, false);
        if (IsSameVariable(lower, upper)) {
            if (lower.isInverted != upper.isInverted)
                return Drop(lower.start, false);
            m_end = upper.start;
            return lower;
        }
        *m_end++ = kKqAnd | (lower.isInverted ? kKqInvertLower : 0u) |
                   (upper.isInverted ? kKqInvertUpper : 0u);
        return Value{lower.start, false, false};
    }

    Value PutXor(const Value& lower, const Value& upper)
    {
        const bool isInverted = lower.isInverted != upper.isInverted;
        if (lower.isConstant || upper.isConstant)
            return Value{lower.start, lower.isConstant && upper.isConstant, isInverted};
        if (IsSameVariable(lower, upper))
            return Drop(lower.start, isInverted);
        *m_end++ = kKqXor;
        return Value{lower.start, false, isInverted};
    }

    KqCode* GetEnd() const { return m_end; }

  private:
    Value Drop(KqCode* start, bool isOne)
    {
        m_end = start;
        return Value{start, true, isOne};
    }

    bool IsSameVariable(const Value& lower, const Value& upper) const
    {
        return upper.start - lower.start == 1 && m_end - upper.start == 1 &&
               *lower.start == *upper.start;
    }

    KqCode* m_codes;
    KqCode* m_end;
};

inline KqWriter::Value KqInverted(const KqWriter::Value& value, bool isInverted)
{
    return KqWriter::Value{value.start, value.isConstant, value.isInverted != isInverted};
}

// A whole program: the codes, none for a constant, and whether its result is complemented.
struct KqProgram {
    std::vector<KqCode> codes;
    bool isInverted = false;
};

// How many values the machine's stack ever holds, at most: of two operands the one that needs more
// is written first, so that n operands never need more than log2(n) + 1 values.
constexpr size_t kKqMaxStack = 48;

// Compiles the tree at 'root', null counting as 0. A variable's number is its index or, when
// 'isReversed', numVariables-1 less its index. An ID whose index is not below 'numVariables' is 0.
// Requires: a checked tree, numVariables < 2^29.  Fails: std::bad_alloc.  Cost: O(nodes).
KqProgram KqCompile(const Kq_BoolEquationImp::Node* root, uint32_t numVariables, bool isReversed);

// A program for a machine that keeps the last value at hand. TAKE stacks that value and takes a
// variable's; COMBINE makes a new one of it, as the lower value, and a variable, as the upper one;
// UNSTACK makes it of it, as the lower value, and one off the stack, as the upper one.
struct KqStep {
    enum ACTION : uint8_t { TAKE, COMBINE, UNSTACK };

    uint32_t variable;
    ACTION action;
    uint8_t kind;  // the operator
    uint8_t table; // the operator's result for lower and upper value, bit lower + 2 * upper
};

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
    unsigned int Eval(const Kq_BoolEquationImp::Node& root, const Variables& variables);

    // The column of up to six variables, repeated up to the word's end.
    uint64_t GetWord(const Kq_BoolEquationImp::Node& root, unsigned int numVariables);

    void Drop() noexcept;

  private:
    unsigned int RunSteps(const Variables& variables) const;

    uint64_t m_word = 0;
    unsigned int m_num_word_variables = UINT32_MAX; // what m_word is for; none
    unsigned int m_num_evaluations = 0;
    uint32_t m_num_steps_variables = 0; // what m_steps is for
    bool m_is_inverted = false;
    std::vector<KqStep> m_steps;
};

#endif
