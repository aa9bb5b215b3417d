#include "notation_writer.h"

#include <algorithm>
#include <cassert>
#include <iterator>

namespace booleq {

namespace {

constexpr int kLeafLevel = 100;

// How one node is written: before, between and after its operands.
struct Form {
    std::string text;
    int level = kLeafLevel;
    Chain chain = Chain::Any;
};

// What a writer asks about a syntax.
class Syntax {
  public:
    virtual ~Syntax() = default;
    virtual Form FormOf(const Expression::Node& node) const = 0;
    virtual bool Has(Operator op) const = 0;
    // Two inversions may follow each other.
    virtual bool InversionsNest() const { return true; }
    // Compilers warn about "!a & (b | c)", because "!(a & ...)" may have been meant.
    virtual bool DoubtsInversions() const { return false; }
    // Every operation gets parentheses.
    virtual bool IsWhole() const { return false; }
};

class ForeignSyntax : public Syntax {
  public:
    ForeignSyntax(const Notation& notation, const std::vector<std::string>& names)
        : m_notation(notation), m_names(names)
    {
    }

    Form FormOf(const Expression::Node& node) const override
    {
        if (node.op == Operator::Input)
            return {m_names[node.left], kLeafLevel, Chain::Any};
        if (node.op == Operator::Zero || node.op == Operator::One)
            return {node.op == Operator::Zero ? m_notation.zero : m_notation.one, kLeafLevel,
                    Chain::Any};
        if (node.op == Operator::Not) {
            const OperatorForm& form = m_notation.prefixes.front();
            const std::string text = form.text;
            return {text.size() > 1 ? text + " " : text, form.level, form.chain};
        }
        const OperatorForm* form = Find(node.op);
        assert(form);
        if (m_notation.mixesInParentheses)
            return {std::string(" ") + form->text + " ", 1, Chain::Same};
        return {std::string(" ") + form->text + " ", form->level, form->chain};
    }

    bool Has(Operator op) const override { return Find(op) != nullptr; }
    bool InversionsNest() const override { return m_notation.prefixesNest; }
    bool DoubtsInversions() const override { return m_notation.mixesInParentheses; }

  private:
    const OperatorForm* Find(Operator op) const
    {
        const auto isIt = [op](const OperatorForm& form) {
            return form.isWritten && form.meaning == MeaningOf(op);
        };
        const auto found =
            std::find_if(m_notation.binaries.begin(), m_notation.binaries.end(), isIt);
        return found == m_notation.binaries.end() ? nullptr : &*found;
    }

    const Notation& m_notation;
    const std::vector<std::string>& m_names;
};

class LibrarySyntax : public Syntax {
  public:
    LibrarySyntax(const std::vector<std::string>& names, OwnSyntax syntax, Parentheses parentheses)
        : m_names(names), m_syntax(syntax), m_parentheses(parentheses)
    {
    }

    Form FormOf(const Expression::Node& node) const override
    {
        if (node.op == Operator::Input)
            return {m_names[node.left], kLeafLevel, Chain::Any};
        if (node.op == Operator::Zero || node.op == Operator::One)
            return {node.op == Operator::Zero ? "0" : "1", kLeafLevel, Chain::Any};
        const std::string text = SpellOperator(node.op, Style(node));
        if (node.op == Operator::Not)
            return {text.size() > 1 ? text + " " : text, kLeafLevel - 1, Chain::Any};
        Chain chain = Chain::Any;
        if (m_parentheses == Parentheses::Clear)
            chain = node.op >= Operator::Nand ? Chain::None : Chain::Same;
        return {" " + text + " ", 1, chain};
    }

    bool Has(Operator) const override { return true; }
    bool IsWhole() const override { return m_parentheses == Parentheses::Whole; }

  private:
    uint8_t Style(const Expression::Node& node) const
    {
        if (m_syntax == OwnSyntax::AsTyped)
            return node.spelling;
        if (node.op == Operator::Not || m_syntax == OwnSyntax::First)
            return 0;
        return m_syntax == OwnSyntax::Second ? 1 : 2;
    }

    const std::vector<std::string>& m_names;
    OwnSyntax m_syntax;
    Parentheses m_parentheses;
};

// The operator that a negated operator inverts.
Operator Inner(Operator op)
{
    if (op == Operator::Nand)
        return Operator::And;
    if (op == Operator::Nor)
        return Operator::Or;
    assert(op == Operator::Nxor);
    return Operator::Xor;
}

class Writer {
  public:
    Writer(const Expression& expression, const Syntax& syntax)
        : m_nodes(expression.nodes), m_syntax(syntax)
    {
    }

    std::string Write()
    {
        if (m_nodes.empty())
            return "0";
        Push(m_nodes.back(), m_syntax.IsWhole() && IsBinary(m_nodes.back().op));
        while (!m_pending.empty()) {
            const Piece piece = m_pending.back();
            m_pending.pop_back();
            if (piece.text.empty())
                Expand(piece.node);
            else
                m_text += piece.text;
        }
        assert(!m_text.empty());
        return m_text;
    }

  private:
    // A text, or a node that is still to be written.
    struct Piece {
        std::string text;
        Expression::Node node;
    };

    void PushText(const std::string& text) { m_pending.push_back({text, {}}); }

    void Push(const Expression::Node& node, bool hasParentheses)
    {
        if (hasParentheses)
            PushText(")");
        m_pending.push_back({"", node});
        if (hasParentheses)
            PushText("(");
    }

    // In a syntax without NAND, a NAND is an inversion of an AND and is treated as one.
    bool IsInversion(const Expression::Node& node) const
    {
        return node.op == Operator::Not || (IsBinary(node.op) && !m_syntax.Has(node.op));
    }

    Form FormOf(const Expression::Node& node) const
    {
        return m_syntax.FormOf(
            IsInversion(node) ? Expression::Node{Operator::Not, node.spelling, 0, 0} : node);
    }

    bool InversionNeeds(const Form& inversion, const Expression::Node& operand) const
    {
        if (IsInversion(operand))
            return !m_syntax.InversionsNest();
        const Form form = FormOf(operand);
        return form.level < inversion.level || (m_syntax.IsWhole() && IsBinary(operand.op));
    }

    bool BinaryNeeds(const Expression::Node& node, const Form& own, const Expression::Node& operand,
                     bool isLeft) const
    {
        const Form form = FormOf(operand);
        if (isLeft && IsInversion(operand) && m_syntax.DoubtsInversions()) {
            const Expression::Node& right = m_nodes[node.right];
            return right.op != Operator::Input && !IsInversion(right);
        }
        if (form.level >= kLeafLevel - 1)
            return false;
        if (m_syntax.IsWhole())
            return true;
        if (form.level != own.level || !isLeft)
            return form.level <= own.level;
        const bool chains =
            own.chain == Chain::Any || (own.chain == Chain::Same && node.op == operand.op);
        return !chains || form.chain == Chain::None;
    }

    // Pushes the pieces from the last to the first.
    void Expand(const Expression::Node& node)
    {
        assert(!IsBinary(node.op) || (node.left < m_nodes.size() && node.right < m_nodes.size()));
        const Form form = FormOf(node);
        if (IsInversion(node)) {
            Expression::Node operand = node;
            if (node.op == Operator::Not)
                operand = m_nodes[node.left];
            else
                operand.op = Inner(node.op);
            Push(operand, InversionNeeds(form, operand));
            PushText(form.text);
        } else if (IsBinary(node.op)) {
            const Expression::Node& left = m_nodes[node.left];
            const Expression::Node& right = m_nodes[node.right];
            Push(right, BinaryNeeds(node, form, right, false));
            PushText(form.text);
            Push(left, BinaryNeeds(node, form, left, true));
        } else {
            m_text += form.text;
        }
    }

    const std::vector<Expression::Node>& m_nodes;
    const Syntax& m_syntax;
    std::vector<Piece> m_pending;
    std::string m_text;
};

} // namespace

std::string Write(const Expression& expression, const Notation& notation,
                  const std::vector<std::string>& names)
{
    return Writer(expression, ForeignSyntax(notation, names)).Write();
}

std::string WriteOwn(const Expression& expression, OwnSyntax syntax, Parentheses parentheses)
{
    const std::string text =
        Writer(expression, LibrarySyntax(expression.names, syntax, parentheses)).Write();
    return text.size() > 2 && text[0] == '0' ? "(" + text + ")" : text;
}

} // namespace booleq
