#include "word_program.h"

#include <algorithm>
#include <cassert>

namespace booleq_python {

namespace {

using booleq::Expression;
using booleq::Operator;

// How many columns each node needs at once, in addition to the inputs'.
std::vector<uint32_t> Needs(const Expression& expression)
{
    std::vector<uint32_t> needs;
    needs.reserve(expression.nodes.size());
    for (const Expression::Node& node : expression.nodes) {
        if (node.op == Operator::Input) {
            needs.push_back(0);
        } else if (!booleq::IsBinary(node.op)) {
            needs.push_back(node.op == Operator::Not ? std::max(needs[node.left], 1u) : 1);
        } else {
            const uint32_t left = needs[node.left];
            const uint32_t right = needs[node.right];
            needs.push_back(std::max({left == right ? left + 1 : std::max(left, right), 1u}));
        }
    }
    return needs;
}

template <class Combine>
void Apply(uint64_t* target, const uint64_t* left, const uint64_t* right, size_t numWords,
           const Combine& combine)
{
    if (numWords == kBlockWords) { // a constant, so the compiler can vectorise the loop
        for (size_t word = 0; word < kBlockWords; ++word)
            target[word] = combine(left[word], right[word]);
        return;
    }
    for (size_t word = 0; word < numWords; ++word)
        target[word] = combine(left[word], right[word]);
}

} // namespace

WordProgram::WordProgram(const Expression& expression) : m_num_inputs(expression.names.size())
{
    assert(!expression.nodes.empty());
    const std::vector<uint32_t> needs = Needs(expression);
    std::vector<uint32_t> places(expression.nodes.size()); // columns of results
    std::vector<uint32_t> free;
    struct Visit {
        uint32_t node;
        bool hasOperands;
    };
    std::vector<Visit> pending = {{static_cast<uint32_t>(expression.nodes.size() - 1), false}};
    const auto release = [&](uint32_t place) {
        if (place >= m_num_inputs)
            free.push_back(place);
    };
    while (!pending.empty()) {
        const Visit visit = pending.back();
        pending.pop_back();
        const Expression::Node& node = expression.nodes[visit.node];
        if (node.op == Operator::Input) {
            places[visit.node] = node.left;
            continue;
        }
        const bool isBinary = booleq::IsBinary(node.op);
        const bool hasOperands = isBinary || node.op == Operator::Not;
        if (hasOperands && !visit.hasOperands) {
            pending.push_back({visit.node, true});
            const bool isLeftFirst = !isBinary || needs[node.left] >= needs[node.right];
            if (isBinary) // the one pushed last is visited first
                pending.push_back({isLeftFirst ? node.right : node.left, false});
            pending.push_back({isLeftFirst ? node.left : node.right, false});
            continue;
        }
        const uint32_t left = hasOperands ? places[node.left] : 0;
        const uint32_t right = isBinary ? places[node.right] : 0;
        if (hasOperands)
            release(left);
        if (isBinary)
            release(right);
        if (free.empty())
            free.push_back(static_cast<uint32_t>(m_num_inputs + m_num_slots++));
        places[visit.node] = free.back();
        free.pop_back();
        m_steps.push_back({node.op, places[visit.node], left, right});
    }
    m_result = places.back();
    assert(m_num_slots <= needs.back() + 1);
}

const uint64_t* WordProgram::Run(uint64_t* block, size_t numWords) const
{
    assert(numWords <= kBlockWords);
    for (const Step& step : m_steps) {
        uint64_t* const target = block + kBlockWords * step.target;
        const uint64_t* const left = block + kBlockWords * step.left;
        const uint64_t* const right = block + kBlockWords * step.right;
        switch (step.op) {
        case Operator::Zero:
            std::fill_n(target, numWords, uint64_t(0));
            break;
        case Operator::One:
            std::fill_n(target, numWords, ~uint64_t(0));
            break;
        case Operator::Not:
            Apply(target, left, left, numWords, [](uint64_t value, uint64_t) { return ~value; });
            break;
        case Operator::And:
            Apply(target, left, right, numWords, [](uint64_t a, uint64_t b) { return a & b; });
            break;
        case Operator::Or:
            Apply(target, left, right, numWords, [](uint64_t a, uint64_t b) { return a | b; });
            break;
        case Operator::Xor:
            Apply(target, left, right, numWords, [](uint64_t a, uint64_t b) { return a ^ b; });
            break;
        case Operator::Nand:
            Apply(target, left, right, numWords, [](uint64_t a, uint64_t b) { return ~(a & b); });
            break;
        case Operator::Nor:
            Apply(target, left, right, numWords, [](uint64_t a, uint64_t b) { return ~(a | b); });
            break;
        case Operator::Nxor:
            Apply(target, left, right, numWords, [](uint64_t a, uint64_t b) { return ~(a ^ b); });
            break;
        case Operator::Input:
            assert(false && "inputs are columns, not steps");
            break;
        }
    }
    return block + kBlockWords * m_result;
}

namespace {

// Appends the function of 'rows', whose first input is input 'first' of the expression. At most
// kMaxExpandedInputs deep. NOLINTNEXTLINE(misc-no-recursion)
uint32_t Expand(const booleq::Rows& rows, uint32_t first, Expression& expression)
{
    if (booleq::IsZero(rows) || booleq::IsOne(rows))
        return booleq::AddConstant(expression, booleq::IsOne(rows));
    const booleq::Rows low = booleq::Half(rows, false);
    const booleq::Rows high = booleq::Half(rows, true);
    if (low == high)
        return Expand(low, first + 1, expression);
    if (booleq::IsZero(low) || booleq::IsOne(high)) { // input & high, low | input
        const uint32_t input = booleq::AddInput(expression, first);
        if (booleq::IsZero(low) && booleq::IsOne(high))
            return input;
        const uint32_t other = Expand(booleq::IsZero(low) ? high : low, first + 1, expression);
        return booleq::AddBinary(expression, booleq::IsZero(low) ? Operator::And : Operator::Or,
                                 input, other);
    }
    if (booleq::IsOne(low) && booleq::IsZero(high))
        return booleq::AddNot(expression, booleq::AddInput(expression, first));
    // low ^ (input & (low ^ high))
    const uint32_t left = Expand(low, first + 1, expression);
    const uint32_t input = booleq::AddInput(expression, first);
    if (low == ~high)
        return booleq::AddBinary(expression, Operator::Xor, left, input);
    const uint32_t change = Expand(low ^ high, first + 1, expression);
    return booleq::AddBinary(expression, Operator::Xor, left,
                             booleq::AddBinary(expression, Operator::And, input, change));
}

} // namespace

Expression Expanded(const booleq::Rows& rows)
{
    assert(rows.NumInputs() <= kMaxExpandedInputs);
    Expression expression;
    for (unsigned int input = 0; input < rows.NumInputs(); ++input)
        expression.names.push_back("i" + std::to_string(input));
    Expand(rows, 0, expression);
    return expression;
}

} // namespace booleq_python
