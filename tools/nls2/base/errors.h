// How a command gives up: one exception, with an exit code and a message for standard error.
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

// A text that cannot be used. The message goes after the text's place: ", column 3: ..." or
// ": ...".
class TextFault : public Error {
public:
  explicit TextFault(const std::string &text) : Error(exitFailed, text) {}
};

// A status of the library or of ICU in words.
inline std::string statusText(int32_t status) { return category().message(status); }

// Throws where ICU failed: std::bad_alloc without memory, else Error, which says what could not be
// done.
inline void requireSuccess(UErrorCode status, const char *what) {
  if (status == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  if (U_FAILURE(status)) {
    throw failure("cannot {}: {}", what, statusText(status));
  }
}

// A message of the command on standard error. Allocates nothing.
inline void complain(const char *text) noexcept { std::fprintf(stderr, "nls2: %s\n", text); }

} // namespace nls2::tool
