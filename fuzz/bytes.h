// An input read byte by byte; beyond its end it reads as zeros, so every input stands for
// something.
#ifndef FUZZ_BYTES_H
#define FUZZ_BYTES_H

#include <string>
#include <vector>

namespace fuzz {

class Bytes {
  public:
    explicit Bytes(const std::string& input) : m_input(input) {}

    bool IsAtEnd() const { return m_position >= m_input.size(); }
    size_t Next()
    {
        return IsAtEnd() ? 0
                         : static_cast<size_t>(static_cast<unsigned char>(m_input[m_position++]));
    }
    // 0 to limit - 1.  Requires: 0 < limit <= 256.
    size_t Below(size_t limit) { return Next() % limit; }
    bool Flag() { return Next() % 2 != 0; }
    const std::string& OneOf(const std::vector<std::string>& texts)
    {
        return texts[Below(texts.size())];
    }
    // The next bytes as they are, fewer at the end of the input.
    std::string Raw(size_t numBytes)
    {
        std::string text;
        while (text.size() < numBytes && !IsAtEnd())
            text += static_cast<char>(Next());
        return text;
    }

  private:
    const std::string& m_input;
    size_t m_position = 0;
};

} // namespace fuzz

#endif
