// The number of classes of functions of five inputs: counts the functions that are their own
// canonical form. If a class had two such functions, or none, the number would be different.
#include <algorithm>
#include <numeric>
#include <random>
#include <vector>

#include <gtest/gtest.h>

#include "canonical.h"

namespace {

using namespace booleq;

constexpr unsigned int kUpperInputs = 4;
constexpr size_t kNumUppers = 65536;
// Harrison, "The number of equivalence classes of Boolean functions under groups containing
// negation", 1963.
constexpr size_t kNumUpperClasses = 402; // for four inputs, up to order and inversions of inputs
constexpr size_t kNumClasses =
    616126; // for five inputs, up to order and inversions of inputs and output

// Functions of four inputs that no order or inversion of inputs makes less, found row by row.
std::vector<uint32_t> LeastUppers()
{
    std::vector<bool> isMade(kNumUppers);
    std::vector<uint32_t> least;
    for (uint32_t function = 0; function < kNumUppers; ++function) {
        if (isMade[function])
            continue;
        least.push_back(function);
        std::vector<unsigned int> order = {0, 1, 2, 3};
        do {
            for (uint32_t inverted = 0; inverted < 16; ++inverted) {
                uint32_t made = 0;
                for (uint32_t row = 0; row < 16; ++row) {
                    uint32_t source = 0;
                    for (unsigned int bit = 0; bit < kUpperInputs; ++bit)
                        source |= ((row ^ inverted) >> bit & 1u) << order[bit];
                    made |= (function >> source & 1u) << row;
                }
                isMade[made] = true;
            }
        } while (std::next_permutation(order.begin(), order.end()));
    }
    return least;
}

size_t CountFixed(const std::vector<uint64_t>& tables)
{
    std::vector<uint64_t> forms(tables.size());
    FindCanonicals(LutsOf(tables, 5), CanonicalScope::OrderAndInversions, forms.data(), nullptr);
    size_t count = 0;
    for (size_t place = 0; place < tables.size(); ++place) {
        EXPECT_LE(forms[place], tables[place]);
        count += forms[place] == tables[place] ? 1 : 0;
    }
    return count;
}

TEST(CanonicalOfFiveInputs, HasTheKnownNumberOfClasses)
{
    // The rows where input 0 is 1 are the upper half of the number. If that half can be made less,
    // the number is not a form.
    const std::vector<uint32_t> uppers = LeastUppers();
    ASSERT_EQ(uppers.size(), kNumUpperClasses);
    size_t numFixed = 0;
    std::vector<uint64_t> tables(kNumUppers);
    for (const uint32_t upper : uppers) {
        std::iota(tables.begin(), tables.end(), uint64_t(upper) << 16);
        numFixed += CountFixed(tables);
    }
    EXPECT_EQ(numFixed, kNumClasses);
}

TEST(CanonicalOfFiveInputs, IsNoneThatTheUpperHalfRulesOut)
{
    const std::vector<uint32_t> uppers = LeastUppers();
    std::mt19937 random(16);
    std::vector<uint64_t> tables;
    while (tables.size() < 5000000) {
        const auto table = static_cast<uint32_t>(random());
        if (!std::binary_search(uppers.begin(), uppers.end(), table >> 16))
            tables.push_back(table);
    }
    EXPECT_EQ(CountFixed(tables), 0u);
}

} // namespace
