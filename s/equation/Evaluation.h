// What is kept of a tree for evaluation: the column of up to six variables as a word, or a program
// for more. It is derived from the nodes and their variable indices, and not used once they change.
#ifndef KQ_EVALUATION_H
#define KQ_EVALUATION_H

#include <atomic>
#include <cassert>
#include <cstdint>

#include "Program.h"

// Made when it pays: the word at once, a program at the second evaluation.
// Threads: Eval and GetWord at any time. What either of them makes is published once, complete; a
// thread that loses the race frees its own. Drop and SetWord need exclusive access.
class KqEvaluation {
  public:
    typedef Kq_BoolEquationImp::Node Node;
    typedef std::vector<std::pair<Port::StringBase<char>, unsigned int>> Variables;

    KqEvaluation() = default;
    ~KqEvaluation() { Drop(); }
    KqEvaluation(const KqEvaluation&) = delete;
    KqEvaluation& operator=(const KqEvaluation&) = delete;

    // Whether the column over this many variables is at hand.
    bool HasWord(size_t numVariables) const
    {
        return numVariables == m_num_word_variables.load(std::memory_order_acquire);
    }

    // The value for a table of values 0 or 1.  Requires: HasWord(variables.size()).
    unsigned int EvalWord(const Variables& variables) const
    {
        unsigned int row = 0;
        for (const auto& variable : variables)
            row = row << 1 | variable.second;
        return m_word.load(std::memory_order_relaxed) >> row & 1u;
    }

    // The value of the tree at 'root' for a table of values 0 or 1.
    // Fails: std::bad_alloc.  Cost: O(nodes); for up to six variables O(variables) except the first
    // time.
    unsigned int Eval(const Node& root, const Variables& variables);

    // The column of the tree at 'root' over up to six variables, repeated up to the word's end.
    uint64_t GetWord(const Node& root, unsigned int numVariables);

    // Takes a known column.  Requires: numVariables <= 6.
    void SetWord(uint64_t word, unsigned int numVariables)
    {
        assert(numVariables <= 6);
        m_word.store(word, std::memory_order_relaxed);
        m_num_word_variables.store(numVariables, std::memory_order_release);
    }

    // Forgets everything.
    void Drop() noexcept;
    // Keeps nothing from now on, because indices change that other objects may be reading: their
    // threads may still be using what was kept, so it is freed only at the end.
    void Abandon() noexcept;

  private:
    struct Kept; // a program and the number of variables it needs

    unsigned int EvalKeptWord(size_t numWordVariables, const Variables& variables) const;
    void PublishWord(uint64_t word, unsigned int numVariables);
    const Kept* GetKept(const Node& root);

    // States of m_num_word_variables besides 0 to 6.
    static constexpr size_t kNoWord = SIZE_MAX;
    static constexpr size_t kPublishing = SIZE_MAX - 1;
    static constexpr size_t kAbandoned = SIZE_MAX - 2;

    std::atomic<uint64_t> m_word{0};
    std::atomic<size_t> m_num_word_variables{kNoWord}; // what m_word is for
    std::atomic<const Kept*> m_kept{nullptr};          // owned
    std::atomic<bool> m_is_evaluated{false};           // at least once, for over six variables
};

#endif
