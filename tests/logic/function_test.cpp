// Functions as columns: against the library, input order by input order, and init texts as the
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

// The value for an assignment that is given by the row over 'inputs'.
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
            std::vector<std::string> inputs = Names(numInputs + random() % 3);
            std::shuffle(inputs.begin(), inputs.end(), random);
            const Function other = function.Over(inputs);
            ASSERT_EQ(inputs, other.Inputs());
            for (uint64_t row = 0; row < other.NumRows(); ++row)
                ASSERT_EQ(ValueFor(function, inputs, row), other.At(row)) << numInputs;
            ASSERT_EQ(other, other.Reversed().Reversed());
        }
    }
}

TEST(Function, DependsOnAnInputThatChangesSomeRow)
{
    std::mt19937_64 random(2);
    for (size_t numInputs = 1; numInputs <= 8; ++numInputs) {
        const Function function = RandomFunction(Names(numInputs), random);
        const Function wide = function.Over(Names(numInputs + 1));
        EXPECT_FALSE(wide.DependsOn(numInputs));
        for (size_t index = 0; index < numInputs; ++index) {
            bool depends = false;
            const uint64_t step = uint64_t(1) << (numInputs - 1 - index);
            for (uint64_t row = 0; row < function.NumRows(); ++row)
                depends = depends || function.At(row) != function.At(row ^ step);
            EXPECT_EQ(depends, function.DependsOn(index));
            EXPECT_EQ(depends, wide.DependsOn(index));
        }
    }
}

TEST(Function, FirstDifferenceIsTheLowestRow)
{
    std::mt19937_64 random(3);
    const Function function = RandomFunction(Names(9), random);
    EXPECT_EQ(Function::kNoRow, function.FirstDifference(function));
    for (const uint64_t row : {0u, 63u, 64u, 300u, 511u}) {
        std::vector<uint64_t> words = function.Words();
        words[row / 64] ^= uint64_t(1) << (row % 64);
        words.back() ^= uint64_t(1) << 63;
        const Function other(function.Inputs(), words);
        EXPECT_EQ(row == 511 ? Function::kNoRow : row, function.FirstDifference(other));
    }
}

// Every binary text and, with one digit more or less, every hexadecimal one of a few inputs.
TEST(Function, InitTextsReadAsTheLibraryReadsThem)
{
    std::mt19937_64 random(4);
    size_t numAccepted = 0;
    for (int repeat = 0; repeat < 4000; ++repeat) {
        const bool isHex = random() % 2 == 0;
        std::string text = isHex ? "0x" : "0b";
        const size_t numDigits = 1 + random() % (isHex ? 10 : 36);
        const uint64_t few = random() % 3; // some are all zeros or all ones, or nearly
        for (size_t digit = 0; digit < numDigits; ++digit) {
            const uint64_t value = random() % 8 == 0 || few == 2 ? random() : few == 0 ? 0 : 15;
            text += "0123456789abcdef"[value % (isHex ? 16 : 2)];
        }
        if (random() % 16 == 0)
            text[2 + random() % numDigits] = 'g';
        Reading reading;
        reading.hasInputs = true;
        reading.inputs = Names(random() % 6);
        reading.lsbFirst = random() % 2 == 0;
        if (reading.inputs.empty())
            continue; // the library makes an empty group of "0b0" and "0b1"
        Kq_BoolEquation equation;
        const bool isAccepted = SetFromText(equation, text, reading);
        Function function;
        const InitText init = FunctionFromInit(text, reading.inputs, reading.lsbFirst, function);
        ASSERT_EQ(isAccepted, init.fault == InitFault::kNone) << text;
        if (!isAccepted)
            continue;
        ++numAccepted;
        Function expected;
        ASSERT_TRUE(FunctionOf(equation, expected));
        ASSERT_EQ(expected, function) << text << (reading.lsbFirst ? " lsb first" : "");
    }
    EXPECT_GT(numAccepted, 300u);
}

TEST(Function, FaultsOfInitTexts)
{
    EXPECT_EQ(InitFault::kPrefix, ReadInitText("0y1", 1).fault);
    EXPECT_EQ(InitFault::kPrefix, ReadInitText("A", 1).fault);
    EXPECT_EQ(InitFault::kPrefix, ReadInitText("0x", 1).fault);
    EXPECT_EQ(InitFault::kDigit, ReadInitText("0x1g", 3).fault);
    EXPECT_EQ(3u, ReadInitText("0x1g", 3).faultPosition);
    EXPECT_EQ(InitFault::kDigit, ReadInitText("0b12", 1).fault);
    EXPECT_EQ(InitFault::kWidth, ReadInitText("0x8", 3).fault);
    EXPECT_EQ(2u, ReadInitText("0x8", 3).numInputs);
}

TEST(Function, TwentyFourInputsFromDigitsAndBack)
{
    std::string text = "0x";
    std::mt19937_64 random(5);
    for (int digit = 0; digit < 1 << 22; ++digit)
        text += "0123456789abcdef"[random() % 16];
    Function function;
    ASSERT_EQ(InitFault::kNone, FunctionFromInit(text, Names(24), false, function).fault);
    EXPECT_EQ(text, function.Hex());
    EXPECT_EQ(function, function.Reversed().Reversed());
}

} // namespace
