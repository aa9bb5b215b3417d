// The engine object: empty, set, copied, assigned, cleared, compared, tested.
#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

TEST(Equation, NewObjectIsEmpty)
{
    const Engine engine;
    EXPECT_TRUE(!engine);
    EXPECT_FALSE(static_cast<bool>(engine.operator Kq_PtrTester*()));
    EXPECT_FALSE(engine.IsExpression());
    EXPECT_EQ(0u, engine.GetNumVariables());
    EXPECT_EQ(nullptr, engine.GetRoot());
}

TEST(Equation, EmptyTextIsRefusedAndLeavesTheObjectEmpty)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A"));
    EXPECT_FALSE(engine.SetEquation(""));
    EXPECT_TRUE(!engine);
    EXPECT_EQ(0u, engine.GetNumVariables());
}

TEST(Equation, NullTextCountsAsEmpty)
{
    const char* null = nullptr;
    Engine engine;
    EXPECT_FALSE(engine.SetEquation(null));
    engine.TokenizeNodes(nullptr);
    EXPECT_TRUE(!engine);
}

TEST(Equation, PrefixesOfInitValuesAloneAreExpressions)
{
    // The constant 0 followed by a variable: two operands in a row.
    EXPECT_EQ("refused", TreeOf("0x"));
    EXPECT_EQ("refused", TreeOf("0b"));
    Messages messages;
    Engine engine;
    engine.SetEquation("0x");
    EXPECT_EQ("NODE: TOP. parent= type=0 token=0 val=0\n"
              "LEFT:\n  NODE: TOP.L parent=TOP. type=ID token=x val=0\n",
              messages.Text());
}

TEST(Equation, UnknownPrefixIsReadAsExpression)
{
    EXPECT_EQ("AND(0, A)", TreeOf("0&A"));
    EXPECT_EQ("refused", TreeOf("0y1"));
    EXPECT_EQ("OR(AND(0, x1), b)", TreeOf("0&x1|b"));
}

TEST(Equation, ExpressionStartsItsVariablesAtZeroInOrderOfTheText)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("B & A & B"));
    EXPECT_EQ("B0 A0", VariablesOf(engine));
    engine.SetVariable("A", 1);
    ASSERT_TRUE(engine.SetEquation("A & B"));
    EXPECT_EQ("A0 B0", VariablesOf(engine));
}

TEST(Equation, VariablesFollowTheTextWhereTheTreeDoesNot)
{
    // "Z" is written first but is the right operand of the operator that closes over an empty
    // group.
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("() Z & Y"));
    EXPECT_EQ("Z0 Y0", VariablesOf(engine));
}

TEST(Equation, CopiesShareNodesUntilOneIsSet)
{
    Engine a;
    ASSERT_TRUE(a.SetEquation("A & B"));
    Engine b(a);
    EXPECT_EQ(a.GetRoot(), b.GetRoot());
    EXPECT_TRUE(a == b);
    ASSERT_TRUE(b.SetEquation("C"));
    EXPECT_EQ("AND(A, B)", TreeText(a.GetRoot()));
    EXPECT_EQ("A0 B0", VariablesOf(a));
    EXPECT_EQ("C", TreeText(b.GetRoot()));
}

TEST(Equation, CopiesHaveValuesOfTheirOwn)
{
    Engine a;
    ASSERT_TRUE(a.SetEquation("A"));
    Engine b;
    b = a;
    b.SetVariable("A", 1);
    EXPECT_EQ(0u, a.Eval());
    EXPECT_EQ(1u, b.Eval());
}

TEST(Equation, RefusedTextInACopyLeavesTheOthers)
{
    Engine a;
    ASSERT_TRUE(a.SetEquation("A & B"));
    Engine b(a);
    EXPECT_FALSE(b.SetEquation("A $ B"));
    EXPECT_TRUE(!b);
    EXPECT_EQ("AND(A, B)", TreeText(a.GetRoot()));
}

TEST(Equation, ClearOfACopyLeavesTheOthers)
{
    Engine a;
    ASSERT_TRUE(a.SetEquation("A & B"));
    Engine b(a);
    b.Clear();
    EXPECT_TRUE(!b);
    EXPECT_EQ(0u, b.GetNumVariables());
    EXPECT_EQ("AND(A, B)", TreeText(a.GetRoot()));
    EXPECT_EQ(0u, a.Eval());
}

// References into the variable list stay valid.
TEST(Equation, AssignmentToItselfMovesNothing)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A & B"));
    const Engine* const self = &engine;
    const void* const variables = engine.GetVariables().data();
    const char* const name = engine.GetVariables()[0].first.c_str();
    const Node* const root = engine.GetRoot();
    engine = *self;
    engine.Copy(*self);
    EXPECT_EQ(variables, engine.GetVariables().data());
    EXPECT_EQ(name, engine.GetVariables()[0].first.c_str());
    EXPECT_EQ(root, engine.GetRoot());

    Kq_BoolEquation equation("A & B");
    const Kq_BoolEquation* const itself = &equation;
    const void* const entries = equation.GetVariables().data();
    equation = *itself;
    equation.Copy(*itself);
    equation.SetEquationFromEquation(*itself);
    EXPECT_EQ(entries, equation.GetVariables().data());

    Engine::TruthTable table = engine.GetTruthTable();
    const Engine::TruthTable* const sameTable = &table;
    const void* const rows = table.GetRows().data();
    const void* const names = table.GetVariableNames().data();
    table = *sameTable;
    EXPECT_EQ(rows, table.GetRows().data());
    EXPECT_EQ(names, table.GetVariableNames().data());
}

TEST(Equation, VariableListKeepsItsCapacity)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a|b|c|d|e|f|g|h|i|j|k|l|m|n|o|p|q"));
    const size_t capacity = engine.GetVariables().capacity();
    ASSERT_GE(capacity, 17u);
    const auto expectKept = [&](const char* after) {
        EXPECT_EQ(capacity, engine.GetVariables().capacity()) << after;
    };
    engine.Clear();
    expectKept("Clear");
    EXPECT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B"}, "A & B", false, false));
    expectKept("an expression over terms");
    EXPECT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B"}, "0x8", false, false));
    expectKept("an init value over terms");
    EXPECT_TRUE(engine.SetEquation("0x6"));
    expectKept("an init value");
    EXPECT_TRUE(engine.SetEquation("A"));
    expectKept("an expression");
    const Messages messages;
    EXPECT_FALSE(engine.SetEquationWithExplicitTerms({"A", "B"}, "A & (", false, false));
    expectKept("a refused text");
    EXPECT_FALSE(engine.SetEquationWithExplicitTerms({"A", "B"}, "0x888", false, false));
    expectKept("a refused init value");
}

TEST(Equation, AssignmentToItselfAndToACopyChangesNothing)
{
    Engine a;
    ASSERT_TRUE(a.SetEquation("A | B"));
    a.SetVariable("B", 1);
    Engine& same = a;
    a = same;
    EXPECT_EQ("A0 B1", VariablesOf(a));
    Engine b(a);
    a = b;
    b.Copy(a);
    EXPECT_EQ(1u, a.Eval());
    EXPECT_EQ(1u, b.Eval());
}

TEST(Equation, AssignmentInARingKeepsTheLastHolder)
{
    Engine a;
    Engine b;
    Engine c;
    ASSERT_TRUE(a.SetEquation("A"));
    ASSERT_TRUE(b.SetEquation("B"));
    ASSERT_TRUE(c.SetEquation("C"));
    a = b;
    b = c;
    c = a;
    EXPECT_EQ("B", TreeText(a.GetRoot()));
    EXPECT_EQ("C", TreeText(b.GetRoot()));
    EXPECT_EQ("B", TreeText(c.GetRoot()));
    a.Clear();
    EXPECT_EQ("B", TreeText(c.GetRoot()));
}

TEST(Equation, ComparisonIsByTreeAndIgnoresVariables)
{
    Engine a;
    Engine b;
    EXPECT_TRUE(a == b);
    ASSERT_TRUE(a.SetEquation("A & B"));
    EXPECT_TRUE(a != b);
    ASSERT_TRUE(b.SetEquation("A * B"));
    EXPECT_TRUE(a == b) << "the spelling of an operator does not count";
    b.DefineVariable("C", 1);
    b.SetVariable("A", 1);
    EXPECT_TRUE(a == b) << "variables do not count";
    ASSERT_TRUE(b.SetEquation("B & A"));
    EXPECT_TRUE(a != b);
    ASSERT_TRUE(b.SetEquation("(A & B)"));
    EXPECT_TRUE(a != b);
    ASSERT_TRUE(a.SetEquation("0"));
    ASSERT_TRUE(b.SetEquation("1"));
    EXPECT_TRUE(a != b);
}

TEST(Equation, InitValuesCompareByTheirText)
{
    Engine a;
    Engine b;
    ASSERT_TRUE(a.SetEquationWithExplicitTerms({"A", "B"}, "0x8", false, false));
    ASSERT_TRUE(b.SetEquationWithExplicitTerms({"A", "B"}, "0b1000", false, false));
    EXPECT_TRUE(a != b);
    ASSERT_TRUE(b.SetEquationWithExplicitTerms({"A", "B"}, "0x8", false, false));
    EXPECT_TRUE(a == b);
    ASSERT_TRUE(b.SetEquation("(A*B)"));
    EXPECT_TRUE(a != b);
}

TEST(Equation, ArgumentsMayBeTheObjectsOwnData)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("'a name that is too long to be kept in place' & B"));
    ASSERT_TRUE(engine.SetEquation(engine.GetVariables()[0].first));
    EXPECT_EQ("'a name that is too long to be kept in place'", TreeText(engine.GetRoot()));
    ASSERT_TRUE(
        engine.SetEquationWithExplicitTerms({"B"}, engine.GetVariables()[0].first, false, false));
    EXPECT_EQ("B0 'a name that is too long to be kept in place'0", VariablesOf(engine));
    ASSERT_TRUE(engine.SetEquation(engine.GetRoot()->GetToken()));
    EXPECT_FALSE(engine.DefineVariable(engine.GetVariables()[0].first, 1));
    Engine& same = engine;
    engine.Copy(same);
    EXPECT_EQ(1u, engine.GetNumVariables());
}

TEST(Equation, ANulByteEndsTheText)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation(FromBytes(std::string("A\0$$$", 5))));
    EXPECT_EQ("A", TreeText(engine.GetRoot()));
    EXPECT_FALSE(engine.SetEquation(FromBytes(std::string("\0A", 2))));
    ASSERT_TRUE(engine.SetEquation(FromBytes(std::string("0\0x", 3))));
    EXPECT_EQ("0", TreeText(engine.GetRoot()));
    EXPECT_FALSE(engine.SetEquation(FromBytes(std::string("0x8\0", 4))));
}

TEST(Equation, EvalOfAnEmptyObjectIsZeroAndPrintsNothing)
{
    const DebugMode debugMode;
    Messages messages;
    const Engine engine;
    EXPECT_EQ(0u, engine.Eval());
    EXPECT_EQ("", messages.Text());
}

TEST(Equation, DebugModeIsReadAndWritten)
{
    EXPECT_FALSE(Engine::GetInternalDebugMode());
    {
        const DebugMode debugMode;
        EXPECT_TRUE(Engine::GetInternalDebugMode());
    }
    EXPECT_FALSE(Engine::GetInternalDebugMode());
}

TEST(Equation, BuildingTwiceChangesNothing)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A & B"));
    const Node* root = engine.GetRoot();
    engine.BuildTree();
    engine.TokenizeNodes("C");
    EXPECT_EQ(root, engine.GetRoot());
    EXPECT_EQ("AND(A, B)", TreeText(engine.GetRoot()));
    Engine empty;
    empty.BuildTree();
    EXPECT_TRUE(!empty);
}

TEST(Equation, TokensWithoutATreeEvaluateToZero)
{
    Engine engine;
    engine.TokenizeNodes("1");
    EXPECT_TRUE(!engine);
    EXPECT_EQ(0u, engine.Eval());
    EXPECT_EQ("", Std(engine.GetEquation(true)));
    EXPECT_EQ("", Std(engine.GetEquationAlt1(true)));
    engine.BuildTree();
    EXPECT_EQ(1u, engine.Eval());
}

TEST(Equation, SharedTokensCanBeBuiltAfterAnotherHolderFailed)
{
    Engine a;
    Engine b(a);
    a.TokenizeNodes("A B");
    {
        const Messages messages;
        a.BuildTree();
        EXPECT_TRUE(!a);
        b.BuildTree();
    }
    EXPECT_TRUE(!b);
    EXPECT_TRUE(b.SetEquation("A"));
}

TEST(Equation, AllocatorServesItsOwnSizeAndOthers)
{
    void* own = Engine::operator new(sizeof(Engine));
    void* other = Engine::operator new(1); // deliberately as large as one engine object
    ASSERT_NE(nullptr, own);
    ASSERT_NE(nullptr, other);
    ::new (other) Engine;
    static_cast<Engine*>(other)->~Engine();
    Engine::operator delete(own, sizeof(Engine));
    Engine::operator delete(other, 1);
    Engine::operator delete(nullptr, sizeof(Engine));
    Engine::operator delete(nullptr, 1);
}

} // namespace
