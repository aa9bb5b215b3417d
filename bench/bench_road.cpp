// The whole road: from text to an init value or to one value, and from an init value to the text of
// an expression. The object is made and destroyed each time.
#include <Kq_BoolEquationImp.h>

#include "support/cases.h"
#include "support/formulas.h"
#include "support/plain_parser.h"
#include "support/texts.h"

namespace {

bench::Case MakeToInitValue(const std::string& text, unsigned int numVariables)
{
    bench::Case made;
    made.isRight = [=] {
        const Kq_BoolEquation equation(text.c_str());
        return equation.GetNumVariables() == numVariables &&
               bench::WriteInitValue(bench::EvaluateColumn(equation), numVariables) ==
                   equation.GetEquationAsHexInitValue(false).c_str();
    };
    made.ours = [=](benchmark::State& state) {
        const Port::StringBase<char> equationText(text.c_str());
        for (auto _ : state) {
            Kq_BoolEquation equation;
            equation.SetEquation(equationText);
            benchmark::DoNotOptimize(equation.GetEquationAsHexInitValue(false));
        }
        bench::SetItems(state, double(uint64_t(1) << numVariables), "row");
    };
    return made;
}

// Only one value: whatever is prepared for evaluation is paid for here.
bench::Case MakeToValue(const std::string& text)
{
    bench::Case made;
    made.isRight = [=] {
        const Kq_BoolEquation equation(text.c_str());
        bench::PlainEquation plain;
        return plain.Parse(text.c_str()) && equation.Eval() == plain.Eval();
    };
    made.ours = [=](benchmark::State& state) {
        const Port::StringBase<char> equationText(text.c_str());
        for (auto _ : state) {
            Kq_BoolEquation equation;
            equation.SetEquation(equationText);
            benchmark::DoNotOptimize(equation.Eval());
        }
        const Kq_BoolEquation equation(equationText);
        bench::SetItems(state, double(bench::CountNodes(equation.GetImp()->GetRoot())), "token");
    };
    return made;
}

bench::Case MakeFromInitValue(unsigned int numVariables)
{
    const std::string value = bench::MakeInitValue(numVariables, 1);
    const std::vector<Port::StringBase<char>> names = bench::MakeNames(numVariables);
    bench::Case made;
    made.isRight = [=] {
        Kq_BoolEquation equation;
        equation.SetEquationWithExplicitTerms(names, value.c_str(), false, false);
        Kq_BoolEquation again;
        again.SetEquationWithExplicitTerms(names, equation.GetEquationAsExpression(false), false,
                                           false);
        return value == again.GetEquationAsHexInitValue(false).c_str();
    };
    made.ours = [=](benchmark::State& state) {
        const Port::StringBase<char> valueText(value.c_str());
        for (auto _ : state) {
            Kq_BoolEquation equation;
            equation.SetEquationWithExplicitTerms(names, valueText, false, false);
            benchmark::DoNotOptimize(equation.GetEquationAsExpression(false));
        }
        bench::SetItems(state, double(uint64_t(1) << numVariables), "row");
    };
    return made;
}

} // namespace

void bench::AddCases()
{
    AddSingle("to_init_value/typical/n=6",
              [] { return MakeToInitValue("~(x0 & x1) ^ (x2 | ~x3 & x4) ~| x5 & (x0 ^ x3)", 6); });
    for (unsigned int numVariables : {10u, 16u, 20u})
        for (const Formula& formula : GetColumnFormulas(numVariables))
            if (formula.GetName() == "tree/1")
                AddSingle("to_init_value/typical/n=" + std::to_string(numVariables),
                          [=] { return MakeToInitValue(formula.text, numVariables); });
    for (unsigned int numVariables : {4u, 6u, 10u, 16u, 20u}) {
        const std::string size = "/n=" + std::to_string(numVariables);
        AddSingle("to_init_value/wide" + size, [=] {
            return MakeToInitValue(MakeWide(4 * numVariables + 1, numVariables), numVariables);
        });
        AddSingle("to_init_value/deep" + size, [=] {
            return MakeToInitValue(MakeDeep(10 * numVariables + 1, numVariables), numVariables);
        });
    }
    for (const Shape& shape : GetShapes())
        for (size_t numTokens : {20u, 100u, 1000u, 10000u})
            AddSingle("to_value/" + shape.name + "/" + std::to_string(numTokens),
                      [=] { return MakeToValue(shape.make(numTokens, 16)); });
    for (unsigned int numVariables : {2u, 4u, 6u, 8u, 10u, 12u, 14u})
        AddSingle("from_init_value/n=" + std::to_string(numVariables),
                  [=] { return MakeFromInitValue(numVariables); });
}
