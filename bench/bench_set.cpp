// Setting an equation: tokens, tree and variables. The object is made, set and destroyed.
#include <algorithm>

#include <Kq_BoolEquationImp.h>

#include "support/cases.h"
#include "support/plain_parser.h"
#include "support/texts.h"

namespace {

bench::Body TimeSetting(const std::string& text)
{
    return [text](benchmark::State& state) {
        const Port::StringBase<char> equationText(text.c_str());
        for (auto _ : state) {
            Kq_BoolEquation equation;
            benchmark::DoNotOptimize(equation.SetEquation(equationText));
        }
        const Kq_BoolEquation equation(equationText);
        bench::SetItems(state, double(bench::CountNodes(equation.GetImp()->GetRoot())), "token");
    };
}

// Whether both give the same value for all assignments, or for 4096 of them if there are more.
bool AreEqual(Kq_BoolEquation& equation, bench::PlainEquation& plain)
{
    const size_t numVariables = plain.GetVariables().size();
    if (equation.GetNumVariables() != numVariables)
        return false;
    for (uint64_t row = 0; row < 4096; ++row) {
        const uint64_t bits = numVariables > 12 ? row * 0x9e3779b97f4a7c15u : row;
        for (size_t variable = 0; variable < numVariables; ++variable) {
            plain.GetVariables()[variable].second = bits >> variable % 64 & 1u;
            equation.SetVariable(plain.GetVariables()[variable].first.c_str(),
                                 bits >> variable % 64 & 1u);
        }
        if (equation.Eval() != plain.Eval())
            return false;
    }
    return true;
}

bench::Case MakePair(const std::string& text, size_t numTokens)
{
    bench::Case made;
    made.isRight = [=] {
        Kq_BoolEquation equation;
        bench::PlainEquation plain;
        return equation.SetEquation(text.c_str()) && plain.Parse(text.c_str()) &&
               bench::CountNodes(equation.GetImp()->GetRoot()) == numTokens &&
               AreEqual(equation, plain);
    };
    made.ours = TimeSetting(text);
    made.baseline = [=](benchmark::State& state) {
        for (auto _ : state) {
            bench::PlainEquation plain;
            benchmark::DoNotOptimize(plain.Parse(text.c_str()));
        }
        bench::SetItems(state, double(numTokens), "token");
    };
    return made;
}

// Too long to check by evaluation; the tree gives the text back.
bench::Case MakeLong(const std::string& text)
{
    bench::Case made;
    made.isRight = [=] {
        Kq_BoolEquation equation;
        std::string closed = text;
        closed.erase(std::remove(closed.begin(), closed.end(), ' '), closed.end());
        return equation.SetEquation(text.c_str()) &&
               closed == equation.GetEquationAlt1(false).c_str();
    };
    made.ours = TimeSetting(text);
    return made;
}

void AddLong(const std::string& kind, size_t size, std::string (*make)(size_t, size_t),
             size_t numNames)
{
    bench::AddSingle("set_long/" + kind + "/" + std::to_string(size),
                     [=] { return MakeLong(make(size, numNames)); });
}

} // namespace

void bench::AddCases()
{
    for (unsigned int seed : {1u, 2u, 3u, 4u, 5u}) {
        AddPair("set/12_tokens/typical/" + std::to_string(seed),
                [=] { return MakePair(MakeTypical(12, 6, seed), 12); });
        AddPair("set/100_tokens/typical/" + std::to_string(seed),
                [=] { return MakePair(MakeTypical(100, 12, seed), 100); });
    }
    AddPair("set/100_tokens/wide/1", [] { return MakePair(MakeWide(101, 12), 101); });
    AddPair("set/100_tokens/deep/1", [] { return MakePair(MakeDeep(101, 12), 101); });
    for (size_t size : {100u, 1000u, 10000u, 100000u, 1000000u}) {
        AddLong(
            "typical", size,
            [](size_t tokens, size_t names) { return MakeTypical(tokens, names, 1); }, 20);
        AddLong("chain", size, MakeWide, 20);
        AddLong("nesting", size, MakeDeep, 20);
        AddLong("nesting_left", size, MakeDeepLeft, 20);
        AddLong("names", size, MakeWide, 100000);
    }
}
