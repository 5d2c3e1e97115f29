// nls2: the library's work on files, from the command line.

#include "commands.h"
#include "io/print.h"
#include "memory.h"
#include "near_names.h"
#include "nls2.h"

#include <algorithm>
#include <array>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <fcntl.h>
#include <new>
#include <string_view>
#include <unistd.h>

namespace nls2::tool {

namespace {

constexpr std::array commands{
    CommandEntry{"translate", "Translate fixed-length records to another code page", exitFailed,
                 translateCommand},
    CommandEntry{"locales", "List the locales that the library knows", exitFailed, localesCommand},
    CommandEntry{"codepages", "List code pages by number and by Windows name", exitFailed,
                 codepagesCommand},
    CommandEntry{"detect", "Report the Unicode signatures of files", exitUsage, detectCommand},
    CommandEntry{"dump", "Show a file in hex and as text of a code page", exitFailed, dumpCommand},
    CommandEntry{"cat", "Write text files in any encoding to standard output as UTF-8", exitFailed,
                 catCommand},
    CommandEntry{"compare", "Compare two strings by the rules of a language", exitUsage,
                 compareCommand},
    CommandEntry{"sort", "Sort lines or fixed-length records by the rules of a language",
                 exitFailed, sortCommand},
    CommandEntry{"find", "Print the lines in which a text occurs", exitUsage, findCommand}};

constexpr const char *outOfMemory = "out of memory";

int failureCode = exitFailed; // of the command

constexpr const char *generalNotes =
    "Exit codes: 0 done, 1 a record or a file failed, 2 the command line is wrong. Of detect,\n"
    "compare and find, which answer a question: 0 yes, 1 no, 2 trouble.\nSee nls2(1).\n";

// A standard stream that the caller closed must not become a file opened here: its descriptor is
// taken by an open file that can only fail.
void occupyStandardStreams() {
  for (const int fd : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (fcntl(fd, F_GETFD) < 0) {
      static_cast<void>(open("/dev/null", fd == STDIN_FILENO ? O_WRONLY : O_RDONLY));
    }
  }
}

const CommandEntry *commandNamed(std::string_view name) {
  const auto found = std::find_if(commands.begin(), commands.end(),
                                  [=](const CommandEntry &entry) { return name == entry.name; });
  return found == commands.end() ? nullptr : &*found;
}

Error unknownCommand(const std::string &name) {
  std::vector<std::string> names{"help"};
  for (const CommandEntry &entry : commands) {
    names.emplace_back(entry.name);
  }
  return usageError("unknown command {}{}", printable(name), didYouMean(nearNames(name, names)));
}

std::string versionText() { return std::string(NLS2_BuildStamp()) + "\n"; }

std::string generalHelp() {
  std::string text = "Usage: nls2 COMMAND [OPTION]... [OPERAND]...\n"
                     "National-language support from the command line.\n\n";
  for (const CommandEntry &entry : commands) {
    text += helpLine(entry.name, entry.summary);
  }
  return text + helpLine("help [COMMAND]", "Print this help, or that of a command") +
         helpLine("-h, --help", "Print this help, or a command's after its name") +
         helpLine("--version", "Print how the library was built") + "\n" + generalNotes;
}

// Options before the command, `nls2 help`, or nothing at all.
int runWithoutCommand(int argc, char **argv) {
  const std::string first = argc > 1 ? argv[1] : "-";
  const bool isHelp = first == "help";
  std::string topic;
  Command general;
  if (isHelp) {
    general.operands.push_back({"COMMAND", "", into(topic)});
  } else if (!first.starts_with("-")) {
    throw unknownCommand(first);
  }
  const Request request = parse(general, isHelp ? argc - 1 : argc, isHelp ? argv + 1 : argv);
  const CommandEntry *entry = commandNamed(topic);
  if (!isHelp && request == Request::work) {
    throw usageError("COMMAND is missing");
  }
  if (entry == nullptr && !topic.empty()) {
    throw unknownCommand(topic);
  }
  print(request == Request::version ? versionText()
        : entry != nullptr          ? helpOf(*entry, entry->make())
                                    : generalHelp());
  return exitDone;
}

int runCommand(const CommandEntry &entry, int argc, char **argv) {
  const Command command = entry.make();
  const Request request = parse(command, argc, argv);
  if (request == Request::work) {
    return command.run();
  }
  print(request == Request::help ? helpOf(entry, command) : versionText());
  return exitDone;
}

int report(const CommandEntry *entry, const Error &error) {
  requireMemory();
  if (error.code() != exitUsage) {
    complain(error.what());
    return failureCode;
  }
  std::fprintf(stderr, "nls2: %s; see nls2%s%s --help\n", error.what(), entry != nullptr ? " " : "",
               entry != nullptr ? entry->name : "");
  return exitUsage;
}

// The one place where failures become messages and exit codes. What ICU reports without memory is
// not to be believed.
int run(const CommandEntry *entry, int argc, char **argv) noexcept {
  try {
    try {
      const int code =
          entry != nullptr ? runCommand(*entry, argc - 1, argv + 1) : runWithoutCommand(argc, argv);
      requireMemory();
      return code;
    } catch (const Error &error) {
      return report(entry, error);
    }
  } catch (const std::bad_alloc &) {
    complain(outOfMemory);
  } catch (const std::exception &error) {
    complain(error.what());
  }
  return failureCode;
}

// Without memory for an exception the process would be aborted.
void endWithoutMemory() {
  if (!std::current_exception()) {
    complain(outOfMemory);
    _exit(failureCode);
  }
  std::abort();
}

} // namespace

} // namespace nls2::tool

int main(int argc, char **argv) {
  nls2::tool::occupyStandardStreams();
  std::signal(SIGXFSZ, SIG_IGN); // a full file is a write error, reported like any other
  std::set_terminate(nls2::tool::endWithoutMemory);
  nls2::tool::watchMemory();
  const auto *entry = argc > 1 ? nls2::tool::commandNamed(argv[1]) : nullptr;
  nls2::tool::failureCode = entry != nullptr ? entry->failureCode : nls2::tool::exitFailed;
  return nls2::tool::run(entry, argc, argv);
}
