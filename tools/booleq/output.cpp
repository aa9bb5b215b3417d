#include "output.h"

#include <cerrno>
#include <cstring>
#include <utility>

namespace booleq {

namespace {

constexpr size_t kBlockBytes = 65536;

} // namespace

IoError::IoError(const std::string& what, int errorNumber)
    : std::runtime_error(what + ": " + std::strerror(errorNumber))
{
}

Output::Output(std::FILE* stream, std::string name) : m_stream(stream), m_name(std::move(name)) {}

void Output::Fail() const
{
    if (errno == EPIPE)
        throw ReaderGone(errno);
    throw IoError("cannot write " + m_name, errno);
}

void Output::Put(const std::string& text)
{
    Put(text.data(), text.size());
}

void Output::Put(const char* text, size_t length)
{
    if (m_block.size() + length >= kBlockBytes)
        WriteBlock();
    if (length >= kBlockBytes)
        Write(text, length);
    else
        m_block.append(text, length);
}

void Output::Flush()
{
    WriteBlock();
    if (std::fflush(m_stream) != 0)
        Fail();
}

void Output::WriteBlock()
{
    const std::string block = std::move(m_block);
    m_block.clear(); // even when writing fails: it is not tried again
    Write(block.data(), block.size());
}

void Output::Write(const char* text, size_t length)
{
    if (std::fwrite(text, 1, length, m_stream) != length)
        Fail();
}

void Complain(Output& output, const std::string& message)
{
    output.Flush();
    std::fprintf(stderr, "booleq: %s\n", message.c_str());
}

} // namespace booleq
