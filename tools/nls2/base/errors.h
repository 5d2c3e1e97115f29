// How a command fails: with one exception that has an exit code and a message.
#pragma once

#include "nls2/error.hpp"

#include <cstdint>
#include <cstdio>
#include <fmt/core.h>
#include <new>
#include <stdexcept>
#include <string>
#include <unicode/utypes.h>
#include <utility>

namespace nls2::tool {

// For a command that answers a question, 1 means "no" and every failure ends it with 2.
enum ExitCode : int { exitDone = 0, exitFailed = 1, exitUsage = 2 };

// Ends a command. exitFailed becomes 2 if the command answers a question.
class Error : public std::runtime_error {
public:
  Error(ExitCode code, const std::string &text) : std::runtime_error(text), code_(code) {}

  ExitCode code() const noexcept { return code_; }

private:
  ExitCode code_;
};

// The work failed: throw failure("...", ...).
template <typename... Arguments>
Error failure(fmt::format_string<Arguments...> format, Arguments &&...arguments) {
  return {exitFailed, fmt::format(format, std::forward<Arguments>(arguments)...)};
}

// The command line is wrong: throw usageError("...", ...). main appends "see nls2 ... --help".
template <typename... Arguments>
Error usageError(fmt::format_string<Arguments...> format, Arguments &&...arguments) {
  return {exitUsage, fmt::format(format, std::forward<Arguments>(arguments)...)};
}

// A text that cannot be used. The caller puts the place of the text before the message, which
// begins with ", column 3: " or ": ".
class TextFault : public Error {
public:
  explicit TextFault(const std::string &text) : Error(exitFailed, text) {}
};

// The message of a status of the library or of ICU.
inline std::string statusText(int32_t status) { return category().message(status); }

// Writes a message to standard error. Allocates nothing.
inline void complain(const char *text) noexcept { std::fprintf(stderr, "nls2: %s\n", text); }

} // namespace nls2::tool
