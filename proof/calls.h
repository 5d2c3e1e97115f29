// A call of each exported function on a short input, for the programs that sweep and stress.
#pragma once

#include "nls2.h"

#include <string>
#include <vector>

namespace proof {

// A row of calls.cases.
struct Call {
  std::string text;
  std::string onFailure;

  // The answer. `in` is the object that the word "given" stands for.
  std::string make(NLS2_Locale *in) const;
  // Whether it is the answer of a failure, with a status that the header documents.
  bool isFailure(const std::string &answer) const;
};

const std::vector<Call> &calls();

} // namespace proof
