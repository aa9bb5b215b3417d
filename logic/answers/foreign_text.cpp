#include "foreign_text.h"

#include <set>

#include "listed_inputs.h"
#include "short_form.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kMaxShortenedInputs = 8;

// The name as this library spells it; empty if it cannot.
std::string OwnName(const std::string& name)
{
    if (CheckInputs({name}).illegal.empty() && name[0] != '\'')
        return name;
    return name.find('\'') == std::string::npos && !name.empty() ? "'" + name + "'" : std::string();
}

} // namespace

bool ToBits(const ForeignTree& tree, const WordFunction& function, Expression& expression)
{
    if (ToExpression(tree, expression))
        return true;
    if (tree.names.size() > kMaxShortenedInputs)
        return false;
    const ShortForm shortForm = FindShortForm(Tabulate(function, tree.names));
    expression = shortForm.expression;
    return shortForm.isFound;
}

ForeignText ReadForeignText(const std::string& text, const Notation& notation)
{
    ForeignText result;
    ForeignTree tree;
    if (!Read(text, notation, tree, result.fault))
        return result;
    if (!ToBits(tree, ToWordFunction(tree), result.expression)) {
        result.fault = "values there are wider than a bit, and the function has " +
                       Count(tree.names.size(), "input");
        return result;
    }
    std::set<std::string> known;
    for (std::string& name : result.expression.names) {
        const std::string own = OwnName(name);
        if (own.empty() || !known.insert(own).second) {
            result.fault = "the name " + Excerpt(name) + " has no spelling here";
            return result;
        }
        name = own;
    }
    return result;
}

} // namespace booleq
