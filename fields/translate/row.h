// A row of a table: what a character becomes.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

namespace zelfields {

// The bytes lie in the low half as they do in memory; above them are the flags, and on top the
// number of bytes. A row of zero has not been asked for yet.
using Row = uint64_t;

namespace row {

constexpr std::size_t mostBytes = 4;
constexpr unsigned sizeShift = 56;

constexpr Row known = Row{1} << 32;
constexpr Row plain = Row{1} << 33; // known, one byte, no null, nothing replaced
constexpr Row blank = Row{1} << 34;
constexpr Row null = Row{1} << 35;
constexpr Row replaced = Row{1} << 36;
constexpr Row lead = Row{1} << 37;      // not known: a byte that begins a character of two
constexpr Row unlearned = Row{1} << 38; // not known, and it is of no use to ask again

inline std::size_t size(Row row) { return static_cast<std::size_t>(row >> sizeShift); }

inline Row make(std::string_view bytes, Row flags) {
  char low[mostBytes] = {};
  bytes.copy(low, mostBytes);
  uint32_t packed = 0;
  std::memcpy(&packed, low, mostBytes);
  const bool isPlain = bytes.size() == 1 && (flags & (null | replaced)) == 0;
  return packed | Row{bytes.size()} << sizeShift | flags | known | (isPlain ? plain : 0);
}

inline char firstByte(Row row) {
  return static_cast<char>(std::endian::native == std::endian::little ? row : row >> 24);
}

// Writes all four bytes, of which the first size(row) are the character's.
inline void putFour(char *target, Row row) {
  const auto bytes = static_cast<uint32_t>(row);
  std::memcpy(target, &bytes, mostBytes);
}

} // namespace row
} // namespace zelfields
