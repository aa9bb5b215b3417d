// The bytes of a netlist file, uncompressed, in one block that is filled once.
#ifndef BOOLEQ_DESIGN_SOURCE_TEXT_H
#define BOOLEQ_DESIGN_SOURCE_TEXT_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace booleq {

// Positions in a text are 32 bits in the readers.
constexpr uint64_t kMaxSourceBytes = 4294967000;

// Invariant: kPadding zero bytes follow the text.
class SourceText {
  public:
    static constexpr size_t kPadding = 64;

    SourceText() = default;
    ~SourceText();
    SourceText(const SourceText&) = delete;
    SourceText& operator=(const SourceText&) = delete;

    // The file, standard input for "-"; a file that begins as gzip files do is uncompressed.
    // Throws ReadFault: it cannot be read, is not whole, or is larger than kMaxSourceBytes.
    void ReadFile(const std::string& file);
    void ReadStream(int descriptor);
    // A text that is compressed, too, is uncompressed.
    void Copy(std::string_view text);

    // Empty again, without its memory.
    void Release();

    std::string_view Text() const { return std::string_view(m_bytes, m_size); }
    // Including the padding.
    size_t Capacity() const { return m_size + kPadding; }
    // From 1.  Cost: in step with the position.
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
