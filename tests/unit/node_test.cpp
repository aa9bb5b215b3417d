// The node: types, predicates, spellings, comparison, evaluation, dump.
#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

const Node::TYPE kCorrupt = static_cast<Node::TYPE>(14);

TEST(Node, TypesAreNumbered)
{
    const Node::TYPE types[] = {Node::AND,  Node::ZERO,        Node::ONE, Node::ID,      Node::LP,
                                Node::NAND, Node::NOR,         Node::NOT, Node::NXOR,    Node::OR,
                                Node::RP,   Node::TRUTH_TABLE, Node::XOR, Node::SENTINEL};
    for (unsigned int number = 0; number < 14; ++number)
        EXPECT_EQ(number, static_cast<unsigned int>(types[number]));
}

TEST(Node, DefaultIsASentinel)
{
    const Node node;
    EXPECT_EQ(Node::SENTINEL, node.GetType());
    EXPECT_EQ("", Std(node.GetToken()));
    EXPECT_EQ(nullptr, node.GetParent());
    EXPECT_EQ(nullptr, node.GetLeftChild());
    EXPECT_EQ(nullptr, node.GetRightChild());
    EXPECT_EQ(0u, node.GetValue());
    EXPECT_EQ("SENTINEL", Std(node.GetTypeName()));
    EXPECT_EQ("?", Std(node.GetTokenAlt1()));
    EXPECT_EQ("?", Std(node.GetTokenAlt2()));
    EXPECT_EQ("?", Std(node.GetTokenAlt3()));
}

struct TypeRow {
    Node::TYPE type;
    const char* name;
    const char* alt1;
    const char* alt2;
    const char* alt3;
    bool isBinOp;
};

TEST(Node, EveryTypeHasItsNameAndSpellings)
{
    const TypeRow rows[] = {
        {Node::AND, "AND", "&", "*", ".AND.", true},
        {Node::ZERO, "0", "0", "0", "0", true},
        {Node::ONE, "1", "1", "1", "1", true},
        {Node::ID, "ID", "own", "own", "own", false},
        {Node::LP, "LP", "(", "(", "(", false},
        {Node::NAND, "NAND", "~&", "~*", ".NAND.", true},
        {Node::NOR, "NOR", "~|", "~+", ".NOR.", true},
        {Node::NOT, "NOT", "~", "~", "~", false},
        {Node::NXOR, "NXOR", "~^", "~@", ".NXOR.", true},
        {Node::OR, "OR", "|", "+", ".OR.", true},
        {Node::RP, "RP", ")", ")", ")", false},
        {Node::TRUTH_TABLE, "TRUTH_TABLE", "own", "own", "own", true},
        {Node::XOR, "XOR", "^", "@", ".XOR.", true},
        {Node::SENTINEL, "SENTINEL", "?", "?", "?", false},
        {kCorrupt, "UNKNOWN", "??", "??", "??", true},
        {static_cast<Node::TYPE>(0xffffffffu), "UNKNOWN", "??", "??", "??", true}};
    for (const TypeRow& row : rows) {
        const Node node(row.type, "own");
        EXPECT_EQ(row.name, Std(node.GetTypeName()));
        EXPECT_EQ(row.alt1, Std(node.GetTokenAlt1())) << row.name;
        EXPECT_EQ(row.alt2, Std(node.GetTokenAlt2())) << row.name;
        EXPECT_EQ(row.alt3, Std(node.GetTokenAlt3())) << row.name;
        EXPECT_EQ("own", Std(node.GetToken()));
        EXPECT_EQ(row.isBinOp, node.IsBinOp()) << row.name;
        EXPECT_EQ(&node.GetTypeName(), &Node(row.type, "").GetTypeName()) << "names are shared";
    }
}

TEST(Node, PredicatesNameOneTypeEach)
{
    for (unsigned int number = 0; number <= 14; ++number) {
        const Node node(static_cast<Node::TYPE>(number), "");
        EXPECT_EQ(number == 1, node.Is0());
        EXPECT_EQ(number == 2, node.Is1());
        EXPECT_EQ(number == 1 || number == 2, node.IsConst());
        EXPECT_EQ(number == 4, node.IsLp());
        EXPECT_EQ(number == 10, node.IsRp());
        EXPECT_EQ(number == 3, node.IsId());
        EXPECT_EQ(number == 7, node.IsNot());
        EXPECT_EQ(number == 0, node.IsAnd());
        EXPECT_EQ(number == 9, node.IsOr());
        EXPECT_EQ(number == 12, node.IsXor());
        EXPECT_EQ(number == 5, node.IsNAnd());
        EXPECT_EQ(number == 6, node.IsNOr());
        EXPECT_EQ(number == 8, node.IsNXor());
    }
}

TEST(Node, CopyIsShallow)
{
    Node parent(Node::AND, "&");
    Node left(Node::ID, "a");
    Node right(Node::ID, "b");
    Node node(Node::OR, "+");
    node.SetParent(&parent);
    node.SetLeftChild(&left);
    node.SetRightChild(&right);
    node.SetValue(7);
    const Node copy(node);
    Node assigned;
    assigned = node;
    for (const Node* same : {&copy, static_cast<const Node*>(&assigned)}) {
        EXPECT_EQ(Node::OR, same->GetType());
        EXPECT_EQ("+", Std(same->GetToken()));
        EXPECT_EQ(&parent, same->GetParent());
        EXPECT_EQ(&left, same->GetLeftChild());
        EXPECT_EQ(&right, same->GetRightChild());
        EXPECT_EQ(7u, same->GetValue());
    }
}

TEST(Node, ComparisonLooksAtTypePresenceOfLinksAndNames)
{
    Node a(Node::ID, "a");
    Node b(Node::ID, "a");
    Node up1(Node::AND, "&");
    Node up2(Node::OR, "|");
    EXPECT_TRUE(a == b);
    a.SetParent(&up1);
    EXPECT_TRUE(a != b) << "one has a parent";
    b.SetParent(&up2);
    EXPECT_TRUE(a == b) << "both have one, whichever";
    a.SetLeftChild(&up1);
    EXPECT_TRUE(a != b);
    b.SetLeftChild(&up2);
    a.SetRightChild(&up1);
    EXPECT_TRUE(a != b);
    b.SetRightChild(&up1);
    EXPECT_TRUE(a == b);
    b.SetValue(3);
    EXPECT_TRUE(a == b) << "the value does not count";
    b.SetToken("b");
    EXPECT_TRUE(a != b);
    EXPECT_TRUE(Node(Node::AND, "&") == Node(Node::AND, "*"));
    EXPECT_TRUE(Node(Node::AND, "&") != Node(Node::OR, "&"));
    EXPECT_TRUE(Node(Node::TRUTH_TABLE, "0x8") != Node(Node::TRUTH_TABLE, "0X8"));
}

TEST(Node, TopParentOfARootIsTheRoot)
{
    Node root(Node::NOT, "~");
    Node operand(Node::ID, "a");
    root.SetLeftChild(&operand);
    operand.SetParent(&root);
    EXPECT_EQ(&root, root.GetTopParent());
    EXPECT_EQ(&root, operand.GetTopParent());
}

TEST(Node, TopParentEndsInACircle)
{
    // A long way into a circle whose only false link is its last.
    std::vector<Node> nodes(1000);
    for (size_t index = 0; index + 1 < nodes.size(); ++index) {
        nodes[index].SetParent(&nodes[index + 1]);
        nodes[index + 1].SetLeftChild(&nodes[index]);
    }
    for (const size_t target : {0u, 1u, 500u, 998u, 999u}) {
        nodes.back().SetParent(&nodes[target]);
        EXPECT_EQ(&nodes.back(), nodes[0].GetTopParent()) << target;
    }
    // A circle of true links is not a tree, but the walk still ends.
    nodes.back().SetParent(&nodes[0]);
    nodes[0].SetRightChild(&nodes.back());
    EXPECT_NE(nullptr, nodes[0].GetTopParent());
}

typedef std::vector<std::pair<String, unsigned int>> Table;

unsigned int EvalWith(const char* text, const Table& table)
{
    Engine engine;
    EXPECT_TRUE(engine.SetEquation(text)) << text;
    return engine.GetRoot()->Eval(table);
}

TEST(NodeEval, ConstantsNeedNoTable)
{
    EXPECT_EQ(0u, EvalWith("0", {}));
    EXPECT_EQ(1u, EvalWith("1", {}));
}

TEST(NodeEval, OperatorsOverBits)
{
    for (unsigned int a = 0; a < 2; ++a) {
        for (unsigned int b = 0; b < 2; ++b) {
            const Table table = {{"a", a}, {"b", b}};
            EXPECT_EQ(a & b, EvalWith("a & b", table));
            EXPECT_EQ(a | b, EvalWith("a | b", table));
            EXPECT_EQ(a ^ b, EvalWith("a ^ b", table));
            EXPECT_EQ(1 - (a & b), EvalWith("a ~& b", table));
            EXPECT_EQ(1 - (a | b), EvalWith("a ~| b", table));
            EXPECT_EQ(1 - (a ^ b), EvalWith("a ~^ b", table));
            EXPECT_EQ(1 - a, EvalWith("~a", table));
            EXPECT_EQ(a, EvalWith("(a)", table));
        }
    }
}

TEST(NodeEval, WholeValuesAreNotForcedToBits)
{
    const Table two = {{"a", 2}};
    EXPECT_EQ(0u, EvalWith("a & 1", two));
    EXPECT_EQ(2u, EvalWith("a | 0", two));
    EXPECT_EQ(0u, EvalWith("~a", two));
    EXPECT_EQ(1u, EvalWith("a ^ 0", two));
    EXPECT_EQ(0u, EvalWith("a ~^ 1", two));
    EXPECT_EQ(1u, EvalWith("a ~& 1", two));
    EXPECT_EQ(0u, EvalWith("a ~| 0", two));
    EXPECT_EQ(2u, EvalWith("(a)", two));
    EXPECT_EQ(1u, EvalWith("a & b", {{"a", 3}, {"b", 1}}));
    EXPECT_EQ(2u, EvalWith("a & b", {{"a", 3}, {"b", 2}}));
    EXPECT_EQ(0u, EvalWith("~a", {{"a", 3}}));
    EXPECT_EQ(1u, EvalWith("~(~a)", {{"a", 3}}));
}

TEST(NodeEval, VariablesAreFoundByPosition)
{
    EXPECT_EQ(1u, EvalWith("a & b", {{"x", 1}, {"y", 1}}));
    EXPECT_EQ(0u, EvalWith("a & b", {{"a", 1}})) << "an index beyond the table reads as 0";
    EXPECT_EQ(1u, EvalWith("~a", {}));
}

TEST(NodeEval, WhatIsNoTreeCountsAsZero)
{
    EXPECT_EQ(0u, Node(Node::RP, ")").Eval({}));
    EXPECT_EQ(0u, Node().Eval({}));
    EXPECT_EQ(0u, Node(kCorrupt, "").Eval({}));
    EXPECT_EQ(0u, Node(Node::LP, "(").Eval({}));
    EXPECT_EQ(1u, Node(Node::NAND, "~&").Eval({}));
    EXPECT_EQ(0u, EvalWith("()", {}));
    EXPECT_EQ(1u, EvalWith("~()", {}));
}

TEST(NodeEval, TraceIsOneLineForEachNodeChildrenFirst)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a & ~(b)"));
    engine.SetVariable("a", 1);
    const DebugMode debugMode;
    Messages messages;
    EXPECT_EQ(1u, engine.GetRoot()->Eval(engine.GetVariables()));
    const std::string start = "DEBUG:../s/Kq_BoolEquationImpNode.cpp:446 Eval ";
    EXPECT_EQ(start + "TOP.L type=ID token=a value=1\n" + start +
                  "TOP.RLL type=ID token=b value=0\n" + start + "TOP.RL type=LP token=( value=0\n" +
                  start + "TOP.R type=NOT token=~ value=1\n" + start +
                  "TOP. type=AND token=& value=1\n",
              messages.Text());
    EXPECT_EQ(std::vector<int>(5, 444), messages.Lines());
    EXPECT_EQ("Kq ../s/Kq_BoolEquationImpNode.cpp $Revision: 1.10 $", messages.Origins()[0]);
}

TEST(NodeEval, EngineDumpsTheRootAfterEachEvaluation)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a"));
    const DebugMode debugMode;
    Messages messages;
    engine.Eval();
    EXPECT_EQ("DEBUG:../s/Kq_BoolEquationImpNode.cpp:446 Eval TOP. type=ID token=a value=0\n"
              "NODE: TOP. parent= type=ID token=a val=0\n",
              messages.Text());
}

TEST(NodeDump, LinesAreMadeOfSeveralMessages)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a & (b)"));
    Messages messages;
    engine.GetRoot()->Dbg();
    EXPECT_EQ("NODE: TOP. parent= type=AND token=& val=0\n"
              "LEFT:\n"
              "  NODE: TOP.L parent=TOP. type=ID token=a val=0\n"
              "RIGHT:\n"
              "  NODE: TOP.R parent=TOP. type=LP token=( val=0\n"
              "  LEFT:\n"
              "    NODE: TOP.RL parent=TOP.R type=ID token=b val=1\n"
              "  RIGHT:\n"
              "    NODE: TOP.RR parent=TOP.R type=RP token=) val=0\n",
              messages.Text());
    EXPECT_EQ((std::vector<int>{512, 503, 487, 512, 508, 487, 512, 487, 503, 487, 487, 512, 487,
                                508, 487, 487, 512}),
              messages.Lines());
}

TEST(NodeDump, ASubtreeStartsAtDepthZeroWithItsOwnPath)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("a & ~b"));
    Messages messages;
    engine.GetRoot()->GetRightChild()->Dbg();
    EXPECT_EQ("RIGHT:\n"
              "NODE: TOP.R parent=TOP. type=NOT token=~ val=0\n"
              "LEFT:\n"
              "  NODE: TOP.RL parent=TOP.R type=ID token=b val=1\n",
              messages.Text());
}

TEST(NodeDump, FalseParentLinkEndsThePathAndHasNoHeader)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("P & X ~ | Y"));
    Messages messages;
    engine.GetRoot()->Dbg();
    EXPECT_EQ("NODE: TOP. parent= type=AND token=& val=0\n"
              "LEFT:\n"
              "  NODE: TOP.L parent=TOP. type=ID token=P val=0\n"
              "  NODE:  parent=LL type=NOT token=~ val=0\n"
              "  LEFT:\n"
              "    NODE: L parent= type=OR token=| val=0\n"
              "    LEFT:\n"
              "      NODE: LL parent=L type=ID token=X val=1\n"
              "    RIGHT:\n"
              "      NODE: LR parent=L type=ID token=Y val=2\n",
              messages.Text());
}

TEST(Node, AllocatorServesItsOwnSizeAndOthers)
{
    void* own = Node::operator new(sizeof(Node));
    void* larger = Node::operator new(sizeof(Node) + 100);
    ASSERT_NE(nullptr, own);
    ASSERT_NE(nullptr, larger);
    static_cast<char*>(larger)[sizeof(Node) + 99] = 'x';
    Node::operator delete(own, sizeof(Node));
    Node::operator delete(larger, sizeof(Node) + 100);
    Node::operator delete(nullptr, sizeof(Node));
    Node::operator delete(nullptr, 1);
}

} // namespace
