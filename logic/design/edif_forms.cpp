#include "edif_forms.h"

#include "read_fault.h"

namespace booleq {

bool EdifForms::NextPart(const char* form)
{
    if (m_pace.IsDue())
        m_pace.Report(m_tokens.Position());
    switch (m_tokens.Next()) {
    case EdifToken::Open:
    case EdifToken::Word:
    case EdifToken::String:
        return true;
    case EdifToken::Close:
        return false;
    case EdifToken::End:
        break;
    }
    Refuse(std::string("the text ends inside (") + form + " ...");
}

void EdifForms::RequireVersion()
{
    std::string version;
    while (NextPart("edifVersion"))
        version += (version.empty() ? "" : " ") + std::string(m_tokens.Text().substr(0, 40));
    if (version != "2 0 0")
        Refuse("it is EDIF " + Quoted(version) + ", and 2 0 0 is what is read");
}

void EdifForms::Close(const char* form)
{
    while (NextPart(form))
        m_tokens.Skip();
}

std::string_view EdifForms::Decoded(std::string_view text)
{
    const std::string_view decoded = DecodeEdifString(text, m_buffer);
    if (decoded.data() == text.data())
        return text;
    m_strings.push_back(m_buffer);
    return m_strings.back();
}

std::string_view EdifForms::Ident() const
{
    if (m_tokens.Kind() != EdifToken::Word)
        Refuse("expected a name");
    std::string_view ident = m_tokens.Text();
    if (ident.size() > 1 && ident[0] == '&')
        ident.remove_prefix(1);
    return ident;
}

EdifName EdifForms::CurrentName()
{
    EdifName name;
    if (m_tokens.IsOpen("rename")) {
        m_tokens.Next();
        name.ident = Ident();
        m_tokens.Next();
        name.text = m_tokens.Kind() == EdifToken::String ? WithoutMark(Decoded(m_tokens.Text()))
                                                         : name.ident;
        m_tokens.Skip();
        Close("rename");
        return name;
    }
    if (m_tokens.IsOpen("name")) { // with a place on a drawing
        m_tokens.Next();
        name.ident = name.text = Ident();
        Close("name");
        return name;
    }
    if (m_tokens.Kind() == EdifToken::String) {
        name.ident = name.text = Decoded(m_tokens.Text());
        return name;
    }
    name.ident = name.text = Ident();
    return name;
}

EdifName EdifForms::ReadName()
{
    m_tokens.Next();
    if (!m_tokens.IsOpen("array"))
        return CurrentName();
    m_tokens.Next();
    EdifName name = CurrentName();
    name.isArray = true;
    m_tokens.Next();
    name.numBits = static_cast<uint32_t>(Number(kMaxPortBits));
    Close("array");
    return name;
}

bool EdifForms::ReadValue(CellValue& value)
{
    bool isRead = false;
    while (NextPart("property")) {
        const bool isString = m_tokens.IsOpen("string");
        const bool isInteger = m_tokens.IsOpen("integer") || m_tokens.IsOpen("number");
        if (!isString && !isInteger) {
            m_tokens.Skip();
            continue;
        }
        m_tokens.Next();
        if (m_tokens.Kind() == EdifToken::Close)
            continue; // no value
        value.text = isString ? Decoded(m_tokens.Text()) : m_tokens.Text();
        value.isNumber = isInteger && TakeNumber(value);
        m_tokens.Skip();
        Close("property");
        isRead = true;
    }
    return isRead;
}

uint64_t EdifForms::Number(uint64_t max) const
{
    uint64_t number = 0;
    const std::string_view text = m_tokens.Text();
    bool isNumber = m_tokens.Kind() == EdifToken::Word && !text.empty() && text.size() < 20;
    for (const char character : text) {
        isNumber = isNumber && character >= '0' && character <= '9';
        if (isNumber)
            number = number * 10 + static_cast<uint64_t>(character - '0');
    }
    if (!isNumber || number > max)
        Refuse("expected a number up to " + std::to_string(max) + " instead of " + Quoted(text));
    return number;
}

} // namespace booleq
