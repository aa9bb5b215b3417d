// The result column of what a store holds: of its tree, or of the digits it was read from.
#ifndef KQ_RESULTS_H
#define KQ_RESULTS_H

#include <optional>

#include "Column.h"
#include "Store.h"

class KqResults {
  public:
    // Requires: an equation; numVariables <= kKqMaxColumnVariables, and all variables of an object
    // that holds the store. That object is neither set nor cleared while this is in use.
    // Fails: std::bad_alloc.
    KqResults(const KqStore& store, unsigned int numVariables)
        : m_digits(store.GetDigits()), m_num_variables(numVariables)
    {
        if (!m_digits)
            m_column.emplace(store.GetRoot(), numVariables);
    }

    // 2^numVariables / 64, at least 1.
    size_t GetNumWords() const
    {
        return m_num_variables > 6 ? size_t(1) << (m_num_variables - 6) : 1;
    }

    // Words of a piece that is filled within some milliseconds; a power of two that divides
    // GetNumWords().
    size_t GetNumPieceWords() const
    {
        return m_digits ? GetNumWords() : m_column->GetNumPieceWords();
    }

    // As KqColumn::Fill.
    void Fill(uint64_t firstWord, size_t numWords, uint64_t* words)
    {
        if (m_digits)
            m_digits->Fill(m_num_variables, firstWord, numWords, words);
        else
            m_column->Fill(firstWord, numWords, words);
    }

  private:
    const KqDigits* m_digits;
    unsigned int m_num_variables;
    std::optional<KqColumn> m_column;
};

#endif
