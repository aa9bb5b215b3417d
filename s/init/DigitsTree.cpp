// The tree of an init value, made from its results: node by node the one that its expression would
// give. Its shape follows from the rows alone, so positions need no tree.
#include "DigitsTree.h"

#include <cassert>

#include "Spelling.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;

namespace {

// Terms, and factors in a term, hang in chains that lean to the left: pre-order has all operators
// of a chain, the topmost first, then its operands.
size_t CountOperators(size_t numOperands)
{
    return numOperands - 1;
}

// The nodes of one term: its parentheses, operators, names and negations.
size_t CountTermNodes(const KqDigits& digits, uint64_t row)
{
    const size_t numNames = digits.GetNumNames();
    return 2 + CountOperators(numNames) + numNames + digits.CountNegations(row, numNames);
}

void LinkLeft(Node* parent, Node* child)
{
    parent->SetLeftChild(child);
    child->SetParent(parent);
}

void LinkRight(Node* parent, Node* child)
{
    parent->SetRightChild(child);
    child->SetParent(parent);
}

// Requires: room.
Node* MakeNode(KqTree& tree, KqSpellingId id)
{
    return tree.MakeNode(kKqSpellings[id].type, KqGetSpelling(id).text);
}

constexpr KqSpellingId kProduct = KqSpellingOf("*");
constexpr KqSpellingId kSum = KqSpellingOf("+");

// A chain below one node: its operators are made at once, its operands are added one by one.
class Chain {
  public:
    // Requires: room for the operators.
    Chain(KqTree& tree, Node* holder, size_t numOperands, KqSpellingId operation) : m_lowest(holder)
    {
        for (size_t made = 0; made < CountOperators(numOperands); ++made) {
            Node* const node = MakeNode(tree, operation);
            LinkLeft(m_lowest, node);
            m_lowest = node;
        }
    }

    // Operands come in text order, starting with the left one of the lowest operator.
    void Add(Node* operand)
    {
        if (!m_has_first) {
            LinkLeft(m_lowest, operand);
            m_has_first = true;
            return;
        }
        assert(!m_lowest->GetRightChild());
        LinkRight(m_lowest, operand);
        m_lowest = m_lowest->GetParent();
    }

  private:
    Node* m_lowest; // lacks an operand; the holder when there are no operators
    bool m_has_first = false;
};

// The group of one term.  Requires: room for its nodes.
Node* MakeTerm(const KqDigits& digits, uint64_t row, KqTree& tree)
{
    const std::vector<String>& names = digits.GetNames();
    Node* const group = MakeNode(tree, KqSpellingOf("("));
    Chain factors(tree, group, names.size(), digits.IsSum() ? kProduct : kSum);
    for (size_t index = 0; index < names.size(); ++index) {
        Node* const negation =
            digits.IsNegated(row, index) ? MakeNode(tree, KqSpellingOf("~")) : nullptr;
        Node* const name = tree.MakeNode(Node::ID, names[index]);
        name->SetValue(static_cast<unsigned int>(index));
        if (negation)
            LinkLeft(negation, name);
        factors.Add(negation ? negation : name);
    }
    LinkRight(group, MakeNode(tree, KqSpellingOf(")")));
    return group;
}

} // namespace

void KqMakeDigitsTree(const KqDigits& digits, KqTree& tree)
{
    const size_t numTerms = digits.GetNumTerms();
    size_t numTermNodes = 0;
    digits.VisitTerms([&](uint64_t row) { numTermNodes += CountTermNodes(digits, row); });
    const size_t numNodes = 1 + CountOperators(numTerms) + numTermNodes;
    tree.MakeRoom(numNodes);
    Node* const table = tree.MakeNode(Node::TRUTH_TABLE, digits.GetText());
    Chain terms(tree, table, numTerms, digits.IsSum() ? kSum : kProduct);
    digits.VisitTerms([&](uint64_t row) { terms.Add(MakeTerm(digits, row, tree)); });
    tree.root = table;
    assert(tree.list.size() == numNodes);
    KqCheckTree(tree.root, tree.list);
}

void KqAppendDigitsPositions(const KqDigits& digits, size_t nameIndex,
                             std::vector<unsigned int>& positions)
{
    const size_t numNames = digits.GetNumNames();
    assert(nameIndex < numNames);
    positions.reserve(positions.size() + digits.GetNumTerms());
    // After the init value's own root and the operators between terms.
    size_t term = 1 + CountOperators(digits.GetNumTerms());
    digits.VisitTerms([&](uint64_t row) {
        const size_t inTerm =
            1 + CountOperators(numNames) + nameIndex + digits.CountNegations(row, nameIndex + 1);
        positions.push_back(static_cast<unsigned int>(term + inTerm));
        term += CountTermNodes(digits, row);
    });
}
