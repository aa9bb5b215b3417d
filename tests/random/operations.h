// Every exported member as an operation on objects that share all they can.
#ifndef OPERATIONS_H
#define OPERATIONS_H

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "unit/unit_support.h"

namespace operations {

typedef Kq_BoolEquation Equation;
typedef Equation::Handle Handle;

// Two equations that share their nodes, two engine objects that do so too, and values made from
// them.
struct Objects {
    Objects();

    Equation a;
    Equation b;
    Equation::TruthTable table;
    Equation::TruthTable otherTable;
    Equation::TruthTable::Row row;
    Handle handle;
    Engine engine;
    Engine other;
    Engine::TruthTable engineTable;
    Engine::TruthTable otherEngineTable;
    Engine::TruthTable::Row engineRow;
    Node node;
    Engine::StringMgr pool;
};

// Uses the result of an operator. Calls into the library cannot be optimised away, so nothing else
// is needed.
template <class Result>
void Ask(const Result&)
{
}

struct Operation {
    const char* name; // as in the demangled symbol table of the library
    void (*run)(Objects& o);
};

extern const std::vector<Operation> kOfEquation;
extern const std::vector<Operation> kOfTables; // of the facade, and of handles
extern const std::vector<Operation> kOfEngine;
extern const std::vector<Operation> kOfEngineTables; // also of nodes and the pool of names

} // namespace operations

#endif
