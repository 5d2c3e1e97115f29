// The default trace facility, as a program's environment asks for it.

#include <cstdio>
#include <fstream>
#include <gmock/gmock.h>
#include <string>
#include <sys/wait.h>
#include <unistd.h>

namespace {

using testing::MatchesRegex;

const std::string path = testing::TempDir() + "zelhost_trace_" + std::to_string(getpid());

// Both standard streams of the program under these settings, and nothing else from outside.
std::string run(const std::string &environment, const std::string &action) {
  const std::string command = "env -u ZELHOST_TRACE -u ZELHOST_TRACE_FILE " + environment +
                              " '" TRACED_PROGRAM "' " + action + " 2>&1";
  FILE *output = popen(command.c_str(), "r");
  std::string text;
  for (int c = std::fgetc(output); c != EOF; c = std::fgetc(output)) {
    text.push_back(static_cast<char>(c));
  }
  EXPECT_EQ(WEXITSTATUS(pclose(output)), 0) << command;
  return text;
}

std::string contentOfFile() {
  std::ifstream file(path);
  std::string text;
  std::getline(file, text, '\0');
  std::remove(path.c_str());
  return text;
}

// Time and thread, as every line begins.
const std::string head =
    "[0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9]{2}:[0-9]{2}:[0-9]{2}\\.[0-9]{6}Z [0-9]+ ";
const std::string name = head + "NLS2_MapWindowsNameToCCSID:[0-9]+ ";
const std::string entry = name + "entry\n";
const std::string leave = name + "exit 936 \\(0x000003A8\\)\n";
const std::string off = "0 0 7\n"; // the flags, and those that are stored with the sync word
const std::string events = "40 40 7\n";
const std::string locate = name + "Locate matching windows codepage name to windows-936\\.\n";
const std::string found = name + "Found matching name windows-936 in the table\\.\n";

TEST(Trace, FollowsTheEnvironment) {
  const struct {
    const char *reason;
    std::string environment, action, output;
  } rows[] = {
      {"off by default", "", "library", off},
      {"empty is off", "ZELHOST_TRACE=", "library", off},
      {"events alone", "ZELHOST_TRACE=events", "library", events + entry + leave},
      {"details alone", "ZELHOST_TRACE=detail", "library", "10 10 7\n" + locate + found},
      {"all", "ZELHOST_TRACE=all", "library", "50 50 7\n" + entry + locate + found + leave},
      {"a wrong request is reported and off", "ZELHOST_TRACE=everything", "library",
       "zelhost: ZELHOST_TRACE is \"everything\"; it may be events, detail or all\n" + off},
      {"a file alone asks for nothing", "ZELHOST_TRACE_FILE=/dev/full", "library", off},
      {"an empty file name is standard error",
       "ZELHOST_TRACE=events ZELHOST_TRACE_FILE=", "library", events + entry + leave},
      {"a file that does not open is reported, and standard error takes its place",
       "ZELHOST_TRACE=events ZELHOST_TRACE_FILE=/nonexistent/t", "library",
       "zelhost: cannot open ZELHOST_TRACE_FILE \"/nonexistent/t\": No such file or directory\n" +
           events + entry + leave},
      {"one line each: text, signed value, exit without one, dump", "ZELHOST_TRACE=all", "host",
       "50 50 7\n" + head + "Example:31 two lines, -5\n" + head +
           "Example:32 exit -3 \\(0xFFFFFFFD\\)\n" + head + "Example:33 exit\n" + head +
           "Example:34 dump of 3 bytes at 0x[0-9a-f]+: 00 7F FF\n"},
      {"a cancelled thread ends its line, and others go on", "ZELHOST_TRACE=detail", "cancelled",
       "10 10 7\n" + head + "Example:50 held back\n" + head + "Example:52 next\n"},
  };
  for (const auto &row : rows) {
    EXPECT_THAT(run(row.environment, row.action), MatchesRegex(row.output)) << row.reason;
  }
}

TEST(Trace, AppendsToItsFile) {
  std::ofstream(path) << "before\n";
  EXPECT_EQ(run("ZELHOST_TRACE=events ZELHOST_TRACE_FILE='" + path + "'", "library"), events);
  EXPECT_THAT(contentOfFile(), MatchesRegex("before\n" + entry + leave));
}

TEST(Trace, LinesOfThreadsDoNotMix) {
  run("ZELHOST_TRACE=all ZELHOST_TRACE_FILE='" + path + "'", "threads");
  std::istringstream lines(contentOfFile());
  int count = 0;
  for (std::string line; std::getline(lines, line); ++count) {
    const size_t text = line.find(" Example:40 ");
    ASSERT_EQ(line.size(), text + 12 + 3000) << line;
    ASSERT_EQ(line.substr(text + 12), std::string(3000, line.back()));
  }
  EXPECT_EQ(count, 1600);
}

} // namespace
