// Every exported member as an operation on objects that share what can be shared.
#ifndef OPERATIONS_H
#define OPERATIONS_H

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "unit/unit_support.h"

namespace operations {

typedef Kq_BoolEquation Equation;
typedef Equation::Handle Handle;

// Two equations that share their nodes, two engine objects that do, and values made of them.
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

// For an operator whose result would be unused; the members asked are calls into the library, so
// none is left out for that.
template <class Result>
void Ask(const Result&)
{
}

struct Operation {
    const char* name; // as the demangled symbol table of the library has it
    void (*run)(Objects& o);
};

extern const std::vector<Operation> kOfEquation;
extern const std::vector<Operation> kOfTables; // of the facade, and handles
extern const std::vector<Operation> kOfEngine;
extern const std::vector<Operation> kOfEngineTables; // and nodes, and the pool of names

} // namespace operations

#endif
