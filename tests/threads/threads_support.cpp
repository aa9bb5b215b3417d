#include "threads/threads_support.h"

#include <cstring>

namespace threads {

void InThreads(size_t numThreads, const std::function<void(size_t thread)>& work)
{
    std::atomic<size_t> numReady{0};
    std::vector<std::thread> running;
    for (size_t thread = 0; thread < numThreads; ++thread) {
        running.emplace_back([&work, &numReady, numThreads, thread] {
            for (++numReady; numReady < numThreads;)
                std::this_thread::yield();
            work(thread);
        });
    }
    for (std::thread& thread : running)
        thread.join();
}

// In a single exchange, so that no message of another thread is lost.
CountingSink::CountingSink() : m_before(Port_MsgManData::setSink(MakeSink())) {}

CountingSink::~CountingSink()
{
    Remove();
}

Port_MsgManData::Sink CountingSink::MakeSink()
{
    return [this](const char* id, const char* file, int line, const char* revision,
                  const char* text) { Receive(id, file, line, revision, text); };
}

void CountingSink::Exchange()
{
    Port_MsgManData::setSink(MakeSink());
}

void CountingSink::Remove()
{
    Port_MsgManData::setSink(m_before);
}

void CountingSink::Receive(const char* id, const char* file, int line, const char* revision,
                           const char* text)
{
    const bool isAlone = ++m_numInside == 1;
    ++m_numMessages;
    // The parts of the origin must belong together; a text that another one overwrote would change
    // between two readings.
    m_last = text;
    const bool isNode = std::strstr(file, "ImpNode.cpp") != nullptr;
    const bool isEngine = std::strstr(file, "Imp.cpp") != nullptr;
    const char* const expected = isEngine ? "$Revision: 1.35 $" : "$Revision: 1.10 $";
    const bool isWhole = std::strcmp(id, "Kq") == 0 && line > 0 &&
                         (isNode || isEngine || std::strstr(file, "/Kq_BoolEquation.cpp")) &&
                         std::strcmp(revision, expected) == 0 && m_last == text;
    m_numWrong += !isAlone || !isWhole;
    --m_numInside;
}

} // namespace threads
