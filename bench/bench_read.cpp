// Reading init values: from digits over listed inputs to an equation, to values, back to digits.
#include <malloc.h>

#include <cstdlib>
#include <cstring>
#include <memory>

#include <Kq_BoolEquationImpNode.h>

#include "support/cases.h"
#include "support/formulas.h"
#include "support/memory.h"
#include "support/texts.h"

namespace {

typedef Port::StringBase<char> String;
typedef std::vector<Kq_BoolEquation::Handle> Handles;

struct Value {
    std::string text;
    std::vector<String> names;

    explicit Value(unsigned int numVariables)
        : text(bench::MakeInitValue(numVariables, numVariables)),
          names(bench::MakeNames(numVariables))
    {
    }

    double GetNumDigits() const { return double(text.length() - 2); }
    bool Set(Kq_BoolEquation& equation, const String& digits) const
    {
        return equation.SetEquationWithExplicitTerms(names, digits, false, false);
    }
};

// The same by hand: digits to a word, the word to digits, each text in its own string.
std::string ConvertByHand(const std::string& digits)
{
    const std::string text = digits;
    uint64_t word = 0;
    for (size_t position = 2; position < text.length(); ++position) {
        const char digit = text[position];
        if (digit >= '0' && digit <= '9')
            word = word << 4 | static_cast<uint64_t>(digit - '0');
        else if (digit >= 'a' && digit <= 'f')
            word = word << 4 | static_cast<uint64_t>(digit - 'a' + 10);
        else
            return std::string();
    }
    std::string result = "0x";
    for (unsigned int shift = 64; shift > 0; shift -= 4)
        result += "0123456789abcdef"[word >> (shift - 4) & 15];
    return result;
}

// Whether setting and rendering leave less memory in use than the nodes of one term take.
bool IsSetWithoutNodes(const Value& value)
{
    const String digits(value.text.c_str());
    const size_t before = mallinfo2().uordblks;
    Kq_BoolEquation equation;
    const bool isSet = value.Set(equation, digits);
    const String rendered = equation.GetEquationAsHexInitValue(false);
    const size_t used = mallinfo2().uordblks - before;
    return isSet && value.text == rendered.c_str() &&
           used < 2 * value.names.size() * sizeof(Kq_BoolEquationImp::Node);
}

bench::Body TimeRoundTrip(const Value& value)
{
    return [=](benchmark::State& state) {
        const String digits(value.text.c_str());
        for (auto _ : state) {
            Kq_BoolEquation equation;
            benchmark::DoNotOptimize(value.Set(equation, digits));
            benchmark::DoNotOptimize(equation.GetEquationAsHexInitValue(false));
        }
        bench::SetItems(state, value.GetNumDigits(), "digit");
    };
}

bool IsRoundTripRight(const Value& value)
{
    Kq_BoolEquation equation;
    return value.Set(equation, value.text.c_str()) &&
           value.text == equation.GetEquationAsHexInitValue(false).c_str();
}

bench::Case MakeSmall()
{
    const Value value(6);
    bench::Case made;
    made.isRight = [=] {
        return IsSetWithoutNodes(value) && ConvertByHand(value.text) == value.text;
    };
    made.ours = TimeRoundTrip(value);
    made.baseline = [=](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize(ConvertByHand(value.text));
        bench::SetItems(state, value.GetNumDigits(), "digit");
    };
    return made;
}

bench::Case MakeRoundTrip(unsigned int numVariables)
{
    const Value value(numVariables);
    bench::Case made;
    made.isRight = [=] { return IsRoundTripRight(value); };
    made.ours = TimeRoundTrip(value);
    return made;
}

// The largest possible value: set, evaluated once, rendered back.
bench::Case MakeLongest()
{
    const std::shared_ptr<Value> value = std::make_shared<Value>(30);
    bench::Case made;
    made.isRight = [=] { return IsRoundTripRight(*value); };
    made.ours = [=](benchmark::State& state) {
        const String digits(value->text.c_str());
        for (auto _ : state) {
            Kq_BoolEquation equation;
            benchmark::DoNotOptimize(value->Set(equation, digits));
            benchmark::DoNotOptimize(equation.Eval());
            benchmark::DoNotOptimize(equation.GetEquationAsHexInitValue(false));
        }
    };
    return made;
}

// Not a time: 'peak' is the number of bytes that one byte of text takes, including that byte.
bench::Case MakePeak(unsigned int numVariables)
{
    const std::shared_ptr<Value> value = std::make_shared<Value>(numVariables);
    bench::Case made;
    made.isRight = [] { return true; };
    made.ours = [=](benchmark::State& state) {
        const String digits(value->text.c_str());
        double peak = 0;
        for (auto _ : state)
            peak = bench::MeasurePeak([&] {
                Kq_BoolEquation equation;
                value->Set(equation, digits);
                benchmark::DoNotOptimize(equation.Eval());
                benchmark::DoNotOptimize(equation.GetEquationAsHexInitValue(false));
            });
        if (peak <= 0)
            state.SkipWithError("peak memory cannot be measured here");
        state.counters["peak"] = 1 + peak / double(digits.length());
    };
    return made;
}

Handles GetHandles(const Kq_BoolEquation& equation)
{
    Handles handles;
    for (const auto& variable : equation.GetVariables())
        handles.push_back(equation.GetVariableHandle(variable.first));
    return handles;
}

// Evaluates all 64 assignments, the first variable being the most significant bit.
uint64_t EvaluateAll(Kq_BoolEquation& equation, const Handles& handles)
{
    uint64_t column = 0;
    for (unsigned int row = 0; row < 64; ++row) {
        for (unsigned int variable = 0; variable < 6; ++variable)
            equation.SetVariable(handles[variable], row >> (5 - variable) & 1u);
        column |= uint64_t(equation.Eval()) << row;
    }
    return column;
}

// Reads a value and evaluates every assignment, with handles that are kept from one value to the
// next; compared with an expression that exists already and is evaluated in the same way.
bench::Case MakeEvaluated(const bench::Formula& formula)
{
    const std::shared_ptr<Kq_BoolEquation> expression = std::make_shared<Kq_BoolEquation>();
    bench::SetFormula(formula, *expression);
    const Handles expressionHandles = GetHandles(*expression);
    const std::string text = expression->GetEquationAsHexInitValue(false).c_str();
    const Value value(6);
    bench::Case made;
    made.isRight = [=] {
        Kq_BoolEquation equation;
        return value.Set(equation, text.c_str()) && EvaluateAll(equation, GetHandles(equation)) ==
                                                        EvaluateAll(*expression, expressionHandles);
    };
    made.ours = [=](benchmark::State& state) {
        const String digits(text.c_str());
        Kq_BoolEquation equation;
        value.Set(equation, digits);
        const Handles handles = GetHandles(equation);
        for (auto _ : state) {
            value.Set(equation, digits);
            benchmark::DoNotOptimize(EvaluateAll(equation, handles));
        }
        bench::SetItems(state, 64, "evaluation");
    };
    made.baseline = [=](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize(EvaluateAll(*expression, expressionHandles));
        bench::SetItems(state, 64, "evaluation");
    };
    return made;
}

bench::Case MakeHandles(unsigned int numVariables)
{
    const Value value(numVariables);
    bench::Case made;
    made.isRight = [=] { return IsRoundTripRight(value); };
    made.ours = [=](benchmark::State& state) {
        Kq_BoolEquation equation;
        value.Set(equation, value.text.c_str());
        for (auto _ : state)
            benchmark::DoNotOptimize(GetHandles(equation));
        bench::SetItems(state, numVariables, "handle");
    };
    return made;
}

} // namespace

void bench::AddCases()
{
    AddPair("read/round_trip/n=6", [] { return MakeSmall(); });
    for (const Formula& formula : GetEvalFormulas(6))
        AddPair("read/evaluated/" + formula.GetName(), [=] { return MakeEvaluated(formula); });
    for (unsigned int numVariables : {2u, 4u, 6u, 8u, 10u, 12u, 16u, 20u, 24u})
        AddSingle("read_back/n=" + std::to_string(numVariables),
                  [=] { return MakeRoundTrip(numVariables); });
    for (unsigned int numVariables : {4u, 6u, 10u, 16u})
        AddSingle("read_handles/n=" + std::to_string(numVariables),
                  [=] { return MakeHandles(numVariables); });
    AddSingle("read_longest/n=30", [] { return MakeLongest(); });
    for (unsigned int numVariables : {24u, 30u})
        AddSingle("read_peak/n=" + std::to_string(numVariables),
                  [=] { return MakePeak(numVariables); });
}
