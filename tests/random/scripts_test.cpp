// Random scripts over objects that share nodes, on engine and facade, against the model. Every
// other script looks at the objects after each step; the rest ask only what their steps ask,
// because a look may complete what an answer has put off. A failure prints the seed and the script,
// reduced to the steps that it needs.
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
