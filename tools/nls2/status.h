// Statuses of the library in words.
#pragma once

#include <cstdint>
#include <string>

namespace nls2::tool {

// "U_BUFFER_OVERFLOW_ERROR (15)", "NLS2_ERR_INVALID_PARAMETER (37)".
std::string statusName(int32_t status);

// What a caller of the tool can do about it; empty where there is nothing to say.
std::string statusAdvice(int32_t status);

} // namespace nls2::tool
