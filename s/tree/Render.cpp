// Tree in, equation text out, in the syntax typed or in one of the three fixed ones.
// The four renderings differ only in the spelling they ask a node for.
#include "Render.h"

#include <cassert>
#include <cstring>

#include "Walk.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;

namespace {

// A node, and the topmost of the unwritten NOT nodes directly above it; the node itself when there
// are none.
struct Place {
    const Node* node;
    const Node* pendingTop;
};

// Writes one tree as text. Characters collect in a buffer that is flushed when it is full, so the
// result grows in pieces, not character by character.
class Writer {
  public:
    Writer(KqSpellingOfNode spelling, bool spaces) : m_spelling(spelling), m_spaces(spaces) {}

    String WriteTree(const Node* root);

    // A NOT is written before the first token of its operand, or before the operator that is its
    // operand: the form "A ~ & B" that the tree builder reads back.
    unsigned int Enter(Place& place, Place& left, Place& right)
    {
        left.node = place.node->GetLeftChild();
        if (place.node->IsNot())
            return left.node ? KQ_ONE : KQ_NONE;
        left.pendingTop = left.node;
        right.node = right.pendingTop = place.node->GetRightChild();
        if (left.node && place.node->IsBinOp()) {
            assert(right.node); // an init value's own root is never written
            return KQ_BOTH | KQ_RETURN;
        }
        WriteTokens(place);
        if (left.node && right.node)
            return KQ_BOTH;
        left = left.node ? left : right;
        return left.node ? KQ_ONE : KQ_NONE;
    }

    bool Between(const Place& place, Place& right)
    {
        WriteTokens(place);
        right.node = right.pendingTop = place.node->GetRightChild();
        return true;
    }

    void Leave(const Place&) {}

  private:
    void WriteTokens(const Place& place);
    void WriteToken(const String& token);
    void Flush();

    static constexpr size_t kBufferSize = 65536;

    KqSpellingOfNode m_spelling;
    bool m_spaces;
    bool m_has_written = false;
    String m_result;
    size_t m_length = 0;
    char m_buffer[kBufferSize];
};

String Writer::WriteTree(const Node* root)
{
    if (root)
        KqWalk(Place{root, root}, *this);
    Flush();
    return m_result;
}

void Writer::WriteTokens(const Place& place)
{
    for (const Node* pending = place.pendingTop; pending != place.node;
         pending = pending->GetLeftChild())
        WriteToken((pending->*m_spelling)());
    WriteToken((place.node->*m_spelling)());
}

void Writer::WriteToken(const String& token)
{
    const size_t length = token.length();
    // A blank before the token and a 0 after the text take one character each.
    if (length + 2 > kBufferSize - m_length)
        Flush();
    if (m_spaces && m_has_written)
        m_buffer[m_length++] = ' ';
    m_has_written = m_has_written || length > 0;
    // The buffer ends at its first NUL byte; a token that is too long or has one bypasses it.
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
    assert(m_length < kBufferSize);
    m_buffer[m_length] = '\0';
    if (m_length > 0)
        m_result += m_buffer;
    m_length = 0;
}

} // namespace

String KqRender(const Node* root, KqSpellingOfNode spelling, bool spaces)
{
    return Writer(spelling, spaces).WriteTree(root);
}
