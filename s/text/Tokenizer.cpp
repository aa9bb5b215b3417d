// Text in, one token for each piece out, in text order.
// Fails: false for a refused text, with the reason on request; std::bad_alloc.
// Cost: one pass over the text.
#include "Tokens.h"

#include <cassert>
#include <cstring>

#include "NamePool.h"
#include "SpellingTables.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Kq_BoolEquation::Refusal Refusal;
typedef Port::StringBase<char> String;

using namespace KqTables;

namespace {

constexpr KqSpellingId kLeftParen = KqSpellingOf("(");
constexpr KqSpellingId kRightParen = KqSpellingOf(")");

KqSpellingId NegationSpelling(char prefix, char next)
{
    size_t row = 0;
    while (kNegations.of[row].prefix != prefix)
        ++row;
    assert(row < kNumNegations);
    return kNegations.of[row].next[next];
}

// The spelling of a word of 'length' characters, both dots included; kKqNoSpelling without one.
KqSpellingId KeywordSpelling(const char* word, size_t length)
{
    for (const KqSpellingId id : kKeywords.of) {
        const char* const text = kKqSpellings[id].text;
        if (std::strlen(text) == length && std::memcmp(text, word, length) == 0)
            return id;
    }
    return kKqNoSpelling;
}

bool IsNameStart(char character)
{
    return kCharacters[character].startsA == NAME;
}

bool IsNamePart(char character)
{
    const CLASS startsA = kCharacters[character].startsA;
    return startsA == NAME || startsA == CONSTANT || startsA == DIGIT_OF_NAME;
}

// The position after the next 'mark' beyond the character at 'start'; null when there is none.
const char* EndOfMarked(const char* start, char mark)
{
    const char* end = std::strchr(start + 1, mark);
    return end ? end + 1 : nullptr;
}

// Scans one text into tokens.
class Scanner {
  public:
    Scanner(KqNamePool& names, KqTokens& tokens) : m_names(names), m_tokens(tokens) {}

    // False when the text is refused.
    bool ScanText(const char* text)
    {
        m_next = text;
        m_text = text;
        while (*m_next) {
            if (!ScanToken())
                return false;
        }
        // Only the totals are compared: ")A(" is left for the tree builder to refuse.
        return m_num_opened == m_num_closed || RefuseParens();
    }

    // Why ScanText was false.
    const Refusal& GetRefusal() const { return m_refusal; }

  private:
    // Records why the text is refused at the current position, in case the caller asks.
    bool Refuse(Refusal::CODE code, size_t length)
    {
        m_refusal.code = code;
        m_refusal.offset = static_cast<size_t>(m_next - m_text);
        m_refusal.length = length;
        return false;
    }

    // Blames the first ")" that closes nothing, otherwise the last "(" that nothing closes.
    bool RefuseParens()
    {
        size_t numOpen = 0;
        for (size_t position = 0; position < m_tokens.GetSize(); ++position) {
            const Node::TYPE type = m_tokens.begin()[position].type;
            if (type == Node::RP && numOpen == 0)
                return RefuseToken(Refusal::PAREN, position);
            numOpen += type == Node::LP ? 1u : 0u;
            numOpen -= type == Node::RP ? 1u : 0u;
        }
        // The counts differ and every ")" closes a "(", so some "(" is never closed.
        size_t position = m_tokens.GetSize() - 1;
        for (size_t numClosed = 0;; --position) {
            const Node::TYPE type = m_tokens.begin()[position].type;
            if (type == Node::LP && numClosed == 0)
                return RefuseToken(Refusal::PAREN, position);
            numClosed += type == Node::RP ? 1u : 0u;
            numClosed -= type == Node::LP ? 1u : 0u;
        }
    }

    bool RefuseToken(Refusal::CODE code, size_t position)
    {
        m_refusal.code = code;
        KqLocateToken(m_text, m_tokens, position, m_refusal);
        return false;
    }

    bool ScanToken()
    {
        const Character& first = kCharacters[*m_next];
        switch (first.startsA) {
        case BLANK:
            ++m_next;
            return true;
        case NAME:
            return ScanName();
        case CONSTANT:
        case SINGLE:
            m_num_opened += first.spelling == kLeftParen ? 1u : 0u;
            m_num_closed += first.spelling == kRightParen ? 1u : 0u;
            AppendSpelling(first.spelling, 1);
            return true;
        case NEGATION:
            return ScanNegation();
        case KEYWORD:
            return ScanKeyword();
        case QUOTE:
            return ScanQuotedName();
        case REFUSED:
        case DIGIT_OF_NAME:
            break;
        }
        return Refuse(Refusal::CHARACTER, 1);
    }

    bool ScanName()
    {
        const char* end = m_next + 1;
        while (IsNamePart(*end))
            ++end;
        AppendName(end);
        return true;
    }

    bool ScanQuotedName()
    {
        const char* end = EndOfMarked(m_next, '\'');
        if (!end)
            return Refuse(Refusal::QUOTE, 1);
        AppendName(end);
        return true;
    }

    bool ScanKeyword()
    {
        const char* end = EndOfMarked(m_next, '.');
        if (!end)
            return Refuse(Refusal::WORD, 1);
        const size_t length = static_cast<size_t>(end - m_next);
        const KqSpellingId id = KeywordSpelling(m_next, length);
        if (id == kKqNoSpelling)
            return Refuse(Refusal::WORD, length);
        AppendSpelling(id, length);
        return true;
    }

    bool ScanNegation()
    {
        const KqSpellingId id = NegationSpelling(m_next[0], m_next[1]);
        AppendSpelling(id, kKqSpellings[id].type == Node::NOT ? 1 : 2);
        return true;
    }

    void AppendSpelling(KqSpellingId id, size_t length)
    {
        m_tokens.Append(kKqSpellings[id].type, m_spellings[id]);
        m_next += length;
    }

    void AppendName(const char* end)
    {
        m_tokens.Append(Node::ID, m_names.Find(m_next, static_cast<size_t>(end - m_next)));
        m_next = end;
    }

    KqNamePool& m_names;
    KqTokens& m_tokens;
    const KqName* m_spellings = &KqGetSpelling(0);
    const char* m_next = nullptr;
    const char* m_text = nullptr; // where the text starts
    Refusal m_refusal;
    size_t m_num_opened = 0;
    size_t m_num_closed = 0;
};

} // namespace

bool KqScanTokens(const char* text, KqNamePool& names, KqTokens& tokens, Refusal* refusal)
{
    Scanner scanner(names, tokens);
    const bool isRead = scanner.ScanText(text);
    if (!isRead && refusal)
        *refusal = scanner.GetRefusal();
    return isRead;
}

void KqLocateToken(const char* text, const KqTokens& tokens, size_t position, Refusal& refusal)
{
    assert(position < tokens.GetSize());
    // Only blanks separate tokens, and each token is as long as its text.
    const KqTokens::Token* token = tokens.begin();
    size_t offset = std::strspn(text, " \t\n");
    for (size_t left = position; left > 0; --left, ++token) {
        offset += token->word->text.length();
        offset += std::strspn(text + offset, " \t\n");
    }
    refusal.offset = offset;
    refusal.length = token->word->text.length();
}

bool KqIsLegalName(const String& name)
{
    const char* character = name.c_str();
    // Deliberate: after the second quote anything may follow, so "'a'+b" is a legal name.
    if (*character == '\'')
        return EndOfMarked(character, '\'') != nullptr;
    if (!IsNameStart(*character))
        return false;
    while (IsNamePart(*character))
        ++character;
    return *character == '\0';
}

bool KqIsPlainName(const String& name)
{
    assert(KqIsLegalName(name));
    const char* const text = name.c_str();
    if (std::strlen(text) != name.length())
        return false;
    return *text != '\'' || EndOfMarked(text, '\'') == text + name.length();
}
