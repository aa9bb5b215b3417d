// Why a file is not read. Readers throw it at any depth and ReadDesign catches it, so no caller of
// the room sees it, and unwinding the stack discards what was built so far.
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

// A name from a file, quoted and shortened for messages.
inline std::string Quoted(std::string_view name)
{
    return "'" + Excerpt(std::string(name.substr(0, 200))) + "'";
}

} // namespace booleq

#endif
