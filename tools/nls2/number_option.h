// Options whose values are numbers.
#pragma once

#include <CLI/CLI.hpp>
#include <cstdint>
#include <optional>
#include <string>

namespace nls2::tool {

// A decimal number from `least` to `most`. Leading zeros mean nothing: code page 037 is 37.
CLI::Option *addNumber(CLI::App &command, const std::string &name, int32_t &value, int32_t least,
                       int32_t most, const std::string &description);

// The number that a text is, decimal or hexadecimal after 0x; nothing where it is no number.
std::optional<uint32_t> wholeNumber(const std::string &text);

} // namespace nls2::tool
