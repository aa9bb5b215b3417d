// Tokens to tree: grouping, negation, groups, negated operators, refusals and their dumps.
#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

struct TreeRow {
    const char* text;
    const char* tree;
};

void ExpectTrees(const std::vector<TreeRow>& rows)
{
    for (const TreeRow& row : rows)
        EXPECT_EQ(row.tree, TreeOf(row.text)) << row.text;
}

TEST(Tree, AllBinaryOperatorsGroupFromTheLeft)
{
    ExpectTrees({{"a & b | c", "OR(AND(a, b), c)"},
                 {"a | b & c", "AND(OR(a, b), c)"},
                 {"a ^ b ~& c ~| d ~^ e", "NXOR(NOR(NAND(XOR(a, b), c), d), e)"},
                 {"a | (b & c)", "OR(a, LP(AND(b, c)))"},
                 {"(a | b & c) ^ d", "XOR(LP(AND(OR(a, b), c)), d)"}});
}

TEST(Tree, NotAppliesToTheOperandBehindIt)
{
    ExpectTrees({{"~a & b", "AND(NOT(a), b)"},
                 {"~(a & b)", "NOT(LP(AND(a, b)))"},
                 {"a & ~b | c", "OR(AND(a, NOT(b)), c)"},
                 {"a & ~~b | ~c", "OR(AND(a, NOT(NOT(b))), NOT(c))"},
                 {"~1 ^ ~0", "XOR(NOT(1), NOT(0))"},
                 {"~(a) & b", "AND(NOT(LP(a)), b)"},
                 {"(~a & b)", "LP(AND(NOT(a), b))"},
                 {"(~~a & b)", "LP(AND(NOT(NOT(a)), b))"},
                 {"(a & ~(b | c) ^ d)", "LP(XOR(AND(a, NOT(LP(OR(b, c)))), d))"}});
}

TEST(Tree, OneTokenIsATree)
{
    ExpectTrees({{"a", "a"}, {"0", "0"}, {"1", "1"}});
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a"));
    EXPECT_EQ(nullptr, engine.GetRoot()->GetParent());
}

TEST(Tree, GroupsAreNodesWithTheirClosingParenthesis)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("(a)"));
    const Node* group = engine.GetRoot();
    EXPECT_TRUE(group->IsLp());
    EXPECT_TRUE(group->GetLeftChild()->IsId());
    EXPECT_TRUE(group->GetRightChild()->IsRp());
    EXPECT_EQ(group, group->GetRightChild()->GetParent());
    ExpectTrees({{"((a))", "LP(LP(a))"}, {"((a) & (b))", "LP(AND(LP(a), LP(b)))"}});
}

TEST(Tree, EmptyGroupIsAcceptedAndTakesAnOperand)
{
    ExpectTrees({{"()", "LP(-)"},
                 {"()A", "LP(A)"},
                 {"A & ()", "AND(A, LP(-))"},
                 {"~()", "NOT(LP(-))"},
                 {"(())", "LP(LP(-))"},
                 {"()()", "LP(LP(-))"}});
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("()A"));
    EXPECT_EQ("(A)", Std(engine.GetEquation(false)));
}

TEST(Tree, NegatedOperatorAppliesToTheOperandBeforeIt)
{
    ExpectTrees({{"X ~ | Y", "NOT(OR(X, Y))"},
                 {"X ~ ~ | Y", "NOT(NOT(OR(X, Y)))"},
                 {"P & X ~ | Y", "AND(P, NOT(OR(X, Y)))"},
                 {"(A ~ & B)", "LP(NOT(AND(A, B)))"},
                 {"~A ~ & B", "NOT(NOT(AND(A, B)))"},
                 {"A ~~& B", "NOT(NAND(A, B))"},
                 {"0 ! ^ 1", "NOT(XOR(0, 1))"}});
}

TEST(Tree, OperatorBehindANegatedOneStaysUnderItsNot)
{
    // Deliberate: it takes the run of operators below the NOT, not the NOT.
    ExpectTrees({{"P & X ~ | Y & Q", "AND(P, NOT(AND(OR(X, Y), Q)))"},
                 {"X ~ & Y | Z", "NOT(OR(AND(X, Y), Z))"}});
}

TEST(Tree, NegatedOperatorWithoutAPlaceIsRefused)
{
    ExpectTrees({{"~ & A", "refused"},
                 {"A & ~ | B", "refused"},
                 {"(A) ~ & B", "refused"},
                 {"A ~ & ~ | B", "refused"},
                 {"(~ & A)", "refused"}});
}

TEST(Tree, NegatedOperatorInsideAnOpenGroupTakesTheGroup)
{
    // The "(" itself is the operand; the ")" closes it although it is now below the operator.
    ExpectTrees({{"P & (~ | Y)", "AND(P, NOT(OR(LP(-), Y)))"}});
}

TEST(Tree, MalformedTextsAreRefused)
{
    for (const char* text :
         {"a b",   "a ~ b",  "(a",         "a)",    ")a(",   "a &",    "& a",   "a & & b",
          "~",     "~~",     "a ~",        "a ~ &", "()A B", "(a)(b)", "(a) b", "1 0",
          "1 1 &", "a () b", "a & () b c", "( & )", "(a &)", "(~)",    "a ~ ~", "a)(b"})
        EXPECT_EQ("refused", TreeOf(text)) << text;
}

std::string RefusalOf(const char* text)
{
    Messages messages;
    Engine engine;
    EXPECT_FALSE(engine.SetEquation(text)) << text;
    return messages.Text();
}

TEST(Tree, RefusalDumpsTheNodeThatBrokeTheTree)
{
    EXPECT_EQ("NODE: TOP. parent= type=AND token=& val=0\n"
              "LEFT:\n  NODE: TOP.L parent=TOP. type=ID token=a val=0\n",
              RefusalOf("a &"));
    EXPECT_EQ("NODE: TOP. parent= type=NOT token=~ val=0\n", RefusalOf("~ & A"));
    EXPECT_EQ("RIGHT:\nNODE: TOP.R parent=TOP. type=NOT token=~ val=0\n", RefusalOf("A & ~ | B"));
    EXPECT_EQ("NODE: TOP. parent= type=ID token=a val=0\n"
              "LEFT:\n  NODE: TOP.L parent=TOP. type=ID token=b val=0\n",
              RefusalOf("a b"));
    EXPECT_EQ("", RefusalOf("(a) b")) << "an operand without a free slot is not dumped";
    EXPECT_EQ("", RefusalOf("a)(b")) << "nor is a ')' without its '('";
}

TEST(Tree, FailureDumpIsWholeUpTo256Nodes)
{
    // n consecutive names: the first one breaks the tree, with all others below it.
    for (const size_t numNames : {256u, 257u, 5000u}) {
        std::string text;
        for (size_t count = 0; count < numNames; ++count)
            text += "a ";
        Messages messages;
        Engine engine;
        EXPECT_FALSE(engine.SetEquation(text.c_str()));
        size_t numLines = 0;
        for (const int line : messages.Lines())
            numLines += line == 512 ? 1u : 0u;
        EXPECT_EQ(numNames > 256 ? 257u : 256u, numLines);
        const std::string end = "NODE: ...\n";
        const bool hasEnd =
            messages.Text().compare(messages.Text().size() - end.size(), end.size(), end) == 0;
        EXPECT_EQ(numNames > 256, hasEnd);
    }
}

TEST(Tree, DebugModeDumpsTheTreeBeforeEachPlacementAndAfterTheLast)
{
    const DebugMode debugMode;
    {
        Messages messages;
        Engine engine;
        ASSERT_TRUE(engine.SetEquation("a & b"));
        EXPECT_EQ("NODE: TOP. parent= type=ID token=a val=0\n"
                  "NODE: TOP. parent= type=AND token=& val=0\n"
                  "LEFT:\n  NODE: TOP.L parent=TOP. type=ID token=a val=0\n"
                  "NODE: TOP. parent= type=AND token=& val=0\n"
                  "LEFT:\n  NODE: TOP.L parent=TOP. type=ID token=a val=0\n"
                  "RIGHT:\n  NODE: TOP.R parent=TOP. type=ID token=b val=0\n",
                  messages.Text());
    }
    {
        Messages messages;
        Engine engine;
        ASSERT_TRUE(engine.SetEquation("a"));
        EXPECT_EQ("NODE: TOP. parent= type=ID token=a val=0\n", messages.Text());
    }
    {
        Messages messages;
        Engine engine;
        EXPECT_FALSE(engine.SetEquation("a)("));
        EXPECT_EQ("NODE: TOP. parent= type=ID token=a val=0\n", messages.Text())
            << "nothing is dumped after a placement that fails";
    }
}

TEST(Tree, TopNotOfANegatedOperatorKeepsItsParentLink)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("P & X ~ | Y"));
    const Node* chain = engine.GetRoot()->GetRightChild();
    ASSERT_TRUE(chain->IsNot());
    const Node* operand = chain->GetLeftChild()->GetLeftChild();
    EXPECT_EQ("X", Std(operand->GetToken()));
    EXPECT_EQ(operand, chain->GetParent());
    EXPECT_EQ(chain, operand->GetTopParent()) << "the first node that its parent does not have";
    EXPECT_EQ(engine.GetRoot(), engine.GetRoot()->GetLeftChild()->GetTopParent());
    ASSERT_TRUE(engine.SetEquation("X ~ | Y"));
    EXPECT_EQ(nullptr, engine.GetRoot()->GetParent());
}

// The dump of the node that broke a build ends before its bytes exceed one MiB, after a whole line.
TEST(Tree, FailureDumpIsWholeUpToOneMebibyte)
{
    for (const size_t length : {40000u, 200000u, 2000000u}) {
        const std::string name(length, 'a');
        std::string text; // six consecutive names: the first one breaks the tree
        for (const char* last : {"b ", "c ", "d ", "e ", "f ", "g "})
            text += name + last;
        const Messages messages;
        Engine engine;
        EXPECT_FALSE(engine.SetEquation(text.c_str()));
        const std::string end = "NODE: ...\n";
        const std::string& dump = messages.Text();
        EXPECT_LE(dump.size(), (size_t(1) << 20) + end.size());
        const bool isCut =
            dump.size() >= end.size() && dump.substr(dump.size() - end.size()) == end;
        EXPECT_EQ(length > 40000u, isCut);
        if (isCut && dump.size() > end.size()) {
            EXPECT_EQ('\n', dump[dump.size() - end.size() - 1]);
        }
        if (length == 200000u) { // the next line would have exceeded the limit
            EXPECT_GT(dump.size() + length, size_t(1) << 20);
        }
    }
}

// Exact to the byte, including the lines that say which child a node is, and indentation.
TEST(Tree, FailureDumpOfExactlyOneMebibyteIsWhole)
{
    const auto dumpOf = [](size_t length) {
        const std::string text = "a b c d e f " + std::string(length, 'g');
        const Messages messages;
        Engine engine;
        EXPECT_FALSE(engine.SetEquation(text.c_str()));
        return messages.Text();
    };
    const size_t numOtherBytes = dumpOf(1).size() - 1;
    const size_t longest = (size_t(1) << 20) - numOtherBytes;
    EXPECT_EQ(size_t(1) << 20, dumpOf(longest).size());
    const std::string cut = dumpOf(longest + 1);
    EXPECT_LT(cut.size(), numOtherBytes);
    EXPECT_EQ("NODE: ...\n", cut.substr(cut.size() - 10));
}

// A list that outlives the failure, because another object shares it, has loose tokens again.
TEST(Tree, ListThatFailedCanBeBuiltAgain)
{
    Engine first;
    first.TokenizeNodes("(P | A & ~ | B)");
    Engine second(first);
    std::string dump;
    {
        const Messages messages;
        first.BuildTree();
        dump = messages.Text();
    }
    EXPECT_TRUE(!first);
    EXPECT_NE("", dump);
    const Messages messages;
    second.BuildTree();
    EXPECT_TRUE(!second);
    EXPECT_EQ(dump, messages.Text()) << "the same node broke it in the same way";
}

TEST(Tree, ListWhoseTraceWasCutShortCanBeBuiltAgain)
{
    struct Stop {};
    for (int numMessages = 0; numMessages < 40; numMessages += 3) {
        Engine engine;
        engine.TokenizeNodes("(A | ~B) & C ^ (D ~ & E)");
        int numLeft = numMessages;
        const auto before =
            Port_MsgManData::setSink([&](const char*, const char*, int, const char*, const char*) {
                if (numLeft-- == 0)
                    throw Stop();
            });
        {
            const DebugMode debugMode;
            EXPECT_THROW(engine.BuildTree(), Stop);
        }
        Port_MsgManData::setSink(before);
        engine.BuildTree();
        EXPECT_EQ("XOR(AND(LP(OR(A, NOT(B))), C), LP(NOT(AND(D, E))))", TreeText(engine.GetRoot()));
    }
}

} // namespace
