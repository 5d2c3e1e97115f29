// Runs of nls2, as the *.cases files of this folder have them (see support/case_file.h). Keys:
//   $ SCRIPT          a line for sh; several are one script
//   row SCRIPT => OUT one of several scripts that begin with the $ lines, each with its output:
//                     standard output and error together, without "nls2: standard input: ", the last
//                     newline, and the command that a message recommends
//   in BYTES          standard input; several add up, as for out
//   out BYTES         standard output, whole
//   has BYTES         standard output, a part of it, in place of out
//   err BYTES         standard error, a part of it; without any it is empty
//   exit CODE         0 by default; of every row
//   LC_ALL NAME       the locale; en_US.UTF-8 by default
//   file NAME BYTES   a file that is there before, and as it was afterwards
//   left NAME BYTES   a file that is there afterwards; no others are
//   gone NAME         a file that was there before and is not afterwards

#include "support/case_file.h"
#include "tool_runner.h"

#include <gtest/gtest.h>
#include <map>
#include <regex>

namespace tools {

namespace {

using support::CaseLine;

const std::vector<std::string> keys{"$",    "row",    "in",   "out",  "has", "err",
                                    "exit", "LC_ALL", "file", "left", "gone"};

struct Run {
  std::string script;
  std::vector<CaseLine> rows;
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

void Run::read(const CaseLine &line) {
  if (line.key == "$") {
    script += line.value + "\n";
  } else if (line.key == "row") {
    rows.push_back(line);
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
  } else {
    const auto [name, bytes] = line.firstWord();
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

void runScript(const Run &run, const TempDir &dir) {
  ASSERT_TRUE(run.out.empty() || run.has.empty()) << "out and has exclude each other";
  const Result result = tools::run(run.script, run.input, dir.path("."));
  EXPECT_EQ(result.exitCode, run.exitCode) << result.err;
  if (run.has.empty()) {
    EXPECT_EQ(result.out, run.out);
  }
  expectParts(run.has, result.out);
  EXPECT_EQ(result.err.empty(), run.err.empty()) << result.err;
  expectParts(run.err, result.err);
}

void runRow(const Run &run, const CaseLine &row, const TempDir &dir) {
  static const std::regex frame(
      "^(nls2: )?(standard input: )?|(; `nls2 [^;]*)?(; see nls2[^;]*)?\n$");
  const auto [script, expected] = row.split(" => ");
  const Result result = tools::run(run.script + script, run.input, dir.path("."));
  EXPECT_EQ(std::regex_replace(result.out + result.err, frame, ""), expected.bytes()) << row.place;
  EXPECT_EQ(result.exitCode, run.exitCode) << row.place << ": " << script;
}

void runCase(const support::Case &each) {
  SCOPED_TRACE(each.place + ": " + each.why);
  Run run;
  for (const CaseLine &line : each.lines) {
    run.read(line);
  }
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__) || defined(EMULATED)
  if (std::regex_search(run.script, std::regex("FAULTS|ulimit -v"))) {
    return; // a sanitizer or an emulator must come first, and takes much address space
  }
#endif
  const TempDir dir;
  for (const auto &[name, bytes] : run.before) {
    writeFile(dir.path(name), bytes);
  }
  setenv("LC_ALL", run.locale.c_str(), 1);
  if (run.rows.empty()) {
    runScript(run, dir);
  }
  for (const CaseLine &row : run.rows) {
    runRow(run, row, dir);
  }
  std::map<std::string, std::string> left;
  for (const auto &entry : fs::directory_iterator(dir.path("."))) {
    left[entry.path().filename()] = readFile(entry.path());
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
                         [](const auto &file) { return fs::path(file.param).stem().string(); });

} // namespace

} // namespace tools
