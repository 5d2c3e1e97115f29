// How a command gives up: with a message for standard error and an exit code.
#pragma once

#include <stdexcept>

namespace nls2::tool {

enum ExitCode : int {
  exitDone = 0,
  exitFailed = 1,  // a record that cannot be translated, or input or output that fails
  exitUsage = 2,   // the command line asks for something that cannot be
  exitNotFound = 3 // nothing failed, but what was looked for is not there
};

struct Failure : std::runtime_error {
  using std::runtime_error::runtime_error;
};

struct UsageError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// A command that has told all it had to tell, and ended with this code.
struct AlreadySaid {
  ExitCode code;
};

} // namespace nls2::tool
