// What a run of translate has done so far, and its report.
#pragma once

#include "convert/problem.h"
#include "convert/translate_options.h"

#include <cstdint>
#include <optional>
#include <string>

namespace nls2::tool {

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
  std::optional<Problem> firstProblem() const { return first ? first : failure; }
};

// What became of the characters and records that were replaced or rejected; empty where none was.
std::string summaryOf(const Tally &tally, std::string_view unit);

// The report as JSON.
std::string reportOf(const Tally &tally, const TranslateOptions &options, double seconds);

} // namespace nls2::tool
