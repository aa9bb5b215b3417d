// Functions as columns: against the library, for each order of inputs; and init texts as the
// library reads them.
#include <algorithm>
#include <random>

#include <gtest/gtest.h>

#include "function.h"
#include "listed_inputs.h"
#include "logic_support.h"
#include "text.h"

namespace {

using namespace booleq;
using namespace logic_support;

// The value for the assignment given as a row over 'inputs'.
bool ValueFor(const Function& function, const std::vector<std::string>& inputs, uint64_t row)
{
    uint64_t own = 0;
    for (const std::string& name : function.Inputs()) {
        const auto place = std::find(inputs.begin(), inputs.end(), name) - inputs.begin();
        own = 2 * own + (row >> (inputs.size() - 1 - static_cast<size_t>(place)) & 1u);
    }
    return function.At(own);
}

TEST(Function, ColumnAndDigitsAreTheLibrarys)
{
    for (const char* text : {"A & ~B", "A", "~A", "A ^ B | C & D ~| E", "(A|B)&(C^D)~^(E&F&G)|H"}) {
        Kq_BoolEquation equation;
        ASSERT_TRUE(equation.SetEquation(text));
        Function function;
        ASSERT_TRUE(FunctionOf(equation, function));
        EXPECT_EQ(ToStd(equation.GetEquationAsHexInitValue(false)), function.Hex()) << text;
        EXPECT_EQ(ToStd(equation.GetEquationAsBinaryInitValue()), function.Binary()) << text;
    }
}

TEST(Function, ConstantsHaveOneRow)
{
    Kq_BoolEquation equation;
    ASSERT_TRUE(equation.SetEquation("~0"));
    Function function;
    ASSERT_TRUE(FunctionOf(equation, function));
    EXPECT_EQ(0u, function.NumInputs());
    EXPECT_EQ("0b1", function.Binary());
    EXPECT_EQ("0b1111", function.Over({"A", "B"}).Binary());
}

TEST(Function, AnotherOrderOfInputsIsTheSameFunctionRowByRow)
{
    std::mt19937_64 random(1);
    for (size_t numInputs = 0; numInputs <= 9; ++numInputs) {
        for (int repeat = 0; repeat < 30; ++repeat) {
            const Function function = RandomFunction(Names(numInputs), random);
            std::vector<std::string> inputs = Names(numInputs + static_cast<size_t>(random() % 3));
            std::shuffle(inputs.begin(), inputs.end(), random);
            const Function other = function.Over(inputs);
            ASSERT_EQ(inputs, other.Inputs());
            for (uint64_t row = 0; row < other.NumRows(); ++row)
                ASSERT_EQ(ValueFor(function, inputs, row), other.At(row)) << numInputs;
            ASSERT_EQ(other.GetRows(), ReverseInputs(ReverseInputs(other.GetRows())));
        }
    }
}

TEST(Function, DependsOnAnInputThatChangesSomeRow)
{
    std::mt19937_64 random(2);
    for (unsigned int numInputs = 1; numInputs <= 8; ++numInputs) {
        const Function function = RandomFunction(Names(numInputs), random);
        const Function wide = function.Over(Names(numInputs + 1));
        EXPECT_FALSE(DependsOn(wide.GetRows(), numInputs));
        for (unsigned int index = 0; index < numInputs; ++index) {
            bool depends = false;
            const uint64_t step = uint64_t(1) << (numInputs - 1 - index);
            for (uint64_t row = 0; row < function.NumRows(); ++row)
                depends = depends || function.At(row) != function.At(row ^ step);
            EXPECT_EQ(depends, DependsOn(function.GetRows(), index));
            EXPECT_EQ(depends, DependsOn(wide.GetRows(), index));
        }
    }
}

TEST(Function, FirstDifferenceIsTheLowestRow)
{
    std::mt19937_64 random(3);
    const Function function = RandomFunction(Names(9), random);
    EXPECT_EQ(Function::kNoRow, function.FirstDifference(function));
    for (const uint64_t row : {0u, 63u, 64u, 300u, 511u}) {
        Rows rows = function.GetRows();
        rows.Set(row, !rows.At(row));
        rows.Set(511, !rows.At(511));
        const Function other(function.Inputs(), rows);
        EXPECT_EQ(row == 511 ? Function::kNoRow : row, function.FirstDifference(other));
    }
}

TEST(Function, WidthOfAnInitValueIsWhatTheLibraryTakes)
{
    for (size_t numDigits = 1; numDigits <= 40; ++numDigits) {
        for (const bool isHex : {true, false}) {
            const std::string text = (isHex ? "0X" : "0b") + std::string(numDigits, '1');
            const InitWidth width = WidthOfInit(text);
            EXPECT_EQ(isHex, width.isHex);
            EXPECT_EQ(numDigits * (isHex ? 4 : 1), width.numRows);
            for (size_t numInputs = 0; numInputs <= 9; ++numInputs) {
                Reading reading;
                reading.hasInputs = true;
                reading.inputs = Names(numInputs);
                Kq_BoolEquation equation;
                EXPECT_EQ(numInputs == width.numInputs, SetVerbatim(equation, text, reading))
                    << text << " over " << numInputs;
            }
        }
    }
}

TEST(Function, OtherTextsAreNoInitValuesByTheirBeginning)
{
    for (const char* text : {"", "0", "0x", "0b", "0y1", "A", "x10", " 0x1"})
        EXPECT_EQ(0u, WidthOfInit(text).numRows) << text;
}

TEST(Function, TwentyFourInputsFromDigitsAndBack)
{
    std::string text = "0x";
    std::mt19937_64 random(5);
    for (int digit = 0; digit < 1 << 22; ++digit)
        text += "0123456789abcdef"[random() % 16];
    const Function function = FromInit(text, Names(24));
    EXPECT_EQ(text, function.Hex());
    EXPECT_EQ(function.GetRows(), ReverseInputs(ReverseInputs(function.GetRows())));
}

} // namespace
