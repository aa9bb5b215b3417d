// Silences the library's messages. The library sends a dump of the node that broke a tree to the
// host's message manager; callers that explain a refusal have a better text.
#ifndef BOOLEQ_BASE_MESSAGES_H
#define BOOLEQ_BASE_MESSAGES_H

#include <cassert>
#include <cstddef>
#include <cstdio>
#include <mutex>
#include <type_traits>
#include <utility>

#include <port/Port_MsgManData.h>

namespace booleq {

// Drops the messages of this thread for as long as the object lives; those of other threads go out
// as before. If the host's message manager cannot be redirected, nothing changes.
// Threads: any number of them may be silent, each for as long as it likes.
template <class Manager, class = void>
class Silence {
};

template <class Manager>
class Silence<Manager, std::void_t<decltype(Manager::setSink(typename Manager::Sink()))>> {
  public:
    Silence()
    {
        Shared& shared = GetShared();
        const std::lock_guard<std::mutex> guard(shared.mutex);
        if (shared.numSilences == 0)
            shared.former = Manager::setSink(&Pass);
        ++shared.numSilences;
        ++Depth();
    }
    ~Silence()
    {
        typename Manager::Sink mine; // destroyed after the mutex is released
        Shared& shared = GetShared();
        const std::lock_guard<std::mutex> guard(shared.mutex);
        assert(shared.numSilences > 0 && Depth() > 0);
        --Depth();
        if (--shared.numSilences == 0)
            mine = Manager::setSink(std::exchange(shared.former, nullptr));
    }
    Silence(const Silence&) = delete;
    Silence& operator=(const Silence&) = delete;

  private:
    // Invariant: our sink is installed while numSilences > 0; 'former' is the sink that it
    // replaced.
    struct Shared {
        std::mutex mutex;
        size_t numSilences = 0;
        typename Manager::Sink former;
    };
    static Shared& GetShared()
    {
        static Shared shared;
        return shared;
    }
    static size_t& Depth()
    {
        static thread_local size_t depth = 0;
        return depth;
    }
    static void Pass(const char* id, const char* file, int line, const char* revision,
                     const char* text)
    {
        if (Depth() > 0)
            return;
        typename Manager::Sink former;
        {
            Shared& shared = GetShared();
            const std::lock_guard<std::mutex> guard(shared.mutex);
            former = shared.former;
        }
        if (former)
            former(id, file, line, revision, text);
        else
            std::fputs(text, stderr);
    }
};

typedef Silence<Port_MsgManData> NoMessages;

} // namespace booleq

#endif
