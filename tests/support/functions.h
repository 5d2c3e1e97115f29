// Every function of the library by its name, called with words.
#pragma once

#include "support/words.h"

namespace support {

using Functions = std::map<std::string, std::string (*)(const Words &)>;

// The call returns its answer. The names are those that the functions have in traces; beside them
// stands "lengths-by-byte".
const Functions &functions();

} // namespace support
