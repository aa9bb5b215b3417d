// Expressions made from expressions, against the columns of their parts.
#include "substitute.h"

#include <gtest/gtest.h>

#include "foreign_text.h"
#include "notation_writer.h"

namespace booleq {
namespace {

Expression Of(const char* text)
{
    return ToExpression(Kq_BoolEquation(text));
}

std::string Written(const Expression& expression)
{
    return WriteOwn(expression, OwnSyntax::First, Parentheses::Clear);
}

TEST(Substitute, ExpressionsTakeThePlaceOfInputs)
{
    const Expression expression = Of("a & ~b");
    const Expression inner = Of("x | a");
    std::vector<std::string> names;
    std::vector<Substitute> substitutes(2);
    substitutes[0].expression = &inner;
    substitutes[0].places = Merge(inner.names, names);
    substitutes[1].places = Merge({"b"}, names);
    const Expression result = Substituted(expression, substitutes, names);
    EXPECT_EQ(Written(result), "(x | a) & ~b");
    EXPECT_EQ(result.names, (std::vector<std::string>{"x", "a", "b"}));
}

TEST(Substitute, ConstantsAreFoldedAsTheColumnSays)
{
    const char* const kOperators[] = {"&", "|", "^", "~&", "~|", "~^"};
    const char* const kOperands[] = {"0", "1", "a", "~b"};
    for (const char* left : kOperands)
        for (const char* first : kOperators)
            for (const char* middle : kOperands)
                for (const char* second : kOperators) {
                    const std::string text = std::string("(") + left + " " + first + " " + middle +
                                             ") " + second + " (c " + first + " " + left + ")";
                    const Expression expression = Of(text.c_str());
                    const Expression folded = Folded(expression);
                    EXPECT_EQ(ToFunction(folded), ToFunction(expression)) << text;
                    for (const Expression::Node& node : folded.nodes)
                        EXPECT_TRUE(folded.nodes.size() == 1 || node.op > Operator::One) << text;
                }
}

TEST(Substitute, JoinedNamesAreThoseOfTheLeftFirst)
{
    const Expression joined = Joined(Of("b | a"), Operator::And, Of("c ^ a"));
    EXPECT_EQ(Written(joined), "(b | a) & (c ^ a)");
    EXPECT_EQ(joined.names, (std::vector<std::string>{"b", "a", "c"}));
    EXPECT_EQ(NamesInText(Of("b & a | b")), (std::vector<std::string>{"b", "a"}));
}

TEST(Substitute, DepthDoesNotCount)
{
    const std::string text = std::string(100000, '~') + "a";
    EXPECT_EQ(Folded(Of(text.c_str())).nodes.size(), 100001u);
}

TEST(ForeignText, IsReadAsItsNotationGroups)
{
    EXPECT_EQ(Written(ReadForeignText("a | b & c", VerilogNotation()).expression), "a | (b & c)");
    EXPECT_EQ(Written(ReadForeignText("a b + !c", LibertyNotation()).expression), "(a & b) | ~c");
    EXPECT_EQ(ReadForeignText("\\b[0] ", VerilogNotation()).expression.names[0], "'b[0]'");
    EXPECT_FALSE(ReadForeignText("a +", VerilogNotation()).fault.empty());
}

} // namespace
} // namespace booleq
