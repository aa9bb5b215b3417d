// Whether a proof shows that nothing satisfies some clauses, told by a program that shares no code
// with whoever wrote it. Both enter as text, DIMACS and DRAT; what leaves says where a proof fails.
// Each added clause is checked when it comes, in the order of the file, by unit propagation or,
// where that does not do, by its resolvents on the first literal; a deleted clause is used no more.
// After Wetzler, Heule, Hunt, "DRAT-trim: Efficient Checking and Trimming Using Expressive Clausal
// Proofs", SAT 2014; stricter than that: a clause that is deleted must be there, also one that was
// a unit, and the empty clause must stand in the proof.
#ifndef TESTS_DECIDE_PROOF_CHECK_H
#define TESTS_DECIDE_PROOF_CHECK_H

#include <cstddef>
#include <string>

namespace decide_pairs {

struct ProofVerdict {
    bool isAccepted = false;
    std::string reason; // not empty: why it is not, and where
    size_t numAdded = 0;
    size_t numDeleted = 0;
    size_t numByResolvents = 0; // of those added: not by unit propagation alone
};

// Never fails for want of a format: what is not DIMACS or DRAT is a reason.
// Cost: in step with the propagations that the writer of the proof did, as a rule.
ProofVerdict CheckProof(const std::string& dimacs, const std::string& proof);

} // namespace decide_pairs

#endif
