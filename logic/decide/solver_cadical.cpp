// The solver of a build that has CaDiCaL.
#include "solver.h"

#include <cassert>
#include <cstdio>
#include <exception>

#include <cadical.hpp>

namespace booleq {

// No exception passes through the solver: what the watcher throws is kept and ends the search.
struct Solver::State : CaDiCaL::Terminator {
    explicit State(const Deadline& limit) : deadline(limit) {}

    bool terminate() override
    {
        try {
            return thrown || deadline.IsOver();
        } catch (...) {
            thrown = std::current_exception();
            return true;
        }
    }

    const Deadline& deadline;
    std::exception_ptr thrown;
    Answer lastAnswer = Answer::Unknown;
    std::unique_ptr<FILE, int (*)(FILE*)> trace{nullptr, fclose};
    CaDiCaL::Solver solver; // last, so that it is destroyed first
};

Solver::Solver(Effort effort, const Deadline& deadline) : m_state(new State(deadline))
{
    CaDiCaL::Solver& solver = m_state->solver;
    if (effort == Effort::Quick) {
        solver.configure("plain");
        solver.set("lucky", 0);
    }
    solver.set("quiet", 1);
    solver.set("seed", 0);
    solver.connect_terminator(m_state.get());
}

Solver::~Solver()
{
    m_state->solver.disconnect_terminator();
}

bool Solver::IsThere()
{
    return true;
}

bool Solver::TraceTo(const std::string& path)
{
    m_state->solver.set("binary", 0);
    m_state->trace.reset(fopen(path.c_str(), "w"));
    return m_state->trace && m_state->solver.trace_proof(m_state->trace.get(), path.c_str());
}

bool Solver::EndTrace()
{
    m_state->solver.flush_proof_trace();
    m_state->solver.close_proof_trace();
    const bool isWritten = ferror(m_state->trace.get()) == 0;
    return fclose(m_state->trace.release()) == 0 && isWritten;
}

void Solver::Add(std::initializer_list<int> clause)
{
    for (const int literal : clause)
        AddLiteral(literal);
    m_state->solver.add(0);
}

void Solver::AddLiteral(int literal)
{
    m_state->solver.add(literal);
}

Solver::Answer Solver::Solve(std::initializer_list<int> assumptions, int maxConflicts)
{
    State& state = *m_state;
    for (const int literal : assumptions)
        state.solver.assume(literal);
    state.solver.limit("conflicts", maxConflicts);
    const int status = state.solver.solve();
    if (state.thrown) {
        const std::exception_ptr thrown = state.thrown;
        state.thrown = nullptr;
        state.lastAnswer = Answer::Unknown;
        std::rethrow_exception(thrown);
    }
    assert(status == 0 || status == 10 || status == 20);
    state.lastAnswer = status == 10   ? Answer::Satisfiable
                       : status == 20 ? Answer::Unsatisfiable
                                      : Answer::Unknown;
    return state.lastAnswer;
}

bool Solver::Value(int variable) const
{
    assert(m_state->lastAnswer == Answer::Satisfiable);
    return m_state->solver.val(variable) > 0;
}

} // namespace booleq
