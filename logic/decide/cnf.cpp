// The clauses of an operator are Tseitin's ("On the Complexity of Derivation in Propositional
// Calculus", 1968), in both directions.
#include "cnf.h"

#include <cassert>
#include <initializer_list>

#include "joined_inputs.h"
#include "solver.h"
#include "text.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr size_t kWatchedNodes = 4096;

// Appends to the clauses. A literal is a variable or its negative.
class CnfWriter {
  public:
    explicit CnfWriter(Cnf& cnf) : m_cnf(cnf)
    {
        m_cnf.numVariables = static_cast<int>(cnf.names.size());
    }

    void Add(std::initializer_list<int> clause)
    {
        m_cnf.literals.insert(m_cnf.literals.end(), clause);
        m_cnf.literals.push_back(0);
        ++m_cnf.numClauses;
    }

    // Input k of the expression is variable places[k] + 1.
    int LiteralOf(const Expression& expression, const std::vector<uint32_t>& places)
    {
        assert(!expression.nodes.empty());
        std::vector<int> literals; // of operands that wait for their operator
        for (size_t index = 0; index < expression.nodes.size(); ++index) {
            if (index % kWatchedNodes == 0)
                Watch();
            const Expression::Node& node = expression.nodes[index];
            if (node.op == Operator::Input) {
                literals.push_back(static_cast<int>(places[node.left]) + 1);
            } else if (node.op == Operator::Not) {
                literals.back() = -literals.back();
            } else if (IsBinary(node.op)) {
                const int right = literals.back();
                literals.pop_back();
                literals.back() = Binary(node.op, literals.back(), right);
            } else {
                literals.push_back(node.op == Operator::One ? True() : -True());
            }
        }
        assert(literals.size() == 1);
        return literals.back();
    }

    int Binary(Operator op, int left, int right)
    {
        switch (op) {
        case Operator::And:
            return And(left, right);
        case Operator::Or:
            return -And(-left, -right);
        case Operator::Xor:
            return Xor(left, right);
        case Operator::Nand:
            return -And(left, right);
        case Operator::Nor:
            return And(-left, -right);
        case Operator::Nxor:
            return -Xor(left, right);
        case Operator::Zero:
        case Operator::One:
        case Operator::Input:
        case Operator::Not:
            break;
        }
        assert(false);
        return 0;
    }

  private:
    // The variable that is always 1, for constants.
    int True()
    {
        if (m_true == 0) {
            m_true = ++m_cnf.numVariables;
            Add({m_true});
        }
        return m_true;
    }

    int And(int left, int right)
    {
        if (left == right)
            return left;
        if (left == -right)
            return -True();
        const int output = ++m_cnf.numVariables;
        Add({-output, left});
        Add({-output, right});
        Add({output, -left, -right});
        return output;
    }

    int Xor(int left, int right)
    {
        if (left == right)
            return -True();
        if (left == -right)
            return True();
        const int output = ++m_cnf.numVariables;
        Add({-output, left, right});
        Add({-output, -left, -right});
        Add({output, -left, right});
        Add({output, left, -right});
        return output;
    }

    Cnf& m_cnf;
    int m_true = 0;
};

std::vector<uint32_t> InOrder(size_t numInputs)
{
    std::vector<uint32_t> places;
    for (uint32_t input = 0; input < numInputs; ++input)
        places.push_back(input);
    return places;
}

} // namespace

Cnf ClausesOfDifference(const Expression& left, const Expression& right)
{
    Cnf cnf;
    cnf.meaning = "satisfiable when the two expressions differ";
    cnf.names = left.names;
    const std::vector<uint32_t> places = JoinInputs(right.names, cnf.names);
    CnfWriter writer(cnf);
    const int leftLiteral = writer.LiteralOf(left, InOrder(left.names.size()));
    const int rightLiteral = writer.LiteralOf(right, places);
    writer.Add({writer.Binary(Operator::Xor, leftLiteral, rightLiteral)});
    return cnf;
}

Cnf ClausesOfValue(const Expression& expression, bool value)
{
    Cnf cnf;
    cnf.meaning = std::string("satisfiable when the expression can be ") + (value ? "1" : "0");
    cnf.names = expression.names;
    CnfWriter writer(cnf);
    const int literal = writer.LiteralOf(expression, InOrder(expression.names.size()));
    writer.Add({value ? literal : -literal});
    return cnf;
}

std::string ToDimacs(const Cnf& cnf)
{
    std::string text = "c " + cnf.meaning + "\n";
    for (size_t input = 0; input < cnf.names.size(); ++input)
        text += "c " + Visible(cnf.names[input]) + " = " + std::to_string(input + 1) + "\n";
    text +=
        "p cnf " + std::to_string(cnf.numVariables) + " " + std::to_string(cnf.numClauses) + "\n";
    for (const int literal : cnf.literals) {
        text += std::to_string(literal);
        text += literal == 0 ? '\n' : ' ';
    }
    return text;
}

ProofEnd WriteProof(const Cnf& cnf, const std::string& path, const Limits& limits)
{
    if (!Solver::IsThere())
        return ProofEnd::NoSolver;
    const Deadline deadline(limits);
    Solver solver(Solver::Effort::Thorough, deadline);
    if (!solver.TraceTo(path))
        return ProofEnd::CannotWrite;
    for (const int literal : cnf.literals)
        solver.AddLiteral(literal);
    const Solver::Answer answer = solver.Solve({});
    const bool isWritten = solver.EndTrace();
    if (answer == Solver::Answer::Satisfiable)
        return ProofEnd::Satisfiable;
    if (answer == Solver::Answer::Unknown)
        return ProofEnd::TimeIsOver;
    return isWritten ? ProofEnd::Proved : ProofEnd::CannotWrite;
}

} // namespace booleq
