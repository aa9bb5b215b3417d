#include "network.h"

#include <algorithm>
#include <set>

#include "notation.h"
#include "notation_writer.h"

namespace booleq {

namespace {

// Names for inner signals, "n1" and so on, that neither an input nor the output has.
class FreshNames {
  public:
    explicit FreshNames(const UnitNames& names) : m_used(names.inputs.begin(), names.inputs.end())
    {
        m_used.insert(names.output);
    }

    std::string Next()
    {
        std::string name;
        do
            name = "n" + std::to_string(++m_number);
        while (m_used.count(name) != 0);
        return name;
    }

  private:
    std::set<std::string> m_used;
    size_t m_number = 0;
};

std::string Joined(const std::vector<std::string>& names)
{
    std::string text;
    for (const std::string& name : names)
        text += " " + name;
    return text;
}

// The rows of a gate's table where it is 1.
const char* BlifRows(Operator op)
{
    switch (op) {
    case Operator::Zero:
        return "";
    case Operator::One:
        return "1\n";
    case Operator::Input:
        return "1 1\n";
    case Operator::Not:
        return "0 1\n";
    case Operator::And:
        return "11 1\n";
    case Operator::Or:
        return "1- 1\n-1 1\n";
    case Operator::Xor:
        return "10 1\n01 1\n";
    case Operator::Nand:
        return "0- 1\n-0 1\n";
    case Operator::Nor:
        return "00 1\n";
    case Operator::Nxor:
        return "11 1\n00 1\n";
    }
    return "";
}

// Writes an expression as equations of AND, OR and NOT.
//
// Invariant: m_nodes holds the operands that wait for their operator, one after another, each in
// post-order and starting at its element of m_starts. Links are not set.
class EqnWriter {
  public:
    EqnWriter(const Expression& expression, const UnitNames& names)
        : m_source(expression), m_names(names), m_fresh(names), m_signals(names.inputs)
    {
    }

    std::string Write()
    {
        for (const Expression::Node& node : m_source.nodes)
            Add(node);
        const std::string last = Equation(m_names.output, 0, m_nodes.size());
        return "INORDER =" + Joined(m_names.inputs) + ";\nOUTORDER = " + m_names.output + ";\n" +
               m_equations + last;
    }

  private:
    void Add(const Expression::Node& node)
    {
        if (!IsBinary(node.op)) {
            if (node.op != Operator::Not)
                m_starts.push_back(m_nodes.size());
            m_nodes.push_back(node);
            return;
        }
        const size_t right = m_starts.back();
        m_starts.pop_back();
        if (node.op == Operator::Xor || node.op == Operator::Nxor) {
            AddExclusive(node.op, right);
            return;
        }
        const bool isAnd = node.op == Operator::And || node.op == Operator::Nand;
        Append(isAnd ? Operator::And : Operator::Or);
        if (node.op == Operator::Nand || node.op == Operator::Nor)
            Append(Operator::Not);
    }

    void Append(Operator op) { m_nodes.push_back({op, 0, 0, 0}); }

    // Both operands are needed twice, so an operand of more than one node becomes a signal.
    void AddExclusive(Operator op, size_t rightStart)
    {
        const size_t leftStart = m_starts.back();
        const Expression::Node left = Named(leftStart, rightStart);
        const Expression::Node right = Named(rightStart, m_nodes.size());
        m_nodes.resize(leftStart);
        m_nodes.push_back(left);
        m_nodes.push_back(right);
        if (op == Operator::Xor)
            Append(Operator::Not);
        Append(Operator::And);
        m_nodes.push_back(left);
        Append(Operator::Not);
        m_nodes.push_back(right);
        if (op == Operator::Nxor)
            Append(Operator::Not);
        Append(Operator::And);
        Append(Operator::Or);
    }

    Expression::Node Named(size_t start, size_t end)
    {
        if (end - start == 1)
            return m_nodes[start];
        const std::string name = m_fresh.Next();
        m_equations += Equation(name, start, end);
        m_signals.push_back(name);
        return {Operator::Input, 0, static_cast<uint32_t>(m_signals.size() - 1), 0};
    }

    std::string Equation(const std::string& name, size_t start, size_t end) const
    {
        Expression expression;
        std::vector<uint32_t> operands;
        for (size_t place = start; place < end; ++place) {
            Expression::Node node = m_nodes[place];
            if (IsBinary(node.op)) {
                node.right = operands.back();
                operands.pop_back();
            }
            if (IsBinary(node.op) || node.op == Operator::Not) {
                node.left = operands.back();
                operands.pop_back();
            }
            operands.push_back(static_cast<uint32_t>(expression.nodes.size()));
            expression.nodes.push_back(node);
        }
        return name + " = " + booleq::Write(expression, EqnNotation(), m_signals) + ";\n";
    }

    const Expression& m_source;
    const UnitNames& m_names;
    FreshNames m_fresh;
    std::vector<std::string> m_signals;
    std::vector<Expression::Node> m_nodes;
    std::vector<size_t> m_starts;
    std::string m_equations;
};

} // namespace

std::string WriteBlif(const Expression& expression, const UnitNames& names)
{
    std::string text = ".model " + names.unit + "\n.inputs" + Joined(names.inputs) + "\n.outputs " +
                       names.output + "\n";
    FreshNames fresh(names);
    std::vector<std::string> operands;
    for (size_t node = 0; node < expression.nodes.size(); ++node) {
        const Expression::Node& own = expression.nodes[node];
        const bool isRoot = node + 1 == expression.nodes.size();
        std::string inputs;
        if (own.op == Operator::Input) {
            inputs = " " + names.inputs[own.left];
            if (!isRoot) {
                operands.push_back(names.inputs[own.left]);
                continue;
            }
        } else if (own.op >= Operator::Not) {
            inputs = " " + operands.back();
            operands.pop_back();
        }
        if (IsBinary(own.op)) {
            inputs.insert(0, " " + operands.back());
            operands.pop_back();
        }
        operands.push_back(isRoot ? names.output : fresh.Next());
        text += ".names" + inputs + " " + operands.back() + "\n" + BlifRows(own.op);
    }
    return text + ".end\n";
}

std::string WriteEqn(const Expression& expression, const UnitNames& names)
{
    return EqnWriter(expression, names).Write();
}

std::string WritePla(const std::vector<Cube>& cubes, const UnitNames& names)
{
    const size_t numInputs = names.inputs.size();
    std::string text = ".i " + std::to_string(numInputs) + "\n.o 1\n.ilb" + Joined(names.inputs) +
                       "\n.ob " + names.output + "\n.p " +
                       std::to_string(std::max<size_t>(cubes.size(), 1)) + "\n";
    for (const Cube& cube : cubes) {
        for (size_t input = 0; input < numInputs; ++input) {
            const bool isUsed = (cube.used >> input & 1u) != 0;
            text += isUsed ? static_cast<char>('0' + (cube.values >> input & 1u)) : '-';
        }
        text += " 1\n";
    }
    // Some readers do not accept a table without rows; a row with result 0 adds nothing.
    if (cubes.empty())
        text += std::string(numInputs, '-') + " 0\n";
    return text + ".e\n";
}

} // namespace booleq
