// How a command gives up: with a message for standard error and an exit code.
#pragma once

#include <stdexcept>

namespace nls2::tool {

enum ExitCode : int {
  exitDone = 0,
  exitFailed = 1, // a record that cannot be translated, or input or output that fails
  exitUsage = 2,  // the command line asks for something that cannot be
  exitNo = 1,     // a command that answers a question: the answer is no
  exitTrouble = 2 // such a command: whatever went wrong
};

struct Failure : std::runtime_error {
  using std::runtime_error::runtime_error;
};

struct UsageError : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// What is a Failure elsewhere, in a command that answers a question.
struct Trouble : std::runtime_error {
  using std::runtime_error::runtime_error;
};

// A command that has told all it had to tell, and ended with this code.
struct AlreadySaid {
  ExitCode code;
};

} // namespace nls2::tool
