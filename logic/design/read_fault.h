// Why a file is not read. Readers throw it from wherever they stand, ReadDesign catches it: no
// caller of the room sees it, and what was built so far goes with the stack.
#ifndef BOOLEQ_DESIGN_READ_FAULT_H
#define BOOLEQ_DESIGN_READ_FAULT_H

#include <cstdint>
#include <string>
#include <string_view>

#include "text.h"

namespace booleq {

struct ReadFault {
    std::string text; // what is wrong and where, without the file's name
};

// "line 7: text"
[[noreturn]] inline void ThrowAtLine(uint64_t line, const std::string& text)
{
    throw ReadFault{"line " + std::to_string(line) + ": " + text};
}

// A name from a file as messages show it.
inline std::string Quoted(std::string_view name)
{
    return "'" + Excerpt(std::string(name.substr(0, 200))) + "'";
}

} // namespace booleq

#endif
