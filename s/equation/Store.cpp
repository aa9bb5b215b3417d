// An equation's content: taken whole, shared, owed and paid, compared, searched by name.
// Fails: std::bad_alloc, and the store is as it was.
#include "Store.h"

#include <algorithm>
#include <cassert>
#include <mutex>
#include <unordered_map>

#include "DigitsTree.h"
#include "Tokens.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;

namespace {

constexpr size_t kKeptSlots = 3000;

// Guards what changes in stores that several objects may share: the list and the links before
// there is a root, the moment in which an owed tree appears, and the watchers. Never held while
// memory is allocated or freed, because that may use equations, or while a message goes out.
std::mutex s_sharedStores;

// Takes the lock while nodes are loose: once there is a root, nodes and list no longer change.
std::unique_lock<std::mutex> LockLoose(const std::atomic<Node*>& root)
{
    std::unique_lock<std::mutex> lock(s_sharedStores, std::defer_lock);
    if (!root.load(std::memory_order_acquire))
        lock.lock();
    return lock;
}

} // namespace

bool KqStore::IsEmpty() const
{
    return !HasEquation() && CountNodes() == 0;
}

size_t KqStore::CountNodes() const
{
    const std::unique_lock<std::mutex> reading = LockLoose(m_root);
    return m_list.size();
}

void KqStore::TakeTree(KqTree& tree) noexcept
{
    assert(!HasEquation());
    assert(m_list.empty());
    assert(tree.root);
    assert(tree.list[0] == tree.root); // in pre-order
    m_list.swap(tree.list);
    m_block.Swap(tree.block);
    m_root.store(tree.root, std::memory_order_release);
}

void KqStore::TakeDigits(std::unique_ptr<KqDigits> digits) noexcept
{
    assert(!HasEquation());
    assert(m_list.empty());
    assert(digits->IsExact());
    const unsigned int numNames = static_cast<unsigned int>(digits->GetNumNames());
    if (numNames <= 6) {
        uint64_t word = 0;
        digits->Fill(numNames, 0, 1, &word);
        m_evaluation.SetWord(word, numNames);
    }
    m_digits = std::move(digits);
}

void KqStore::Clear() noexcept
{
    assert(!IsShared());
    m_root.store(nullptr, std::memory_order_relaxed);
    m_block.Free();
    m_list.clear();
    // The list of an ordinary equation is kept for the next one; a long one is given back.
    if (m_list.capacity() > kKeptSlots)
        std::vector<Node*>().swap(m_list);
    m_evaluation.Drop();
    m_digits.reset();
    assert(IsEmpty());
}

// Makes the tree that the digits owe, for all holders. The thread that comes second frees its own.
const Node* KqStore::PayTree() const
{
    KqTree made;
    KqMakeDigitsTree(*m_digits, made);
    // Declared after 'made', so that what is thrown away is freed without the lock.
    const std::lock_guard<std::mutex> paying(s_sharedStores);
    if (!m_root.load(std::memory_order_relaxed)) {
        assert(m_list.empty()); // invariant 5
        m_list.swap(made.list);
        m_block.Swap(made.block);
        m_root.store(made.root, std::memory_order_release);
    }
    return m_root.load(std::memory_order_relaxed);
}

void KqStore::TakeTokens(const KqTokens& tokens)
{
    KqTree made;
    made.MakeNodes(tokens);
    const std::lock_guard<std::mutex> taking(s_sharedStores);
    if (HasEquation() || !m_list.empty())
        return;
    m_list.swap(made.list);
    m_block.Swap(made.block);
}

void KqStore::CopyTokens(KqTree& copy) const
{
    if (HasEquation())
        return;
    const size_t numNodes = CountNodes();
    if (numNodes == 0)
        return;
    // Loose tokens come and go as a whole, and here they exist: their texts and types stay.
    copy.MakeRoom(numNodes);
    for (const Node* node : m_list)
        copy.MakeNode(node->GetType(), node->GetToken())->SetValue(node->GetValue());
}

void KqStore::TakeLinks(const KqTree& tree) noexcept
{
    // Both blocks hold the nodes side by side in the order of the tokens.
    const std::lock_guard<std::mutex> linking(s_sharedStores);
    if (m_root.load(std::memory_order_relaxed))
        return;
    assert(m_list.size() == tree.list.size());
    const auto own = [&](const Node* node) {
        return node ? m_list[static_cast<size_t>(node - tree.list[0])] : nullptr;
    };
    for (size_t position = 0; position < m_list.size(); ++position) {
        m_list[position]->SetParent(own(tree.list[position]->GetParent()));
        m_list[position]->SetLeftChild(own(tree.list[position]->GetLeftChild()));
        m_list[position]->SetRightChild(own(tree.list[position]->GetRightChild()));
    }
    m_root.store(own(tree.root), std::memory_order_release);
}

const String* KqStore::GetInitValue() const
{
    if (m_digits)
        return &m_digits->GetText();
    const Node* const root = m_root.load(std::memory_order_acquire);
    return root && root->GetType() == Node::TRUTH_TABLE ? &root->GetToken() : nullptr;
}

bool KqStore::IsSame(const KqStore& other) const
{
    if (this == &other)
        return true;
    // Two init values with the same text differ if their names do or, with the bits in another
    // order, if their terms do. Nodes are compared only where one of the trees was made at once.
    const String* const initValue = GetInitValue();
    const String* const otherInitValue = other.GetInitValue();
    if (!initValue != !otherInitValue || (initValue && !KqIsSameText(*initValue, *otherInitValue)))
        return false;
    if (m_digits && other.m_digits) {
        const std::vector<String>& names = m_digits->GetNames();
        if (!std::equal(names.begin(), names.end(), other.m_digits->GetNames().begin(),
                        other.m_digits->GetNames().end(), KqIsSameText))
            return false;
        return m_digits->IsFirstLowest() == other.m_digits->IsFirstLowest() ||
               m_digits->HasSymmetricTerms();
    }
    const Node* const root = GetRoot();
    const Node* const otherRoot = other.GetRoot();
    return CountNodes() == other.CountNodes() && KqIsSameTree(root, otherRoot);
}

void KqStore::LinkVariable(const String& name, unsigned int variableIndex)
{
    if (m_digits)
        return; // invariant 5: its names are variables already
    const std::unique_lock<std::mutex> linking = LockLoose(m_root);
    const bool isShared = IsShared();
    for (Node* node : m_list) {
        if (!node->IsId() || !KqIsSameText(node->GetToken(), name) ||
            node->GetValue() == variableIndex)
            continue;
        // Done before the value changes: what is made from it afterwards must not be kept.
        if (isShared)
            m_evaluation.Abandon();
        else
            m_evaluation.Drop();
        node->SetValue(variableIndex);
    }
}

std::vector<unsigned int> KqStore::MakeHandle(const String& name, unsigned int variableIndex) const
{
    std::vector<unsigned int> values(1, variableIndex);
    if (m_digits) {
        const std::vector<String>& names = m_digits->GetNames();
        const auto found = std::find_if(names.begin(), names.end(), [&](const String& other) {
            return KqIsSameText(other, name);
        });
        if (found != names.end())
            KqAppendDigitsPositions(*m_digits, static_cast<size_t>(found - names.begin()), values);
        return values;
    }
    const size_t numNodes = CountNodes(); // once nodes exist, their texts stay
    for (size_t position = 0; position < numNodes; ++position) {
        // Deliberate: only the node's token is compared, not its type.
        if (KqIsSameText(m_list[position]->GetToken(), name))
            values.push_back(static_cast<unsigned int>(position));
    }
    return values;
}

std::vector<KqStore::Place> KqStore::ListPlaces(size_t& root) const
{
    GetRoot(); // makes the nodes
    std::vector<Place> places(CountNodes());
    std::unordered_map<const Node*, size_t> positions;
    positions.reserve(places.size());
    for (size_t position = 0; position < places.size(); ++position)
        positions.emplace(m_list[position], position);
    const auto positionOf = [&](const Node* node) {
        const auto found = positions.find(node);
        return found == positions.end() ? size_t(Place::kNowhere) : found->second;
    };
    const std::unique_lock<std::mutex> reading = LockLoose(m_root);
    for (size_t position = 0; position < places.size(); ++position) {
        const Node* const node = m_list[position];
        places[position] = {node, positionOf(node->GetParent()), positionOf(node->GetLeftChild()),
                            positionOf(node->GetRightChild())};
    }
    root = positionOf(m_root.load(std::memory_order_relaxed));
    return places;
}

void KqStore::AddWatcher(Watcher& watcher) noexcept
{
    const std::lock_guard<std::mutex> adding(s_sharedStores);
    watcher.next = m_watchers.load(std::memory_order_relaxed);
    m_watchers.store(&watcher, std::memory_order_relaxed);
}

void KqStore::RemoveWatcher(const Watcher& watcher) noexcept
{
    const std::lock_guard<std::mutex> removing(s_sharedStores);
    Watcher* const first = m_watchers.load(std::memory_order_relaxed);
    if (first == &watcher) {
        m_watchers.store(watcher.next, std::memory_order_relaxed);
        return;
    }
    Watcher* before = first;
    while (before->next != &watcher) {
        before = before->next;
        assert(before); // a watcher that was never added
    }
    before->next = watcher.next;
}

bool KqStore::HasHolder(const Watcher& watcher) const noexcept
{
    const std::lock_guard<std::mutex> reading(s_sharedStores);
    return watcher.holder != nullptr;
}

void KqStore::TellEachWatcher(const void* holder) noexcept
{
    const std::lock_guard<std::mutex> telling(s_sharedStores);
    for (Watcher* watcher = m_watchers.load(std::memory_order_relaxed); watcher;
         watcher = watcher->next) {
        if (watcher->holder == holder)
            watcher->holder = nullptr;
    }
}

uint64_t KqStore::GetWord(unsigned int numVariables) const
{
    if (!m_digits)
        return m_evaluation.GetWord(*m_root.load(std::memory_order_acquire), numVariables);
    uint64_t word = 0;
    m_digits->Fill(numVariables, 0, 1, &word);
    return word;
}

unsigned int KqStore::EvalOther(const Variables& variables) const
{
    if (m_digits)
        return m_digits->Eval(variables);
    const Node* const root = m_root.load(std::memory_order_acquire);
    return root ? m_evaluation.Eval(*root, variables) : 0;
}
