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

// A number of 64 bits for a text, of which all bits vary; another one in each process where the
// system places libraries at random, so that no text can be written to slow a table down.
// Of two texts of one length up to kKqMaxExactHash it is different: every step can be undone.
uint64_t KqHashText(const char* text, size_t length);

// Whether 'name' is the text, whose hash is known.
inline bool KqIsNamed(const Port::StringBase<char>& name, uint64_t nameHash, const char* text,
                      size_t length, uint64_t hash)
{
    return nameHash == hash && name.length() == length &&
           (length <= kKqMaxExactHash || std::memcmp(name.c_str(), text, length) == 0);
}

#endif
