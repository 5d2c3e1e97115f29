// The worked example of nls2(7) does what the page shows.

#include "tool_runner.h"

#include <gtest/gtest.h>
#include <sstream>

namespace tools {

namespace {

// In literal blocks, "$ " begins a command, and what follows is its output. \e is a backslash, at
// whose end a command goes on; a backslash alone joins two lines.
TEST(Manual, ShowsWhatItsCommandsDo) {
  std::istringstream page(readFile(TOOL_MANUALS "/nls2.7"));
  std::string script = "exec 2>&1\n";
  std::string output;
  bool literal = false;
  bool goesOn = false;
  for (std::string line; std::getline(page, line);) {
    if (line == ".Bd -literal" || line == ".Ed") {
      literal = line != ".Ed";
      continue;
    }
    if (!literal) {
      continue;
    }
    const bool joined = line.ends_with('\\');
    line.replace(joined ? line.size() - 1 : line.size(), 1, joined ? "" : "\n");
    for (std::size_t at = line.find("\\e"); at != std::string::npos; at = line.find("\\e", at)) {
      line.replace(at, 2, "\\");
    }
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
