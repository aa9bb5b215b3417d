// Shows on a terminal how far long work has got, and ends cleanly when it is interrupted.
#ifndef BOOLEQ_PROGRESS_H
#define BOOLEQ_PROGRESS_H

#include <chrono>
#include <cstdint>
#include <string>

namespace booleq {

// Writes "booleq: WHAT: 42%" over and over to standard error when that is a terminal and the work
// takes longer than a moment; erases it at the end.
class Progress {
  public:
    // 'total' 0: unknown, so the number itself is shown.
    Progress(std::string what, uint64_t total);
    ~Progress();
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;

    void Show(uint64_t done)
    {
        if (m_is_terminal && done >= m_next)
            Write(done);
    }
    // The same for work that counts slowly: the clock is read each time.
    void ShowNow(uint64_t done)
    {
        if (m_is_terminal)
            Write(done);
    }

  private:
    void Write(uint64_t done);

    std::string m_what;
    uint64_t m_total;
    uint64_t m_next = 0; // below this the clock is not read
    bool m_is_terminal;
    bool m_is_shown = false;
    std::chrono::steady_clock::time_point m_start;
    std::chrono::steady_clock::time_point m_written;
};

// From now on an interrupt prints a message and ends the process by its signal, so that a shell's
// loop around it ends too.
void HandleInterrupts();

} // namespace booleq

#endif
