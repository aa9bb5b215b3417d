// The tiny host library; its headers say how it differs.
#include <port/Port_Env.h>
#include <port/Port_Init.h>
#include <port/Port_MsgManData.h>
#include <port/mav_malloc.h>

#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <string>

namespace {

int s_numBlocks = 0;
int s_numServices = 0;
std::FILE* s_messages = nullptr;

} // namespace

void* mav_malloc(std::size_t size)
{
    ++s_numBlocks;
    return ::operator new(size);
}

void mav_free(void* memory)
{
    --s_numBlocks;
    ::operator delete(memory);
}

int tiny_live_blocks()
{
    return s_numBlocks;
}

const char* Port_Env::GetEnv(const char* name)
{
    return std::getenv((std::string("TINY_") + name).c_str());
}

Port_MsgManData& Port_MsgManData::createObject(const char* id, const char* file, int,
                                               const char* revision)
{
    static Port_MsgManData object;
    object.m_origin[0] = id;
    object.m_origin[1] = file;
    object.m_origin[2] = revision;
    return object;
}

void Port_MsgManData::issueStatus(const char* format, ...)
{
    if (!s_messages)
        std::abort();
    std::fprintf(s_messages, "[%s %s %s]", m_origin[0], m_origin[1], m_origin[2]);
    std::va_list arguments;
    va_start(arguments, format);
    std::vfprintf(s_messages, format, arguments);
    va_end(arguments);
    std::fflush(s_messages);
}

int tiny_services()
{
    return s_numServices;
}

Port::FileInit::FileInit()
{
    ++s_numServices;
}
Port::FileInit::~FileInit()
{
    --s_numServices;
}

Port::PathListInit::PathListInit()
{
    ++s_numServices;
}
Port::PathListInit::~PathListInit()
{
    --s_numServices;
}

Port_MsgManInit::Port_MsgManInit()
{
    ++s_numServices;
    const char* path = Port_Env::GetEnv("MESSAGES");
    s_messages = std::fopen(path ? path : "/dev/null", "w");
}
Port_MsgManInit::~Port_MsgManInit()
{
    --s_numServices;
    if (s_messages)
        std::fclose(s_messages);
    s_messages = nullptr;
}

InstanceTableInit::InstanceTableInit()
{
    ++s_numServices;
}
InstanceTableInit::~InstanceTableInit()
{
    --s_numServices;
}

FactoryInit::FactoryInit()
{
    ++s_numServices;
}
FactoryInit::~FactoryInit()
{
    --s_numServices;
}
