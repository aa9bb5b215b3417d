// Functions as tables that read each other: what both a mapped netlist and a file of equations are.
#ifndef NETLIST_CHECK_NETWORK_H
#define NETLIST_CHECK_NETWORK_H

#include <cstddef>
#include <cstdint>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

typedef Port::StringBase<char> KqString;

// What is wrong with an input file: "FILE:LINE: what; hint".
struct Fault : std::runtime_error {
    using std::runtime_error::runtime_error;
};
[[noreturn]] void Fail(const std::string& file, size_t line, const std::string& what);

// One signal as a function of others, with the first input as the most significant.
struct Table {
    std::string output;
    std::vector<std::string> inputs;
    Kq_BoolEquation equation;
    std::vector<uint64_t> column; // the equation's: row k is bit k % 64 of word k / 64
    size_t line = 0;              // of the file that the table comes from
};

// Invariant: a table reads only the network's inputs and the outputs of earlier tables.
struct Network {
    std::string file;
    std::vector<std::string> inputs;
    std::vector<std::string> outputs;
    std::vector<Table> tables;
};

// The name of a signal as the library reads it: between quotes unless it is a plain one.
std::string ToName(const std::string& signal);

// Establishes the invariant.  Fails: Fault for a signal that is driven by nothing or more than
// once, and for tables in a circle.
void SortTables(Network& network);

// Computes one output of a network, assignment by assignment, from the tables that it needs.
class Evaluator {
  public:
    Evaluator(const Network& network, const std::string& output);

    // The network inputs that the output depends on structurally.
    const std::vector<std::string>& GetInputs() const { return m_inputs; }
    // 'values' has at least these inputs.
    bool Evaluate(const std::map<std::string, bool>& values);

  private:
    struct Step {
        const Table* table;
        std::vector<size_t> inputs; // places in m_values
    };
    std::vector<std::string> m_inputs;
    std::vector<Step> m_steps; // each appends its result to the values so far
    std::vector<unsigned char> m_values;
    size_t m_output = 0;
};

#endif
