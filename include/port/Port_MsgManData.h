// The host tool chain's message manager: one object per report, one printf-style text per call.
#ifndef PORT_MSGMANDATA_H
#define PORT_MSGMANDATA_H

#include <functional>

// Lets the compiler compare a format with the arguments behind it; positions count from 2 in a
// member, as the object is number 1.
#if defined(__GNUC__)
#define PORT_PRINTF(formatIndex, firstIndex)                                                       \
    __attribute__((__format__(__printf__, formatIndex, firstIndex)))
#else
#define PORT_PRINTF(formatIndex, firstIndex)
#endif

class Port_MsgManData { // one report: where it comes from, and its text
  public:
    // Where texts go: message id, source path, source line, revision text, the formatted text.
    // All pointers are valid during the call only; the text has no line end but its own.
    typedef std::function<void(const char* id, const char* file, int line, const char* revision,
                               const char* text)>
        Sink;

    // Installs 'sink' for all later messages and returns the one before. An empty sink stands for
    // the default, which writes each text as it comes to standard error. What the sink throws
    // reaches whoever issued the message.
    static Sink setSink(Sink sink);

    // The message object for the next report. It is one object per process, valid until unload;
    // the four values are copied pointers, so they must outlive the issueStatus call.
    static Port_MsgManData& createObject(const char* id, const char* file, int line,
                                         const char* revision);

    // Formats as printf does and hands the text, whole at any length, to the sink.
    // Fails: std::bad_alloc; a text that cannot be formatted is not issued.
    void issueStatus(const char* format, ...) PORT_PRINTF(2, 3);

  private:
    const char* m_id = "";
    const char* m_file = "";
    int m_line = 0;
    const char* m_revision = "";
};

#endif
