// Whether two expressions are the same function: small ones against all rows, large ones by
// construction.
#include "decision.h"

#include <algorithm>
#include <chrono>
#include <stdexcept>

#include <gtest/gtest.h>

#include "cnf.h"
#include "column_decision.h"
#include "decide/pairs.h"
#include "flatten.h"
#include "gate_graph.h"
#include "logic_support.h"
#include "solver.h"
#include "sweep.h"
#include "watch.h"

namespace {

using namespace booleq;
using namespace decide_pairs;
using namespace logic_support;

Decision Decided(const std::string& left, const std::string& right)
{
    return DecideEqual(Parsed(left), Parsed(right), {});
}

// All operands joined by one operator, in the given order, grouped at random.
Expression Chain(Operator op, std::vector<uint32_t> inputs, std::mt19937_64& random)
{
    Expression expression;
    expression.names = Names(inputs.size());
    std::vector<uint32_t> waiting;
    const auto join = [&] {
        const uint32_t right = waiting.back();
        waiting.pop_back();
        waiting.back() = AddBinary(expression, op, waiting.back(), right);
    };
    for (const uint32_t input : inputs) {
        waiting.push_back(AddInput(expression, input));
        while (waiting.size() > 1 && random() % 2 == 0)
            join();
    }
    while (waiting.size() > 1)
        join();
    return expression;
}

TEST(Decision, SeesTheSameOperandsWithoutASearch)
{
    const char* const kPairs[][2] = {
        {"a & b & c", "c & (a & b) & a"},
        {"a | b | c", "~(~c & ~(b | a))"},
        {"a ^ b ^ c ^ a", "c ~^ ~b"},
        {"~(a & b) | c", "~((b & a) & ~c)"},
        {"a ~& b", "~b | ~a"},
        {"a ~| b", "~b & ~a"},
        {"a ~^ (b ~^ c)", "(c ^ a) ^ b"},
        {"(a | b) & 1 | 0", "b | a | a"},
        {"a & ~a", "0"},
        {"a | b | ~a", "1"},
        {"(a & ~b) | (~a & b)", "b ^ a"},
        {"(a | b) & ~(a & b)", "a ^ b"},
        {"a & (a | b)", "a"},
        {"a | (~a & b)", "b | a"},
        {"(a & b) | (a & ~b)", "a"},
        {"'x y' & ()", "0"},
    };
    for (const auto& pair : kPairs) {
        const Decision decision = Decided(pair[0], pair[1]);
        EXPECT_TRUE(decision.IsEqual()) << pair[0] << "  " << pair[1];
        EXPECT_EQ(decision.proof, Proof::Structure) << pair[0] << "  " << pair[1];
    }
}

TEST(Decision, TakesInputsByName)
{
    EXPECT_TRUE(Decided("b & a", "a & b").IsEqual());
    const Decision decision = Decided("a | b & c", "(d | ~d) & c & a | (c & b)");
    EXPECT_EQ(decision.inputs, (std::vector<std::string>{"a", "b", "c", "d"}));
    EXPECT_TRUE(decision.IsEqual());
    const Decision other = Decided("a", "b");
    EXPECT_EQ(other.assignment, (std::vector<bool>{false, true}));
    EXPECT_FALSE(other.left);
    EXPECT_TRUE(other.right);
}

TEST(Decision, AgreesWithAllRowsOnSmallPairs)
{
    std::mt19937_64 random(5);
    size_t numEqual = 0;
    for (int round = 0; round < 20000; ++round) {
        const auto numInputs = static_cast<uint32_t>(1 + random() % 7);
        const Expression left =
            RandomExpression(random, numInputs, static_cast<uint32_t>(random() % 12));
        const Expression right =
            round % 3 == 0
                ? Rewrite(left, random)
                : RandomExpression(random, numInputs, static_cast<uint32_t>(random() % 12));
        const uint64_t row = ToFunction(left).FirstDifference(ToFunction(right));
        const Decision decision = DecideEqual(left, right, {});
        ASSERT_EQ(decision.IsEqual(), row == Function::kNoRow) << round;
        numEqual += decision.IsEqual() ? 1 : 0;
        if (decision.IsEqual())
            continue;
        ASSERT_TRUE(decision.IsDifferent());
        ASSERT_TRUE(decision.isFirstRow);
        ASSERT_EQ(decision.Row(), row);
        const Decision columns = DecideColumns(ToFunction(left), ToFunction(right));
        ASSERT_EQ(columns.Row(), row);
        ASSERT_EQ(columns.assignment, decision.assignment);
    }
    EXPECT_GT(numEqual, 7000u);
    EXPECT_LT(numEqual, 15000u);
}

// For medium sizes every row can still be tried, but the decision works differently.
TEST(Decision, FindsTheFirstRowAlsoWhereTheSolverMustHelp)
{
    std::mt19937_64 random(3);
    size_t numDifferent = 0;
    for (int round = 0; round < 16; ++round) {
        const Expression left = RandomExpression(random, 18, 400);
        const Expression right = Rewrite(ChangeOneOperator(left, random), random);
        const uint64_t row = ToFunction(left).FirstDifference(ToFunction(right));
        const Decision decision = DecideEqual(left, right, {});
        ASSERT_EQ(decision.IsEqual(), row == Function::kNoRow) << round;
        if (decision.IsEqual())
            continue;
        ++numDifferent;
        EXPECT_TRUE(decision.isFirstRow);
        EXPECT_EQ(decision.Row(), row) << round;
    }
    EXPECT_GT(numDifferent, 3u);
}

TEST(Decision, FindsTheOneRowOfThirtyInputs)
{
    std::string literals = "v0";
    for (int input = 1; input < 30; ++input)
        literals += std::string(input % 3 == 0 ? " & ~v" : " & v") + std::to_string(input);
    const Decision decision = Decided(literals, "v0 & ~v0 & " + literals.substr(5));
    ASSERT_TRUE(decision.IsDifferent());
    EXPECT_TRUE(decision.isFirstRow);
    for (size_t input = 0; input < 30; ++input)
        EXPECT_EQ(decision.assignment[input], input == 0 || input % 3 != 0);
}

TEST(Decision, ReordersThousandsOfOperandsWithoutASearch)
{
    std::mt19937_64 random(1);
    std::vector<uint32_t> inputs;
    for (uint32_t input = 0; input < 2000; ++input)
        inputs.push_back(input);
    for (const Operator op : {Operator::And, Operator::Or, Operator::Xor}) {
        const Expression left = Chain(op, inputs, random);
        std::vector<uint32_t> shuffled = inputs;
        std::shuffle(shuffled.begin(), shuffled.end(), random);
        const Decision decision = DecideEqual(left, Chain(op, shuffled, random), {});
        EXPECT_TRUE(decision.IsEqual());
        EXPECT_EQ(decision.proof, Proof::Structure);
        shuffled.back() = shuffled.front(); // one is missing
        EXPECT_FALSE(DecideEqual(left, Chain(op, shuffled, random), {}).IsEqual());
    }
}

TEST(Decision, TakesDeepExpressions)
{
    constexpr uint32_t kDepth = 300000;
    Expression left;
    left.names = Names(3);
    for (uint32_t level = 0; level < kDepth; ++level)
        AddInput(left, level % 3);
    for (uint32_t level = 1; level < kDepth; ++level)
        AddBinary(left, level % 2 == 0 ? Operator::And : Operator::Or, kDepth - 1 - level,
                  static_cast<uint32_t>(left.nodes.size() - 1));
    const Decision decision = DecideEqual(left, left, {});
    EXPECT_TRUE(decision.IsEqual());
    EXPECT_EQ(decision.proof, Proof::Structure);
    Expression inversions;
    inversions.names = left.names;
    uint32_t node = AddInput(inversions, 0);
    for (uint32_t level = 0; level < kDepth; ++level)
        node = AddNot(inversions, node);
    EXPECT_TRUE(DecideEqual(inversions, Parsed("v0"), {}).IsEqual());
}

TEST(Decision, SatisfiesOrSaysNever)
{
    const Decision never = DecideConstant(Parsed("a & (b ^ a) & b"), false, {});
    EXPECT_TRUE(never.IsEqual());
    const Decision some = DecideConstant(Parsed("(a | b) & ~a"), false, {});
    ASSERT_TRUE(some.IsDifferent());
    EXPECT_EQ(some.Row(), 1u);
    EXPECT_TRUE(some.left);
    EXPECT_TRUE(DecideConstant(Parsed("a | ~a"), true, {}).IsEqual());
    EXPECT_EQ(DecideConstant(Parsed("a | b"), true, {}).Row(), 0u);
}

TEST(GateGraph, FoldsToWhatTheOperandsSay)
{
    std::mt19937_64 random(9);
    for (int round = 0; round < 2000; ++round) {
        GateGraph graph(4);
        std::vector<Edge> edges = {kFalseEdge};
        std::vector<uint64_t> values = {0};
        for (uint32_t input = 0; input < 4; ++input) {
            edges.push_back(graph.Input(input));
            values.push_back(InputWord(4, input, 0));
        }
        std::vector<uint64_t> gates = {0};
        for (int step = 0; step < 20; ++step) {
            const auto left = static_cast<size_t>(random() % edges.size());
            const auto right = static_cast<size_t>(random() % edges.size());
            const bool inverts = random() % 2 == 0;
            const uint64_t leftValue = values[left] ^ (inverts ? ~0ull : 0);
            const Edge leftEdge = InvertedIf(edges[left], inverts);
            const bool isAnd = random() % 3 != 0;
            edges.push_back(isAnd ? graph.And(leftEdge, edges[right])
                                  : graph.Xor(leftEdge, edges[right]));
            values.push_back(isAnd ? leftValue & values[right] : leftValue ^ values[right]);
        }
        gates.assign(1, 0);
        for (uint32_t gate = 1; gate < graph.NumGates(); ++gate) {
            const Gate& parts = graph.At(gate);
            if (parts.kind == GateKind::Input) {
                gates.push_back(InputWord(4, parts.left, 0));
                continue;
            }
            const uint64_t left = gates[GateOf(parts.left)] ^ (IsInverted(parts.left) ? ~0ull : 0);
            const uint64_t right =
                gates[GateOf(parts.right)] ^ (IsInverted(parts.right) ? ~0ull : 0);
            gates.push_back(parts.kind == GateKind::And ? left & right : left ^ right);
        }
        for (size_t index = 0; index < edges.size(); ++index)
            ASSERT_EQ(values[index],
                      gates[GateOf(edges[index])] ^ (IsInverted(edges[index]) ? ~0ull : 0));
    }
}

// Questions that only the solver decides.
class SolverDecision : public testing::Test {
  protected:
    void SetUp() override
    {
        if (!Solver::IsThere())
            GTEST_SKIP() << "this build has no solver";
    }
};

TEST_F(SolverDecision, SeesThroughRewriting)
{
    size_t numBySolver = 0;
    for (uint64_t number = 0; number < 300; ++number) {
        const Pair pair = MakePair(number, 120);
        const Decision decision = DecideEqual(pair.left, pair.right, {});
        ASSERT_NE(decision.verdict, Verdict::Undecided);
        ASSERT_TRUE(decision.IsEqual() || !pair.isRewritten) << number;
        numBySolver += decision.proof == Proof::Solver ? 1 : 0;
    }
    EXPECT_GT(numBySolver, 100u);
}

TEST_F(SolverDecision, FindsTheOneAssignmentOfMany)
{
    std::string literals = "x0";
    for (int input = 1; input < 200; ++input)
        literals += std::string(input % 3 == 0 ? " & ~x" : " & x") + std::to_string(input);
    const Decision decision = Decided("y & z | (" + literals + ")", "z & y");
    ASSERT_TRUE(decision.IsDifferent());
    EXPECT_TRUE(decision.left);
    EXPECT_FALSE(decision.right);
}

struct Interrupt : std::runtime_error {
    Interrupt() : std::runtime_error("interrupt") {}
};

std::chrono::steady_clock::time_point interruptAt;

void InterruptWhenItIsTime()
{
    if (std::chrono::steady_clock::now() >= interruptAt)
        throw Interrupt();
}

double SecondsSince(std::chrono::steady_clock::time_point start)
{
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

TEST_F(SolverDecision, EndsWhenTheTimeIsOverAndWhenItIsInterrupted)
{
    const Expression pigeons = Parsed(Pigeons(14));
    auto start = std::chrono::steady_clock::now();
    const Decision decision = DecideConstant(pigeons, false, {0.1});
    EXPECT_LT(SecondsSince(start), 1.0); // allows for a busy machine
    EXPECT_EQ(decision.verdict, Verdict::Undecided);
    EXPECT_TRUE(decision.isTimeOver);
    EXPECT_EQ(decision.reason, "out of time");

    SetWatch(InterruptWhenItIsTime);
    start = std::chrono::steady_clock::now();
    interruptAt = start + std::chrono::milliseconds(100);
    EXPECT_THROW(DecideConstant(pigeons, false, {}), Interrupt);
    SetWatch(nullptr);
    EXPECT_LT(SecondsSince(start), 1.0);
}

TEST_F(SolverDecision, IsNeverGuessed)
{
    EXPECT_TRUE(DecideConstant(Parsed(Pigeons(5)), false, {}).IsEqual());
    EXPECT_EQ(DecideConstant(Parsed(Pigeons(14)), false, {1e-9}).verdict, Verdict::Undecided);
}

TEST(WithoutSolver, SaysSoWhereOnlyThatCouldTell)
{
    if (Solver::IsThere())
        GTEST_SKIP() << "this build has a solver";
    const Decision decision = DecideConstant(Parsed(Pigeons(14)), false, {});
    EXPECT_EQ(decision.verdict, Verdict::Undecided);
    EXPECT_NE(decision.reason.find("no solver"), std::string::npos);
    EXPECT_TRUE(DecideConstant(Parsed(Pigeons(4)), false, {}).IsEqual());
}

TEST(Clauses, SayWhatTheirAssignmentsMean)
{
    const Cnf cnf = ClausesOfDifference(Parsed("a & b"), Parsed("b ^ c"));
    EXPECT_EQ(cnf.names, (std::vector<std::string>{"a", "b", "c"}));
    EXPECT_EQ(ToDimacs(cnf), "c satisfiable when the two expressions differ\n"
                             "c a = 1\nc b = 2\nc c = 3\np cnf 6 12\n"
                             "-4 1 0\n-4 2 0\n4 -1 -2 0\n"
                             "-5 2 3 0\n-5 -2 -3 0\n5 -2 3 0\n5 2 -3 0\n"
                             "-6 4 5 0\n-6 -4 -5 0\n6 -4 5 0\n6 4 -5 0\n6 0\n");
}

// The assignments of the inputs that have the value can be completed, and no others.
TEST(Clauses, AreSatisfiedByTheAssignmentsOfTheValue)
{
    std::mt19937_64 random(11);
    for (int round = 0; round < 300; ++round) {
        const Expression expression =
            RandomExpression(random, 3, static_cast<uint32_t>(random() % 4));
        const bool value = random() % 2 == 0;
        const Cnf cnf = ClausesOfValue(expression, value);
        ASSERT_LE(cnf.numVariables, 12);
        uint64_t rows = 0;
        for (uint32_t assignment = 0; assignment < 1u << cnf.numVariables; ++assignment) {
            bool isSatisfied = true;
            bool isClauseSatisfied = false;
            for (const int literal : cnf.literals) {
                if (literal != 0) {
                    const bool bit = (assignment >> (std::abs(literal) - 1) & 1u) != 0;
                    isClauseSatisfied = isClauseSatisfied || bit == (literal > 0);
                    continue;
                }
                isSatisfied = isSatisfied && isClauseSatisfied;
                isClauseSatisfied = false;
            }
            if (isSatisfied) // the first variable is the most significant input
                rows |= uint64_t(1)
                        << ((assignment & 1u) << 2 | (assignment & 2u) | (assignment >> 2 & 1u));
        }
        const uint64_t column = ToFunction(expression).GetRows().Words()[0];
        ASSERT_EQ(rows, value ? column : ~column & 0xffu) << round;
    }
}

} // namespace
