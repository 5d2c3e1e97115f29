// Code pages and the ICU names of their converters: all pages that the library opens by name, and some
// of each other kind. Conversions by bare ICU.
#pragma once

#include <algorithm>
#include <cstdint>
#include <string>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace support {

struct Page {
  int32_t number;
  const char *icuName;
  int32_t terminator = 1; // zero bytes that end a string
  bool isNamed = true;    // the library opens it by this name, not by its number
};

// clang-format off
constexpr Page pages[] = {
    {37, "ibm-37", 1, false}, {273, "ibm-273", 1, false}, {500, "ibm-500", 1, false},
    {819, "ibm-819", 1, false}, {930, "ibm-930", 1, false}, {939, "ibm-939", 1, false},
    {943, "ibm-943", 1, false}, {954, "ibm-954", 1, false}, {1047, "ibm-1047", 1, false},
    {1141, "ibm-1141", 1, false}, {1388, "ibm-1388", 1, false}, {874, "windows-874"},
    {932, "shift-jis"}, {936, "windows-936"}, {949, "windows-949"}, {950, "windows-950"},
    {1200, "utf-16be", 2}, {1208, "utf-8"}, {57352, "utf-8"}, {57358, "utf-16be", 2},
    {57359, "utf-16le", 2}, {57360, "utf-32be"}, {57361, "utf-32le"}, {57362, "hz"}, {57363, "scsu"},
    {57365, "iscii,version=0"}, {57366, "utf-7"}, {57367, "bocu1"}, {57368, "utf-16", 2},
    {57369, "utf-32"}, {57370, "cesu-8"}, {57371, "gb18030"}, {57372, "ucs-2"},
};
// clang-format on

inline icu::LocalUConverterPointer open(const Page &page) {
  UErrorCode error = U_ZERO_ERROR;
  return icu::LocalUConverterPointer(ucnv_open(page.icuName, &error));
}

template <class To, class From, class Convert>
std::basic_string<To> converted(const Page &page, const std::basic_string<From> &text,
                                Convert convert) {
  UErrorCode error = U_ZERO_ERROR;
  std::basic_string<To> result(text.size() * 8 + 16, To{0});
  result.resize(static_cast<std::size_t>(convert(open(page).getAlias(), result.data(),
                                                 static_cast<int32_t>(result.size()), text.data(),
                                                 static_cast<int32_t>(text.size()), &error)));
  return result;
}
inline std::u16string decode(const Page &page, const std::string &bytes) {
  return converted<char16_t>(page, bytes, ucnv_toUChars);
}
inline std::string encode(const Page &page, const std::u16string &text) {
  return converted<char>(page, text, ucnv_fromUChars);
}

} // namespace support
