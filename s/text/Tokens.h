// The tokens of one text, in text order, and the scan that makes them.
#ifndef KQ_TOKENS_H
#define KQ_TOKENS_H

#include <algorithm>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

#include "Name.h"

class KqNamePool;

// A list of tokens. The first ones need no heap.
// Words belong to the pool of names or the table of spellings, so they outlive every equation.
class KqTokens {
  public:
    struct Token {
        Kq_BoolEquationImp::Node::TYPE type;
        const KqName* word;
    };

    // Few texts have more than one token for every two characters. Room for that many is made at
    // once, because growing a long list costs more than memory that is never touched.
    explicit KqTokens(size_t textLength) : m_expected_size(std::min(textLength / 2, kMaxExpected))
    {
    }

    size_t GetSize() const { return m_size; }
    const Token* begin() const { return m_size <= kInline ? m_first : m_all.data(); }
    const Token* end() const { return begin() + m_size; }

    void Append(Kq_BoolEquationImp::Node::TYPE type, const KqName& word)
    {
        if (m_size < kInline)
            m_first[m_size] = {type, &word};
        else
            AppendToHeap({type, &word});
        ++m_size;
    }

  private:
    static constexpr size_t kInline = 128;
    // A text may be mostly blanks, so the guess may reserve at most 16 MB.
    static constexpr size_t kMaxExpected = size_t(1) << 20;

    void AppendToHeap(const Token& token)
    {
        if (m_size == kInline) {
            m_all.reserve(std::max(m_expected_size, 2 * kInline));
            m_all.assign(m_first, m_first + kInline);
        }
        m_all.push_back(token);
    }

    size_t m_expected_size;
    size_t m_size = 0;
    Token m_first[kInline];
    std::vector<Token> m_all; // all tokens, once they are too many for m_first
};

// Appends the tokens of 'text', up to its first NUL byte, and adds its names to the pool. False
// when the text is refused; 'refusal', unless null, then says why and where.
// Tokens do not point into the text.  Requires: no tokens yet.  Fails: std::bad_alloc.
bool KqScanTokens(const char* text, KqNamePool& names, KqTokens& tokens,
                  Kq_BoolEquation::Refusal* refusal);

// Stores the place of the token at 'position' in 'refusal'. Tokens do not record their places,
// because only a refusal needs them.
// Requires: the tokens of the text, more than 'position' of them.
void KqLocateToken(const char* text, const KqTokens& tokens, size_t position,
                   Kq_BoolEquation::Refusal& refusal);

// Whether a variable may have this name. Reads the characters up to the first NUL byte.
bool KqIsLegalName(const Port::StringBase<char>& name);

// Whether the tokenizer reads the whole name as one token: letters and digits, or text between two
// quotes; no NUL byte.  Requires: a legal name.
bool KqIsPlainName(const Port::StringBase<char>& name);

#endif
