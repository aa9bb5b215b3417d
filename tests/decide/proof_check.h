// Checks a proof that clauses are unsatisfiable, independently: no code is shared with the solver.
// In: clauses as DIMACS, the proof as DRAT; out: whether it holds, and where it fails. Method of
// Wetzler, Heule, Hunt, "DRAT-trim: Efficient Checking and Trimming Using Expressive Clausal
// Proofs", SAT 2014, but stricter: deleted clauses must exist, units too, and the empty clause must
// be in the proof.
#ifndef TESTS_DECIDE_PROOF_CHECK_H
#define TESTS_DECIDE_PROOF_CHECK_H

#include <cstddef>
#include <string>

namespace decide_pairs {

struct ProofVerdict {
    bool isAccepted = false;
    std::string reason; // if not empty: why it is not a proof, and where
    size_t numAdded = 0;
    size_t numDeleted = 0;
    size_t numByResolvents = 0; // of the added clauses: not by unit propagation alone
};

// Checks each added clause in the order of the file, by unit propagation or else by its resolvents
// on the first literal; a deleted clause is no longer used.
// Fails: never; text that is not DIMACS or DRAT is a reason.
// Cost: usually proportional to the propagations of the program that wrote the proof.
ProofVerdict CheckProof(const std::string& dimacs, const std::string& proof);

} // namespace decide_pairs

#endif
