#include "match.h"

#include <algorithm>

#include "watch.h"

namespace booleq {

namespace {

typedef std::vector<uint8_t> Rows; // one value each

Rows RowsOf(const Function& function)
{
    Rows rows(function.NumRows());
    for (size_t row = 0; row < rows.size(); ++row)
        rows[row] = function.At(row) ? 1 : 0;
    return rows;
}

class MatchSearch {
  public:
    MatchSearch(const Rows& second, unsigned int numInputs, bool allowInversions)
        : m_second(second), m_num_inputs(numInputs), m_allow_inversions(allowInversions)
    {
        for (unsigned int input = 0; input < numInputs; ++input)
            m_order.push_back(input);
        m_inverted.resize(numInputs);
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
                Rows rows = Moved(first, place, source, isInverted);
                const bool isNew = std::find(tried.begin(), tried.end(), rows) == tried.end();
                if (!isNew || !HasSameCounts(rows, place))
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
    // The inputs at two places trade them; the one that is now at 'place' is inverted on demand.
    Rows Moved(const Rows& first, unsigned int place, unsigned int source, bool isInverted) const
    {
        const unsigned int placeBit = m_num_inputs - 1 - place;
        const unsigned int sourceBit = m_num_inputs - 1 - source;
        Rows rows(first.size());
        for (size_t row = 0; row < rows.size(); ++row) {
            const size_t value = (row >> placeBit & 1u) ^ (isInverted ? 1u : 0u);
            const size_t other = row >> sourceBit & 1u;
            size_t from = row & ~(size_t(1) << placeBit) & ~(size_t(1) << sourceBit);
            if (place == source)
                from |= value << placeBit;
            else
                from |= value << sourceBit | other << placeBit;
            rows[row] = first[from];
        }
        return rows;
    }

    // Every cofactor by the inputs up to 'place' has as many ones in both.
    bool HasSameCounts(const Rows& rows, unsigned int place) const
    {
        const auto length = static_cast<std::ptrdiff_t>(uint64_t(1) << (m_num_inputs - 1 - place));
        for (auto own = rows.begin(), other = m_second.begin(); own != rows.end();
             own += length, other += length)
            if (std::count(own, own + length, 1) != std::count(other, other + length, 1))
                return false;
        return true;
    }

    const Rows& m_second;
    unsigned int m_num_inputs;
    bool m_allow_inversions;
    std::vector<unsigned int> m_order;
    std::vector<bool> m_inverted;
};

} // namespace

Matching Match(const Function& first, const Function& second, bool allowInversions)
{
    const auto numInputs = static_cast<unsigned int>(first.NumInputs());
    const Rows target = RowsOf(second);
    Matching matching;
    for (const bool isInverted : {false, true}) {
        if (isInverted && !allowInversions)
            break;
        Rows rows = RowsOf(first);
        if (isInverted)
            for (uint8_t& value : rows)
                value ^= 1u;
        const auto count = [](const Rows& counted) {
            return std::count(counted.begin(), counted.end(), 1);
        };
        MatchSearch search(target, numInputs, allowInversions);
        if (count(rows) != count(target) || !search.Find(rows, 0))
            continue;
        matching = {true, search.Order(), search.Inverted(), isInverted};
        break;
    }
    return matching;
}

Function Apply(const Matching& matching, const Function& first,
               const std::vector<std::string>& inputs)
{
    std::vector<uint64_t> words(first.Words().size());
    const size_t numInputs = first.NumInputs();
    for (size_t row = 0; row < first.NumRows(); ++row) {
        size_t from = 0;
        for (size_t place = 0; place < numInputs; ++place) {
            const bool value =
                ((row >> (numInputs - 1 - place) & 1u) != 0) != matching.inverted[place];
            from |= size_t(value ? 1 : 0) << (numInputs - 1 - matching.sources[place]);
        }
        if (first.At(from) != matching.isInverted)
            words[row / 64] |= uint64_t(1) << (row % 64);
    }
    return Function(inputs, std::move(words));
}

} // namespace booleq
