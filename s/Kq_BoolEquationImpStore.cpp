// The node store: nodes made in one block, listed in the order asked for, freed together.
// Fails: std::bad_alloc, with the nodes made so far listed.
#include "Kq_BoolEquationImpStore.h"

#include <cerrno>
#include <new>

#if defined(__linux__)
#include <sys/mman.h>
#endif

#include "Kq_BoolEquationImpWalk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Kq_BoolEquationImp::Store Store;
typedef Port::StringBase<char> String;

namespace {

constexpr size_t kKeptSlots = 3000;

// Asks for large pages for a block of several megabytes that is about to be filled. A hint to the
// system where there is one, and nothing elsewhere; docs/benchmarks.md says what it saves.
void AdviseLargePages(void* block, size_t size)
{
#if defined(__linux__)
    constexpr uintptr_t kPage = 2u << 20;
    const uintptr_t begin = (reinterpret_cast<uintptr_t>(block) + kPage - 1) / kPage * kPage;
    const uintptr_t end = (reinterpret_cast<uintptr_t>(block) + size) / kPage * kPage;
    const int savedErrno = errno;
    if (end > begin + kPage)
        madvise(reinterpret_cast<void*>(begin), end - begin, MADV_HUGEPAGE);
    errno = savedErrno;
#else
    (void)block;
    (void)size;
#endif
}

// Whether the trees at 'left' and 'right', either of which may be null, have equal nodes.
bool IsSameTree(const Node* left, const Node* right)
{
    struct Pair {
        const Node* left;
        const Node* right;
    };
    KqStack<Pair, 64> pending;
    pending.Push({left, right});
    while (!pending.IsEmpty()) {
        const Pair pair = pending.Pop();
        if (!pair.left != !pair.right)
            return false;
        if (!pair.left)
            continue;
        if (*pair.left != *pair.right)
            return false;
        pending.Push({pair.left->GetRightChild(), pair.right->GetRightChild()});
        pending.Push({pair.left->GetLeftChild(), pair.right->GetLeftChild()});
    }
    return true;
}

} // namespace

Node* Store::MakeNode(Node::TYPE type, const String& text)
{
    assert(m_nodes.size() < m_num_slots);
    Node* node = ::new (static_cast<void*>(m_block + m_nodes.size())) Node(type, text);
    m_nodes.push_back(node);
    return node;
}

void Store::MakeRoom(size_t numNodes)
{
    assert(m_nodes.empty());
    FreeNodes(); // an allocation that failed before may have left a block without nodes
    m_nodes.reserve(numNodes);
    m_block = Node::m_kq_boolequationimp_node_mem.allocate(numNodes);
    m_num_slots = numNodes;
    AdviseLargePages(m_block, m_num_slots * sizeof(Node));
}

void Store::MakeNodes(const Tokens& tokens)
{
    MakeRoom(tokens.GetSize() + 1);
    for (const Tokens::Token& token : tokens)
        MakeNode(token.type, *token.text);
}

void Store::AddTruthTableRoot(const String& initValue)
{
    Node* table = MakeNode(Node::TRUTH_TABLE, initValue);
    table->SetLeftChild(m_root);
    m_root->SetParent(table);
    m_root = table;
}

void Store::ListInPreOrder()
{
    KqStack<Node*, 32> pending;
    pending.Push(m_root);
    for (Node*& position : m_nodes) {
        Node* node = pending.Pop();
        position = node;
        // The right child is pushed first, so the left one is listed first.
        if (node->GetRightChild()) {
            __builtin_prefetch(node->GetRightChild()); // far away in a text nested to the left
            pending.Push(node->GetRightChild());
        }
        if (node->GetLeftChild())
            pending.Push(node->GetLeftChild());
    }
}

void Store::Owe(std::unique_ptr<KqInitText> initText) noexcept
{
    assert(IsEmpty());
    assert(initText->IsExact());
    m_init_text = std::move(initText);
    const unsigned int numNames = static_cast<unsigned int>(m_init_text->GetNumNames());
    if (numNames <= 6) {
        uint64_t word = 0;
        m_init_text->Fill(numNames, 0, 1, &word);
        m_compiled.SetWord(word, numNames);
    }
}

void Store::Clear() noexcept
{
    FreeNodes();
    m_compiled.Drop();
    m_init_text.reset();
}

void Store::FreeNodes() noexcept
{
    m_root = nullptr;
    for (size_t position = 0; position < m_nodes.size(); ++position)
        m_block[position].~Node();
    m_nodes.clear();
    // The list of an ordinary equation is kept for the next one, a long one is given back.
    if (m_nodes.capacity() > kKeptSlots)
        std::vector<Node*>().swap(m_nodes);
    if (m_block)
        Node::m_kq_boolequationimp_node_mem.deallocate(m_block, m_num_slots);
    m_block = nullptr;
}

const String* Store::GetInitValue() const
{
    if (m_init_text)
        return &m_init_text->GetText();
    return m_root && m_root->GetType() == Node::TRUTH_TABLE ? &m_root->GetToken() : nullptr;
}

bool Store::IsSame(Store& other)
{
    if (this == &other)
        return true;
    // Two init values of the same text differ as their names do and, with the bits in another
    // order, as their terms do. Nodes are asked for where one of the trees was made at once.
    const String* const initValue = GetInitValue();
    const String* const otherInitValue = other.GetInitValue();
    if (!initValue != !otherInitValue || (initValue && !KqIsSameText(*initValue, *otherInitValue)))
        return false;
    if (m_init_text && other.m_init_text) {
        const std::vector<String>& names = m_init_text->GetNames();
        if (!std::equal(names.begin(), names.end(), other.m_init_text->GetNames().begin(),
                        other.m_init_text->GetNames().end(), KqIsSameText))
            return false;
        return m_init_text->IsFirstLowest() == other.m_init_text->IsFirstLowest() ||
               m_init_text->HasSymmetricTerms();
    }
    return GetNodes().size() == other.GetNodes().size() && IsSameTree(GetRoot(), other.GetRoot());
}

void Store::LinkVariable(const String& name, unsigned int variableIndex)
{
    if (m_init_text)
        return; // invariant 5: its names have been variables ever since
    for (Node* node : m_nodes) {
        if (node->IsId() && KqIsSameText(node->GetToken(), name)) {
            node->SetValue(variableIndex);
            m_compiled.Drop();
        }
    }
}

std::vector<unsigned int> Store::MakeHandle(const String& name, unsigned int variableIndex) const
{
    std::vector<unsigned int> values(1, variableIndex);
    if (m_init_text) {
        AppendInitPositions(name, values);
        return values;
    }
    for (size_t position = 0; position < m_nodes.size(); ++position) {
        // Deliberate: the node's type is not asked for, only its token.
        if (KqIsSameText(m_nodes[position]->GetToken(), name))
            values.push_back(static_cast<unsigned int>(position));
    }
    return values;
}

uint64_t Store::GetWord(unsigned int numVariables)
{
    if (!m_init_text)
        return m_compiled.GetWord(*m_root, numVariables);
    uint64_t word = 0;
    m_init_text->Fill(numVariables, 0, 1, &word);
    return word;
}

unsigned int Store::EvalOther(const std::vector<Variable>& variables)
{
    if (m_init_text)
        return m_init_text->Eval(variables);
    return m_root ? m_compiled.Eval(*m_root, variables) : 0;
}

void KqCheckStore(Kq_BoolEquationImp::Store& store)
{
#ifdef NDEBUG
    (void)store;
#else
    std::vector<const Node*> pending;
    const std::vector<Node*>& nodes = store.GetNodes();
    if (store.GetRoot())
        pending.push_back(store.GetRoot());
    size_t position = 0;
    while (!pending.empty()) {
        const Node* node = pending.back();
        pending.pop_back();
        assert(position < nodes.size());
        assert(nodes[position] == node);
        ++position;
        for (const Node* child : {node->GetRightChild(), node->GetLeftChild()}) {
            if (!child)
                continue;
            assert(child->GetParent() == node || child->IsNot());
            pending.push_back(child);
        }
    }
    assert(position == nodes.size());
#endif
}
