// The input is a text, and only the library is asked: its answers in one way must agree with its
// answers in another. There is no model, so one core gets through many thousands of inputs a
// second.
#include <Kq_BoolEquation.h>
#include <Kq_BoolEquationImpNode.h>

#include "fuzz/target.h"
#include "support/library_view.h"

namespace fuzz {

namespace {

typedef Kq_BoolEquation Equation;
typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;
typedef std::vector<uint64_t> Column;

// Every row up to this many variables, so many rows above; no column at all beyond the second
// limit.
const unsigned int kMaxEvaluated = 6;
const unsigned int kMaxTabulated = 10;
const size_t kNumEvaluatedRows = 64;

// Failure dumps of refused texts are discarded.
const bool s_isQuiet = [] {
    Port_MsgManData::setSink([](const char*, const char*, int, const char*, const char*) {});
    return true;
}();

// Whether every negation stands before what it negates: a name, a constant, a group or another
// negation. Only a negation apart from its operator ("X ~ & Y") hangs over an operator without
// parentheses. Rendering adds none, so such a text may read back as another equation. 'pending' is
// a stack to use.
bool KeepsItsMeaning(const Node* root, std::vector<const Node*>& pending)
{
    pending.assign(1, root);
    while (!pending.empty()) {
        const Node* const node = pending.back();
        pending.pop_back();
        const Node* const left = node->GetLeftChild();
        const Node* const right = node->GetRightChild();
        if (node->IsNot() && left && left->IsBinOp() && !left->IsConst())
            return false;
        for (const Node* const child : {left, right}) {
            if (child)
                pending.push_back(child);
        }
    }
    return true;
}

// Where rendering keeps the meaning, the text is accepted and has the same tree and value; that of
// an init value over no inputs ("0b1") has the same value. Any other text may be refused.
std::string CheckRendering(const Equation& equation, const String& text, bool isKept)
{
    const Equation again(text);
    const char* difference = nullptr;
    if (!isKept)
        return "";
    if (!again)
        difference = "is refused: ";
    else if (again.Eval() != equation.Eval())
        difference = "has another value: ";
    else if (equation.IsExpression() && again != equation)
        difference = "has another tree: ";
    if (!difference)
        return "";
    return "the rendering " + (difference + support::Printable(support::ToStd(text)));
}

// As typed, and in one of the fixed syntaxes; 'choice' says in which one, and with which blanks.
std::string CheckRenderings(const Equation& equation, size_t choice)
{
    typedef String (Equation::*Render)(bool) const;
    static const Render syntaxes[] = {&Equation::GetEquationAlt1, &Equation::GetEquationAlt2,
                                      &Equation::GetEquationAlt3};
    static std::vector<const Node*> pending;
    const bool isKept = KeepsItsMeaning(equation.GetImp()->GetRoot(), pending);
    const bool spaces = choice % 2 != 0;
    const std::string difference = CheckRendering(equation, equation.GetEquation(spaces), isKept);
    if (!difference.empty())
        return difference;
    return CheckRendering(equation, (equation.*syntaxes[choice / 4 % 3])(choice / 2 % 2 != 0),
                          isKept);
}

bool GetBit(const Column& words, size_t row)
{
    return (words[row / 64] >> row % 64 & 1u) != 0;
}

// Digit 'position' of 'text', counted from the last, in its base.
unsigned int DigitAt(const String& text, size_t position)
{
    const char digit = text.c_str()[text.length() - 1 - position];
    return static_cast<unsigned int>(digit <= '9' ? digit - '0' : digit - 'a' + 10);
}

// Column, hexadecimal and binary text agree with evaluation, row by row.
std::string CheckRows(Equation& equation, const Column& words)
{
    const unsigned int numVariables = equation.GetNumVariables();
    const size_t numRows = size_t(1) << numVariables;
    const String hex = equation.GetEquationAsHexInitValue(false);
    const String binary = equation.GetEquationAsBinaryInitValue();
    if (binary.length() != 2 + numRows || hex.length() != 2 + (numRows + 3) / 4)
        return "an init value has another length";
    static std::vector<Equation::Handle> handles;
    handles.clear();
    for (const auto& variable : equation.GetVariables())
        handles.push_back(equation.GetVariableHandle(variable.first));
    const size_t step = numVariables > kMaxEvaluated ? numRows / kNumEvaluatedRows + 1 : 1;
    for (size_t row = 0; row < numRows; row += step) {
        for (unsigned int index = 0; index < numVariables; ++index)
            equation.SetVariable(handles[index],
                                 static_cast<unsigned int>(row >> (numVariables - 1 - index) & 1u));
        const unsigned int value = equation.Eval();
        if (GetBit(words, row) != (value != 0) || value > 1)
            return "row " + std::to_string(row) + " of the column is not its value";
        if (DigitAt(binary, row) != value || (DigitAt(hex, row / 4) >> row % 4 & 1u) != value)
            return "row " + std::to_string(row) + " of an init value is not its value";
    }
    return "";
}

// The digits, read back over the same inputs, are the same and have the same column, and so does
// the expression made from them. They are hexadecimal, except for one input: a digit has too many
// rows.
std::string CheckReading(const Equation& equation, const Column& words)
{
    static std::vector<String> names;
    names.clear();
    for (const auto& variable : equation.GetVariables())
        names.push_back(variable.first);
    const bool isHex = names.size() > 1;
    const String digits =
        isHex ? equation.GetEquationAsHexInitValue(false) : equation.GetEquationAsBinaryInitValue();
    Equation again;
    Column read;
    if (!again.SetEquationWithExplicitTerms(names, digits, false, false))
        return "the digits are refused";
    if (!again.GetColumn(read) || read != words)
        return "the digits have another column";
    if (support::ToStd(digits) != support::ToStd(again.GetEquation(false)))
        return "the digits come back as others";
    Equation expression;
    const String text = again.GetEquationAsExpression(false);
    if (!expression.SetEquationWithExplicitTerms(names, text, false, false))
        return "the expression of the digits is refused";
    if (!expression.GetColumn(read) || read != words)
        return "the expression of the digits has another column";
    return "";
}

// The object is empty, and the place of the fault is within the text.
std::string CheckRefused(const Equation& equation, const std::string& input, const String& text)
{
    if (equation.GetNumVariables() != 0 || equation.Eval() != 0 || equation.GetImp()->GetRoot())
        return "it is refused, and the object is not empty";
    const Equation::Refusal refusal = Equation::FindRefusal(text);
    if (refusal.code == Equation::Refusal::NONE)
        return "it is refused without a reason";
    if (refusal.offset > input.size() || refusal.length > input.size() - refusal.offset)
        return "what is wrong lies outside of the text";
    return "";
}

} // namespace

std::string Describe(const std::string& input)
{
    return "text \"" + support::Printable(input) + "\"\n";
}

std::string Check(const std::string& input)
{
    const String text = support::ToPort(input);
    Equation equation(text);
    if (!equation)
        return CheckRefused(equation, input, text);
    const unsigned int numVariables = equation.GetNumVariables();
    if (!equation.IsExpression() && (numVariables != 0 || !equation.IsBinaryInitValue()))
        return "an init value over no inputs has some, or a digit for four rows";
    std::string difference = CheckRenderings(equation, input.size());
    if (!difference.empty() || numVariables == 0 || numVariables > kMaxTabulated)
        return difference;
    static Column words;
    if (!equation.GetColumn(words))
        return "there is no column";
    difference = CheckRows(equation, words);
    if (difference.empty() && numVariables <= kMaxEvaluated)
        difference = CheckReading(equation, words);
    return difference;
}

} // namespace fuzz
