// Many look-up tables of one width in a caller's memory: the form in which Python arrays, netlists
// and canonical forms hand tables to each other. It owns nothing.
// Input 0 is the most significant bit of a row's number, row k is bit k of the table, as in rows.h;
// a table of seven inputs is two words of 64 bits, rows 0 to 63 first.
// Fails: never; whoever makes an array must keep its invariants.
#ifndef BOOLEQ_LUTS_LUT_ARRAY_H
#define BOOLEQ_LUTS_LUT_ARRAY_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace booleq {

constexpr unsigned int kMaxLutInputs = 7;
constexpr size_t kNoLut = SIZE_MAX; // instead of a place in an array

// How work on an array is done: by several threads at once if the array is long enough. The calling
// thread calls Watch() (watch.h) every few milliseconds, the others never. What Watch() throws ends
// them all, and the results are then partly written.
struct LutWork {
    unsigned int numThreads = 0; // 0: one for each processor
};

// Tables to be read.
// Invariants, of which HasLutShape checks the first:
// 1. A table has tableBytes bytes: 1, 2, 4 or 8, or 16 for two words; enough for 2^numInputs rows.
// 2. Bits beyond the last row are 0.
struct LutArray {
    const void* tables; // aligned as words of tableBytes, at most 8
    size_t count;
    unsigned int numInputs; // 0 to kMaxLutInputs
    unsigned int tableBytes;
};

// The fewest bytes that hold a table: 1 up to three inputs, 16 for seven.
constexpr unsigned int LutBytes(unsigned int numInputs)
{
    return numInputs <= 3 ? 1u : 1u << (numInputs - 3);
}

// Words of 64 bits as an array: one word for each table, two for seven inputs. Owns nothing:
// 'words' must outlive the result.
LutArray LutsOf(const std::vector<uint64_t>& words, unsigned int numInputs);

// Whether numInputs and tableBytes go together (invariant 1).
bool HasLutShape(unsigned int numInputs, unsigned int tableBytes);

} // namespace booleq

#endif
