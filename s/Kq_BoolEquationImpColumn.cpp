// Tree in, packed result column out: the tree becomes a list of steps once, and each step works on
// a block of words at a time, so that a block stays in the cache for all steps.
// Every operator is symmetric on single bits, so the operand that needs more blocks is computed
// first: a tree of n nodes never needs more than log2(n)+1 blocks, however deep it is.
#include "Kq_BoolEquationImpColumn.h"

#include <algorithm>
#include <cassert>

#include "Kq_BoolEquationImpWalk.h"

typedef Kq_BoolEquationImp::Node Node;

namespace {

// Column of the variable that is bit 'bit' of the row number, for bits below 6.
constexpr uint64_t kPatterns[6] = {0xaaaaaaaaaaaaaaaau, 0xccccccccccccccccu, 0xf0f0f0f0f0f0f0f0u,
                                   0xff00ff00ff00ff00u, 0xffff0000ffff0000u, 0xffffffff00000000u};

constexpr unsigned int kNoBit = UINT32_MAX;

void FillVariable(unsigned int bit, uint64_t firstWord, size_t numWords, uint64_t* words)
{
    if (bit < 6 || bit == kNoBit) {
        std::fill_n(words, numWords, bit == kNoBit ? 0u : kPatterns[bit]);
        return;
    }
    for (size_t word = 0; word < numWords; ++word)
        words[word] = uint64_t(0) - ((firstWord + word) >> (bit - 6) & 1u);
}

// Applies the binary operator 'type' to 'left' and 'right' into 'left'.
void Combine(Node::TYPE type, size_t numWords, uint64_t* left, const uint64_t* right)
{
    switch (type) {
    case Node::AND:
        for (size_t word = 0; word < numWords; ++word)
            left[word] &= right[word];
        return;
    case Node::OR:
        for (size_t word = 0; word < numWords; ++word)
            left[word] |= right[word];
        return;
    case Node::XOR:
        for (size_t word = 0; word < numWords; ++word)
            left[word] ^= right[word];
        return;
    case Node::NAND:
        for (size_t word = 0; word < numWords; ++word)
            left[word] = ~(left[word] & right[word]);
        return;
    case Node::NOR:
        for (size_t word = 0; word < numWords; ++word)
            left[word] = ~(left[word] | right[word]);
        return;
    case Node::NXOR:
        for (size_t word = 0; word < numWords; ++word)
            left[word] = ~(left[word] ^ right[word]);
        return;
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
}

// The node whose value 'node' has: groups and init-value roots hand on their operand's, null when
// there is none.
const Node* Skip(const Node* node)
{
    while (node && (node->IsLp() || node->GetType() == Node::TRUTH_TABLE))
        node = node->GetLeftChild();
    return node;
}

// A node of the tree without groups, with the number of blocks that its subtree needs.
struct Item {
    const Node* node; // null counts as 0
    size_t left;      // positions of the operands, 0 when there are none
    size_t right;
    size_t need;
};

bool IsOperator(const Node* node)
{
    return node && !node->IsConst() && node->IsBinOp();
}

// All nodes below 'root', each before its operands.
std::vector<Item> ListItems(const Node* root)
{
    std::vector<Item> items(1, Item{Skip(root), 0, 0, 1});
    for (size_t position = 0; position < items.size(); ++position) {
        const Node* node = items[position].node;
        if (node && (node->IsNot() || IsOperator(node))) {
            items[position].left = items.size();
            items.push_back(Item{Skip(node->GetLeftChild()), 0, 0, 1});
        }
        if (IsOperator(node)) {
            items[position].right = items.size();
            items.push_back(Item{Skip(node->GetRightChild()), 0, 0, 1});
        }
    }
    // Operands stand behind their operator, so a walk backwards knows their needs.
    for (size_t position = items.size(); position-- > 0;) {
        Item& item = items[position];
        if (item.left == 0)
            continue;
        const size_t left = items[item.left].need;
        const size_t right = item.right != 0 ? items[item.right].need : 0;
        item.need = left == right ? left + 1 : std::max(left, right);
    }
    return items;
}

} // namespace

KqColumn::KqColumn(const Node* root, unsigned int numVariables)
    : m_num_variables(numVariables),
      m_num_words(numVariables > 6 ? uint64_t(1) << (numVariables - 6) : 1)
{
    assert(numVariables <= 30);
    Compile(root);
}

void KqColumn::Compile(const Node* root)
{
    const std::vector<Item> items = ListItems(root);
    m_steps.reserve(items.size());
    m_stack.resize(items[0].need * kBlockWords);
    // Steps come out in reverse, the operator before its operands, and are turned round at the end.
    KqStack<size_t, 64> pending;
    pending.Push(0);
    while (!pending.IsEmpty()) {
        const Item& item = items[pending.Pop()];
        Step step = {item.node ? item.node->GetType() : Node::ZERO, kNoBit};
        if (step.type == Node::ID && item.node->GetValue() < m_num_variables)
            step.bit = m_num_variables - 1 - item.node->GetValue();
        m_steps.push_back(step);
        const bool isRightFirst = item.right != 0 && items[item.right].need > items[item.left].need;
        // What is pushed last comes out first here, and so is computed last.
        if (item.right != 0 && isRightFirst)
            pending.Push(item.right);
        if (item.left != 0)
            pending.Push(item.left);
        if (item.right != 0 && !isRightFirst)
            pending.Push(item.right);
    }
    std::reverse(m_steps.begin(), m_steps.end());
}

void KqColumn::Fill(uint64_t firstWord, size_t numWords, uint64_t* words)
{
    assert(firstWord + numWords <= m_num_words);
    for (size_t done = 0; done < numWords; done += kBlockWords)
        FillBlock(firstWord + done, std::min(kBlockWords, numWords - done), words + done);
}

void KqColumn::FillBlock(uint64_t firstWord, size_t numWords, uint64_t* words)
{
    uint64_t* next = m_stack.data(); // the free block above the stack's top
    for (const Step& step : m_steps) {
        switch (step.type) {
        case Node::ID:
            FillVariable(step.bit, firstWord, numWords, next);
            next += kBlockWords;
            break;
        case Node::ZERO:
        case Node::RP:
        case Node::SENTINEL:
            std::fill_n(next, numWords, uint64_t(0));
            next += kBlockWords;
            break;
        case Node::ONE:
            std::fill_n(next, numWords, ~uint64_t(0));
            next += kBlockWords;
            break;
        case Node::NOT:
            std::transform(next - kBlockWords, next - kBlockWords + numWords, next - kBlockWords,
                           [](uint64_t word) { return ~word; });
            break;
        case Node::AND:
        case Node::NAND:
        case Node::NOR:
        case Node::NXOR:
        case Node::OR:
        case Node::XOR:
            next -= kBlockWords;
            Combine(step.type, numWords, next - kBlockWords, next);
            break;
        case Node::LP:
        case Node::TRUTH_TABLE:
            assert(!"groups are left out");
            break;
        }
    }
    assert(next == m_stack.data() + kBlockWords);
    std::copy_n(m_stack.data(), numWords, words);
}
