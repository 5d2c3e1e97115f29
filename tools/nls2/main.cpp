// nls2: the library's work on files, from the command line.

#include "commands.h"
#include "errors.h"
#include "nls2.h"

#include <csignal>
#include <fcntl.h>
#include <fmt/core.h>
#include <new>
#include <unistd.h>

namespace {

using namespace nls2::tool;

// A standard stream that the caller closed must not become a file opened here: its number is taken
// by an open that can do nothing but fail on use.
void occupyStandardStreams() {
  for (const int fd : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (fcntl(fd, F_GETFD) < 0) {
      static_cast<void>(open("/dev/null", fd == STDIN_FILENO ? O_WRONLY : O_RDONLY));
    }
  }
}

// A reader that went away and a full file are write errors, reported like any other.
void turnSignalsIntoErrors() {
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
}

int complain(ExitCode code, const char *message) {
  fmt::print(stderr, "nls2: {}\n", message);
  return code;
}

int run(CLI::App &app, int argc, char **argv) {
  try {
    app.parse(argc, argv);
    return exitDone;
  } catch (const CLI::ParseError &error) {
    return app.exit(error) == 0 ? exitDone : exitUsage;
  } catch (const AlreadySaid &outcome) {
    return outcome.code;
  } catch (const UsageError &error) {
    return complain(exitUsage, error.what());
  } catch (const Trouble &error) {
    return complain(exitTrouble, error.what());
  } catch (const Failure &error) {
    return complain(exitFailed, error.what());
  } catch (const std::bad_alloc &) {
    return complain(exitFailed, "out of memory");
  }
}

int runCommand(int argc, char **argv) {
  CLI::App app{"National-language support from the command line.", "nls2"};
  app.set_version_flag("--version", std::string(NLS2_BuildStamp()));
  app.require_subcommand(1);
  app.failure_message(CLI::FailureMessage::simple);
  app.footer("Exit codes: 0 done, 1 a record or a file failed, 2 the command line is wrong. Of "
             "detect, compare and find, which answer a question: 0 yes, 1 no, 2 trouble.");
  addTranslateCommand(app);
  addLocalesCommand(app);
  addCodepagesCommand(app);
  addDetectCommand(app);
  addCatCommand(app);
  addCompareCommand(app);
  addSortCommand(app);
  addFindCommand(app);
  return run(app, argc, argv);
}

} // namespace

int main(int argc, char **argv) {
  occupyStandardStreams();
  turnSignalsIntoErrors();
  try {
    return runCommand(argc, argv);
  } catch (...) { // standard error itself fails
    return exitFailed;
  }
}
