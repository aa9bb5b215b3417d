// Proofs that a solver writes, and the checker that reads them.
#include <cstdio>
#include <fstream>
#include <random>
#include <sstream>

#include <gtest/gtest.h>
#include <unistd.h>

#include "cnf.h"
#include "decide/pairs.h"
#include "decide/proof_check.h"
#include "decision.h"
#include "logic_support.h"
#include "solver.h"

namespace {

using namespace booleq;
using decide_pairs::CheckProof;
using decide_pairs::ProofVerdict;
using namespace logic_support;

// Two variables, none of whose four assignments is allowed.
constexpr const char* kFour = "c nothing\np cnf 2 4\n1 2 0\n-1 2 0\n1 -2 0\n-1 -2 0\n";

std::string ReasonOf(const std::string& clauses, const std::string& proof)
{
    const ProofVerdict verdict = CheckProof(clauses, proof);
    EXPECT_EQ(verdict.isAccepted, verdict.reason.empty());
    return verdict.reason;
}

TEST(ProofCheck, FollowsUnitsAndDeletions)
{
    EXPECT_EQ(ReasonOf(kFour, "1 0\n0\n"), "");
    EXPECT_EQ(ReasonOf(kFour, "1 0\nd 1 2 0\nd -2 1 0\n0\n"), "");
    EXPECT_EQ(ReasonOf(kFour, "1 0\nd 1 0\n0\n"), "proof, line 3: the clause does not follow");
    // What followed from a deleted clause is gone, although it was propagated before.
    EXPECT_EQ(ReasonOf("p cnf 3 4\n1 0\n-1 2 0\n-2 3 0\n-3 -2 0\n", "0\n"), "");
    EXPECT_EQ(ReasonOf("p cnf 3 4\n1 0\n-1 2 0\n-2 3 0\n-3 -2 0\n", "d -1 2 0\n0\n"),
              "proof, line 2: the clause does not follow");
    EXPECT_EQ(ReasonOf("p cnf 3 4\n1 0\n-1 2 0\n-2 3 0\n-3 -2 0\n", "2 0\nd 2 -1 0\n0\n"), "");
    EXPECT_EQ(ReasonOf("p cnf 2 3\n1 0\n1 0\n-1 0\n", "d 1 0\n0\n"), "");
    EXPECT_EQ(ReasonOf("p cnf 0 1\n0\n", "0\n"), "");
}

TEST(ProofCheck, TakesResolventsWherePropagationDoesNotDo)
{
    // 3 is new and defined as 1 AND 2; the unsatisfiable clauses have other variables.
    const ProofVerdict verdict = CheckProof("p cnf 5 5\n1 2 0\n4 5 0\n-4 5 0\n4 -5 0\n-4 -5 0\n",
                                            "3 -1 -2 0\n-3 1 0\n-3 2 0\n4 0\n0\n");
    EXPECT_TRUE(verdict.isAccepted) << verdict.reason;
    EXPECT_EQ(verdict.numByResolvents, 3u);
    EXPECT_EQ(ReasonOf("p cnf 2 1\n1 2 0\n", "-1 -2 0\n1 0\n"),
              "proof, line 2: the clause does not follow");
    // The first literal counts: nothing resolves on 3.
    EXPECT_EQ(ReasonOf("p cnf 2 2\n1 2 0\n-1 -2 0\n", "3 1 0\n"),
              "proof, line 2: it ends without the empty clause");
    EXPECT_EQ(ReasonOf("p cnf 2 2\n1 2 0\n-1 -2 0\n", "1 3 0\n"),
              "proof, line 1: the clause does not follow");
}

TEST(ProofCheck, RefusesWhatIsNoProof)
{
    EXPECT_EQ(ReasonOf(kFour, ""), "proof, line 1: it ends without the empty clause");
    EXPECT_EQ(ReasonOf(kFour, "1 0\n"), "proof, line 2: it ends without the empty clause");
    EXPECT_EQ(ReasonOf("p cnf 2 1\n1 2 0\n", "0\n"), "proof, line 1: the clause does not follow");
    EXPECT_EQ(ReasonOf(kFour, "d 1 0\n1 0\n0\n"),
              "proof, line 1: deletes a clause that is not there");
    EXPECT_EQ(ReasonOf(kFour, "1 0\nd 1 2 0\nd 1 2 0\n0\n"),
              "proof, line 3: deletes a clause that is not there");
    EXPECT_EQ(ReasonOf(kFour, "1 x 0\n"), "proof, line 1: no clause");
    EXPECT_EQ(ReasonOf(kFour, "1"), "proof, line 1: no clause");
    EXPECT_EQ(ReasonOf(kFour, "1 99999999999 0\n"), "proof, line 1: no clause");
    EXPECT_EQ(ReasonOf("1 0\n", "0\n"), "clauses, line 1: no line 'p cnf VARIABLES CLAUSES'");
    EXPECT_EQ(ReasonOf("p cnf 1 2\n1 0\n", "0\n"), "clauses, line 3: no clause");
    EXPECT_EQ(ReasonOf("p cnf 1 1\n1 0\n-1 0\n", "0\n"), "clauses, line 3: more than was said");
}

// Proofs that the solver writes, to a file that is removed.
class SolverProof : public testing::Test {
  protected:
    void SetUp() override
    {
        if (!Solver::IsThere())
            GTEST_SKIP() << "this build has no solver";
        m_path = testing::TempDir() + "proof_" + std::to_string(getpid()) + ".drat";
    }
    void TearDown() override { std::remove(m_path.c_str()); }

    std::string ProofOf(const Cnf& cnf)
    {
        EXPECT_EQ(WriteProof(cnf, m_path, {}), ProofEnd::Proved);
        std::ifstream file(m_path, std::ios::binary);
        std::ostringstream text;
        text << file.rdbuf();
        return text.str();
    }

    std::string m_path;
};

// The clauses without one of them; the header has the right count.
Cnf Without(const Cnf& cnf, size_t dropped)
{
    Cnf fewer(cnf);
    fewer.literals.clear();
    --fewer.numClauses;
    size_t clause = 0;
    for (const int literal : cnf.literals) {
        if (clause != dropped)
            fewer.literals.push_back(literal);
        clause += literal == 0 ? 1 : 0;
    }
    return fewer;
}

TEST_F(SolverProof, IsOneForRandomPairs)
{
    std::mt19937_64 random(3);
    size_t numAdded = 0;
    size_t numDeleted = 0;
    size_t numSpoilt = 0;
    for (uint64_t number = 0; number < 300; ++number) {
        const decide_pairs::Pair pair = decide_pairs::MakePair(number, 60);
        if (!pair.isRewritten)
            continue;
        const Cnf cnf = ClausesOfDifference(pair.left, pair.right);
        const std::string proof = ProofOf(cnf);
        const ProofVerdict verdict = CheckProof(ToDimacs(cnf), proof);
        ASSERT_TRUE(verdict.isAccepted) << number << ": " << verdict.reason;
        numAdded += verdict.numAdded;
        numDeleted += verdict.numDeleted;
        // Without the clause that demands a difference, the others are satisfiable, so no proof may
        // be accepted for them.
        ASSERT_FALSE(CheckProof(ToDimacs(Without(cnf, cnf.numClauses - 1)), proof).isAccepted);
        // Without any other clause, the solver says whether the rest is satisfiable, and the
        // checker must agree.
        const Cnf fewer = Without(cnf, static_cast<size_t>(random() % cnf.numClauses));
        if (WriteProof(fewer, m_path, {}) != ProofEnd::Satisfiable)
            continue;
        ++numSpoilt;
        ASSERT_FALSE(CheckProof(ToDimacs(fewer), proof).isAccepted) << number;
    }
    EXPECT_GT(numAdded, 10000u);
    EXPECT_GT(numDeleted, 1000u);
    EXPECT_GT(numSpoilt, 10u);
}

TEST_F(SolverProof, IsNoneWhenItIsSpoilt)
{
    const Cnf cnf = ClausesOfValue(Parsed(Pigeons(6)), true);
    const std::string clauses = ToDimacs(cnf);
    const std::string proof = ProofOf(cnf);
    const ProofVerdict whole = CheckProof(clauses, proof);
    ASSERT_TRUE(whole.isAccepted) << whole.reason;
    // Only its end, only its start, and each clause with one literal inverted.
    EXPECT_NE(ReasonOf(clauses, "0\n"), "");
    EXPECT_NE(ReasonOf(clauses, proof.substr(proof.size() / 2)), "");
    EXPECT_NE(ReasonOf(clauses, proof.substr(0, proof.find('\n', proof.size() / 2) + 1)), "");
    size_t numRefused = 0;
    size_t numTried = 0;
    for (size_t start = 0; start < proof.size(); start = proof.find('\n', start) + 1) {
        if (++numTried % 5 != 0 || proof[start] == '0')
            continue;
        const size_t number = start + (proof[start] == 'd' ? 2 : 0);
        std::string spoilt(proof);
        if (spoilt[number] == '-')
            spoilt.erase(number, 1);
        else
            spoilt.insert(number, "-");
        numRefused += CheckProof(clauses, spoilt).isAccepted ? 0 : 1;
    }
    EXPECT_GT(numRefused, numTried / 10); // about a fifth; the other changes do no harm
}

TEST_F(SolverProof, IsOneForLargeQuestions)
{
    const Cnf pigeons = ClausesOfValue(Parsed(Pigeons(8)), true);
    const ProofVerdict verdict = CheckProof(ToDimacs(pigeons), ProofOf(pigeons));
    EXPECT_TRUE(verdict.isAccepted) << verdict.reason;
    EXPECT_GT(verdict.numAdded, 1000u);
    for (const uint64_t number : {1000u, 1001u, 1002u, 1003u, 1004u, 1005u}) {
        const decide_pairs::Pair pair = decide_pairs::MakePair(number, 300);
        if (!pair.isRewritten)
            continue;
        const Cnf cnf = ClausesOfDifference(pair.left, pair.right);
        const ProofVerdict ofPair = CheckProof(ToDimacs(cnf), ProofOf(cnf));
        EXPECT_TRUE(ofPair.isAccepted) << number << ": " << ofPair.reason;
    }
}

} // namespace
