// What an equation holds: a tree, or digits that owe one. Shared by all engine objects that are
// copies of each other.
#ifndef KQ_STORE_H
#define KQ_STORE_H

#include <atomic>
#include <cassert>
#include <memory>

#include "Digits.h"
#include "Evaluation.h"
#include "Tree.h"

// The tree of an equation that was read from an init value is owed at first: it is made for all
// holders at once when somebody asks for the root or the nodes. Those who ask for them cannot tell
// the difference; whatever the digits can answer is answered without them.
//
// Invariants:
// 1. m_count is the number of engine objects, and guards, that point here; the last one deletes it.
// 2. m_list lists every node of m_block once, and owns none.
// 3. m_root is null until the whole tree has passed its checks. After that nodes and list no longer
//    change, except for the nodes' values. From the end of SetEquation on, the list is in
//    pre-order.
// 4. m_evaluation is derived from the nodes and their variable indices, and not used once they
//    change.
// 5. The tree is owed while there are m_digits and no root; then there are no nodes. The names of
//    m_digits are the first variables of every holder. They never change while others hold them.
//
// Threads: const members at any time; they publish the owed tree and what evaluation keeps once,
// complete. Other members need exclusive access, except those that say otherwise: one process-wide
// lock guards the loose tokens and watchers that these change. Nothing is allocated or freed under
// it.
class KqStore {
  public:
    typedef Kq_BoolEquationImp::Node Node;
    typedef Port::StringBase<char> String;
    typedef KqEvaluation::Variables Variables;

    KqStore() = default;
    KqStore(const KqStore&) = delete;
    KqStore& operator=(const KqStore&) = delete;

    void Hold()
    {
        assert(m_count.load(std::memory_order_relaxed) > 0);
        m_count.fetch_add(1, std::memory_order_relaxed);
    }
    // Removes one holder.
    static void Release(KqStore* store) noexcept
    {
        assert(store->m_count.load(std::memory_order_relaxed) > 0);
        // Nobody can join the only holder, so it need not be counted down.
        if (!store->IsShared() || store->m_count.fetch_sub(1, std::memory_order_acq_rel) == 1)
            delete store;
    }
    bool IsShared() const { return m_count.load(std::memory_order_acquire) > 1; }

    bool HasEquation() const { return m_digits || m_root.load(std::memory_order_acquire); }
    // Whether there are neither nodes nor an owed tree.
    bool IsEmpty() const;

    // The root, null without one. Makes the tree when it is owed.
    // Fails: std::bad_alloc; the tree is still owed.
    const Node* GetRoot() const
    {
        Node* const root = m_root.load(std::memory_order_acquire);
        return root || !m_digits ? root : PayTree();
    }

    // A whole equation.  Requires: an empty store.
    void TakeTree(KqTree& tree) noexcept;
    void TakeDigits(std::unique_ptr<KqDigits> digits) noexcept;
    void Clear() noexcept;
    // A list whose capacity may serve the next tree.
    void LendList(std::vector<Node*>& list) noexcept { m_list.swap(list); }

    // Loose tokens, even of a shared store. Makes nodes of them, unless the store is not empty.
    void TakeTokens(const KqTokens& tokens);
    // Copies the nodes while they are loose; makes none when there are none, or when there is a
    // tree.
    void CopyTokens(KqTree& copy) const;
    // Links the nodes as the tree of such copies is linked, unless somebody else has done so.
    void TakeLinks(const KqTree& tree) noexcept;

    // The text of an equation that is an init value, null for any other.
    const String* GetInitValue() const;
    // Whether both have the same nodes.  Fails: std::bad_alloc.
    bool IsSame(const KqStore& other) const;

    // Writes a new variable's index into the ID nodes of its name, even in a shared store.
    void LinkVariable(const String& name, unsigned int variableIndex);
    // The variable's index, then the position of every node whose token is the name.
    std::vector<unsigned int> MakeHandle(const String& name, unsigned int variableIndex) const;

    // A node as the equation dump shows it: links as positions in the list.
    struct Place {
        static constexpr size_t kNowhere = SIZE_MAX;
        const Node* node;
        size_t parent;
        size_t left;
        size_t right;
    };
    // All nodes in the order of the list, and the root's position.  Fails: std::bad_alloc.
    std::vector<Place> ListPlaces(size_t& root) const;

    // The equation's value for a table of values 0 or 1; 0 without an equation.
    // Fails: std::bad_alloc.
    unsigned int Eval(const Variables& variables) const
    {
        if (m_evaluation.HasWord(variables.size()))
            return m_evaluation.EvalWord(variables);
        return EvalOther(variables);
    }
    // The column of up to six variables, repeated up to the word's end.
    // Requires: an equation.
    uint64_t GetWord(unsigned int numVariables) const;
    // The results as read, null for an equation that was not read from digits.
    const KqDigits* GetDigits() const { return m_digits.get(); }

    // A builder that works here while messages go out. There may be several: the receiver of one's
    // messages, or another thread, may build a copy.
    struct Watcher {
        const void* holder; // null once it has let the store go
        Watcher* next;
    };
    // Any thread may call these for a shared store.
    void AddWatcher(Watcher& watcher) noexcept;
    void RemoveWatcher(const Watcher& watcher) noexcept;
    bool HasHolder(const Watcher& watcher) const noexcept;
    // The holder lets the store go. A watcher of this holder is seen even without the lock: it was
    // added before, and it stays.
    void TellWatchers(const void* holder) noexcept
    {
        if (m_watchers.load(std::memory_order_relaxed))
            TellEachWatcher(holder);
    }

  private:
    const Node* PayTree() const;
    size_t CountNodes() const;
    void TellEachWatcher(const void* holder) noexcept;
    unsigned int EvalOther(const Variables& variables) const;

    // The first three fields are what an equation consists of, in this order.
    mutable std::atomic<Node*> m_root{nullptr};
    mutable std::vector<Node*> m_list;
    std::atomic<unsigned int> m_count{1};
    mutable KqNodeBlock m_block;
    mutable KqEvaluation m_evaluation;
    std::unique_ptr<const KqDigits> m_digits;
    std::atomic<Watcher*> m_watchers{nullptr}; // none is owned
};

// One more holder, during a call that may set, clear or destroy all the others.
class KqStoreHold {
  public:
    explicit KqStoreHold(KqStore& store) : m_store(store) { m_store.Hold(); }
    ~KqStoreHold() { KqStore::Release(&m_store); }
    KqStoreHold(const KqStoreHold&) = delete;
    KqStoreHold& operator=(const KqStoreHold&) = delete;

  private:
    KqStore& m_store;
};

#endif
