// The work of `nls2 translate`: a file of records, from input to output.
#pragma once

#include "convert/translate_options.h"

namespace nls2::tool {

// The exit code. Throws Error.
int translateFile(const TranslateOptions &options);

} // namespace nls2::tool
