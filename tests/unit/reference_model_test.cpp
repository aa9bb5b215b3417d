// The reference model against hand-written rows: the other tests trust it, so it must be right.
#include <gtest/gtest.h>

#include "reference/builder.h"
#include "reference/equation.h"
#include "reference/evaluation.h"
#include "reference/init_text.h"
#include "reference/node_dump.h"
#include "reference/tokenizer.h"

namespace {

using reference::Equation;

// "AND(NOT(a), LP(b, RP))"; names and constants are shown as their token.
std::string Tree(const reference::Store& store, int index)
{
    const reference::Node& node = store.nodes[static_cast<size_t>(index)];
    if (node.type == reference::kId || node.type == reference::kZero ||
        node.type == reference::kOne)
        return node.token;
    std::string text = reference::TypeName(node.type);
    if (node.left == reference::kNone && node.right == reference::kNone)
        return text;
    text += "(";
    text += node.left == reference::kNone ? "" : Tree(store, node.left);
    text += node.right == reference::kNone ? "" : ", " + Tree(store, node.right);
    return text + ")";
}

std::string TreeOf(const std::string& text)
{
    Equation equation;
    if (!equation.SetEquation(text))
        return !equation && equation.GetNumVariables() == 0 ? "refused" : "refused, not cleared";
    return Tree(equation.GetStore(), equation.GetStore().root);
}

std::string TokensOf(const std::string& text)
{
    std::vector<reference::Node> nodes;
    if (!reference::Tokenize(text, nodes))
        return "refused";
    std::string tokens;
    for (const reference::Node& node : nodes)
        tokens += (tokens.empty() ? "" : " ") + std::string(reference::TypeName(node.type)) + ":" +
                  node.token;
    return tokens;
}

std::string Printed()
{
    std::string text;
    for (const reference::Message& message : reference::Log())
        text += message.text;
    return text;
}

std::string Names(const Equation& equation)
{
    std::string names;
    for (const Equation::Variable& variable : equation.GetVariables())
        names += (names.empty() ? "" : ",") + variable.first;
    return names;
}

class ReferenceModel : public testing::Test {
  protected:
    void SetUp() override { reference::Log().clear(); }
    void TearDown() override { reference::SetDebugMode(false); }
};

struct Row {
    const char* text;
    const char* expected;
};

TEST_F(ReferenceModel, TokenizesEverySpelling)
{
    const Row rows[] = {
        {"A&B", "ID:A AND:& ID:B"},
        {"A & B", "ID:A AND:& ID:B"},
        {"A\nB", "ID:A ID:B"},
        {"A\r\nB", "refused"},
        {"(A", "refused"},
        {"A)", "refused"},
        {")A(", "RP:) ID:A LP:("},
        {"~&", "NAND:~&"},
        {"~ &", "NOT:~ AND:&"},
        {"!!A", "NOT:! NOT:! ID:A"},
        {"!*!|!+!^!@", "NAND:!* NOR:!| NOR:!+ NXOR:!^ NXOR:!@"},
        {".and.", "refused"},
        {".XNOR.", "refused"},
        {". AND.", "refused"},
        {".AND", "refused"},
        {"A .AND. B", "ID:A AND:.AND. ID:B"},
        {".NOT.A.NXOR..NAND.", "NOT:.NOT. ID:A NXOR:.NXOR. NAND:.NAND."},
        {"'a b'", "ID:'a b'"},
        {"''", "ID:''"},
        {"'ab", "refused"},
        {"A1_b", "ID:A1_b"},
        {"_", "ID:_"},
        {"9", "refused"},
        {"1A", "ONE:1 ID:A"},
        {"10", "ONE:1 ZERO:0"},
        {" \t\n", ""},
        {"A\x80", "refused"},
    };
    for (const Row& row : rows) {
        std::string expected = row.expected;
        // In type names the constants are "0" and "1".
        for (size_t at; (at = expected.find("ONE:")) != std::string::npos;)
            expected.replace(at, 4, "1:");
        for (size_t at; (at = expected.find("ZERO:")) != std::string::npos;)
            expected.replace(at, 5, "0:");
        EXPECT_EQ(TokensOf(row.text), expected) << row.text;
    }
}

TEST_F(ReferenceModel, GroupsFromTheLeftWithOnePrecedence)
{
    const Row rows[] = {
        {"a", "a"},
        {"0", "0"},
        {"a & b | c", "OR(AND(a, b), c)"},
        {"a | b & c", "AND(OR(a, b), c)"},
        {"a | ~b & c", "AND(OR(a, NOT(b)), c)"},
        {"~a & b", "AND(NOT(a), b)"},
        {"~~a ~& b", "NAND(NOT(NOT(a)), b)"},
        {"~(a & b)", "NOT(LP(AND(a, b), RP))"},
        {"(~a ^ b) @ c", "XOR(LP(XOR(NOT(a), b), RP), c)"},
        {"(a | b & c) + d", "OR(LP(AND(OR(a, b), c), RP), d)"},
        {"a & (b | c)", "AND(a, LP(OR(b, c), RP))"},
        {"()", "LP(, RP)"},
        {"()A", "LP(A, RP)"},
        {"a b", "refused"},
        {"a ~ b", "refused"},
        {"(a", "refused"},
        {"a)", "refused"},
        {")A(", "refused"},
        {"a &", "refused"},
        {"& a", "refused"},
        {"~", "refused"},
        {"", "refused"},
        {"0x", "refused"},
        {" \n", "refused"},
    };
    for (const Row& row : rows)
        EXPECT_EQ(TreeOf(row.text), row.expected) << row.text;
}

TEST_F(ReferenceModel, NegatedOperatorBindsTheOperandBeforeItAndTheOneAfterIt)
{
    const Row rows[] = {
        {"a ~ & b", "NOT(AND(a, b))"},
        {"a ~ ~ & b", "NOT(NOT(AND(a, b)))"},
        {"a ~~& b", "NOT(NAND(a, b))"},
        {"P & X ~ | Y", "AND(P, NOT(OR(X, Y)))"},
        {"P & X ~ | Y & Q", "AND(P, NOT(AND(OR(X, Y), Q)))"},
        {"~ X ~ & Y", "NOT(NOT(AND(X, Y)))"},
        {"(A ~ & B)", "LP(NOT(AND(A, B)), RP)"},
        {"A ~ & B ~ | C", "NOT(AND(A, NOT(OR(B, C))))"},
        {"A & ~ | B", "refused"},
        {"~ & B", "refused"},
        {"(A) ~ & B", "refused"},
        {"() ~ & B", "NOT(AND(LP(, RP), B))"},
        {"A & ( ~ & B )", "AND(A, NOT(AND(LP(, RP), B)))"},
        {"( ~ & B )", "refused"},
    };
    for (const Row& row : rows)
        EXPECT_EQ(TreeOf(row.text), row.expected) << row.text;
}

TEST_F(ReferenceModel, TopParentEndsInACircle)
{
    Equation equation;
    ASSERT_TRUE(equation.SetEquation("P & X ~ | Y"));
    const reference::Store& store = equation.GetStore();
    for (size_t node = 0; node < store.nodes.size(); ++node) {
        const bool isOutside = node < 2; // P and the AND
        EXPECT_EQ(reference::TopParent(store.nodes, static_cast<int>(node)),
                  isOutside ? store.root : 3)
            << node;
    }
}

TEST_F(ReferenceModel, RendersInFourSyntaxes)
{
    Equation equation;
    EXPECT_EQ(equation.GetEquation(true), "");
    EXPECT_EQ(equation.GetEquationAlt3(true), "");
    ASSERT_TRUE(equation.SetEquation("A & ~B"));
    EXPECT_EQ(equation.GetEquation(true), "A & ~ B");
    EXPECT_EQ(equation.GetEquation(false), "A&~B");
    EXPECT_EQ(equation.GetEquationAlt3(true), "A .AND. ~ B");
    ASSERT_TRUE(equation.SetEquation("a ~& b"));
    EXPECT_EQ(equation.GetEquationAlt2(true), "a ~* b");
    ASSERT_TRUE(equation.SetEquation("a ~ & b"));
    EXPECT_EQ(equation.GetEquationAlt2(true), "a ~ * b");
    EXPECT_EQ(equation.GetEquationAlt2(false), "a~*b");
    ASSERT_TRUE(equation.SetEquation("(a)"));
    EXPECT_EQ(equation.GetEquation(true), "( a )");
    EXPECT_EQ(equation.GetEquation(false), "(a)");
    ASSERT_TRUE(equation.SetEquation("!a .OR. .NOT.~(b+0)"));
    EXPECT_EQ(equation.GetEquation(true), "! a .OR. .NOT. ~ ( b + 0 )");
    EXPECT_EQ(equation.GetEquationAlt1(true), "~ a | ~ ~ ( b | 0 )");
    ASSERT_TRUE(equation.SetEquation("P & X ~ | Y & Q"));
    EXPECT_EQ(equation.GetEquation(true), "P & X | Y ~ & Q");
}

TEST_F(ReferenceModel, EvaluatesWholeValuesWithoutForcingThemToBits)
{
    const struct {
        const char* text;
        unsigned int a, b, expected;
    } rows[] = {
        {"a & b", 3, 1, 1},  {"a & b", 3, 2, 2},  {"~a & 1", 3, 0, 0}, {"~(~a)", 3, 0, 1},
        {"a & 1", 2, 0, 0},  {"a | 0", 2, 0, 2},  {"~a", 2, 0, 0},     {"a ^ 0", 2, 0, 1},
        {"a ~^ b", 0, 0, 1}, {"a ~^ b", 1, 1, 1}, {"a ~^ b", 1, 0, 0}, {"a ~& b", 2, 1, 1},
        {"a ~| b", 0, 4, 0}, {"()", 0, 0, 0},     {"0", 0, 0, 0},      {"1", 0, 0, 1},
        {"(a)", 7, 0, 7},
    };
    for (const auto& row : rows) {
        Equation equation;
        ASSERT_TRUE(equation.SetEquation(row.text));
        EXPECT_EQ(reference::EvalTree(equation.GetStore().nodes, equation.GetStore().root,
                                      {row.a, row.b}),
                  row.expected)
            << row.text;
    }
}

TEST_F(ReferenceModel, NumbersVariablesByFirstOccurrence)
{
    Equation equation;
    ASSERT_TRUE(equation.SetEquation("b & a | b"));
    EXPECT_EQ(Names(equation), "b,a");
    EXPECT_FALSE(equation.DefineVariable("a", 1));
    EXPECT_TRUE(equation.DefineVariable("A", 5));
    EXPECT_EQ(equation.GetVariable("A"), 1u);
    const reference::Handle handle = equation.GetVariableHandle("b");
    EXPECT_EQ(std::vector<unsigned int>(handle.begin(), handle.end()),
              (std::vector<unsigned int>{0, 2, 4}));
    EXPECT_TRUE(equation.GetVariableHandle("c").empty());
    EXPECT_EQ(equation.GetInitValueTermEquation(), "A+a+b");
    for (const char* name : {"_", "x1", "'a b'", "''", "'a'xyz"})
        EXPECT_TRUE(equation.DefineVariable(name, 0)) << name;
    for (const char* name : {"", "1x", "a-b", "'", "'abc", "a b", "a\xc3"})
        EXPECT_FALSE(equation.DefineVariable(name, 0)) << name;
    EXPECT_TRUE(equation.DefineVariable(std::string("a\0-", 3), 0));
    EXPECT_FALSE(equation.DefineVariable(std::string("\0a", 2), 0));
}

TEST_F(ReferenceModel, TabulatesWithTheFirstVariableMostSignificant)
{
    Equation equation;
    ASSERT_TRUE(equation.SetEquation("A & ~B"));
    const reference::TruthTable table = equation.GetTruthTable();
    ASSERT_EQ(table.GetRows().size(), 4u);
    EXPECT_EQ(table.GetRows()[2].GetResultValue(), 1u);
    EXPECT_EQ(table.GetRows()[2].GetVariableValues(), (std::vector<unsigned int>{1, 0}));
    EXPECT_EQ(equation.GetEquationAsHexInitValue(false), "0x4");
    EXPECT_EQ(equation.GetVariable("A"), 0u);
    const struct {
        const char *text, *hex, *binary;
    } rows[] = {
        {"A & B", "0x8", "0b1000"},
        {"A ^ B", "0x6", "0b0110"},
        {"A | B", "0xe", "0b1110"},
        {"A", "0x2", "0b10"},
        {"1", "0x0", "0b"},
        {"", "0x0", "0b"},
        {"A & B | C", "0xea", "0b11101010"},
    };
    for (const auto& row : rows) {
        equation.SetEquation(row.text);
        EXPECT_EQ(equation.GetEquationAsHexInitValue(false), row.hex) << row.text;
        EXPECT_EQ(equation.GetEquationAsBinaryInitValue(), row.binary) << row.text;
    }
    EXPECT_TRUE(!Equation().GetTruthTable());
}

TEST_F(ReferenceModel, ReadsInitValues)
{
    const std::vector<std::string> names{"A", "B"};
    EXPECT_EQ(reference::ReadInitValue("0b1000", names, false), "(A*B)");
    EXPECT_EQ(reference::ReadInitValue("0X8", names, false), "(A*B)");
    EXPECT_EQ(reference::ReadInitValue("0b0110", names, false), "(A+B)*(~A+~B)");
    EXPECT_EQ(reference::ReadInitValue("0b0010", names, true), "(A*~B)");
    EXPECT_EQ(reference::ReadInitValue("0b0010", names, false), "(~A*B)");
    EXPECT_EQ(reference::ReadInitValue("0b100", names, false), "(A*~B)");
    EXPECT_EQ(reference::ReadInitValue("0b1111", names, false), "(~A*~B)+(~A*B)+(A*~B)+(A*B)");
    EXPECT_EQ(reference::ReadInitValue("0b00", {"A"}, false), "(A)*(~A)");
    EXPECT_EQ(reference::ReadInitValue("0b0", {}, false), "()");
    EXPECT_EQ(reference::ReadInitValue("0b1", {}, false), "()");
    for (const char* text : {"0x1G", "0b", "0x", "0b12", "0y1", "0b10", "0b10000", "0x80"})
        EXPECT_EQ(reference::ReadInitValue(text, names, false), "") << text;
}

TEST_F(ReferenceModel, SetsInitValuesOverTheDefinedVariables)
{
    Equation equation;
    equation.DefineVariable("A", 1);
    equation.DefineVariable("B", 1);
    ASSERT_TRUE(equation.SetEquation("0x4"));
    EXPECT_EQ(equation.GetEquation(true), "0x4");
    EXPECT_EQ(equation.GetEquationAsExpression(false), "(A&~B)");
    EXPECT_TRUE(equation.IsHexInitValue());
    EXPECT_FALSE(equation.IsExpression());
    EXPECT_EQ(equation.GetVariable("A"), 0u);
    EXPECT_EQ(equation.GetEquationAsHexInitValue(false), "0x4");
    EXPECT_FALSE(equation.SetEquation("0b1"));
    ASSERT_TRUE(equation.SetEquation("0b1"));
    EXPECT_EQ(equation.Eval(), 0u);
    EXPECT_TRUE(equation.IsBinaryInitValue());
    Equation lenient;
    lenient.DefineVariable("'a'+b", 0);
    ASSERT_TRUE(lenient.SetEquation("0b10"));
    EXPECT_EQ(Names(lenient), "'a',b");
}

TEST_F(ReferenceModel, SetsEquationsOverListedInputs)
{
    Equation equation;
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"A", "B", "D"}, "A & B", false, true));
    EXPECT_EQ(Names(equation), "A,B,D");
    EXPECT_EQ(equation.GetEquationAsHexInitValue(false), "0xc0");
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"D", "B", "A"}, "A & B", true, false));
    EXPECT_EQ(Names(equation), "D,B,A");
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"A", "B"}, "0b1000", false, false));
    EXPECT_EQ(equation.GetEquationAlt2(false), "(A*B)");
    EXPECT_EQ(equation.GetEquationAsBinaryInitValue(), "0b1000");
    EXPECT_FALSE(equation.SetEquationWithExplicitTerms({"A", "B", "D"}, "0b1000", false, false));
    EXPECT_TRUE(!equation);
    EXPECT_EQ(equation.GetNumVariables(), 0u);
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"A", "B"}, "0b0010", false, true));
    EXPECT_EQ(equation.GetEquationAlt2(false), "(~B*A)");
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"A", "A", "1", "B"}, "E", false, false));
    EXPECT_EQ(Names(equation), "A,B,E");
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"A", "A", "1", "B"}, "0x8", false, false));
    EXPECT_FALSE(equation.SetEquationWithExplicitTerms({}, "0 & A", false, false));
}

TEST_F(ReferenceModel, ComparesTreesOnly)
{
    Equation a;
    Equation b;
    EXPECT_TRUE(a == b);
    a.SetEquation("a & b");
    b.SetEquation("a * b");
    b.SetVariable("a", 1);
    EXPECT_TRUE(a == b);
    b.SetEquation("(a & b)");
    EXPECT_TRUE(a != b);
    b = a;
    EXPECT_TRUE(b.IsShared());
    b.SetEquation("c");
    EXPECT_EQ(a.GetEquation(true), "a & b");
}

TEST_F(ReferenceModel, DumpsNodes)
{
    Equation equation;
    equation.SetEquation("a & ~b");
    reference::DumpNode(equation.GetStore().nodes, equation.GetStore().root);
    EXPECT_EQ(Printed(), "NODE: TOP. parent= type=AND token=& val=0\n"
                         "LEFT:\n"
                         "  NODE: TOP.L parent=TOP. type=ID token=a val=0\n"
                         "RIGHT:\n"
                         "  NODE: TOP.R parent=TOP. type=NOT token=~ val=0\n"
                         "  LEFT:\n"
                         "    NODE: TOP.RL parent=TOP.R type=ID token=b val=1\n");
    reference::Log().clear();
    EXPECT_FALSE(equation.SetEquation("~ & b"));
    EXPECT_EQ(Printed(), "NODE: TOP. parent= type=NOT token=~ val=0\n");
    reference::Log().clear();
    EXPECT_FALSE(equation.SetEquation("& b"));
    EXPECT_EQ(Printed(), "NODE: TOP. parent= type=AND token=& val=0\n"
                         "LEFT:\n"
                         "  NODE: TOP.L parent=TOP. type=ID token=b val=0\n");
    reference::Log().clear();
    EXPECT_FALSE(equation.SetEquation("1 & ~"));
    EXPECT_EQ(Printed(), "RIGHT:\n"
                         "NODE: TOP.R parent=TOP. type=NOT token=~ val=0\n");
}

TEST_F(ReferenceModel, EndsALongFailureDumpAfter256Nodes)
{
    Equation equation;
    std::string text = "& b";
    for (int copy = 0; copy < 300; ++copy)
        text += " b";
    EXPECT_FALSE(equation.SetEquation(text));
    EXPECT_EQ(reference::Log().back().text, "NODE: ...\n");
    EXPECT_EQ(reference::Log().back().line, 512);
    size_t numNodeLines = 0;
    for (const reference::Message& message : reference::Log())
        numNodeLines += message.text.compare(0, 5, "NODE:") == 0;
    EXPECT_EQ(numNodeLines, 257u);
}

TEST_F(ReferenceModel, TracesBuildAndEvaluation)
{
    reference::SetDebugMode(true);
    Equation equation;
    equation.SetEquation("a");
    EXPECT_EQ(Printed(), "NODE: TOP. parent= type=ID token=a val=0\n");
    reference::Log().clear();
    equation.SetEquation("~(a)");
    EXPECT_EQ(Printed(), "NODE: TOP. parent= type=NOT token=~ val=0\n"
                         "NODE: TOP. parent= type=NOT token=~ val=0\n"
                         "LEFT:\n"
                         "  NODE: TOP.L parent=TOP. type=LP token=( val=0\n"
                         "NODE: TOP. parent= type=NOT token=~ val=0\n"
                         "LEFT:\n"
                         "  NODE: TOP.L parent=TOP. type=LP token=( val=0\n"
                         "  LEFT:\n"
                         "    NODE: TOP.LL parent=TOP.L type=ID token=a val=0\n"
                         "NODE: TOP. parent= type=NOT token=~ val=0\n"
                         "LEFT:\n"
                         "  NODE: TOP.L parent=TOP. type=LP token=( val=0\n"
                         "  LEFT:\n"
                         "    NODE: TOP.LL parent=TOP.L type=ID token=a val=0\n"
                         "  RIGHT:\n"
                         "    NODE: TOP.LR parent=TOP.L type=RP token=) val=0\n");
    reference::Log().clear();
    equation.SetEquation("a");
    reference::Log().clear();
    equation.Eval();
    EXPECT_EQ(Printed(), "DEBUG:../s/Kq_BoolEquationImpNode.cpp:446 Eval TOP. type=ID token=a "
                         "value=0\n"
                         "NODE: TOP. parent= type=ID token=a val=0\n");
    EXPECT_EQ(reference::Log().front().line, 444);
    reference::Log().clear();
    Equation().Eval();
    EXPECT_EQ(Printed(), "");
}

TEST_F(ReferenceModel, DumpsEquations)
{
    Equation equation;
    equation.Dbg();
    EXPECT_EQ(Printed(), "Bool Equation = \nBool Equation Alt1 = \nBool Equation Alt2 = \n"
                         "Bool Equation Alt3 = \nNumVariables = 0\n\n"
                         "  Id Name             Value\n  == ================ =====\n\nExprTree\n\n"
                         "NumNodes = 0\nRoot =  -----\n\nTruthTable\n  Eqn: \"\"\n  NumCols: 0\n"
                         "  NumRows: 0\n\n");
    equation.SetEquation("~a");
    equation.SetVariable("a", 1);
    reference::Log().clear();
    equation.Dbg();
    EXPECT_EQ(Printed(), "Bool Equation = ~a\nBool Equation Alt1 = ~a\nBool Equation Alt2 = ~a\n"
                         "Bool Equation Alt3 = ~a\nNumVariables = 1\n\n"
                         "  Id Name             Value\n  == ================ =====\n"
                         "   1 a                    1\n\nExprTree\n"
                         "NODE: TOP. parent= type=NOT token=~ val=0\nLEFT:\n"
                         "  NODE: TOP.L parent=TOP. type=ID token=a val=0\n\n"
                         "NumNodes = 2\nRoot =  [000]\n\n"
                         "     Id     Par  Left Right\n   =====   ===== ===== =====\n"
                         "   [000] = ----- [001] ----- NOT          ~\n"
                         "   [001] = [000] ----- ----- ID           a\n\n"
                         "TruthTable\n  Eqn: \"~a\"\n  NumCols: 1\n  Col[1] = \"a\"\n  NumRows: 2\n"
                         "        v  1\n       == ==\n     1  1  0\n     2  0  1\n\n");
    reference::Log().clear();
    reference::Row(1, {0, 1, 1, 0}).Dbg();
    EXPECT_EQ(Printed(), "    Row: 1=0110\n");
    reference::Log().clear();
    reference::Handle({7, 2}).Dbg();
    EXPECT_EQ(Printed(), "Kq_BoolEquation::Handle::DbgSize = 2\nEntry[0] = 7\nEntry[1] = 2\n");
}

} // namespace
