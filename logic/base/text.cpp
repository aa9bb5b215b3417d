#include "text.h"

#include <algorithm>

namespace booleq {

namespace {

constexpr size_t kExcerptBytes = 60;

bool IsPrintableByte(char byte)
{
    return byte >= ' ' && byte <= '~';
}

} // namespace

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
    for (const char byte : text) {
        if (IsPrintableByte(byte)) {
            visible += byte;
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

bool IsBlank(const std::string& text)
{
    return text.find_first_not_of(" \t\n") == std::string::npos;
}

} // namespace booleq
