// Uncompresses a text with zlib. A build without zlib uses no_gzip_text.cpp instead.
#include "source_text.h"

#include <algorithm>
#include <cassert>
#include <cstring>
#include <new>

#include <zlib.h>

#include "read_fault.h"
#include "watch.h"

namespace booleq {

namespace {

// Owns a zlib stream and ends it.
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

// Reads one member after another, because a gzip file may have several. The length that the file
// states is not trusted.
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
                                                     plain.m_size * 3 / 2 + kFirstSourceBytes,
                                                     kMaxSourceBytes + kPadding))));
        const size_t room = std::min(plain.m_capacity - plain.m_size - kPadding, kSourceReadBytes);
        if (room == 0)
            throw ReadFault{kSourceTooLarge};
        stream.next_in = reinterpret_cast<Bytef*>(m_bytes + numTaken);
        stream.avail_in = static_cast<uInt>(std::min(m_size - numTaken, kSourceReadBytes));
        stream.next_out = reinterpret_cast<Bytef*>(plain.m_bytes + plain.m_size);
        stream.avail_out = static_cast<uInt>(room);
        const uInt numOffered = stream.avail_in;
        status = inflate(&stream, Z_NO_FLUSH);
        numTaken += numOffered - stream.avail_in;
        plain.m_size += room - stream.avail_out;
        if (status == Z_BUF_ERROR ||
            (status == Z_OK && numTaken == m_size && stream.avail_out != 0))
            throw ReadFault{"the compressed file is truncated"};
        if (status != Z_OK && status != Z_STREAM_END)
            throw ReadFault{"the compressed file is damaged"};
    }
    plain.Reserve(plain.m_size + kPadding);
    std::memset(plain.m_bytes + plain.m_size, 0, kPadding);
    std::swap(m_bytes, plain.m_bytes);
    std::swap(m_size, plain.m_size);
    std::swap(m_capacity, plain.m_capacity);
}

} // namespace booleq
