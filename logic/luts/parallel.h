// Work on an array by several threads, some elements at a time.
#ifndef BOOLEQ_LUTS_PARALLEL_H
#define BOOLEQ_LUTS_PARALLEL_H

#include <functional>

#include "lut_array.h"

namespace booleq {

// Calls 'run' with parts begin to end of 0 to count, each of at most 'partSize' elements, until all
// are done; the calling thread takes part, and calls Watch() before each of its own.
// Requires: partSize > 0; 'run' may be called by several threads at once, for parts that do not
// overlap. Choose partSize for about a millisecond.
// Fails: what 'run' or Watch() throws first ends the work of all, and is thrown when all have
// ended. A thread that the system does not give is done without.
typedef std::function<void(size_t begin, size_t end)> PartRunner;
void RunInParts(size_t count, size_t partSize, const LutWork& work, const PartRunner& run);

// The least place from 0 to count that 'find' finds in a part, kNoLut when it finds none: 'find'
// gives the first place of its part, the part's end for none.
typedef std::function<size_t(size_t begin, size_t end)> PartFinder;
size_t FindFirstInParts(size_t count, size_t partSize, const LutWork& work, const PartFinder& find);

} // namespace booleq

#endif
