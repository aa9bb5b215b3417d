#include "edif_tokens.h"

#include <algorithm>
#include <cassert>

#include "read_fault.h"

namespace booleq {

namespace {

bool IsBlank(char character)
{
    return character == ' ' || character == '\n' || character == '\t' || character == '\r';
}

char Lower(char character)
{
    return character >= 'A' && character <= 'Z' ? static_cast<char>(character | 0x20) : character;
}

} // namespace

void EdifTokens::Refuse(const std::string& what) const
{
    ThrowAtLine(m_line, what);
}

void EdifTokens::SkipBlanks()
{
    while (m_place < m_text.size() && IsBlank(m_text[m_place])) {
        m_line += m_text[m_place] == '\n';
        ++m_place;
    }
}

std::string_view EdifTokens::ReadWord()
{
    const size_t start = m_place;
    while (m_place < m_text.size() && !IsBlank(m_text[m_place]) && m_text[m_place] != '(' &&
           m_text[m_place] != ')' && m_text[m_place] != '"')
        ++m_place;
    return m_text.substr(start, m_place - start);
}

EdifToken EdifTokens::Next()
{
    SkipBlanks();
    m_token = std::string_view();
    if (m_place == m_text.size())
        return m_kind = EdifToken::End;
    const char first = m_text[m_place];
    if (first == ')') {
        ++m_place;
        return m_kind = EdifToken::Close;
    }
    if (first == '(') {
        ++m_place;
        SkipBlanks();
        m_token = ReadWord();
        return m_kind = EdifToken::Open;
    }
    if (first != '"') {
        m_token = ReadWord();
        assert(!m_token.empty());
        return m_kind = EdifToken::Word;
    }
    const size_t end = m_text.find('"', m_place + 1);
    if (end == std::string_view::npos)
        Refuse("the string has no end");
    m_token = m_text.substr(m_place + 1, end - m_place - 1);
    m_line += static_cast<uint64_t>(std::count(m_token.begin(), m_token.end(), '\n'));
    m_place = end + 1;
    return m_kind = EdifToken::String;
}

bool EdifTokens::IsOpen(std::string_view keyword) const
{
    return m_kind == EdifToken::Open && m_token.size() == keyword.size() &&
           std::equal(keyword.begin(), keyword.end(), m_token.begin(),
                      [](char left, char right) { return Lower(left) == Lower(right); });
}

void EdifTokens::Skip()
{
    if (m_kind != EdifToken::Open)
        return;
    const std::string form(m_token.substr(0, 40));
    const uint64_t line = m_line;
    for (uint64_t depth = 1; depth != 0;) {
        switch (Next()) {
        case EdifToken::Open:
            ++depth;
            break;
        case EdifToken::Close:
            --depth;
            break;
        case EdifToken::End:
            ThrowAtLine(line, "the text ends inside (" + Excerpt(form) + " ...");
        case EdifToken::Word:
        case EdifToken::String:
            break;
        }
    }
}

std::string_view DecodeEdifString(std::string_view text, std::string& buffer)
{
    if (text.find('%') == std::string_view::npos)
        return text;
    buffer.clear();
    size_t place = 0;
    while (place < text.size()) {
        if (text[place] != '%') {
            buffer += text[place++];
            continue;
        }
        const size_t end = std::min(text.find('%', place + 1), text.size());
        unsigned int code = 0;
        bool hasDigits = false;
        for (++place; place <= end; ++place) {
            const bool isDigit = place < end && text[place] >= '0' && text[place] <= '9';
            if (isDigit)
                code = code * 10 + static_cast<unsigned int>(text[place] - '0');
            else if (hasDigits)
                buffer += static_cast<char>(code);
            code = isDigit ? code % 1000 : 0;
            hasDigits = isDigit;
        }
    }
    return buffer;
}

} // namespace booleq
