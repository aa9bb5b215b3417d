// Threads that disturb each other as far as allowed: a sink is exchanged while others report, or
// memory runs out for one of them. What succeeds must give a single thread's answer.
#include <memory>
#include <new>

#include <gtest/gtest.h>

#include "random/failing_memory.h"
#include "random/operations.h"
#include "support/random_text.h"
#include "threads/questions.h"
#include "threads/threads_support.h"

namespace {

using memory::FailingAllocation;
using operations::Objects;
using operations::Operation;
using threads::InThreads;
using threads::kNumThreads;
using threads::Question;
using threads::SharedObjects;

// Dumps an object of this thread, and a refused text.
void Report(size_t thread, int round)
{
    const std::string name = "name_" + std::to_string(thread) + "_" + std::to_string(round);
    Kq_BoolEquation equation((name + " & ~(B ~ | C)").c_str());
    equation.Dbg();
    EXPECT_FALSE(equation.SetEquation((name + " & | B").c_str()));
    EXPECT_EQ("", VariablesOf(equation));
}

TEST(Threads, ReportsWhileTheSinkIsExchanged)
{
    const int kNumRounds = 20;
    size_t expected = 0;
    {
        threads::CountingSink sink;
        for (size_t thread = 1; thread < kNumThreads; ++thread) {
            for (int round = 0; round < kNumRounds; ++round)
                Report(thread, round);
        }
        sink.Remove();
        expected = sink.GetNumMessages();
        EXPECT_EQ(0u, sink.GetNumWrong());
    }
    threads::CountingSink first;
    size_t numOfBrief = 0;
    size_t numWrong = 0;
    std::atomic<size_t> numReporting{kNumThreads - 1};
    InThreads(kNumThreads, [&](size_t thread) {
        if (thread == 0) {
            while (numReporting > 0) {
                first.Exchange();
                threads::CountingSink brief; // restores the first sink when it is destroyed
                Kq_BoolEquationImp::SetInternalDebugMode(false);
                std::this_thread::yield();
                brief.Remove();
                numOfBrief += brief.GetNumMessages();
                numWrong += brief.GetNumWrong();
            }
        } else {
            for (int round = 0; round < kNumRounds; ++round)
                Report(thread, round);
            --numReporting;
        }
    });
    first.Remove();
    EXPECT_EQ(expected, first.GetNumMessages() + numOfBrief);
    EXPECT_EQ(0u, numWrong + first.GetNumWrong());
}

// The state of an equation as threads can see it.
std::string View(const Engine& engine)
{
    return Std(engine.GetEquation(true)) + " " + TreeText(engine.GetRoot()) + " " +
           VariablesOf(engine) + " " + Std(engine.GetEquationAsHexInitValue(false)) + " " +
           std::to_string(engine.Eval());
}

// Checks that the objects answer and take new values, whatever has failed.
void Use(Objects& o)
{
    for (Kq_BoolEquation* equation : {&o.a, &o.b}) {
        equation->Eval();
        equation->GetEquation(true);
        const Kq_BoolEquation copy(*equation);
        EXPECT_TRUE(copy == *equation);
        EXPECT_EQ(VariablesOf(copy), VariablesOf(*equation));
        ASSERT_TRUE(equation->SetEquation("a_name_that_needs_memory & ~B"));
        EXPECT_EQ("0x4", Std(equation->GetEquationAsHexInitValue(false)));
    }
    o.engine.SetEquation("A ^ B");
    EXPECT_EQ("A ^ B XOR(A, B) A0 B0 0x6 0", View(o.engine));
    o.other = o.engine;
    EXPECT_EQ(View(o.engine), View(o.other));
    o.table = o.a;
    EXPECT_EQ(4u, o.table.GetRows().size());
    EXPECT_EQ("A", Std(o.pool.find("A")));
}

// Runs operations that sometimes fail, on objects whose nodes all threads share. Returns the number
// of failures.
size_t FailSome(size_t thread, const Objects& shared, size_t numOperations)
{
    std::vector<Operation> all;
    for (const auto* list : {&operations::kOfEquation, &operations::kOfTables,
                             &operations::kOfEngine, &operations::kOfEngineTables})
        all.insert(all.end(), list->begin(), list->end());
    support::RandomText random(static_cast<unsigned int>(thread) + 1);
    size_t numFailed = 0;
    for (size_t count = 0; count < numOperations; ++count) {
        const Operation& operation = all[random.Below(all.size())];
        Objects objects;
        objects.a = shared.a;
        objects.b = shared.b;
        objects.engine = shared.engine;
        objects.other = shared.other;
        const Engine witness(objects.engine);
        const std::string before = View(witness);
        try {
            const FailingAllocation armed(random.Below(random.Chance(80) ? 6 : 60));
            operation.run(objects);
        } catch (const std::bad_alloc&) {
            ++numFailed;
        }
        EXPECT_EQ(before, View(witness)) << operation.name;
        Use(objects);
    }
    return numFailed;
}

TEST(Threads, OperationsWhoseAllocationsFail)
{
    const threads::CountingSink sink;
    size_t numLive = 0;
    for (int round = 0; round < 3; ++round) {
        std::vector<size_t> numFailed(kNumThreads);
        {
            const Objects shared;
            InThreads(kNumThreads,
                      [&](size_t thread) { numFailed[thread] = FailSome(thread, shared, 100); });
        }
        for (const size_t failed : numFailed)
            EXPECT_LT(10u, failed);
        // The first round fills what the process keeps: names and spellings.
        if (round == 0)
            numLive = memory::NumLive();
    }
    EXPECT_GE(numLive, memory::NumLive()) << "something leaks";
}

// Memory runs out for one thread while another asks the same: no answer is wrong, and deferred
// work, such as an owed tree, is available for the next question.
TEST(Threads, QuestionsWhoseAllocationsFail)
{
    const threads::CountingSink sink;
    const std::vector<Question> questions = threads::AllQuestions();
    std::atomic<size_t> numFailed{0};
    size_t numLive = 0;
    for (unsigned int round = 0; round < 6; ++round) {
        {
            const SharedObjects single(round % 3);
            const SharedObjects objects(round % 3);
            std::vector<std::vector<std::string>> expected;
            for (const Question& question : questions) {
                expected.emplace_back();
                for (size_t position = 0; position < single.size(); ++position)
                    expected.back().push_back(question.ask(single, position));
            }
            InThreads(kNumThreads, [&](size_t thread) {
                support::RandomText random(50 * (round % 3) + static_cast<unsigned int>(thread));
                for (size_t count = 0; count < 200; ++count) {
                    const size_t number = random.Below(questions.size());
                    const size_t position = random.Below(objects.size());
                    try {
                        std::string answer;
                        {
                            const FailingAllocation armed(random.Below(12));
                            answer = questions[number].ask(objects, position);
                        }
                        EXPECT_EQ(expected[number][position], answer) << questions[number].name;
                    } catch (const std::bad_alloc&) {
                        ++numFailed;
                    }
                }
            });
            // Afterwards all answers are available.
            for (size_t number = 0; number < questions.size(); ++number) {
                for (size_t position = 0; position < objects.size(); ++position)
                    EXPECT_EQ(expected[number][position], questions[number].ask(objects, position))
                        << questions[number].name;
            }
        }
        if (round == 2)
            numLive = memory::NumLive();
    }
    EXPECT_LT(500u, numFailed);
    EXPECT_GE(numLive, memory::NumLive()) << "something leaks";
}

} // namespace
