// Init values: from a checked tree to hexadecimal and binary text.
#include <sys/mman.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>

#include <Kq_BoolEquationImpNode.h>

#include "support/cases.h"
#include "support/formulas.h"
#include "support/memory.h"
#include "support/texts.h"

namespace {

typedef std::shared_ptr<Kq_BoolEquation> EquationPointer;

EquationPointer MakeEquation(const bench::Formula& formula)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>();
    bench::SetFormula(formula, *equation);
    return equation;
}

bench::Body TimeHexText(EquationPointer equation, double numDigits)
{
    return [=](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize(equation->GetEquationAsHexInitValue(false));
        bench::SetItems(state, numDigits, "digit");
    };
}

bool HasDigits(const std::vector<uint64_t>& words, const Kq_BoolEquation& equation)
{
    return bench::WriteInitValue(words, equation.GetNumVariables()) ==
           equation.GetEquationAsHexInitValue(false).c_str();
}

// Gives the pages within a text that will not be read again back to the system, so that the next
// use of that memory pays for new pages, whichever block gets it.
void DropPages(const char* text, size_t length)
{
    constexpr uintptr_t kPage = 4096;
    const uintptr_t begin = (reinterpret_cast<uintptr_t>(text) + kPage - 1) / kPage * kPage;
    const uintptr_t end = (reinterpret_cast<uintptr_t>(text) + length) / kPage * kPage;
    if (end > begin)
        madvise(reinterpret_cast<void*>(begin), end - begin, MADV_DONTNEED);
}

// A long text, compared with writing as many bytes into memory that is fresh each time.
bench::Case MakeLong(const bench::Formula& formula)
{
    const EquationPointer equation = MakeEquation(formula);
    const size_t numDigits = size_t(1) << (formula.numVariables - 2);
    bench::Case made;
    made.isRight = [=] {
        std::vector<uint64_t> words(formula.GetNumWords());
        std::string name;
        bench::FindFastestKernel(formula, words.data(), &name)(words.data());
        return HasDigits(words, *equation);
    };
    made.ours = [=](benchmark::State& state) {
        for (auto _ : state) {
            const auto text = equation->GetEquationAsHexInitValue(false);
            benchmark::DoNotOptimize(text.c_str());
            DropPages(text.c_str(), text.length());
        }
        bench::SetItems(state, double(numDigits), "digit");
    };
    made.baseline = [=](benchmark::State& state) {
        for (auto _ : state) {
            char* const text = static_cast<char*>(std::malloc(numDigits + 3));
            benchmark::DoNotOptimize(text);
            if (text) {
                std::memset(text, '0', numDigits + 3);
                benchmark::ClobberMemory();
                DropPages(text, numDigits + 3);
            }
            std::free(text);
        }
        bench::SetItems(state, double(numDigits), "digit");
    };
    return made;
}

// Not a time: 'peak' is the number of bytes that one byte of text takes.
bench::Case MakePeak(const bench::Formula& formula)
{
    const EquationPointer equation = MakeEquation(formula);
    const double numBytes = double(size_t(1) << (formula.numVariables - 2)) + 2;
    bench::Case made;
    made.isRight = [] { return true; };
    made.ours = [=](benchmark::State& state) {
        double peak = 0;
        for (auto _ : state)
            peak = bench::MeasurePeak(
                [=] { benchmark::DoNotOptimize(equation->GetEquationAsHexInitValue(false)); });
        if (peak <= 0)
            state.SkipWithError("peak memory cannot be measured here");
        state.counters["peak"] = peak / numBytes;
    };
    return made;
}

// The text of a small equation, compared with one evaluation of its tree.
bench::Case MakeSmall(const bench::Formula& formula)
{
    const EquationPointer equation = MakeEquation(formula);
    bench::Case made;
    made.isRight = [=] { return HasDigits(bench::EvaluateColumn(*equation), *equation); };
    made.ours = TimeHexText(equation, double(size_t(1) << (formula.numVariables - 2)));
    made.baseline = [=](benchmark::State& state) {
        const Kq_BoolEquationImp::Node* const root = equation->GetImp()->GetRoot();
        for (auto _ : state)
            benchmark::DoNotOptimize(root->Eval(equation->GetVariables()));
    };
    return made;
}

bench::Case MakeShape(const std::string& text, bool binary)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>(text.c_str());
    const unsigned int numVariables = equation->GetNumVariables();
    bench::Case made;
    made.isRight = [=] {
        const std::vector<uint64_t> words = bench::EvaluateColumn(*equation);
        const Port::StringBase<char> digits = equation->GetEquationAsBinaryInitValue();
        bool isRight = HasDigits(words, *equation);
        for (size_t row = 0; isRight && row < size_t(1) << numVariables; ++row)
            isRight = (digits.c_str()[digits.length() - 1 - row] == '1') ==
                      ((words[row / 64] >> (row % 64) & 1u) != 0);
        return isRight;
    };
    if (!binary) {
        made.ours = TimeHexText(equation, double(size_t(1) << (numVariables - 2)));
        return made;
    }
    made.ours = [=](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize(equation->GetEquationAsBinaryInitValue());
        bench::SetItems(state, double(size_t(1) << numVariables), "digit");
    };
    return made;
}

} // namespace

void bench::AddCases()
{
    for (unsigned int numVariables : {20u, 24u, 30u}) {
        const std::string size = "/n=" + std::to_string(numVariables) + "/";
        for (const Formula& formula : GetColumnFormulas(numVariables))
            AddPair("hex_text" + size + formula.GetName(), [=] { return MakeLong(formula); });
    }
    for (const Formula& formula : GetColumnFormulas(30)) {
        AddSingle("hex_text_peak/n=30/" + formula.GetName(), [=] { return MakePeak(formula); });
    }
    for (const Formula& formula : GetEvalFormulas(6))
        AddPair("hex_text/n=6/" + formula.GetName(), [=] { return MakeSmall(formula); });
    for (unsigned int numVariables : {2u, 4u, 6u, 8u, 12u, 16u, 20u}) {
        const std::string size = "/n=" + std::to_string(numVariables);
        const std::string wide = MakeWide(4 * numVariables + 1, numVariables);
        const std::string deep = MakeDeep(10 * numVariables + 1, numVariables);
        AddSingle("hex_text_shape/wide" + size, [=] { return MakeShape(wide, false); });
        AddSingle("hex_text_shape/deep" + size, [=] { return MakeShape(deep, false); });
        AddSingle("binary_text_shape/wide" + size, [=] { return MakeShape(wide, true); });
        AddSingle("binary_text_shape/deep" + size, [=] { return MakeShape(deep, true); });
    }
}
