#include "names.h"

#include <algorithm>
#include <cassert>

#include "foreign_tree.h"

namespace booleq {

namespace {

// The name without the quotes around it.
std::string Content(const std::string& name)
{
    const bool isQuoted = name.size() >= 2 && name.front() == '\'' && name.back() == '\'';
    return isQuoted ? name.substr(1, name.size() - 2) : name;
}

// Letters, digits and "_", beginning with a letter and without two "_" side by side: every target
// accepts such names.
std::string Sanitized(const std::string& content)
{
    std::string name;
    for (const char character : content) {
        const bool isLetter =
            (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z');
        const bool isDigit = character >= '0' && character <= '9';
        if (name.empty() && !isLetter)
            name = "n";
        if (isLetter || isDigit)
            name += character;
        else if (name.back() != '_')
            name += '_';
    }
    while (!name.empty() && name.back() == '_')
        name.pop_back();
    return name.empty() ? "n" : name;
}

} // namespace

bool TargetNamer::IsPlainName(const std::string& name) const
{
    return m_notation ? IsPlain(*m_notation, name) : IsNetName(name);
}

bool TargetNamer::Claim(const std::string& spelled)
{
    return m_used.insert(m_notation ? CanonicalName(*m_notation, spelled) : spelled).second;
}

std::string TargetNamer::NameOther(const std::string& wanted)
{
    if (IsPlainName(wanted) && Claim(wanted))
        return wanted;
    size_t& number = m_last_numbers[wanted];
    for (;;) {
        std::string name = wanted + "_" + std::to_string(++number);
        if (IsPlainName(name) && Claim(name))
            return name;
    }
}

std::string TargetNamer::Spell(const std::string& content)
{
    if (IsPlainName(content) && Claim(content))
        return content;
    if (m_notation && m_notation->escape) {
        std::string escaped = m_notation->escape(content);
        if (!escaped.empty() && Claim(escaped))
            return escaped;
    }
    return NameOther(Sanitized(content));
}

std::vector<std::string> TargetNamer::NameInputs(const std::vector<std::string>& inputs)
{
    std::vector<std::string> names(inputs.size());
    for (size_t input = 0; input < inputs.size(); ++input)
        if (IsPlainName(inputs[input]) && Claim(inputs[input]))
            names[input] = inputs[input];
    for (size_t input = 0; input < inputs.size(); ++input)
        if (names[input].empty())
            names[input] = Spell(Content(inputs[input]));
    assert(std::none_of(names.begin(), names.end(),
                        [](const std::string& name) { return name.empty(); }));
    return names;
}

} // namespace booleq
