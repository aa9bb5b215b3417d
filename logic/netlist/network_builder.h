// What the readers of files of gates share: words of a line, signals by name, rows of tables.
#ifndef BOOLEQ_NETLIST_NETWORK_BUILDER_H
#define BOOLEQ_NETLIST_NETWORK_BUILDER_H

#include <string>
#include <unordered_map>
#include <vector>

#include "network.h"

namespace booleq {

std::vector<std::string> SplitWords(const std::string& line);

// Invariant: a name has one signal, inputs come first.
class NetworkBuilder {
  public:
    // Fails: false for a name that is there, or an input after other signals.
    bool AddInput(const std::string& name);
    bool AddSignal(const std::string& name);
    // Fails: false for a name that is not there.
    bool Find(const std::string& name, uint32_t& signal) const;
    // The signal that was added last becomes the expression, whose inputs are signals.
    void DefineLast(Expression expression);
    // Fails: false for an output that is not a signal.
    bool Take(const std::string& output, Network& network);

    size_t NumInputs() const { return m_network.numInputs; }

  private:
    Network m_network;
    std::unordered_map<std::string, uint32_t> m_numbers;
};

// A table of rows over signals as a sum of products.
class SumOfRows {
  public:
    // Fails: false for other characters than "01-", or too many or few.
    bool Add(const std::string& row, const std::vector<uint32_t>& signals);
    // The sum, the constant 0 without rows. The table is empty then.
    Expression Take();

  private:
    Expression m_sum;
};

} // namespace booleq

#endif
