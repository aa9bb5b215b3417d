// Init values as people write them give the same rows as the library's own spelling.
#include "init_literal.h"

#include <gtest/gtest.h>

#include "listed_inputs.h"
#include "logic_support.h"
#include "refusal.h"

namespace {

using namespace booleq;
using namespace logic_support;

Function ReadOver(const std::string& text, const std::vector<std::string>& inputs)
{
    Reading reading;
    reading.hasInputs = true;
    reading.inputs = inputs;
    Kq_BoolEquation equation;
    Function function;
    EXPECT_TRUE(SetFromText(equation, text, reading)) << text;
    EXPECT_TRUE(FunctionOf(equation, function));
    return function;
}

TEST(InitLiteral, SizedValuesReadAsTheirRows)
{
    std::mt19937_64 random(30);
    for (size_t numInputs = 1; numInputs <= 9; ++numInputs)
        for (int round = 0; round < 20; ++round) {
            const Function function = RandomFunction(Names(numInputs), random);
            const std::string size = std::to_string(function.NumRows());
            std::string hex = function.Hex().substr(2);
            if (hex.size() > 1 && round % 2 == 1)
                hex.insert(hex.size() / 2, "_");
            EXPECT_EQ(ReadOver(size + "'h" + hex, function.Inputs()), function);
            EXPECT_EQ(
                ReadOver(" " + size + "'B" + function.Binary().substr(2) + "\t", function.Inputs()),
                function);
        }
}

TEST(InitLiteral, DigitsThatAreLeftOutAreZero)
{
    EXPECT_EQ(ReadOver("64'h1", Names(6)).GetRows(), Rows::OfWord(6, 1));
    EXPECT_EQ(ReadOver("8'b101", Names(3)).GetRows(), Rows::OfWord(3, 5));
}

TEST(InitLiteral, OneInputReadsWhatIsPrinted)
{
    for (const char* text : {"0b00", "0b01", "0b10", "0b11"}) {
        const Function function = ReadOver(text, {"A"});
        EXPECT_EQ(ReadOver(function.Hex(), {"A"}), function) << function.Hex();
        EXPECT_EQ(ReadOver("2'h" + function.Hex().substr(2), {"A"}), function);
    }
}

TEST(InitLiteral, AWrongOneIsRefusedWithItsPlace)
{
    Reading reading;
    reading.hasInputs = true;
    reading.inputs = {"A", "B", "C"};
    struct Row {
        const char* text;
        const char* code;
        size_t offset;
    };
    constexpr Row kRows[] = {
        {"16'hca", "init-width", 0}, {" 4'hca", "init-width", 1},
        {"8'h1ca", "init-width", 3}, {"8'hcx", "init-digit", 4},
        {"8'b2", "init-digit", 3},   {"8'd7", "init-digit", 2},
        {"8'h", "init-digit", 2},    {"99999999999999999999'h1", "init-width", 0}};
    for (const Row& row : kRows) {
        Kq_BoolEquation equation;
        EXPECT_FALSE(SetFromText(equation, row.text, reading)) << row.text;
        const RefusalReport report = ExplainRefusal(row.text, reading);
        EXPECT_STREQ(report.code, row.code) << row.text;
        EXPECT_EQ(report.offset, row.offset) << row.text;
    }
}

} // namespace
