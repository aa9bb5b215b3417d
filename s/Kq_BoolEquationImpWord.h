// Packed results, 64 rows to a word: bit k % 64 of word k / 64 is the result of row k.
#ifndef KQ_BOOLEQUATIONIMPWORD_H
#define KQ_BOOLEQUATIONIMPWORD_H

#include <cstdint>

// The rows of a word whose number has bit 'index' set, for each bit that tells rows of a word
// apart.
constexpr uint64_t kKqRowsWithBit[6] = {0xaaaaaaaaaaaaaaaau, 0xccccccccccccccccu,
                                        0xf0f0f0f0f0f0f0f0u, 0xff00ff00ff00ff00u,
                                        0xffff0000ffff0000u, 0xffffffff00000000u};

#endif
