// A cause is undone by changing the other notation's tree. All causes undone together give this
// library's function, so a search over sets of causes, small ones first, ends with an answer.
#include "lint_reason.h"

#include <algorithm>
#include <cassert>
#include <cstring>
#include <map>

namespace booleq {

namespace {

// What can differ there, in the order in which causes are tried and named.
enum Cause : unsigned int {
    kGrouping = 1,  // operators have several precedences
    kInversion = 2, // "~" inverts numbers
    kSum = 4,       // "+" adds
    kWidth = 8,     // "0" and "1" are wider than a bit
    kAllCauses = 15
};

const OperatorForm* FindForm(const std::vector<OperatorForm>& forms, const std::string& text)
{
    const auto found = std::find_if(forms.begin(), forms.end(),
                                    [&](const OperatorForm& form) { return text == form.text; });
    return found == forms.end() ? nullptr : &*found;
}

Meaning ConstantOf(const ForeignTree& tree, Meaning narrow, Meaning wide)
{
    const bool isWide =
        std::any_of(tree.nodes.begin(), tree.nodes.end(), [](const ForeignTree::Node& node) {
            return node.meaning == Meaning::WideZero || node.meaning == Meaning::WideOne;
        });
    return isWide ? wide : narrow;
}

// This library's grouping of the text, with the notation's meaning of each operator. What is one
// operator there and two here ("^~": an exclusive OR and an inversion) keeps this library's
// meaning.
ForeignTree Regrouped(const Expression& expression, const ForeignTree& tree)
{
    const Notation& notation = *tree.notation;
    ForeignTree regrouped;
    regrouped.notation = &notation;
    regrouped.names = tree.names;
    for (const Expression::Node& node : expression.nodes) {
        Meaning meaning = MeaningOf(node.op);
        if (node.op == Operator::Zero)
            meaning = ConstantOf(tree, Meaning::Zero, Meaning::WideZero);
        if (node.op == Operator::One)
            meaning = ConstantOf(tree, Meaning::One, Meaning::WideOne);
        const bool isOperator = node.op == Operator::Not || IsBinary(node.op);
        const OperatorForm* form =
            isOperator ? FindForm(node.op == Operator::Not ? notation.prefixes : notation.binaries,
                                  SpellOperator(node.op, node.spelling))
                       : nullptr;
        if (form && form->meaning != Meaning::Foreign)
            meaning = form->meaning;
        regrouped.nodes.push_back({meaning, node.left, node.right, form ? form->text : nullptr});
    }
    return regrouped;
}

ForeignTree Undo(const Expression& expression, const ForeignTree& tree, unsigned int causes)
{
    ForeignTree undone = causes & kGrouping ? Regrouped(expression, tree) : tree;
    for (ForeignTree::Node& node : undone.nodes) {
        if ((causes & kInversion) != 0 && node.meaning == Meaning::BitNot)
            node.meaning = Meaning::LogicalNot;
        if ((causes & kSum) != 0 && node.meaning == Meaning::Add)
            node.meaning = Meaning::Or;
        if ((causes & kWidth) != 0 && node.meaning == Meaning::WideZero)
            node.meaning = Meaning::Zero;
        if ((causes & kWidth) != 0 && node.meaning == Meaning::WideOne)
            node.meaning = Meaning::One;
    }
    return undone;
}

bool Has(const ForeignTree& tree, Meaning meaning)
{
    return std::any_of(
        tree.nodes.begin(), tree.nodes.end(),
        [meaning](const ForeignTree::Node& node) { return node.meaning == meaning; });
}

// The causes that can apply to the text.
unsigned int PossibleCauses(const ForeignTree& tree)
{
    unsigned int causes = kGrouping;
    if (tree.notation->values == Values::Int && Has(tree, Meaning::BitNot))
        causes |= kInversion;
    if (Has(tree, Meaning::Add))
        causes |= kSum;
    if (tree.notation->values == Values::Vector &&
        (Has(tree, Meaning::WideZero) || Has(tree, Meaning::WideOne)))
        causes |= kWidth;
    return causes;
}

// The fewest causes that explain the difference.
unsigned int FindCauses(const Expression& expression, const ForeignTree& tree,
                        const Agreement& agrees)
{
    const unsigned int possible = PossibleCauses(tree);
    const auto count = [](unsigned int causes) { return __builtin_popcount(causes); };
    for (int size = 1; size < count(possible); ++size)
        for (unsigned int causes = 1; causes < kAllCauses; ++causes)
            if (count(causes) == size && (causes & possible) == causes &&
                agrees(Undo(expression, tree, causes)))
                return causes;
    assert(agrees(Undo(expression, tree, possible)));
    return possible;
}

// Lists the binary operators of the text by level, the tightest first: '"&" binds tighter than "^"
// there, and "^" tighter than "|"'.
std::string GroupingReason(const ForeignTree& tree)
{
    std::map<int, std::vector<std::string>> levels;
    for (const OperatorForm& form : tree.notation->binaries) {
        const bool isUsed =
            std::any_of(tree.nodes.begin(), tree.nodes.end(), [&](const ForeignTree::Node& node) {
                return node.text && std::strcmp(form.text, node.text) == 0;
            });
        if (isUsed)
            levels[-form.level].push_back('"' + std::string(form.text) + '"');
    }
    std::vector<std::string> names;
    for (const auto& level : levels) {
        std::string name = level.second.front();
        for (size_t which = 1; which < level.second.size(); ++which)
            name += " and " + level.second[which];
        names.push_back(name);
    }
    std::string reason;
    for (size_t level = 0; level + 1 < names.size(); ++level) {
        if (level > 0)
            reason += level + 2 < names.size() ? ", " : ", and ";
        reason += names[level] + (level > 0 ? " tighter than " : " binds tighter than ") +
                  names[level + 1] + (level == 0 ? " there" : "");
    }
    return reason;
}

} // namespace

std::string FindReason(const Expression& expression, const ForeignTree& tree,
                       const Agreement& agrees)
{
    const unsigned int causes = FindCauses(expression, tree, agrees);
    std::vector<std::string> reasons;
    if (causes & kGrouping)
        reasons.push_back(GroupingReason(tree));
    if (causes & kInversion)
        reasons.emplace_back("\"~\" inverts every bit of a number there, so ~1 is -2, which counts "
                             "as true");
    if (causes & kSum)
        reasons.emplace_back("\"+\" adds there");
    if (causes & kWidth)
        reasons.emplace_back("0 and 1 are numbers of 32 bits there, and \"!\" asks for all of "
                             "their bits");
    std::string reason;
    for (const std::string& one : reasons)
        reason += (reason.empty() ? "" : "; ") + one;
    return reason;
}

} // namespace booleq
