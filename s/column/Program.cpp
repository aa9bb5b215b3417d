// Tree in, program out; program in, value out. The program has neither groups nor constants, and
// inversions cost nothing. Cost: O(nodes) to compile, O(codes) to run; no recursion.
#include "Program.h"

#include <algorithm>
#include <cassert>

#include "Operators.h"
#include "ProgramWriter.h"
#include "Walk.h"

typedef Kq_BoolEquationImp::Node Node;

namespace {

// Writes the leaves and operators of one tree into a list that grows as needed.
class Compiler {
  public:
    Compiler(uint32_t numVariables, bool isReversed, std::vector<KqCode>& codes)
        : m_num_variables(numVariables), m_is_reversed(isReversed), m_codes(codes),
          m_writer(codes.data(), 0)
    {
    }

    size_t GetEnd() const { return m_writer.GetEnd(); }

    KqValue PutLeaf(const KqOperand& leaf)
    {
        Reserve();
        const Node* const node = leaf.node;
        if (!node || !node->IsId() || node->GetValue() >= m_num_variables)
            return m_writer.PutConstant(node && node->Is1()).Invert(leaf.inversion);
        const uint32_t index = node->GetValue();
        return m_writer.PutVariable(m_is_reversed ? m_num_variables - 1 - index : index)
            .Invert(leaf.inversion);
    }

    // All operators are symmetric: either operand may be the one put last.
    KqValue PutOperator(const KqOperand& operation, KqValue last, KqValue before)
    {
        Reserve();
        const KqOperator found = KqOperatorOf(operation.node->GetType());
        return m_writer.PutUnstack(found.kind, last, before)
            .Invert(found.inversion ^ operation.inversion);
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

// By kind: the operator's result for a lower and an upper value is bit lower + 2 * upper.
constexpr uint8_t kTables[8] = {0x6, 0, 0, 0, 0x8, 0x4, 0x2, 0x1};

// Compiles operands in their order, except that a leaf goes after an operand that is an operator.
// Gives up when that stacks too many values. A step of the walk costs more than a leaf's code, so
// leaves are written with their operator.
struct CompilerAsItStands {
    // An operator, its child that is put last, and the value of the other one once it is written.
    struct Place {
        const Node* node;
        const Node* last;
        KqValue before;
        uint32_t inversion;
    };

    explicit CompilerAsItStands(Compiler& writer) : compiler(writer) {}

    void Compile(const Node* root)
    {
        const KqOperand operand = KqFindOperand(root);
        if (operand.isOperator)
            KqWalk(PlaceOf(operand), *this);
        else
            value = compiler.PutLeaf(operand);
    }

    static Place PlaceOf(const KqOperand& operand)
    {
        return {operand.node, nullptr, KqValue(), operand.inversion};
    }

    unsigned int Enter(Place& place, Place& first, Place&)
    {
        place.last = place.node->GetRightChild();
        KqOperand operand = KqFindOperand(place.node->GetLeftChild());
        // The right child may be far away in memory, so it is read only when it is needed.
        if (!operand.isOperator) {
            place.last = place.node->GetLeftChild();
            operand = KqFindOperand(place.node->GetRightChild());
        }
        if (operand.isOperator) {
            first = PlaceOf(operand);
            return KQ_BOTH | KQ_RETURN;
        }
        value = compiler.PutLeaf(operand);
        Between(place, first);
        Leave(place);
        return KQ_NONE;
    }

    bool Between(Place& place, Place& second)
    {
        place.before = value;
        ++numStacked;
        maxStacked = std::max(maxStacked, numStacked);
        const KqOperand operand = KqFindOperand(place.last);
        if (operand.isOperator) {
            second = PlaceOf(operand);
            return true;
        }
        value = compiler.PutLeaf(operand);
        return false;
    }

    void Leave(const Place& place)
    {
        value = compiler.PutOperator({place.node, place.inversion, true}, value, place.before);
        --numStacked;
    }

    Compiler& compiler;
    KqValue value;
    size_t numStacked = 0;
    size_t maxStacked = 0;
};

// An operator or a leaf of the tree, for a walk that must know them all before it starts.
struct Item {
    KqOperand operand;
    uint32_t left; // positions of the operands; 0 when there are none
    uint32_t right;
    uint32_t need; // how many values the machine stacks for it
};

// All items below 'root', operators before their operands.
std::vector<Item> ListItems(const Node* root)
{
    std::vector<Item> items;
    items.reserve(64);
    items.push_back({KqFindOperand(root), 0, 0, 1});
    for (size_t position = 0; position < items.size(); ++position) {
        const KqOperand operand = items[position].operand;
        if (!operand.isOperator)
            continue;
        assert(items.size() < UINT32_MAX - 1);
        items[position].left = static_cast<uint32_t>(items.size());
        items.push_back({KqFindOperand(operand.node->GetLeftChild()), 0, 0, 1});
        items[position].right = static_cast<uint32_t>(items.size());
        items.push_back({KqFindOperand(operand.node->GetRightChild()), 0, 0, 1});
    }
    // Operands come after their operator, so a backward pass knows what they need.
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

// Compiles the operand that needs more values first.
struct CompilerByNeed {
    struct Place {
        const Item* item;
        KqValue first;
    };

    unsigned int Enter(const Place& place, Place& first, Place&)
    {
        const Item& item = *place.item;
        if (item.left == 0) {
            value = compiler.PutLeaf(item.operand);
            return KQ_NONE;
        }
        first.item = &items[IsRightFirst(item) ? item.right : item.left];
        return KQ_BOTH | KQ_RETURN;
    }

    bool Between(Place& place, Place& second)
    {
        place.first = value;
        const Item& item = *place.item;
        second.item = &items[IsRightFirst(item) ? item.left : item.right];
        return true;
    }

    void Leave(const Place& place)
    {
        value = compiler.PutOperator(place.item->operand, value, place.first);
    }

    // All operators are symmetric, so either operand may go first.
    bool IsRightFirst(const Item& item) const
    {
        return items[item.right].need > items[item.left].need;
    }

    Compiler& compiler;
    const std::vector<Item>& items;
    KqValue value;
};

} // namespace

KqProgram KqCompile(const Node* root, uint32_t numVariables, bool isReversed)
{
    KqProgram program;
    Compiler compiler(numVariables, isReversed, program.codes);
    CompilerAsItStands asItStands(compiler);
    asItStands.Compile(root);
    KqValue value = asItStands.value;
    assert(asItStands.numStacked == 0);
    program.numCodes = compiler.GetEnd();
    if (asItStands.maxStacked >= kKqMaxStack) {
        Compiler again(numVariables, isReversed, program.codes);
        const std::vector<Item> items = ListItems(root);
        assert(items[0].need <= kKqMaxStack);
        CompilerByNeed byNeed{again, items, KqValue()};
        KqWalk(CompilerByNeed::Place{&items[0], KqValue()}, byNeed);
        value = byNeed.value;
        program.numCodes = again.GetEnd();
    }
    program.isInverted = value.GetInversion() != 0;
    assert(value.GetStart() == 0);
    assert(value.IsConstant() == (program.numCodes == 0));
    return program;
}

unsigned int
KqRunProgram(const KqProgram& program,
             const std::vector<std::pair<Port::StringBase<char>, unsigned int>>& variables)
{
    static_assert(kKqMaxStack < 64, "the stack is the bits of a word");
    uint64_t stack = 0;
    unsigned int value = 0;
    const KqCode* const end = program.codes.data() + program.numCodes;
    for (const KqCode* next = program.codes.data(); next != end; ++next) {
        const KqCode action = KqActionOf(*next);
        const unsigned int table = kTables[KqKindOf(action)];
        if (action >= kKqUnstack) {
            value = table >> (2 * (stack & 1u)) >> value & 1u;
            stack >>= 1;
            continue;
        }
        assert(KqVariableOf(*next) < variables.size());
        const unsigned int operand = variables[KqVariableOf(*next)].second;
        assert(operand <= 1);
        if (action >= kKqCombine) {
            value = table >> (2 * operand) >> value & 1u;
        } else {
            stack = stack << 1 | value;
            value = operand;
        }
    }
    return value ^ (program.isInverted ? 1u : 0u);
}

size_t KqCountVariables(const KqProgram& program)
{
    size_t numVariables = 0;
    for (size_t position = 0; position < program.numCodes; ++position) {
        const KqCode code = program.codes[position];
        if (KqActionOf(code) < kKqUnstack)
            numVariables = std::max<size_t>(numVariables, KqVariableOf(code) + 1);
    }
    return numVariables;
}
