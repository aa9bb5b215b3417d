#include "lines.h"

#include <cerrno>
#include <cstring>

#include <sys/stat.h>
#ifdef _WIN32
#include <io.h>
#else
#include <unistd.h>
#endif

#include "output.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kBufferBytes = 65536;

// Reads what is available, at least one byte; fread would wait until the buffer is full.
// Fails: 0 at the end; -1.
long ReadSome(int file, std::vector<char>& buffer)
{
#ifdef _WIN32
    return _read(file, buffer.data(), static_cast<unsigned int>(buffer.size()));
#else
    ssize_t length;
    do
        length = read(file, buffer.data(), buffer.size());
    while (length < 0 && errno == EINTR);
    return length;
#endif
}

} // namespace

void DropByteOrderMark(std::string& line)
{
    if (line.compare(0, 3, "\xef\xbb\xbf") == 0)
        line.erase(0, 3);
}

void DropCarriageReturn(std::string& line)
{
    if (!line.empty() && line.back() == '\r')
        line.pop_back();
}

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
    m_end = 0;
    const long length = ReadSome(fileno(m_stream), m_buffer);
    if (length < 0)
        throw IoError("cannot read " + m_name, errno);
    m_end = static_cast<size_t>(length);
    m_num_read += m_end;
    return m_end > 0;
}

} // namespace booleq
