// Objects that threads share without a lock, and every question, one for each const member.
#ifndef THREADS_QUESTIONS_H
#define THREADS_QUESTIONS_H

#include <string>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

namespace threads {

// Made once, then only queried. The equation and the engine object at a position have the same text
// but share no nodes; tables, handles and rows belong to the equation.
struct SharedObjects {
    // The same seed gives the same objects: expressions of many sizes, init values whose tree is
    // not made yet, constants, an empty one. Nothing has been asked yet.
    // With 'hasLarge' also some that are compiled before they are evaluated, whose traces in debug
    // mode would have a hundred thousand messages.
    explicit SharedObjects(unsigned int seed, bool hasLarge = true);

    size_t size() const { return equations.size(); }

    std::vector<Kq_BoolEquation> equations;
    std::vector<Kq_BoolEquationImp> engines;
    std::vector<Kq_BoolEquation::TruthTable> tables;
    std::vector<Kq_BoolEquationImp::TruthTable> engineTables;
    std::vector<Kq_BoolEquation::Handle> handles;
};

// One question about the objects at a position, answered as text; "" for a dump.
struct Question {
    const char* name; // as in the demangled symbol table of the library
    std::string (*ask)(const SharedObjects& objects, size_t position);
};

extern const std::vector<Question> kOfEquation;
extern const std::vector<Question> kOfTables; // of the facade, and of handles
extern const std::vector<Question> kOfEngine;
extern const std::vector<Question> kOfEngineTables; // also of nodes

// All four lists together.
std::vector<Question> AllQuestions();

} // namespace threads

#endif
