// A small recursive-descent parser.
#include "plain_parser.h"

#include <cstring>

namespace bench {

namespace {

constexpr uint32_t kNegated = 128;

bool IsNameCharacter(char character)
{
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
           (character >= '0' && character <= '9') || character == '_';
}

bool IsNameStart(char character)
{
    return IsNameCharacter(character) && !(character >= '0' && character <= '9');
}

const char* SkipBlanks(const char* text)
{
    while (*text == ' ' || *text == '\t' || *text == '\n')
        ++text;
    return text;
}

} // namespace

bool PlainEquation::Parse(const char* text)
{
    m_next = text;
    m_root = ParseChain();
    return m_root != kNone && *SkipBlanks(m_next) == '\0';
}

uint32_t PlainEquation::ParseChain()
{
    uint32_t left = ParseOperand();
    while (left != kNone) {
        const uint32_t operation = ReadOperator();
        if (operation == 0)
            break;
        const uint32_t right = ParseOperand();
        left = right == kNone ? kNone : Add(operation, left, right);
    }
    return left;
}

uint32_t PlainEquation::ParseOperand()
{
    m_next = SkipBlanks(m_next);
    if (IsNameStart(*m_next))
        return ParseName();
    if (*m_next == '~') {
        ++m_next;
        const uint32_t operand = ParseOperand();
        return operand == kNone ? kNone : Add('~', operand, 0);
    }
    if (*m_next == '(') {
        ++m_next;
        const uint32_t inner = ParseChain();
        m_next = SkipBlanks(m_next);
        if (inner == kNone || *m_next != ')')
            return kNone;
        ++m_next;
        return inner;
    }
    return kNone;
}

uint32_t PlainEquation::ParseName()
{
    const char* const name = m_next;
    while (IsNameCharacter(*m_next))
        ++m_next;
    return Add('x', FindVariable(name, size_t(m_next - name)), 0);
}

// Reads the operator at the next character and moves past it; 0 when there is none.
uint32_t PlainEquation::ReadOperator()
{
    m_next = SkipBlanks(m_next);
    const bool isNegated = *m_next == '~';
    const char character = m_next[isNegated ? 1 : 0];
    if (character != '&' && character != '|' && character != '^')
        return 0;
    m_next += isNegated ? 2 : 1;
    return uint32_t(character) + (isNegated ? kNegated : 0);
}

uint32_t PlainEquation::Add(uint32_t operation, uint32_t left, uint32_t right)
{
    m_nodes.push_back(PlainNode{operation, left, right, 0});
    return uint32_t(m_nodes.size() - 1);
}

uint32_t PlainEquation::FindVariable(const char* name, size_t length)
{
    for (size_t index = 0; index < m_variables.size(); ++index) {
        const std::string& known = m_variables[index].first;
        if (known.length() == length && std::memcmp(known.data(), name, length) == 0)
            return uint32_t(index);
    }
    m_variables.emplace_back(std::string(name, length), 0u);
    return uint32_t(m_variables.size() - 1);
}

unsigned int PlainEquation::Eval() const
{
    // An operator comes after its operands, and the root is last.
    std::vector<unsigned int> values;
    values.reserve(m_nodes.size());
    for (const PlainNode& node : m_nodes) {
        if (node.operation == 'x') {
            values.push_back(m_variables[node.left].second);
            continue;
        }
        const unsigned int left = values[node.left];
        const unsigned int right = values[node.right];
        const unsigned int negated = node.operation >= kNegated ? 1u : 0u;
        const char character = char(node.operation % kNegated);
        const unsigned int value = character == '~'   ? left ^ 1u
                                   : character == '&' ? left & right
                                   : character == '|' ? left | right
                                                      : left ^ right;
        values.push_back(value ^ negated);
    }
    return values.back();
}

} // namespace bench
