// A tree and a table of values in, a value out, from what was kept of the tree or from its nodes.
// Fails: std::bad_alloc, with nothing kept that was not kept before.
#include "Evaluation.h"

#include <algorithm>
#include <cassert>
#include <memory>

#include "NodeEval.h"
#include "Word.h"

typedef Kq_BoolEquationImp::Node Node;

namespace {

constexpr size_t kMaxWordVariables = 6;

// The number of the row that the first variables' values make.
unsigned int RowOf(const KqEvaluation::Variables& variables, size_t numVariables)
{
    unsigned int row = 0;
    for (size_t index = 0; index < numVariables; ++index)
        row = row << 1 | variables[index].second;
    assert(row < 1u << numVariables); // values are 0 or 1
    return row;
}

} // namespace

struct KqEvaluation::Kept {
    KqProgram program;
    size_t numVariables;
};

unsigned int KqEvaluation::Eval(const Node& root, const Variables& variables)
{
    const size_t numWordVariables = m_num_word_variables.load(std::memory_order_acquire);
    if (numWordVariables <= kMaxWordVariables)
        return EvalKeptWord(numWordVariables, variables);
    if (variables.size() <= kMaxWordVariables) {
        const uint64_t word = GetWord(root, static_cast<unsigned int>(variables.size()));
        return word >> RowOf(variables, variables.size()) & 1u;
    }
    // Compiling costs several evaluations, and many equations are evaluated just once.
    if (!m_is_evaluated.load(std::memory_order_relaxed)) {
        m_is_evaluated.store(true, std::memory_order_relaxed);
        return KqEvalSilently(root, variables);
    }
    const Kept* const kept = GetKept(root);
    if (!kept || kept->numVariables > variables.size())
        return KqEvalSilently(root, variables);
    return KqRunProgram(kept->program, variables);
}

// Copies of an equation may have tables of different sizes. Variables after those of the word make
// no difference, and those that a table lacks count as 0.
unsigned int KqEvaluation::EvalKeptWord(size_t numWordVariables, const Variables& variables) const
{
    const size_t numKnown = std::min(numWordVariables, variables.size());
    const unsigned int row = RowOf(variables, numKnown) << (numWordVariables - numKnown);
    return m_word.load(std::memory_order_relaxed) >> row & 1u;
}

uint64_t KqEvaluation::GetWord(const Node& root, unsigned int numVariables)
{
    assert(numVariables <= kMaxWordVariables);
    if (HasWord(numVariables))
        return m_word.load(std::memory_order_relaxed);
    bool isComplete = false;
    const uint64_t word = KqComputeWord(&root, numVariables, isComplete);
    if (isComplete)
        PublishWord(word, numVariables);
    return word;
}

// Keeps the word of the first thread that comes.
void KqEvaluation::PublishWord(uint64_t word, unsigned int numVariables)
{
    assert(numVariables <= kMaxWordVariables);
    size_t state = kNoWord;
    if (!m_num_word_variables.compare_exchange_strong(state, kPublishing,
                                                      std::memory_order_relaxed))
        return;
    m_word.store(word, std::memory_order_relaxed);
    state = kPublishing; // unless it has been abandoned meanwhile
    m_num_word_variables.compare_exchange_strong(state, numVariables, std::memory_order_release);
}

// The program of the tree; null when nothing more may be kept.
const KqEvaluation::Kept* KqEvaluation::GetKept(const Node& root)
{
    if (m_num_word_variables.load(std::memory_order_acquire) == kAbandoned)
        return nullptr;
    const Kept* kept = m_kept.load(std::memory_order_acquire);
    if (kept)
        return kept;
    std::unique_ptr<Kept> made(new Kept{KqCompile(&root, kKqMaxVariables, false), 0});
    made->numVariables = KqCountVariables(made->program);
    if (m_kept.compare_exchange_strong(kept, made.get(), std::memory_order_acq_rel))
        kept = made.release();
    return kept;
}

void KqEvaluation::Drop() noexcept
{
    m_num_word_variables.store(kNoWord, std::memory_order_relaxed);
    m_is_evaluated.store(false, std::memory_order_relaxed);
    delete m_kept.exchange(nullptr, std::memory_order_relaxed);
}

void KqEvaluation::Abandon() noexcept
{
    m_num_word_variables.store(kAbandoned, std::memory_order_release);
}
