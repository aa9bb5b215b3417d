// Lines of any length from a file or standard input; only memory limits them.
#ifndef BOOLEQ_LINES_H
#define BOOLEQ_LINES_H

#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

namespace booleq {

// Some programs put these before the first line of a file, and at the end of each line.
void DropByteOrderMark(std::string& line);
void DropCarriageReturn(std::string& line);

// Invariant: the bytes from m_position on are read from the stream but not yet given out.
class LineReader {
  public:
    // Reads the file, "-" being standard input.
    // Fails: IoError when it cannot be opened.
    explicit LineReader(const std::string& path);
    ~LineReader();
    LineReader(const LineReader&) = delete;
    LineReader& operator=(const LineReader&) = delete;

    // The next line without its line feed; the last line needs none. NUL bytes and carriage returns
    // are kept. It waits only for the end of this line, not for what follows in a pipe.
    // Fails: false after the last line; IoError when the stream cannot be read.
    bool Next(std::string& line);

    // Bytes read so far, and in all; 0 in all when the size is unknown (a pipe).
    uint64_t GetPosition() const { return m_num_read - (m_end - m_position); }
    uint64_t GetSize() const { return m_size; }

  private:
    bool Fill();

    std::string m_name; // for complaints
    std::FILE* m_stream;
    uint64_t m_size = 0;
    uint64_t m_num_read = 0;
    std::vector<char> m_buffer;
    size_t m_position = 0;
    size_t m_end = 0;
};

} // namespace booleq

#endif
