// How many children take part in a node's value: the one place that sorts node types into
// operators, those that pass on or invert one operand, and leaves.
#ifndef KQ_OPERANDS_H
#define KQ_OPERANDS_H

#include <Kq_BoolEquationImpNode.h>

inline unsigned int KqNumOperands(Kq_BoolEquationImp::Node::TYPE type)
{
    typedef Kq_BoolEquationImp::Node Node;
    switch (type) {
    case Node::AND:
    case Node::NAND:
    case Node::NOR:
    case Node::NXOR:
    case Node::OR:
    case Node::XOR:
        return 2;
    case Node::NOT:
    case Node::LP:
    case Node::TRUTH_TABLE:
        return 1;
    case Node::ZERO:
    case Node::ONE:
    case Node::ID:
    case Node::RP:
    case Node::SENTINEL:
        return 0;
    }
    return 0;
}

#endif
