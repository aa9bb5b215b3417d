// Dumps and traces, byte for byte: each scenario's messages against the .ok file of the same name.
// To make a new or changed file, run with KQ_GOLDEN_WRITE set, and review it like code.
#include <cstdlib>
#include <fstream>
#include <sstream>

#include <gtest/gtest.h>

#include "unit/unit_support.h"

namespace {

std::string FileOf(const std::string& scenario)
{
    const std::string source = __FILE__;
    return source.substr(0, source.rfind('/') + 1) + scenario + ".ok";
}

std::string ReadFile(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

// Compares the messages that 'play' issues with the scenario's file.
template <class Play>
void ExpectGolden(const std::string& scenario, Play play)
{
    Messages messages;
    play();
    if (std::getenv("KQ_GOLDEN_WRITE")) {
        std::ofstream(FileOf(scenario), std::ios::binary) << messages.Text();
        return;
    }
    EXPECT_EQ(ReadFile(FileOf(scenario)), messages.Text()) << FileOf(scenario);
}

void SetAndDump(const char* text)
{
    Kq_BoolEquation equation(text);
    equation.Dbg();
}

TEST(Golden, DumpOfEveryOperator)
{
    ExpectGolden("dump_operators", [] {
        SetAndDump("(a & b | c) ^ ~d");
        SetAndDump("a .NAND. b !| 0 ~@ 1 * !!'quoted name'");
    });
}

TEST(Golden, DumpOfNegatedOperators)
{
    ExpectGolden("dump_negated_operators", [] {
        SetAndDump("X ~ | Y");
        SetAndDump("P & X ~ ~ | Y & Q");
        SetAndDump("(A ~ & B) | C ~ ^ (D)");
        SetAndDump("P & (~ | Y)");
    });
}

TEST(Golden, DumpOfAnInitValue)
{
    ExpectGolden("dump_init_value", [] {
        Kq_BoolEquation equation;
        equation.SetEquationWithExplicitTerms({"sel", "a", "b"}, "0xCa", false, false);
        equation.SetVariable("a", 1);
        equation.Dbg();
        equation.GetVariableHandle("sel").Dbg();
        equation.SetEquation("0b1");
        equation.Clear();
        equation.SetEquation("0b1");
        equation.Dbg();
    });
}

TEST(Golden, DumpsOfRefusedTexts)
{
    ExpectGolden("refusals", [] {
        for (const char* text : {"a b", "a &", "~ & a", "a & ~ | b", "(a ~ & b) c", "0x1G", ")a(",
                                 "a & (b | ~)", "1 0 & a", "() a b", "a ~ & ~ | b"})
            Kq_BoolEquation equation(text);
    });
}

TEST(Golden, TraceOfBuildingAndEvaluating)
{
    ExpectGolden("trace", [] {
        const DebugMode debugMode;
        Kq_BoolEquation equation("a & (b ~ | ~c) ^ 1");
        equation.SetVariable("a", 1);
        equation.Eval();
        equation.SetEquation("P & X ~ | Y");
        equation.Eval();
        equation.SetEquation("a b (");
        equation.SetEquation("a b )(");
        equation.SetEquationWithExplicitTerms({"p", "q"}, "0x6", false, false);
        equation.GetEquationAsHexInitValue(false);
        equation.Dbg();
    });
}

} // namespace
