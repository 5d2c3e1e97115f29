// The default trace facility, set up by environment variables.

#include "nls2.h"
#include "trc1.h"

#include <array>
#include <cstdio>
#include <fstream>
#include <gmock/gmock.h>
#include <latch>
#include <string>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace {

using testing::MatchesRegex;

const std::string path = testing::TempDir() + "zelhost_trace_" + std::to_string(getpid());

TRC1_UnitBlock unit = {};
uint32_t syncWord = 7;
TRC1_EntryBlock anchor = {&unit, "Example", 7, 30, &syncWord, TRC1_ENTRY_EXPORTED, 0, 0, {0, 0}};

void callLibrary() {
  int32_t status = 0;
  NLS2_MapWindowsNameToCCSID("windows-936", &status);
}

// Everything that the library may call, called directly.
void callHost() {
  TRC1_Printf(&anchor, 31, "%s, %d\n", "two\nlines", -5);
  TRC1_Event(&anchor, 32, TRC1_EVENT_EXIT_VALUE, 0xFFFFFFFDU);
  TRC1_Event(&anchor, 33, TRC1_EVENT_EXIT);
  TRC1_Dump(&anchor, 34, "\x00\x7F\xFF", 3, 0);
}

void callFromThreads() {
  std::latch allAreReady(8);
  std::vector<std::jthread> threads;
  for (const char letter : std::string("abcdefgh")) {
    threads.emplace_back([letter, &allAreReady] {
      const std::string text(3000, letter);
      allAreReady.arrive_and_wait();
      for (int i = 0; i < 200; ++i) {
        TRC1_Printf(&anchor, 40, "%s\n", text.c_str());
      }
    });
  }
}

// If a thread is cancelled while it writes a line, other threads can still write.
void callCancelled() {
  alarm(30); // if the stream stayed locked, the next line would wait for ever
  std::jthread([] {
    pthread_cancel(pthread_self());
    TRC1_Printf(&anchor, 50, "held back\n");
    pthread_testcancel();
    TRC1_Printf(&anchor, 51, "not cancelled\n");
  }).join();
  TRC1_Printf(&anchor, 52, "next\n");
}

using Action = void (*)();

// Runs the action in a process with these settings (null: unset). Returns everything that it writes:
// the trace flags and then the trace.
std::string run(const char *trace, const char *file, Action action) {
  std::array<int, 2> ends{};
  EXPECT_EQ(pipe(ends.data()), 0);
  const pid_t child = fork();
  if (child == 0) {
    dup2(ends[1], 1);
    dup2(ends[1], 2);
    trace == nullptr ? unsetenv("ZELHOST_TRACE") : setenv("ZELHOST_TRACE", trace, 1);
    file == nullptr ? unsetenv("ZELHOST_TRACE_FILE") : setenv("ZELHOST_TRACE_FILE", file, 1);
    const uint32_t flags = TRC1_Sync(&anchor);
    std::printf("%X %X %u\n", flags, anchor.cachedFlags, anchor.cachedSync);
    std::fflush(stdout);
    action();
    std::fflush(nullptr);
    _exit(0);
  }
  close(ends[1]);
  std::string text;
  for (char c = 0; read(ends[0], &c, 1) == 1;) {
    text.push_back(c);
  }
  close(ends[0]);
  int status = -1;
  EXPECT_TRUE(waitpid(child, &status, 0) == child && status == 0);
  return text;
}

std::string contentOfFile() {
  std::string text;
  std::getline(std::ifstream(path), text, '\0');
  std::remove(path.c_str());
  return text;
}

// Every line begins with the time and the thread.
const std::string head =
    "[0-9]{4}-[0-9]{2}-[0-9]{2}T[0-9]{2}:[0-9]{2}:[0-9]{2}\\.[0-9]{6}Z [0-9]+ ";
const std::string name = head + "NLS2_MapWindowsNameToCCSID:[0-9]+ ";
const std::string entry = name + "entry\n";
const std::string leave = name + "exit 936 \\(0x000003A8\\)\n";
const std::string off = "0 0 7\n"; // the flags, the stored flags and the stored sync word
const std::string events = "40 40 7\n";
const std::string locate = name + "Locate matching windows codepage name to windows-936\\.\n";
const std::string found = name + "Found matching name windows-936 in the table\\.\n";

TEST(Trace, FollowsTheEnvironment) {
  const struct {
    const char *reason;
    const char *trace, *file;
    Action action;
    std::string output;
  } rows[] = {
      {"off by default", nullptr, nullptr, callLibrary, off},
      {"empty is off", "", nullptr, callLibrary, off},
      {"events alone", "events", nullptr, callLibrary, events + entry + leave},
      {"details alone", "detail", nullptr, callLibrary, "10 10 7\n" + locate + found},
      {"all", "all", nullptr, callLibrary, "50 50 7\n" + entry + locate + found + leave},
      {"a wrong request is reported and off", "everything", nullptr, callLibrary,
       "zelhost: ZELHOST_TRACE is \"everything\"; it may be events, detail or all\n" + off},
      {"a file alone asks for nothing", nullptr, "/dev/full", callLibrary, off},
      {"an empty file name is standard error", "events", "", callLibrary, events + entry + leave},
      {"a file that does not open is reported, and standard error takes its place", "events",
       "/nonexistent/t", callLibrary,
       "zelhost: cannot open ZELHOST_TRACE_FILE \"/nonexistent/t\": No such file or directory\n" +
           events + entry + leave},
      {"one line each: text, signed value, exit without one, dump", "all", nullptr, callHost,
       "50 50 7\n" + head + "Example:31 two lines, -5\n" + head +
           "Example:32 exit -3 \\(0xFFFFFFFD\\)\n" + head + "Example:33 exit\n" + head +
           "Example:34 dump of 3 bytes at 0x[0-9a-f]+: 00 7F FF\n"},
      {"a cancelled thread ends its line, and others go on", "detail", nullptr, callCancelled,
       "10 10 7\n" + head + "Example:50 held back\n" + head + "Example:52 next\n"},
  };
  for (const auto &row : rows) {
    EXPECT_THAT(run(row.trace, row.file, row.action), MatchesRegex(row.output)) << row.reason;
  }
}

TEST(Trace, AppendsToItsFile) {
  std::ofstream(path) << "before\n";
  EXPECT_EQ(run("events", path.c_str(), callLibrary), events);
  EXPECT_THAT(contentOfFile(), MatchesRegex("before\n" + entry + leave));
}

TEST(Trace, LinesOfThreadsDoNotMix) {
  run("all", path.c_str(), callFromThreads);
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
