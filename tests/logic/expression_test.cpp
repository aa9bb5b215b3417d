// Expressions: made from equations, evaluated, written in the library's syntaxes.
#include <gtest/gtest.h>

#include "expression.h"
#include "logic_support.h"
#include "notation_writer.h"

namespace {

using namespace booleq;
using namespace logic_support;

std::string Whole(const std::string& text)
{
    return WriteOwn(Parsed(text), OwnSyntax::First, Parentheses::Whole);
}

std::string Needed(const std::string& text)
{
    return WriteOwn(Parsed(text), OwnSyntax::First, Parentheses::Needed);
}

std::string Clear(const std::string& text)
{
    return WriteOwn(Parsed(text), OwnSyntax::First, Parentheses::Clear);
}

TEST(Expression, HasTheLibrarysColumn)
{
    for (const char* text :
         {"A & ~B", "a | b & c", "P & X ~ | Y & Q", "()", "1", "(A) ~& (0)", "A @ B !+ C .NAND. D",
          "a & b | c ^ d ~& e ~| f ~^ g & h", "'x y' & ()"}) {
        Kq_BoolEquation equation;
        ASSERT_TRUE(equation.SetEquation(text));
        Function function;
        ASSERT_TRUE(FunctionOf(equation, function));
        EXPECT_TRUE(ToFunction(ToExpression(equation)) == function) << text;
    }
}

TEST(Expression, OfAnInitValueIsWhatItStandsFor)
{
    Kq_BoolEquation equation;
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"A", "B", "C"}, "0xca", false, false));
    EXPECT_EQ(ToFunction(ToExpression(equation)).Hex(), "0xca");
}

TEST(Expression, WithoutAnEquationIsZero)
{
    const Expression expression = ToExpression(Kq_BoolEquation());
    ASSERT_EQ(expression.nodes.size(), 1u);
    EXPECT_EQ(expression.nodes[0].op, Operator::Zero);
}

TEST(Writer, GroupsFromTheLeft)
{
    EXPECT_EQ(Whole("a | b & c"), "((a | b) & c)");
    EXPECT_EQ(Needed("a | b & c"), "a | b & c");
    EXPECT_EQ(Needed("(a | b) & c"), "a | b & c");
    EXPECT_EQ(Needed("a | (b & c)"), "a | (b & c)");
    EXPECT_EQ(Needed("a & (b & c)"), "a & (b & c)");
    EXPECT_EQ(Clear("a | b & c"), "(a | b) & c");
    EXPECT_EQ(Clear("a & b & c"), "a & b & c");
    EXPECT_EQ(Clear("a ~& b ~& c"), "(a ~& b) ~& c");
}

TEST(Writer, KeepsTheMeaningOfANegatedOperatorWithABlank)
{
    EXPECT_EQ(Needed("P & X ~ | Y & Q"), "P & ~(X | Y & Q)");
    EXPECT_EQ(Whole("P & X ~ | Y & Q"), "(P & ~((X | Y) & Q))");
}

TEST(Writer, NeverBeginsWithAZeroThatStartsAnInitValue)
{
    EXPECT_EQ(Needed("0 | A"), "(0 | A)");
    EXPECT_EQ(Needed("0"), "0");
}

TEST(Writer, KeepsEachOperatorAsItWasTyped)
{
    const Expression expression = Parsed("A .AND. !B * (c .NXOR. .NOT. d) !| ~e @ f ~* g !^ h");
    EXPECT_EQ(WriteOwn(expression, OwnSyntax::AsTyped, Parentheses::Needed),
              "A .AND. !B * (c .NXOR. .NOT. d) !| ~e @ f ~* g !^ h");
    EXPECT_EQ(WriteOwn(expression, OwnSyntax::Third, Parentheses::Needed),
              "A .AND. ~B .AND. (c .NXOR. ~d) .NOR. ~e .XOR. f .NAND. g .NXOR. h");
}

TEST(Writer, TakesDeepExpressions)
{
    std::string text = "a | c";
    for (int level = 0; level < 100000; ++level)
        text = "b & (" + text;
    text += std::string(100000, ')');
    EXPECT_TRUE(Needed(text) == text);
    const std::string inversions = std::string(100000, '~') + "a";
    EXPECT_TRUE(Needed(inversions) == inversions);
}

} // namespace
