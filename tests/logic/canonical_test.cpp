// Canonical forms: against all orders and inversions tried row by row, by the number of classes,
// and on functions whose inputs are hard to distinguish.
#include <algorithm>
#include <numeric>
#include <random>
#include <set>

#include <gtest/gtest.h>

#include "canonical.h"
#include "lut_kernels.h"
#include "rows.h"

namespace {

using namespace booleq;

// The model: a function is its rows as a vector, and transformations are applied by definition.
typedef std::vector<bool> Values;

Values ValuesOf(uint64_t table, unsigned int numInputs)
{
    Values values;
    for (unsigned int row = 0; row < 1u << numInputs; ++row)
        values.push_back((table >> row & 1u) != 0);
    return values;
}

uint64_t TableOf(const Values& values)
{
    uint64_t table = 0;
    for (size_t row = 0; row < values.size(); ++row)
        table |= uint64_t(values[row] ? 1 : 0) << row;
    return table;
}

Values Transformed(const LutTransformation& how, const Values& values, unsigned int numInputs)
{
    Values result(values.size());
    for (unsigned int row = 0; row < values.size(); ++row) {
        unsigned int source = 0;
        for (unsigned int input = 0; input < numInputs; ++input) {
            const bool x = (row >> (numInputs - 1 - input) & 1u) != 0;
            const bool y = x != ((how.invertedInputs >> input & 1u) != 0);
            source |= (y ? 1u : 0u) << (numInputs - 1 - how.order[input]);
        }
        result[row] = values[source] != (how.invertsOutput != 0);
    }
    return result;
}

std::vector<LutTransformation> AllTransformations(unsigned int numInputs, CanonicalScope scope)
{
    const bool isOrder = scope == CanonicalScope::Order;
    std::vector<LutTransformation> all;
    LutTransformation how;
    do {
        for (unsigned int inverted = 0; inverted < (isOrder ? 1u : 1u << numInputs); ++inverted) {
            for (unsigned int output = 0; output < (isOrder ? 1u : 2u); ++output) {
                how.invertedInputs = static_cast<uint8_t>(inverted);
                how.invertsOutput = static_cast<uint8_t>(output);
                all.push_back(how);
            }
        }
    } while (std::next_permutation(how.order, how.order + numInputs));
    return all;
}

uint64_t LeastByTrying(uint64_t table, unsigned int numInputs, CanonicalScope scope)
{
    uint64_t least = UINT64_MAX;
    for (const LutTransformation& how : AllTransformations(numInputs, scope))
        least = std::min(least, TableOf(Transformed(how, ValuesOf(table, numInputs), numInputs)));
    return least;
}

LutTransformation RandomTransformation(unsigned int numInputs, CanonicalScope scope,
                                       std::mt19937_64& random)
{
    LutTransformation how;
    std::shuffle(how.order, how.order + numInputs, random);
    if (scope == CanonicalScope::Order)
        return how;
    how.invertedInputs = static_cast<uint8_t>(random() & AllLutInputs(numInputs));
    how.invertsOutput = static_cast<uint8_t>(random() & 1u);
    return how;
}

void ExpectCanonical(uint64_t table, unsigned int numInputs, CanonicalScope scope)
{
    const CanonicalLut found = FindCanonical(table, numInputs, scope);
    ASSERT_EQ(TableOf(Transformed(found.transformation, ValuesOf(table, numInputs), numInputs)),
              found.form)
        << std::hex << table;
    ASSERT_EQ(FindCanonical(found.form, numInputs, scope).form, found.form) << std::hex << table;
}

constexpr CanonicalScope kScopes[] = {CanonicalScope::Order, CanonicalScope::OrderAndInversions};

TEST(Canonical, IsTheLeastOfAllTransformationsUpToFourInputs)
{
    std::mt19937_64 random(11);
    for (const CanonicalScope scope : kScopes) {
        for (unsigned int numInputs = 0; numInputs <= 4; ++numInputs) {
            const uint64_t numFunctions = uint64_t(1) << (1u << numInputs);
            for (uint64_t table = 0; table < numFunctions; ++table) {
                ExpectCanonical(table, numInputs, scope);
                if (numInputs == 4 && random() % 256 != 0)
                    continue;
                ASSERT_EQ(FindCanonical(table, numInputs, scope).form,
                          LeastByTrying(table, numInputs, scope));
            }
        }
    }
}

TEST(Canonical, HasTheKnownNumbersOfClasses)
{
    // Harrison, "The number of equivalence classes of Boolean functions under groups containing
    // negation", 1963.
    const size_t kUpToOrder[] = {2, 4, 12, 80, 3984};
    const size_t kUpToInversions[] = {1, 2, 4, 14, 222};
    for (unsigned int numInputs = 0; numInputs <= 4; ++numInputs) {
        std::set<uint64_t> upToOrder;
        std::set<uint64_t> upToInversions;
        for (uint64_t table = 0; table < uint64_t(1) << (1u << numInputs); ++table) {
            upToOrder.insert(FindCanonical(table, numInputs, CanonicalScope::Order).form);
            upToInversions.insert(
                FindCanonical(table, numInputs, CanonicalScope::OrderAndInversions).form);
        }
        EXPECT_EQ(upToOrder.size(), kUpToOrder[numInputs]);
        EXPECT_EQ(upToInversions.size(), kUpToInversions[numInputs]);
    }
}

TEST(Canonical, IsTheLeastOfAllTransformationsOfFiveAndSixInputs)
{
    std::mt19937_64 random(12);
    for (const CanonicalScope scope : kScopes) {
        for (unsigned int numInputs = 5; numInputs <= 6; ++numInputs) {
            for (int repeat = 0; repeat < (numInputs == 5 ? 20 : 3); ++repeat) {
                const uint64_t table =
                    (repeat % 2 == 0 ? random() : random() & random() & random()) &
                    RowMask(numInputs);
                ASSERT_EQ(FindCanonical(table, numInputs, scope).form,
                          LeastByTrying(table, numInputs, scope))
                    << std::hex << table;
            }
        }
    }
}

// Functions whose inputs are hard to distinguish: linear, bent and symmetric ones, and sparse ones
// with many upper blocks of zeros.
TEST(Canonical, IsTheLeastWhereInputsAreAlike)
{
    const uint64_t tables[] = {0,
                               UINT64_MAX,
                               0x6996966996696996,
                               0x8777788878887888,
                               0xfee8e880e8808000,
                               0x8000000000000001,
                               0x40d0850204000020,
                               0x0000080000012100,
                               0xffff0000ffff0000};
    std::mt19937_64 random(14);
    for (const uint64_t table : tables) {
        const CanonicalLut found = FindCanonical(table, 6, CanonicalScope::OrderAndInversions);
        ASSERT_EQ(found.form, LeastByTrying(table, 6, CanonicalScope::OrderAndInversions));
        for (int repeat = 0; repeat < 200; ++repeat) {
            const uint64_t other = Transform(
                RandomTransformation(6, CanonicalScope::OrderAndInversions, random), table, 6);
            ASSERT_EQ(FindCanonical(other, 6, CanonicalScope::OrderAndInversions).form, found.form);
        }
    }
}

// Arrays of every word and width give what single tables give, however threads share the work.
TEST(Canonical, OfAnArrayIsThatOfEachTable)
{
    std::mt19937_64 random(15);
    for (const CanonicalScope scope : kScopes) {
        for (unsigned int numInputs = 0; numInputs <= kMaxCanonicalInputs; ++numInputs) {
            std::vector<uint64_t> words(3000);
            for (uint64_t& word : words)
                word = random() & RowMask(numInputs);
            const LutArray luts = LutsOf(words, numInputs);
            std::vector<uint64_t> forms(words.size());
            std::vector<LutTransformation> transformations(words.size());
            FindCanonicals(luts, scope, forms.data(), transformations.data(), LutWork{3});
            for (size_t place = 0; place < words.size(); ++place) {
                ASSERT_EQ(Transform(transformations[place], words[place], numInputs), forms[place]);
                ASSERT_EQ(FindCanonical(words[place], numInputs, scope).form, forms[place]);
            }
            if (numInputs > 4)
                continue;
            std::vector<uint16_t> narrow(words.begin(), words.end());
            FindCanonicals({narrow.data(), narrow.size(), numInputs, 2}, scope, narrow.data(),
                           nullptr);
            ASSERT_TRUE(std::equal(narrow.begin(), narrow.end(), forms.begin()));
        }
    }
}

TEST(Canonical, IsOneForAllTransformationsOfAFunction)
{
    std::mt19937_64 random(13);
    for (const CanonicalScope scope : kScopes) {
        for (unsigned int numInputs = 5; numInputs <= 6; ++numInputs) {
            for (int repeat = 0; repeat < 5000; ++repeat) {
                uint64_t table = random();
                for (int sparser = 0; sparser < repeat % 5; ++sparser)
                    table &= random();
                table &= RowMask(numInputs);
                const LutTransformation how = RandomTransformation(numInputs, scope, random);
                const uint64_t other = Transform(how, table, numInputs);
                ASSERT_EQ(other, TableOf(Transformed(how, ValuesOf(table, numInputs), numInputs)));
                ASSERT_EQ(TransformBack(how, other, numInputs), table);
                ExpectCanonical(table, numInputs, scope);
                ASSERT_EQ(FindCanonical(table, numInputs, scope).form,
                          FindCanonical(other, numInputs, scope).form)
                    << std::hex << table;
            }
        }
    }
}

} // namespace
