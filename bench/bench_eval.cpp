// Evaluation for variable values that change from one call to the next.
#include <memory>

#include <Kq_BoolEquationImp.h>

#include "support/cases.h"
#include "support/formulas.h"
#include "support/plain_parser.h"
#include "support/texts.h"

namespace {

typedef std::vector<Kq_BoolEquation::Handle> Handles;
typedef std::shared_ptr<Kq_BoolEquation> EquationPointer;

// Values that differ from call to call, at the cost of one addition.
uint64_t NextBits(uint64_t bits)
{
    return bits + 0x9e3779b97f4a7c15u;
}

// A number below 'limit' made from the upper half of 'bits'.
size_t Pick(uint64_t bits, size_t limit)
{
    return (bits >> 32) * limit >> 32;
}

Handles GetHandles(const Kq_BoolEquation& equation)
{
    Handles handles;
    for (const auto& variable : equation.GetVariables())
        handles.push_back(equation.GetVariableHandle(variable.first));
    return handles;
}

bool IsSameFunction(Kq_BoolEquation& equation, const Handles& handles, bench::Function function)
{
    uint64_t bits = 1;
    for (int call = 0; call < 10000; ++call, bits = NextBits(bits)) {
        unsigned int values[64];
        for (size_t variable = 0; variable < handles.size(); ++variable) {
            values[variable] = bits >> (variable + 16) & 1u;
            equation.SetVariable(handles[variable], values[variable]);
        }
        if (equation.Eval() != function(values))
            return false;
    }
    return true;
}

// Sets all variables by handle, then evaluates the equation.
bench::Case MakeSetAll(const bench::Formula& formula)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>();
    bench::SetFormula(formula, *equation);
    const Handles handles = GetHandles(*equation);
    const bench::Function function = bench::GetFunction(formula);
    bench::Case made;
    made.isRight = [=] { return IsSameFunction(*equation, handles, function); };
    made.ours = [=](benchmark::State& state) {
        uint64_t bits = 1;
        for (auto _ : state) {
            bits = NextBits(bits);
            for (size_t variable = 0; variable < 6; ++variable)
                equation->SetVariable(handles[variable], bits >> (variable + 16) & 1u);
            benchmark::DoNotOptimize(equation->Eval());
        }
    };
    made.baseline = [=](benchmark::State& state) {
        uint64_t bits = 1;
        unsigned int values[6] = {};
        for (auto _ : state) {
            bits = NextBits(bits);
            for (size_t variable = 0; variable < 6; ++variable)
                values[variable] = bits >> (variable + 16) & 1u;
            benchmark::DoNotOptimize(function(values));
        }
    };
    return made;
}

// Sets one variable, so that no value can be kept from the previous call, and then evaluates the
// equation.
bench::Case MakeSetOne(const bench::Formula& formula)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>();
    bench::SetFormula(formula, *equation);
    const Handles handles = GetHandles(*equation);
    const bench::Function function = bench::GetFunction(formula);
    bench::Case made;
    made.isRight = [=] { return IsSameFunction(*equation, handles, function); };
    made.ours = [=](benchmark::State& state) {
        uint64_t bits = 1;
        for (auto _ : state) {
            bits = NextBits(bits);
            equation->SetVariable(handles[Pick(bits, 30)], bits >> 16 & 1u);
            benchmark::DoNotOptimize(equation->Eval());
        }
    };
    made.baseline = [=](benchmark::State& state) {
        uint64_t bits = 1;
        unsigned int values[32] = {};
        for (auto _ : state) {
            bits = NextBits(bits);
            values[Pick(bits, 30)] = bits >> 16 & 1u;
            benchmark::DoNotOptimize(function(values));
        }
    };
    return made;
}

bool IsSameText(Kq_BoolEquation& equation, const Handles& handles, const std::string& text)
{
    // The benchmark's own parser calls itself for each group, so the deepest text is left out.
    bench::PlainEquation plain;
    if (text.compare(0, 2, "~(") == 0 && text.length() > 100000)
        return true;
    if (!plain.Parse(text.c_str()) || plain.GetVariables().size() != handles.size())
        return false;
    uint64_t bits = 1;
    for (int call = 0; call < 100; ++call, bits = NextBits(bits)) {
        for (size_t variable = 0; variable < handles.size(); ++variable) {
            plain.GetVariables()[variable].second = bits >> (variable + 40) & 1u;
            equation.SetVariable(handles[variable], bits >> (variable + 40) & 1u);
        }
        if (equation.Eval() != plain.Eval())
            return false;
    }
    return true;
}

bench::Case MakeShape(const std::string& text)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>(text.c_str());
    const Handles handles = GetHandles(*equation);
    const double numNodes = double(bench::CountNodes(equation->GetImp()->GetRoot()));
    bench::Case made;
    made.isRight = [=] { return handles.size() == 16 && IsSameText(*equation, handles, text); };
    made.ours = [=](benchmark::State& state) {
        uint64_t bits = 1;
        for (auto _ : state) {
            bits = NextBits(bits);
            equation->SetVariable(handles[Pick(bits, 16)], bits >> 16 & 1u);
            benchmark::DoNotOptimize(equation->Eval());
        }
        bench::SetItems(state, numNodes, "node");
    };
    return made;
}

} // namespace

void bench::AddCases()
{
    for (const Formula& formula : GetEvalFormulas(6))
        AddPair("eval/set_6_and_20_operators/" + formula.GetName(),
                [=] { return MakeSetAll(formula); });
    for (const Formula& formula : GetEvalFormulas(30))
        AddPair("eval/200_operators/" + formula.GetName(), [=] { return MakeSetOne(formula); });
    for (const Shape& shape : GetShapes())
        for (size_t numTokens : {100u, 1000u, 10000u, 100000u, 1000000u})
            AddSingle("eval_shape/" + shape.name + "/" + std::to_string(numTokens),
                      [=] { return MakeShape(shape.make(numTokens, 16)); });
}
