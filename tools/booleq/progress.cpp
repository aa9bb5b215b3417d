#include "progress.h"

#include <csignal>
#include <cstdio>
#include <utility>

#include <unistd.h>

namespace booleq {

namespace {

constexpr auto kPatience = std::chrono::milliseconds(500);
constexpr auto kPause = std::chrono::milliseconds(100);

// Only async-signal-safe calls.
void Interrupted(int signal)
{
    constexpr char kMessage[] = "\nbooleq: interrupted, the output is not complete\n";
    const ssize_t written = write(STDERR_FILENO, kMessage, sizeof(kMessage) - 1);
    (void)written; // there is nobody left to tell
    std::signal(signal, SIG_DFL);
    std::raise(signal);
}

} // namespace

Progress::Progress(std::string what, uint64_t total)
    : m_what(std::move(what)), m_total(total), m_is_terminal(isatty(STDERR_FILENO) == 1),
      m_start(std::chrono::steady_clock::now()), m_written(m_start)
{
}

Progress::~Progress()
{
    if (m_is_shown)
        std::fprintf(stderr, "\r%*s\r", static_cast<int>(m_what.size()) + 32, "");
}

void Progress::Write(uint64_t done)
{
    m_next = done + 256;
    const auto now = std::chrono::steady_clock::now();
    if (now - m_start < kPatience || now - m_written < kPause)
        return;
    m_written = now;
    m_is_shown = true;
    if (m_total == 0)
        std::fprintf(stderr, "\rbooleq: %s: %llu", m_what.c_str(),
                     static_cast<unsigned long long>(done));
    else
        std::fprintf(
            stderr, "\rbooleq: %s: %d%%", m_what.c_str(),
            static_cast<int>(static_cast<double>(done) * 100.0 / static_cast<double>(m_total)));
    std::fflush(stderr);
}

void HandleInterrupts()
{
    // A signal that the parent ignored stays ignored.
    for (const int signal : {SIGINT, SIGTERM})
        if (std::signal(signal, Interrupted) == SIG_IGN)
            std::signal(signal, SIG_IGN);
}

} // namespace booleq
