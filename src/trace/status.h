// The one test of a status.
#pragma once

#include <cstdint>

namespace nls2 {

// True for a failure. ICU's warnings are negative and count as success. A UErrorCode will do, too.
constexpr bool failed(int32_t status) { return status > 0; }

} // namespace nls2
