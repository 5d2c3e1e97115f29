// Parses options and operands, and writes --help.

#include "base/options.h"

#include "base/near_names.h"

#include <algorithm>
#include <getopt.h>
#include <utility>

namespace nls2::tool {

namespace {

// getopt_long returns this plus the index of a long option, and a short option as its letter.
constexpr int firstLong = 256;

const Option helpOption = flag("help", "print this help", {}, 'h');
const Option versionOption = flag("version", "print the library's build stamp", {});

using Given = std::vector<std::pair<const Option *, std::string>>;

// The options of a command in the form that getopt_long needs.
class Getopt {
public:
  explicit Getopt(const Command &command) {
    for (const Option &each : command.options) {
      add(each);
    }
    add(helpOption);
    add(versionOption);
    long_.push_back({});
  }

  // The next option, its value in optarg; null when only operands are left. Throws usageError.
  const Option *next(int argc, char **argv) {
    switch (const int code = getopt_long(argc, argv, letters_.c_str(), long_.data(), nullptr)) {
    case -1:
      return nullptr;
    case ':':
      throw usageError("--{} needs a value: {}", optionOf(optopt).name, optionOf(optopt).metavar);
    case '?':
      throw unknown(optopt, argv[optind - 1]);
    default:
      return &optionOf(code);
    }
  }

private:
  void add(const Option &added) {
    const int takesValue = added.metavar != nullptr ? required_argument : no_argument;
    long_.push_back(
        {added.name, takesValue, nullptr, firstLong + static_cast<int>(options_.size())});
    options_.push_back(&added);
    if (added.letter != '\0') {
      letters_.append(1, added.letter).append(takesValue != 0 ? ":" : "");
    }
  }

  const Option &optionOf(int code) const {
    if (code >= firstLong) {
      return *options_[static_cast<std::size_t>(code - firstLong)];
    }
    return **std::ranges::find(options_, code, &Option::letter);
  }

  // `code` is the unknown letter, or the long option that got a value it does not take; 0 for an
  // unknown long option. `word` is the argument.
  Error unknown(int code, const std::string &word) const {
    if (code >= firstLong) {
      return usageError("--{} takes no value", optionOf(code).name);
    }
    const std::string letter(code != 0 ? 1 : 0, static_cast<char>(code));
    const std::string name = code != 0 ? "-" + letter : word.substr(0, word.find('='));
    std::vector<std::string> names;
    std::vector<std::string> longer;
    for (const Option *option : options_) {
      names.push_back(std::string("--") + option->name);
      if (names.back().starts_with(code != 0 ? "--" + letter : name)) {
        longer.push_back(names.back());
      }
    }
    const bool isLong = code == 0;
    if (isLong && longer.size() > 1) {
      return usageError("option {} is ambiguous{}", printable(name), didYouMean(longer));
    }
    return usageError("unknown option {}{}", printable(name),
                      didYouMean(isLong && longer.empty() ? nearNames(name, names) : longer));
  }

  std::vector<const Option *> options_;
  std::vector<option> long_;
  std::string letters_ = ":"; // so that getopt_long tells a missing value from an unknown option
};

void checkOperands(const Command &command, int count, char **operands) {
  auto left = static_cast<std::size_t>(count);
  const Operand *missing = nullptr;
  for (const Operand &operand : command.operands) {
    if (missing == nullptr && left < operand.least) {
      missing = &operand;
    }
    left -= std::min(left, operand.most);
  }
  if (left > 0) {
    throw usageError("extra operand {}",
                     printable(operands[static_cast<std::size_t>(count) - left]));
  }
  if (missing != nullptr) {
    throw usageError("{} is missing", missing->metavar);
  }
}

void checkRequired(const Command &command, const Given &given) {
  for (const Option &option : command.options) {
    if (option.isRequired &&
        std::ranges::find(given, &option, &Given::value_type::first) == given.end()) {
      throw usageError("--{} {} is missing", option.name, option.metavar);
    }
  }
}

std::string usageOf(const char *name, const Command &command) {
  std::string text = fmt::format("Usage: nls2 {}", name);
  for (const Option &option : command.options) {
    text += option.isRequired ? fmt::format(" --{} {}", option.name, option.metavar) : "";
  }
  text += " [OPTION]...";
  for (const Operand &operand : command.operands) {
    const char *more = operand.most == Operand::anyNumber ? "..." : "";
    text += operand.least == 0 ? fmt::format(" [{}]{}", operand.metavar, more)
                               : fmt::format(" {}{}", operand.metavar, more);
  }
  return text + "\n";
}

std::string optionLine(const Option &option) {
  std::string what = option.letter != '\0' ? fmt::format("-{}, ", option.letter) : "";
  what += fmt::format("--{}", option.name);
  return helpLine(option.metavar != nullptr ? what + " " + option.metavar : what, option.help);
}

} // namespace

std::string helpLine(const std::string &what, const char *help) {
  return fmt::format("  {:<24} {}\n", what, help);
}

Request parse(const Command &command, int argc, char **argv) {
  Getopt getopt(command);
  Given given;
  while (const Option *option = getopt.next(argc, argv)) {
    if (option == &helpOption || option == &versionOption) {
      return option == &helpOption ? Request::help : Request::version;
    }
    given.emplace_back(option, optarg != nullptr ? optarg : "");
  }
  char **operands = argv + optind;
  checkOperands(command, argc - optind, operands);
  checkRequired(command, given);
  for (const auto &[option, value] : given) {
    option->take(value);
  }
  for (const Operand &operand : command.operands) {
    for (std::size_t i = 0; i < operand.most && operands != argv + argc; ++i) {
      operand.take(*operands++);
    }
  }
  return Request::work;
}

std::string helpOf(const CommandEntry &entry, const Command &command) {
  std::string text = usageOf(entry.name, command) + entry.summary + ".\n\n";
  for (const Operand &operand : command.operands) {
    text += helpLine(operand.metavar, operand.help);
  }
  for (const Option &option : command.options) {
    text += optionLine(option);
  }
  text += optionLine(helpOption) + optionLine(versionOption) + "\n";
  return text + command.notes + "See nls2(1).\n";
}

} // namespace nls2::tool
