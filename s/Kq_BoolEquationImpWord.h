// Packed results, 64 rows to a word: bit k % 64 of word k / 64 is the result of row k.
#ifndef KQ_BOOLEQUATIONIMPWORD_H
#define KQ_BOOLEQUATIONIMPWORD_H

#include <cstdint>

// The rows of a word whose number has bit 'index' set, for each bit that tells rows of a word
// apart.
constexpr uint64_t kKqRowsWithBit[6] = {0xaaaaaaaaaaaaaaaau, 0xccccccccccccccccu,
                                        0xf0f0f0f0f0f0f0f0u, 0xff00ff00ff00ff00u,
                                        0xffff0000ffff0000u, 0xffffffff00000000u};

struct KqByteCounts {
    uint8_t of[256];
};

constexpr KqByteCounts KqMakeByteCounts()
{
    KqByteCounts counts = {};
    for (unsigned int byte = 1; byte < 256; ++byte)
        counts.of[byte] = static_cast<uint8_t>(counts.of[byte / 2] + byte % 2);
    return counts;
}

constexpr KqByteCounts kKqByteCounts = KqMakeByteCounts();

// How many bits are set. Few low bits, as row numbers have them, take a look or two.
inline unsigned int KqCountBits(uint64_t bits)
{
    unsigned int count = 0;
    for (; bits != 0; bits >>= 8)
        count += kKqByteCounts.of[bits & 0xffu];
    return count;
}

#endif
