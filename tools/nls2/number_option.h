// Options whose values are numbers.
#pragma once

#include <CLI/CLI.hpp>
#include <cstdint>
#include <string>

namespace nls2::tool {

// A decimal number from `least` to `most`. Leading zeros mean nothing: code page 037 is 37.
CLI::Option *addNumber(CLI::App &command, const std::string &name, int32_t &value, int32_t least,
                       int32_t most, const std::string &description);

} // namespace nls2::tool
