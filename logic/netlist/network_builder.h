// What the readers of gate files share: the words of a line, signals by name, rows of tables.
#ifndef BOOLEQ_NETLIST_NETWORK_BUILDER_H
#define BOOLEQ_NETLIST_NETWORK_BUILDER_H

#include <string>
#include <unordered_map>
#include <vector>

#include "network.h"

namespace booleq {

std::vector<std::string> SplitWords(const std::string& line);

// Invariant: a name has one signal, and inputs come first.
class NetworkBuilder {
  public:
    // Fails: false for a name that exists already, or for an input after other signals.
    bool AddInput(const std::string& name);
    bool AddSignal(const std::string& name);
    // Fails: false for an unknown name.
    bool Find(const std::string& name, uint32_t& signal) const;
    // Defines the signal added last by an expression, whose inputs are signals.
    void DefineLast(Expression expression);
    // Moves the network out.  Fails: false if 'output' is not a signal.
    bool Take(const std::string& output, Network& network);

    size_t NumInputs() const { return m_network.numInputs; }

  private:
    Network m_network;
    std::unordered_map<std::string, uint32_t> m_numbers;
};

// Turns a table of rows over signals into a sum of products.
class SumOfRows {
  public:
    // Fails: false for characters other than "01-", or for too many or too few of them.
    bool Add(const std::string& row, const std::vector<uint32_t>& signals);
    // The sum, or the constant 0 if there are no rows. Empties the table.
    Expression Take();

  private:
    Expression m_sum;
};

} // namespace booleq

#endif
