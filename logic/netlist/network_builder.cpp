#include "network_builder.h"

#include <cassert>
#include <memory>
#include <sstream>
#include <utility>

namespace booleq {

std::vector<std::string> SplitWords(const std::string& line)
{
    std::istringstream stream(line);
    std::vector<std::string> words;
    for (std::string word; stream >> word;)
        words.push_back(word);
    return words;
}

bool NetworkBuilder::AddInput(const std::string& name)
{
    if (m_network.signals.size() != m_network.numInputs || !AddSignal(name))
        return false;
    ++m_network.numInputs;
    return true;
}

bool NetworkBuilder::AddSignal(const std::string& name)
{
    if (!m_numbers.emplace(name, static_cast<uint32_t>(m_network.signals.size())).second)
        return false;
    m_network.signals.push_back(name);
    return true;
}

bool NetworkBuilder::Find(const std::string& name, uint32_t& signal) const
{
    const auto found = m_numbers.find(name);
    if (found == m_numbers.end())
        return false;
    signal = found->second;
    return true;
}

void NetworkBuilder::DefineLast(Expression expression)
{
    assert(!expression.nodes.empty());
    assert(m_network.signals.size() > m_network.numInputs);
    const auto signal = static_cast<uint32_t>(m_network.signals.size() - 1);
    m_network.definitions.push_back({signal, std::move(expression)});
}

bool NetworkBuilder::Take(const std::string& output, Network& network)
{
    if (!Find(output, m_network.output))
        return false;
    network = std::move(m_network);
    return true;
}

bool SumOfRows::Add(const std::string& row, const std::vector<uint32_t>& signals)
{
    if (row.size() != signals.size())
        return false;
    // Nodes are in post-order and are evaluated by their place, so an operator follows its second
    // operand.
    const auto addOperator = [this](Operator op) { m_sum.nodes.push_back({op, 0, 0, 0}); };
    const bool isFirstRow = m_sum.nodes.empty();
    bool isFirst = true;
    for (size_t input = 0; input < row.size(); ++input) {
        if (row[input] == '-')
            continue;
        if (row[input] != '0' && row[input] != '1')
            return false;
        m_sum.nodes.push_back({Operator::Input, 0, signals[input], 0});
        if (row[input] == '0')
            addOperator(Operator::Not);
        if (!isFirst)
            addOperator(Operator::And);
        isFirst = false;
    }
    if (isFirst)
        AddConstant(m_sum, true);
    if (!isFirstRow)
        addOperator(Operator::Or);
    return true;
}

Expression SumOfRows::Take()
{
    if (m_sum.nodes.empty())
        AddConstant(m_sum, false);
    return std::exchange(m_sum, Expression());
}

WordFunction ToWordFunction(const Network& network)
{
    const auto shared = std::make_shared<Network>(network);
    const auto values = std::make_shared<std::vector<uint64_t>>(network.signals.size());
    const auto stack = std::make_shared<std::vector<uint64_t>>();
    return [shared, values, stack](const std::vector<uint64_t>& inputs) {
        std::copy(inputs.begin(), inputs.end(), values->begin());
        for (const Network::Definition& definition : shared->definitions)
            (*values)[definition.signal] = EvaluateWord(definition.expression, *values, *stack);
        return (*values)[shared->output];
    };
}

} // namespace booleq
