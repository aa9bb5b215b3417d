#include "net_equations.h"

#include <vector>

#include "convert.h"

namespace booleq {

NetEquations::NetEquations(const Comparison& comparison)
    : m_comparison(comparison), m_target(*FindTarget("alt1"))
{
}

std::string NetEquations::Of(const NetFunction& function)
{
    auto known = m_texts.find(function.rows);
    if (known == m_texts.end())
        known = m_texts.emplace(function.rows, MakeTexts(function.rows, m_target)).first;
    std::vector<std::string> names;
    for (const NetId number : function.nets)
        names.push_back(Spell(number));
    return Fill(known->second.equation, names);
}

std::string NetEquations::Spell(NetId number) const
{
    const NetMap& nets = m_comparison.Nets();
    return nets.IsLeft(number) ? SpellNet(m_comparison.Left(), number, m_target)
                               : SpellNet(m_comparison.Right(), nets.RightOf(number), m_target);
}

} // namespace booleq
