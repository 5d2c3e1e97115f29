// What --help shows completes in bash, and the manual pages show what the commands do.

#include "support/case_file.h"
#include "tool_runner.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <regex>
#include <set>

namespace tools {

namespace {

// What completes after these words, the last of which is the one at the cursor.
std::vector<std::string> completionsOf(const std::string &words) {
  const TempDir dir;
  writeFile(dir.path("script"), "source " PROJECT "/completions/nls2.bash\nCOMP_WORDS=(nls2 " +
                                    words +
                                    ")\nCOMP_CWORD=$((${#COMP_WORDS[@]} - 1))\n_nls2\n"
                                    "printf '%s\\n' \"${COMPREPLY[@]}\"\n");
  return linesOf(run("bash " + dir.path("script")).out);
}

// What the expression captures in the lines of a help.
std::vector<std::string> entriesOf(const std::string &arguments, const std::regex &entry) {
  std::vector<std::string> found;
  for (const std::string &line : linesOf(run("nls2 " + arguments).out)) {
    if (std::smatch match; std::regex_search(line, match, entry)) {
      found.push_back(match[1]);
    }
  }
  return found;
}

TEST(Completion, OffersWhatHelpShows) {
  const auto commands = entriesOf("--help", std::regex("^  ([a-z]+) "));
  ASSERT_GE(commands.size(), 10U);
  EXPECT_EQ(completionsOf("\"\"").size(), commands.size() + 2); // --help and --version
  for (const std::string &command : commands) {
    EXPECT_EQ(completionsOf(command.substr(0, command.size() - 1)).front(), command);
    const auto options = entriesOf(command + " --help", std::regex("^  (?:-., )?(--[a-z-]+)"));
    EXPECT_EQ(completionsOf(command + " --"), options) << command;
  }
}

TEST(Completion, OffersPagesAndLocales) {
  const std::pair<const char *, const char *> rows[] = {
      {"translate --from cp03", "cp037"},
      {"translate --to = windows-93", "windows-932"},
      {"sort --codepage ibm-114", "ibm-1140"},
      {"cat --encoding UTF-16L", "UTF-16LE"},
      {"codepages Bi", "Big5"},
      {"compare --locale de_B", "de_BE"},
      {"locales pos", "posix"},
      {"translate --write pre", "prefixed:data"},
      {"find --locale = da", "da_DK"},
      {"translate --on-error rej", "reject"},
      {"help tr", "translate"},
      {"sort --read fixed:1 countr", ""}};
  for (const auto &[line, expected] : rows) {
    const auto found = completionsOf(line);
    EXPECT_EQ(std::ranges::count(found, expected), 1) << line;
  }
}

// The text of a page's line without the escapes of its language.
std::string plain(const std::string &line) {
  return std::regex_replace(std::regex_replace(line, std::regex(R"(\\&|\\(?=-))"), ""),
                            std::regex(R"(\\e)"), "\\");
}

TEST(Manual, EveryExampleIsACase) {
  std::set<std::string> scripts;
  for (const std::string &path : support::caseFiles(TOOL_CASES)) {
    for (const std::string &line : linesOf(readFile(path))) {
      scripts.insert(line);
    }
  }
  int examples = 0;
  for (const std::string &line : linesOf(readFile(PROJECT "/docs/nls2.1"))) {
    if (line.starts_with(".Dl ")) {
      EXPECT_TRUE(scripts.contains("$ " + plain(line.substr(4)))) << line;
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
  for (std::string line : linesOf(readFile(PROJECT "/docs/nls2.7"))) {
    if (line == ".Bd -literal" || line == ".Ed") {
      literal = line != ".Ed";
      continue;
    }
    if (!literal) {
      continue;
    }
    const bool joined = line.ends_with('\\');
    line.replace(joined ? line.size() - 1 : line.size(), 1, joined ? "" : "\n");
    line = plain(line);
    const bool begins = line.starts_with("$ ");
    (begins || goesOn ? script : output) += begins ? line.substr(2) : line;
    goesOn = (begins || goesOn) && line.ends_with("\\\n");
  }
  ASSERT_FALSE(output.empty());
  const TempDir dir;
  const Result result = run(script, "", dir.path("."));
  EXPECT_EQ(result.out, output);
  EXPECT_EQ(result.exitCode, 0);
}

} // namespace

} // namespace tools
