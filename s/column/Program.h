// An equation as a program: the tree without its groups and constants, as steps of a machine.
// Evaluation runs it for one assignment; the result column fixes its variables one after another.
#ifndef KQ_PROGRAM_H
#define KQ_PROGRAM_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

// One step of a machine that keeps the last value at hand. TAKE stacks that value and takes a
// variable's instead. COMBINE makes a new value from the one at hand, as the lower value, and a
// variable, as the upper one. UNSTACK makes it from the one at hand, as the lower value, and one
// off the stack, as the upper one. Inversions are part of the AND that takes the value, so four
// forms of AND and one XOR are enough; an inversion left at the very end belongs to the program.
// The lowest three bits are the operator's kind, the next two the action, the rest a variable.
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

// A whole program: the first codes of a list, none for a constant, and whether it is inverted.
struct KqProgram {
    std::vector<KqCode> codes;
    size_t numCodes = 0;
    bool isInverted = false;
};

// The most values that the machine ever stacks. Operands are written in their order while this is
// enough; otherwise the one that needs more goes first: then n operands need log2(n) + 1 values.
constexpr size_t kKqMaxStack = 48;

// As many as a step can name.
constexpr uint32_t kKqMaxVariables = 1u << (32 - kKqVariableShift);

// Compiles the tree at 'root', null counting as 0. A variable's number is its index or, when
// 'isReversed', numVariables-1 less its index. An ID whose index is not below 'numVariables' is 0.
// Requires: a checked tree of fewer than 2^30 nodes, numVariables <= kKqMaxVariables.
// Fails: std::bad_alloc.  Cost: O(nodes).
KqProgram KqCompile(const Kq_BoolEquationImp::Node* root, uint32_t numVariables, bool isReversed);

// The program's value for a table of values 0 or 1.
// Requires: a program of variables numbered by their index, all of them in the table.
unsigned int
KqRunProgram(const KqProgram& program,
             const std::vector<std::pair<Port::StringBase<char>, unsigned int>>& variables);

// How many variables a table must have for the program: 1 more than the highest one it uses.
// Requires: a program of variables numbered by their index.
size_t KqCountVariables(const KqProgram& program);

#endif
