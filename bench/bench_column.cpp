// Result columns: from a checked tree to 2^n bits.
#include <algorithm>
#include <memory>

#include <Kq_BoolEquationImp.h>

#include "Column.h"
#include "support/cases.h"
#include "support/formulas.h"
#include "support/texts.h"

namespace {

typedef std::shared_ptr<Kq_BoolEquation> EquationPointer;

// One result for all cases, so that none of them pays for fresh memory.
uint64_t* GetWords(uint64_t numWords)
{
    static std::vector<uint64_t> words;
    if (words.size() < numWords)
        words.assign(numWords, 1);
    return words.data();
}

void FillColumn(const Kq_BoolEquation& equation, uint64_t* words)
{
    KqColumn column(equation.GetImp()->GetRoot(), equation.GetNumVariables());
    column.Fill(0, column.GetNumWords(), words);
}

bench::Body TimeColumn(EquationPointer equation, uint64_t numWords, double numItems,
                       const char* unit)
{
    return [=](benchmark::State& state) {
        uint64_t* const words = GetWords(numWords);
        for (auto _ : state) {
            FillColumn(*equation, words);
            benchmark::DoNotOptimize(words);
            benchmark::ClobberMemory();
        }
        bench::SetItems(state, numItems, unit);
    };
}

bench::Case MakeFormula(const bench::Formula& formula)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>();
    bench::SetFormula(formula, *equation);
    const uint64_t numWords = formula.GetNumWords();
    std::string kernelName;
    const bench::Kernel kernel = bench::FindFastestKernel(formula, GetWords(numWords), &kernelName);

    bench::Case made;
    made.isRight = [=] {
        std::vector<uint64_t> expected(numWords);
        kernel(expected.data());
        FillColumn(*equation, GetWords(numWords));
        return equation->GetNumVariables() == formula.numVariables &&
               std::equal(expected.begin(), expected.end(), GetWords(numWords));
    };
    made.ours = TimeColumn(equation, numWords, double(numWords), "word");
    made.baseline = [=](benchmark::State& state) {
        uint64_t* const words = GetWords(numWords);
        for (auto _ : state) {
            kernel(words);
            benchmark::DoNotOptimize(words);
            benchmark::ClobberMemory();
        }
        bench::SetItems(state, double(numWords), "word");
        state.SetLabel(kernelName);
    };
    return made;
}

// A random function, as the sum of products or product of sums that its init value stands for.
bench::Case MakeTerms(unsigned int numVariables, unsigned int seed, bool asExpression)
{
    const std::string value = bench::MakeInitValue(numVariables, seed);
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>();
    const std::vector<Port::StringBase<char>> terms = bench::MakeNames(numVariables);
    equation->SetEquationWithExplicitTerms(terms, value.c_str(), false, false);
    if (asExpression)
        equation->SetEquationWithExplicitTerms(terms, equation->GetEquationAsExpression(false),
                                               false, false);
    const uint64_t numWords = numVariables > 6 ? uint64_t(1) << (numVariables - 6) : 1;

    bench::Case made;
    made.isRight = [=] {
        const std::vector<uint64_t> expected = bench::ReadInitValue(value);
        FillColumn(*equation, GetWords(numWords));
        return std::equal(expected.begin(), expected.end(), GetWords(numWords));
    };
    made.ours = TimeColumn(equation, numWords,
                           double(bench::CountNodes(equation->GetImp()->GetRoot())), "node");
    return made;
}

// Shapes that the compiled formulas do not have; checked against single evaluations.
bench::Case MakeText(const std::string& text)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>(text.c_str());
    const uint64_t numWords = bench::EvaluateColumn(*equation).size();
    bench::Case made;
    made.isRight = [=] {
        const std::vector<uint64_t> expected = bench::EvaluateColumn(*equation);
        FillColumn(*equation, GetWords(numWords));
        const unsigned int numVariables = equation->GetNumVariables();
        const uint64_t mask =
            numVariables < 6 ? (uint64_t(1) << (1u << numVariables)) - 1 : ~uint64_t(0);
        return std::equal(expected.begin(), expected.end(), GetWords(numWords),
                          [=](uint64_t a, uint64_t b) { return ((a ^ b) & mask) == 0; });
    };
    made.ours = TimeColumn(equation, numWords,
                           double(bench::CountNodes(equation->GetImp()->GetRoot())), "node");
    return made;
}

} // namespace

void bench::AddCases()
{
    for (unsigned int numVariables : {16u, 20u, 24u, 28u})
        for (const Formula& formula : GetColumnFormulas(numVariables))
            AddPair("column/n=" + std::to_string(numVariables) + "/" + formula.GetName(),
                    [=] { return MakeFormula(formula); });
    for (unsigned int numVariables : {8u, 12u, 16u}) {
        const std::string size = "/n=" + std::to_string(numVariables) + "/";
        for (unsigned int seed : {1u, 2u}) {
            AddSingle("column_of_terms/init_value" + size + std::to_string(seed),
                      [=] { return MakeTerms(numVariables, seed, false); });
            AddSingle("column_of_terms/expression" + size + std::to_string(seed),
                      [=] { return MakeTerms(numVariables, seed, true); });
        }
    }
    for (const Shape& shape : GetShapes())
        for (size_t numTokens : {20u, 200u, 2000u, 20000u})
            AddSingle("column_of_shape/" + shape.name + "/" + std::to_string(numTokens),
                      [=] { return MakeText(shape.make(numTokens, 10)); });
}
