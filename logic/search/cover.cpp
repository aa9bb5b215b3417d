#include "cover.h"

#include <algorithm>

#include "watch.h"

namespace booleq {

namespace {

// Columns while the recursion takes the first input off them: its halves are the cofactors.
typedef std::vector<uint64_t> Words;

uint64_t RowMask(unsigned int numInputs)
{
    return numInputs >= 6 ? ~uint64_t(0) : (uint64_t(1) << (1u << numInputs)) - 1;
}

Words Half(const Words& words, unsigned int numInputs, bool isUpper)
{
    if (numInputs > 6) {
        const auto middle = words.begin() + static_cast<std::ptrdiff_t>(words.size() / 2);
        return isUpper ? Words(middle, words.end()) : Words(words.begin(), middle);
    }
    const unsigned int rows = 1u << (numInputs - 1);
    return {isUpper ? words[0] >> rows : words[0] & RowMask(numInputs - 1)};
}

Words Joined(const Words& lower, const Words& upper, unsigned int numInputs)
{
    if (numInputs > 6) {
        Words words = lower;
        words.insert(words.end(), upper.begin(), upper.end());
        return words;
    }
    return {lower[0] | upper[0] << (1u << (numInputs - 1))};
}

Words AndNot(const Words& left, const Words& right)
{
    Words words(left);
    for (size_t word = 0; word < words.size(); ++word)
        words[word] &= ~right[word];
    return words;
}

Words Or(const Words& left, const Words& right)
{
    Words words(left);
    for (size_t word = 0; word < words.size(); ++word)
        words[word] |= right[word];
    return words;
}

Words And(const Words& left, const Words& right)
{
    Words words(left);
    for (size_t word = 0; word < words.size(); ++word)
        words[word] &= right[word];
    return words;
}

class CoverSearch {
  public:
    explicit CoverSearch(unsigned int numInputs) : m_num_inputs(numInputs) {}

    // Adds products over the last 'numLeft' inputs that cover 'needed' and nothing outside
    // 'allowed', each with what 'prefix' says of the inputs before. Gives back what they cover.
    // The depth is the number of inputs.
    Words Find(const Words& needed, const Words& allowed, unsigned int numLeft, Cube prefix)
    {
        Watch();
        const auto isZero = [](uint64_t word) { return word == 0; };
        if (std::all_of(needed.begin(), needed.end(), isZero))
            return Words(needed.size());
        const uint64_t ones = RowMask(numLeft);
        if (std::all_of(allowed.begin(), allowed.end(), [ones](uint64_t w) { return w == ones; })) {
            m_cubes.push_back(prefix);
            return allowed;
        }
        const uint32_t input = uint32_t(1) << (m_num_inputs - numLeft);
        const Words needed0 = Half(needed, numLeft, false);
        const Words needed1 = Half(needed, numLeft, true);
        const Words allowed0 = Half(allowed, numLeft, false);
        const Words allowed1 = Half(allowed, numLeft, true);
        const Words covered0 = Find(AndNot(needed0, allowed1), allowed0, numLeft - 1,
                                    {prefix.used | input, prefix.values});
        const Words covered1 = Find(AndNot(needed1, allowed0), allowed1, numLeft - 1,
                                    {prefix.used | input, prefix.values | input});
        const Words both = Find(Or(AndNot(needed0, covered0), AndNot(needed1, covered1)),
                                And(allowed0, allowed1), numLeft - 1, prefix);
        return Joined(Or(covered0, both), Or(covered1, both), numLeft);
    }

    std::vector<Cube> Take() { return std::move(m_cubes); }

  private:
    unsigned int m_num_inputs;
    std::vector<Cube> m_cubes;
};

} // namespace

std::vector<Cube> FindCover(const Bits& function)
{
    CoverSearch search(function.NumInputs());
    search.Find(function.Words(), function.Words(), function.NumInputs(), {0, 0});
    return search.Take();
}

size_t CountLiterals(const std::vector<Cube>& cubes)
{
    size_t count = 0;
    for (const Cube& cube : cubes)
        count += static_cast<size_t>(__builtin_popcount(cube.used));
    return count;
}

} // namespace booleq
