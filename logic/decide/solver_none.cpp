// The solver of a build that has none.
#include "solver.h"

namespace booleq {

struct Solver::State {};

Solver::Solver(Effort /*effort*/, const Deadline& /*deadline*/) {}

Solver::~Solver() = default;

bool Solver::IsThere()
{
    return false;
}

bool Solver::TraceTo(const std::string& /*path*/)
{
    return false;
}

bool Solver::EndTrace()
{
    return false;
}

void Solver::Add(std::initializer_list<int> /*clause*/) {}

void Solver::AddLiteral(int /*literal*/) {}

Solver::Answer Solver::Solve(std::initializer_list<int> /*assumptions*/, int /*maxConflicts*/)
{
    return Answer::Unknown;
}

bool Solver::Value(int /*variable*/) const
{
    return false;
}

} // namespace booleq
