// The library seen in the reference model's terms: captured messages, strings, flat trees.
#ifndef SUPPORT_LIBRARY_VIEW_H
#define SUPPORT_LIBRARY_VIEW_H

#include <string>
#include <vector>

#include <Kq_BoolEquationImpNode.h>
#include <port/Port_MsgManData.h>

#include "reference/equation.h"
#include "reference/message.h"

namespace support {

struct Captured {
    std::string id;
    std::string file;
    int line;
    std::string revision;
    std::string text;
};

// Records every message while it lives, then restores the former sink.
class Capture {
  public:
    Capture();
    ~Capture();
    Capture(const Capture&) = delete;
    Capture& operator=(const Capture&) = delete;

    std::vector<Captured> messages;

  private:
    Port_MsgManData::Sink m_former;
};

// Sets the debug mode of library and model while it lives, whatever happens.
class DebugMode {
  public:
    DebugMode();
    ~DebugMode();
    DebugMode(const DebugMode&) = delete;
    DebugMode& operator=(const DebugMode&) = delete;
};

Port::StringBase<char> ToPort(const std::string& text);
std::string ToStd(const Port::StringBase<char>& text);
std::vector<Port::StringBase<char>> ToPort(const std::vector<std::string>& texts);

// A printable form of a text: bytes outside ASCII and NUL as \xNN.
std::string Printable(const std::string& text);

// The tree below 'root' as reference::Flatten gives it for the model.
std::vector<reference::FlatNode> Flatten(const Kq_BoolEquationImp::Node* root);

// The first difference, or "" if there is none. A model line kAnyLine matches any line above 0, and
// messages that the model marks as free match any messages of the node module's dump.
std::string CompareMessages(const std::vector<reference::Message>& expected,
                            const std::vector<Captured>& actual);
std::string CompareTrees(const std::vector<reference::FlatNode>& expected,
                         const std::vector<reference::FlatNode>& actual);

} // namespace support

#endif
