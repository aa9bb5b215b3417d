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

// A whole program: the first codes of a list, none for a constant, and whether it is complemented.
struct KqProgram {
    std::vector<KqCode> codes;
    size_t numCodes = 0;
    bool isInverted = false;
};

// How many values the machine ever stacks, at most. Operands are written as they stand while that
// is enough, and otherwise the one that needs more first: then n operands need log2(n) + 1 values.
constexpr size_t kKqMaxStack = 48;

// As many as a step can name.
constexpr uint32_t kKqMaxVariables = 1u << (32 - kKqVariableShift);

// Compiles the tree at 'root', null counting as 0. A variable's number is its index or, when
// 'isReversed', numVariables-1 less its index. An ID whose index is not below 'numVariables' is 0.
// Requires: a checked tree of fewer than 2^30 nodes, numVariables <= kKqMaxVariables.
// Fails: std::bad_alloc.  Cost: O(nodes).
KqProgram KqCompile(const Kq_BoolEquationImp::Node* root, uint32_t numVariables, bool isReversed);

// What a store keeps of its tree for evaluation: the column of up to six variables as a word, or
// a program for more. Made when it pays: the word at once, a program at the second evaluation.
class KqCompiled {
  public:
    typedef std::vector<std::pair<Port::StringBase<char>, unsigned int>> Variables;

    // Whether the column over so many variables is at hand.
    bool HasWord(size_t numVariables) const { return numVariables == m_num_word_variables; }

    // The value for a table of values 0 or 1.  Requires: HasWord(variables.size()).
    unsigned int EvalWord(const Variables& variables) const
    {
        unsigned int row = 0;
        for (const auto& variable : variables)
            row = row << 1 | variable.second;
        return m_word >> row & 1u;
    }

    // The value of the tree at 'root' for a table of values 0 or 1.
    // Fails: std::bad_alloc.  Cost: O(nodes); for up to six variables O(variables), but for the
    // first time and after a copy with another number of variables.
    unsigned int Eval(const Kq_BoolEquationImp::Node& root, const Variables& variables);

    // The column of up to six variables, repeated up to the word's end.
    uint64_t GetWord(const Kq_BoolEquationImp::Node& root, unsigned int numVariables);

    // Takes a column that is known.  Requires: numVariables <= 6.
    void SetWord(uint64_t word, unsigned int numVariables)
    {
        m_word = word;
        m_num_word_variables = numVariables;
    }

    void Drop() noexcept;

  private:
    unsigned int RunProgram(const Variables& variables) const;

    static constexpr size_t kNoWord = SIZE_MAX;

    uint64_t m_word = 0;
    size_t m_num_word_variables = kNoWord; // what m_word is for
    KqProgram m_program;
    size_t m_num_program_variables = 0; // what m_program is for
    bool m_is_evaluated = false;        // at least once, for more than six variables
};

#endif
