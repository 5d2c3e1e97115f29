// A call of each exported function on a short input, for the programs that sweep and stress.
#pragma once

#include "nls2.h"

#include <cstdint>
#include <span>
#include <string>

namespace proof {

// What a call gave back. A positive status is a failure, and then `answer` is the one that the
// function documents for a failure.
struct Outcome {
  int32_t status = 0;
  int64_t answer = 0;
  std::string bytes;

  friend bool operator==(const Outcome &, const Outcome &) = default;
};

struct Call {
  const char *function;
  Outcome (*make)(const NLS2_Locale *in); // any code page; the object is not changed
  int64_t onFailure;                      // the answer with a status above 0
};

// All of them. `in` must be a live object.
std::span<const Call> calls();

// Where the functions that take a directory or a file find one.
void prepareFiles();
void removeFiles();

} // namespace proof
