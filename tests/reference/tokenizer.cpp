// Each token is found by trying a list of rules at the current position.
#include "reference/tokenizer.h"

namespace reference {

namespace {

struct Fixed {
    const char* spelling;
    Type type;
};

// Longer spellings come before their own prefixes, so the first match is the right one.
const Fixed kFixed[] = {
    {"~&", kNand},     {"!&", kNand},   {"~*", kNand},   {"!*", kNand},     {"~|", kNor},
    {"!|", kNor},      {"~+", kNor},    {"!+", kNor},    {"~^", kNxor},     {"!^", kNxor},
    {"~@", kNxor},     {"!@", kNxor},   {"~", kNot},     {"!", kNot},       {"(", kLp},
    {")", kRp},        {"&", kAnd},     {"*", kAnd},     {"|", kOr},        {"+", kOr},
    {"^", kXor},       {"@", kXor},     {"0", kZero},    {"1", kOne},       {".AND.", kAnd},
    {".NAND.", kNand}, {".NOR.", kNor}, {".NOT.", kNot}, {".NXOR.", kNxor}, {".OR.", kOr},
    {".XOR.", kXor},
};

bool IsNameStart(char c)
{
    return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_';
}

bool IsNamePart(char c)
{
    return IsNameStart(c) || (c >= '0' && c <= '9');
}

// The length of the name at 'position'; 0 if there is none or its quote is never closed.
size_t NameLength(const std::string& text, size_t position)
{
    if (text[position] == '\'') {
        const size_t close = text.find('\'', position + 1);
        return close == std::string::npos ? 0 : close + 1 - position;
    }
    if (!IsNameStart(text[position]))
        return 0;
    size_t end = position;
    while (end < text.size() && IsNamePart(text[end]))
        ++end;
    return end - position;
}

const Fixed* FindFixed(const std::string& text, size_t position)
{
    for (const Fixed& fixed : kFixed) {
        const std::string spelling(fixed.spelling);
        if (text.compare(position, spelling.size(), spelling) == 0)
            return &fixed;
    }
    return nullptr;
}

} // namespace

bool Tokenize(const std::string& wholeText, std::vector<Node>& nodes)
{
    const std::string text = wholeText.substr(0, wholeText.find('\0'));
    size_t numOpen = 0;
    size_t numClose = 0;
    size_t position = 0;
    while (position < text.size()) {
        const char c = text[position];
        if (c == ' ' || c == '\t' || c == '\n') {
            ++position;
            continue;
        }
        if (const size_t length = NameLength(text, position)) {
            nodes.push_back(Node(kId, text.substr(position, length)));
            position += length;
            continue;
        }
        const Fixed* fixed = FindFixed(text, position);
        if (!fixed)
            return false;
        numOpen += fixed->type == kLp;
        numClose += fixed->type == kRp;
        nodes.push_back(Node(fixed->type, fixed->spelling));
        position += nodes.back().token.size();
    }
    return numOpen == numClose;
}

} // namespace reference
