#include "network.h"

#include <algorithm>
#include <cctype>
#include <set>

void Fail(const std::string& file, size_t line, const std::string& what)
{
    throw Fault(file + ":" + std::to_string(line) + ": " + what);
}

std::string ToName(const std::string& signal)
{
    const auto isPart = [](unsigned char c) { return (c < 128 && std::isalnum(c)) || c == '_'; };
    const bool isPlain = !std::isdigit(static_cast<unsigned char>(signal[0])) &&
                         std::all_of(signal.begin(), signal.end(), isPart);
    return isPlain ? signal : "'" + signal + "'";
}

namespace {

// Says why none of the remaining tables can be computed from the signals that are 'done'.
[[noreturn]] void FailUndriven(const std::string& file, const std::vector<Table>& left,
                               const std::set<std::string>& done)
{
    std::set<std::string> driven = done;
    for (const Table& table : left)
        driven.insert(table.output);
    for (const Table& table : left)
        for (const std::string& name : table.inputs)
            if (driven.count(name) == 0)
                Fail(file, table.line,
                     table.output + " reads " + name +
                         ", which nothing drives; add it to the "
                         "inputs, or the block that drives it");
    Fail(file, left.front().line,
         left.front().output + " depends on itself; only combinational networks can be checked");
}

} // namespace

void SortTables(Network& network)
{
    std::map<std::string, size_t> lines; // of the tables by their outputs
    for (const Table& table : network.tables) {
        const auto [first, isNew] = lines.emplace(table.output, table.line);
        if (!isNew)
            Fail(network.file, table.line,
                 table.output + " is driven a second time; the first is line " +
                     std::to_string(first->second));
    }
    for (const std::string& input : network.inputs)
        if (lines.count(input) != 0)
            Fail(network.file, lines[input],
                 input + " is an input of the model and cannot be driven");

    // Takes the tables whose inputs are available, until none is left or none can be taken.
    std::set<std::string> done(network.inputs.begin(), network.inputs.end());
    std::vector<Table> left = std::move(network.tables);
    network.tables.clear();
    while (!left.empty()) {
        const auto waiting =
            std::stable_partition(left.begin(), left.end(), [&done](const Table& table) {
                return std::all_of(table.inputs.begin(), table.inputs.end(),
                                   [&](const std::string& name) { return done.count(name) != 0; });
            });
        if (waiting == left.begin())
            FailUndriven(network.file, left, done);
        for (auto table = left.begin(); table != waiting; ++table) {
            done.insert(table->output);
            network.tables.push_back(std::move(*table));
        }
        left.erase(left.begin(), waiting);
    }
}

Evaluator::Evaluator(const Network& network, const std::string& output)
{
    // What is needed, from the output backwards; a table comes after those that it reads.
    std::set<std::string> needed = {output};
    std::vector<const Table*> tables;
    for (auto table = network.tables.rbegin(); table != network.tables.rend(); ++table) {
        if (needed.count(table->output) == 0)
            continue;
        tables.push_back(&*table);
        needed.insert(table->inputs.begin(), table->inputs.end());
    }
    std::map<std::string, size_t> places;
    for (const std::string& input : network.inputs) {
        if (needed.count(input) == 0)
            continue;
        places[input] = m_inputs.size();
        m_inputs.push_back(input);
    }
    for (auto table = tables.rbegin(); table != tables.rend(); ++table) {
        Step step = {*table, {}};
        for (const std::string& input : (*table)->inputs)
            step.inputs.push_back(places.at(input));
        places[(*table)->output] = m_inputs.size() + m_steps.size();
        m_steps.push_back(std::move(step));
    }
    m_values.resize(m_inputs.size() + m_steps.size());
    m_output = places.at(output);
}

bool Evaluator::Evaluate(const std::map<std::string, bool>& values)
{
    size_t next = 0;
    for (const std::string& input : m_inputs)
        m_values[next++] = values.at(input) ? 1 : 0;
    for (const Step& step : m_steps) {
        size_t row = 0;
        for (const size_t place : step.inputs)
            row = row * 2 + m_values[place];
        m_values[next++] = step.table->column[row / 64] >> (row % 64) & 1;
    }
    return m_values[m_output] != 0;
}
