// Numbers on the command line. Not CLI11's own reading of integers, to which 037 is octal.

#include "number_option.h"

#include <charconv>
#include <fmt/core.h>

namespace nls2::tool {

CLI::Option *addNumber(CLI::App &command, const std::string &name, int32_t &value, int32_t least,
                       int32_t most, const std::string &description) {
  const auto parse = [=, &value](const std::string &text) {
    const char *end = text.data() + text.size();
    int32_t number = 0;
    const auto [stop, error] = std::from_chars(text.data(), end, number);
    if (error != std::errc() || stop != end || number < least || number > most) {
      throw CLI::ValidationError(
          name, fmt::format("\"{}\" is not a number from {} to {}", text, least, most));
    }
    value = number;
  };
  return command.add_option_function<std::string>(name, parse, description)->type_name("NUMBER");
}

std::optional<uint32_t> wholeNumber(const std::string &text) {
  const bool hexadecimal = text.rfind("0x", 0) == 0 || text.rfind("0X", 0) == 0;
  const char *start = text.data() + (hexadecimal ? 2 : 0);
  const char *end = text.data() + text.size();
  uint32_t number = 0;
  const auto [stop, error] = std::from_chars(start, end, number, hexadecimal ? 16 : 10);
  return error == std::errc() && stop == end ? std::optional(number) : std::nullopt;
}

} // namespace nls2::tool
