#include "text.h"

#include <algorithm>
#include <cassert>
#include <cwchar>
#include <cwctype>

namespace booleq {

namespace {

constexpr size_t kExcerptBytes = 60;

bool isUtf8Shown = false;

bool IsPrintableByte(char byte)
{
    return byte >= ' ' && byte <= '~';
}

// Signs without a picture of their own, some of which turn the direction of the text around them:
// locales call them printable.
bool IsUnseen(wchar_t character)
{
    const auto code = static_cast<unsigned long>(character);
    return (code >= 0x200b && code <= 0x200f) || (code >= 0x2028 && code <= 0x202e) ||
           (code >= 0x2060 && code <= 0x206f) || code == 0xfeff;
}

// Bytes of the printable character that begins there, 0 for none.
size_t PrintableLength(const std::string& text, size_t position)
{
    if (IsPrintableByte(text[position]))
        return 1;
    if (!isUtf8Shown || static_cast<unsigned char>(text[position]) < 0x80)
        return 0;
    wchar_t character = 0;
    std::mbstate_t state = {};
    const size_t length =
        std::mbrtowc(&character, text.data() + position, text.size() - position, &state);
    const bool isWhole = length != 0 && length <= text.size() - position;
    return isWhole && !IsUnseen(character) &&
                   std::iswprint(static_cast<std::wint_t>(character)) != 0
               ? length
               : 0;
}

} // namespace

void ShowUtf8(bool isShown)
{
    isUtf8Shown = isShown;
}

size_t Width(const std::string& visible)
{
    // A character has one byte that does not continue another.
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
    return Visible(text.substr(0, kExcerptBytes)) + "... (" + std::to_string(text.size()) +
           " bytes)";
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
