// Reports what the look-up tables of a design compute: for each its name among engineers, inputs
// without effect, a short expression, and an earlier table that could replace it.
// usage: lut_report FILE
// A line of FILE is a name, inputs separated by commas (the most significant first) and an init
// value; # begins a comment. Exit status: 0 done, 1 a line was refused, 2 there is no such file.
#include <algorithm>
#include <fstream>
#include <iostream>
#include <sstream>
#include <string>
#include <vector>

#include <kq_logic/explain.h>
#include <kq_logic/match.h>
#include <kq_logic/short_form.h>

namespace {

struct Lut {
    std::string name;
    kq_logic::Function function;
};

std::vector<Port::StringBase<char>> SplitNames(const std::string& list)
{
    std::vector<Port::StringBase<char>> names;
    std::istringstream stream(list);
    for (std::string name; std::getline(stream, name, ',');)
        names.push_back(name.c_str());
    return names;
}

// Fails: a reason.
std::string Read(const std::string& line, Lut& lut)
{
    std::istringstream words(line);
    std::string inputs;
    std::string init;
    if (!(words >> lut.name >> inputs >> init))
        return "a name, inputs and an init value are needed";
    const std::vector<Port::StringBase<char>> names = SplitNames(inputs);
    Kq_BoolEquation equation;
    if (!equation.SetEquationWithExplicitTerms(names, init.c_str(), false, false) ||
        equation.IsExpression() || equation.GetNumVariables() != names.size())
        return init + " is not an init value over " + inputs;
    return lut.function.Set(equation) ? std::string() : "too many inputs";
}

std::string Joined(const std::vector<std::string>& names)
{
    std::string text;
    for (const std::string& name : names)
        text += (text.empty() ? "" : ", ") + name;
    return text;
}

void Report(const Lut& lut, const std::vector<Lut>& earlier)
{
    const kq_logic::Explanation explanation = kq_logic::Explain(lut.function);
    std::cout << lut.name << ": ";
    if (!explanation.fault.empty()) {
        std::cout << explanation.fault << '\n';
        return;
    }
    std::cout << (explanation.text.empty() ? "no common name" : explanation.text) << '\n';
    if (!explanation.idle.empty())
        std::cout << "  without effect: " << Joined(explanation.idle) << '\n';
    const kq_logic::ShortForm shortForm = kq_logic::FindShortForm(lut.function);
    if (shortForm.fault.empty())
        std::cout << "  short: " << shortForm.text << '\n';
    for (const Lut& other : earlier) {
        const kq_logic::Matching matching =
            kq_logic::Match(other.function, lut.function, kq_logic::MatchScope::Order);
        if (!matching.isFound)
            continue;
        std::cout << "  like " << other.name << ", with";
        for (size_t input = 0; input < matching.sources.size(); ++input)
            std::cout << ' ' << other.function.Inputs()[matching.sources[input]] << '='
                      << lut.function.Inputs()[input];
        std::cout << '\n';
        return;
    }
}

} // namespace

int main(int argc, char** argv)
{
    std::ifstream file(argc == 2 ? argv[1] : "");
    if (!file) {
        std::cerr << "usage: lut_report FILE (which must be there)\n";
        return 2;
    }
    int status = 0;
    std::vector<Lut> luts;
    size_t lineNumber = 0;
    for (std::string line; std::getline(file, line);) {
        ++lineNumber;
        line.resize(std::min(line.find('#'), line.size()));
        if (line.find_first_not_of(" \t\r") == std::string::npos)
            continue;
        Lut lut;
        const std::string fault = Read(line, lut);
        if (!fault.empty()) {
            std::cerr << "line " << lineNumber << ": " << fault << '\n';
            status = 1;
            continue;
        }
        Report(lut, luts);
        luts.push_back(lut);
    }
    return status;
}
