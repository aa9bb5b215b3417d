// Tree to text in four syntaxes, with and without blanks.
#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

struct RenderRow {
    const char* text;
    const char* primary;
    const char* alt1;
    const char* alt2;
    const char* alt3;
};

TEST(Render, FourSyntaxesWithBlanks)
{
    const RenderRow rows[] = {
        {"A & ~B", "A & ~ B", "A & ~ B", "A * ~ B", "A .AND. ~ B"},
        {"a*b+c", "a * b + c", "a & b | c", "a * b + c", "a .AND. b .OR. c"},
        {"a~&b", "a ~& b", "a ~& b", "a ~* b", "a .NAND. b"},
        {"a!|b", "a !| b", "a ~| b", "a ~+ b", "a .NOR. b"},
        {"a@b.NXOR.c", "a @ b .NXOR. c", "a ^ b ~^ c", "a @ b ~@ c", "a .XOR. b .NXOR. c"},
        {"a ~ & b", "a ~ & b", "a ~ & b", "a ~ * b", "a ~ .AND. b"},
        {".NOT.a", ".NOT. a", "~ a", "~ a", "~ a"},
        {"~!a", "~ ! a", "~ ~ a", "~ ~ a", "~ ~ a"},
        {"!(a|0)", "! ( a | 0 )", "~ ( a | 0 )", "~ ( a + 0 )", "~ ( a .OR. 0 )"},
        {"(a)", "( a )", "( a )", "( a )", "( a )"},
        {"()", "( )", "( )", "( )", "( )"},
        {"a", "a", "a", "a", "a"},
        {"1", "1", "1", "1", "1"},
        {"P & X ~ ! | Y", "P & X ~ ! | Y", "P & X ~ ~ | Y", "P * X ~ ~ + Y",
         "P .AND. X ~ ~ .OR. Y"},
        {"P & X ~ | Y & Q", "P & X | Y ~ & Q", "P & X | Y ~ & Q", "P * X + Y ~ * Q",
         "P .AND. X .OR. Y ~ .AND. Q"}};
    for (const RenderRow& row : rows) {
        Engine engine;
        ASSERT_TRUE(engine.SetEquation(row.text)) << row.text;
        EXPECT_EQ(row.primary, Std(engine.GetEquation(true)));
        EXPECT_EQ(row.alt1, Std(engine.GetEquationAlt1(true)));
        EXPECT_EQ(row.alt2, Std(engine.GetEquationAlt2(true)));
        EXPECT_EQ(row.alt3, Std(engine.GetEquationAlt3(true)));
        EXPECT_EQ(row.primary, Std(engine.GetEquationAsExpression(true)));
    }
}

TEST(Render, WithoutBlanksNothingStandsBetweenTokens)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a & ~ b"));
    EXPECT_EQ("a&~b", Std(engine.GetEquation(false)));
    EXPECT_EQ("a*~b", Std(engine.GetEquationAlt2(false)));
    EXPECT_EQ("a.AND.~b", Std(engine.GetEquationAlt3(false)));
    // Deliberate: without blanks, a negated operator becomes a different token.
    ASSERT_TRUE(engine.SetEquation("a ~ & b"));
    EXPECT_EQ("a~*b", Std(engine.GetEquationAlt2(false)));
}

TEST(Render, EmptyEquationIsEmptyText)
{
    const Engine engine;
    for (const bool spaces : {false, true}) {
        EXPECT_EQ("", Std(engine.GetEquation(spaces)));
        EXPECT_EQ("", Std(engine.GetEquationAlt1(spaces)));
        EXPECT_EQ("", Std(engine.GetEquationAlt2(spaces)));
        EXPECT_EQ("", Std(engine.GetEquationAlt3(spaces)));
        EXPECT_EQ("", Std(engine.GetEquationAsExpression(spaces)));
    }
}

TEST(Render, InitValueIsItsTextOrTheExpressionBelow)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B"}, "0X4", false, false));
    EXPECT_EQ("0X4", Std(engine.GetEquation(true)));
    EXPECT_EQ("( A & ~ B )", Std(engine.GetEquationAlt1(true)));
    EXPECT_EQ("(A*~B)", Std(engine.GetEquationAlt2(false)));
    EXPECT_EQ("(A.AND.~B)", Std(engine.GetEquationAlt3(false)));
    EXPECT_EQ("(A&~B)", Std(engine.GetEquationAsExpression(false)));
    EXPECT_FALSE(engine.IsExpression());
}

TEST(Render, NulBytesInATokenAreKept)
{
    Engine engine;
    engine.TokenizeNodes("a & b & c");
    engine.BuildTree();
    engine.GetRoot()->GetRightChild()->GetParent()->GetLeftChild()->GetRightChild()->SetToken(
        FromBytes(std::string("b\0x", 3)));
    EXPECT_EQ(std::string("a&b\0x&c", 7), Std(engine.GetEquation(false)));
}

TEST(Render, TextsLongerThanAnyBufferAreWhole)
{
    for (const size_t length : {65533u, 65534u, 65535u, 65536u, 65537u, 200000u}) {
        const std::string name(length, 'n');
        const std::string text = "a & " + name + " | b & " + name + " ^ c";
        Engine engine;
        ASSERT_TRUE(engine.SetEquation(text.c_str()));
        EXPECT_EQ(text, Std(engine.GetEquation(true)));
    }
    std::string chain = "a";
    for (int count = 0; count < 50000; ++count)
        chain += " & b" + std::to_string(count % 10);
    Engine engine;
    ASSERT_TRUE(engine.SetEquation(chain.c_str()));
    EXPECT_EQ(chain, Std(engine.GetEquation(true)));
}

} // namespace
