#include "source_text.h"

#include <algorithm>
#include <cassert>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <new>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#if !defined(_WIN32)
#include <sys/mman.h>
#endif

#include "read_fault.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr size_t kLargePage = size_t(1) << 21;
#if defined(_WIN32)
constexpr int kReading = O_RDONLY | O_BINARY;
#else
constexpr int kReading = O_RDONLY | O_CLOEXEC;
#endif

std::string SystemReason()
{
    return std::strerror(errno);
}

// Uses large pages if the system has them: filling small ones takes as long as reading the file.
void* AllocateLarge(size_t numBytes)
{
#if defined(MADV_HUGEPAGE)
    void* block = nullptr;
    if (posix_memalign(&block, kLargePage, numBytes) != 0)
        return nullptr;
    madvise(block, numBytes, MADV_HUGEPAGE); // a hint
    return block;
#else
    return std::malloc(numBytes);
#endif
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

// realloc moves large blocks without copying, and pages that were never written take no memory.
void SourceText::Reserve(size_t numBytes)
{
    if (numBytes > kMaxSourceBytes + kPadding)
        throw ReadFault{kSourceTooLarge};
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
    const Descriptor descriptor(open(file.c_str(), kReading));
    if (descriptor.Get() < 0)
        throw ReadFault{"cannot open it: " + SystemReason()};
    struct stat status;
    if (fstat(descriptor.Get(), &status) != 0)
        throw ReadFault{"cannot read it: " + SystemReason()};
    if (S_ISDIR(status.st_mode))
        throw ReadFault{"it is a directory"};
    if (S_ISREG(status.st_mode)) {
        if (static_cast<uint64_t>(status.st_size) > kMaxSourceBytes)
            throw ReadFault{kSourceTooLarge};
        Reserve(static_cast<size_t>(status.st_size) + kPadding + 1);
    }
    ReadStream(descriptor.Get());
}

void SourceText::ReadStream(int descriptor)
{
    for (;;) {
        Watch();
        if (m_capacity < m_size + kPadding + 1)
            Reserve(std::max(kFirstSourceBytes,
                             static_cast<size_t>(std::min<uint64_t>(
                                 m_size + m_size / 2 + kPadding + 1, kMaxSourceBytes + kPadding))));
        if (m_capacity < m_size + kPadding + 1)
            throw ReadFault{kSourceTooLarge};
        const size_t room = std::min(m_capacity - m_size - kPadding, kSourceReadBytes);
        const ssize_t numRead = read(descriptor, m_bytes + m_size,
                                     static_cast<unsigned int>(room)); // at most kSourceReadBytes
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

uint64_t SourceText::LineOf(size_t position) const
{
    assert(position <= m_size);
    return 1 + static_cast<uint64_t>(std::count(m_bytes, m_bytes + position, '\n'));
}

} // namespace booleq
