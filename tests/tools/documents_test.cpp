// What --help shows completes in bash, and the manual pages show what the commands do.

#include "support/case_file.h"
#include "tool_runner.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <regex>
#include <set>
#include <sstream>

namespace tools {

namespace {

std::vector<std::string> linesOf(const std::string &text) {
  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) {
    lines.push_back(line);
  }
  return lines;
}

// What completes after these words, the last of which is the one at the cursor.
std::vector<std::string> completionsOf(const std::string &words) {
  const TempDir dir;
  writeFile(dir.path("script"), "source " COMPLETION "\nCOMP_WORDS=(nls2 " + words +
                                    ")\nCOMP_CWORD=$((${#COMP_WORDS[@]} - 1))\n_nls2\n"
                                    "printf '%s\\n' \"${COMPREPLY[@]}\"\n");
  return linesOf(runShell("bash " + dir.path("script"), "", ".").out);
}

// The first words of lines that begin with two blanks: commands, operands and options.
std::vector<std::string> entriesOf(const std::string &help, const std::regex &entry) {
  std::vector<std::string> found;
  for (const std::string &line : linesOf(help)) {
    if (std::smatch match; std::regex_search(line, match, entry)) {
      found.push_back(match[1]);
    }
  }
  return found;
}

TEST(Completion, OffersWhatHelpShows) {
  const auto commands = entriesOf(runTool("--help").out, std::regex("^  ([a-z]+) "));
  ASSERT_GE(commands.size(), 10U);
  EXPECT_EQ(completionsOf("\"\"").size(), commands.size() + 2); // --help and --version
  for (const std::string &command : commands) {
    EXPECT_EQ(completionsOf(command.substr(0, command.size() - 1)).front(), command);
    const std::string help = runTool(command + " --help").out;
    const auto options = entriesOf(help, std::regex("^  (?:-., )?(--[a-z-]+)"));
    EXPECT_EQ(completionsOf(command + " --"), options) << command;
  }
}

TEST(Completion, OffersPagesAndLocales) {
  const std::vector<std::pair<std::string, std::string>> rows{
      {"translate --from cp03", "cp037"},      {"translate --to = windows-93", "windows-932"},
      {"sort --codepage ibm-114", "ibm-1140"}, {"cat --encoding UTF-16L", "UTF-16LE"},
      {"dump --from ibm-3", "ibm-37"},         {"codepages BI", "BIG5"},
      {"compare --locale de_B", "de_BE"},      {"locales pos", "posix"},
      {"translate --newline n", "none nel"},   {"translate --on-error re", "replace reject"},
      {"find --locale = da", "da_DK"},         {"help tr", "translate"},
      {"sort --record-length 1 countr", ""}};
  for (const auto &[line, expected] : rows) {
    const auto found = completionsOf(line);
    for (const std::string &word : words(expected)) {
      EXPECT_EQ(std::count(found.begin(), found.end(), word), 1) << line;
    }
    EXPECT_EQ(found.front().empty(), expected.empty()) << line;
  }
}

// The text of a ".Dl" line without the escapes of the page's language.
std::string plain(const std::string &line) {
  return std::regex_replace(std::regex_replace(line, std::regex(R"(\\&|\\(?=-))"), ""),
                            std::regex(R"(\\e)"), "\\");
}

TEST(Manual, EveryExampleIsACase) {
  std::set<std::string> cases;
  for (const std::string &path : support::caseFiles(TOOL_CASES)) {
    for (const std::string &line : linesOf(readFile(path))) {
      if (line.starts_with("run ")) {
        cases.insert("nls2 " + line.substr(4));
      } else if (line.starts_with("shell ")) {
        cases.insert(line.substr(6));
      }
    }
  }
  int examples = 0;
  for (const std::string &line : linesOf(readFile(MANUAL))) {
    if (line.starts_with(".Dl ")) {
      EXPECT_TRUE(cases.contains(plain(line.substr(4)))) << line;
      ++examples;
    }
  }
  EXPECT_GE(examples, 8);
}

// In literal blocks, "$ " begins a command, and what follows is its output. \e is a backslash, at
// whose end a command goes on; a backslash alone joins two lines.
TEST(Manual, ShowsWhatTheCommandsOfItsWorkedExampleDo) {
  std::string script = "exec 2>&1\n";
  std::string output;
  bool literal = false;
  bool goesOn = false;
  for (std::string line : linesOf(readFile(TOOL_MANUALS "/nls2.7"))) {
    if (line == ".Bd -literal" || line == ".Ed") {
      literal = line != ".Ed";
      continue;
    }
    if (!literal) {
      continue;
    }
    const bool joined = line.ends_with('\\');
    line.replace(joined ? line.size() - 1 : line.size(), 1, joined ? "" : "\n");
    line = std::regex_replace(line, std::regex(R"(\\e)"), "\\");
    const bool begins = line.starts_with("$ ");
    (begins || goesOn ? script : output) += begins ? line.substr(2) : line;
    goesOn = (begins || goesOn) && line.ends_with("\\\n");
  }
  ASSERT_FALSE(output.empty());
  const TempDir dir;
  const Result result = runShell(script, "", dir.path("."));
  EXPECT_EQ(result.out, output);
  EXPECT_EQ(result.exitCode, 0);
}

} // namespace

} // namespace tools
