// Init values as pure text: what counts as one, and what it stands for.
// Knows names and digits only; no nodes, no engine object.
#ifndef KQ_DIGITS_H
#define KQ_DIGITS_H

#include <cassert>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include <port/Port_StringBase.h>

#include "Word.h"

// An init value as read: its text, the names it is read over, and the results of all rows, packed.
//
// Fewer ones than zeros, or only ones, make it a sum of products over the rows of result 1;
// otherwise it is a product of sums over the rows of result 0. Each of these rows is a term.
// Deliberate: a value with fewer digits than rows is not padded. Its missing high rows have no
// term, so they are 0 in a sum of products and 1 in a product of sums.
//
// Invariants:
// 1. Bit k of the results is that of the truth table's row k: the first name is the most
//    significant bit of k, whichever way the digits count.
// 2. There is at least one term.
class KqDigits {
  public:
    typedef Port::StringBase<char> String;
    typedef std::vector<std::pair<String, unsigned int>> Variables;

    static constexpr size_t kPrefixLength = 2;

    // Whether a text is to be read as an init value: at least three characters, the first a 0.
    static bool IsCandidate(const String& text)
    {
        return text.length() > kPrefixLength && text.c_str()[0] == '0';
    }

    // Reads 'text' over the names of 'inputs'. 'isFirstLowest' gives the first one the lowest bit
    // of a digit's row number instead of the highest. Null when the text is not an init value over
    // these names: an unknown prefix, a bad digit, or digits for another number of names.
    // Requires: IsCandidate(text).  Fails: std::bad_alloc.
    // Cost: O(text), with 'isFirstLowest' O(text * names).
    static std::unique_ptr<KqDigits> Read(const String& text, const Variables& inputs,
                                          bool isFirstLowest);

    // The position, in a text that Read refuses, of the first byte that is not a digit of its base,
    // or 1 when the byte there is not the x or b of a prefix; the text's length when there is none.
    // Requires: IsCandidate(text).
    static size_t FindBadDigit(const String& text);

    // As given.
    const String& GetText() const { return m_text; }
    const std::vector<String>& GetNames() const { return m_names; }
    size_t GetNumNames() const { return m_names.size(); }
    bool IsFirstLowest() const { return m_is_first_lowest; }
    bool IsSum() const { return m_is_sum; }

    // Whether the results are those of the expression as the tokenizer reads it: there is a name,
    // and the tokenizer reads each as one name too. Otherwise only the expression counts.
    bool IsExact() const;

    // The expression, its terms in the order of the digits, from the last to the first.
    std::string Expand() const;

    size_t GetNumTerms() const { return m_num_terms; }

    // The row that each term stands for, in the same order.
    template <class Visit>
    void VisitTerms(Visit visit) const
    {
        if (m_is_first_lowest) {
            for (uint64_t digit = 0; digit < m_num_digits; ++digit) {
                const uint64_t row = ReverseBits(digit);
                if ((GetTermRows(WordOf(row)) >> (row % 64) & 1u) != 0)
                    visit(row);
            }
            return;
        }
        for (uint64_t first = 0; first < m_num_digits; first += 64) {
            uint64_t rows = GetTermRows(WordOf(first));
            if (m_num_digits - first < 64)
                rows &= (uint64_t(1) << m_num_digits % 64) - 1;
            for (; rows != 0; rows &= rows - 1)
                visit(first + static_cast<uint64_t>(__builtin_ctzll(rows)));
        }
    }

    // Whether the terms stay the same when the names' bits are in the opposite order.
    bool HasSymmetricTerms() const;

    // How many of the first 'numNames' names have a "~" in the term of 'row'.
    // Requires: at least that many names.
    unsigned int CountNegations(uint64_t row, size_t numNames) const
    {
        assert(numNames <= m_names.size());
        const unsigned int numOnes = KqCountBits(row >> (m_names.size() - numNames));
        return m_is_sum ? static_cast<unsigned int>(numNames) - numOnes : numOnes;
    }

    // Whether the name has a "~" in the term of 'row'.
    bool IsNegated(uint64_t row, size_t nameIndex) const
    {
        return (row >> (m_names.size() - 1 - nameIndex) & 1u) != (m_is_sum ? 1u : 0u);
    }

    // The result for a table of values 0 or 1 whose first variables are the names.
    unsigned int Eval(const Variables& variables) const;

    // Writes words of the column over 'numVariables' variables, the first ones being the names;
    // with fewer than six variables, the one word repeats the column up to its end.
    // Requires: numVariables >= the number of names.
    void Fill(unsigned int numVariables, uint64_t firstWord, size_t numWords,
              uint64_t* words) const;

  private:
    KqDigits(const String& text, const Variables& inputs, bool isFirstLowest);

    bool ReadDigits(unsigned int bitsPerDigit);
    void ChooseForm();
    // The word that holds a row. All digits are in memory, so its index fits where row numbers do
    // not.
    static size_t WordOf(uint64_t row) { return static_cast<size_t>(row / 64); }
    uint64_t GetTermRows(size_t word) const { return m_is_sum ? m_words[word] : ~m_words[word]; }
    void AddMissingRows();
    void ReverseRows();
    void AppendTerm(uint64_t row, std::string& text) const;
    uint64_t ReverseBits(uint64_t row) const;

    String m_text;
    std::vector<String> m_names;
    std::vector<uint64_t> m_words; // with fewer than six names the rows repeat up to the end
    uint64_t m_num_digits = 0;     // counted in binary digits
    size_t m_num_terms = 0;
    bool m_is_first_lowest;
    bool m_is_sum = false;
};

#endif
