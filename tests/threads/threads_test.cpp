// One thread at a time for everything in the process, with synchronisation in between, is enough:
// threads that take turns under one lock, and objects that pass from thread to thread.
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include <Kq_BoolEquation.h>
#include <Kq_BoolEquationImp.h>
#include <port/Port_MsgManData.h>

namespace {

typedef Port::StringBase<char> String;

constexpr int kNumThreads = 4;
constexpr int kNumRounds = 200;

struct Shared {
    std::mutex lock;
    Kq_BoolEquation equation{"A & ~(B | C)"};
    Kq_BoolEquation::TruthTable table;
    Kq_BoolEquation::Handle handle;
    size_t numMessages = 0;
};

// A bit of everything that threads would get in each other's way with: shared nodes, what they
// keep for evaluation, the pool of names, spellings, the debug switch, the sink of messages.
void TakeTurn(Shared& shared, int round, int thread, std::vector<Kq_BoolEquation>& own)
{
    const std::string name = "name_" + std::to_string(round) + "_" + std::to_string(thread % 2);
    own.push_back(shared.equation);
    if (own.size() > 5)
        own.erase(own.begin());
    Kq_BoolEquation& copy = own.front();
    copy.SetVariable("A", 1);
    EXPECT_TRUE(own.back() == shared.equation);
    shared.table = shared.equation;
    shared.handle = shared.equation.GetVariableHandle("B");
    shared.equation.SetVariable(shared.handle, static_cast<unsigned int>(round % 2));
    shared.equation.Eval();
    if (round % 16 == thread)
        shared.equation.SetEquation(("A & ~(B | C) ^ " + name).c_str());
    Kq_BoolEquationImp::SetInternalDebugMode(round % 64 == 0);
    EXPECT_EQ(std::string(Kq_BoolEquation("a+b+c+d+e+f+g*h").GetEquationAlt1(false).c_str()),
              "a|b|c|d|e|f|g&h");
    Kq_BoolEquationImp::SetInternalDebugMode(false);
}

TEST(Threads, TakeTurnsUnderOneLock)
{
    Shared shared;
    const Port_MsgManData::Sink before = Port_MsgManData::setSink(
        [&](const char*, const char*, int, const char*, const char*) { ++shared.numMessages; });
    std::vector<std::thread> threads;
    for (int thread = 0; thread < kNumThreads; ++thread) {
        threads.emplace_back([&shared, thread] {
            std::vector<Kq_BoolEquation> own;
            for (int round = 0; round < kNumRounds; ++round) {
                const std::lock_guard<std::mutex> turn(shared.lock);
                TakeTurn(shared, round, thread, own);
            }
            const std::lock_guard<std::mutex> turn(shared.lock);
            own.clear(); // letting go counts as use: the nodes are shared
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    Port_MsgManData::setSink(before);
    EXPECT_NE(0u, shared.numMessages);
    EXPECT_FALSE(!shared.equation);
}

TEST(Threads, ObjectsPassFromThreadToThread)
{
    std::vector<Kq_BoolEquation> equations;
    std::vector<Kq_BoolEquation::TruthTable> tables;
    for (int round = 0; round < 20; ++round) {
        std::thread maker([&] {
            const std::string text = "made_in_round_" + std::to_string(round) + " ^ B";
            equations.emplace_back(text.c_str());
            equations.push_back(equations.back());
        });
        maker.join();
        std::thread user([&] {
            equations.back().SetVariable("B", 1);
            EXPECT_EQ(1u, equations.back().Eval());
            tables.push_back(equations.back().GetTruthTable());
        });
        user.join();
        EXPECT_EQ("0x6", std::string(equations.back().GetEquationAsHexInitValue(false).c_str()));
        EXPECT_EQ(4u, tables.back().GetRows().size());
        std::thread remover([&] {
            equations.pop_back();
            if (round % 2 != 0)
                tables.clear();
        });
        remover.join();
    }
    EXPECT_EQ(20u, equations.size());
}

} // namespace
