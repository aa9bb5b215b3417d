// Pictures of functions as SVG: the pieces that they are made of, and which functions have one.
// A white ground with black on it, so that they are readable on dark pages as on light ones.
#ifndef BOOLEQ_PICTURE_H
#define BOOLEQ_PICTURE_H

#include <cstddef>
#include <string>

#include "answer.h"

namespace booleq {

constexpr size_t kCharacterWidth = 9; // of the font, roughly; all lengths are in pixels

// True for one to six inputs.
// Fails: false, and the refusal has been printed: return kRefused. 'what' has this limit: "a map".
bool HasPicture(const kq_logic::Function& function, const std::string& what, const Text& text,
                const Request& request, Output& output);

std::string SvgHead(size_t width, size_t height);
std::string SvgTail();
// 'anchor' is "start", "middle" or "end" of the text at x; y is its base line.
std::string SvgText(size_t x, size_t y, const char* anchor, const std::string& text);
// The same in grey, for text that only explains.
std::string SvgNote(size_t x, size_t y, const char* anchor, const std::string& text);
// A box with a text in it, coloured for the value 1.
std::string SvgBox(size_t x, size_t y, size_t width, size_t height, bool isOne,
                   const std::string& text);
// An arrow to the right and then down, darker for the value 1.
std::string SvgArrow(size_t x, size_t y, size_t toX, size_t toY, bool isOne);

} // namespace booleq

#endif
