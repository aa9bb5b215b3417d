// Work on an array by several threads, a part of the array at a time.
#ifndef BOOLEQ_LUTS_PARALLEL_H
#define BOOLEQ_LUTS_PARALLEL_H

#include <functional>

#include "lut_array.h"

namespace booleq {

// Splits 0 to count into parts of at most 'partSize' elements and calls 'run' with the begin and
// end of each. The calling thread works too, and calls Watch() before each of its parts.
// Requires: partSize > 0; 'run' may be called by several threads at once, for parts that do not
// overlap. Choose partSize for about a millisecond.
// Fails: what 'run' or Watch() throws first ends the work of all, and is thrown when all have
// ended. If the system refuses a thread, the other threads do its work.
typedef std::function<void(size_t begin, size_t end)> PartRunner;
void RunInParts(size_t count, size_t partSize, const LutWork& work, const PartRunner& run);

// The least place from 0 to count that 'find' finds in any part; kNoLut if there is none. 'find'
// returns the first place found in its part, or the part's end if it finds none.
typedef std::function<size_t(size_t begin, size_t end)> PartFinder;
size_t FindFirstInParts(size_t count, size_t partSize, const LutWork& work, const PartFinder& find);

} // namespace booleq

#endif
