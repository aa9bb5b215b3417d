// Threads that start together, and a sink to which several may report.
#ifndef THREADS_SUPPORT_H
#define THREADS_SUPPORT_H

#include <atomic>
#include <functional>
#include <string>
#include <thread>

#include <port/Port_MsgManData.h>

namespace threads {

constexpr size_t kNumThreads = 4;

// Runs work(0) to work(numThreads - 1), each in its own thread, all at the same time. Comparisons
// after the call need no lock, because the threads have ended.
void InThreads(size_t numThreads, const std::function<void(size_t thread)>& work);

// Takes all messages while it lives, instead of the previous sink. Its state is not protected,
// because the host lets in one message at a time.
class CountingSink {
  public:
    CountingSink();
    ~CountingSink();
    CountingSink(const CountingSink&) = delete;
    CountingSink& operator=(const CountingSink&) = delete;

    // Installs a new copy of the sink and removes the previous one.
    void Exchange();
    // Removes the sink, so that no thread is inside it any more.
    void Remove();

    // Requires: the sink was removed.
    size_t GetNumMessages() const { return m_numMessages; }
    size_t GetNumWrong() const { return m_numWrong; } // messages that were not whole or not alone

  private:
    Port_MsgManData::Sink MakeSink();
    void Receive(const char* id, const char* file, int line, const char* revision,
                 const char* text);

    size_t m_numMessages = 0;
    size_t m_numWrong = 0;
    size_t m_numInside = 0;
    std::string m_last;
    Port_MsgManData::Sink m_before; // must be last: from here on messages arrive
};

} // namespace threads

#endif
