#include "rule.h"

std::vector<std::string> SetSignals(Rule& rule, const Signals& signals)
{
    std::vector<std::string> missing;
    for (const auto& variable : rule.equation.GetVariables()) {
        const auto found = signals.find(variable.first.c_str());
        if (found == signals.end())
            missing.emplace_back(variable.first.c_str());
        else
            rule.equation.SetVariable(variable.first, found->second ? 1 : 0);
    }
    return missing;
}

std::vector<std::string> FindDeciding(const Rule& rule)
{
    const unsigned int value = rule.equation.Eval();
    std::vector<std::string> deciding;
    for (const auto& variable : rule.equation.GetVariables()) {
        Kq_BoolEquation changed(rule.equation); // nothing is parsed again
        changed.SetVariable(variable.first, 1 - variable.second);
        if (changed.Eval() != value)
            deciding.emplace_back(variable.first.c_str());
    }
    return deciding;
}
