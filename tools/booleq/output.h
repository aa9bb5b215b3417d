// The result stream: collected in blocks, every write checked.
#ifndef BOOLEQ_OUTPUT_H
#define BOOLEQ_OUTPUT_H

#include <cstdio>
#include <stdexcept>
#include <string>

namespace booleq {

// Reading or writing failed; the text says what and why.
class IoError : public std::runtime_error {
  public:
    IoError(const std::string& what, int errorNumber);
};

// The reader of the output has gone away, as 'head' does.
class ReaderGone : public IoError {
  public:
    explicit ReaderGone(int errorNumber) : IoError("cannot write standard output", errorNumber) {}
};

class Output {
  public:
    // 'name' is what complaints call it.
    explicit Output(std::FILE* stream, std::string name = "standard output");
    // Fails: IoError or ReaderGone, here or at the next call, when the stream takes no more.
    void Put(const std::string& text);
    void Put(const char* text, size_t length);
    // After this, everything put so far has left the process.
    void Flush();

  private:
    void WriteBlock();
    void Write(const char* text, size_t length);
    [[noreturn]] void Fail() const;

    std::FILE* m_stream;
    std::string m_name;
    std::string m_block;
};

// Writes one line to standard error after "booleq: ". What was put before it is flushed first, so
// that the two streams keep their order on a terminal.
void Complain(Output& output, const std::string& message);

} // namespace booleq

#endif
