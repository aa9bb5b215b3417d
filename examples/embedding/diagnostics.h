// The library's messages, collected for the program's own log; the debug mode for a while.
#ifndef EMBEDDING_DIAGNOSTICS_H
#define EMBEDDING_DIAGNOSTICS_H

#include <stdexcept>
#include <string>
#include <vector>

#include <port/Port_MsgManData.h>

// Collects what the library says while it lives; then the sink before is back, whatever happened.
// The library's messages are pieces of lines, so a line is whole when its line end has come.
class Diagnostics {
  public:
    // What the sink throws at one line more than 'maxLines'. It comes out of the library's member
    // that was at work; every object stays safe to use. An Eval that is cut has changed nothing
    // and can be repeated. A SetEquation that is cut has not set anything, and no one knows whether
    // the text would have been refused; so there the limit is not used.
    struct TooMany : std::runtime_error {
        using std::runtime_error::runtime_error;
    };

    explicit Diagnostics(size_t maxLines);
    ~Diagnostics();
    Diagnostics(const Diagnostics&) = delete;
    Diagnostics& operator=(const Diagnostics&) = delete;

    const std::vector<std::string>& GetLines() const { return m_lines; }

  private:
    void Add(const char* text);

    size_t m_max_lines;
    std::string m_begun;
    std::vector<std::string> m_lines;
    Port_MsgManData::Sink m_before;
};

// The debug mode is one switch for the whole process: on while this lives, then as before.
class DebugMode {
  public:
    DebugMode();
    ~DebugMode();
    DebugMode(const DebugMode&) = delete;
    DebugMode& operator=(const DebugMode&) = delete;

  private:
    bool m_before;
};

#endif
