// The default trace facility, as a program's environment asks for it.

#include <cstdio>
#include <fstream>
#include <gtest/gtest.h>
#include <regex.h>
#include <string>
#include <sys/wait.h>
#include <vector>

namespace {

std::string traceFile() {
  return testing::TempDir() + "zelhost_trace_" + std::to_string(getpid()) + ".log";
}

std::vector<std::string> linesOf(FILE *stream) {
  std::vector<std::string> lines(1);
  for (int c = std::fgetc(stream); c != EOF; c = std::fgetc(stream)) {
    if (c == '\n') {
      lines.emplace_back();
    } else {
      lines.back().push_back(static_cast<char>(c));
    }
  }
  if (lines.back().empty()) {
    lines.pop_back();
  } else {
    lines.back() += "(no newline)";
  }
  return lines;
}

// Both standard streams of the program under these settings, and nothing else from outside.
std::vector<std::string> run(const std::string &environment, const std::string &action) {
  const std::string command = "env -u ZELHOST_TRACE -u ZELHOST_TRACE_FILE " + environment +
                              " '" TRACED_PROGRAM "' " + action;
  FILE *output = popen((command + " 2>&1").c_str(), "r");
  std::vector<std::string> lines = linesOf(output);
  EXPECT_EQ(WEXITSTATUS(pclose(output)), 0) << command;
  return lines;
}

std::vector<std::string> contentOf(const std::string &path) {
  FILE *file = std::fopen(path.c_str(), "r");
  if (file == nullptr) {
    return {"(no file)"};
  }
  std::vector<std::string> lines = linesOf(file);
  std::fclose(file);
  return lines;
}

bool matches(const std::string &line, const std::string &pattern) {
  regex_t compiled;
  if (regcomp(&compiled, ("^(" + pattern + ")$").c_str(), REG_EXTENDED | REG_NOSUB) != 0) {
    return false;
  }
  const bool found = regexec(&compiled, line.c_str(), 0, nullptr, 0) == 0;
  regfree(&compiled);
  return found;
}

void expectMatches(const std::vector<std::string> &lines,
                   const std::vector<std::string> &patterns) {
  EXPECT_EQ(lines.size(), patterns.size()) << testing::PrintToString(lines);
  for (size_t i = 0; i < lines.size() && i < patterns.size(); ++i) {
    EXPECT_TRUE(matches(lines[i], patterns[i])) << lines[i] << "\ndoes not match\n" << patterns[i];
  }
}

// Time and thread, as every line begins.
const std::string head =
    "[0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9]{2}:[0-9]{2}:[0-9]{2}\\.[0-9]{6}Z [0-9]+ ";
const std::string name = head + "NLS2_MapWindowsNameToCCSID:[0-9]+ ";
const std::string entry = name + "entry";
const std::string leave = name + R"(exit 936 \(0x000003A8\))";
const std::string locate = name + "Locate matching windows codepage name to windows-936\\.";
const std::string found = name + "Found matching name windows-936 in the table\\.";

const struct {
  const char *reason;
  std::string environment;
  std::string action;
  std::vector<std::string> lines;
} rows[] = {
    {"off by default", "", "library", {}},
    {"an empty request is none", "ZELHOST_TRACE=", "library", {}},
    {"events alone", "ZELHOST_TRACE=events", "library", {entry, leave}},
    {"details alone", "ZELHOST_TRACE=detail", "library", {locate, found}},
    {"all, in the order of the calls",
     "ZELHOST_TRACE=all",
     "library",
     {entry, locate, found, leave}},
    {"a wrong request is told and off",
     "ZELHOST_TRACE=everything",
     "library",
     {"zelhost: ZELHOST_TRACE is \"everything\"; it may be events, detail or all"}},
    {"a file alone asks for nothing", "ZELHOST_TRACE_FILE=/dev/full", "library", {}},
    {"a file that does not open is told, and standard error takes its place",
     "ZELHOST_TRACE=events ZELHOST_TRACE_FILE=/nonexistent/t",
     "library",
     {"zelhost: cannot open ZELHOST_TRACE_FILE \"/nonexistent/t\": No such file or directory",
      entry, leave}},
    {"one line each: text, signed value, exit without one, dump",
     "ZELHOST_TRACE=all",
     "host",
     {head + "Example:31 two lines, -5", head + R"(Example:32 exit -3 \(0xFFFFFFFD\))",
      head + "Example:33 exit", head + "Example:34 dump of 3 bytes at 0x[0-9a-f]+: 00 7F FF"}},
    {"flags when off, stored with the sync word", "", "flags", {"0 0 7"}},
    {"flags of events", "ZELHOST_TRACE=events", "flags", {"40 40 7"}},
    {"flags of details", "ZELHOST_TRACE=detail", "flags", {"10 10 7"}},
};

} // namespace

TEST(Trace, FollowsTheEnvironment) {
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    expectMatches(run(row.environment, row.action), row.lines);
  }
}

TEST(Trace, AppendsToItsFile) {
  const std::string path = traceFile();
  std::ofstream(path) << "before\n";
  const std::string environment = "ZELHOST_TRACE=events ZELHOST_TRACE_FILE='" + path + "'";
  expectMatches(run(environment, "library"), {});
  expectMatches(contentOf(path), {"before", entry, leave});
  std::remove(path.c_str());
}

TEST(Trace, LinesOfThreadsDoNotMix) {
  const std::string path = traceFile();
  run("ZELHOST_TRACE=all ZELHOST_TRACE_FILE='" + path + "'", "threads");
  const std::vector<std::string> lines = contentOf(path);
  std::remove(path.c_str());
  EXPECT_EQ(lines.size(), 1600U);
  for (const std::string &line : lines) {
    const size_t text = line.find(" Example:40 ");
    ASSERT_EQ(line.size(), text + 12 + 3000) << line;
    ASSERT_EQ(line.substr(text + 12), std::string(3000, line.back()));
  }
}
