// Threads that start together, and a sink that several may report to.
#ifndef THREADS_SUPPORT_H
#define THREADS_SUPPORT_H

#include <atomic>
#include <functional>
#include <string>
#include <thread>

#include <port/Port_MsgManData.h>

namespace threads {

constexpr size_t kNumThreads = 4;

// Runs work(0) to work(numThreads - 1), each in a thread of its own, all at the same time.
// What is compared after it needs no lock: the threads have ended.
void InThreads(size_t numThreads, const std::function<void(size_t thread)>& work);

// Takes all messages while it lives, in place of the sink before.
// Nothing in here is protected: the host lets in one message at a time.
class CountingSink {
  public:
    CountingSink();
    ~CountingSink();
    CountingSink(const CountingSink&) = delete;
    CountingSink& operator=(const CountingSink&) = delete;

    // Installs it once more, as a copy of its own, and takes away the one before.
    void Exchange();
    // Takes it away, so that no thread is in it any more.
    void Remove();

    // To be asked when it was taken away.
    size_t GetNumMessages() const { return m_numMessages; }
    size_t GetNumWrong() const { return m_numWrong; } // not whole, or not alone

  private:
    Port_MsgManData::Sink MakeSink();
    void Receive(const char* id, const char* file, int line, const char* revision,
                 const char* text);

    size_t m_numMessages = 0;
    size_t m_numWrong = 0;
    size_t m_numInside = 0;
    std::string m_last;
    Port_MsgManData::Sink m_before; // last: messages come from here on
};

} // namespace threads

#endif
