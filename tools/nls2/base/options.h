// The command line: tables of options and operands, and their parser.
#pragma once

#include "base/errors.h"
#include "base/printable.h"

#include <charconv>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <limits>
#include <optional>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

namespace nls2::tool {

// Takes the value of an option or operand. May throw usageError; is called only after all required
// options and operands were found.
using Take = std::function<void(const std::string &)>;

struct Option {
  const char *name;    // without the two dashes
  const char *metavar; // of the value; null for a flag, whose `take` gets ""
  const char *help;
  Take take;
  char letter = '\0'; // of the short form, if it has one
  bool isRequired = false;
};

inline Option flag(const char *name, const char *help, Take take, char letter = '\0') {
  return {name, nullptr, help, std::move(take), letter};
}

inline Option value(const char *name, const char *metavar, const char *help, Take take,
                    char letter = '\0') {
  return {name, metavar, help, std::move(take), letter};
}

inline Option required(Option option) {
  option.isRequired = true;
  return option;
}

// Arguments that are not options, in the order of the table.
struct Operand {
  static constexpr std::size_t anyNumber = std::numeric_limits<std::size_t>::max();

  const char *metavar;
  const char *help;
  Take take;
  std::size_t least = 0;
  std::size_t most = 1;
};

struct Command {
  std::vector<Operand> operands = {};
  std::vector<Option> options = {};
  const char *notes = "";   // of --help, at most six lines
  std::function<int()> run; // the exit code; throws Error
};

Command catCommand();
Command codepagesCommand();
Command compareCommand();
Command detectCommand();
Command dumpCommand();
Command findCommand();
Command localesCommand();
Command sortCommand();
Command translateCommand();

// An entry in the list of commands.
struct CommandEntry {
  const char *name;
  const char *summary;
  Command (*make)();
  ExitCode failureCode = exitFailed; // 2 for a command whose 1 means "no"
};

// What the command line requests.
enum class Request { work, help, version };

// Parses the arguments (argv[0] is the command's name) and hands the values to the tables. Throws
// usageError for the first error found: unknown options and missing values, then the number of
// operands, then missing options, then the values in the order given.
Request parse(const Command &command, int argc, char **argv);

std::string helpOf(const CommandEntry &entry, const Command &command);
std::string helpLine(const std::string &what, const char *help);

// Reads a decimal number (never octal) or 0x...; nothing if the text is anything else.
template <typename Number = uint32_t>
std::optional<Number> wholeNumber(std::string_view text) {
  const bool isHex = text.starts_with("0x") || text.starts_with("0X");
  text.remove_prefix(isHex ? 2 : 0);
  Number number = 0;
  const char *end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number, isHex ? 16 : 10);
  return error == std::errc() && stop == end ? std::optional(number) : std::nullopt;
}

// Throws usageError with the name of the option.
template <typename Number>
Number parseNumber(const char *option, const std::string &text, Number least, Number most) {
  const auto number = wholeNumber<Number>(text);
  if (!number || *number < least || *number > most) {
    throw usageError("{}: \"{}\" is not a number from {} to {}", option, printable(text), least,
                     most);
  }
  return *number;
}

template <typename Number>
Option numberValue(const char *name, const char *metavar, const char *help, Number &number,
                   std::type_identity_t<Number> least, std::type_identity_t<Number> most) {
  return value(name, metavar, help, [=, &number](const std::string &text) {
    number = parseNumber<Number>(fmt::format("--{}", name).c_str(), text, least, most);
  });
}

// Stores the value, appends it to a list, or sets a flag.
template <class Value>
Take into(Value &value) {
  return [&value](const std::string &text) {
    if constexpr (std::is_same_v<Value, bool>) {
      value = true;
    } else if constexpr (std::is_same_v<Value, std::vector<std::string>>) {
      value.push_back(text);
    } else {
      value = text;
    }
  };
}

} // namespace nls2::tool
