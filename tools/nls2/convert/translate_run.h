// The work of `nls2 translate`: a file of records, from input to output.
#pragma once

#include "convert/record_translator.h"

#include <string>

namespace nls2::tool {

// "-" is standard input or output. Throws Error.
void translateFile(const TranslateOptions &options, const std::string &inputPath,
                   const std::string &outputPath);

} // namespace nls2::tool
