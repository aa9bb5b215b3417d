// Tree in, program out; program in, value out. The program has neither groups nor constants, and
// inversions cost nothing. Cost: O(nodes) to compile, O(codes) to run; no recursion.
#include "Kq_BoolEquationImpProgram.h"

#include <algorithm>
#include <cassert>

#include "Kq_BoolEquationImpWalk.h"

typedef Kq_BoolEquationImp::Node Node;

namespace {

// Column of each of six variables, the most significant one first.
constexpr uint64_t kPatterns[6] = {0xffffffff00000000u, 0xffff0000ffff0000u, 0xff00ff00ff00ff00u,
                                   0xf0f0f0f0f0f0f0f0u, 0xccccccccccccccccu, 0xaaaaaaaaaaaaaaaau};

bool IsBinary(const Node* node)
{
    switch (node->GetType()) {
    case Node::AND:
    case Node::NAND:
    case Node::NOR:
    case Node::NXOR:
    case Node::OR:
    case Node::XOR:
        return true;
    case Node::ZERO:
    case Node::ONE:
    case Node::ID:
    case Node::LP:
    case Node::NOT:
    case Node::RP:
    case Node::TRUTH_TABLE:
    case Node::SENTINEL:
        return false;
    }
    return false;
}

// An operator or a leaf of the tree, what merely hands a value on left out.
struct Item {
    const Node* node; // null counts as 0
    uint32_t left;    // positions of the operands; 0 when there are none
    uint32_t right;
    uint32_t need; // how many values the machine stacks for it
    bool isInverted;
};

// The item at or below 'node': groups and init values hand on their operand, a NOT inverts it.
Item FindItem(const Node* node)
{
    bool isInverted = false;
    while (node && (node->IsLp() || node->IsNot() || node->GetType() == Node::TRUTH_TABLE)) {
        isInverted = isInverted != node->IsNot();
        node = node->GetLeftChild();
    }
    return Item{node, 0, 0, 1, isInverted};
}

// All items below 'root', operators before their operands.
std::vector<Item> ListItems(const Node* root)
{
    std::vector<Item> items;
    items.reserve(64);
    items.push_back(FindItem(root));
    for (size_t position = 0; position < items.size(); ++position) {
        const Node* node = items[position].node;
        if (!node || !IsBinary(node))
            continue;
        assert(items.size() < UINT32_MAX - 1);
        items[position].left = static_cast<uint32_t>(items.size());
        items.push_back(FindItem(node->GetLeftChild()));
        items[position].right = static_cast<uint32_t>(items.size());
        items.push_back(FindItem(node->GetRightChild()));
    }
    // Operands stand behind their operator, so a walk backwards knows what they need.
    for (size_t position = items.size(); position-- > 0;) {
        Item& item = items[position];
        if (item.left == 0)
            continue;
        const uint32_t left = items[item.left].need;
        const uint32_t right = items[item.right].need;
        item.need = left == right ? left + 1 : std::max(left, right);
    }
    return items;
}

KqWriter::Value PutOperator(Node::TYPE type, const KqWriter::Value& lower,
                            const KqWriter::Value& upper, KqWriter& writer)
{
    switch (type) {
    case Node::AND:
        return writer.PutAnd(lower, upper);
    case Node::NAND:
        return KqInverted(writer.PutAnd(lower, upper), true);
    case Node::OR:
        return KqInverted(writer.PutAnd(KqInverted(lower, true), KqInverted(upper, true)), true);
    case Node::NOR:
        return writer.PutAnd(KqInverted(lower, true), KqInverted(upper, true));
    case Node::XOR:
        return writer.PutXor(lower, upper);
    case Node::NXOR:
        return KqInverted(writer.PutXor(lower, upper), true);
    case Node::ZERO:
    case Node::ONE:
    case Node::ID:
    case Node::LP:
    case Node::NOT:
    case Node::RP:
    case Node::TRUTH_TABLE:
    case Node::SENTINEL:
        break;
    }
    assert(!"a binary operator");
    return writer.PutConstant(false);
}

KqWriter::Value PutLeaf(const Node* node, uint32_t numVariables, bool isReversed, KqWriter& writer)
{
    if (node && node->IsId() && node->GetValue() < numVariables) {
        const uint32_t index = node->GetValue();
        return writer.PutVariable(isReversed ? numVariables - 1 - index : index);
    }
    return writer.PutConstant(node && node->Is1());
}

// The operator's result for lower and upper value, bit lower + 2 * upper.
uint8_t TableOf(KqCode kind)
{
    constexpr unsigned int lower = 0xa;
    constexpr unsigned int upper = 0xc;
    if (kind == kKqXor)
        return lower ^ upper;
    const unsigned int left = (kind & kKqInvertLower) != 0 ? ~lower : lower;
    const unsigned int right = (kind & kKqInvertUpper) != 0 ? ~upper : upper;
    return static_cast<uint8_t>(left & right & 0xfu);
}

// The same operator with lower and upper value exchanged.
KqCode ExchangedKind(KqCode kind)
{
    if (kind == kKqXor)
        return kind;
    return kKqAnd | ((kind & kKqInvertLower) != 0 ? kKqInvertUpper : 0u) |
           ((kind & kKqInvertUpper) != 0 ? kKqInvertLower : 0u);
}

KqStep MakeStep(KqStep::ACTION action, uint32_t variable, KqCode kind)
{
    return KqStep{variable, action, static_cast<uint8_t>(kind), TableOf(kind)};
}

// The operators on whole words.
struct WordOperators {
    static uint64_t Apply(Node::TYPE type, uint64_t left, uint64_t right)
    {
        switch (type) {
        case Node::AND:
            return left & right;
        case Node::OR:
            return left | right;
        case Node::XOR:
            return left ^ right;
        case Node::NAND:
            return ~(left & right);
        case Node::NOR:
            return ~(left | right);
        case Node::NXOR:
            return ~(left ^ right);
        case Node::ZERO:
        case Node::ONE:
        case Node::ID:
        case Node::LP:
        case Node::NOT:
        case Node::RP:
        case Node::TRUTH_TABLE:
        case Node::SENTINEL:
            break;
        }
        return 0;
    }
};

uint64_t LeafWord(const Node* node, unsigned int numVariables)
{
    if (node && node->IsId() && node->GetValue() < numVariables)
        return kPatterns[6 - numVariables + node->GetValue()];
    return node && node->Is1() ? ~uint64_t(0) : 0;
}

// The column of the tree at 'root', walked once with a word for each node: for a small table that
// is less work than compiling it.
uint64_t ComputeWord(const Node* root, unsigned int numVariables)
{
    // An operator whose left operand is being computed, or is known and the right one is.
    struct Pending {
        const Node* node;
        uint64_t left;
        bool isInverted;
        bool hasLeft;
    };
    KqStack<Pending, 32> pending;
    const Node* next = root;
    for (;;) {
        Item item = FindItem(next);
        while (item.node && IsBinary(item.node)) {
            pending.Push({item.node, 0, item.isInverted, false});
            item = FindItem(item.node->GetLeftChild());
        }
        uint64_t word = LeafWord(item.node, numVariables) ^ (uint64_t(0) - item.isInverted);
        while (!pending.IsEmpty() && pending.Top().hasLeft) {
            const Pending done = pending.Pop();
            word = WordOperators::Apply(done.node->GetType(), done.left, word) ^
                   (uint64_t(0) - done.isInverted);
        }
        if (pending.IsEmpty())
            return word;
        pending.Top().left = word;
        pending.Top().hasLeft = true;
        next = pending.Top().node->GetRightChild();
    }
}

} // namespace

KqProgram KqCompile(const Node* root, uint32_t numVariables, bool isReversed)
{
    const std::vector<Item> items = ListItems(root);
    KqProgram program;
    program.codes.resize(items.size());
    KqWriter writer(program.codes.data());
    struct Work {
        uint32_t position;
        bool hasOperands;
    };
    KqStack<Work, 64> pending;
    KqStack<KqWriter::Value, kKqMaxStack> values;
    pending.Push({0, false});
    while (!pending.IsEmpty()) {
        const Work work = pending.Pop();
        const Item& item = items[work.position];
        if (work.hasOperands) {
            const KqWriter::Value upper = values.Pop();
            const KqWriter::Value lower = values.Pop();
            values.Push(KqInverted(PutOperator(item.node->GetType(), lower, upper, writer),
                                   item.isInverted));
        } else if (item.left == 0) {
            values.Push(
                KqInverted(PutLeaf(item.node, numVariables, isReversed, writer), item.isInverted));
        } else {
            // All operators are symmetric, so the operand that needs more goes first.
            const bool isRightFirst = items[item.right].need > items[item.left].need;
            pending.Push({work.position, true});
            pending.Push({isRightFirst ? item.left : item.right, false});
            pending.Push({isRightFirst ? item.right : item.left, false});
        }
    }
    const KqWriter::Value result = values.Pop();
    program.codes.resize(static_cast<size_t>(writer.GetEnd() - program.codes.data()));
    program.isInverted = result.isInverted;
    return program;
}

size_t KqMakeSteps(const KqCode* codes, size_t numCodes, std::vector<KqStep>& steps)
{
    // Values on the program's stack: a variable that no step has taken yet, or a computed one.
    // Only the topmost computed value is at hand, the others have been stacked.
    constexpr uint32_t kComputed = UINT32_MAX;
    KqStack<uint32_t, kKqMaxStack> values;
    size_t numStacked = 0;
    size_t maxStacked = 0;
    steps.clear();
    const auto take = [&](uint32_t variable) {
        steps.push_back(MakeStep(KqStep::TAKE, variable, kKqXor));
        maxStacked = std::max(maxStacked, ++numStacked);
    };
    for (size_t position = 0; position < numCodes; ++position) {
        const KqCode kind = KqKindOf(codes[position]);
        if (kind == kKqVariable) {
            values.Push(KqVariableOf(codes[position]));
            continue;
        }
        const uint32_t upper = values.Pop();
        const uint32_t lower = values.Pop();
        if (upper != kComputed) {
            if (lower != kComputed)
                take(lower);
            steps.push_back(MakeStep(KqStep::COMBINE, upper, kind));
        } else if (lower != kComputed) {
            steps.push_back(MakeStep(KqStep::COMBINE, lower, ExchangedKind(kind)));
        } else {
            steps.push_back(MakeStep(KqStep::UNSTACK, 0, ExchangedKind(kind)));
            --numStacked;
        }
        values.Push(kComputed);
    }
    if (values.Top() != kComputed)
        take(values.Top());
    return maxStacked;
}

unsigned int KqCompiled::Eval(const Node& root, const Variables& variables)
{
    const size_t numVariables = variables.size();
    if (numVariables <= 6) {
        unsigned int row = 0;
        for (const auto& variable : variables)
            row = row << 1 | variable.second;
        return GetWord(root, static_cast<unsigned int>(numVariables)) >> row & 1u;
    }
    // Compiling costs several evaluations, and many equations are evaluated just once.
    if (m_num_evaluations == 0) {
        ++m_num_evaluations;
        return root.Eval(variables);
    }
    if (m_num_steps_variables != numVariables) {
        m_num_steps_variables = 0;
        const KqProgram program = KqCompile(&root, static_cast<uint32_t>(numVariables), false);
        m_is_inverted = program.isInverted;
        m_steps.clear();
        if (!program.codes.empty())
            KqMakeSteps(program.codes.data(), program.codes.size(), m_steps);
        m_num_steps_variables = static_cast<uint32_t>(numVariables);
    }
    return RunSteps(variables) ^ (m_is_inverted ? 1u : 0u);
}

uint64_t KqCompiled::GetWord(const Node& root, unsigned int numVariables)
{
    assert(numVariables <= 6);
    if (m_num_word_variables != numVariables) {
        m_word = ComputeWord(&root, numVariables);
        m_num_word_variables = numVariables;
    }
    return m_word;
}

void KqCompiled::Drop() noexcept
{
    m_num_word_variables = UINT32_MAX;
    m_num_evaluations = 0;
    m_num_steps_variables = 0;
    std::vector<KqStep>().swap(m_steps);
}

unsigned int KqCompiled::RunSteps(const Variables& variables) const
{
    static_assert(kKqMaxStack < 64, "the stack is the bits of a word");
    uint64_t stack = 0;
    unsigned int value = 0;
    for (const KqStep& step : m_steps) {
        const unsigned int operand = variables[step.variable].second;
        switch (step.action) {
        case KqStep::COMBINE:
            value = step.table >> (2 * operand) >> value & 1u;
            break;
        case KqStep::TAKE:
            stack = stack << 1 | value;
            value = operand;
            break;
        case KqStep::UNSTACK:
            value = step.table >> (2 * (stack & 1u)) >> value & 1u;
            stack >>= 1;
            break;
        }
    }
    return value;
}
