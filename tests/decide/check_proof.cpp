// Checks a proof that clauses are unsatisfiable: check_proof CLAUSES PROOF, files in the formats
// DIMACS and DRAT. Exit status 0: it is a proof, 1: it is not, with the reason, 2: a file cannot be
// read.
#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>

#include "proof_check.h"

namespace {

bool Read(const char* path, std::string& text)
{
    std::ifstream file(path, std::ios::binary);
    std::ostringstream content;
    content << file.rdbuf();
    text = content.str();
    if (file)
        return true;
    std::fprintf(stderr, "check_proof: cannot read %s\n", path);
    return false;
}

} // namespace

int main(int argc, char** argv)
{
    std::string clauses;
    std::string proof;
    if (argc != 3) {
        std::fprintf(stderr, "usage: check_proof CLAUSES PROOF\n");
        return 2;
    }
    if (!Read(argv[1], clauses) || !Read(argv[2], proof))
        return 2;
    const decide_pairs::ProofVerdict verdict = decide_pairs::CheckProof(clauses, proof);
    if (!verdict.isAccepted) {
        std::printf("refused: %s\n", verdict.reason.c_str());
        return 1;
    }
    std::printf("proved: %zu clauses added, %zu of them by their resolvents, %zu deleted\n",
                verdict.numAdded, verdict.numByResolvents, verdict.numDeleted);
    return 0;
}
