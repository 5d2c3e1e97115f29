// The command line: commands as tables of options and operands, and the parser that reads them.
#pragma once

#include "errors.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <limits>
#include <optional>
#include <string>
#include <vector>

namespace nls2::tool {

// What receives the value of an option or operand. It may throw usageError, after the whole command
// line was found complete.
using Take = std::function<void(const std::string &)>;

struct Option {
  const char *name = "";         // without its two dashes
  char letter = '\0';            // of the short form; none by default
  const char *metavar = nullptr; // of the value; null for a flag, whose `take` gets an empty text
  const char *help = "";
  Take take;
  bool isRequired = false;
};

// Arguments that are not options, taken in the order of the table.
struct Operand {
  static constexpr std::size_t anyNumber = std::numeric_limits<std::size_t>::max();

  const char *metavar = "";
  const char *help = "";
  Take take;
  std::size_t least = 0;
  std::size_t most = 1;
};

struct Command {
  std::vector<Operand> operands;
  std::vector<Option> options;
  const char *notes = "";   // of --help, at most six lines
  std::function<int()> run; // the exit code; throws Error
};

// What stands in the list of commands.
struct CommandEntry {
  const char *name;
  const char *summary;
  ExitCode failureCode; // 2 for a command whose 1 means "no"
  Command (*make)();
};

// What a command line asks for.
enum class Request { work, help, version };

// Hands the arguments (argv[0] is the command's own name) to the command's tables. Throws
// usageError for the first fault: an unknown option, a missing value, an operand too many or too
// few, a missing option, and then values in the order in which they were given.
Request parse(const Command &command, int argc, char **argv);

std::string helpOf(const CommandEntry &entry, const Command &command);

// Values. `option` is what messages name.
int32_t parseNumber(const char *option, const std::string &text, int32_t least, int32_t most);
std::optional<uint32_t> wholeNumber(const std::string &text); // decimal or 0x...; never octal

Take into(std::string &value);
Take into(std::vector<std::string> &values);
Take into(bool &flag);

} // namespace nls2::tool
