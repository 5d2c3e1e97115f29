// A row of a table: what a character becomes.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>
#include <unicode/uchar.h>

namespace zelfields {

// The bytes lie in the low half as they do in memory; above them are the flags, and on top is one
// more than the number of bytes, or 0 if the row is not known. A row of zero has not been asked for.
using Row = uint64_t;

namespace row {

constexpr std::ptrdiff_t mostBytes = 4;
constexpr unsigned sizeShift = 56;

constexpr Row known = Row{1} << 32;
constexpr Row plain = Row{1} << 33; // known, one byte, no null, nothing replaced
constexpr Row blank = Row{1} << 34;
constexpr Row null = Row{1} << 35;
constexpr Row replaced = Row{1} << 36;
constexpr Row pair = Row{1} << 37;      // known, two bytes, no null, nothing replaced
constexpr Row lead = Row{1} << 38;      // not known: a byte that begins a character of two
constexpr Row unlearned = Row{1} << 39; // not known, and it is of no use to ask again

// The row of a last shift: no text, and so no end of one.
constexpr Row none = Row{1} << sizeShift | known | null;

// Whether a code point is a blank or a null.
inline Row kindOf(uint32_t codePoint) {
  const bool isBlank = codePoint == ' ' || codePoint == '\t' ||
                       (codePoint > 0x7E && u_isblank(static_cast<UChar32>(codePoint)) != 0);
  return codePoint == 0 ? null : isBlank ? blank : 0;
}

inline bool isKnown(Row row) { return row >> sizeShift != 0; }
inline std::ptrdiff_t size(Row row) { return static_cast<std::ptrdiff_t>(row >> sizeShift) - 1; }

inline Row make(std::string_view bytes, Row flags) {
  char low[mostBytes] = {};
  bytes.copy(low, mostBytes);
  uint32_t packed = 0;
  std::memcpy(&packed, low, mostBytes);
  const Row usual = bytes.size() == 1 ? plain : bytes.size() == 2 ? pair : 0;
  return packed | Row{bytes.size() + 1} << sizeShift | flags | known |
         ((flags & (null | replaced)) == 0 ? usual : 0);
}

inline char firstByte(Row row) {
  return static_cast<char>(std::endian::native == std::endian::little ? row : row >> 24);
}

// Writes all four bytes, of which the first size(row) are the character's.
inline void putFour(char *target, Row row) {
  const auto bytes = static_cast<uint32_t>(row);
  std::memcpy(target, &bytes, mostBytes);
}

// The bytes of a pair.
inline void putTwo(char *target, Row row) {
  const auto bytes =
      static_cast<uint16_t>(std::endian::native == std::endian::little ? row : row >> 16);
  std::memcpy(target, &bytes, sizeof bytes);
}

} // namespace row
} // namespace zelfields
