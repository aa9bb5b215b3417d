// The host tool chain's message manager: one object per report, one printf-style text per call.
#ifndef PORT_MSGMANDATA_H
#define PORT_MSGMANDATA_H

#include <functional>

// Lets the compiler compare a format with the arguments after it. In a member, positions count from
// 2, because the object is number 1.
#if defined(__GNUC__)
#define PORT_PRINTF(formatIndex, firstIndex)                                                       \
    __attribute__((__format__(__printf__, formatIndex, firstIndex)))
#else
#define PORT_PRINTF(formatIndex, firstIndex)
#endif

// One report: where it comes from, and its text.
// Threads: any may report, and exchange the sink, at any time. Texts arrive whole and one at a
// time, so a sink needs no lock against other reports. While it runs, other threads that report or
// exchange the sink wait. Its own thread does not: the sink may use code that reports, issue
// messages (which reach it before the current one is done), exchange the sink and throw. It must
// not wait for a thread that may report.
class Port_MsgManData {
  public:
    // Where texts go: message id, source path, source line, revision text, the formatted text.
    // All pointers are valid during the call only; no line end is added to the text.
    typedef std::function<void(const char* id, const char* file, int line, const char* revision,
                               const char* text)>
        Sink;

    // Installs 'sink' for all later messages and returns the previous one. An empty sink stands for
    // the default, which writes each text unchanged to standard error. What the sink throws reaches
    // the code that issued the message. Once this returns, the former sink runs in no other thread,
    // so what it refers to may go; the sink itself is destroyed when no report is under way.
    static Sink setSink(Sink sink);

    // The message object for the calling thread's next report. Each thread has one object, valid
    // until the thread ends or the library is unloaded, and only for that thread. The four values
    // are copied pointers, so they must outlive the issueStatus call.
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
