// The packed result column: the results of all rows of a tree's truth table, 64 rows to a word.
// A root goes in, bits come out; no strings, no messages, no engine object.
#ifndef KQ_BOOLEQUATIONIMPCOLUMN_H
#define KQ_BOOLEQUATIONIMPCOLUMN_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

// Bit k of the column, bit k % 64 of word k / 64, is the value of row k. The first variable is bit
// numVariables-1 of k, the last is bit 0. With fewer than six variables the one word repeats the
// column's 2^numVariables bits up to its end.
class KqColumn {
  public:
    // Compiles the tree at 'root', which may be null and then counts as 0.
    // Requires: a checked tree; numVariables <= 30. An ID whose index is no variable counts as 0.
    // Fails: std::bad_alloc.  Cost: O(nodes).
    KqColumn(const Kq_BoolEquationImp::Node* root, unsigned int numVariables);

    // 2^numVariables / 64, at least 1.
    uint64_t GetNumWords() const { return m_num_words; }

    // Writes words firstWord .. firstWord+numWords-1 of the column to 'words'.
    // Requires: firstWord + numWords <= GetNumWords().
    // Cost: O(nodes * numWords); nothing is allocated.
    void Fill(uint64_t firstWord, size_t numWords, uint64_t* words);

  private:
    // One step of a stack machine over blocks of words. A push writes the block on top, a NOT
    // changes it, a binary step combines the upper two into the lower.
    struct Step {
        Kq_BoolEquationImp::Node::TYPE type;
        unsigned int bit; // for an ID: the bit of the row number that is the variable's value
    };

    static constexpr size_t kBlockWords = 64;

    void Compile(const Kq_BoolEquationImp::Node* root);
    void FillBlock(uint64_t firstWord, size_t numWords, uint64_t* words);

    unsigned int m_num_variables;
    uint64_t m_num_words;
    std::vector<Step> m_steps;
    std::vector<uint64_t> m_stack; // as many blocks as the steps ever hold at once
};

#endif
