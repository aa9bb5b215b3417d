// The tokens of an EDIF text, one at a time: parentheses with their keyword, words and strings.
// Fails: ReadFault with a line.  Cost: linear in the text; nesting takes no memory.
#ifndef BOOLEQ_DESIGN_EDIF_TOKENS_H
#define BOOLEQ_DESIGN_EDIF_TOKENS_H

#include <string>
#include <string_view>

namespace booleq {

enum class EdifToken { Open, Close, Word, String, End };

class EdifTokens {
  public:
    explicit EdifTokens(std::string_view text) : m_text(text) {}

    // Makes the next token the current one; "(net" is Open with the text "net".
    EdifToken Next();
    EdifToken Kind() const { return m_kind; }
    // A keyword or word as written, or a string without its quotes.
    std::string_view Text() const { return m_token; }
    // Whether the current token opens that form; upper and lower case are the same in keywords.
    bool IsOpen(std::string_view keyword) const;
    // Skips the rest of the form that the current token opens; nothing if it is not an Open.
    void Skip();
    // Line of the current token, from 1.
    uint64_t Line() const { return m_line; }
    size_t Position() const { return m_place; }

    [[noreturn]] void Refuse(const std::string& what) const;

  private:
    void SkipBlanks();
    std::string_view ReadWord();

    std::string_view m_text;
    size_t m_place = 0;
    uint64_t m_line = 1;
    EdifToken m_kind = EdifToken::End;
    std::string_view m_token;
};

// The bytes of a string: "%34%" is a quotation mark, "%10 13%" is two characters. Returns the text
// itself if there is nothing to replace, else 'buffer'.
std::string_view DecodeEdifString(std::string_view text, std::string& buffer);

} // namespace booleq

#endif
