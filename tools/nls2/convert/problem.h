// Problems of records, and how they and a whole run are reported.
#pragma once

#include "convert/field_translator.h"

#include <map>

namespace nls2::tool {

struct Problem {
  int32_t kind = 0;      // NLS2F_..., or one of the tool's own
  uint64_t record = 0;   // its number, from 1
  uint64_t byte = 0;     // the record's offset in the input
  int64_t column = 0;    // the offset in the record; -1: it is the record's
  std::size_t field = 0; // from 1; 0 without a layout
  std::string name;      // the field's, if it has one
  NLS2F_Problem found = sized<NLS2F_Problem>();
  std::string words;
};

// Counts of a piece of the input, or of all of it.
struct Tally {
  uint64_t records = 0; // translated or rejected
  uint64_t rejected = 0;
  uint64_t replaced = 0;        // characters
  uint64_t replacedRecords = 0; // with such characters
  uint64_t lines = 0;           // of --problems, also those beyond its limit
  uint64_t bytesIn = 0;
  uint64_t bytesOut = 0;
  std::map<std::string, uint64_t> kinds; // problems
  std::optional<Problem> first;          // that was replaced or rejected
  std::optional<Problem> failure;        // that ended the run, after all the others

  void add(const Tally &later);
};

// The message, such as "record 3 at byte 160, column 5, field 2: the character ...", and the advice
// that may follow it.
std::string messageOf(const Problem &problem, std::string_view unit);
std::string adviceFor(const Problem &problem);

const char *kindName(int32_t kind);

// One line of JSON; `action` is "rejected", "replaced" or "failed".
std::string lineOf(const Problem &problem, const char *action);

// A summary of the replaced or rejected characters and records; empty if there are none.
std::string summaryOf(const Tally &tally, std::string_view unit);

// The report as JSON.
std::string reportOf(const Tally &tally, const Plan &plan, double seconds, bool isDone);

} // namespace nls2::tool
