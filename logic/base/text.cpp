#include "text.h"

#include <algorithm>
#include <cassert>

namespace booleq {

namespace {

constexpr size_t kExcerptBytes = 60;

CharacterTest isShown = nullptr;

bool IsPrintableByte(char byte)
{
    return byte >= ' ' && byte <= '~';
}

// Characters without a glyph, which locales call printable all the same. Some of them turn the
// direction of the text around them.
bool IsUnseen(uint32_t code)
{
    return (code >= 0x200b && code <= 0x200f) || (code >= 0x2028 && code <= 0x202e) ||
           (code >= 0x2060 && code <= 0x206f) || code == 0xfeff;
}

// The length in bytes of the UTF-8 character that begins at 'position', and its code; 0 if there is
// none.
size_t ReadCharacter(const std::string& text, size_t position, uint32_t& character)
{
    constexpr uint32_t kLowest[] = {0, 0, 0x80, 0x800, 0x10000}; // code for each length
    const auto first = static_cast<unsigned char>(text[position]);
    const size_t length = first < 0xc2   ? 0
                          : first < 0xe0 ? 2
                          : first < 0xf0 ? 3
                          : first < 0xf5 ? 4
                                         : 0;
    if (length == 0 || position + length > text.size())
        return 0;
    character = first & (0x7fu >> length);
    for (size_t next = 1; next < length; ++next) {
        const auto byte = static_cast<unsigned char>(text[position + next]);
        if ((byte & 0xc0u) != 0x80u)
            return 0;
        character = character << 6 | (byte & 0x3fu);
    }
    const bool isSurrogate = character >= 0xd800 && character < 0xe000;
    return character < kLowest[length] || isSurrogate || character > 0x10ffff ? 0 : length;
}

// The length in bytes of the printable character that begins at 'position'; 0 if there is none.
size_t PrintableLength(const std::string& text, size_t position)
{
    if (IsPrintableByte(text[position]))
        return 1;
    uint32_t character = 0;
    const size_t length = isShown ? ReadCharacter(text, position, character) : 0;
    return length > 0 && !IsUnseen(character) && isShown(character) ? length : 0;
}

} // namespace

void ShowUtf8(CharacterTest test)
{
    isShown = test;
}

size_t Width(const std::string& visible)
{
    // Each character has exactly one byte that is not a continuation byte.
    return static_cast<size_t>(std::count_if(visible.begin(), visible.end(), [](char byte) {
        return (static_cast<unsigned char>(byte) & 0xc0u) != 0x80u;
    }));
}

std::string ToStd(const Port::StringBase<char>& text)
{
    return std::string(text.c_str(), text.length());
}

bool IsPrintable(const std::string& text)
{
    return std::all_of(text.begin(), text.end(), IsPrintableByte);
}

std::string Visible(const std::string& text)
{
    static constexpr char kDigits[] = "0123456789abcdef";
    std::string visible;
    visible.reserve(text.size());
    for (size_t position = 0; position < text.size(); ++position) {
        const char byte = text[position];
        const size_t length = PrintableLength(text, position);
        if (length > 0) {
            visible.append(text, position, length);
            position += length - 1;
            continue;
        }
        const unsigned int value = static_cast<unsigned char>(byte);
        visible += "\\x";
        visible += kDigits[value >> 4];
        visible += kDigits[value & 15u];
    }
    return visible;
}

std::string Excerpt(const std::string& text)
{
    if (text.size() <= kExcerptBytes)
        return Visible(text);
    size_t length = kExcerptBytes; // or less, so that no character is split
    while (length > kExcerptBytes - 3 &&
           (static_cast<unsigned char>(text[length]) & 0xc0u) == 0x80u)
        --length;
    return Visible(text.substr(0, length)) + "... (" + std::to_string(text.size()) + " bytes)";
}

std::string Count(uint64_t number, const std::string& noun)
{
    return std::to_string(number) + " " + noun + (number == 1 ? "" : "s");
}

std::string Join(const std::vector<std::string>& words, const char* between)
{
    std::string text;
    bool isFirst = true;
    for (const std::string& word : words) {
        text += (isFirst ? "" : between) + word;
        isFirst = false;
    }
    return text;
}

std::string ValuesByName(const std::vector<std::string>& names, const std::vector<bool>& values)
{
    assert(names.size() == values.size());
    std::string text;
    for (size_t index = 0; index < names.size(); ++index)
        text += (index == 0 ? "" : " ") + Visible(names[index]) + (values[index] ? "=1" : "=0");
    return text.empty() ? "no inputs" : text;
}

bool IsBlank(const std::string& text)
{
    return text.find_first_not_of(" \t\n") == std::string::npos;
}

} // namespace booleq
