#include "source_text.h"

#include <algorithm>
#include <cassert>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <new>

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <zlib.h>

#include "read_fault.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr size_t kFirstBytes = size_t(1) << 16;
constexpr size_t kLargePage = size_t(1) << 21;
constexpr size_t kReadBytes = size_t(1) << 24;
constexpr char kTooLarge[] = "the text is larger than 4,294,967,000 bytes";

std::string SystemReason()
{
    return std::strerror(errno);
}

// In large pages, where the system has them: filling small ones takes as long as reading the file.
void* AllocateLarge(size_t numBytes)
{
    void* block = nullptr;
    if (posix_memalign(&block, kLargePage, numBytes) != 0)
        return nullptr;
    madvise(block, numBytes, MADV_HUGEPAGE); // a hint
    return block;
}

class Descriptor {
  public:
    explicit Descriptor(int descriptor) : m_descriptor(descriptor) {}
    ~Descriptor()
    {
        if (m_descriptor >= 0)
            close(m_descriptor);
    }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;
    int Get() const { return m_descriptor; }

  private:
    int m_descriptor;
};

// A stream of zlib that is ended.
class Inflater {
  public:
    Inflater()
    {
        std::memset(&m_stream, 0, sizeof m_stream);
        if (inflateInit2(&m_stream, 15 + 16) != Z_OK) // gzip's header
            throw std::bad_alloc();
    }
    ~Inflater() { inflateEnd(&m_stream); }
    Inflater(const Inflater&) = delete;
    Inflater& operator=(const Inflater&) = delete;
    z_stream& Stream() { return m_stream; }

  private:
    z_stream m_stream;
};

} // namespace

SourceText::~SourceText()
{
    std::free(m_bytes);
}

void SourceText::Release()
{
    std::free(m_bytes);
    m_bytes = nullptr;
    m_size = m_capacity = 0;
}

// Large blocks move without being copied, and pages that nobody has written take no memory.
void SourceText::Reserve(size_t numBytes)
{
    if (numBytes > kMaxSourceBytes + kPadding)
        throw ReadFault{kTooLarge};
    if (numBytes <= m_capacity)
        return;
    auto* bytes = static_cast<char*>(m_bytes == nullptr && numBytes >= kLargePage
                                         ? AllocateLarge(numBytes)
                                         : std::realloc(m_bytes, numBytes));
    if (bytes == nullptr)
        throw std::bad_alloc();
    m_bytes = bytes;
    m_capacity = numBytes;
}

void SourceText::Finish()
{
    Reserve(m_size + kPadding);
    std::memset(m_bytes + m_size, 0, kPadding);
    const auto* head = reinterpret_cast<const unsigned char*>(m_bytes);
    if (m_size >= 2 && head[0] == 0x1f && head[1] == 0x8b)
        Inflate();
    if (std::memcmp(m_bytes, "\xef\xbb\xbf", 3) == 0) { // the mark of UTF-8; the padding moves, too
        m_size -= 3;
        std::memmove(m_bytes, m_bytes + 3, m_size + kPadding);
    }
    assert(m_bytes[m_size] == 0);
}

void SourceText::ReadFile(const std::string& file)
{
    if (file == "-") {
        ReadStream(STDIN_FILENO);
        return;
    }
    const Descriptor descriptor(open(file.c_str(), O_RDONLY | O_CLOEXEC));
    if (descriptor.Get() < 0)
        throw ReadFault{"cannot open it: " + SystemReason()};
    struct stat status;
    if (fstat(descriptor.Get(), &status) != 0)
        throw ReadFault{"cannot read it: " + SystemReason()};
    if (S_ISDIR(status.st_mode))
        throw ReadFault{"it is a directory"};
    if (S_ISREG(status.st_mode)) {
        if (static_cast<uint64_t>(status.st_size) > kMaxSourceBytes)
            throw ReadFault{kTooLarge};
        Reserve(static_cast<size_t>(status.st_size) + kPadding + 1);
    }
    ReadStream(descriptor.Get());
}

void SourceText::ReadStream(int descriptor)
{
    for (;;) {
        Watch();
        if (m_capacity < m_size + kPadding + 1)
            Reserve(std::max(kFirstBytes,
                             static_cast<size_t>(std::min<uint64_t>(
                                 m_size + m_size / 2 + kPadding + 1, kMaxSourceBytes + kPadding))));
        if (m_capacity < m_size + kPadding + 1)
            throw ReadFault{kTooLarge};
        const size_t room = std::min(m_capacity - m_size - kPadding, kReadBytes);
        const ssize_t numRead = read(descriptor, m_bytes + m_size, room);
        if (numRead < 0 && errno == EINTR)
            continue;
        if (numRead < 0)
            throw ReadFault{"cannot read it: " + SystemReason()};
        if (numRead == 0)
            break;
        m_size += static_cast<size_t>(numRead);
    }
    Finish();
}

void SourceText::Copy(std::string_view text)
{
    Reserve(text.size() + kPadding);
    if (!text.empty())
        std::memcpy(m_bytes, text.data(), text.size());
    m_size = text.size();
    Finish();
}

// One member after another, as gzip files may have them; the length that the file announces is not
// believed.
void SourceText::Inflate()
{
    SourceText plain;
    Inflater inflater;
    z_stream& stream = inflater.Stream();
    size_t numTaken = 0;
    int status = Z_OK;
    while (status != Z_STREAM_END || numTaken < m_size) {
        Watch();
        if (status == Z_STREAM_END && inflateReset(&stream) != Z_OK)
            throw ReadFault{"the compressed file is damaged"};
        plain.Reserve(std::max(plain.m_capacity, static_cast<size_t>(std::min<uint64_t>(
                                                     plain.m_size * 3 / 2 + kFirstBytes,
                                                     kMaxSourceBytes + kPadding))));
        const size_t room = std::min(plain.m_capacity - plain.m_size - kPadding, kReadBytes);
        if (room == 0)
            throw ReadFault{kTooLarge};
        stream.next_in = reinterpret_cast<Bytef*>(m_bytes + numTaken);
        stream.avail_in = static_cast<uInt>(std::min(m_size - numTaken, kReadBytes));
        stream.next_out = reinterpret_cast<Bytef*>(plain.m_bytes + plain.m_size);
        stream.avail_out = static_cast<uInt>(room);
        const uInt numOffered = stream.avail_in;
        status = inflate(&stream, Z_NO_FLUSH);
        numTaken += numOffered - stream.avail_in;
        plain.m_size += room - stream.avail_out;
        if (status == Z_BUF_ERROR ||
            (status == Z_OK && numTaken == m_size && stream.avail_out != 0))
            throw ReadFault{"the compressed file is not whole"};
        if (status != Z_OK && status != Z_STREAM_END)
            throw ReadFault{"the compressed file is damaged"};
    }
    plain.Reserve(plain.m_size + kPadding);
    std::memset(plain.m_bytes + plain.m_size, 0, kPadding);
    std::swap(m_bytes, plain.m_bytes);
    std::swap(m_size, plain.m_size);
    std::swap(m_capacity, plain.m_capacity);
}

uint64_t SourceText::LineOf(size_t position) const
{
    assert(position <= m_size);
    return 1 + static_cast<uint64_t>(std::count(m_bytes, m_bytes + position, '\n'));
}

} // namespace booleq
