// What the nodes of a tree mean to code that computes with bits: operators as kinds of one
// machine's steps, leaving out nodes that merely pass a value on.
#ifndef KQ_OPERATORS_H
#define KQ_OPERATORS_H

#include "Operands.h"
#include "Program.h"

// An operator or leaf, null counting as 0.
struct KqOperand {
    const Kq_BoolEquationImp::Node* node;
    uint32_t inversion; // 1 when its value is complemented
    bool isOperator;
};

// The operand at or below 'node': groups and init values pass theirs on, a NOT inverts it.
inline KqOperand KqFindOperand(const Kq_BoolEquationImp::Node* node)
{
    uint32_t inversion = 0;
    for (; node; node = node->GetLeftChild()) {
        const unsigned int numOperands = KqNumOperands(node->GetType());
        if (numOperands != 1)
            return {node, inversion, numOperands == 2};
        inversion ^= node->IsNot() ? 1u : 0u;
    }
    return {nullptr, inversion, false};
}

// A binary operator as a kind, and 1 when the result is complemented: OR is an AND of complements.
struct KqOperator {
    KqCode kind;
    uint32_t inversion;
};

// Requires: a binary operator.
inline KqOperator KqOperatorOf(Kq_BoolEquationImp::Node::TYPE type)
{
    typedef Kq_BoolEquationImp::Node Node;
    constexpr KqCode invertBoth = kKqInvertLower | kKqInvertUpper;
    switch (type) {
    case Node::AND:
        return {kKqAnd, 0};
    case Node::NAND:
        return {kKqAnd, 1};
    case Node::OR:
        return {kKqAnd | invertBoth, 1};
    case Node::NOR:
        return {kKqAnd | invertBoth, 0};
    case Node::NXOR:
        return {kKqXor, 1};
    case Node::XOR:
    case Node::ZERO:
    case Node::ONE:
    case Node::ID:
    case Node::LP:
    case Node::NOT:
    case Node::RP:
    case Node::TRUTH_TABLE:
    case Node::SENTINEL:
        break;
    }
    return {kKqXor, 0};
}

#endif
