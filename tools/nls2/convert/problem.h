// Problems of records, and how they and a whole run are reported.
#pragma once

#include "convert/translate_options.h"

#include <string>
#include <string_view>

namespace nls2::tool {

// Those of nls2::problem_kind come first, with its numbers.
enum class ProblemKind {
  none,
  invalidBytes,
  notInPage,
  tooLong,
  nullInside,
  noExactFill,
  beyondLimit,
  noMemory,
  notReversible,
  shortRecord
};

// The limit that a text exceeded.
enum class Limit { outLength, fieldWidth, ownLength };

struct Problem {
  ProblemKind kind = ProblemKind::invalidBytes;
  uint64_t record = 0;    // its number, from 1
  uint64_t byte = 0;      // the record's offset in the input
  std::size_t column = 0; // the offset in the record
  std::size_t field = 0;  // of --fields, from 1; 0 without it
  int32_t page = 0;       // the one whose rules the text breaks
  nls2::problem found;    // the bytes and the character at fault, and the bytes needed
  std::size_t limit = 0;  // bytes that it may take, or should have
  Limit limitedBy = Limit::outLength;
  int cameBack = -1; // notReversible: the byte in place of the one found; -1: not that many came
};

// Counts of a piece of the input, or of all of it.
struct Tally {
  uint64_t records = 0; // translated or rejected
  uint64_t rejected = 0;
  uint64_t replaced = 0;        // characters
  uint64_t replacedRecords = 0; // with such characters
  uint64_t bytesIn = 0;
  uint64_t bytesOut = 0;
  std::optional<Problem> first;   // that was replaced or rejected
  std::optional<Problem> failure; // that ended the run, after all the others

  void add(const Tally &later);
};

// "record 3 at byte 160, column 5, field 2"; `unit` is "record" or "line".
std::string placeOf(const Problem &problem, std::string_view unit);

struct Explanation {
  std::string reason; // "the character U+0416 (bytes D0 96) is not in code page 37"
  std::string advice; // a hint that begins with a semicolon; may be empty
};

Explanation explain(const Problem &problem);

// A summary of the replaced or rejected characters and records; empty if there are none.
std::string summaryOf(const Tally &tally, std::string_view unit);

// The report as JSON.
std::string reportOf(const Tally &tally, const TranslateOptions &options, double seconds);

} // namespace nls2::tool
