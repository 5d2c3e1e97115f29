// Characters on a terminal: whether they print, and how many columns they take.

#include "codepage/display.h"

#include <fmt/core.h>
#include <unicode/uchar.h>
#include <unicode/unistr.h>
#include <unicode/utf16.h>

namespace nls2::tool {

namespace {

template <class Visit>
void forEachCharacter(std::u16string_view text, Visit visit) {
  for (std::size_t i = 0; i < text.size();) {
    UChar32 character = 0;
    U16_NEXT(text.data(), i, text.size(), character);
    visit(character);
  }
}

// A line separator would break the line, as a control character does.
bool prints(UChar32 character) {
  const auto type = u_charType(character);
  return u_isprint(character) != 0 && type != U_LINE_SEPARATOR && type != U_PARAGRAPH_SEPARATOR;
}

int columnsOf(UChar32 character) {
  const auto type = u_charType(character);
  if (type == U_NON_SPACING_MARK || type == U_ENCLOSING_MARK) {
    return 0;
  }
  const int32_t width = u_getIntPropertyValue(character, UCHAR_EAST_ASIAN_WIDTH);
  return width == U_EA_WIDE || width == U_EA_FULLWIDTH ? 2 : 1;
}

} // namespace

Display displayOf(std::u16string_view text) {
  Display display;
  forEachCharacter(text, [&](UChar32 character) {
    const UChar32 shown = prints(character) ? character : U'.';
    icu::UnicodeString(shown).toUTF8String(display.text);
    display.columns += columnsOf(shown);
  });
  return display;
}

std::string codePointsOf(std::u16string_view text) {
  std::string points;
  forEachCharacter(text, [&](UChar32 character) {
    points +=
        fmt::format("{}U+{:04X}", points.empty() ? "" : " ", static_cast<uint32_t>(character));
  });
  return points;
}

} // namespace nls2::tool
