// Packed rows: the one form in which functions, covers, matches and short forms hold a column.
// In: words and a number of inputs. Input 0 is the most significant bit of a row's number; row k is
// bit k % 64 of word k / 64.
// Fails: std::bad_alloc only; up to six inputs need no allocation.
// Cost: each operation takes time in step with the words, 2^inputs / 64, unless it says otherwise.
#ifndef BOOLEQ_COLUMN_ROWS_H
#define BOOLEQ_COLUMN_ROWS_H

#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

namespace booleq {

constexpr unsigned int kMaxRowInputs = 30; // the library has no column with more

// Number of words of a column.  Requires, here and below: at most kMaxRowInputs inputs.
constexpr size_t NumWords(unsigned int numInputs)
{
    return numInputs <= 6 ? 1 : size_t(1) << (numInputs - 6);
}

// The bits of every word that hold rows.
constexpr uint64_t RowMask(unsigned int numInputs)
{
    return numInputs >= 6 ? ~uint64_t(0) : (uint64_t(1) << (1u << numInputs)) - 1;
}

// The bits of a word whose position in the word has bit 'bit' set.  Requires: bit < 6.
constexpr uint64_t BitPattern(size_t bit)
{
    constexpr uint64_t kPatterns[6] = {0xaaaaaaaaaaaaaaaa, 0xcccccccccccccccc, 0xf0f0f0f0f0f0f0f0,
                                       0xff00ff00ff00ff00, 0xffff0000ffff0000, 0xffffffff00000000};
    return kPatterns[bit];
}

// The bits of 'movers' trade places with the bits 'distance' above them: the delta swap of H. S.
// Warren, Hacker's Delight, 2nd edition, section 7-1.
template <class Word>
constexpr Word DeltaSwapped(Word word, Word movers, unsigned int distance)
{
    const auto change = static_cast<Word>((word ^ (word >> distance)) & movers);
    return static_cast<Word>(word ^ change ^ (change << distance));
}

// Word 'word' of the column of input 'input'. It goes on beyond the last row.
constexpr uint64_t InputWord(unsigned int numInputs, unsigned int input, uint64_t word)
{
    const unsigned int bit = numInputs - 1 - input; // of the row number
    if (bit < 6)
        return BitPattern(bit);
    return (word >> (bit - 6) & 1u) != 0 ? ~uint64_t(0) : 0;
}

// Invariants:
// 1. As many words as NumWords says.
// 2. Bits beyond the last row are 0.
class Rows {
  public:
    static constexpr uint64_t kNoRow = UINT64_MAX;

    // The constant 0; without inputs it has one row.
    explicit Rows(unsigned int numInputs = 0);
    // Requires: the invariants.
    Rows(unsigned int numInputs, std::vector<uint64_t> words);
    // Up to six inputs.  Requires: the invariants.
    static Rows OfWord(unsigned int numInputs, uint64_t word);

    unsigned int NumInputs() const { return m_num_inputs; }
    size_t NumRows() const { return size_t(1) << m_num_inputs; } // at most 2^30
    size_t Size() const { return m_num_inputs <= 6 ? 1 : m_words.size(); }
    const uint64_t* Words() const { return m_num_inputs <= 6 ? &m_word : m_words.data(); }
    // The caller keeps invariant 2.
    uint64_t* Words() { return m_num_inputs <= 6 ? &m_word : m_words.data(); }
    // Requires: row < NumRows().
    bool At(uint64_t row) const
    {
        return (Words()[static_cast<size_t>(row / 64)] >> (row % 64) & 1u) != 0;
    }
    void Set(uint64_t row, bool value);

  private:
    unsigned int m_num_inputs;
    uint64_t m_word = 0;           // for up to six inputs
    std::vector<uint64_t> m_words; // for more
};

bool operator==(const Rows& left, const Rows& right);
inline bool operator!=(const Rows& left, const Rows& right)
{
    return !(left == right);
}
// Some order, for maps.
bool operator<(const Rows& left, const Rows& right);

// Requires: as many inputs in both.
Rows operator&(Rows left, const Rows& right);
Rows operator|(Rows left, const Rows& right);
Rows operator^(Rows left, const Rows& right);
Rows operator~(Rows rows);
// left & ~right
Rows AndNot(Rows left, const Rows& right);
// The first row that differs, kNoRow when none does.
uint64_t FirstDifference(const Rows& left, const Rows& right);

bool IsZero(const Rows& rows);
bool IsOne(const Rows& rows);
uint64_t NumOnes(const Rows& rows);

Rows ConstantRows(unsigned int numInputs, bool value);
// The column of one input.
Rows InputRows(unsigned int numInputs, unsigned int input);

// The function with one input fixed. It keeps all its inputs and does not depend on that one.
Rows Cofactor(Rows rows, unsigned int input, bool value);
// Whether any row changes its value when only this input changes.
bool DependsOn(const Rows& rows, unsigned int input);
// The inputs that matter, ascending.
std::vector<unsigned int> Support(const Rows& rows);

// The half in which input 0 is 'isUpper', over the other inputs.  Requires: an input.
Rows Half(const Rows& rows, bool isUpper);
// Both halves joined to a function of one more input.  Requires: as many inputs in both.
Rows JoinHalves(const Rows& lower, const Rows& upper);
// The function over one more input in front, which has no effect.
Rows Widen(const Rows& rows);

// Two inputs trade places; doing it twice changes nothing.
Rows SwapInputs(Rows rows, unsigned int first, unsigned int second);
// Inverts one input.
Rows InvertInput(Rows rows, unsigned int input);
// Input k of the result is input order[k] of 'rows'.
// Requires: order is a permutation of all inputs.  Cost: O(inputs * words).
Rows PermuteInputs(Rows rows, const std::vector<unsigned int>& order);
// Input k of the result is input numInputs - 1 - k: rows counted from the other end.
Rows ReverseInputs(Rows rows);
// The function over the inputs 'inputs' alone.  Requires: they are ascending and hold the support.
// Cost: O(inputs * words).
Rows Restrict(Rows rows, const std::vector<unsigned int>& inputs);

} // namespace booleq

#endif
