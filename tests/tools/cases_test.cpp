// Runs of nls2, as the *.cases files of this folder have them (see support/case_file.h). Keys:
//   run ARGUMENTS    of nls2, split at blanks; "" is an empty one
//   shell LINE       in place of run: for sh, with nls2 in its path and faults.c as $FAULTS
//   example WHERE    run is an example of the manual page
//   in BYTES         standard input; several add up, as for out
//   out BYTES        standard output, whole
//   has BYTES        standard output, a part of it, in place of out
//   err BYTES        standard error, a part of it; without any it is empty
//   exit CODE        0 by default; negative: the signal that ends it
//   LC_ALL NAME      the locale; en_US.UTF-8 by default
//   file NAME BYTES  a file that is there before, and as it was afterwards
//   left NAME BYTES  a file that is there afterwards; no others are
//   gone NAME        a file that was there before and is not afterwards

#include "support/case_file.h"
#include "tool_runner.h"

#include <cstdlib>
#include <filesystem>
#include <gtest/gtest.h>
#include <map>

namespace tools {

namespace {

using support::CaseLine;

const std::vector<std::string> keys{"run", "shell", "example", "in",   "out",  "has",
                                    "err", "exit",  "LC_ALL",  "file", "left", "gone"};

struct Run {
  std::vector<std::string> arguments;
  std::string shell;
  std::string input;
  std::string locale = "en_US.UTF-8";
  int exitCode = 0;
  std::string out;
  std::vector<std::string> has;
  std::vector<std::string> err;
  std::map<std::string, std::string> before;
  std::map<std::string, std::string> after;

  void read(const CaseLine &line);
};

std::vector<std::string> argumentsOf(const CaseLine &line) {
  std::vector<std::string> arguments;
  for (const std::string &word : words(line.value)) {
    arguments.push_back(word == "\"\"" ? "" : CaseLine{line.key, word, line.place}.bytes());
  }
  return arguments;
}

void Run::read(const CaseLine &line) {
  if (line.key == "run") {
    arguments = argumentsOf(line);
  } else if (line.key == "shell") {
    shell = line.value;
  } else if (line.key == "in") {
    input += line.bytes();
  } else if (line.key == "out") {
    out += line.bytes();
  } else if (line.key == "has" || line.key == "err") {
    (line.key == "has" ? has : err).push_back(line.bytes());
  } else if (line.key == "exit") {
    exitCode = static_cast<int>(line.number());
  } else if (line.key == "LC_ALL") {
    locale = line.value;
  } else if (line.key == "gone") {
    after.erase(line.value);
  } else if (line.key == "file" || line.key == "left") {
    const auto [escaped, bytes] = line.firstWord();
    const std::string name = CaseLine{line.key, escaped, line.place}.bytes();
    after[name] = bytes.bytes();
    if (line.key == "file") {
      before[name] = after[name];
    }
  }
}

void expectParts(const std::vector<std::string> &parts, const std::string &text) {
  for (const std::string &part : parts) {
    EXPECT_NE(text.find(part), std::string::npos) << part << "\nis not in\n" << text;
  }
}

void runCase(const support::Case &each) {
  SCOPED_TRACE(each.place + ": " + each.why);
  Run run;
  for (const CaseLine &line : each.lines) {
    run.read(line);
  }
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__) || defined(EMULATED)
  if (run.shell.find("$FAULTS") != std::string::npos ||
      run.shell.find("ulimit -v") != std::string::npos) {
    return; // a sanitizer or an emulator must come first, and takes much address space
  }
#endif
  ASSERT_TRUE(run.out.empty() || run.has.empty()) << "out and has cannot be combined";
  const TempDir dir;
  for (const auto &[name, bytes] : run.before) {
    writeFile(dir.path(name), bytes);
  }
  setenv("LC_ALL", run.locale.c_str(), 1);
  const Result result = run.shell.empty() ? runTool(run.arguments, run.input, dir.path("."))
                                          : runShell(run.shell, run.input, dir.path("."));
  EXPECT_EQ(result.exitCode, run.exitCode) << result.err;
  if (run.has.empty()) {
    EXPECT_EQ(result.out, run.out);
  }
  expectParts(run.has, result.out);
  EXPECT_EQ(result.err.empty(), run.err.empty()) << result.err;
  expectParts(run.err, result.err);
  std::map<std::string, std::string> left;
  for (const std::string &name : dir.names()) {
    left[name] = readFile(dir.path(name));
  }
  EXPECT_EQ(left, run.after);
}

class Cases : public testing::TestWithParam<std::string> {};

TEST_P(Cases, AnswerAsTheFileHasThem) {
  for (const support::Case &each : support::readCases(GetParam(), keys)) {
    runCase(each);
  }
}

INSTANTIATE_TEST_SUITE_P(Of, Cases, testing::ValuesIn(support::caseFiles(TOOL_CASES)),
                         [](const auto &file) {
                           return std::filesystem::path(file.param).stem().string();
                         });

} // namespace

} // namespace tools
