#include "equation_text.h"

#include <algorithm>
#include <cassert>

#include "convert.h"
#include "kind.h"
#include "names.h"
#include "short_form.h"

namespace booleq {

namespace {

// A word that is a name in every notation, is reserved in none, and occurs in no other text.
std::string Placeholder(unsigned int input)
{
    return "kqin" + std::to_string(input) + "kq";
}

TextWithInputs Split(const std::string& text, unsigned int numInputs)
{
    TextWithInputs split;
    size_t begin = 0;
    for (;;) {
        size_t next = std::string::npos;
        unsigned int nextInput = 0;
        for (unsigned int input = 0; input < numInputs; ++input) {
            const size_t found = text.find(Placeholder(input), begin);
            if (found < next) {
                next = found;
                nextInput = input;
            }
        }
        if (next == std::string::npos)
            break;
        split.pieces.push_back(text.substr(begin, next - begin));
        split.inputs.push_back(nextInput);
        begin = next + Placeholder(nextInput).size();
    }
    split.pieces.push_back(text.substr(begin));
    return split;
}

bool IsLetterOrDigit(char character)
{
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
           (character >= '0' && character <= '9');
}

bool IsIdentifier(const std::string& name)
{
    return !name.empty() && !(name[0] >= '0' && name[0] <= '9') &&
           std::all_of(name.begin(), name.end(), [](char character) {
               return IsLetterOrDigit(character) || character == '_';
           });
}

// The letters and digits of the name, followed by the net's number.
std::string ChangedName(const Design& design, NetId net, const std::string& name)
{
    std::string changed = "net";
    for (const char character : name) {
        if (IsLetterOrDigit(character))
            changed += character;
        else if (changed.back() != '_')
            changed += '_';
    }
    changed += (changed.back() == '_' ? "n" : "_n") + std::to_string(net);
    while (design.names.Find(changed) != NameArena::kNoName)
        changed += "n" + std::to_string(net);
    return changed;
}

} // namespace

std::string Fill(const TextWithInputs& text, const std::vector<std::string>& names)
{
    std::string filled;
    for (size_t place = 0; place < text.pieces.size(); ++place) {
        filled += text.pieces[place];
        if (place < text.inputs.size())
            filled += names[text.inputs[place]];
    }
    return filled;
}

FunctionTexts MakeTexts(const Rows& rows, const Target& target)
{
    assert(WritesExpressions(target));
    FunctionTexts texts;
    std::vector<std::string> names;
    for (unsigned int input = 0; input < rows.NumInputs(); ++input)
        names.push_back(Placeholder(input));
    const Function function(names, rows);
    const FunctionKind kind = FindKind(function);
    texts.kind = kind.kind;
    texts.meaning = Split(kind.text, rows.NumInputs());
    const ShortForm form = FindShortForm(function);
    if (!form.isFound)
        return texts;
    const Conversion conversion = Convert(form.expression, target, "", Limits());
    if (conversion.fault.empty() && conversion.isProved)
        texts.equation =
            Split(conversion.text.substr(0, conversion.text.find('\n')), rows.NumInputs());
    return texts;
}

std::vector<std::string> Letters(unsigned int numInputs)
{
    std::vector<std::string> names;
    for (unsigned int input = 0; input < numInputs; ++input)
        names.push_back(std::string(1, static_cast<char>('A' + input)));
    return names;
}

NamedFunction NameFunction(const Rows& rows)
{
    const FunctionTexts texts = MakeTexts(rows, *FindTarget("alt1"));
    const std::vector<std::string> names = Letters(rows.NumInputs());
    return {texts.kind, Fill(texts.meaning, names), Fill(texts.equation, names)};
}

bool WritesExpressions(const Target& target)
{
    return target.wrapping != Wrapping::Always;
}

std::string SpellNet(const Design& design, NetId net, const Target& target)
{
    std::string name = NetName(design, net);
    if (net < kNumFixedNets)
        return ChangedName(design, net, net == kNetOpen ? "open" : "unknown");
    if (!target.notation) {
        if (IsIdentifier(name))
            return name;
        return name.find_first_of("'\n") == std::string::npos ? "'" + name + "'"
                                                              : ChangedName(design, net, name);
    }
    const Notation& notation = target.notation();
    if (IsPlain(notation, name))
        return name;
    const std::string escaped = notation.escape ? notation.escape(name) : std::string();
    return escaped.empty() ? ChangedName(design, net, name) : escaped;
}

} // namespace booleq
