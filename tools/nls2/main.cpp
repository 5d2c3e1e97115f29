// The command nls2: finds the command to run, and turns failures into messages and exit codes.

#include "base/errors.h"
#include "base/icu_memory.h"
#include "base/near_names.h"
#include "base/options.h"
#include "io/output_file.h"
#include "nls2.h"

#include <algorithm>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <fcntl.h>
#include <iterator>
#include <memory>
#include <new>
#include <string_view>
#include <unistd.h>

namespace nls2::tool {

namespace {

constexpr CommandEntry commands[] = {
    {"translate", "Translate records or lines to another code page", translateCommand},
    {"locales", "List the locales that the library knows", localesCommand},
    {"codepages", "Show code pages, their names and their charts", codepagesCommand},
    {"detect", "Report the Unicode signatures of files", detectCommand, exitUsage},
    {"dump", "Show a file in hex and as text of a code page", dumpCommand},
    {"cat", "Write text files in any encoding to standard output as UTF-8", catCommand, exitUsage},
    {"compare", "Compare two strings by the rules of a language", compareCommand, exitUsage},
    {"sort", "Sort lines or fixed-length records by the rules of a language", sortCommand},
    {"find", "Print the lines that contain a text", findCommand, exitUsage}};

int failureCode = exitFailed; // of the command that runs

// If the caller closed a standard stream, opens something in its place that fails, so that a file
// opened later does not become that stream.
void occupyStandardStreams() {
  for (const int fd : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (fcntl(fd, F_GETFD) < 0) {
      static_cast<void>(open("/dev/null", fd == STDIN_FILENO ? O_WRONLY : O_RDONLY));
    }
  }
}

const CommandEntry *commandNamed(std::string_view name) {
  const auto *found = std::ranges::find(commands, name, &CommandEntry::name);
  return found == std::end(commands) ? nullptr : found;
}

Error unknownCommand(const std::string &name) {
  std::vector<std::string> names{"help"};
  for (const CommandEntry &entry : commands) {
    names.emplace_back(entry.name);
  }
  return usageError("unknown command {}{}", printable(name), didYouMean(nearNames(name, names)));
}

std::string generalHelp() {
  std::string text = "Usage: nls2 COMMAND [OPTION]... [OPERAND]...\n"
                     "National-language support from the command line.\n\n";
  for (const CommandEntry &entry : commands) {
    text += helpLine(entry.name, entry.summary);
  }
  return text + helpLine("help [COMMAND]", "Print this help, or the help of a command") +
         helpLine("-h, --help", "Print this help; after COMMAND, its help") +
         helpLine("--version", "Print the library's build stamp") +
         "\nExit codes: 0 success, 1 a record or file failed, 2 wrong usage. For detect, compare and\n"
         "find, which answer a question: 0 yes, 1 no, 2 error.\nSee nls2(1).\n";
}

std::string helpOn(const CommandEntry *entry) {
  return entry != nullptr ? helpOf(*entry, entry->make()) : generalHelp();
}

// Runs `nls2 help`; reports options without a command and unknown commands.
Command generalCommand(const std::string &first) {
  if (first.starts_with("-")) {
    return {.run = []() -> int { throw usageError("COMMAND is missing"); }};
  }
  if (first != "help") {
    throw unknownCommand(first);
  }
  const auto topic = std::make_shared<std::string>();
  return {.operands = {{"COMMAND", "", into(*topic)}}, .run = [topic] {
            const CommandEntry *entry = commandNamed(*topic);
            if (entry == nullptr && !topic->empty() && *topic != "help") {
              throw unknownCommand(*topic);
            }
            return print(helpOn(entry));
          }};
}

int runCommand(const CommandEntry *entry, int argc, char **argv) {
  const std::string first = argc > 1 ? argv[1] : "-";
  const int own = first.starts_with("-") ? 0 : 1; // words that belong to nls2 itself
  const Command command = entry != nullptr ? entry->make() : generalCommand(first);
  switch (parse(command, argc - own, argv + own)) {
  case Request::help:
    return print(helpOn(entry));
  case Request::version:
    return print(fmt::format("{}\n", NLS2_BuildStamp()));
  default:
    return command.run();
  }
}

// Turns failures into messages and exit codes. After a failed allocation ICU's reports cannot be
// trusted.
int run(const CommandEntry *entry, int argc, char **argv) noexcept {
  try {
    try {
      const int code = runCommand(entry, argc, argv);
      requireMemory();
      return code;
    } catch (const Error &error) {
      requireMemory();
      if (error.code() == exitUsage) {
        std::fprintf(stderr, "nls2: %s; see nls2%s%s --help\n", error.what(),
                     entry != nullptr ? " " : "", entry != nullptr ? entry->name : "");
        return exitUsage;
      }
      complain(error.what());
    }
  } catch (const std::bad_alloc &) {
    complain("out of memory");
  } catch (const std::exception &error) {
    complain(error.what());
  }
  return failureCode;
}

// Without this the process would abort if there is no memory even for an exception.
void endWithoutMemory() {
  if (!std::current_exception()) {
    complain("out of memory");
    _exit(failureCode);
  }
  std::abort();
}

} // namespace

} // namespace nls2::tool

int main(int argc, char **argv) {
  nls2::tool::occupyStandardStreams();
  std::signal(SIGXFSZ, SIG_IGN); // a file that is too large is then a write error like any other
  std::set_terminate(nls2::tool::endWithoutMemory);
  nls2::tool::giveIcuReserve();
  const auto *entry = argc > 1 ? nls2::tool::commandNamed(argv[1]) : nullptr;
  nls2::tool::failureCode = entry != nullptr ? entry->failureCode : nls2::tool::exitFailed;
  return nls2::tool::run(entry, argc, argv);
}
