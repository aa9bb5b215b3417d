// The variable table: legal names, values, handles.
#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

TEST(Variables, LegalNamesAreDefined)
{
    for (const char* name : {"_", "x1", "'a b'", "''", "'a'xyz", "A", "'a'+b", "'''"}) {
        Engine engine;
        EXPECT_TRUE(engine.DefineVariable(name, 0)) << name;
        EXPECT_TRUE(engine.IsVariableDefined(name)) << name;
    }
}

TEST(Variables, IllegalNamesAreRefused)
{
    Engine engine;
    for (const char* name :
         {"", "1x", "a-b", "'", "'abc", "a b", "a.b", "\x80", "a\x80", "0", "&", "a'", " a"}) {
        EXPECT_FALSE(engine.DefineVariable(name, 1)) << name;
        EXPECT_FALSE(engine.IsVariableDefined(name)) << name;
    }
    const char* null = nullptr;
    EXPECT_FALSE(engine.DefineVariable(null, 1));
    EXPECT_EQ(0u, engine.GetNumVariables());
}

TEST(Variables, EveryByteIsALegalFirstOrLaterOneOrNone)
{
    const std::string letters = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz_";
    const std::string digits = "0123456789";
    for (int code = 1; code < 256; ++code) {
        const char byte = static_cast<char>(code);
        const bool isLetter = letters.find(byte) != std::string::npos;
        const bool isDigit = digits.find(byte) != std::string::npos;
        Engine engine;
        EXPECT_EQ(isLetter, engine.DefineVariable(std::string(1, byte).c_str(), 0)) << code;
        EXPECT_EQ(isLetter || isDigit, engine.DefineVariable((std::string("a") + byte).c_str(), 0))
            << code;
    }
}

TEST(Variables, SpellingIsCheckedUpToANulAndComparedInFull)
{
    Engine engine;
    const String long1 = FromBytes(std::string("a\0-", 3));
    EXPECT_TRUE(engine.DefineVariable(long1, 1));
    EXPECT_FALSE(engine.IsVariableDefined("a"));
    EXPECT_TRUE(engine.IsVariableDefined(long1));
    EXPECT_FALSE(engine.DefineVariable(FromBytes(std::string("\0a", 2)), 1));
    EXPECT_FALSE(engine.DefineVariable(FromBytes(std::string("'\0'", 3)), 1));
}

TEST(Variables, SecondDefinitionIsRefusedAndKeepsTheValue)
{
    Engine engine;
    EXPECT_TRUE(engine.DefineVariable("a", 5));
    EXPECT_EQ(1u, engine.GetVariable("a"));
    EXPECT_FALSE(engine.DefineVariable("a", 0));
    EXPECT_EQ(1u, engine.GetVariable("a"));
    EXPECT_TRUE(engine.DefineVariable("A", 0)) << "case counts";
    EXPECT_EQ("a1 A0", VariablesOf(engine));
}

TEST(Variables, ValuesAreZeroOrOne)
{
    Engine engine;
    engine.DefineVariable("a", 0);
    EXPECT_TRUE(engine.SetVariable("a", 0x80000000u));
    EXPECT_EQ(1u, engine.GetVariable("a"));
    EXPECT_TRUE(engine.SetVariable("a", 0));
    EXPECT_EQ(0u, engine.GetVariable("a"));
}

TEST(Variables, UnknownNamesReadZeroAndAreNotAdded)
{
    Engine engine;
    EXPECT_EQ(0u, engine.GetVariable("a"));
    EXPECT_FALSE(engine.SetVariable("a", 1));
    EXPECT_EQ(0u, engine.GetNumVariables());
}

TEST(Variables, HandleHoldsIndexAndPositions)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("b | a & a ^ a"));
    // Pre-order: ^ & | b a a a
    const Kq_BoolEquation::Handle handle = engine.GetVariableHandle("a");
    EXPECT_EQ((std::vector<unsigned int>{1, 4, 5, 6}),
              std::vector<unsigned int>(handle.begin(), handle.end()));
    EXPECT_EQ(4u, handle.size());
    EXPECT_TRUE(engine.GetVariableHandle("c").empty());
    EXPECT_TRUE(Engine().GetVariableHandle("a").empty());
    engine.DefineVariable("c", 0);
    EXPECT_EQ(1u, engine.GetVariableHandle("c").size()) << "no node has the name";
}

TEST(Variables, HandleReadsAndWrites)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a & b"));
    const Kq_BoolEquation::Handle b = engine.GetVariableHandle("b");
    EXPECT_TRUE(engine.IsVariableDefined(b));
    EXPECT_TRUE(engine.SetVariable(b, 7));
    EXPECT_EQ(1u, engine.GetVariable(b));
    EXPECT_EQ("a0 b1", VariablesOf(engine));
    engine.DefineVariable("c", 1);
    EXPECT_EQ(1u, engine.GetVariable(b)) << "indices never move";
}

TEST(Variables, HandleIsAnIndexForAnyEquation)
{
    Engine two;
    Engine one;
    ASSERT_TRUE(two.SetEquation("a & b"));
    ASSERT_TRUE(one.SetEquation("x"));
    const Kq_BoolEquation::Handle a = two.GetVariableHandle("a");
    const Kq_BoolEquation::Handle b = two.GetVariableHandle("b");
    EXPECT_TRUE(one.SetVariable(a, 1));
    EXPECT_EQ(1u, one.GetVariable("x"));
    EXPECT_FALSE(one.IsVariableDefined(b)) << "an index equal to the number is out of range";
    EXPECT_FALSE(one.SetVariable(b, 1));
    EXPECT_EQ(0u, one.GetVariable(b));
}

TEST(Variables, EmptyHandleIsRefused)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a"));
    const Kq_BoolEquation::Handle empty;
    EXPECT_FALSE(engine.IsVariableDefined(empty));
    EXPECT_FALSE(engine.SetVariable(empty, 1));
    EXPECT_EQ(0u, engine.GetVariable(empty));
}

TEST(Variables, DefinitionLinksNodesThatCameBefore)
{
    Engine engine;
    engine.TokenizeNodes("a & b & a");
    engine.BuildTree();
    EXPECT_TRUE(engine.DefineVariable("b", 1));
    EXPECT_TRUE(engine.DefineVariable("a", 0));
    EXPECT_EQ(0u, engine.Eval());
    engine.SetVariable("a", 1);
    EXPECT_EQ(1u, engine.Eval());
}

// Copies share nodes, and a node has one index for all of them: that of the last definition.
// Tables of more than six variables are evaluated by a program from the second time on.
TEST(Variables, NodesOfAVariableThatACopyLacksCountAsZero)
{
    Engine engine;
    engine.TokenizeNodes("a|b|c|d|e|f|g|h");
    engine.BuildTree();
    Engine copy(engine);
    for (const char* const name : {"a", "b", "c", "d", "e", "f", "g"})
        EXPECT_TRUE(copy.DefineVariable(name, 0));
    for (const char* const name : {"s", "t", "u", "v", "w", "x", "y", "z", "h"})
        EXPECT_TRUE(engine.DefineVariable(name, 1));
    for (unsigned int time = 0; time < 3; ++time)
        EXPECT_EQ(0u, copy.Eval());
    EXPECT_EQ(1u, engine.Eval());
    EXPECT_TRUE(copy.SetVariable("g", 1));
    EXPECT_EQ(1u, copy.Eval());
}

TEST(Variables, ManyNamesKeepTheirOrder)
{
    std::string text = "v0";
    for (int number = 1; number < 3000; ++number)
        text += "|v" + std::to_string(number) + "&v" + std::to_string(number / 2);
    Engine engine;
    ASSERT_TRUE(engine.SetEquation(text.c_str()));
    ASSERT_EQ(3000u, engine.GetNumVariables());
    for (unsigned int number = 0; number < 3000; ++number)
        ASSERT_EQ("v" + std::to_string(number), Std(engine.GetVariables()[number].first));
    engine.SetVariable("v0", 1);
    engine.SetVariable("v1", 1);
    const Kq_BoolEquation::Handle handle = engine.GetVariableHandle("v1499");
    EXPECT_EQ(1499u, *handle.begin());
    EXPECT_EQ(4u, handle.size());
}

} // namespace
