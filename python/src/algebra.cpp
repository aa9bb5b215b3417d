// Equations made from equations: by operators, by replacing, fixing, renaming and reordering
// inputs. An init value stays an init value if the rows suffice; together with an expression it
// becomes an expression.
#include <algorithm>
#include <cassert>
#include <set>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include <kq_logic/permute.h>

#include "bind.h"
#include "equation.h"
#include "errors.h"
#include "function_access.h"
#include "listed_inputs.h"
#include "lock.h"
#include "messages.h"
#include "notation_writer.h"
#include "permute.h"
#include "short_form.h"
#include "substitute.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

constexpr size_t kMaxShortenedInputs = 6; // the short form of an init value is quick up to here
constexpr size_t kMaxExpandedInputs = 16; // an init value stands for at most a million operands

// A result for Python, made without the interpreter's lock.
struct Made {
    SharedContent content;
    std::string text;
    bool isListed; // the inputs have another order than in the text
};

Made Read(std::string text, const std::vector<std::string>& names, bool isListed)
{
    const booleq::NoMessages silence;
    booleq::Reading reading;
    reading.hasInputs = true;
    reading.inputs = names;
    const auto content = std::make_shared<Content>();
    if (!SetFromText(content->equation, text, reading) || content->NumInputs() != names.size())
        throw std::runtime_error("what was written does not read back: " + booleq::Excerpt(text));
    return {content, std::move(text), isListed};
}

booleq::Function FunctionOf(const Content& content)
{
    booleq::Function function;
    if (!booleq::FunctionOf(content.equation, function))
        throw py::value_error(booleq::NoFunctionReason(content.NumInputs()));
    return function;
}

// Whether the equation consists of digits. If an input has a split name, the library reads the
// expression that the digits stand for instead, and such an equation is that expression.
bool IsDigits(const Content& content)
{
    return content.IsInit() && booleq::FirstSplitName(booleq::InputNames(content.equation)).empty();
}

booleq::Expression ExpressionOf(const Content& content)
{
    if (IsDigits(content) && content.NumInputs() <= kMaxShortenedInputs) {
        booleq::ShortForm found = FindShortForm(FunctionOf(content));
        if (found.isFound) {
            assert(found.expression.names.size() == content.NumInputs());
            return found.expression;
        }
    }
    return booleq::ToExpression(content.equation);
}

[[noreturn]] void RefuseSplitName(const std::string& name)
{
    throw py::value_error(booleq::SplitNameReason(name));
}

Made FromNodes(const booleq::Expression& expression)
{
    const std::vector<std::string> names = NamesInText(expression);
    const std::string split = booleq::FirstSplitName(names);
    if (!split.empty())
        RefuseSplitName(split);
    std::string text = WriteOwn(expression, booleq::OwnSyntax::AsTyped, booleq::Parentheses::Clear);
    return Read(std::move(text), expression.names, names != expression.names);
}

// Makes an init value, or a constant.  Requires: no split names.
Made FromWholeNames(const booleq::Function& function)
{
    if (function.NumInputs() == 0)
        return Read(function.At(0) ? "1" : "0", {}, false);
    return Read(function.Hex(), function.Inputs(), true);
}

// Makes an equation of a function with split names, which may occur only in the list of inputs.
Made FromIdleNames(const booleq::Function& function)
{
    std::vector<std::string> names;
    std::vector<unsigned int> places;
    for (unsigned int input = 0; input < function.NumInputs(); ++input) {
        const std::string& name = function.Inputs()[input];
        const bool isSplit = !booleq::FirstSplitName({name}).empty();
        if (isSplit && DependsOn(function.GetRows(), input))
            RefuseSplitName(name);
        if (isSplit)
            continue;
        names.push_back(name);
        places.push_back(input);
    }
    if (names.size() > kMaxExpandedInputs)
        RefuseSplitName(booleq::FirstSplitName(function.Inputs()));
    const Made whole = FromWholeNames({names, Restrict(function.GetRows(), places)});
    booleq::Expression expression = ExpressionOf(*whole.content);
    for (booleq::Expression::Node& node : expression.nodes)
        if (node.op == booleq::Operator::Input)
            node.left = places[node.left];
    expression.names = function.Inputs();
    return FromNodes(expression);
}

// Makes an init value if the names of the inputs allow one.
Made FromFunction(const booleq::Function& function)
{
    return booleq::FirstSplitName(function.Inputs()).empty() ? FromWholeNames(function)
                                                             : FromIdleNames(function);
}

py::object Give(const Made& made)
{
    py::object inputs = py::none();
    if (made.isListed) {
        std::vector<std::string> names;
        for (const auto& variable : made.content->equation.GetVariables())
            names.push_back(booleq::ToStd(variable.first));
        inputs = DecodeAll(names);
    }
    return Wrap({made.content, Decode(made.text), inputs, false});
}

bool HasRowsOnly(const Content& content)
{
    return IsDigits(content) || content.NumInputs() == 0;
}

Made Join(const Content& left, booleq::Operator op, const Content& right)
{
    const bool hasDigits = left.IsInit() || right.IsInit();
    if (hasDigits && HasRowsOnly(left) && HasRowsOnly(right)) {
        const booleq::Function own = FunctionOf(left);
        const booleq::Function other = FunctionOf(right);
        std::vector<std::string> names = own.Inputs();
        booleq::Merge(other.Inputs(), names);
        if (names.size() <= booleq::kMaxFunctionInputs) {
            const booleq::Rows first = own.Over(names).GetRows();
            const booleq::Rows second = other.Over(names).GetRows();
            return FromFunction({names, op == booleq::Operator::And  ? first & second
                                        : op == booleq::Operator::Or ? first | second
                                                                     : first ^ second});
        }
    }
    return FromNodes(booleq::Joined(ExpressionOf(left), op, ExpressionOf(right)));
}

Made Inverted(const Content& content)
{
    if (IsDigits(content)) {
        const booleq::Function function = FunctionOf(content);
        return FromFunction({function.Inputs(), ~function.GetRows()});
    }
    booleq::Expression expression = booleq::ToExpression(content.equation);
    if (expression.nodes.back().op == booleq::Operator::Not)
        expression.nodes.pop_back();
    else
        booleq::AddNot(expression, static_cast<uint32_t>(expression.nodes.size() - 1));
    return FromNodes(expression);
}

booleq::Operator OperatorOf(char name)
{
    if (name == '&')
        return booleq::Operator::And;
    return name == '|' ? booleq::Operator::Or : booleq::Operator::Xor;
}

// NotImplemented for an operand that is not an equation, a text, 0 or 1.
py::object JoinObjects(const py::object& left, char op, const py::object& right)
{
    const py::object own = ToEquation(left);
    const py::object other = ToEquation(right);
    if (!own || !other)
        return py::reinterpret_borrow<py::object>(Py_NotImplemented);
    const SharedContent first = Own(own).Shared();
    const SharedContent second = Own(other).Shared();
    const Length length = std::max(Own(own).GetLength(), Own(other).GetLength());
    return Give(Run(length, [first, op, second] { return Join(*first, OperatorOf(op), *second); }));
}

py::object InvertObject(const py::object& self)
{
    const SharedContent content = Own(self).Shared();
    return Give(Run(Own(self).GetLength(), [content] { return Inverted(*content); }));
}

size_t RequireInput(const std::vector<std::string>& inputs, const py::handle& name)
{
    const py::str text = RequireStr(name, "the name of an input");
    const std::string bytes = Encode(text);
    for (size_t input = 0; input < inputs.size(); ++input)
        if (inputs[input] == bytes)
            return input;
    throw py::type_error(
        "there is no input " + Shown(name) +
        (inputs.empty() ? "; there are none" : "; the inputs are " + booleq::Join(inputs, ", ")));
}

// 'items' maps names to their replacements: an equation, a text, 0 or 1.
py::object Compose(const py::object& self, const py::dict& items)
{
    const SharedContent content = Own(self).Shared();
    const std::vector<std::string> inputs = Own(self).InputBytes();
    std::vector<SharedContent> others(inputs.size());
    Length length = Own(self).GetLength();
    for (const auto& item : items) {
        const py::object other = ToEquation(item.second);
        if (!other)
            throw py::type_error("in place of " + Shown(item.first) +
                                 " comes an Equation, a text, 0 or 1, not " +
                                 TypeName(item.second));
        others[RequireInput(inputs, item.first)] = Own(other).Shared();
        length = std::max(length, Own(other).GetLength());
    }
    return Give(RunLong(length, [content, inputs, others] {
        std::vector<std::string> names;
        std::vector<booleq::Substitute> substitutes(inputs.size());
        std::vector<booleq::Expression> expressions(inputs.size());
        bool hasConstant = false;
        for (size_t input = 0; input < inputs.size(); ++input) {
            if (!others[input]) {
                substitutes[input].places = booleq::Merge({inputs[input]}, names);
                continue;
            }
            expressions[input] = ExpressionOf(*others[input]);
            hasConstant = hasConstant || expressions[input].names.empty();
            substitutes[input].expression = &expressions[input];
            substitutes[input].places = booleq::Merge(expressions[input].names, names);
        }
        const booleq::Expression result =
            Substituted(ExpressionOf(*content), substitutes, std::move(names));
        return FromNodes(hasConstant ? Folded(result) : result);
    }));
}

Made FixRows(const Content& content, const std::vector<int>& values)
{
    const booleq::Function function = FunctionOf(content);
    booleq::Rows rows = function.GetRows();
    std::vector<std::string> names;
    std::vector<unsigned int> kept;
    for (unsigned int input = 0; input < values.size(); ++input) {
        if (values[input] >= 0) {
            rows = booleq::Cofactor(std::move(rows), input, values[input] == 1);
            continue;
        }
        kept.push_back(input);
        names.push_back(function.Inputs()[input]);
    }
    return FromFunction({names, booleq::Restrict(std::move(rows), kept)});
}

Made FixNodes(const Content& content, const std::vector<int>& values)
{
    const booleq::Expression expression = booleq::ToExpression(content.equation);
    booleq::Expression constants[2];
    booleq::AddConstant(constants[0], false);
    booleq::AddConstant(constants[1], true);
    std::vector<std::string> names;
    std::vector<booleq::Substitute> substitutes(values.size());
    for (size_t input = 0; input < values.size(); ++input) {
        if (values[input] >= 0) {
            substitutes[input].expression = &constants[values[input]];
            continue;
        }
        substitutes[input].places = {static_cast<uint32_t>(names.size())};
        names.push_back(expression.names[input]);
    }
    return FromNodes(Folded(Substituted(expression, substitutes, std::move(names))));
}

py::object Cofactor(const py::object& self, const py::dict& items)
{
    const SharedContent content = Own(self).Shared();
    const std::vector<std::string> inputs = Own(self).InputBytes();
    std::vector<int> values(inputs.size(), -1);
    for (const auto& item : items)
        values[RequireInput(inputs, item.first)] =
            static_cast<int>(RequireBit(item.second, item.first));
    return Give(Run(Own(self).GetLength(), [content, values] {
        return IsDigits(*content) ? FixRows(*content, values) : FixNodes(*content, values);
    }));
}

py::object Rename(const py::object& self, const py::dict& items)
{
    const SharedContent content = Own(self).Shared();
    std::vector<std::string> names = Own(self).InputBytes();
    const std::vector<std::string> inputs = names;
    for (const auto& item : items)
        names[RequireInput(inputs, item.first)] = Encode(RequireStr(item.second, "a new name"));
    const std::string fault = booleq::OrderFault(names);
    if (!fault.empty())
        throw py::value_error(fault + " among the new names");
    return Give(Run(Own(self).GetLength(), [content, names] {
        if (IsDigits(*content))
            return FromFunction({names, FunctionOf(*content).GetRows()});
        booleq::Expression expression = booleq::ToExpression(content->equation);
        expression.names = names;
        return FromNodes(expression);
    }));
}

py::object Permute(const py::object& self, const py::object& inputs)
{
    const Equation& equation = Own(self);
    const std::vector<std::string> order = EncodeAll(RequireInputs(inputs));
    if (order.size() > booleq::kMaxPermuteInputs)
        throw py::value_error("inputs has " + booleq::Count(order.size(), "input") + ": at most " +
                              std::to_string(booleq::kMaxPermuteInputs));
    const std::string forgotten = booleq::FirstUnlisted(equation.InputBytes(), order);
    if (!forgotten.empty())
        throw py::value_error("inputs does not list " + booleq::Excerpt(forgotten));
    const SharedContent content = equation.Shared();
    const Length length = order.size() > 10 ? Length::Long : Length::Short;
    return Give(Run(std::max(length, equation.GetLength()), [content, order] {
        if (!booleq::FirstSplitName(order).empty() && !IsDigits(*content)) {
            booleq::Expression expression = booleq::ToExpression(content->equation);
            std::vector<std::string> names = order;
            const std::vector<uint32_t> places = booleq::Merge(expression.names, names);
            for (booleq::Expression::Node& node : expression.nodes)
                if (node.op == booleq::Operator::Input)
                    node.left = places[node.left];
            expression.names = order;
            return FromNodes(expression);
        }
        kq_logic::Function permuted;
        const std::string fault = kq_logic::Permute(
            kq_logic::FunctionAccess::Make(FunctionOf(*content)), order, permuted);
        if (!fault.empty())
            throw py::value_error(fault);
        return FromFunction(kq_logic::FunctionAccess::Of(permuted));
    }));
}

} // namespace

void BindAlgebra(py::module_& module)
{
    module.def("join", &JoinObjects);
    module.def("invert", &InvertObject);
    module.def("compose", &Compose);
    module.def("cofactor", &Cofactor);
    module.def("rename", &Rename);
    module.def("permute", &Permute);
}

} // namespace booleq_python
