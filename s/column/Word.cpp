// Tree in, the column of up to six variables out, as one word.
#include "Word.h"

#include "Operators.h"
#include "Walk.h"

typedef Kq_BoolEquationImp::Node Node;

namespace {

// An operator or leaf, and the word of its left operand once that is known.
struct Place {
    const Node* node;
    uint32_t inversion;
    uint64_t left;
};

uint64_t AllBits(uint32_t bit)
{
    return uint64_t(0) - bit;
}

uint64_t ApplyToWords(Node::TYPE type, uint64_t left, uint64_t right)
{
    const KqOperator found = KqOperatorOf(type);
    if (found.kind == kKqXor)
        return left ^ right ^ AllBits(found.inversion);
    // Both operands are complemented or neither is.
    const uint64_t inverted = AllBits(found.kind & kKqInvertLower);
    return ((left ^ inverted) & (right ^ inverted)) ^ AllBits(found.inversion);
}

// Keeps the word of the subtree that was left last.
struct WordOfTree {
    explicit WordOfTree(unsigned int number) : numVariables(number) {}

    unsigned int Enter(Place& place, Place& left, Place&)
    {
        if (!ResolveOperator(place))
            return KQ_NONE;
        left = {place.node->GetLeftChild(), 0, 0};
        return KQ_BOTH | KQ_RETURN;
    }

    bool Between(Place& place, Place& right)
    {
        place.left = word;
        right = {place.node->GetRightChild(), 0, 0};
        return ResolveOperator(right);
    }

    void Leave(const Place& place)
    {
        word = ApplyToWords(place.node->GetType(), place.left, word) ^ AllBits(place.inversion);
    }

    // Goes to the operator at or below the place; false for a leaf, whose word is then known.
    bool ResolveOperator(Place& place)
    {
        const KqOperand operand = KqFindOperand(place.node);
        place.node = operand.node;
        place.inversion ^= operand.inversion;
        if (operand.isOperator)
            return true;
        word = LeafWord(operand.node) ^ AllBits(operand.inversion);
        return false;
    }

    uint64_t LeafWord(const Node* node)
    {
        if (!node)
            return 0;
        if (!node->IsId())
            return AllBits(node->Is1() ? 1 : 0);
        const unsigned int index = node->GetValue();
        if (index < numVariables)
            return kKqRowsWithBit[numVariables - 1 - index];
        isComplete = false;
        return 0;
    }

    unsigned int numVariables;
    uint64_t word = 0;
    bool isComplete = true;
};

} // namespace

uint64_t KqComputeWord(const Node* root, unsigned int numVariables, bool& isComplete)
{
    assert(numVariables <= 6);
    WordOfTree visitor(numVariables);
    KqWalk(Place{root, 0, 0}, visitor);
    isComplete = visitor.isComplete;
    return visitor.word;
}
