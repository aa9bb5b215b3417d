// Functions as networks of signals, as logic synthesis programs read them: writers for three file
// formats, and the readers that check what was written.
#ifndef BOOLEQ_NETLIST_NETWORK_H
#define BOOLEQ_NETLIST_NETWORK_H

#include <string>
#include <vector>

#include "cover.h"
#include "expression.h"

namespace booleq {

struct UnitNames {
    std::vector<std::string> inputs;
    std::string output;
    std::string unit; // a model, a module, a function, a cell
};

// One gate for each operator, named so that nothing collides.
std::string WriteBlif(const Expression& expression, const UnitNames& names);
// One equation; an operand of an exclusive-or that is more than a name gets its own equation.
std::string WriteEqn(const Expression& expression, const UnitNames& names);
// A sum of products.
std::string WritePla(const std::vector<Cube>& cubes, const UnitNames& names);

// The one output of a text in one of the formats, over its inputs in their order.
// Invariant: a definition uses inputs and signals defined before it.
struct Network {
    struct Definition {
        uint32_t signal;
        Expression expression; // its inputs are signals
    };
    std::vector<std::string> signals; // inputs first
    size_t numInputs = 0;
    std::vector<Definition> definitions;
    uint32_t output = 0;
};

// Read the part of the formats that the writers use.
// Fails: false for anything else.
bool ReadBlif(const std::string& text, Network& network);
bool ReadEqn(const std::string& text, Network& network);
bool ReadPla(const std::string& text, Network& network);

WordFunction ToWordFunction(const Network& network);

} // namespace booleq

#endif
