// Sums of products for tables with too many rows that are 0 to be listed as cubes.
#include <random>

#include <gtest/gtest.h>

#include "expand.h"
#include "proof.h"
#include "sum.h"

namespace {

using namespace booleq;

// Disjoint terms of two inputs, each twice: 2^(numInputs / 2) cubes for the rows that are 0.
Pla DisjointTerms(size_t numInputs)
{
    std::string text = ".i " + std::to_string(numInputs) + "\n.o 1\n";
    for (size_t input = 0; input < numInputs; input += 2) {
        std::string row(numInputs, '-');
        row[input] = row[input + 1] = '1';
        text += row + " 1\n";
        row[(input + 2) % numInputs] = '0'; // and a redundant part of it
        text += row + " 1\n";
    }
    Pla table;
    PlaFault fault;
    EXPECT_TRUE(ReadPla(text, table, fault)) << fault.message;
    return table;
}

TEST(MinimiseWithoutOff, TermsOfManyInputsNeedNoOffSet)
{
    const Pla table = DisjointTerms(36); // 2^18 cubes, twice the number that is tried
    for (const Goal goal : {Goal::Terms, Goal::Literals}) {
        SumOptions options;
        options.goal = goal;
        Sum sum(table.space);
        PlaFault fault;
        Work work;
        ASSERT_TRUE(Minimise(table, options, sum, fault, work)) << fault.message;
        EXPECT_TRUE(IsSumOf(table, sum.cubes, false, work));
        EXPECT_EQ(sum.cost.numTerms, 18u);
        EXPECT_EQ(sum.cost.numLiterals, 36u);
        EXPECT_TRUE(sum.isProved);
        EXPECT_TRUE(sum.isSecondProved);
    }
}

TEST(MinimiseWithoutOff, SaysWhatItCannotDoWithoutOffSet)
{
    const Pla table = DisjointTerms(60);
    SumOptions inverted;
    inverted.isInverted = true;
    Sum sum(table.space);
    PlaFault fault;
    Work work;
    EXPECT_FALSE(Minimise(table, inverted, sum, fault, work));
    EXPECT_NE(fault.message.find("product of sums"), std::string::npos) << fault.message;
}

// Sums without the off-set are as good as with it: primes, irredundant, and the same function.
TEST(MinimiseWithoutOff, GrowsByTautologyToPrimesToo)
{
    for (unsigned int seed = 1; seed <= 50; ++seed) {
        std::mt19937 random(seed);
        std::string text = ".i 6\n.o 2\n";
        for (int row = 0; row < 20; ++row) {
            for (int digit = 0; digit < 6; ++digit)
                text += "01-"[random() % 3];
            text += std::string(" ") + "01-"[random() % 3] + "01-"[random() % 3] + "\n";
        }
        Pla table;
        PlaFault fault;
        Work work;
        ASSERT_TRUE(ReadPla(text, table, fault)) << fault.message;
        TwoLevelProblem problem(table.space);
        ASSERT_TRUE(ToProblem(table, problem, fault, work));
        TwoLevelProblem without = problem;
        without.off.Resize(0);
        without.hasOff = false;
        CubeList sum(table.space.NumWords());
        EXPECT_TRUE(FindSmallSum(without, work, sum));
        EXPECT_TRUE(IsSumOf(table, sum, false, work)) << text;
        Cover cover(table.space.NumWords());
        cover.cubes = table.on;
        cover.isPrime.assign(cover.cubes.Size(), 0);
        Expander byTautology(without, work);
        Expander byOffSet(problem, work);
        ExpandCover(table.space, byTautology, cover, work);
        for (size_t index = 0; index < cover.cubes.Size(); ++index) {
            const uint64_t* cube = cover.cubes.At(index);
            ASSERT_TRUE(byOffSet.IsImplicant(cube)) << text;
            for (size_t bit = 0; bit < 14; ++bit) {
                std::vector<uint64_t> larger(cube, cube + table.space.NumWords());
                SetBit(larger.data(), bit);
                ASSERT_TRUE(GetBit(cube, bit) || !byOffSet.IsImplicant(larger.data())) << text;
            }
        }
    }
}

} // namespace
