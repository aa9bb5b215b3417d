#include "pairs.h"

#include <algorithm>
#include <string>
#include <vector>

namespace decide_pairs {

namespace {

using booleq::Expression;
using booleq::IsBinary;
using booleq::Operator;

// A tree with shared parts, so that rules that copy an operand are cheap. 'size' counts shared
// parts each time.
struct Part {
    Operator op;
    uint32_t left;
    uint32_t right;
    uint64_t size;
};

class Rewriter {
  public:
    Rewriter(const Expression& expression, std::mt19937_64& random)
        : m_expression(expression), m_random(random),
          m_max_size(3 * expression.nodes.size() / 2 + 30)
    {
    }

    Expression Run()
    {
        std::vector<uint32_t> made;
        for (const Expression::Node& node : m_expression.nodes) {
            uint32_t part = 0;
            if (node.op == Operator::Not)
                part = Not(made[node.left]);
            else if (IsBinary(node.op))
                part = Binary(node.op, made[node.left], made[node.right]);
            else
                part = Add(node.op, node.left, 0, 1);
            made.push_back(Chance(12) ? Not(Not(part)) : part);
        }
        return AsTree(made.back());
    }

  private:
    bool Chance(uint64_t oneOf) { return m_random() % oneOf == 0; }

    uint32_t Add(Operator op, uint32_t left, uint32_t right, uint64_t size)
    {
        m_parts.push_back({op, left, right, size});
        return static_cast<uint32_t>(m_parts.size() - 1);
    }

    uint32_t Not(uint32_t part) { return Add(Operator::Not, part, 0, m_parts[part].size + 1); }

    uint32_t Plain(Operator op, uint32_t left, uint32_t right)
    {
        if (Chance(2))
            std::swap(left, right);
        return Add(op, left, right, m_parts[left].size + m_parts[right].size + 1);
    }

    // Whether copying an operand is affordable.
    bool MayCopy(uint32_t part)
    {
        if (m_copied + m_parts[part].size > m_max_size || m_parts[part].size > 60)
            return false;
        m_copied += m_parts[part].size;
        return true;
    }

    uint32_t Binary(Operator op, uint32_t left, uint32_t right)
    {
        const bool isInverted = op >= Operator::Nand;
        if (isInverted && Chance(2)) // keep the inversion separate
            return Not(Binary(static_cast<Operator>(static_cast<int>(op) - 3), left, right));
        if (op == Operator::Xor && Chance(3) && MayCopy(left) && MayCopy(right))
            return Plain(Operator::Or, Plain(Operator::And, left, Not(right)),
                         Plain(Operator::And, Not(left), right));
        if ((op == Operator::And || op == Operator::Or) && Chance(3)) // De Morgan
            return Not(
                Plain(op == Operator::And ? Operator::Or : Operator::And, Not(left), Not(right)));
        if (op == Operator::And || op == Operator::Or || op == Operator::Xor) {
            if (Chance(2))
                std::swap(left, right);
            const Part inner = m_parts[right];
            if (inner.op == op && Chance(2)) // regroup
                return Plain(op, Plain(op, left, inner.left), inner.right);
            const bool distributes =
                (op == Operator::And && (inner.op == Operator::Or || inner.op == Operator::Xor)) ||
                (op == Operator::Or && inner.op == Operator::And);
            if (distributes && Chance(2) && MayCopy(left))
                return Plain(inner.op, Plain(op, left, inner.left), Plain(op, left, inner.right));
        }
        return Plain(op, left, right);
    }

    Expression AsTree(uint32_t root) const
    {
        struct Visit {
            uint32_t part;
            bool hasOperands;
        };
        Expression tree;
        tree.names = m_expression.names;
        std::vector<uint32_t> operands;
        std::vector<Visit> pending = {{root, false}};
        while (!pending.empty()) {
            const Visit visit = pending.back();
            pending.pop_back();
            const Part& part = m_parts[visit.part];
            if (!visit.hasOperands && part.op >= Operator::Not) {
                pending.push_back({visit.part, true});
                if (IsBinary(part.op))
                    pending.push_back({part.right, false});
                pending.push_back({part.left, false});
                continue;
            }
            uint32_t right = 0;
            if (IsBinary(part.op)) {
                right = operands.back();
                operands.pop_back();
            }
            uint32_t left = part.left;
            if (part.op >= Operator::Not) {
                left = operands.back();
                operands.pop_back();
            }
            tree.nodes.push_back({part.op, 0, left, right});
            operands.push_back(static_cast<uint32_t>(tree.nodes.size() - 1));
        }
        return tree;
    }

    const Expression& m_expression;
    std::mt19937_64& m_random;
    uint64_t m_max_size;
    uint64_t m_copied = 0;
    std::vector<Part> m_parts;
};

} // namespace

Expression RandomExpression(std::mt19937_64& random, uint32_t numInputs, uint32_t numOperators)
{
    Expression expression;
    for (uint32_t input = 0; input < numInputs; ++input)
        expression.names.push_back("v" + std::to_string(input));
    struct Task {
        uint32_t numOperators;
        Operator op; // append it now; Zero: make a tree of so many operators
    };
    std::vector<Task> tasks = {{numOperators, Operator::Zero}};
    std::vector<uint32_t> made;
    while (!tasks.empty()) {
        const Task task = tasks.back();
        tasks.pop_back();
        if (task.op == Operator::Not) {
            made.back() = AddNot(expression, made.back());
        } else if (task.op != Operator::Zero) {
            const uint32_t right = made.back();
            made.pop_back();
            made.back() = AddBinary(expression, task.op, made.back(), right);
        } else if (task.numOperators == 0) {
            made.push_back(random() % 200 == 0
                               ? AddConstant(expression, random() % 2 == 0)
                               : AddInput(expression, static_cast<uint32_t>(random() % numInputs)));
        } else {
            if (random() % 6 == 0)
                tasks.push_back({0, Operator::Not});
            const auto numLeft = static_cast<uint32_t>(random() % task.numOperators);
            static constexpr Operator kOften[] = {Operator::And,  Operator::Or,  Operator::And,
                                                  Operator::Or,   Operator::Xor, Operator::Xor,
                                                  Operator::Nand, Operator::Nor, Operator::Nxor};
            tasks.push_back({0, kOften[random() % 9]});
            tasks.push_back({task.numOperators - 1 - numLeft, Operator::Zero});
            tasks.push_back({numLeft, Operator::Zero});
        }
    }
    return expression;
}

Expression Rewrite(const Expression& expression, std::mt19937_64& random)
{
    return Rewriter(expression, random).Run();
}

Expression ChangeOneOperator(const Expression& expression, std::mt19937_64& random)
{
    std::vector<uint32_t> depths(expression.nodes.size());
    std::vector<uint32_t> operators;
    for (size_t index = expression.nodes.size(); index-- > 0;) {
        const Expression::Node& node = expression.nodes[index];
        if (node.op >= Operator::Not)
            depths[node.left] = depths[index] + 1;
        if (IsBinary(node.op)) {
            depths[node.right] = depths[index] + 1;
            operators.push_back(static_cast<uint32_t>(index));
        }
    }
    std::sort(operators.begin(), operators.end(), [&](uint32_t first, uint32_t second) {
        return depths[first] != depths[second] ? depths[first] > depths[second] : first < second;
    });
    Expression changed = expression;
    if (operators.empty())
        return changed;
    Operator& op =
        changed.nodes[operators[static_cast<size_t>(random() % (operators.size() / 2 + 1))]].op;
    const auto first = static_cast<uint64_t>(Operator::And);
    const uint64_t old = static_cast<uint64_t>(op) - first;
    op = static_cast<Operator>(first + (old + 1 + random() % 5) % 6);
    return changed;
}

Pair MakePair(uint64_t number, uint32_t maxInputs)
{
    std::mt19937_64 random(number + 1);
    const auto numInputs = static_cast<uint32_t>(20 + random() % (maxInputs - 19));
    const auto numOperators = static_cast<uint32_t>(numInputs + random() % (3 * numInputs));
    Pair pair;
    pair.isRewritten = random() % 2 == 0;
    pair.left = RandomExpression(random, numInputs, numOperators);
    pair.right =
        Rewrite(pair.isRewritten ? pair.left : ChangeOneOperator(pair.left, random), random);
    return pair;
}

} // namespace decide_pairs
