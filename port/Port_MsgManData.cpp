// Messages of the default host: each text is formatted whole and goes to the installed sink, or to
// standard error. Nothing here is ever destroyed, so that static objects of other libraries may
// report from their constructors and destructors.
#include <port/Port_MsgManData.h>

#include <cstdarg>
#include <cstdio>
#include <memory>
#include <new>
#include <utility>
#include <vector>

namespace {

typedef std::shared_ptr<const Port_MsgManData::Sink> SharedSink;

// The installed sink, null for the default.
// Shared, so that a sink stays alive while it runs, even when it installs another one.
SharedSink& CurrentSink()
{
    alignas(SharedSink) static unsigned char storage[sizeof(SharedSink)];
    static SharedSink* const sink = new (storage) SharedSink();
    return *sink;
}

} // namespace

Port_MsgManData::Sink Port_MsgManData::setSink(Sink sink)
{
    SharedSink& current = CurrentSink();
    SharedSink next = sink ? std::make_shared<const Sink>(std::move(sink)) : SharedSink();
    Sink previous = current ? *current : Sink();
    current.swap(next); // from here on nothing throws
    return previous;
}

Port_MsgManData& Port_MsgManData::createObject(const char* id, const char* file, int line,
                                               const char* revision)
{
    static Port_MsgManData object;
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

    const SharedSink sink = CurrentSink();
    if (sink)
        (*sink)(m_id, m_file, m_line, m_revision, text);
    else
        std::fputs(text, stderr);
}
