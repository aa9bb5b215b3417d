// Plays steps on one side (model, engine or facade) and returns every result as text. A side names
// the types and converts texts; all sides run the same code for steps.
#ifndef RANDOM_SCRIPT_PLAYER_H
#define RANDOM_SCRIPT_PLAYER_H

#include <array>
#include <memory>

#include "random/script.h"
#include "support/library_view.h"

namespace script {

// Limits for tables, so that a step stays short.
const unsigned int kMaxTabulated = 7;
const unsigned int kMaxTabulatedInDebugMode = 3;
const unsigned int kMaxTableVariables = 30;

inline std::string TellTree(const std::vector<reference::FlatNode>& tree)
{
    std::string text;
    for (const reference::FlatNode& node : tree)
        text += std::to_string(node.type) + ":" + node.token + ":" + std::to_string(node.parent) +
                ":" + std::to_string(node.left) + ":" + std::to_string(node.right) + ":" +
                std::to_string(node.value) + " ";
    return text;
}

template <class Side>
class Player {
  public:
    Player()
    {
        Side::SetDebugMode(false);
        for (auto& object : m_objects)
            object.reset(new Equation);
    }
    ~Player() { Side::SetDebugMode(false); }
    Player(const Player&) = delete;
    Player& operator=(const Player&) = delete;

    std::string Play(const Step& step);
    // Makes an object a copy of a given one.
    void Take(size_t object, const typename Side::Equation& equation)
    {
        m_may_build[object] = false;
        Replace(object, new Equation(equation));
    }
    // What an object shows without being changed or printing anything.
    std::string Look(size_t object) const;

  private:
    typedef typename Side::Equation Equation;
    typedef typename Side::Handle Handle;
    typedef typename Side::TruthTable TruthTable;
    typedef typename Side::Text Text;

    const Text& Argument(const Step& step);
    bool IsTabulated(const Equation& equation) const;
    void Replace(size_t object, Equation* equation);
    std::string PlayLife(const Step& step);
    std::string PlayVariables(const Step& step);
    std::string PlayHandles(const Step& step);
    std::string PlayTexts(const Step& step);
    std::string PlayTables(const Step& step);
    std::string PlayByHand(const Step& step);
    std::string PlayQuestion(const Step& step);
    std::string PlayRendering(const Step& step);

    std::array<std::unique_ptr<Equation>, kNumObjects> m_objects;
    std::array<Handle, kNumHandles> m_handles;
    std::array<TruthTable, kNumTables> m_tables;
    // Objects whose tokens may be built: they are not shared and nothing has changed them.
    std::array<bool, kNumObjects> m_may_build{};
    Text m_argument;
    bool m_is_debug = false;
};

// The text that a step passes; a reference into the object itself when the step says so.
template <class Side>
const typename Player<Side>::Text& Player<Side>::Argument(const Step& step)
{
    const Equation& equation = *m_objects[step.object];
    if (step.source == Source::OwnName && equation.GetNumVariables() > 0)
        return equation.GetVariables()[step.value % equation.GetNumVariables()].first;
    const Text* token = step.source == Source::OwnRootToken ? Side::RootToken(equation) : nullptr;
    if (token)
        return *token;
    m_argument = Side::ToText(step.text);
    return m_argument;
}

template <class Side>
bool Player<Side>::IsTabulated(const Equation& equation) const
{
    const unsigned int numVariables = equation.GetNumVariables();
    return numVariables > kMaxTableVariables ||
           numVariables <= (m_is_debug ? kMaxTabulatedInDebugMode : kMaxTabulated);
}

template <class Side>
void Player<Side>::Replace(size_t object, Equation* equation)
{
    std::unique_ptr<Equation> former(equation);
    former.swap(m_objects[object]);
}

template <class Side>
std::string Player<Side>::Play(const Step& step)
{
    switch (step.op) {
    case Op::Create:
    case Op::CreateFromText:
    case Op::CreateCopy:
    case Op::Assign:
    case Op::Clear:
    case Op::Set:
    case Op::SetTerms:
    case Op::SetDebugMode:
        return PlayLife(step);
    case Op::Define:
    case Op::SetVariable:
    case Op::GetVariable:
        return PlayVariables(step);
    case Op::GetHandle:
    case Op::UseHandle:
    case Op::CompareHandles:
    case Op::DumpHandle:
        return PlayHandles(step);
    case Op::CompareObjects:
    case Op::Eval:
    case Op::Render:
    case Op::RenderInitValues:
    case Op::Dump:
    case Op::DumpRoot:
        return PlayTexts(step);
    case Op::BuildTable:
    case Op::CompareTables:
    case Op::ReadTable:
        return PlayTables(step);
    case Op::Tokenize:
    case Op::Build:
        return PlayByHand(step);
    case Op::Ask:
        return PlayQuestion(step);
    case Op::kCount:
        break;
    }
    return "";
}

template <class Side>
std::string Player<Side>::PlayLife(const Step& step)
{
    Equation& equation = *m_objects[step.object];
    const bool isCopy = step.op == Op::CreateCopy || step.op == Op::Assign;
    m_may_build[step.object] = false;
    m_may_build[step.other] = m_may_build[step.other] && !isCopy;
    switch (step.op) {
    case Op::Create:
        Replace(step.object, new Equation);
        return "";
    case Op::CreateFromText:
        Replace(step.object, Side::Construct(Argument(step)));
        return "";
    case Op::CreateCopy:
        Replace(step.object, new Equation(*m_objects[step.other]));
        return "";
    case Op::Assign:
        Side::Assign(equation, *m_objects[step.other], step.value);
        return "";
    case Op::Clear:
        equation.Clear();
        return "";
    case Op::Set:
        return std::to_string(equation.SetEquation(Argument(step)));
    case Op::SetTerms:
        return std::to_string(equation.SetEquationWithExplicitTerms(
            Side::ToTexts(step.terms), Argument(step), step.firstFlag, step.secondFlag));
    default:
        m_is_debug = step.firstFlag;
        Side::SetDebugMode(step.firstFlag);
        return "";
    }
}

template <class Side>
std::string Player<Side>::PlayVariables(const Step& step)
{
    Equation& equation = *m_objects[step.object];
    const Text& name = Argument(step);
    if (step.op == Op::Define)
        return std::to_string(equation.DefineVariable(name, step.value));
    if (step.op == Op::SetVariable)
        return std::to_string(equation.SetVariable(name, step.value));
    return std::to_string(equation.GetVariable(name)) +
           std::to_string(equation.IsVariableDefined(name));
}

template <class Side>
std::string Player<Side>::PlayHandles(const Step& step)
{
    Equation& equation = *m_objects[step.object];
    Handle& handle = m_handles[step.other % kNumHandles];
    const Handle& second = m_handles[step.value % kNumHandles];
    switch (step.op) {
    case Op::GetHandle:
        handle = equation.GetVariableHandle(Argument(step));
        break;
    case Op::UseHandle: {
        std::string text = std::to_string(equation.IsVariableDefined(handle));
        if (step.firstFlag)
            text += std::to_string(equation.SetVariable(handle, step.value));
        return text + std::to_string(equation.GetVariable(handle));
    }
    case Op::CompareHandles:
        return std::to_string(handle == second) + std::to_string(handle != second);
    default:
        handle.Dbg();
    }
    std::string text = std::to_string(handle.empty()) + std::to_string(handle.size());
    for (unsigned int value : handle)
        text += " " + std::to_string(value);
    return text;
}

template <class Side>
std::string Player<Side>::PlayTexts(const Step& step)
{
    const Equation& equation = *m_objects[step.object];
    const Equation& other = *m_objects[step.other];
    std::string text;
    switch (step.op) {
    case Op::CompareObjects:
        return std::to_string(equation == other) + std::to_string(equation != other);
    case Op::Eval:
        return std::to_string(equation.Eval());
    case Op::Render:
        for (bool spaces : {false, true})
            text += Side::ToStd(equation.GetEquation(spaces)) + "\n" +
                    Side::ToStd(equation.GetEquationAlt1(spaces)) + "\n" +
                    Side::ToStd(equation.GetEquationAlt2(spaces)) + "\n" +
                    Side::ToStd(equation.GetEquationAlt3(spaces)) + "\n" +
                    Side::ToStd(equation.GetEquationAsExpression(spaces)) + "\n";
        return text;
    case Op::RenderInitValues:
        if (IsTabulated(equation))
            text = Side::ToStd(equation.GetEquationAsHexInitValue(step.firstFlag)) +
                   Side::ToStd(equation.GetEquationAsBinaryInitValue());
        return text + Side::ToStd(equation.GetInitValueTermEquation());
    case Op::Dump:
        if (IsTabulated(equation))
            equation.Dbg();
        return "";
    default:
        Side::DumpRoot(equation);
        return "";
    }
}

template <class Side>
std::string Player<Side>::PlayTables(const Step& step)
{
    const Equation& equation = *m_objects[step.object];
    TruthTable& table = m_tables[step.other % kNumTables];
    const TruthTable& second = m_tables[step.value % kNumTables];
    if (step.op == Op::CompareTables)
        return std::to_string(table == second) + std::to_string(table != second);
    if (step.op == Op::BuildTable && IsTabulated(equation)) {
        if (step.value == 0)
            table = equation;
        else
            table = step.value == 1 ? equation.GetTruthTable() : TruthTable(equation);
    }
    std::string text = std::to_string(!table);
    for (const Text& name : table.GetVariableNames())
        text += " " + Side::ToStd(name);
    for (const auto& row : table.GetRows()) {
        text += " " + std::to_string(row.GetResultValue()) + ":";
        for (unsigned int value : row.GetVariableValues())
            text += std::to_string(value);
    }
    if (step.op == Op::ReadTable) {
        table.Dbg();
        const auto rows = table.GetRows();
        for (size_t row = 0; row < rows.size() && row < 3; ++row) {
            rows[row].Dbg();
            text += std::to_string(rows[row] == rows[0]) + std::to_string(rows[row] != rows[0]);
        }
    }
    return text;
}

template <class Side>
std::string Player<Side>::PlayByHand(const Step& step)
{
    Equation& equation = *m_objects[step.object];
    if (step.op == Op::Tokenize) {
        equation.Clear();
        Side::Tokenize(equation, step.text);
        if (step.firstFlag)
            Side::Tokenize(equation, "z"); // refused: it has a list already, or none was made
        m_may_build[step.object] = true;
    } else if (m_may_build[step.object]) {
        Side::Build(equation);
    }
    return "";
}

// One question at a time, so that everything the library defers is requested in every order.
template <class Side>
std::string Player<Side>::PlayQuestion(const Step& step)
{
    const Equation& equation = *m_objects[step.object];
    std::vector<unsigned int> values;
    switch (step.value % 16) {
    case 0:
        return std::to_string(!equation);
    case 1:
        return std::to_string(equation.IsExpression());
    case 2:
        return std::to_string(equation.IsHexInitValue());
    case 3:
        return std::to_string(equation.IsBinaryInitValue());
    case 4:
        return std::to_string(equation.Eval());
    case 5:
        return TellTree(Side::Tree(equation));
    case 6:
        return std::to_string(Side::IsSameTree(equation, *m_objects[step.other]));
    case 7: // the values of some variables, in reverse order
        for (size_t index = equation.GetNumVariables(); index-- > (step.firstFlag ? 1 : 0);)
            values.push_back(equation.GetVariables()[index].second + (step.secondFlag ? 2 : 0));
        return std::to_string(Side::EvalNodes(equation, values));
    case 8:
        return std::to_string(equation == *m_objects[step.other]);
    default:
        return PlayRendering(step);
    }
}

template <class Side>
std::string Player<Side>::PlayRendering(const Step& step)
{
    const Equation& equation = *m_objects[step.object];
    switch (step.value % 16) {
    case 9:
        return Side::ToStd(equation.GetEquation(step.firstFlag));
    case 10:
        return Side::ToStd(equation.GetEquationAlt1(step.firstFlag));
    case 11:
        return Side::ToStd(equation.GetEquationAlt2(step.firstFlag));
    case 12:
        return Side::ToStd(equation.GetEquationAlt3(step.firstFlag));
    case 13:
        return Side::ToStd(equation.GetEquationAsExpression(step.firstFlag));
    case 14:
        return IsTabulated(equation) ? Side::ToStd(equation.GetEquationAsBinaryInitValue()) : "";
    default:
        return IsTabulated(equation)
                   ? Side::ToStd(equation.GetEquationAsHexInitValue(step.firstFlag))
                   : "";
    }
}

template <class Side>
std::string Player<Side>::Look(size_t object) const
{
    const Equation& equation = *m_objects[object];
    std::string text = std::to_string(!equation) + std::to_string(equation.IsExpression()) +
                       std::to_string(equation.IsHexInitValue()) +
                       std::to_string(equation.IsBinaryInitValue()) + " ";
    for (const auto& variable : equation.GetVariables())
        text += Side::ToStd(variable.first) + "=" + std::to_string(variable.second) + " ";
    text += Side::ToStd(equation.GetEquation(true)) + " ";
    return text + TellTree(Side::Tree(equation));
}

} // namespace script

#endif
