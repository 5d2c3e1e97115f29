// What keeps a record from being translated, where it is, and how it is said.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace nls2::tool {

enum class ProblemKind {
  invalidBytes,
  notInPage,
  tooLong,
  nullInside,
  noExactFill,
  notReversible,
  shortRecord,
  noMemory
};

// What a text had to fit in.
enum class Limit { outLength, fieldWidth, ownLength };

struct Problem {
  ProblemKind kind = ProblemKind::invalidBytes;
  uint64_t record = 0;    // before it in the input
  uint64_t byte = 0;      // the record's offset in the input
  std::size_t column = 0; // the offset in the record
  std::size_t field = 0;  // of --fields, from 1; 0 without it
  int32_t page = 0;       // the one whose rules the text breaks
  std::array<char, 8> bytes = {};
  std::size_t byteCount = 0;
  char32_t codePoint = 0;
  std::size_t needed = 0; // bytes that it takes, or has
  std::size_t limit = 0;  // bytes that it may take, or should have
  Limit limitedBy = Limit::outLength;
  int cameBack = -1; // notReversible: the byte in place of the first one; -1: none

  // "41 FF"; empty where no bytes are at fault.
  std::string hex() const;
  std::string codePointText() const; // "U+0416"; empty where there is none
};

// "invalid bytes", as a report has it.
std::string_view kindName(ProblemKind kind);

// "record 3 at byte 160, column 5, field 2"; `unit` is "record" or "line".
std::string placeOf(const Problem &problem, std::string_view unit);

// "the character U+0416 (bytes D0 96) is not in code page 37"
std::string reasonOf(const Problem &problem);

// What would help, after a semicolon; empty where nothing is known to.
std::string adviceOn(const Problem &problem);

} // namespace nls2::tool
