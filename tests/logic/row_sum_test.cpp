// Sums by rows: against the rows that were drawn, and against growth by cubes.
#include <random>

#include <gtest/gtest.h>

#include "proof.h"
#include "row_sum.h"
#include "sum.h"

namespace {

using namespace booleq;

// A row for each assignment; digits are 0, 1 and, for a quarter of them, '-'.
std::string RandomTable(size_t numInputs, size_t numOutputs, size_t percentOn,
                        std::mt19937_64& random)
{
    std::string text =
        ".i " + std::to_string(numInputs) + "\n.o " + std::to_string(numOutputs) + "\n";
    for (size_t row = 0; row >> numInputs == 0; ++row) {
        for (size_t input = 0; input < numInputs; ++input)
            text += (row >> input & 1) != 0 ? '1' : '0';
        text += ' ';
        for (size_t output = 0; output < numOutputs; ++output)
            text += random() % 4 == 0 ? '-' : random() % 100 < percentOn ? '1' : '0';
        text += '\n';
    }
    return text;
}

Pla Parsed(const std::string& text)
{
    Pla table;
    PlaFault fault;
    EXPECT_TRUE(ReadPla(text, table, fault)) << fault.message;
    return table;
}

// Whether a product can lose an output or a literal, or can be dropped.
bool IsLoose(const Pla& table, const RowTable& rows, const CubeList& sum, Work& work)
{
    for (size_t term = 0; term < sum.Size(); ++term) {
        std::vector<uint8_t> isKept(sum.Size(), 1);
        isKept[term] = 0;
        CubeList fewer = sum;
        fewer.Keep(isKept);
        if (IsSumOfRows(table.space, rows, fewer, work))
            return true;
        for (size_t bit = 0; bit < 2 * table.inputs.size(); ++bit) {
            CubeList larger = sum;
            if (GetBit(larger.At(term), bit))
                continue;
            SetBit(larger.At(term), bit);
            if (IsSumOfRows(table.space, rows, larger, work))
                return true;
        }
    }
    return false;
}

TEST(RowSum, IsRightIrredundantAndOfPrimes)
{
    std::mt19937_64 random(4711);
    for (unsigned round = 0; round < 120; ++round) {
        const size_t numInputs = 1 + random() % 8;
        const Pla table = Parsed(RandomTable(numInputs, 1 + static_cast<size_t>(random() % 5),
                                             static_cast<size_t>(random() % 101), random));
        ASSERT_TRUE(CanListRows(table));
        Work work;
        const bool isInverted = round % 2 != 0;
        const RowTable rows = ListRows(table, isInverted, work);
        const CubeList sum = FindSumOfRows(table.space, rows, work);
        EXPECT_TRUE(IsSumOfRows(table.space, rows, sum, work)) << "round " << round;
        EXPECT_TRUE(IsSumOf(table, sum, isInverted, work)) << "round " << round; // by cubes
        if (round < 40) {
            EXPECT_FALSE(IsLoose(table, rows, sum, work)) << "round " << round;
        }
    }
}

TEST(RowSum, NeedsLittleMoreThanGrowthByCubes)
{
    std::mt19937_64 random(12);
    size_t numByRows = 0;
    size_t numByCubes = 0;
    for (int round = 0; round < 8; ++round) {
        const Pla table = Parsed(RandomTable(8, 4, 50, random));
        Work work;
        Sum sum(table.space);
        PlaFault fault;
        ASSERT_TRUE(Minimise(table, SumOptions(), sum, fault, work));
        numByCubes += sum.cost.numTerms;
        numByRows += FindSumOfRows(table.space, ListRows(table, false, work), work).Size();
    }
    EXPECT_LE(numByRows * 100, numByCubes * 108);
}

TEST(RowSum, TellsRowsThatAreWrong)
{
    std::mt19937_64 random(8);
    const Pla table = Parsed(RandomTable(7, 3, 40, random));
    Work work;
    const RowTable rows = ListRows(table, false, work);
    const CubeList sum = FindSumOfRows(table.space, rows, work);
    CubeList fewer = sum;
    fewer.Resize(fewer.Size() - 1);
    EXPECT_FALSE(IsSumOfRows(table.space, rows, fewer, work));
    CubeList all = sum;
    for (size_t word = 0; word < table.space.NumWords(); ++word)
        all.At(0)[word] = table.space.All(word);
    EXPECT_FALSE(IsSumOfRows(table.space, rows, all, work));
}

TEST(RowSum, LongTablesAreSummedByRows)
{
    std::mt19937_64 random(17);
    const Pla table = Parsed(RandomTable(15, 3, 30, random)); // 32768 rows
    for (const bool isInverted : {false, true}) {
        SumOptions options;
        options.isInverted = isInverted;
        Sum sum(table.space);
        PlaFault fault;
        Work work;
        ASSERT_TRUE(Minimise(table, options, sum, fault, work)) << fault.message;
        EXPECT_TRUE(IsSumOf(table, sum.cubes, isInverted, work));
        EXPECT_EQ(sum.lowerBound, 1u);
        CubeList fewer = sum.cubes;
        fewer.Resize(fewer.Size() - 1);
        EXPECT_FALSE(IsSumOf(table, fewer, isInverted, work));
    }
}

TEST(RowSum, ContradictionsOfLongTablesHaveTheirLines)
{
    std::mt19937_64 random(3);
    std::string text = ".type fr\n" + RandomTable(15, 1, 50, random);
    text += "--------------- 1\n";
    Pla table = Parsed(text);
    Sum sum(table.space);
    PlaFault fault;
    Work work;
    EXPECT_FALSE(Minimise(table, SumOptions(), sum, fault, work));
    EXPECT_EQ(fault.line, 32772u);
    EXPECT_NE(fault.message.find("contradict"), std::string::npos) << fault.message;
}

TEST(RowSum, RowsAreListedOnlyWhereTheyAreFewForTheText)
{
    EXPECT_TRUE(CanListRows(Parsed(".i 16\n.o 1\n---------------- 1\n")));
    EXPECT_FALSE(CanListRows(Parsed(".i 17\n.o 1\n----------------- 1\n")));
    EXPECT_FALSE(CanListRows(Parsed(".i 2\n.o 65\n11 " + std::string(65, '1') + "\n")));
}

} // namespace
