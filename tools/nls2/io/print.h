// Text on standard output, for commands that write it at once.
#pragma once

#include <string_view>

namespace nls2::tool {

// Writes all of it. Throws Error.
void print(std::string_view text);

} // namespace nls2::tool
