// How a command gives up: one exception, with an exit code and a message for standard error.
#pragma once

#include <cstdint>
#include <fmt/core.h>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

namespace nls2::tool {

// Of a command that answers a question, 1 is "no", and a failure ends it with 2 as well.
enum ExitCode : int { exitDone = 0, exitFailed = 1, exitUsage = 2 };

// Ends a command. Code exitFailed becomes 2 where the command answers a question.
class Error : public std::runtime_error {
public:
  Error(ExitCode code, const std::string &text) : std::runtime_error(text), code_(code) {}

  ExitCode code() const noexcept { return code_; }

private:
  ExitCode code_;
};

// What went wrong while the work was done: throw failure("...", ...).
template <typename... Arguments>
Error failure(fmt::format_string<Arguments...> format, Arguments &&...arguments) {
  return {exitFailed, fmt::format(format, std::forward<Arguments>(arguments)...)};
}

// What the command line asks for cannot be: throw usageError("...", ...). main adds where to look.
template <typename... Arguments>
Error usageError(fmt::format_string<Arguments...> format, Arguments &&...arguments) {
  return {exitUsage, fmt::format(format, std::forward<Arguments>(arguments)...)};
}

// Why a piece of the input cannot be used; nothing where it can.
using Refusal = std::optional<std::string>;

// A status of the library or of ICU in words.
std::string statusText(int32_t status);

// A file name for a message: its control characters are escaped.
std::string printable(std::string_view name);

// A message of the command on standard error. Allocates nothing.
void complain(const char *text) noexcept;

} // namespace nls2::tool
