// Text in, one token or node for each piece out, in text order and without links.
// A text that is refused clears the object; nothing is said.  Fails: std::bad_alloc.
// Cost: one pass; a name that was met lately is found again by a glance at its characters.
#include <Kq_BoolEquationImp.h>

#include <cstring>
#include <string>

#include "Kq_BoolEquationImpSpelling.h"
#include "Kq_BoolEquationImpStore.h"

typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;
typedef Kq_BoolEquation::Refusal Refusal;

namespace {

// Names met lately, by a hash of their length and a few characters. They live in the pool of names,
// which never forgets one.
constexpr size_t kNumRecent = 256;
const String* s_recentNames[kNumRecent];

// What a character starts.
enum CLASS : uint8_t {
    REFUSED,
    BLANK,
    NAME,
    DIGIT_OF_NAME,
    CONSTANT,
    SINGLE,
    NEGATION,
    KEYWORD,
    QUOTE
};

struct Character {
    CLASS startsA;
    KqSpelling::Id spelling; // of CONSTANT and SINGLE
};

struct Characters {
    Character of[256];

    const Character& operator[](char character) const
    {
        return of[static_cast<unsigned char>(character)];
    }
};

constexpr Characters MakeCharacters()
{
    Characters table = {};
    for (Character& character : table.of)
        character = {REFUSED, KqSpelling::kOwnToken};
    for (unsigned int letter = 0; letter < 26; ++letter) {
        table.of['A' + letter].startsA = NAME;
        table.of['a' + letter].startsA = NAME;
    }
    table.of[static_cast<int>('_')].startsA = NAME;
    for (int digit = '2'; digit <= '9'; ++digit)
        table.of[digit].startsA = DIGIT_OF_NAME;
    for (const char blank : {' ', '\t', '\n'})
        table.of[static_cast<int>(blank)].startsA = BLANK;
    table.of[static_cast<int>('0')] = {CONSTANT, KqSpelling::kZero};
    table.of[static_cast<int>('1')] = {CONSTANT, KqSpelling::kOne};
    table.of[static_cast<int>('(')] = {SINGLE, KqSpelling::kLeftParen};
    table.of[static_cast<int>(')')] = {SINGLE, KqSpelling::kRightParen};
    table.of[static_cast<int>('&')] = {SINGLE, KqSpelling::kAmpersand};
    table.of[static_cast<int>('*')] = {SINGLE, KqSpelling::kStar};
    table.of[static_cast<int>('|')] = {SINGLE, KqSpelling::kBar};
    table.of[static_cast<int>('+')] = {SINGLE, KqSpelling::kPlus};
    table.of[static_cast<int>('^')] = {SINGLE, KqSpelling::kCaret};
    table.of[static_cast<int>('@')] = {SINGLE, KqSpelling::kAt};
    for (const char prefix : {'~', '!'})
        table.of[static_cast<int>(prefix)].startsA = NEGATION;
    table.of[static_cast<int>('.')].startsA = KEYWORD;
    table.of[static_cast<int>('\'')].startsA = QUOTE;
    return table;
}

constexpr Characters kCharacters = MakeCharacters();

bool IsNamePart(char character)
{
    const CLASS startsA = kCharacters[character].startsA;
    return startsA == NAME || startsA == CONSTANT || startsA == DIGIT_OF_NAME;
}

// The spelling that starts with the negation 'prefix'. An operator written right behind it belongs
// to it: "~&" is always one NAND and never NOT and AND.
KqSpelling::Id NegationSpelling(char prefix, char next)
{
    const bool isTilde = prefix == '~';
    switch (next) {
    case '&':
        return isTilde ? KqSpelling::kTildeAmpersand : KqSpelling::kBangAmpersand;
    case '*':
        return isTilde ? KqSpelling::kTildeStar : KqSpelling::kBangStar;
    case '|':
        return isTilde ? KqSpelling::kTildeBar : KqSpelling::kBangBar;
    case '+':
        return isTilde ? KqSpelling::kTildePlus : KqSpelling::kBangPlus;
    case '^':
        return isTilde ? KqSpelling::kTildeCaret : KqSpelling::kBangCaret;
    case '@':
        return isTilde ? KqSpelling::kTildeAt : KqSpelling::kBangAt;
    default:
        return isTilde ? KqSpelling::kTilde : KqSpelling::kBang;
    }
}

// The keyword of 'length' characters with both dots, kOwnToken when there is no such keyword.
KqSpelling::Id KeywordSpelling(const char* word, size_t length)
{
    constexpr KqSpelling::Id keywords[] = {
        KqSpelling::kDotAnd,  KqSpelling::kDotOr,  KqSpelling::kDotXor, KqSpelling::kDotNot,
        KqSpelling::kDotNand, KqSpelling::kDotNor, KqSpelling::kDotNxor};
    for (const KqSpelling::Id id : keywords) {
        const char* text = KqSpelling::kSpellings[id].text;
        if (std::strlen(text) == length && std::memcmp(text, word, length) == 0)
            return id;
    }
    return KqSpelling::kOwnToken;
}

// The character behind the next 'mark' after the one at 'start', null when the text has none.
const char* EndOfMarked(const char* start, char mark)
{
    const char* end = std::strchr(start + 1, mark);
    return end ? end + 1 : nullptr;
}

// Puts the place of the token at 'position' into 'refusal'. Tokens do not know their places,
// because only a refusal asks; but between them there are blanks only, and each is as long as its
// text.
void Locate(const char* text, const Kq_BoolEquationImp::Tokens& tokens, size_t position,
            Refusal& refusal)
{
    const Kq_BoolEquationImp::Tokens::Token* token = tokens.begin();
    size_t offset = std::strspn(text, " \t\n");
    for (size_t left = position; left > 0; --left, ++token) {
        offset += token->text->length();
        offset += std::strspn(text + offset, " \t\n");
    }
    refusal.offset = offset;
    refusal.length = token->text->length();
}

// Scans one text into tokens.
class Scanner {
  public:
    Scanner(Kq_BoolEquationImp::StringMgr& names, Kq_BoolEquationImp::Tokens& tokens)
        : m_names(names), m_tokens(tokens)
    {
    }

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
    // Records why the text is refused at the place reached, for whoever asks.
    bool Refuse(Refusal::CODE code, size_t length)
    {
        m_refusal.code = code;
        m_refusal.offset = static_cast<size_t>(m_next - m_text);
        m_refusal.length = length;
        return false;
    }

    // The first ")" that closes nothing, otherwise the last "(" that nothing closes, is to blame.
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
        // The numbers differ and each ")" closes a "(", so there is one that none closes.
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
        Locate(m_text, m_tokens, position, m_refusal);
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
            m_num_opened += first.spelling == KqSpelling::kLeftParen ? 1u : 0u;
            m_num_closed += first.spelling == KqSpelling::kRightParen ? 1u : 0u;
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
        const KqSpelling::Id id = KeywordSpelling(m_next, length);
        if (id == KqSpelling::kOwnToken)
            return Refuse(Refusal::WORD, length);
        AppendSpelling(id, length);
        return true;
    }

    bool ScanNegation()
    {
        const KqSpelling::Id id = NegationSpelling(m_next[0], m_next[1]);
        const bool isLone = KqSpelling::kSpellings[id].type == Node::NOT;
        AppendSpelling(id, isLone ? 1 : 2);
        return true;
    }

    void AppendSpelling(KqSpelling::Id id, size_t length)
    {
        m_tokens.Append(KqSpelling::kSpellings[id].type, m_spellings[id]);
        m_next += length;
    }

    void AppendName(const char* end)
    {
        const size_t length = static_cast<size_t>(end - m_next);
        const String*& recent = s_recentNames[RecentSlot(m_next, length)];
        if (!recent || recent->length() != length ||
            std::memcmp(recent->c_str(), m_next, length) != 0) {
            m_name.assign(m_next, end);
            recent = &m_names.find(m_name.c_str());
        }
        m_tokens.Append(Node::ID, *recent);
        m_next = end;
    }

    // Requires: length > 0.
    static size_t RecentSlot(const char* name, size_t length)
    {
        const size_t mix = static_cast<unsigned char>(name[0]) +
                           static_cast<unsigned char>(name[length - 1]) * 29u +
                           static_cast<unsigned char>(name[length / 2]) * 7u + length * 61u;
        return mix % kNumRecent;
    }

    Kq_BoolEquationImp::StringMgr& m_names;
    Kq_BoolEquationImp::Tokens& m_tokens;
    const String* m_spellings = KqSpelling::GetTexts();
    const char* m_next = nullptr;
    const char* m_text = nullptr; // where the text starts
    Refusal m_refusal;
    size_t m_num_opened = 0;
    size_t m_num_closed = 0;
    std::string m_name; // scratch: the name being handed to the pool
};

} // namespace

// The tokens of 'text'; false when it is refused, and 'refusal', unless null, tells why. Tokens do
// not point into the text.
bool Kq_BoolEquationImp::ScanTokens(const char* text, Tokens& tokens, Refusal* refusal)
{
    Scanner scanner(GetNamePool(), tokens);
    const bool isRead = scanner.ScanText(text);
    if (!isRead && refusal)
        *refusal = scanner.GetRefusal();
    return isRead;
}

// Requires: the tokens of the text; more than 'position'.
void Kq_BoolEquationImp::LocateToken(const char* text, const Tokens& tokens, size_t position,
                                     Refusal& refusal)
{
    Locate(text, tokens, position, refusal);
}

void Kq_BoolEquationImp::TokenizeNodes(const char* text)
{
    if (!text || !*text || !m_store->IsEmpty())
        return;
    Tokens tokens(std::strlen(text));
    if (!ScanTokens(text, tokens))
        Clear();
    else if (tokens.GetSize() != 0)
        m_store->MakeNodes(tokens);
}
