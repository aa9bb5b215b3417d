// Peak memory as the kernel reports it: the high-water mark is reset, then read again.
#include "memory.h"

#include <cstdio>
#include <cstring>
#include <fstream>
#include <string>

#include <malloc.h>
#include <sys/wait.h>
#include <unistd.h>

namespace bench {

namespace {

// Bytes from a line "NAME:   123 kB" of the process status; 0 when there is none.
double ReadStatus(const std::string& name)
{
    std::ifstream status("/proc/self/status");
    std::string line;
    while (std::getline(status, line))
        if (line.compare(0, name.length(), name) == 0)
            return 1024.0 * std::stod(line.substr(name.length()));
    return 0;
}

bool ResetPeak()
{
    std::ofstream file("/proc/self/clear_refs");
    file << "5" << std::flush;
    return bool(file);
}

double MeasureHere(const std::function<void()>& work)
{
    // As in a process that has done nothing else: memory that others have freed would hide what the
    // work takes, and large blocks would no longer be given back at once.
    malloc_trim(0);
    mallopt(M_MMAP_THRESHOLD, 128 * 1024);
    if (!ResetPeak())
        return 0;
    const double before = ReadStatus("VmHWM:");
    work();
    return ReadStatus("VmHWM:") - before;
}

} // namespace

double MeasurePeak(const std::function<void()>& work)
{
    int ends[2];
    if (pipe(ends) != 0)
        return 0;
    std::fflush(nullptr);
    const pid_t child = fork();
    if (child == 0) {
        const double peak = MeasureHere(work);
        const ssize_t written = write(ends[1], &peak, sizeof peak);
        _exit(written == ssize_t(sizeof peak) ? 0 : 1);
    }
    close(ends[1]);
    double peak = 0;
    if (child < 0 || read(ends[0], &peak, sizeof peak) != ssize_t(sizeof peak))
        peak = 0;
    close(ends[0]);
    if (child > 0)
        waitpid(child, nullptr, 0);
    return peak;
}

} // namespace bench
