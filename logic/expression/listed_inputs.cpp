#include "listed_inputs.h"

#include <cassert>
#include <set>

#include "init_literal.h"
#include "text.h"

namespace booleq {

namespace {

std::string WithoutOuterBlanks(const std::string& text)
{
    const size_t first = text.find_first_not_of(" \t");
    if (first == std::string::npos)
        return std::string();
    return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

} // namespace

bool SetFromText(Kq_BoolEquation& equation, const std::string& text, const Reading& reading)
{
    return SetVerbatim(equation, LibraryText(text, reading), reading);
}

bool SetVerbatim(Kq_BoolEquation& equation, const std::string& text, const Reading& reading)
{
    if (!reading.hasInputs)
        return equation.SetEquation(text.c_str());
    return equation.SetEquationWithExplicitTerms(TermsOf(reading), text.c_str(), reading.lsbFirst,
                                                 reading.reverse);
}

std::vector<Port::StringBase<char>> TermsOf(const Reading& reading)
{
    std::vector<Port::StringBase<char>> terms;
    terms.reserve(reading.inputs.size());
    for (const std::string& input : reading.inputs)
        terms.push_back(Port::StringBase<char>(input.c_str()));
    return terms;
}

bool SetOverTerms(Kq_BoolEquation& equation, const std::string& text, const Reading& reading,
                  const std::vector<Port::StringBase<char>>& terms)
{
    assert(reading.hasInputs && terms.size() == reading.inputs.size());
    return equation.SetEquationWithExplicitTerms(terms, LibraryText(text, reading).c_str(),
                                                 reading.lsbFirst, reading.reverse);
}

bool IsInitValue(const Kq_BoolEquation& equation)
{
    return equation.IsHexInitValue() || equation.IsBinaryInitValue();
}

InitWidth WidthOfInit(const std::string& text)
{
    InitWidth width;
    const char base = text.size() > 2 && text[0] == '0' ? static_cast<char>(text[1] | 0x20) : ' ';
    if (base != 'x' && base != 'b')
        return width;
    width.isHex = base == 'x';
    width.numRows = static_cast<uint64_t>(text.size() - 2) * (width.isHex ? 4 : 1);
    for (uint64_t highestRow = width.numRows - 1; highestRow > 0; highestRow /= 2)
        ++width.numInputs;
    return width;
}

std::string LibraryText(const std::string& text, const Reading& reading)
{
    const bool isLoneDigit = text.size() == 3 && text[0] == '0';
    if (!reading.hasInputs || (!isLoneDigit && !IsSizedLiteral(text)))
        return text;
    const InitLiteral literal = ReadInitLiteral(text, CheckInputs(reading.inputs).usable.size());
    return literal.code ? text : literal.text;
}

bool SplitInputs(const std::string& list, std::vector<std::string>& inputs)
{
    bool quoted = false;
    std::string name;
    for (const char character : list) {
        if (character == '\'')
            quoted = !quoted;
        if (character == ',' && !quoted) {
            inputs.push_back(WithoutOuterBlanks(name));
            name.clear();
        } else {
            name += character;
        }
    }
    inputs.push_back(WithoutOuterBlanks(name));
    return !quoted;
}

std::string SplitNameReason(const std::string& name)
{
    return "no expression or init value can hold the name " + Excerpt(name) +
           ": it would be read as a name and more; choose another";
}

std::string FirstSplitName(const std::vector<std::string>& names)
{
    for (const std::string& name : names)
        if (name.front() == '\'' && name.find('\'', 1) + 1 != name.size())
            return name;
    return std::string();
}

InputCheck CheckInputs(const std::vector<std::string>& inputs)
{
    InputCheck check;
    std::set<std::string> known;
    for (const std::string& input : inputs) {
        Kq_BoolEquation probe; // the library itself says what a legal name is
        if (!probe.DefineVariable(input.c_str(), 0))
            check.illegal.push_back(input);
        else if (known.insert(input).second)
            check.usable.push_back(input);
        else
            check.repeated.push_back(input);
    }
    return check;
}

} // namespace booleq
