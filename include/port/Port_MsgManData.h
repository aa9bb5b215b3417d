// The host tool chain's message manager: one object per report, one printf-style text per call.
#ifndef PORT_MSGMANDATA_H
#define PORT_MSGMANDATA_H

#include <functional>

// Lets the compiler compare a format with the arguments after it; positions count from 2 in a
// member, as the object is number 1.
#if defined(__GNUC__)
#define PORT_PRINTF(formatIndex, firstIndex)                                                       \
    __attribute__((__format__(__printf__, formatIndex, firstIndex)))
#else
#define PORT_PRINTF(formatIndex, firstIndex)
#endif

// One report: where it comes from, and its text.
// Threads: any may report, and exchange the sink, at any time. Texts arrive whole and one at a
// time: a sink needs no lock of its own against other reports. While it runs, other threads that
// report or exchange the sink wait; its own thread does not, so that it may use whatever reports,
// issue messages, which reach it before the one at hand is done, exchange the sink and throw. It
// must not wait for a thread that may report.
class Port_MsgManData {
  public:
    // Where texts go: message id, source path, source line, revision text, the formatted text.
    // All pointers are valid during the call only; the text has no line end but its own.
    typedef std::function<void(const char* id, const char* file, int line, const char* revision,
                               const char* text)>
        Sink;

    // Installs 'sink' for all later messages and returns the one before. An empty sink stands for
    // the default, which writes each text as it comes to standard error. What the sink throws
    // reaches whoever issued the message. The former sink runs in no other thread once this
    // returns, so what it refers to may go; itself it is destroyed when no report is under way.
    static Sink setSink(Sink sink);

    // The message object for the calling thread's next report. It is one object for each thread,
    // valid until the thread ends or the library is unloaded, and only for that thread; the four
    // values are copied pointers, so they must outlive the issueStatus call.
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
