#include "lines.h"

#include <cerrno>
#include <cstring>

#include <sys/stat.h>

#include "output.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kBufferBytes = 65536;

} // namespace

LineReader::LineReader(const std::string& path)
    : m_name(path == "-" ? "standard input" : Visible(path)),
      m_stream(path == "-" ? stdin : std::fopen(path.c_str(), "rb")), m_buffer(kBufferBytes)
{
    if (!m_stream)
        throw IoError("cannot open " + m_name, errno);
    struct stat status;
    if (fstat(fileno(m_stream), &status) == 0 && S_ISREG(status.st_mode))
        m_size = static_cast<uint64_t>(status.st_size);
}

LineReader::~LineReader()
{
    if (m_stream != stdin)
        std::fclose(m_stream);
}

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
        throw IoError("cannot read " + m_name, errno);
    m_num_read += m_end;
    return m_end > 0;
}

} // namespace booleq
