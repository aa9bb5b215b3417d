// A solver of clauses. Clauses enter; a satisfying assignment leaves, or that there is none, or
// that a limit was reached first. A build without a solver has the same class, which never finds an
// answer. The search is that of CaDiCaL: Biere, Fazekas, Fleury, Heisinger, "CaDiCaL, Kissat,
// Paracooba, Plingeling and Treengeling Entering the SAT Competition 2020", University of Helsinki,
// 2020.
#ifndef BOOLEQ_DECIDE_SOLVER_H
#define BOOLEQ_DECIDE_SOLVER_H

#include <initializer_list>
#include <memory>
#include <string>

#include "deadline.h"

namespace booleq {

// Variables are numbers from 1 on, a literal is one of them or its negative.
class Solver {
  public:
    enum class Effort {
        Quick,   // many small questions: no simplification between them
        Thorough // one hard question
    };
    enum class Answer { Satisfiable, Unsatisfiable, Unknown };

    static constexpr int kNoLimit = -1;

    // 'deadline' outlives the solver.
    Solver(Effort effort, const Deadline& deadline);
    ~Solver();
    Solver(const Solver&) = delete;
    Solver& operator=(const Solver&) = delete;

    // Whether this build has a solver; without one every answer is Unknown.
    static bool IsThere();

    // Writes every step of the search to a file, as text in the DRAT format.
    // Requires: no clause was added.  Fails: false if the file cannot be opened.
    bool TraceTo(const std::string& path);
    // Closes the file.  Requires: TraceTo succeeded.  Fails: false if something was not written.
    bool EndTrace();

    void Add(std::initializer_list<int> clause);
    // For clauses of any length: literals one by one, then 0.
    void AddLiteral(int literal);

    // The assumptions hold for this question only. The watcher is called meanwhile; what it throws
    // is passed on, and the solver can be asked again.
    // Fails: Unknown, after 'maxConflicts' conflicts or when the time has run out.
    Answer Solve(std::initializer_list<int> assumptions, int maxConflicts = kNoLimit);

    // Requires: the last answer was Satisfiable.
    bool Value(int variable) const;

  private:
    struct State;
    std::unique_ptr<State> m_state;
};

} // namespace booleq

#endif
