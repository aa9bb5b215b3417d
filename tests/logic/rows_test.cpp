// Packed rows: every operation against the same one row by row.
#include <algorithm>
#include <numeric>
#include <random>

#include <gtest/gtest.h>

#include "logic_support.h"
#include "rows.h"

namespace {

using namespace booleq;
using namespace logic_support;

constexpr unsigned int kMaxTestedInputs = 9; // one word, two and eight

Rows RandomRows(unsigned int numInputs, std::mt19937_64& random)
{
    return RandomFunction(Names(numInputs), random, random() % 2 == 0).GetRows();
}

size_t BitOf(unsigned int numInputs, unsigned int input)
{
    return size_t(1) << (numInputs - 1 - input);
}

// Calls 'check' with random rows of every width.
template <class Check>
void ForRandomRows(const Check& check)
{
    std::mt19937_64 random(7);
    for (unsigned int numInputs = 0; numInputs <= kMaxTestedInputs; ++numInputs)
        for (int repeat = 0; repeat < 20; ++repeat)
            check(RandomRows(numInputs, random), random);
}

void ExpectPadding(const Rows& rows)
{
    ASSERT_EQ(rows.Words()[rows.Size() - 1] & ~RowMask(rows.NumInputs()), 0u);
    ASSERT_EQ(rows.Size(), NumWords(rows.NumInputs()));
}

TEST(Rows, InputsAreDigitsOfTheRowNumber)
{
    for (unsigned int numInputs = 1; numInputs <= kMaxTestedInputs; ++numInputs) {
        for (unsigned int input = 0; input < numInputs; ++input) {
            const Rows rows = InputRows(numInputs, input);
            ExpectPadding(rows);
            for (size_t row = 0; row < rows.NumRows(); ++row)
                ASSERT_EQ(rows.At(row), (row & BitOf(numInputs, input)) != 0);
        }
    }
}

TEST(Rows, OperatorsGoRowByRow)
{
    ForRandomRows([](const Rows& left, std::mt19937_64& random) {
        const Rows right = RandomRows(left.NumInputs(), random);
        const Rows results[] = {left & right, left | right, left ^ right, AndNot(left, right),
                                ~left};
        for (const Rows& result : results)
            ExpectPadding(result);
        for (size_t row = 0; row < left.NumRows(); ++row) {
            const bool own = left.At(row);
            const bool other = right.At(row);
            const bool expected[] = {own && other, own || other, own != other, own && !other, !own};
            for (size_t index = 0; index < 5; ++index)
                ASSERT_EQ(results[index].At(row), expected[index]) << index;
        }
        ASSERT_EQ(~~left, left);
        ASSERT_TRUE(IsZero(left ^ left) && IsOne(left | ~left));
    });
}

TEST(Rows, CountsAndFirstDifference)
{
    ForRandomRows([](const Rows& left, std::mt19937_64& random) {
        const Rows right = RandomRows(left.NumInputs(), random);
        uint64_t numOnes = 0;
        uint64_t first = Rows::kNoRow;
        for (size_t row = left.NumRows(); row-- > 0;) {
            numOnes += left.At(row) ? 1 : 0;
            first = left.At(row) != right.At(row) ? row : first;
        }
        ASSERT_EQ(NumOnes(left), numOnes);
        ASSERT_EQ(FirstDifference(left, right), first);
        ASSERT_EQ(left == right, first == Rows::kNoRow);
        ASSERT_EQ(left < right || right < left, left != right);
    });
}

TEST(Rows, ACofactorFixesOneInput)
{
    ForRandomRows([](const Rows& rows, std::mt19937_64&) {
        std::vector<unsigned int> support;
        for (unsigned int input = 0; input < rows.NumInputs(); ++input) {
            const size_t bit = BitOf(rows.NumInputs(), input);
            bool isNeeded = false;
            for (const bool value : {false, true}) {
                const Rows fixed = Cofactor(rows, input, value);
                ExpectPadding(fixed);
                for (size_t row = 0; row < rows.NumRows(); ++row) {
                    ASSERT_EQ(fixed.At(row), rows.At(value ? row | bit : row & ~bit));
                    isNeeded = isNeeded || rows.At(row) != rows.At(row ^ bit);
                }
            }
            ASSERT_EQ(DependsOn(rows, input), isNeeded);
            if (isNeeded)
                support.push_back(input);
        }
        ASSERT_EQ(Support(rows), support);
    });
}

TEST(Rows, HalvesAndWidening)
{
    ForRandomRows([](const Rows& rows, std::mt19937_64&) {
        const Rows wide = Widen(rows);
        ExpectPadding(wide);
        for (size_t row = 0; row < wide.NumRows(); ++row)
            ASSERT_EQ(wide.At(row), rows.At(row % rows.NumRows()));
        ASSERT_EQ(Half(wide, false), rows);
        ASSERT_EQ(Half(wide, true), rows);
        const Rows joined = JoinHalves(rows, ~rows);
        ASSERT_EQ(Half(joined, false), rows);
        ASSERT_EQ(Half(joined, true), ~rows);
    });
}

TEST(Rows, InputsMoveAndAreInverted)
{
    ForRandomRows([](const Rows& rows, std::mt19937_64& random) {
        const unsigned int numInputs = rows.NumInputs();
        std::vector<unsigned int> order(numInputs);
        std::iota(order.begin(), order.end(), 0u);
        std::shuffle(order.begin(), order.end(), random);
        std::vector<unsigned int> opposite(numInputs);
        std::iota(opposite.rbegin(), opposite.rend(), 0u);
        ASSERT_EQ(ReverseInputs(rows), PermuteInputs(rows, opposite));
        const Rows permuted = PermuteInputs(rows, order);
        ExpectPadding(permuted);
        for (size_t row = 0; row < rows.NumRows(); ++row) {
            size_t from = 0;
            for (unsigned int place = 0; place < numInputs; ++place)
                from |= (row & BitOf(numInputs, place)) != 0 ? BitOf(numInputs, order[place]) : 0;
            ASSERT_EQ(permuted.At(row), rows.At(from));
        }
        for (unsigned int input = 0; input < numInputs; ++input) {
            const Rows inverted = InvertInput(rows, input);
            ExpectPadding(inverted);
            for (size_t row = 0; row < rows.NumRows(); ++row)
                ASSERT_EQ(inverted.At(row), rows.At(row ^ BitOf(numInputs, input)));
            const auto other = static_cast<unsigned int>(random() % numInputs);
            ASSERT_EQ(SwapInputs(SwapInputs(rows, input, other), other, input), rows);
        }
    });
}

TEST(Rows, RestrictionKeepsTheInputsThatMatter)
{
    ForRandomRows([](const Rows& rows, std::mt19937_64& random) {
        // Idle inputs can be added anywhere and removed again.
        Rows wide = rows;
        std::vector<unsigned int> order(rows.NumInputs());
        std::iota(order.begin(), order.end(), 3u);
        for (unsigned int idle = 0; idle < 3; ++idle) {
            wide = Widen(wide);
            order.insert(order.begin() + static_cast<long>(random() % (order.size() + 1)), idle);
        }
        wide = PermuteInputs(wide, order);
        std::vector<unsigned int> kept;
        for (unsigned int place = 0; place < order.size(); ++place)
            if (order[place] >= 3)
                kept.push_back(place);
        ASSERT_EQ(Restrict(wide, kept), rows);
    });
}

TEST(Rows, OfSixInputsAndFewerAreOneWord)
{
    EXPECT_EQ(Rows::OfWord(2, 0x8), Rows(2, {0x8}));
    EXPECT_EQ(Rows::OfWord(6, ~uint64_t(0)), ConstantRows(6, true));
    EXPECT_NE(Rows(1), Rows(2)); // they have different numbers of rows
    EXPECT_TRUE(IsOne(ConstantRows(9, true)) && IsZero(ConstantRows(9, false)));
}

} // namespace
