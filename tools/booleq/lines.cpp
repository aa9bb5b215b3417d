#include "lines.h"

#include <cerrno>
#include <cstring>

#include "output.h"

namespace booleq {

namespace {

constexpr size_t kBufferBytes = 65536;

} // namespace

LineReader::LineReader(std::FILE* stream) : m_stream(stream), m_buffer(kBufferBytes) {}

bool LineReader::Next(std::string& line)
{
    line.clear();
    bool found = false;
    while (m_position < m_end || Fill()) {
        found = true;
        const char* start = m_buffer.data() + m_position;
        const size_t available = m_end - m_position;
        const void* lineFeed = std::memchr(start, '\n', available);
        if (lineFeed) {
            const size_t length = static_cast<size_t>(static_cast<const char*>(lineFeed) - start);
            line.append(start, length);
            m_position += length + 1;
            return true;
        }
        line.append(start, available);
        m_position = m_end;
    }
    return found;
}

bool LineReader::Fill()
{
    m_position = 0;
    m_end = std::fread(m_buffer.data(), 1, m_buffer.size(), m_stream);
    if (m_end == 0 && std::ferror(m_stream))
        throw IoError("cannot read standard input", errno);
    return m_end > 0;
}

} // namespace booleq
