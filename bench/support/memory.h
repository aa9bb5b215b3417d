// Peak memory of a piece of work.
#ifndef BENCH_MEMORY_H
#define BENCH_MEMORY_H

#include <functional>

namespace bench {

// Bytes of resident memory that 'work' adds at its peak to what the process had before. The work
// runs in a child process, so it leaves nothing behind; 0 when it cannot be measured.
double MeasurePeak(const std::function<void()>& work);

} // namespace bench

#endif
