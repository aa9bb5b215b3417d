// A program outside the build that uses the installed second library; exits with 1 if a result is
// wrong.
#include <cstdio>
#include <string>

#include <kq_logic/convert.h>
#include <kq_logic/decide.h>
#include <kq_logic/explain.h>
#include <kq_logic/match.h>
#include <kq_logic/permute.h>
#include <kq_logic/short_form.h>
#include <kq_logic/watch.h>

static int s_numWrong = 0;

static void Expect(const char* what, const std::string& expected, const std::string& actual)
{
    if (expected == actual)
        return;
    std::printf("%s: expected '%s', got '%s'\n", what, expected.c_str(), actual.c_str());
    ++s_numWrong;
}

int main()
{
    using namespace kq_logic;
    SetWatch(nullptr);
    Function function;
    Expect("set", "1", std::to_string(function.Set(Kq_BoolEquation("(S & A) | (~S & B)"))));
    Expect("hexadecimal", "0xca", function.Hex());
    Expect("kind", "multiplexer", Explain(function).kind);
    Expect("operands", "4", std::to_string(FindShortForm(function).numOperands));
    Function permuted;
    Expect("permuted", "", Permute(function, {"S", "B", "A"}, permuted));
    Expect("match", "1", std::to_string(Match(function, permuted, MatchScope::Order).isFound));
    Expect("converted", "(a | b) & c\n", Convert(Kq_BoolEquation("a | b & c"), "c").text);
    const Decision decision = DecideEqual(Kq_BoolEquation("~(A & B)"), Kq_BoolEquation("~A | ~B"));
    Expect("equal", "1", std::to_string(decision.verdict == Verdict::Equal));
    std::printf("%d wrong\n", s_numWrong);
    return s_numWrong ? 1 : 0;
}
