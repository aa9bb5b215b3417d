// Reads files of equations: the orders of inputs and outputs, then "signal = expression;" lines,
// each signal defined before it is used and the one output last.
// Fails: false, and 'network' is unchanged.  Cost: linear in the text.
#include <sstream>

#include "foreign_tree.h"
#include "network_builder.h"
#include "notation.h"

namespace booleq {

namespace {

class EqnReader {
  public:
    bool Read(const std::string& text)
    {
        std::istringstream statements(text);
        for (std::string statement; std::getline(statements, statement, ';');) {
            const size_t sign = statement.find('=');
            if (sign == std::string::npos)
                return true; // only the line end after the last statement
            const std::vector<std::string> target = SplitWords(statement.substr(0, sign));
            if (target.size() != 1 || !ReadStatement(target[0], statement.substr(sign + 1)))
                return false;
        }
        return true;
    }

    bool Take(Network& network) { return m_builder.Take(m_output, network); }

  private:
    struct Directive {
        const char* word;
        bool (EqnReader::*read)(const std::string& value);
    };

    bool ReadStatement(const std::string& target, const std::string& value)
    {
        static constexpr Directive kDirectives[] = {{"INORDER", &EqnReader::ReadInputs},
                                                    {"OUTORDER", &EqnReader::ReadOutput}};
        for (const Directive& directive : kDirectives)
            if (target == directive.word)
                return (this->*directive.read)(value);
        return ReadEquation(target, value);
    }

    bool ReadInputs(const std::string& value)
    {
        for (const std::string& name : SplitWords(value))
            if (!m_builder.AddInput(name))
                return false;
        return true;
    }

    bool ReadOutput(const std::string& value)
    {
        const std::vector<std::string> names = SplitWords(value);
        if (names.size() != 1)
            return false;
        m_output = names[0];
        return true;
    }

    bool ReadEquation(const std::string& target, const std::string& value)
    {
        ForeignTree tree;
        Expression expression;
        std::string fault;
        if (!booleq::Read(value, EqnNotation(), tree, fault) || !ToExpression(tree, expression))
            return false;
        for (Expression::Node& node : expression.nodes)
            if (node.op == Operator::Input && !m_builder.Find(tree.names[node.left], node.left))
                return false;
        if (!m_builder.AddSignal(target))
            return false;
        m_builder.DefineLast(std::move(expression));
        return true;
    }

    NetworkBuilder m_builder;
    std::string m_output;
};

} // namespace

bool ReadEqn(const std::string& text, Network& network)
{
    EqnReader reader;
    return reader.Read(text) && reader.Take(network);
}

} // namespace booleq
