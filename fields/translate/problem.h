// How a translation ends.
#pragma once

#include "nls2_fields.h"

namespace zelfields {

struct Done {
  int64_t written = 0;
  int64_t replaced = 0;
};

// Fills in a problem that has no place yet. False, as those who fail return.
inline bool fail(NLS2F_Problem &problem, int32_t kind, int64_t needed = 0) {
  const uint32_t size = problem.size;
  problem = {};
  problem.size = size;
  problem.kind = kind;
  problem.needed = needed;
  return false;
}

} // namespace zelfields
