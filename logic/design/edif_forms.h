// The forms of an EDIF text and the names in them.
// Fails: ReadFault with a line.
#ifndef BOOLEQ_DESIGN_EDIF_FORMS_H
#define BOOLEQ_DESIGN_EDIF_FORMS_H

#include <cstdint>
#include <deque>
#include <string>

#include "cell_intake.h"
#include "edif_tokens.h"
#include "readers.h"

namespace booleq {

constexpr uint32_t kMaxPortBits = 1u << 20;

// An identifier, and the name that it stands for.
struct EdifName {
    std::string_view ident;
    std::string_view text;
    uint32_t numBits = 1;
    bool isArray = false;
};

// Strings that had to be decoded live as long as this object.
class EdifForms {
  public:
    explicit EdifForms(const ReadJob& job) : m_pace(job), m_tokens(job.source.Text()) {}

    EdifTokens& Tokens() { return m_tokens; }
    [[noreturn]] void Refuse(const std::string& what) const { m_tokens.Refuse(what); }
    // The next part of a form; false at its end.
    bool NextPart(const char* form);
    // Reads the rest of (edifVersion ..., which must be 2 0 0: other versions write nets in other
    // forms.
    void RequireVersion();
    // Skips the rest of a form.
    void Close(const char* form);
    // A string with its escapes replaced.
    std::string_view Decoded(std::string_view text);
    // The current token as a name: (rename ident "text") or ident.
    EdifName CurrentName();
    // The next token as a name, or as an array: a name with a number of bits.
    EdifName ReadName();
    // Reads the rest of (property NAME ...). False unless the value is a string or an integer.
    bool ReadValue(CellValue& value);
    // The current token as a number.
    uint64_t Number(uint64_t max) const;

  private:
    // The current token as a word, without an '&' in front, which only lets it begin with a digit.
    std::string_view Ident() const;

    Pace m_pace;
    EdifTokens m_tokens;
    std::string m_buffer;
    std::deque<std::string> m_strings; // that had to be decoded
};

} // namespace booleq

#endif
