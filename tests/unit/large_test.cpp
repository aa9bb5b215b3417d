// Extreme texts: deep, long and wide ones are set, evaluated, rendered, compared, copied and freed
// on an ordinary stack.
#include <string_view>

#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

constexpr size_t kMillion = 1000000;

// 'piece' repeated, in time linear in the result's length.
std::string Repeat(const std::string& piece, size_t count)
{
    std::string text;
    text.reserve(piece.size() * count);
    for (; count > 0; --count)
        text += piece;
    return text;
}

// Sets 'text', asks everything that works on a large equation, and compares with known answers.
void ExpectLarge(const std::string& text, unsigned int value, const std::string& rendered)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation(text.c_str()));
    EXPECT_TRUE(rendered == Std(engine.GetEquation(false)));
    EXPECT_EQ(value, engine.Eval());
    Engine copy(engine);
    EXPECT_TRUE(copy == engine);
    Engine again;
    ASSERT_TRUE(again.SetEquation(rendered.c_str()));
    EXPECT_TRUE(again == engine);
    copy.Clear();
    EXPECT_TRUE(copy != engine);
    engine = copy;
    EXPECT_TRUE(!engine);
}

TEST(Large, MillionNestedParentheses)
{
    const std::string text = Repeat("(", kMillion) + "1" + Repeat(")", kMillion);
    ExpectLarge(text, 1, text);
}

TEST(Large, MillionNots)
{
    const std::string text = Repeat("~", kMillion) + "A";
    ExpectLarge(text, 0, text);
    ExpectLarge(text + "&1", 0, text + "&1");
}

TEST(Large, ChainOfAMillionOperands)
{
    const std::string text = "A" + Repeat("|A", kMillion);
    ExpectLarge(text, 0, text);
}

TEST(Large, RightNestedGroups)
{
    const std::string text = Repeat("1^(", kMillion) + "A" + Repeat(")", kMillion);
    ExpectLarge(text, 0, text);
}

TEST(Large, TenMegabyteNames)
{
    const std::string plain(10 * kMillion, 'n');
    const std::string quoted = "'" + std::string(10 * kMillion, '*') + "'";
    ExpectLarge(plain + "|~" + quoted, 1, plain + "|~" + quoted);
}

TEST(Large, NegatedOperatorsInEveryPosition)
{
    Engine engine;
    // Each is ~(0 | next), which inverts.
    ASSERT_TRUE(
        engine.SetEquation((Repeat("(0 ~ | ", 200000) + "1" + Repeat(")", 200000)).c_str()));
    EXPECT_EQ(1u, engine.Eval());
    ASSERT_TRUE(
        engine.SetEquation(("P & " + Repeat("(~ & ", 200000) + "0" + Repeat(")", 200000)).c_str()));
    EXPECT_EQ(0u, engine.Eval());
    ASSERT_TRUE(engine.SetEquation(("A" + Repeat(" ~ ~ ~ & 1 | 0", 200000)).c_str()));
    EXPECT_EQ(1u, engine.GetNumVariables());
}

TEST(Large, RefusedTextsEnd)
{
    const Messages messages;
    for (const std::string& text :
         {Repeat("A ", kMillion), Repeat("1 ", kMillion), Repeat("(", kMillion),
          Repeat(")", kMillion), Repeat("~ & ", kMillion), Repeat("1 1 & ", kMillion),
          "A" + Repeat(" ~ & ~ | B", kMillion), Repeat("A & ~ | ", kMillion),
          Repeat(")(", kMillion), Repeat("& ", kMillion),
          "X " + Repeat("~ ", kMillion) + Repeat("& ", 1000), Repeat("() A ", kMillion),
          Repeat("'", 1 + 2 * kMillion), "." + Repeat("A", kMillion), Repeat("A&", kMillion)}) {
        Engine engine;
        EXPECT_FALSE(engine.SetEquation(text.c_str())) << text.substr(0, 20);
        EXPECT_TRUE(!engine);
    }
}

TEST(Large, DeepTreesHaveSmallTables)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation((Repeat("~(B&", 200000) + "A" + Repeat(")", 200000)).c_str()));
    EXPECT_EQ("0b1011", Std(engine.GetEquationAsBinaryInitValue()));
    ASSERT_TRUE(engine.SetEquation(("A" + Repeat("~^B", 200001)).c_str()));
    EXPECT_EQ("0b1001", Std(engine.GetEquationAsBinaryInitValue()));
}

TEST(Large, HundredThousandNames)
{
    std::string text = "v0";
    for (int number = 1; number < 100000; ++number)
        text += "|v" + std::to_string(number);
    Engine engine;
    ASSERT_TRUE(engine.SetEquation(text.c_str()));
    EXPECT_EQ(100000u, engine.GetNumVariables());
    engine.SetVariable("v99999", 1);
    EXPECT_EQ(1u, engine.Eval());
    EXPECT_EQ("0x0", Std(engine.GetEquationAsHexInitValue(false))) << "no table of 100,000 inputs";
}

TEST(Large, DumpOfADeepTreeDoesNotRecurse)
{
    // The path names on each line grow with the depth, so the tree is kept small.
    Engine engine;
    ASSERT_TRUE(engine.SetEquation((Repeat("~", 1500) + "A").c_str()));
    Messages messages;
    engine.GetRoot()->Dbg();
    EXPECT_NE(std::string::npos, messages.Text().find("TOP." + Repeat("L", 1500) + " parent="));
    size_t numLines = 0;
    for (const int line : messages.Lines())
        numLines += line == 512 ? 1u : 0u;
    EXPECT_EQ(1501u, numLines);
}

TEST(Large, InitValueOfSixteenVariablesReadsBack)
{
    std::string value = "0x";
    for (unsigned int digit = 0; digit < 16384; ++digit)
        value += "0123456789abcdef"[digit * 2654435761u >> 28];
    std::vector<String> terms;
    for (int number = 0; number < 16; ++number)
        terms.push_back(("i" + std::to_string(number)).c_str());
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms(terms, value.c_str(), false, false));
    EXPECT_TRUE(value == Std(engine.GetEquationAsHexInitValue(false)));
}

// An AND of all inputs is 1 in the last row only, whose digit comes first.
TEST(Large, ThirtyInputsHaveAnInitValueAndThirtyOneHaveNone)
{
    std::string text = "v0";
    for (int number = 1; number < 30; ++number)
        text += "&v" + std::to_string(number);
    Engine engine;
    ASSERT_TRUE(engine.SetEquation(text.c_str()));
    const String value = engine.GetEquationAsHexInitValue(false);
    ASSERT_EQ(2 + (size_t(1) << 28), value.length());
    EXPECT_EQ("0x8", std::string(value.c_str(), 3));
    EXPECT_EQ(2u, std::string_view(value.c_str()).find_last_not_of('0')); // only zeros follow
    engine.DefineVariable("v30", 0);
    EXPECT_EQ("0x0", Std(engine.GetEquationAsHexInitValue(false)));
    EXPECT_EQ("0b", Std(engine.GetEquationAsBinaryInitValue()));
}

// 2^24 rows; the tree would have 500 million nodes.
TEST(Large, InitValueOfManyRowsNeedsNoTree)
{
    std::vector<String> names;
    for (int number = 0; number < 24; ++number)
        names.push_back(("v" + std::to_string(number)).c_str());
    std::string text = "0x" + std::string(size_t(1) << 22, '0');
    text[2] = '8';
    text[text.size() - 1] = '1';
    text[text.size() - 2] = '4';
    for (const bool termOrderFlag : {false, true}) {
        Engine engine;
        ASSERT_TRUE(engine.SetEquationWithExplicitTerms(names, text.c_str(), termOrderFlag, false));
        EXPECT_EQ(1u, engine.Eval());
        engine.SetVariable(termOrderFlag ? "v1" : "v22", 1);
        EXPECT_EQ(0u, engine.Eval());
        engine.SetVariable(termOrderFlag ? "v2" : "v21", 1);
        EXPECT_EQ(1u, engine.Eval()) << "row 6 has a digit of its own";
        // There are two "+" between three terms; in the first term every name is negated.
        const Kq_BoolEquation::Handle handle = engine.GetVariableHandle("v0");
        const std::vector<unsigned int> positions(handle.begin(), handle.end());
        EXPECT_EQ((std::vector<unsigned int>{0, 28, 28 + 73, 28 + 73 + 71 - 1}), positions);
        if (!termOrderFlag) {
            EXPECT_EQ(text, Std(engine.GetEquationAsHexInitValue(false)));
        }
    }
}

} // namespace
