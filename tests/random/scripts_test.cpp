// Random scripts over objects that share nodes, on engine and facade, against the model. Every
// second script looks at the objects after each step; the others ask only what their steps ask,
// because a look may complete deferred work. A failure prints the seed and the script, reduced to
// the necessary steps.
#include <algorithm>
#include <numeric>

#include <gtest/gtest.h>

#include "random/script_run.h"

namespace {

using script::Side;

void ExpectScriptsAgree(Side side, unsigned int firstSeed, unsigned int numScripts, size_t numSteps)
{
    for (unsigned int seed = firstSeed; seed < firstSeed + numScripts; ++seed) {
        const bool looksOften = seed % 2 == 0;
        const std::vector<script::Step> steps =
            script::RandomScript(seed, numSteps, side == Side::Engine);
        if (!script::Run(side, steps, looksOften).empty()) {
            const std::vector<script::Step> shrunk = script::Shrink(side, steps, looksOften);
            FAIL() << "seed " << seed << "\n"
                   << script::Describe(shrunk) << script::Run(side, shrunk, looksOften);
        }
    }
}

script::Step Ask(size_t object, unsigned int question)
{
    script::Step step;
    step.op = script::Op::Ask;
    step.object = object;
    step.other = 3;
    step.value = question;
    return step;
}

script::Step WithName(script::Op op, size_t object, const std::string& name)
{
    script::Step step;
    step.op = op;
    step.object = object;
    step.text = name;
    return step;
}

// Sets an init value, copies it, and asks the questions in every possible order.
void ExpectEveryOrderAgrees(Side side, const std::vector<std::string>& terms,
                            const std::string& text, bool termOrderFlag)
{
    script::Step set;
    set.op = script::Op::SetTerms;
    set.terms = terms;
    set.text = text;
    set.firstFlag = termOrderFlag;
    script::Step setOther = set;
    setOther.object = 3;
    setOther.firstFlag = !termOrderFlag;
    script::Step copy;
    copy.op = script::Op::CreateCopy;
    copy.object = 1;
    // Value, tree, rendering, digits, comparison with object 3; a handle, a new variable.
    const std::vector<script::Step> questions = {Ask(0, 4),
                                                 Ask(1, 5),
                                                 Ask(1, 10),
                                                 Ask(0, 14),
                                                 Ask(0, 8),
                                                 WithName(script::Op::GetHandle, 1, "b"),
                                                 WithName(script::Op::Define, 0, "new")};
    std::vector<size_t> order(questions.size());
    std::iota(order.begin(), order.end(), size_t(0));
    size_t numOrders = 0;
    do {
        std::vector<script::Step> steps = {set, setOther, copy};
        for (const size_t position : order)
            steps.push_back(questions[position]);
        const std::string difference = script::Run(side, steps, false);
        ASSERT_EQ("", difference) << script::Describe(steps);
        ++numOrders;
    } while (std::next_permutation(order.begin(), order.end()));
    EXPECT_EQ(5040u, numOrders);
}

TEST(Scripts, InitValuesAnswerTheSameInEveryOrder)
{
    for (const Side side : {Side::Engine, Side::Facade}) {
        ExpectEveryOrderAgrees(side, {"a", "b"}, "0x4", false);
        ExpectEveryOrderAgrees(side, {"a", "b", "c"}, "0b11011", true);
        ExpectEveryOrderAgrees(side, {"'a'+b", "c"}, "0x1", false);
    }
}

TEST(Scripts, ShortEngineScriptsAgreeWithTheModel)
{
    ExpectScriptsAgree(Side::Engine, 1, 6000, 15);
}

TEST(Scripts, LongEngineScriptsAgreeWithTheModel)
{
    ExpectScriptsAgree(Side::Engine, 100001, 1000, 120);
}

TEST(Scripts, ShortFacadeScriptsAgreeWithTheModel)
{
    ExpectScriptsAgree(Side::Facade, 200001, 6000, 15);
}

TEST(Scripts, LongFacadeScriptsAgreeWithTheModel)
{
    ExpectScriptsAgree(Side::Facade, 300001, 1000, 120);
}

} // namespace
