#include "network.h"

#include <memory>
#include <sstream>
#include <unordered_map>

#include "foreign_tree.h"
#include "notation.h"

namespace booleq {

namespace {

typedef std::unordered_map<std::string, uint32_t> SignalNumbers;

std::vector<std::string> Words(const std::string& line)
{
    std::istringstream stream(line);
    std::vector<std::string> words;
    for (std::string word; stream >> word;)
        words.push_back(word);
    return words;
}

// Fails: false for a name that is there.
bool AddSignal(Network& network, SignalNumbers& numbers, const std::string& name)
{
    if (!numbers.emplace(name, static_cast<uint32_t>(network.signals.size())).second)
        return false;
    network.signals.push_back(name);
    return true;
}

// Operand and operator behind each other, the first operand alone.
void Join(Expression& expression, Operator op, bool isFirst)
{
    if (!isFirst)
        expression.nodes.push_back({op, 0, 0, 0}); // evaluation goes by place
}

// Adds a row of a table to a sum of products. Fails: false for other characters than "01-".
bool AddRow(const std::string& row, const std::vector<uint32_t>& signals, Expression& sum)
{
    if (row.size() != signals.size())
        return false;
    const bool isFirstRow = sum.nodes.empty();
    bool isFirst = true;
    for (size_t input = 0; input < row.size(); ++input) {
        if (row[input] == '-')
            continue;
        if (row[input] != '0' && row[input] != '1')
            return false;
        sum.nodes.push_back({Operator::Input, 0, signals[input], 0});
        if (row[input] == '0')
            sum.nodes.push_back({Operator::Not, 0, 0, 0});
        Join(sum, Operator::And, isFirst);
        isFirst = false;
    }
    if (isFirst)
        AddConstant(sum, true);
    Join(sum, Operator::Or, isFirstRow);
    return true;
}

void Define(Network& network, uint32_t signal, Expression expression)
{
    if (expression.nodes.empty())
        AddConstant(expression, false);
    network.definitions.push_back({signal, std::move(expression)});
}

// The signals that a line names behind its first word.
bool FindSignals(const std::vector<std::string>& words, const SignalNumbers& numbers,
                 size_t numSignals, std::vector<uint32_t>& signals)
{
    signals.clear();
    for (size_t word = 1; word <= numSignals; ++word) {
        const auto found = numbers.find(words[word]);
        if (found == numbers.end())
            return false;
        signals.push_back(found->second);
    }
    return true;
}

bool SetOutput(Network& network, const SignalNumbers& numbers, const std::string& name)
{
    const auto found = numbers.find(name);
    if (found == numbers.end())
        return false;
    network.output = found->second;
    return true;
}

} // namespace

bool ReadBlif(const std::string& text, Network& network)
{
    network = Network();
    SignalNumbers numbers;
    std::istringstream lines(text);
    std::string output;
    std::vector<uint32_t> inputs;
    Expression sum;
    uint32_t signal = 0;
    bool isInTable = false;
    for (std::string line; std::getline(lines, line);) {
        const std::vector<std::string> words = Words(line);
        if (words.empty() || words[0][0] == '#')
            continue;
        if (words[0][0] == '.' && isInTable) {
            Define(network, signal, std::move(sum));
            sum = Expression();
            isInTable = false;
        }
        if (words[0] == ".inputs") {
            for (size_t word = 1; word < words.size(); ++word)
                if (!AddSignal(network, numbers, words[word]))
                    return false;
            network.numInputs = network.signals.size();
        } else if (words[0] == ".outputs" && words.size() == 2) {
            output = words[1];
        } else if (words[0] == ".names" && words.size() > 1) {
            if (!FindSignals(words, numbers, words.size() - 2, inputs) ||
                !AddSignal(network, numbers, words.back()))
                return false;
            signal = static_cast<uint32_t>(network.signals.size() - 1);
            isInTable = true;
        } else if (words[0] == ".end") {
            return SetOutput(network, numbers, output);
        } else if (isInTable) {
            if (words.back() != "1" || words.size() > 2 ||
                !AddRow(words.size() == 2 ? words[0] : std::string(), inputs, sum))
                return false;
        } else if (words[0] != ".model") {
            return false;
        }
    }
    return false;
}

bool ReadPla(const std::string& text, Network& network)
{
    network = Network();
    SignalNumbers numbers;
    std::istringstream lines(text);
    std::string output;
    std::vector<uint32_t> inputs;
    Expression sum;
    for (std::string line; std::getline(lines, line);) {
        const std::vector<std::string> words = Words(line);
        if (words.empty() || words[0][0] == '#')
            continue;
        if (words[0] == ".ilb") {
            for (size_t word = 1; word < words.size(); ++word) {
                if (!AddSignal(network, numbers, words[word]))
                    return false;
                inputs.push_back(static_cast<uint32_t>(word - 1));
            }
            network.numInputs = inputs.size();
        } else if (words[0] == ".ob" && words.size() == 2) {
            output = words[1];
        } else if (words[0] == ".e") {
            if (!AddSignal(network, numbers, output))
                return false;
            Define(network, static_cast<uint32_t>(network.signals.size() - 1), std::move(sum));
            return SetOutput(network, numbers, output);
        } else if (words[0][0] != '.') {
            if (words.size() != 2 || (words[1] != "0" && words[1] != "1"))
                return false;
            if (words[1] == "1" && !AddRow(words[0], inputs, sum))
                return false;
        }
    }
    return false;
}

bool ReadEqn(const std::string& text, Network& network)
{
    network = Network();
    SignalNumbers numbers;
    std::istringstream statements(text);
    std::string output;
    std::string fault;
    for (std::string statement; std::getline(statements, statement, ';');) {
        const size_t sign = statement.find('=');
        if (sign == std::string::npos)
            break; // the line end behind the last statement
        const std::vector<std::string> target = Words(statement.substr(0, sign));
        if (target.size() != 1)
            return false;
        const std::string value = statement.substr(sign + 1);
        if (target[0] == "INORDER") {
            for (const std::string& name : Words(value))
                if (!AddSignal(network, numbers, name))
                    return false;
            network.numInputs = network.signals.size();
            continue;
        }
        if (target[0] == "OUTORDER") {
            output = Words(value).empty() ? std::string() : Words(value)[0];
            continue;
        }
        ForeignTree tree;
        Expression expression;
        if (!Read(value, EqnNotation(), tree, fault) || !ToExpression(tree, expression))
            return false;
        for (Expression::Node& node : expression.nodes) {
            if (node.op != Operator::Input)
                continue;
            const auto found = numbers.find(tree.names[node.left]);
            if (found == numbers.end())
                return false;
            node.left = found->second;
        }
        if (!AddSignal(network, numbers, target[0]))
            return false;
        Define(network, static_cast<uint32_t>(network.signals.size() - 1), std::move(expression));
    }
    return SetOutput(network, numbers, output);
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
