// Messages of the default host: each text is formatted whole and goes to the installed sink, or to
// standard error, one at a time. Nothing here is ever destroyed, so that static objects of other
// libraries may report from their constructors and destructors.
// Fails: std::bad_alloc, and what a sink throws; both leave the lock free.
#include <port/Port_MsgManData.h>

#include <cassert>
#include <cstdarg>
#include <cstdio>
#include <memory>
#include <mutex>
#include <new>
#include <type_traits>
#include <utility>
#include <vector>

namespace {

struct Installed {
    Port_MsgManData::Sink sink;
    Installed* next; // in the list of those replaced
};

// What threads share.
// Invariants: 1. Everything is read and changed only by the thread that has the lock.
// 2. 'depth' is how many times that thread has it: a sink may issue messages and exchange the sink.
// 3. A sink that was replaced lives until the thread that has the lock gives it up.
struct Host {
    std::recursive_mutex lock;
    size_t depth = 0;
    Installed* current = nullptr;  // owned; null for the default
    Installed* replaced = nullptr; // owned
};

Host& GetHost()
{
    alignas(Host) static unsigned char storage[sizeof(Host)];
    static Host* const host = new (storage) Host();
    return *host;
}

// Holds the lock while it exists. The last one to give it up frees the sinks that were replaced,
// after unlocking, because what a sink has captured may do anything when it is destroyed.
class Turn {
  public:
    explicit Turn(Host& host) : m_host(host)
    {
        m_host.lock.lock();
        ++m_host.depth;
    }
    ~Turn()
    {
        assert(m_host.depth > 0);
        Installed* replaced = nullptr;
        if (--m_host.depth == 0)
            replaced = std::exchange(m_host.replaced, nullptr);
        m_host.lock.unlock();
        while (replaced)
            delete std::exchange(replaced, replaced->next);
    }
    Turn(const Turn&) = delete;
    Turn& operator=(const Turn&) = delete;

  private:
    Host& m_host;
};

} // namespace

Port_MsgManData::Sink Port_MsgManData::setSink(Sink sink)
{
    std::unique_ptr<Installed> next(sink ? new Installed{std::move(sink), nullptr} : nullptr);
    Sink previous;
    Host& host = GetHost();
    const Turn turn(host);
    if (Installed* former = host.current) {
        previous = former->sink; // not moved: it may be running; from here on nothing throws
        former->next = host.replaced;
        host.replaced = former;
    }
    host.current = next.release();
    return previous;
}

// Deliberate: plain data without a destructor for each thread. Nothing has to run at the end of a
// thread, which may come after this library is unloaded.
Port_MsgManData& Port_MsgManData::createObject(const char* id, const char* file, int line,
                                               const char* revision)
{
    static_assert(std::is_trivially_destructible<Port_MsgManData>::value, "nothing to run");
    static thread_local Port_MsgManData object;
    object.m_id = id ? id : "";
    object.m_file = file ? file : "";
    object.m_line = line;
    object.m_revision = revision ? revision : "";
    return object;
}

void Port_MsgManData::issueStatus(const char* format, ...)
{
    if (!format)
        return;

    char shortText[512];
    std::va_list arguments;
    va_start(arguments, format);
    const int length = std::vsnprintf(shortText, sizeof shortText, format, arguments);
    va_end(arguments);
    if (length < 0)
        return;

    const char* text = shortText;
    std::vector<char> longText;
    if (static_cast<std::size_t>(length) >= sizeof shortText) {
        longText.resize(static_cast<std::size_t>(length) + 1);
        va_start(arguments, format);
        std::vsnprintf(longText.data(), longText.size(), format, arguments);
        va_end(arguments);
        text = longText.data();
    }

    Host& host = GetHost();
    const Turn turn(host);
    if (const Installed* const installed = host.current)
        installed->sink(m_id, m_file, m_line, m_revision, text);
    else
        std::fputs(text, stderr);
}
