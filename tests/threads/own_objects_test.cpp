// Threads with their own objects, or copies of shared ones: every result must be that of a single
// thread, which runs first. Inside they share names, nodes and what is kept for these.
#include <memory>

#include <gtest/gtest.h>

#include "random/library_sides.h"
#include "random/operations.h"
#include "random/script_player.h"
#include "support/random_text.h"
#include "threads/questions.h"
#include "threads/threads_support.h"

namespace {

using script::Step;
using threads::InThreads;
using threads::kNumThreads;
using threads::SharedObjects;

constexpr unsigned int kNumScripts = 40;
constexpr size_t kNumSteps = 60;

// The debug mode is shared by all threads, so a script must not switch it; its switch only changes
// the limit of tables.
template <class Side>
struct Quiet : Side {
    static void SetDebugMode(bool) {}
};

// Every result of a script and, from time to time, all that an object shows. With shared objects
// the script starts from copies of them and takes more copies on its way.
template <class Side>
std::string Play(unsigned int seed, const std::vector<typename Side::Equation>* shared)
{
    const std::vector<Step> steps =
        script::RandomScript(seed, kNumSteps, std::is_same<Side, script::EngineSide>::value);
    script::Player<Quiet<Side>> player;
    std::string results;
    for (size_t position = 0; position < steps.size(); ++position) {
        if (shared && position % 10 == 0)
            player.Take(position / 10 % script::kNumObjects,
                        (*shared)[(seed + position) % shared->size()]);
        results += player.Play(steps[position]) + "\n";
        if (position % 7 == 0)
            results += player.Look(steps[position].object) + "\n";
    }
    return results;
}

std::string PlayBoth(unsigned int seed, const SharedObjects* shared)
{
    return Play<script::EngineSide>(seed, shared ? &shared->engines : nullptr) +
           Play<script::FacadeSide>(seed, shared ? &shared->equations : nullptr);
}

unsigned int SeedOf(size_t thread, unsigned int number)
{
    return 1000 * static_cast<unsigned int>(thread + 1) + number;
}

TEST(Threads, ScriptsOnOwnObjects)
{
    const threads::CountingSink sink;
    std::vector<std::vector<std::string>> expected(kNumThreads);
    for (size_t thread = 0; thread < kNumThreads; ++thread) {
        for (unsigned int number = 0; number < kNumScripts; ++number)
            expected[thread].push_back(PlayBoth(SeedOf(thread, number), nullptr));
    }
    InThreads(kNumThreads, [&expected](size_t thread) {
        for (unsigned int number = 0; number < kNumScripts; ++number)
            EXPECT_EQ(expected[thread][number], PlayBoth(SeedOf(thread, number), nullptr))
                << "seed " << SeedOf(thread, number);
    });
}

TEST(Threads, ScriptsOnCopiesOfSharedObjects)
{
    threads::CountingSink sink;
    const unsigned int kNumRounds = 20;
    for (unsigned int round = 0; round < kNumRounds; ++round) {
        // Separate objects for each thread, made the same way.
        std::vector<std::string> expected;
        for (size_t thread = 0; thread < kNumThreads; ++thread) {
            const SharedObjects shared(round);
            expected.push_back(PlayBoth(SeedOf(thread, round), &shared));
        }
        // The last holder of the nodes frees them, in whichever thread that is.
        std::vector<SharedObjects> copies(kNumThreads, SharedObjects(round));
        InThreads(kNumThreads, [&](size_t thread) {
            EXPECT_EQ(expected[thread], PlayBoth(SeedOf(thread, round), &copies[thread]))
                << "seed " << SeedOf(thread, round);
            copies[thread].equations.clear();
            copies[thread].engines.clear();
        });
    }
    sink.Remove();
    EXPECT_EQ(0u, sink.GetNumWrong());
    EXPECT_LT(0u, sink.GetNumMessages());
}

std::string View(const operations::Objects& o)
{
    std::string view;
    for (const Engine* engine : {o.a.GetImp(), o.b.GetImp(), &o.engine, &o.other})
        view += Std(engine->GetEquation(true)) + " " + VariablesOf(*engine) + " " +
                std::to_string(engine->Eval()) + "\n";
    return view + std::to_string(o.table.GetRows().size()) + " " +
           std::to_string(o.engineTable.GetRows().size()) + " " + std::to_string(o.handle.size());
}

std::vector<operations::Operation> AllOperations()
{
    std::vector<operations::Operation> all;
    for (const auto* list : {&operations::kOfEquation, &operations::kOfTables,
                             &operations::kOfEngine, &operations::kOfEngineTables})
        all.insert(all.end(), list->begin(), list->end());
    return all;
}

// Runs all operations in a different order for each thread, each on new objects.
std::vector<std::string> RunOperations(size_t thread)
{
    const std::vector<operations::Operation> all = AllOperations();
    support::RandomText random(static_cast<unsigned int>(thread) + 1);
    std::vector<std::string> views;
    for (size_t count = 0; count < 3 * all.size(); ++count) {
        const operations::Operation& operation = all[random.Below(all.size())];
        operations::Objects objects;
        operation.run(objects);
        views.push_back(std::string(operation.name) + "\n" + View(objects));
    }
    return views;
}

TEST(Threads, EveryOperationOnOwnObjects)
{
    const threads::CountingSink sink;
    std::vector<std::vector<std::string>> expected(kNumThreads);
    for (size_t thread = 0; thread < kNumThreads; ++thread)
        expected[thread] = RunOperations(thread);
    InThreads(kNumThreads,
              [&expected](size_t thread) { EXPECT_EQ(expected[thread], RunOperations(thread)); });
}

// Sets unused names, and returns the results without the first part of the names.
std::string UseNewNames(const std::string& first, unsigned int seed)
{
    support::RandomText random(seed);
    std::string told;
    std::vector<Kq_BoolEquation> kept;
    for (int count = 0; count < 40; ++count) {
        std::vector<std::string> names;
        for (size_t number = 0; number < 6; ++number)
            names.push_back(first + std::to_string(random.Below(100)) + "_" +
                            std::to_string(number));
        kept.emplace_back(support::ToPort(random.WellFormed(12, names, true)));
        kept.back().SetVariable(support::ToPort(random.OneOf(names)), 1);
        kept.back().DefineVariable(support::ToPort(first + "defined"), 1);
        std::string text = support::ToStd(kept.back().GetEquationAlt2(true)) + " " +
                           VariablesOf(kept.back()) + " " + std::to_string(kept.back().Eval()) +
                           std::to_string(kept.back() == kept.front());
        for (size_t found = text.find(first); found != std::string::npos; found = text.find(first))
            text.erase(found, first.size());
        told += text + "\n";
    }
    return told;
}

TEST(Threads, NewNames)
{
    for (unsigned int round = 0; round < 10; ++round) {
        const std::string number = std::to_string(100 + round);
        // Two threads use the same new names in the same order, the others similar names.
        const auto firstOf = [&number](size_t thread) {
            return std::string(thread < 2 ? "x"
                                          : std::string(1, static_cast<char>('x' + thread - 1))) +
                   "new" + number + "_a_name_of_some_length_";
        };
        std::vector<std::string> expected;
        for (size_t thread = 0; thread < kNumThreads; ++thread)
            expected.push_back(UseNewNames("wnew" + number + "_a_name_of_some_length_",
                                           round * 10 + static_cast<unsigned int>(thread) / 2));
        InThreads(kNumThreads, [&](size_t thread) {
            EXPECT_EQ(
                expected[thread],
                UseNewNames(firstOf(thread), round * 10 + static_cast<unsigned int>(thread) / 2));
        });
    }
}

// An object passes from thread to thread; joining is the only synchronisation.
TEST(Threads, ObjectsPassFromThreadToThread)
{
    std::vector<Kq_BoolEquation> equations;
    std::vector<Kq_BoolEquation::TruthTable> tables;
    for (int round = 0; round < 20; ++round) {
        InThreads(1, [&](size_t) {
            const std::string text = "made_in_round_" + std::to_string(round) + " ^ B";
            equations.emplace_back(text.c_str());
            equations.push_back(equations.back());
        });
        InThreads(1, [&](size_t) {
            equations.back().SetVariable("B", 1);
            EXPECT_EQ(1u, equations.back().Eval());
            tables.push_back(equations.back().GetTruthTable());
        });
        EXPECT_EQ("0x6", Std(equations.back().GetEquationAsHexInitValue(false)));
        EXPECT_EQ(4u, tables.back().GetRows().size());
        InThreads(1, [&](size_t) {
            equations.pop_back();
            if (round % 2 != 0)
                tables.clear();
        });
    }
    EXPECT_EQ(20u, equations.size());
}

// Copies share their tokens, and each ends up as if it were alone.
TEST(Threads, BuildCopiesOfTheSameTokens)
{
    const threads::CountingSink sink;
    for (unsigned int round = 0; round < 100; ++round) {
        const bool isRefused = round % 2 != 0;
        Engine tokens;
        tokens.TokenizeNodes(isRefused ? "A & B ~ | C D" : "A & B ~ | C");
        std::vector<Engine> copies(kNumThreads, tokens);
        InThreads(kNumThreads, [&](size_t thread) {
            Engine& copy = copies[thread];
            copy.BuildTree();
            copy.TokenizeNodes("P"); // if the text was refused, the list is empty
            copy.BuildTree();
            EXPECT_EQ(isRefused ? "P" : "AND(A, NOT(OR(B, C)))", TreeText(copy.GetRoot()));
        });
    }
}

} // namespace
