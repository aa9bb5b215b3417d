// Tree in, program out; program in, value out. The program has neither groups nor constants, and
// inversions cost nothing. Cost: O(nodes) to compile, O(codes) to run; no recursion.
#include "Kq_BoolEquationImpProgram.h"

#include <algorithm>
#include <cassert>

#include "Kq_BoolEquationImpWalk.h"
#include "Kq_BoolEquationImpWord.h"
#include "Kq_BoolEquationImpWriter.h"

typedef Kq_BoolEquationImp::Node Node;

namespace {

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
        break;
    }
    return false;
}

// An operator or a leaf of the tree, what merely hands a value on left out.
struct Item {
    const Node* node; // null counts as 0
    uint32_t left;    // positions of the operands; 0 when there are none
    uint32_t right;
    uint32_t need;      // how many values the machine stacks for it
    uint32_t inversion; // 1 when it is complemented
};

// The item at or below 'node': groups and init values hand on their operand, a NOT inverts it.
Item FindItem(const Node* node)
{
    uint32_t inversion = 0;
    while (node && (node->IsLp() || node->IsNot() || node->GetType() == Node::TRUTH_TABLE)) {
        inversion ^= node->IsNot() ? 1u : 0u;
        node = node->GetLeftChild();
    }
    return Item{node, 0, 0, 1, inversion};
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

// A binary operator as a kind, and 1 when the result is complemented: OR is an AND of complements.
struct Operator {
    KqCode kind;
    uint32_t inversion;
};

// Requires: a binary operator.
Operator OperatorOf(Node::TYPE type)
{
    constexpr KqCode invertBoth = kKqInvertLower | kKqInvertUpper;
    switch (type) {
    case Node::AND:
        return {kKqAnd, 0};
    case Node::NAND:
        return {kKqAnd, 1};
    case Node::OR:
        return {kKqAnd | invertBoth, 1};
    case Node::NOR:
        return {kKqAnd | invertBoth, 0};
    case Node::NXOR:
        return {kKqXor, 1};
    case Node::XOR:
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
    return {kKqXor, 0};
}

// Writes the leaves and operators of one tree into a list that grows as needed.
class Compiler {
  public:
    Compiler(uint32_t numVariables, bool isReversed, std::vector<KqCode>& codes)
        : m_num_variables(numVariables), m_is_reversed(isReversed), m_codes(codes),
          m_writer(codes.data(), 0)
    {
    }

    size_t GetEnd() const { return m_writer.GetEnd(); }

    KqValue PutLeaf(const Item& item)
    {
        Reserve();
        const Node* node = item.node;
        if (!node || !node->IsId() || node->GetValue() >= m_num_variables)
            return m_writer.PutConstant(node && node->Is1()).Invert(item.inversion);
        const uint32_t index = node->GetValue();
        return m_writer.PutVariable(m_is_reversed ? m_num_variables - 1 - index : index)
            .Invert(item.inversion);
    }

    // All operators are symmetric: either operand may be the one put last.
    KqValue PutOperator(const Node* node, uint32_t inversion, KqValue last, KqValue before)
    {
        Reserve();
        const Operator found = OperatorOf(node->GetType());
        return m_writer.PutUnstack(found.kind, last, before).Invert(found.inversion ^ inversion);
    }

  private:
    void Reserve()
    {
        if (m_writer.GetEnd() < m_codes.size())
            return;
        m_codes.resize(2 * m_codes.size() + 128);
        m_writer.SetCodes(m_codes.data());
    }

    uint32_t m_num_variables;
    bool m_is_reversed;
    std::vector<KqCode>& m_codes;
    KqWriter m_writer;
};

// The operator's result for lower and upper value, bit lower + 2 * upper, by kind.
constexpr uint8_t kTables[8] = {0x6, 0, 0, 0, 0x8, 0x4, 0x2, 0x1};

uint64_t ApplyToWords(Node::TYPE type, uint64_t left, uint64_t right)
{
    const Operator found = OperatorOf(type);
    if (found.kind == kKqXor)
        return left ^ right ^ (uint64_t(0) - found.inversion);
    // Both operands are complemented or none is.
    const uint64_t inverted = uint64_t(0) - (found.kind & kKqInvertLower);
    return ((left ^ inverted) & (right ^ inverted)) ^ (uint64_t(0) - found.inversion);
}

uint64_t LeafWord(const Node* node, unsigned int numVariables)
{
    if (node && node->IsId() && node->GetValue() < numVariables)
        return kKqRowsWithBit[numVariables - 1 - node->GetValue()];
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
        uint64_t inversion; // all ones when the result is complemented
        bool hasLeft;
    };
    KqStack<Pending, 32> pending;
    const Node* next = root;
    for (;;) {
        Item item = FindItem(next);
        while (item.node && IsBinary(item.node)) {
            pending.Push({item.node, 0, uint64_t(0) - item.inversion, false});
            item = FindItem(item.node->GetLeftChild());
        }
        uint64_t word = LeafWord(item.node, numVariables) ^ (uint64_t(0) - item.inversion);
        while (!pending.IsEmpty() && pending.Top().hasLeft) {
            const Pending done = pending.Pop();
            word = ApplyToWords(done.node->GetType(), done.left, word) ^ done.inversion;
        }
        if (pending.IsEmpty())
            return word;
        pending.Top().left = word;
        pending.Top().hasLeft = true;
        next = pending.Top().node->GetRightChild();
    }
}

bool IsOperator(const Item& item)
{
    return item.node && IsBinary(item.node);
}

// Compiles the tree with the operands as they stand, but a leaf behind an operand that is none;
// false when that stacks too many values.
bool CompileAsItStands(const Node* root, Compiler& compiler, KqValue& result)
{
    // An operator, with its first operand once that is written, and its second one until then.
    struct Pending {
        const Node* node;
        const Node* second;
        KqValue first;
        uint32_t inversion;
        bool hasFirst;
    };
    KqStack<Pending, 32> pending;
    size_t numValues = 0;
    const Node* next = root;
    for (;;) {
        Item item = FindItem(next);
        while (IsOperator(item)) {
            const Node* left = item.node->GetLeftChild();
            const Node* right = item.node->GetRightChild();
            Item first = FindItem(left);
            if (IsOperator(first)) {
                pending.Push({item.node, right, KqValue(), item.inversion, false});
            } else {
                pending.Push({item.node, left, KqValue(), item.inversion, false});
                first = FindItem(right);
            }
            item = first;
        }
        KqValue value = compiler.PutLeaf(item);
        while (!pending.IsEmpty() && pending.Top().hasFirst) {
            const Pending done = pending.Pop();
            value = compiler.PutOperator(done.node, done.inversion, value, done.first);
            --numValues;
        }
        if (pending.IsEmpty()) {
            result = value;
            return true;
        }
        if (++numValues == kKqMaxStack)
            return false;
        pending.Top().first = value;
        pending.Top().hasFirst = true;
        next = pending.Top().second;
    }
}

// Compiles the tree with the operand that needs more values first.
KqValue CompileOrdered(const Node* root, Compiler& compiler)
{
    const std::vector<Item> items = ListItems(root);
    struct Work {
        uint32_t position;
        bool hasOperands;
    };
    KqStack<Work, 64> pending;
    KqStack<KqValue, kKqMaxStack> values;
    pending.Push({0, false});
    while (!pending.IsEmpty()) {
        const Work work = pending.Pop();
        const Item& item = items[work.position];
        if (work.hasOperands) {
            const KqValue last = values.Pop();
            const KqValue before = values.Pop();
            values.Push(compiler.PutOperator(item.node, item.inversion, last, before));
        } else if (item.left == 0) {
            values.Push(compiler.PutLeaf(item));
        } else {
            // All operators are symmetric, so either operand may go first.
            const bool isRightFirst = items[item.right].need > items[item.left].need;
            pending.Push({work.position, true});
            pending.Push({isRightFirst ? item.left : item.right, false});
            pending.Push({isRightFirst ? item.right : item.left, false});
        }
    }
    return values.Pop();
}

} // namespace

KqProgram KqCompile(const Node* root, uint32_t numVariables, bool isReversed)
{
    KqProgram program;
    Compiler compiler(numVariables, isReversed, program.codes);
    KqValue value;
    if (CompileAsItStands(root, compiler, value)) {
        program.numCodes = compiler.GetEnd();
    } else {
        Compiler again(numVariables, isReversed, program.codes);
        value = CompileOrdered(root, again);
        program.numCodes = again.GetEnd();
    }
    program.isInverted = value.GetInversion() != 0;
    return program;
}

unsigned int KqCompiled::Eval(const Node& root, const Variables& variables)
{
    const size_t numVariables = variables.size();
    if (numVariables <= 6) {
        GetWord(root, static_cast<unsigned int>(numVariables));
        return EvalWord(variables);
    }
    // Compiling costs several evaluations, and many equations are evaluated just once.
    if (!m_is_evaluated || numVariables > kKqMaxVariables) {
        m_is_evaluated = true;
        return root.Eval(variables);
    }
    if (m_num_program_variables != numVariables) {
        m_program = KqCompile(&root, static_cast<uint32_t>(numVariables), false);
        m_num_program_variables = numVariables;
    }
    return RunProgram(variables) ^ (m_program.isInverted ? 1u : 0u);
}

uint64_t KqCompiled::GetWord(const Node& root, unsigned int numVariables)
{
    assert(numVariables <= 6);
    if (!HasWord(numVariables))
        SetWord(ComputeWord(&root, numVariables), numVariables);
    return m_word;
}

void KqCompiled::Drop() noexcept
{
    m_num_word_variables = kNoWord;
    m_num_program_variables = 0;
    m_is_evaluated = false;
    m_program = KqProgram();
}

unsigned int KqCompiled::RunProgram(const Variables& variables) const
{
    static_assert(kKqMaxStack < 64, "the stack is the bits of a word");
    uint64_t stack = 0;
    unsigned int value = 0;
    const KqCode* const end = m_program.codes.data() + m_program.numCodes;
    for (const KqCode* next = m_program.codes.data(); next != end; ++next) {
        const KqCode action = KqActionOf(*next);
        const unsigned int table = kTables[KqKindOf(action)];
        if (action >= kKqUnstack) {
            value = table >> (2 * (stack & 1u)) >> value & 1u;
            stack >>= 1;
            continue;
        }
        const unsigned int operand = variables[KqVariableOf(*next)].second;
        if (action >= kKqCombine) {
            value = table >> (2 * operand) >> value & 1u;
        } else {
            stack = stack << 1 | value;
            value = operand;
        }
    }
    return value;
}
