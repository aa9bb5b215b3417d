#include "diagnostics.h"

#include <Kq_BoolEquationImp.h>

Diagnostics::Diagnostics(size_t maxLines)
    : m_max_lines(maxLines),
      m_before(Port_MsgManData::setSink(
          [this](const char*, const char*, int, const char*, const char* text) { Add(text); }))
{
}

Diagnostics::~Diagnostics()
{
    // No exception may leave a destructor; if memory runs out here, the previous sink is lost.
    try {
        Port_MsgManData::setSink(m_before);
    } catch (const std::bad_alloc&) {
        Port_MsgManData::setSink(nullptr); // the default, which needs no memory
    }
}

void Diagnostics::Add(const char* text)
{
    m_begun += text;
    for (size_t end; (end = m_begun.find('\n')) != std::string::npos;) {
        if (m_lines.size() == m_max_lines)
            throw TooMany("more than " + std::to_string(m_max_lines) + " lines");
        m_lines.push_back(m_begun.substr(0, end));
        m_begun.erase(0, end + 1);
    }
}

DebugMode::DebugMode() : m_before(Kq_BoolEquationImp::GetInternalDebugMode())
{
    Kq_BoolEquationImp::SetInternalDebugMode(true);
}

DebugMode::~DebugMode()
{
    Kq_BoolEquationImp::SetInternalDebugMode(m_before);
}
