// A Boolean expression as a neutral tree: no syntax, no groups, no library objects. Readers and
// writers of all notations meet here.
#ifndef BOOLEQ_EXPRESSION_EXPRESSION_H
#define BOOLEQ_EXPRESSION_EXPRESSION_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

#include "function.h"
#include "word_function.h"

namespace booleq {

enum class Operator : uint8_t { Zero, One, Input, Not, And, Or, Xor, Nand, Nor, Nxor };

bool IsBinary(Operator op);

// Invariants:
// 1. nodes is the tree in post-order: operands before their operator, the left one first, the root
//    last. So a plain stack evaluates it from front to back.
// 2. An input's number is its place in names.
struct Expression {
    struct Node {
        Operator op;
        uint8_t spelling; // how the operator was typed, see SpellOperator; 0 unless known
        uint32_t left;    // node of the first operand; an input's number
        uint32_t right;   // node of a binary operator's second operand
    };
    std::vector<Node> nodes;
    std::vector<std::string> names; // the first is the most significant
};

// Each appends a node and returns its number. Requires: the operands are where post-order wants
// them.
uint32_t AddInput(Expression& expression, uint32_t input);
uint32_t AddConstant(Expression& expression, bool value);
uint32_t AddNot(Expression& expression, uint32_t operand);
uint32_t AddBinary(Expression& expression, Operator op, uint32_t left, uint32_t right);

// The tree of an equation over its inputs; 0 for an equation that is not set. An init value gives
// the expression it stands for.
// Cost: in step with the equation; no recursion.
Expression ToExpression(const Kq_BoolEquation& equation);

// The library's spelling of an operator: style 0 writes & | ^ ~, style 1 writes * + @, style 2
// writes .AND.; adding 4 writes '!' for '~'. Binary operators and NOT only.
std::string SpellOperator(Operator op, uint8_t style);
// The style in which an operator was typed.
uint8_t StyleOf(const std::string& token);

// The values for 64 assignments at once, one in each bit: inputs[k] holds input k's values.
// 'stack' is scratch space. Cost: O(nodes).
uint64_t EvaluateWord(const Expression& expression, const std::vector<uint64_t>& inputs,
                      std::vector<uint64_t>& stack);

// The function over all names, in their order.
// Requires: at most kMaxFunctionInputs names.  Cost: O(nodes * 2^names / 64).
Function ToFunction(const Expression& expression);

} // namespace booleq

#endif
