// A call of each exported function on a short input, for library_faults and stress.
#pragma once

#include "nls2.h"

#include <string>
#include <vector>

namespace proof {

// A row of calls.cases.
struct Call {
  std::string text;
  std::string onFailure;

  // Makes the call and returns its answer. The word "given" means the object `in`.
  std::string make(NLS2_Locale *in) const;
  // Whether this is the answer after a failure, with a documented status.
  bool isFailure(const std::string &answer) const;
};

const std::vector<Call> &calls();

} // namespace proof
