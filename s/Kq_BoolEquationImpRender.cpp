// Tree in, equation text out, in the syntax typed or in one of the three fixed ones.
// The four renderings differ only in the spelling they ask a node for.
// Fails: std::bad_alloc.  Cost: O(text written); no recursion.
#include <Kq_BoolEquationImp.h>

#include <cstring>

#include "Kq_BoolEquationImpStore.h"
#include "Kq_BoolEquationImpWalk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;
typedef const String& (Node::*SpellingOf)() const;

namespace {

// Writes one tree as text. Characters collect in a buffer that is handed on when it is full, so
// the result grows by pieces and not by characters.
class Writer {
  public:
    Writer(SpellingOf spelling, bool spaces) : m_spelling(spelling), m_spaces(spaces) {}

    String WriteTree(const Node* root);

  private:
    // What is left to write: a subtree, or a node's own token. Either is preceded by the tokens of
    // the NOT nodes on the way from 'pendingTop' down to the node, which have not been written
    // yet; none when it is the node itself.
    struct Work {
        const Node* node;
        const Node* pendingTop;
        bool isToken;
    };

    void WriteNode(const Work& work);
    void WriteTokens(const Work& work);
    void WriteToken(const String& token);
    void Flush();

    static constexpr size_t kBufferSize = 65536;

    SpellingOf m_spelling;
    bool m_spaces;
    bool m_has_written = false;
    KqStack<Work, 32> m_work;
    String m_result;
    size_t m_length = 0;
    char m_buffer[kBufferSize];
};

String Writer::WriteTree(const Node* root)
{
    if (root)
        m_work.Push({root, root, false});
    while (!m_work.IsEmpty()) {
        const Work work = m_work.Pop();
        if (work.isToken)
            WriteTokens(work);
        else
            WriteNode(work);
    }
    Flush();
    return m_result;
}

// Work is pushed in reverse, so that the first piece is on top.
void Writer::WriteNode(const Work& work)
{
    const Node* left = work.node->GetLeftChild();
    const Node* right = work.node->GetRightChild();
    if (work.node->IsNot()) {
        // Written in front of the operand's first token, or of the operand's operator: the form
        // "A ~ & B" that the tree builder reads back.
        if (left)
            m_work.Push({left, work.pendingTop, false});
        return;
    }
    const bool isBinOp = work.node->IsBinOp();
    if (right)
        m_work.Push({right, right, false});
    if (left && !isBinOp)
        m_work.Push({left, left, false});
    m_work.Push({work.node, work.pendingTop, true});
    if (left && isBinOp)
        m_work.Push({left, left, false});
}

void Writer::WriteTokens(const Work& work)
{
    for (const Node* pending = work.pendingTop; pending != work.node;
         pending = pending->GetLeftChild())
        WriteToken((pending->*m_spelling)());
    WriteToken((work.node->*m_spelling)());
}

void Writer::WriteToken(const String& token)
{
    const size_t length = token.length();
    // A blank before the token and a 0 behind the text take a character each.
    if (length + 2 > kBufferSize - m_length)
        Flush();
    if (m_spaces && m_has_written)
        m_buffer[m_length++] = ' ';
    m_has_written = m_has_written || length > 0;
    // The buffer ends at its first NUL byte; a token that is longer or has one goes straight.
    if (length + 2 > kBufferSize || std::memchr(token.c_str(), '\0', length)) {
        Flush();
        m_result += token;
        return;
    }
    std::memcpy(m_buffer + m_length, token.c_str(), length);
    m_length += length;
}

void Writer::Flush()
{
    m_buffer[m_length] = '\0';
    if (m_length > 0)
        m_result += m_buffer;
    m_length = 0;
}

String Write(const Node* root, SpellingOf spelling, bool spaces)
{
    return Writer(spelling, spaces).WriteTree(root);
}

// Deliberate: of an init value the fixed syntaxes show the expression that it stands for, the
// primary one shows the value as given.
const Node* ExpressionOf(const Node* root)
{
    return root && root->GetType() == Node::TRUTH_TABLE ? root->GetLeftChild() : root;
}

} // namespace

String Kq_BoolEquationImp::GetEquation(bool spaces) const
{
    const String* const initValue = m_store->GetInitValue();
    return initValue ? *initValue : Write(m_store->GetRoot(), &Node::GetToken, spaces);
}

String Kq_BoolEquationImp::GetEquationAlt1(bool spaces) const
{
    return Write(ExpressionOf(m_store->GetRoot()), &Node::GetTokenAlt1, spaces);
}

String Kq_BoolEquationImp::GetEquationAlt2(bool spaces) const
{
    return Write(ExpressionOf(m_store->GetRoot()), &Node::GetTokenAlt2, spaces);
}

String Kq_BoolEquationImp::GetEquationAlt3(bool spaces) const
{
    return Write(ExpressionOf(m_store->GetRoot()), &Node::GetTokenAlt3, spaces);
}

String Kq_BoolEquationImp::GetEquationAsExpression(bool spaces) const
{
    return IsExpression() ? GetEquation(spaces) : GetEquationAlt1(spaces);
}
