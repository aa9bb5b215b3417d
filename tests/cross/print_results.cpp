// Prints all answers about random texts, for comparison byte by byte with another machine's output.
// Arguments: seed, number of texts. The form of the answers does not depend on the machine: words
// are printed as digits, bytes outside ASCII as \xNN.
#include <cinttypes>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#ifdef _WIN32
#include <fcntl.h>
#include <io.h>
#endif

#include <Kq_BoolEquation.h>

#include "support/library_view.h"
#include "support/random_text.h"

namespace {

using support::Printable;
using support::ToPort;
using support::ToStd;

const std::vector<std::string> kNames = {"a", "b",     "c1",   "D_d", "x",     "y",
                                         "z", "'q r'", "in_7", "W8",  "n_0_1", "k"};

// A text of any kind: most are accepted and small enough for a table.
std::string AnyText(support::RandomText& random)
{
    const std::vector<std::string> names(
        kNames.begin(), kNames.begin() + static_cast<std::ptrdiff_t>(1 + random.Below(12)));
    const size_t numTokens = 1 + random.Below(60);
    switch (random.Below(8)) {
    case 0:
        return random.TokenSoup(numTokens, names);
    case 1:
        return random.Mutated(random.WellFormed(numTokens, names, true));
    case 2:
        return random.Bytes(numTokens);
    default:
        return random.WellFormed(numTokens, names, random.Chance(50));
    }
}

void Print(const char* what, const Port::StringBase<char>& text)
{
    std::printf("%s %s\n", what, Printable(ToStd(text)).c_str());
}

void PrintRenderings(const Kq_BoolEquation& equation)
{
    for (const bool spaces : {false, true}) {
        Print("typed", equation.GetEquation(spaces));
        Print("alt1", equation.GetEquationAlt1(spaces));
        Print("alt2", equation.GetEquationAlt2(spaces));
        Print("alt3", equation.GetEquationAlt3(spaces));
        Print("expression", equation.GetEquationAsExpression(spaces));
    }
}

void PrintResults(const Kq_BoolEquation& equation)
{
    for (const bool upperCase : {false, true})
        Print("hex", equation.GetEquationAsHexInitValue(upperCase));
    Print("binary", equation.GetEquationAsBinaryInitValue());
    Print("terms", equation.GetInitValueTermEquation());
    std::vector<uint64_t> words;
    std::printf("column %d", equation.GetColumn(words) ? 1 : 0);
    for (const uint64_t word : words)
        std::printf(" %016" PRIx64, word);
    std::printf("\n");
}

// Every assignment, in the order of the table's rows.
void PrintEvaluations(Kq_BoolEquation equation)
{
    const unsigned int numVariables = equation.GetNumVariables();
    std::vector<Kq_BoolEquation::Handle> handles;
    for (const auto& variable : equation.GetVariables())
        handles.push_back(equation.GetVariableHandle(variable.first));
    std::string results;
    for (uint64_t row = 0; numVariables <= 8 && row < uint64_t(1) << numVariables; ++row) {
        for (unsigned int index = 0; index < numVariables; ++index)
            equation.SetVariable(handles[index], (row >> (numVariables - 1 - index)) & 1u);
        results += equation.Eval() != 0 ? '1' : '0';
    }
    std::printf("evaluated %s\n", results.c_str());
    for (const Kq_BoolEquation::Handle& handle : handles) {
        std::printf("handle");
        for (const unsigned int value : handle)
            std::printf(" %u", value);
        std::printf("\n");
    }
}

void PrintTable(const Kq_BoolEquation& equation)
{
    if (equation.GetNumVariables() > 6)
        return;
    for (const Kq_BoolEquation::TruthTable::Row& row : equation.GetTruthTable().GetRows()) {
        std::printf("row");
        for (const unsigned int value : row.GetVariableValues())
            std::printf(" %u", value);
        std::printf(": %u\n", row.GetResultValue());
    }
}

// Prints what the init value reads back as over the same names, in both orders of the terms.
void PrintReadBack(const Kq_BoolEquation& equation)
{
    std::vector<Port::StringBase<char>> terms;
    for (const auto& variable : equation.GetVariables())
        terms.push_back(variable.first);
    for (const bool lowestFirst : {false, true})
        for (const Port::StringBase<char>& text :
             {equation.GetEquationAsHexInitValue(false), equation.GetEquationAsBinaryInitValue()}) {
            Kq_BoolEquation again;
            again.SetEquationWithExplicitTerms(terms, text, lowestFirst, lowestFirst);
            Print("again", again.GetEquationAsHexInitValue(false));
            if (equation.GetNumVariables() <= 6)
                Print("again", again.GetEquationAsExpression(false));
        }
}

void PrintAll(const std::string& text, support::Capture& capture)
{
    Kq_BoolEquation equation;
    std::printf("text %s\n", Printable(text).c_str());
    const bool isSet = equation.SetEquation(ToPort(text));
    const Kq_BoolEquation::Refusal refusal = Kq_BoolEquation::FindRefusal(ToPort(text));
    std::printf("set %d, refused %u at %zu, %zu bytes\n", isSet ? 1 : 0, unsigned(refusal.code),
                refusal.offset, refusal.length);
    for (const auto& variable : equation.GetVariables())
        Print("variable", variable.first);
    if (isSet) {
        PrintRenderings(equation);
        PrintResults(equation);
        PrintEvaluations(equation);
        PrintTable(equation);
        PrintReadBack(equation);
        if (equation.GetNumVariables() <= 4)
            equation.Dbg();
    }
    for (const support::Captured& message : capture.messages)
        std::printf("message %s %s:%d %s %s\n", message.id.c_str(), message.file.c_str(),
                    message.line, message.revision.c_str(), Printable(message.text).c_str());
    capture.messages.clear();
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::fprintf(stderr, "usage: print_results SEED COUNT\n");
        return 2;
    }
#ifdef _WIN32
    _setmode(_fileno(stdout), _O_BINARY);
#endif
    support::RandomText random(static_cast<unsigned int>(std::strtoul(argv[1], nullptr, 10)));
    const unsigned long numTexts = std::strtoul(argv[2], nullptr, 10);
    support::Capture capture;
    for (unsigned long index = 0; index < numTexts; ++index) {
        PrintAll(AnyText(random), capture);
        // Includes init values, which are set over terms.
        Kq_BoolEquation equation;
        const size_t numTerms = 1 + random.Below(10);
        std::vector<Port::StringBase<char>> terms;
        for (size_t term = 0; term < numTerms; ++term)
            terms.push_back(ToPort(kNames[term]));
        const size_t numRows = size_t(1) << numTerms;
        const std::string text = random.Chance(50)
                                     ? random.BinaryInitValue(numRows)
                                     : random.HexInitValue(numRows < 4 ? 1 : numRows / 4);
        const bool lowestFirst = random.Chance(50);
        const bool isReversed = random.Chance(50);
        std::printf(
            "init value %s: %d\n", text.c_str(),
            equation.SetEquationWithExplicitTerms(terms, ToPort(text), lowestFirst, isReversed)
                ? 1
                : 0);
        PrintResults(equation);
        if (numTerms <= 5)
            PrintRenderings(equation);
        capture.messages.clear();
    }
    return std::fflush(stdout) == 0 ? 0 : 1;
}
