#include "match.h"

#include <algorithm>
#include <cassert>
#include <utility>

#include "watch.h"

namespace booleq {

namespace {

// How many ones each block of 2^log rows of a word has, each count in the bits of its block.
// Requires: log <= 6.
uint64_t BlockCounts(uint64_t word, unsigned int log)
{
    for (unsigned int bit = 0; bit < log; ++bit)
        word = (word & ~BitPattern(bit)) + ((word >> (1u << bit)) & ~BitPattern(bit));
    return word;
}

// Whether every cofactor by the inputs up to 'place' has as many ones in both.
bool HasSameCounts(const Rows& left, const Rows& right, unsigned int place)
{
    const unsigned int log = left.NumInputs() - 1 - place; // of a cofactor's rows
    const size_t blockWords = log > 6 ? size_t(1) << (log - 6) : 1;
    for (size_t first = 0; first < left.Size(); first += blockWords) {
        if (blockWords == 1) {
            if (BlockCounts(left.Words()[first], log) != BlockCounts(right.Words()[first], log))
                return false;
            continue;
        }
        int balance = 0; // a cofactor has at most 2^15 rows
        for (size_t word = first; word < first + blockWords; ++word)
            balance += __builtin_popcountll(left.Words()[word]) -
                       __builtin_popcountll(right.Words()[word]);
        if (balance != 0)
            return false;
    }
    return true;
}

class MatchSearch {
  public:
    MatchSearch(const Rows& second, bool allowInversions)
        : m_second(second), m_num_inputs(second.NumInputs()), m_allow_inversions(allowInversions)
    {
        for (unsigned int input = 0; input < m_num_inputs; ++input)
            m_order.push_back(input);
        m_inverted.resize(m_num_inputs);
    }

    // 'first' has its inputs in the order of m_order; those before 'place' are settled.
    // The depth is the number of inputs.
    bool Find(const Rows& first, unsigned int place)
    {
        if (place == m_num_inputs)
            return first == m_second;
        std::vector<Rows> tried;
        for (unsigned int source = place; source < m_num_inputs; ++source) {
            Watch();
            for (const bool isInverted : {false, true}) {
                if (isInverted && !m_allow_inversions)
                    continue;
                Rows rows = SwapInputs(first, place, source);
                if (isInverted)
                    rows = InvertInput(std::move(rows), place);
                const bool isNew = std::find(tried.begin(), tried.end(), rows) == tried.end();
                if (!isNew || !HasSameCounts(rows, m_second, place))
                    continue;
                std::swap(m_order[place], m_order[source]);
                m_inverted[place] = isInverted;
                if (Find(rows, place + 1))
                    return true;
                std::swap(m_order[place], m_order[source]);
                tried.push_back(std::move(rows));
            }
        }
        return false;
    }

    const std::vector<unsigned int>& Order() const { return m_order; }
    const std::vector<bool>& Inverted() const { return m_inverted; }

  private:
    const Rows& m_second;
    unsigned int m_num_inputs;
    bool m_allow_inversions;
    std::vector<unsigned int> m_order;
    std::vector<bool> m_inverted;
};

} // namespace

Matching Match(const Function& first, const Function& second, bool allowInversions)
{
    assert(first.NumInputs() == second.NumInputs() && first.NumInputs() <= kMaxMatchInputs);
    Matching matching;
    for (const bool isInverted : {false, true}) {
        if (isInverted && !allowInversions)
            break;
        const Rows rows = isInverted ? ~first.GetRows() : first.GetRows();
        MatchSearch search(second.GetRows(), allowInversions);
        if (NumOnes(rows) != NumOnes(second.GetRows()) || !search.Find(rows, 0))
            continue;
        matching = {true, search.Order(), search.Inverted(), isInverted};
        assert(Apply(matching, first, second.Inputs()) == second);
        break;
    }
    return matching;
}

Function Apply(const Matching& matching, const Function& first,
               const std::vector<std::string>& inputs)
{
    const size_t numInputs = first.NumInputs();
    Rows rows(static_cast<unsigned int>(numInputs));
    for (size_t row = 0; row < first.NumRows(); ++row) {
        size_t from = 0;
        for (size_t place = 0; place < numInputs; ++place) {
            const bool value =
                ((row >> (numInputs - 1 - place) & 1u) != 0) != matching.inverted[place];
            from |= size_t(value ? 1 : 0) << (numInputs - 1 - matching.sources[place]);
        }
        rows.Set(row, first.At(from) != matching.isInverted);
    }
    return {inputs, std::move(rows)};
}

} // namespace booleq
