// The uncompressed bytes of a netlist file, in one block that is filled once.
#ifndef BOOLEQ_DESIGN_SOURCE_TEXT_H
#define BOOLEQ_DESIGN_SOURCE_TEXT_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace booleq {

// The readers keep positions in 32 bits.
constexpr uint64_t kMaxSourceBytes = 4294967000;
constexpr char kSourceTooLarge[] = "the text is larger than 4,294,967,000 bytes";
constexpr size_t kFirstSourceBytes = size_t(1) << 16;
constexpr size_t kSourceReadBytes = size_t(1) << 24; // at a time

// Invariant: kPadding zero bytes follow the text.
class SourceText {
  public:
    static constexpr size_t kPadding = 64;

    SourceText() = default;
    ~SourceText();
    SourceText(const SourceText&) = delete;
    SourceText& operator=(const SourceText&) = delete;

    // Reads the file, or standard input for "-", and uncompresses it if it begins like a gzip file.
    // Fails: ReadFault if it cannot be read, is truncated, or is larger than kMaxSourceBytes.
    void ReadFile(const std::string& file);
    void ReadStream(int descriptor);
    // Copies a text, which may be compressed, too.
    void Copy(std::string_view text);

    // Empties the text and frees its memory.
    void Release();

    std::string_view Text() const { return std::string_view(m_bytes, m_size); }
    // Including the padding.
    size_t Capacity() const { return m_size + kPadding; }
    // The line, counted from 1.  Cost: linear in the position.
    uint64_t LineOf(size_t position) const;

  private:
    void Reserve(size_t numBytes);
    void Finish();
    void Inflate();

    char* m_bytes = nullptr;
    size_t m_size = 0;
    size_t m_capacity = 0;
};

} // namespace booleq

#endif
