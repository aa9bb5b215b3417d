// Helpers that unit tests share: trees as text, strings for comparison, messages as one text.
#ifndef UNIT_SUPPORT_H
#define UNIT_SUPPORT_H

#include <string>
#include <vector>

#include <Kq_BoolEquation.h>
#include <Kq_BoolEquationImp.h>
#include <Kq_BoolEquationImpNode.h>
#include <port/Port_MsgManData.h>

typedef Kq_BoolEquationImp Engine;
typedef Kq_BoolEquationImp::Node Node;
typedef Port::StringBase<char> String;

inline std::string Std(const String& text)
{
    return std::string(text.c_str(), text.length());
}

// A string with NUL bytes in it.
inline String FromBytes(const std::string& bytes)
{
    String text;
    for (const char byte : bytes)
        text += byte;
    return text;
}

// Collects messages while it lives.
class Messages {
  public:
    Messages()
        : m_before(Port_MsgManData::setSink([this](const char* id, const char* file, int line,
                                                   const char* revision, const char* text) {
              m_text += text;
              m_origins.push_back(std::string(id) + ' ' + file + ' ' + revision);
              m_lines.push_back(line);
          }))
    {
    }
    ~Messages() { Port_MsgManData::setSink(m_before); }
    Messages(const Messages&) = delete;
    Messages& operator=(const Messages&) = delete;

    const std::string& Text() const { return m_text; }
    // "id file revision" of each message.
    const std::vector<std::string>& Origins() const { return m_origins; }
    const std::vector<int>& Lines() const { return m_lines; }

  private:
    std::string m_text;
    std::vector<std::string> m_origins;
    std::vector<int> m_lines;
    Port_MsgManData::Sink m_before;
};

// Debug mode on while it lives.
class DebugMode {
  public:
    DebugMode() { Engine::SetInternalDebugMode(true); }
    ~DebugMode() { Engine::SetInternalDebugMode(false); }
    DebugMode(const DebugMode&) = delete;
    DebugMode& operator=(const DebugMode&) = delete;
};

// A tree as TYPE(left, right), with names and constants as they are and a group as LP(content).
inline std::string TreeText(const Node* node)
{
    if (!node)
        return "-";
    if (node->IsId() || node->IsConst())
        return Std(node->GetToken());
    if (node->IsLp())
        return "LP(" + TreeText(node->GetLeftChild()) + ")";
    std::string text = Std(node->GetTypeName()) + "(" + TreeText(node->GetLeftChild());
    if (node->GetRightChild())
        text += ", " + TreeText(node->GetRightChild());
    return text + ")";
}

// The tree that a text sets, or "refused"; dumps of the refusal are discarded.
inline std::string TreeOf(const String& equation)
{
    const Messages messages;
    Engine engine;
    if (engine.SetEquation(equation))
        return TreeText(engine.GetRoot());
    return !engine && engine.GetNumVariables() == 0 ? "refused" : "refused but not cleared";
}

// The names of the variables, each followed by its value: "A0 B1".
template <class Equation>
std::string VariablesOf(const Equation& equation)
{
    std::string text;
    for (const auto& variable : equation.GetVariables())
        text += (text.empty() ? "" : " ") + Std(variable.first) + std::to_string(variable.second);
    return text;
}

#endif
