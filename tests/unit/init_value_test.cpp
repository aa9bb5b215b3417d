// Init values: written from a column, read back into an expression, over listed inputs.
#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

std::string HexOf(const char* text)
{
    Engine engine;
    EXPECT_TRUE(engine.SetEquation(text)) << text;
    return Std(engine.GetEquationAsHexInitValue(false));
}

std::string BinaryOf(const char* text)
{
    Engine engine;
    EXPECT_TRUE(engine.SetEquation(text)) << text;
    return Std(engine.GetEquationAsBinaryInitValue());
}

TEST(InitValue, KnownFunctions)
{
    EXPECT_EQ("0x8", HexOf("A & B"));
    EXPECT_EQ("0b1000", BinaryOf("A & B"));
    EXPECT_EQ("0x6", HexOf("A ^ B"));
    EXPECT_EQ("0b0110", BinaryOf("A ^ B"));
    EXPECT_EQ("0xe", HexOf("A | B"));
    EXPECT_EQ("0b1110", BinaryOf("A | B"));
    EXPECT_EQ("0x4", HexOf("A & ~B"));
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A | B"));
    EXPECT_EQ("0xE", Std(engine.GetEquationAsHexInitValue(true)));
}

TEST(InitValue, WidthFollowsTheNumberOfVariables)
{
    EXPECT_EQ("0x2", HexOf("A"));
    EXPECT_EQ("0x1", HexOf("~A"));
    EXPECT_EQ("0b10", BinaryOf("A"));
    EXPECT_EQ("0x80", HexOf("A & B & C"));
    EXPECT_EQ("0x8000", HexOf("A & B & C & D"));
    EXPECT_EQ("0x80000000", HexOf("A & B & C & D & E"));
    EXPECT_EQ("0x8000000000000000", HexOf("A & B & C & D & E & F"));
    EXPECT_EQ("0x8" + std::string(31, '0'), HexOf("A & B & C & D & E & F & G"));
    EXPECT_EQ("0x0001", HexOf("~(A | B | C | D)"));
    EXPECT_EQ("0x" + std::string(8191, '0') + "1" + std::string(8192, '0'),
              HexOf("A & ~(B|C|D|E|F|G|H|I|J|K|L|M|N|O|P)"));
    EXPECT_EQ("0b1" + std::string(65535, '0'), BinaryOf("A&B&C&D&E&F&G&H&I&J&K&L&M&N&O&P"));
}

TEST(InitValue, DebugModeGivesTheSameDigits)
{
    std::string text = "~v1";
    for (int number = 2; number <= 9; ++number) {
        text = "(" + text + (number % 2 != 0 ? ") ^ v" : ") | ~v") + std::to_string(number);
        Engine engine;
        ASSERT_TRUE(engine.SetEquation(text.c_str()));
        const std::string hex = Std(engine.GetEquationAsHexInitValue(true));
        const std::string binary = Std(engine.GetEquationAsBinaryInitValue());
        const Messages messages;
        const DebugMode debugMode;
        EXPECT_EQ(hex, Std(engine.GetEquationAsHexInitValue(true))) << text;
        EXPECT_EQ(binary, Std(engine.GetEquationAsBinaryInitValue())) << text;
    }
}

TEST(InitValue, ConstantsHaveNoDigitsOfTheirOwn)
{
    // Deliberate: also for the constant 1, and without any digit in the binary form.
    for (const char* text : {"0", "1"}) {
        EXPECT_EQ("0x0", HexOf(text));
        EXPECT_EQ("0b", BinaryOf(text));
    }
    EXPECT_EQ("0x0", Std(Engine().GetEquationAsHexInitValue(true)));
    EXPECT_EQ("0b", Std(Engine().GetEquationAsBinaryInitValue()));
}

TEST(InitValue, TermEquationListsTheLastVariableFirst)
{
    Engine engine;
    EXPECT_EQ("", Std(engine.GetInitValueTermEquation()));
    for (const char* name : {"I0", "I1", "I2", "I3"})
        engine.DefineVariable(name, 0);
    EXPECT_EQ("I3+I2+I1+I0", Std(engine.GetInitValueTermEquation()));
    ASSERT_TRUE(engine.SetEquation("A"));
    EXPECT_EQ("A", Std(engine.GetInitValueTermEquation()));
}

TEST(InitValue, SetEquationReadsItOverTheCurrentVariables)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A & B"));
    engine.SetVariable("A", 1);
    ASSERT_TRUE(engine.SetEquation("0x4"));
    EXPECT_EQ("A0 B0", VariablesOf(engine));
    EXPECT_EQ("TRUTH_TABLE(LP(AND(A, NOT(B))))", TreeText(engine.GetRoot()));
    EXPECT_EQ("0x4", Std(engine.GetRoot()->GetToken()));
    EXPECT_EQ(engine.GetRoot(), engine.GetRoot()->GetLeftChild()->GetParent());
    EXPECT_TRUE(engine.IsHexInitValue());
    EXPECT_FALSE(engine.IsBinaryInitValue());
    EXPECT_FALSE(engine.IsExpression());
    ASSERT_TRUE(engine.SetEquation("0B0110"));
    EXPECT_TRUE(engine.IsBinaryInitValue());
    EXPECT_FALSE(engine.IsHexInitValue());
    EXPECT_EQ("(A|B)&(~A|~B)", Std(engine.GetEquationAlt1(false)));
    EXPECT_EQ("0b0110", Std(engine.GetEquationAsBinaryInitValue()));
}

TEST(InitValue, ExpressionIsNone)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("(A*B)"));
    EXPECT_FALSE(engine.IsHexInitValue());
    EXPECT_FALSE(engine.IsBinaryInitValue());
    EXPECT_FALSE(Engine().IsHexInitValue());
}

TEST(InitValue, RefusedReadingIsParsedAsExpressionAndCleared)
{
    const Messages messages;
    for (const char* text : {"0x1G", "0b12", "0x88", "0b100000", "0xg", "0b2", "0x8 "}) {
        Engine engine;
        ASSERT_TRUE(engine.SetEquation("A & B"));
        EXPECT_FALSE(engine.SetEquation(text)) << text;
        EXPECT_TRUE(!engine);
        EXPECT_EQ(0u, engine.GetNumVariables());
    }
}

TEST(InitValue, OneDigitOverNoVariablesIsAnEmptyGroup)
{
    for (const char* text : {"0b1", "0b0", "0B1"}) {
        Engine engine;
        ASSERT_TRUE(engine.SetEquation(text)) << text;
        EXPECT_EQ("TRUTH_TABLE(LP(-))", TreeText(engine.GetRoot()));
        EXPECT_EQ(0u, engine.Eval());
        EXPECT_EQ("()", Std(engine.GetEquationAlt1(false)));
        EXPECT_EQ(text, Std(engine.GetEquation(false)));
    }
    EXPECT_EQ("refused", TreeOf("0x1")) << "four digits need two variables";
}

struct ReadRow {
    std::vector<String> terms;
    const char* value;
    bool termOrderFlag;
    bool reverseTerms;
    const char* expression; // null if refused
    const char* binary;
};

TEST(InitValue, ReadingOverListedInputs)
{
    const ReadRow rows[] = {
        {{"A", "B"}, "0b1000", false, false, "(A&B)", "0b1000"},
        {{"A", "B"}, "0x8", false, false, "(A&B)", "0b1000"},
        {{"A", "B"}, "0b0010", true, false, "(A&~B)", "0b0100"},
        {{"A", "B"}, "0b0010", false, true, "(~B&A)", "0b0010"},
        {{"A", "B"}, "0b0010", true, true, "(B&~A)", "0b0100"},
        {{"A", "B"}, "0b0110", false, false, "(A|B)&(~A|~B)", "0b0110"},
        {{"A", "B"}, "0b0000", false, false, "(A|B)&(A|~B)&(~A|B)&(~A|~B)", "0b0000"},
        {{"A", "B"}, "0b1111", false, false, "(~A&~B)|(~A&B)|(A&~B)|(A&B)", "0b1111"},
        {{"A"}, "0b10", false, false, "(A)", "0b10"},
        {{"A"}, "0b01", false, false, "(~A)", "0b01"},
        {{"A"}, "0b11", false, false, "(~A)|(A)", "0b11"},
        {{"A"}, "0b00", false, false, "(A)&(~A)", "0b00"},
        {{"A", "B", "D"}, "0b1000", false, false, nullptr, nullptr},
        {{"A", "B", "A"}, "0x8", false, false, "(A&B)", "0b1000"},
        {{"A", "1x", "B"}, "0x8", false, false, "(A&B)", "0b1000"},
        {{"A", "B"}, "0y8", false, false, nullptr, nullptr},
        {{"A", "B"}, "0&A", false, false, nullptr, nullptr},
        {{"A", "B"}, "0xG", false, false, nullptr, nullptr},
        {{"A", "B"}, "0b10 0", false, false, nullptr, nullptr},
        {{}, "0b1", false, false, "()", "0b"},
        // Missing high rows: 0 in a sum of products, 1 in a product of sums.
        {{"A", "B"}, "0b001", false, false, "(~A&~B)", "0b0001"},
        {{"A", "B"}, "0b011", false, false, "(~A|B)", "0b1011"},
        {{"A", "B", "C"},
         "0b11111",
         false,
         false,
         "(~A&~B&~C)|(~A&~B&C)|(~A&B&~C)|(~A&B&C)|(A&~B&~C)",
         "0b00011111"}};
    for (const ReadRow& row : rows) {
        Engine engine;
        const bool isSet = engine.SetEquationWithExplicitTerms(row.terms, row.value,
                                                               row.termOrderFlag, row.reverseTerms);
        if (!row.expression) {
            EXPECT_FALSE(isSet) << row.value;
            EXPECT_TRUE(!engine);
            EXPECT_EQ(0u, engine.GetNumVariables()) << "listed inputs go too";
            continue;
        }
        ASSERT_TRUE(isSet) << row.value;
        EXPECT_EQ(row.expression, Std(engine.GetEquationAlt1(false)));
        EXPECT_EQ(row.binary, Std(engine.GetEquationAsBinaryInitValue())) << row.value;
        EXPECT_EQ(row.value, Std(engine.GetEquation(false)));
    }
}

TEST(InitValue, LenientNamesAreReadAsTheTextTheyProduce)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"'a'+b"}, "0b10", false, false));
    EXPECT_EQ("'a'+b0 'a'0 b0", VariablesOf(engine));
    // One "1" and one "0" are a tie, which gives the product of sums; its only term is the name
    // itself.
    EXPECT_EQ("('a'+b)", Std(engine.GetEquationAlt2(false)));
    EXPECT_FALSE(engine.SetEquationWithExplicitTerms({"'a'b"}, "0b10", false, false));
    EXPECT_EQ(0u, engine.GetNumVariables());
}

TEST(InitValue, EveryValueOfThreeInputsReadsBack)
{
    for (unsigned int value = 0; value < 256; ++value) {
        char text[8];
        std::snprintf(text, sizeof text, "0x%02x", value);
        for (const bool reverse : {false, true}) {
            Engine engine;
            ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"a", "b", "c"}, text, false, reverse));
            EXPECT_EQ(text, Std(engine.GetEquationAsHexInitValue(false)));
        }
    }
}

TEST(Terms, ListedInputsComeFirstInTheirOrder)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B", "D"}, "A & B", false, false));
    EXPECT_EQ("A0 B0 D0", VariablesOf(engine));
    EXPECT_EQ("0xc0", Std(engine.GetEquationAsHexInitValue(false)));
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"D", "B", "A"}, "A & B", false, false));
    EXPECT_EQ("D0 B0 A0", VariablesOf(engine));
    EXPECT_EQ("0x88", Std(engine.GetEquationAsHexInitValue(false)));
}

TEST(Terms, UnlistedNamesFollow)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B"}, "E & A", false, false));
    EXPECT_EQ("A0 B0 E0", VariablesOf(engine));
    engine.SetVariable("E", 1);
    engine.SetVariable("A", 1);
    EXPECT_EQ(1u, engine.Eval());
}

TEST(Terms, FlagsDoNotMatterForAnExpression)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"B", "A"}, "A & ~B", true, true));
    EXPECT_EQ("B0 A0", VariablesOf(engine));
    EXPECT_EQ("0x2", Std(engine.GetEquationAsHexInitValue(false)));
}

TEST(Terms, RefusedTextsClearTheListedInputsToo)
{
    const Messages messages;
    for (const char* text : {"", "A &", "A $", "(A", "0x", "0b"}) {
        Engine engine;
        EXPECT_FALSE(engine.SetEquationWithExplicitTerms({"A", "B"}, text, false, false)) << text;
        EXPECT_TRUE(!engine);
        EXPECT_EQ(0u, engine.GetNumVariables());
    }
    Engine engine;
    EXPECT_TRUE(engine.SetEquationWithExplicitTerms({"A"}, "0", false, false));
    EXPECT_FALSE(engine.SetEquationWithExplicitTerms({"A"}, "01", false, false));
}

TEST(Terms, ManyListedInputsKeepTheirOrder)
{
    std::vector<String> terms;
    for (int number = 0; number < 5000; ++number)
        terms.push_back(("t" + std::to_string(number % 2500)).c_str());
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms(terms, "t2400 & u & t1", false, false));
    ASSERT_EQ(2501u, engine.GetNumVariables());
    EXPECT_EQ("t0", Std(engine.GetVariables()[0].first));
    EXPECT_EQ("t2499", Std(engine.GetVariables()[2499].first));
    EXPECT_EQ("u", Std(engine.GetVariables()[2500].first));
    EXPECT_EQ(2400u, *engine.GetVariableHandle("t2400").begin());
    for (const char* name : {"t2400", "u", "t1"})
        engine.SetVariable(name, 1);
    EXPECT_EQ(1u, engine.Eval());
}

} // namespace
