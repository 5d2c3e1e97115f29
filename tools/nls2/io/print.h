// Text on standard output, for commands that write it at once.
#pragma once

#include "io/output_file.h"
#include "memory.h"

namespace nls2::tool {

// Writes all of it. Throws Error.
inline void print(std::string_view text) {
  requireMemory();
  OutputFile out("-");
  out.write(text);
  out.commit();
}

} // namespace nls2::tool
