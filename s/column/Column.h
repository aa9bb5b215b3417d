// The packed result column: the results of all rows of a tree's truth table, 64 rows to a word.
// A root goes in, bits come out; no strings, no messages, no engine object.
#ifndef KQ_COLUMN_H
#define KQ_COLUMN_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "Join.h"
#include "Program.h"

// Deliberate: 30 variables are tabulated, 31 are not; row numbers stay within 32 bits.
constexpr unsigned int kKqMaxColumnVariables = 30;

// Words that every kernel can process at a time; pieces of a column should be a multiple of it.
constexpr size_t kKqTileWords = 64;

// A kernel computes 'numWords' words of the column of a program whose variables are numbered by the
// bit of the row number that is their value: bit k of the result, bit k % 64 of word k / 64, is
//     the value of the program for row k, complemented when 'isInverted'.
// Requires: numWords a multiple of kKqTileWords; variables below 30; 'stack' has room for as many
// tiles of kKqTileWords words as the program stacks values.
typedef void (*KqKernel)(const KqCode* codes, size_t numCodes, bool isInverted, size_t numWords,
                         uint64_t* stack, uint64_t* words);

struct KqNamedKernel {
    const char* name;
    KqKernel run;
    KqJoinKernel join;
    bool (*isSupported)(); // by this processor
};

// All kernels of this build, the plain one first, each faster than those before it.
const KqNamedKernel* KqGetKernels(size_t* numKernels);

// The kernel of this name; the fastest one when 'name' is null, is not in the table, or names a
// kernel that this processor lacks.
const KqNamedKernel& KqChooseKernel(const char* name);

// The kernel for all columns: the one named by the environment variable
// MAV_KQ_BOOL_EQUATION_KERNEL, so that a fault seen on one processor can be repeated on another.
// Chosen once, when the library is loaded.
const KqNamedKernel& KqGetKernel();

// Bit k of the column, bit k % 64 of word k / 64, is the value of row k. The first variable is bit
// numVariables-1 of k, the last is bit 0. With fewer than six variables the one word repeats the
// column's 2^numVariables bits up to its end.
//
// The column is split by fixing its first variable, then the next. What is left of the program gets
// shorter each time, and is often a constant or the same as an earlier rest, whose words are
// copied.
class KqColumn {
  public:
    // Compiles the tree at 'root', which may be null and then counts as 0.
    // Requires: a checked tree; numVariables <= kKqMaxColumnVariables. An ID whose index is not
    // that of a variable counts as 0.  Fails: std::bad_alloc.  Cost: O(nodes).
    KqColumn(const Kq_BoolEquationImp::Node* root, unsigned int numVariables);

    // 2^numVariables / 64, at least 1.
    size_t GetNumWords() const { return m_num_words; }

    // Words of a piece that is filled within some milliseconds or, with over 100,000 operators, of
    // the smallest piece worth fixing variables for. A power of two that divides GetNumWords().
    size_t GetNumPieceWords() const;

    // Writes words firstWord .. firstWord+numWords-1 of the column to 'words'. Pieces in sequence,
    // up or down, whose length is a power of two and divides firstWord are cheapest.
    // Requires: firstWord + numWords <= GetNumWords().
    // Fails: std::bad_alloc.  Cost: O(nodes * numWords) at most.
    void Fill(uint64_t firstWord, size_t numWords, uint64_t* words);

  private:
    // What is left of the program when some variables are fixed: codes in m_codes.
    struct Rest {
        size_t first;
        size_t numCodes; // 0 for a constant
        uint32_t variables;
        uint32_t hash;
        bool isInverted; // complemented; a constant is 1 then
    };

    // A rest whose block of 2^level rows has been written.
    struct Written {
        Rest rest;
        unsigned int level;
        uint64_t generation; // forgotten unless it is the current one
        const uint64_t* words;
    };

    // A variable fixed on the way to the piece being filled, and what it leaves.
    struct Fixed {
        unsigned int variable;
        bool value;
        Rest rest;
    };

    void FillPiece(uint64_t firstWord, unsigned int level, uint64_t* words);
    void Expand(const Rest& rest, unsigned int level, uint64_t* words);
    void ExpandHalves(const Rest& rest, unsigned int level, uint64_t* words);
    void RunKernel(const Rest& rest, unsigned int level, uint64_t* words);
    Rest Fix(const Rest& rest, unsigned int variable, bool value);
    Rest Describe(size_t first, size_t numCodes, bool isInverted) const;
    bool CopyWritten(const Rest& rest, unsigned int level, uint64_t* words);
    void ForgetWritten() { ++m_generation; }

    static constexpr size_t kNumWritten = 128;

    size_t m_num_words;
    KqKernel m_kernel;
    KqJoiner m_joiner;
    std::vector<KqCode> m_codes; // the program, then what is left of it
    size_t m_num_codes = 0;      // how many of m_codes are in use
    Rest m_whole;
    Fixed m_path[32]; // of m_path_length variables
    size_t m_path_length = 0;
    uint64_t m_generation = 1;
    Written m_written[kNumWritten] = {};          // by hash
    uint64_t m_stack[kKqMaxStack * kKqTileWords]; // the kernel's; set before it is read
};

#endif
