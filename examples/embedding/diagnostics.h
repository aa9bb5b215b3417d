// The library's messages, collected for the program's own log, and debug mode for a while.
#ifndef EMBEDDING_DIAGNOSTICS_H
#define EMBEDDING_DIAGNOSTICS_H

#include <stdexcept>
#include <string>
#include <vector>

#include <port/Port_MsgManData.h>

// While it exists, collects what the library says; after that the previous sink is back, whatever
// happened. The library's messages are pieces of lines, so a line is complete when its line end has
// arrived.
class Diagnostics {
  public:
    // Thrown by the sink at the first line beyond 'maxLines'. It comes out of the library's member
    // that was running; every object stays safe to use. An Eval that is cut short has changed
    // nothing and can be repeated. A SetEquation that is cut short has set nothing, and nobody
    // knows whether the text would have been refused; so the limit is not used there.
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

// Debug mode is one switch for the whole process: it is on while this exists, then as before.
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
