// Text for people: what may go to a terminal, and how wide it is.
#ifndef BOOLEQ_BASE_TEXT_H
#define BOOLEQ_BASE_TEXT_H

#include <cstdint>
#include <string>
#include <vector>

#include <port/Port_StringBase.h>

namespace booleq {

std::string ToStd(const Port::StringBase<char>& text);

// True when every byte is printable ASCII, so that Visible changes nothing.
bool IsPrintable(const std::string& text);
// From now on Visible also leaves UTF-8 characters of more than one byte for which the test is
// true. At first, and after null, it leaves none.  Threads: call it before others start.
typedef bool (*CharacterTest)(uint32_t character);
void ShowUtf8(CharacterTest test);
// How many columns of a terminal a visible text takes.
size_t Width(const std::string& visible);
// Writes every byte that is not printable ASCII as \xNN: a name may hold any byte, even an escape
// sequence for the terminal.
std::string Visible(const std::string& text);
// Like Visible, but cut after at most 60 bytes; the size of the whole text is added then.
std::string Excerpt(const std::string& text);
// "1 input", "2 inputs".
std::string Count(uint64_t number, const std::string& noun);
// The words with 'between' between them.
std::string Join(const std::vector<std::string>& words, const char* between);
// "A=1 B=0", names visible; "no inputs" without any.  Requires: as many values as names.
std::string ValuesByName(const std::vector<std::string>& names, const std::vector<bool>& values);
// True for a text of only blanks, tabs and line feeds, or an empty one.
bool IsBlank(const std::string& text);

} // namespace booleq

#endif
