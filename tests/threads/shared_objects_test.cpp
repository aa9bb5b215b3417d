// Threads that query the same objects without a lock: every answer must be that of a single thread.
// The objects are new in each round, because what they keep for later questions is made only once.
#include <memory>

#include <gtest/gtest.h>

#include <Kq_BoolEquationImp.h>

#include "support/random_text.h"
#include "threads/questions.h"
#include "threads/threads_support.h"

namespace {

using threads::InThreads;
using threads::kNumThreads;
using threads::Question;
using threads::SharedObjects;

typedef std::vector<std::vector<std::string>> Answers; // by question, then by position

bool IsDump(const Question& question)
{
    return std::string(question.name).find("::Dbg()") != std::string::npos;
}

Answers AskAll(const SharedObjects& objects)
{
    Answers answers;
    for (const Question& question : threads::AllQuestions()) {
        answers.emplace_back();
        for (size_t position = 0; position < objects.size(); ++position)
            answers.back().push_back(question.ask(objects, position));
    }
    return answers;
}

// Asks what 'random' chooses, with few dumps, because a dump takes as long as hundreds of answers.
void Ask(const SharedObjects& objects, const Answers& expected, size_t numQuestions,
         support::RandomText& random)
{
    static const std::vector<Question> questions = threads::AllQuestions();
    for (size_t count = 0; count < numQuestions; ++count) {
        size_t number = random.Below(questions.size());
        while (IsDump(questions[number]) && !random.Chance(10))
            number = random.Below(questions.size());
        const size_t position = random.Below(objects.size());
        EXPECT_EQ(expected[number][position], questions[number].ask(objects, position))
            << questions[number].name << ", object " << position;
    }
}

TEST(Threads, QuestionsToSharedObjects)
{
    threads::CountingSink sink;
    for (unsigned int round = 0; round < 8; ++round) {
        const Answers expected = AskAll(SharedObjects(round));
        const SharedObjects objects(round);
        InThreads(kNumThreads, [&](size_t thread) {
            support::RandomText random(100 * round + static_cast<unsigned int>(thread));
            Ask(objects, expected, 300, random);
        });
    }
    sink.Remove();
    EXPECT_EQ(0u, sink.GetNumWrong());
    EXPECT_LT(0u, sink.GetNumMessages());
}

// All threads ask the same question at the same moment, which random questions would rarely do.
TEST(Threads, TheSameQuestionFirst)
{
    const threads::CountingSink sink;
    const std::vector<Question> questions = threads::AllQuestions();
    const Answers expected = AskAll(SharedObjects(7));
    for (size_t number = 0; number < questions.size(); ++number) {
        const SharedObjects objects(7);
        InThreads(kNumThreads, [&](size_t) {
            for (size_t position = 0; position < objects.size(); ++position)
                EXPECT_EQ(expected[number][position], questions[number].ask(objects, position))
                    << questions[number].name << ", object " << position;
        });
    }
}

// One thread switches the debug mode while the others query and copy: more messages, but the same
// answers.
TEST(Threads, QuestionsWhileTheDebugModeIsSwitched)
{
    threads::CountingSink sink;
    Kq_BoolEquationImp::SetInternalDebugMode(false);
    for (unsigned int round = 0; round < 5; ++round) {
        const Answers expected = AskAll(SharedObjects(round, false));
        const SharedObjects objects(round, false);
        std::atomic<size_t> numAsking{kNumThreads - 1};
        InThreads(kNumThreads, [&](size_t thread) {
            support::RandomText random(200 * round + static_cast<unsigned int>(thread));
            if (thread == 0) {
                while (numAsking > 0) {
                    Kq_BoolEquationImp::SetInternalDebugMode(true);
                    EXPECT_TRUE(Kq_BoolEquationImp::GetInternalDebugMode());
                    Ask(objects, expected, 1, random);
                    Kq_BoolEquationImp::SetInternalDebugMode(false);
                    Ask(objects, expected, 10, random);
                }
            } else {
                Ask(objects, expected, 50, random);
                --numAsking;
            }
        });
    }
    sink.Remove();
    EXPECT_FALSE(Kq_BoolEquationImp::GetInternalDebugMode());
    EXPECT_EQ(0u, sink.GetNumWrong());
    EXPECT_LT(0u, sink.GetNumMessages());
}

} // namespace
