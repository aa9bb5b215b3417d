// A question as clauses for any solver, and the answer "never" as a proof for any checker. One or
// two expressions enter and are taken as they are: nothing is flattened, joined or left out, so the
// reader of the clauses need not trust this program.
// Fails: std::bad_alloc, or what the watcher throws.
// Cost: O(nodes) for clauses; a proof may take exponential time even if deciding does not.
#ifndef BOOLEQ_DECIDE_CNF_H
#define BOOLEQ_DECIDE_CNF_H

#include <cstddef>
#include <string>
#include <vector>

#include "deadline.h"
#include "expression.h"

namespace booleq {

// Invariants: variables 1 to names.size() are the inputs; no clause has a variable twice.
struct Cnf {
    std::vector<std::string> names;
    std::string meaning; // of a satisfying assignment; it becomes a comment
    int numVariables = 0;
    size_t numClauses = 0;
    std::vector<int> literals; // each clause ends with 0
};

// Satisfied by the assignments for which the two differ; inputs with the same name are the same.
// Requires: each expression has a node; together they have at most 2^30.
Cnf ClausesOfDifference(const Expression& left, const Expression& right);
// Satisfied by the assignments for which the expression has the value.
Cnf ClausesOfValue(const Expression& expression, bool value);

// The clauses in the DIMACS format, after a comment "c NAME = VARIABLE" for each input.
std::string ToDimacs(const Cnf& cnf);

enum class ProofEnd { Proved, Satisfiable, TimeIsOver, NoSolver, CannotWrite };

// Writes a proof that nothing satisfies exactly these clauses, as text in the DRAT format: Wetzler,
// Heule, Hunt, "DRAT-trim: Efficient Checking and Trimming Using Expressive Clausal Proofs", SAT
// 2014. The file holds a proof only if the result is Proved.
ProofEnd WriteProof(const Cnf& cnf, const std::string& path, const Limits& limits);

} // namespace booleq

#endif
