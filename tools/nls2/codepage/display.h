// How characters are displayed: what prints, and how many columns it takes.
#pragma once

#include <cstdint>
#include <fmt/core.h>
#include <string>
#include <string_view>
#include <unicode/uchar.h>
#include <unicode/unistr.h>

namespace nls2::tool {

struct Display {
  std::string text; // UTF-8; a dot for each character that does not print
  int columns = 0;
};

inline std::u16string fromUtf8(const std::string &text) {
  const auto units = icu::UnicodeString::fromUTF8(text);
  return {units.getBuffer(), static_cast<std::size_t>(units.length())};
}

// Line separators would break the line, as control characters do.
inline bool prints(UChar32 character) {
  return u_isprint(character) != 0 &&
         (U_MASK(u_charType(character)) & (U_GC_ZL_MASK | U_GC_ZP_MASK)) == 0;
}

inline int columnsOf(UChar32 character) {
  if ((U_MASK(u_charType(character)) & (U_GC_MN_MASK | U_GC_ME_MASK)) != 0) {
    return 0;
  }
  const int32_t width = u_getIntPropertyValue(character, UCHAR_EAST_ASIAN_WIDTH);
  return width == U_EA_WIDE || width == U_EA_FULLWIDTH ? 2 : 1;
}

// A text, usually one character, for display.
inline Display displayOf(std::u16string_view text) {
  Display display;
  for (std::size_t i = 0; i < text.size();) {
    UChar32 character = 0;
    U16_NEXT(text.data(), i, text.size(), character);
    const UChar32 shown = prints(character) ? character : UChar32{'.'};
    icu::UnicodeString(shown).toUTF8String(display.text);
    display.columns += columnsOf(shown);
  }
  return display;
}

// "U+00A2", or "U+304B U+309A" for several characters.
inline std::string codePointsOf(std::u16string_view text) {
  std::string points;
  for (std::size_t i = 0; i < text.size();) {
    uint32_t character = 0;
    U16_NEXT(text.data(), i, text.size(), character);
    points += fmt::format("{}U+{:04X}", points.empty() ? "" : " ", character);
  }
  return points;
}

} // namespace nls2::tool
