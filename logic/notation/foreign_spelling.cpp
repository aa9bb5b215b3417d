#include "foreign_spelling.h"

#include <algorithm>
#include <cassert>
#include <cstdint>
#include <cstring>

#include "function.h"
#include "init_literal.h"
#include "text.h"

namespace booleq {

namespace {

struct Spelling {
    const char* foreign;
    const char* own;
};

// A longer spelling comes before those that it begins with.
constexpr Spelling kOperators[] = {
    {"===", "~^"},         {"!==", "^"},          {"==", "~^"},          {"!=", "^"},
    {"~=", "^"},           {"<->", "~^"},         {"<=>", "~^"},         {"\xc2\xac", "~"},
    {"\xe2\x88\xa7", "&"}, {"\xe2\x88\xa8", "|"}, {"\xe2\x8a\x95", "^"}, {"\xc2\xb7", "&"}};
constexpr Spelling kWords[] = {{"and", "&"},   {"or", "|"},   {"xor", "^"},   {"not", "~"},
                               {"nand", "~&"}, {"nor", "~|"}, {"xnor", "~^"}, {"nxor", "~^"}};
constexpr char kBlanks[] = " \t\r\n";

bool IsNamePart(char character)
{
    return (character >= 'A' && character <= 'Z') || (character >= 'a' && character <= 'z') ||
           (character >= '0' && character <= '9') || character == '_';
}

bool IsDigit(char character)
{
    return character >= '0' && character <= '9';
}

std::string Quoted(const std::string& text)
{
    return "'" + Excerpt(text) + "'";
}

// The text around the place of a refusal.
class Place {
  public:
    Place(const std::string& text, size_t offset) : m_text(text), m_offset(offset)
    {
        assert(offset <= text.size());
    }

    bool HasAt(size_t position, const char* wanted) const
    {
        return position <= m_text.size() &&
               m_text.compare(position, std::strlen(wanted), wanted) == 0;
    }
    // Where the name around a position starts and ends; the position itself if there is no name.
    size_t NameStart(size_t position) const
    {
        while (position > 0 && IsNamePart(m_text[position - 1]))
            --position;
        return position;
    }
    size_t NameEnd(size_t position) const
    {
        while (position < m_text.size() && IsNamePart(m_text[position]))
            ++position;
        return position;
    }
    std::string WordAt(size_t position) const
    {
        const size_t start = NameStart(position);
        return m_text.substr(start, NameEnd(position) - start);
    }
    // The word that ends before the blanks in front of the place.
    std::string WordBefore() const
    {
        const size_t last =
            m_offset == 0 ? std::string::npos : m_text.find_last_not_of(kBlanks, m_offset - 1);
        return last == std::string::npos || !IsNamePart(m_text[last]) ? std::string()
                                                                      : WordAt(last);
    }
    // The word that begins after 'skipped' bytes and blanks.
    std::string WordAfter(size_t skipped) const
    {
        const size_t first = m_text.find_first_not_of(kBlanks, m_offset + skipped);
        return first == std::string::npos ? std::string() : WordAt(first);
    }
    bool EndsAfter(size_t skipped) const
    {
        return m_text.find_first_not_of(kBlanks, m_offset + skipped) == std::string::npos;
    }

    std::string OperatorHint() const;
    std::string WordHint() const;
    std::string ImplicationHint() const;
    std::string LiteralHint(const Reading& reading) const;
    std::string DottedHint() const;
    std::string OtherHint() const;

  private:
    std::string SizedHint(size_t start, size_t end, const Reading& reading) const;
    std::string UnquotedHint(size_t start, size_t end, const Reading& reading) const;

    const std::string& m_text;
    size_t m_offset;
};

// The place may be the second character of "!=", because "!" alone is an operator.
std::string Place::OperatorHint() const
{
    for (const Spelling& spelling : kOperators)
        for (const size_t back : {size_t(0), size_t(1)})
            if (m_offset >= back && HasAt(m_offset - back, spelling.foreign))
                return std::string("write '") + spelling.own + "' instead of '" +
                       Visible(spelling.foreign) + "'";
    return std::string();
}

const Spelling* FindWord(std::string word)
{
    std::transform(word.begin(), word.end(), word.begin(), [](char character) {
        return character >= 'A' && character <= 'Z' ? static_cast<char>(character | 0x20)
                                                    : character;
    });
    for (const Spelling& spelling : kWords)
        if (word == spelling.foreign)
            return &spelling;
    return nullptr;
}

// "a and b" stops at the word, "not a" after it.
std::string Place::WordHint() const
{
    const bool startsName = NameStart(m_offset) == m_offset && NameEnd(m_offset) > m_offset;
    const bool startsOperand =
        startsName || HasAt(m_offset, "(") || HasAt(m_offset, "~") || HasAt(m_offset, "!");
    for (const std::string& word :
         {startsName ? WordAt(m_offset) : "", startsOperand ? WordBefore() : ""})
        if (const Spelling* spelling = FindWord(word))
            return std::string("write '") + spelling->own + "' instead of '" + word + "'";
    return std::string();
}

std::string Place::ImplicationHint() const
{
    const bool isArrow = HasAt(m_offset, "->") || HasAt(m_offset, "=>");
    const std::string left = WordBefore();
    const std::string right = WordAfter(2);
    if (isArrow && !left.empty() && !right.empty())
        return "write (~" + Excerpt(left) + " | " + Excerpt(right) + ") for " +
               Excerpt(left + " implies " + right);
    return isArrow ? "write (~x | y) for x implies y" : "";
}

// "6 " for a size of 64 rows; empty for one input, or if the size is not a number of rows.
std::string NumInputsOf(const std::string& literal)
{
    for (size_t numInputs = 1; numInputs <= kMaxFunctionInputs; ++numInputs)
        if (literal.compare(0, literal.find('\''), std::to_string(uint64_t(1) << numInputs)) == 0)
            return numInputs == 1 ? "" : std::to_string(numInputs) + " ";
    return std::string();
}

// N'... is an init value if it is the whole text; as an operand it may be a constant.
std::string Place::SizedHint(size_t start, size_t end, const Reading& reading) const
{
    const std::string literal = m_text.substr(start, end - start);
    const size_t first = m_text.find_first_not_of(kBlanks);
    const bool isWhole =
        first == start && m_text.find_first_not_of(kBlanks, end) == std::string::npos;
    const bool isBit =
        literal == "1'b0" || literal == "1'b1" || literal == "1'h0" || literal == "1'h1";
    if (isBit)
        return std::string("write ") + literal.back() + " instead of " + literal;
    const char base = static_cast<char>(literal[literal.find('\'') + 1] | 0x20);
    if (isWhole && (base == 'd' || base == 'o'))
        return "write an init value in hexadecimal ('h) or binary ('b)";
    if (isWhole && !reading.hasInputs)
        return "to give an init value, list its " + NumInputsOf(literal) + "inputs with " +
               reading.inputsName + ", the most significant first";
    return "the only constants are 0 and 1, without a size";
}

// "16hcaca": the quote was forgotten.
std::string Place::UnquotedHint(size_t start, size_t end, const Reading& reading) const
{
    size_t base = start;
    while (base < end && IsDigit(m_text[base]))
        ++base;
    const bool hasBase = base > start && base + 1 < end && (m_text[base] | 0x20) == 'h';
    const bool isHex =
        hasBase && std::all_of(m_text.begin() + static_cast<long>(base) + 1,
                               m_text.begin() + static_cast<long>(end), [](char character) {
                                   return IsDigit(character) || character == '_' ||
                                          ((character | 0x20) >= 'a' && (character | 0x20) <= 'f');
                               });
    if (!isHex)
        return std::string();
    const std::string sized =
        m_text.substr(start, base - start) + "'" + m_text.substr(base, end - base);
    return "write " + Excerpt(sized) +
           (reading.hasInputs ? ""
                              : std::string(", and list its inputs with ") + reading.inputsName);
}

std::string Place::LiteralHint(const Reading& reading) const
{
    const size_t start = NameStart(m_offset);
    const size_t end = NameEnd(m_offset);
    if (start == m_text.size() || !IsDigit(m_text[start]))
        return std::string();
    const size_t quote = NameEnd(start);
    const bool isQuoted = quote + 1 < m_text.size() && m_text[quote] == '\'' &&
                          std::strchr("bBhHdDoO", m_text[quote + 1]) != nullptr &&
                          std::all_of(m_text.begin() + static_cast<long>(start),
                                      m_text.begin() + static_cast<long>(quote), IsDigit);
    if (isQuoted)
        return SizedHint(start, NameEnd(quote + 1), reading);
    if (quote > start + 1 && std::all_of(m_text.begin() + static_cast<long>(start),
                                         m_text.begin() + static_cast<long>(quote), IsDigit))
        return "the only constants are 0 and 1; a name made of digits needs single quotes";
    return UnquotedHint(start, end, reading);
}

// A hierarchical name: parts with dots between them.
std::string Place::DottedHint() const
{
    if (!HasAt(m_offset, "."))
        return std::string();
    const size_t start = NameStart(m_offset);
    const std::string word = m_text.substr(m_offset + 1, NameEnd(m_offset + 1) - m_offset - 1);
    if (start == m_offset && FindWord(word))
        return "write ." + word + ". with both dots";
    size_t end = m_offset;
    while (HasAt(end, ".") && NameEnd(end + 1) > end + 1)
        end = NameEnd(end + 1);
    if (start == m_offset || end == m_offset)
        return std::string();
    const std::string name = m_text.substr(start, end - start);
    return "if " + Excerpt(name) + " is a name, write " + Quoted(name);
}

std::string Place::OtherHint() const
{
    if (HasAt(m_offset, ";"))
        return EndsAfter(1) ? "remove the ';'"
                            : "one equation at a time: remove the ';' and what follows";
    if (HasAt(m_offset, "?"))
        return "write (S & A) | (~S & B) for S ? A : B";
    if (HasAt(m_offset, "=") || HasAt(m_offset, "<=") || HasAt(m_offset, ":="))
        return "remove the target of the assignment, up to the '" +
               m_text.substr(m_offset, HasAt(m_offset, "=") ? 1 : 2) + "'";
    return std::string();
}

} // namespace

std::string HintForForeign(const std::string& text, size_t offset, const Reading& reading)
{
    const Place place(text, offset);
    for (const std::string& hint :
         {place.OperatorHint(), place.ImplicationHint(), place.WordHint(),
          place.LiteralHint(reading), place.DottedHint(), place.OtherHint()})
        if (!hint.empty())
            return hint;
    return std::string();
}

} // namespace booleq
