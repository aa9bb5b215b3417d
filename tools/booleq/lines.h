// Lines of any length from a stream; only memory bounds them.
#ifndef BOOLEQ_LINES_H
#define BOOLEQ_LINES_H

#include <cstdio>
#include <string>
#include <vector>

namespace booleq {

// Invariant: the bytes from m_position on are read from the stream but not yet given out.
class LineReader {
  public:
    explicit LineReader(std::FILE* stream);
    // The next line without its line feed; a last line needs none. NUL bytes and carriage returns
    // are handed on.
    // Fails: false behind the last line; IoError when the stream cannot be read.
    bool Next(std::string& line);

  private:
    bool Fill();

    std::FILE* m_stream;
    std::vector<char> m_buffer;
    size_t m_position = 0;
    size_t m_end = 0;
};

} // namespace booleq

#endif
