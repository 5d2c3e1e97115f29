// Characters on a terminal: whether they print, and how many columns they take.
#pragma once

#include <string>
#include <string_view>

namespace nls2::tool {

struct Display {
  std::string text; // UTF-8; a dot in place of what does not print
  int columns = 0;
};

// What a piece of text, mostly one character, looks like.
Display displayOf(std::u16string_view text);

// "U+00A2"; of several characters "U+304B U+309A".
std::string codePointsOf(std::u16string_view text);

} // namespace nls2::tool
