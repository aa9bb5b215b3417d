// The tree of an init value, made of its results when somebody asks for it: node by node the one
// that its expression would give. Its shape follows from the rows alone, so positions need no tree.
// Fails: std::bad_alloc, with the tree owed as before.  Cost: O(nodes), and O(rows * names)
// for a value whose first name is the lowest bit.
#include "Kq_BoolEquationImpStore.h"

#include "Kq_BoolEquationImpSpelling.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Kq_BoolEquationImp::Store Store;
typedef Port::StringBase<char> String;

namespace {

// Terms, and factors in a term, hang in chains that lean to the left: in pre-order all operators of
// a chain, the topmost first, then its operands.
size_t CountOperators(size_t numOperands)
{
    return numOperands - 1;
}

// The nodes of one term: its parentheses, operators, names and negations.
size_t CountTermNodes(const KqInitText& initText, uint64_t row)
{
    const size_t numNames = initText.GetNumNames();
    return 2 + CountOperators(numNames) + numNames + initText.CountNegations(row, numNames);
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

const String& TextOf(KqSpelling::Id id)
{
    return KqSpelling::GetTexts()[id];
}

} // namespace

// A chain below one node: its operators are made at once, its operands are handed in.
class Store::Chain {
  public:
    // Requires: room for the operators.
    Chain(Store& store, Node* holder, size_t numOperands, KqSpelling::Id operation)
        : m_lowest(holder)
    {
        for (size_t made = 0; made < CountOperators(numOperands); ++made) {
            Node* const node =
                store.MakeNode(KqSpelling::kSpellings[operation].type, TextOf(operation));
            LinkLeft(m_lowest, node);
            m_lowest = node;
        }
    }

    // Operands come in text order, the one of the lowest operator's left first.
    void Add(Node* operand)
    {
        if (!m_has_first) {
            LinkLeft(m_lowest, operand);
            m_has_first = true;
            return;
        }
        LinkRight(m_lowest, operand);
        m_lowest = m_lowest->GetParent();
    }

  private:
    Node* m_lowest; // that lacks an operand; the holder when there are no operators
    bool m_has_first = false;
};

void Store::MakeInitTree()
{
    const KqInitText& initText = *m_init_text;
    const size_t numTerms = initText.GetNumTerms();
    size_t numTermNodes = 0;
    initText.VisitTerms([&](uint64_t row) { numTermNodes += CountTermNodes(initText, row); });
    try {
        MakeRoom(1 + CountOperators(numTerms) + numTermNodes);
        Node* const table = MakeNode(Node::TRUTH_TABLE, initText.GetText());
        Chain terms(*this, table, numTerms,
                    initText.IsSum() ? KqSpelling::kPlus : KqSpelling::kStar);
        initText.VisitTerms([&](uint64_t row) { terms.Add(MakeInitTerm(row)); });
        m_root = table;
        assert(m_nodes.size() == m_num_slots);
        KqCheckStore(*this);
    } catch (...) {
        FreeNodes();
        throw;
    }
}

// The group of one term.  Requires: room for its nodes.
Node* Store::MakeInitTerm(uint64_t row)
{
    const std::vector<String>& names = m_init_text->GetNames();
    Node* const group = MakeNode(Node::LP, TextOf(KqSpelling::kLeftParen));
    Chain factors(*this, group, names.size(),
                  m_init_text->IsSum() ? KqSpelling::kStar : KqSpelling::kPlus);
    for (size_t index = 0; index < names.size(); ++index) {
        Node* const negation = m_init_text->IsNegated(row, index)
                                   ? MakeNode(Node::NOT, TextOf(KqSpelling::kTilde))
                                   : nullptr;
        Node* const name = MakeNode(Node::ID, names[index]);
        name->SetValue(static_cast<unsigned int>(index)); // invariant 5
        if (negation)
            LinkLeft(negation, name);
        factors.Add(negation ? negation : name);
    }
    LinkRight(group, MakeNode(Node::RP, TextOf(KqSpelling::kRightParen)));
    return group;
}

void Store::AppendInitPositions(const String& name, std::vector<unsigned int>& positions) const
{
    const KqInitText& initText = *m_init_text;
    const std::vector<String>& names = initText.GetNames();
    size_t index = 0;
    while (index < names.size() && !KqIsSameText(names[index], name))
        ++index;
    if (index == names.size())
        return;
    positions.reserve(positions.size() + initText.GetNumTerms());
    // Behind the init value's own root and the operators between terms.
    size_t term = 1 + CountOperators(initText.GetNumTerms());
    initText.VisitTerms([&](uint64_t row) {
        const size_t inTerm =
            1 + CountOperators(names.size()) + index + initText.CountNegations(row, index + 1);
        positions.push_back(static_cast<unsigned int>(term + inTerm));
        term += CountTermNodes(initText, row);
    });
}
