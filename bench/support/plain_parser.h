// What setting an equation is compared with: a small recursive-descent parser for the same
// operators, without any of the checks on depth that a library needs.
#ifndef BENCH_PLAIN_PARSER_H
#define BENCH_PLAIN_PARSER_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace bench {

struct PlainNode {
    uint32_t operation; // the operator's character; for a negated operator, that plus 128
    uint32_t left;      // position of an operand, or the variable's index
    uint32_t right;
    uint32_t reserved;
};
static_assert(sizeof(PlainNode) == 16, "the size that the comparison is about");

// Names, operators & | ^ ~& ~| ~^ ~ of one precedence, grouping from the left, and parentheses.
class PlainEquation {
  public:
    bool Parse(const char* text);
    // The value for the current values of the variables.  Requires: a text that was accepted.
    unsigned int Eval() const;
    std::vector<std::pair<std::string, unsigned int>>& GetVariables() { return m_variables; }

  private:
    static constexpr uint32_t kNone = UINT32_MAX;

    uint32_t ParseChain();
    uint32_t ParseOperand();
    uint32_t ParseName();
    uint32_t ReadOperator();
    uint32_t Add(uint32_t operation, uint32_t left, uint32_t right);
    uint32_t FindVariable(const char* name, size_t length);

    const char* m_next = nullptr;
    uint32_t m_root = kNone;
    std::vector<PlainNode> m_nodes;
    std::vector<std::pair<std::string, unsigned int>> m_variables;
};

} // namespace bench

#endif
