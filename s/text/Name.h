// Texts that many places share, and how they are told apart: by length and bytes.
#ifndef KQ_NAME_H
#define KQ_NAME_H

#include <cstddef>
#include <cstdint>
#include <cstring>

#include <port/Port_StringBase.h>

// A text of the pool of names or of the table of spellings, with its hash; neither changes.
struct KqName {
    Port::StringBase<char> text;
    uint64_t hash; // KqHashText of the text; 0 for a spelling, which nobody looks up
};

// Equal in length and bytes; a NUL byte is a byte like any other.
inline bool KqIsSameText(const Port::StringBase<char>& left, const Port::StringBase<char>& right)
{
    return left.length() == right.length() &&
           std::memcmp(left.c_str(), right.c_str(), left.length()) == 0;
}

// Up to this length the hash alone tells texts of one length apart.
constexpr size_t kKqMaxExactHash = 8;

// A 64-bit hash of a text; all of its bits vary. It differs from process to process where the
// system loads libraries at random addresses, so nobody can write a text that slows a table down.
// Different texts of one length up to kKqMaxExactHash have different hashes: every step can be
// undone.
uint64_t KqHashText(const char* text, size_t length);

// Whether 'name' equals the text; the hashes of both are given.
inline bool KqIsNamed(const Port::StringBase<char>& name, uint64_t nameHash, const char* text,
                      size_t length, uint64_t hash)
{
    return nameHash == hash && name.length() == length &&
           (length <= kKqMaxExactHash || std::memcmp(name.c_str(), text, length) == 0);
}

#endif
