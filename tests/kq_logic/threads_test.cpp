// Four threads ask everything at once, about their own objects and about shared ones; each answer
// must be that of a single thread. The thread sanitizer sees what they share inside.
#include <functional>
#include <random>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include <kq_logic/convert.h>
#include <kq_logic/decide.h>
#include <kq_logic/explain.h>
#include <kq_logic/match.h>
#include <kq_logic/netlist_compare.h>
#include <kq_logic/permute.h>
#include <kq_logic/short_form.h>
#include <kq_logic/watch.h>

namespace {

using namespace kq_logic;

constexpr size_t kNumThreads = 4;

// Texts of three to six inputs with every operator.
std::vector<std::string> RandomTexts(size_t count)
{
    std::mt19937 random(20261122);
    const std::vector<std::string> operators = {" & ", " | ", " ^ ", " ~& ", " ~| ", " ~^ "};
    std::vector<std::string> texts;
    for (size_t text = 0; text < count; ++text) {
        const size_t numInputs = 3 + text % 4;
        std::string written = "v0";
        for (size_t operand = 1; operand < 3 * numInputs; ++operand) {
            const bool isGroup = random() % 3 == 0;
            written = (isGroup ? "~(" + written + ")" : written) +
                      operators[random() % operators.size()] + "v" +
                      std::to_string(operand < numInputs ? operand : random() % numInputs);
        }
        texts.push_back(written);
    }
    return texts;
}

// Everything that can be asked about a pair of equations, as one text.
std::string AnswersAbout(const Kq_BoolEquation& left, const Kq_BoolEquation& right)
{
    Function first;
    Function second;
    EXPECT_TRUE(first.Set(left) && second.Set(right));
    std::string answers = first.Hex() + ' ' + second.Binary();
    const Decision decision = DecideEqual(left, right);
    answers += ' ' + std::to_string(static_cast<int>(decision.verdict));
    for (const bool value : decision.assignment)
        answers += value ? '1' : '0';
    answers += std::to_string(static_cast<int>(DecideConstant(left, false).verdict));
    answers += ' ' + Explain(first).text + ' ' + FindShortForm(first).text;
    const Matching matching = Match(first, second, MatchScope::OrderAndInversions);
    if (matching.isFound)
        answers += ' ' + Apply(matching, first, second.Inputs()).Hex();
    std::vector<std::string> inputs(first.Inputs().rbegin(), first.Inputs().rend());
    Function permuted;
    answers += Permute(first, inputs, permuted) + ' ' + permuted.Hex();
    for (const char* target : {"verilog", "vhdl", "c", "blif"})
        answers += ' ' + Convert(left, target).text;
    Netlist netlist;
    std::string fault;
    EXPECT_TRUE(netlist.ReadText(Convert(left, "blif").text, fault)) << fault;
    const NetlistComparison comparison = Compare(netlist, netlist);
    return answers + ' ' + netlist.At(0).init + (comparison.isSame ? " same" : " different");
}

void InThreads(const std::function<void(size_t)>& work)
{
    std::vector<std::thread> threads;
    for (size_t thread = 0; thread < kNumThreads; ++thread)
        threads.emplace_back(work, thread);
    for (std::thread& thread : threads)
        thread.join();
}

TEST(LogicThreads, AnswerAsOneThreadDoes)
{
    const std::vector<std::string> texts = RandomTexts(40);
    std::vector<Kq_BoolEquation> shared;
    for (const std::string& text : texts)
        shared.emplace_back(text.c_str());
    std::vector<std::vector<std::string>> answers(kNumThreads);
    InThreads([&](size_t thread) {
        for (size_t text = 0; text < texts.size(); ++text) {
            const Kq_BoolEquation own(texts[text].c_str());
            const Kq_BoolEquation& other = shared[(text + 4) % shared.size()];
            answers[thread].push_back(thread % 2 == 0 ? AnswersAbout(own, other)
                                                      : AnswersAbout(shared[text], other));
        }
    });
    for (size_t text = 0; text < texts.size(); ++text) {
        const std::string alone = AnswersAbout(shared[text], shared[(text + 4) % texts.size()]);
        for (size_t thread = 0; thread < kNumThreads; ++thread)
            EXPECT_EQ(answers[thread][text], alone) << texts[text];
    }
}

TEST(LogicThreads, ShareOneFunction)
{
    Function function;
    ASSERT_TRUE(function.Set(Kq_BoolEquation("S & A | (~S & B) ^ C & D | E & F")));
    const std::string alone = FindShortForm(function).text + Explain(function).text;
    std::vector<std::string> answers(kNumThreads);
    InThreads([&](size_t thread) {
        const Function copy = function;
        answers[thread] = FindShortForm(thread % 2 == 0 ? function : copy).text;
        answers[thread] += Explain(function).text;
    });
    for (const std::string& answer : answers)
        EXPECT_EQ(answer, alone);
}

void WatchQuietly() {}

TEST(LogicThreads, ExchangeTheWatcher)
{
    const std::string alone = Convert(Kq_BoolEquation("a | b & c"), "verilog").text;
    InThreads([&](size_t thread) {
        for (size_t round = 0; round < 20; ++round) {
            if (thread == 0)
                SetWatch(round % 2 == 0 ? WatchQuietly : nullptr);
            EXPECT_EQ(Convert(Kq_BoolEquation("a | b & c"), "verilog").text, alone);
        }
    });
    SetWatch(nullptr);
}

} // namespace
