// What is left on disk, and on standard output, after success and after failure.

#include "tool_runner.h"

#include <csignal>
#include <filesystem>
#include <gtest/gtest.h>
#include <unistd.h>

namespace tools {

namespace {

using Names = std::vector<std::string>;
namespace fs = std::filesystem;

const std::string translate = "translate --from 37 --to 1208 --record-length 80 --strip ";
constexpr std::size_t recordCount = 40000; // several chunks for every worker

std::string records() { return std::string(recordCount * 80, '\xC1'); }

// Record 30001 has a null inside.
std::string recordsWithBadOne() {
  std::string all = records();
  all[30000 * 80 + 40] = '\0';
  return all;
}

TEST(OutputFile, ARecordThatFailsLeavesTheOldFile) {
  const TempDir dir;
  writeFile(dir.path("in"), recordsWithBadOne());
  writeFile(dir.path("old"), "old");
  for (const char *name : {"old", "new"}) {
    const Result result = runTool(translate + dir.path("in") + " -o " + dir.path(name));
    EXPECT_EQ(result.exitCode, 1);
    EXPECT_EQ(result.out, "");
    EXPECT_NE(result.err.find(dir.path("in") + ": record 30001 at byte 2400000: a null"),
              std::string::npos)
        << result.err;
  }
  EXPECT_EQ(dir.names(), (Names{"in", "old"}));
  EXPECT_EQ(readFile(dir.path("old")), "old");
}

TEST(OutputFile, StandardOutputHasTheRecordsBefore) {
  const Result result = runTool(translate, recordsWithBadOne());
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_TRUE(result.out == std::string(30000 * 80, 'A')) << result.out.size();
}

TEST(OutputFile, ReplacesAndKeepsWhatTheFileWas) {
  const TempDir dir;
  writeFile(dir.path("file"), std::string(80, '\xC1'));
  fs::permissions(dir.path("file"), fs::perms(0640));
  fs::create_symlink("file", dir.path("link"));
  const Result result = runTool(translate + dir.path("file") + " --output " + dir.path("link"));
  EXPECT_EQ(result.exitCode, 0) << result.err;
  EXPECT_EQ(readFile(dir.path("file")), std::string(80, 'A')) << "input and output in one";
  EXPECT_EQ(fs::status(dir.path("file")).permissions(), fs::perms(0640));
  EXPECT_TRUE(fs::is_symlink(dir.path("link")));
  EXPECT_EQ(dir.names(), (Names{"file", "link"}));
}

TEST(OutputFile, TakesTheNameOnlyAtTheEndAndNotAfterASignal) {
  for (const int signal : {SIGTERM, SIGINT, SIGHUP, 0}) {
    const TempDir dir;
    const TempDir streams;
    {
      RunningTool tool(words(translate + "- -o " + dir.path("out")), streams.path("out"),
                       streams.path("err"));
      ASSERT_TRUE(tool.feed(records()));
      EXPECT_EQ(dir.names(), Names{});
      if (signal != 0) {
        kill(tool.pid(), signal);
      }
      EXPECT_EQ(tool.wait(), -signal);
    }
    EXPECT_EQ(dir.names(), signal == 0 ? Names{"out"} : Names{});
  }
}

TEST(OutputFile, ARecordThatFailsIsToldWhileTheInputIsStillOpen) {
  const TempDir dir;
  RunningTool tool(words(translate), dir.path("out"), dir.path("err"));
  ASSERT_TRUE(tool.feed(recordsWithBadOne().substr(29990 * 80, 20 * 80)));
  for (int i = 0; i < 1000 && readFile(dir.path("err")).empty(); ++i) {
    usleep(10000);
  }
  EXPECT_NE(readFile(dir.path("err")).find("record 11 at byte 800"), std::string::npos);
  EXPECT_EQ(tool.wait(), 1);
}

TEST(OutputFile, RecordsComeOutWhileTheInputIsStillOpen) {
  const TempDir dir;
  RunningTool tool(words("translate --from 37 --to 1208 --record-length 2"), dir.path("out"),
                   dir.path("err"));
  ASSERT_TRUE(tool.feed("\xC1\xC2\xC3"));
  for (int i = 0; i < 1000 && readFile(dir.path("out")).empty(); ++i) {
    usleep(10000);
  }
  EXPECT_EQ(readFile(dir.path("out")), "AB");
  ASSERT_TRUE(tool.feed("\xC4"));
  EXPECT_EQ(tool.wait(), 0);
  EXPECT_EQ(readFile(dir.path("out")), "ABCD");
}

TEST(OutputFile, ALinkToNothingStaysOne) {
  const TempDir dir;
  fs::create_symlink("nowhere", dir.path("dangling"));
  const Result result = runTool(translate + "- -o " + dir.path("dangling"));
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_NE(result.err.find("leads nowhere"), std::string::npos) << result.err;
  EXPECT_EQ(dir.names(), Names{"dangling"});
}

TEST(OutputFile, StandardOutputThatFails) {
  const TempDir dir;
  const auto run = [&](const std::string &arguments, const std::string &out) {
    RunningTool tool(words(arguments), out, dir.path("err"));
    tool.feed(std::string(80, '\xC1'));
    return tool.wait();
  };
  EXPECT_EQ(run(translate, "/dev/full"), 1);
  EXPECT_NE(readFile(dir.path("err")).find("standard output: No space left"), std::string::npos);
  EXPECT_EQ(run("locales", "/dev/full"), 1);
  writeFile(dir.path("in"), std::string(80, '\xC1'));
  EXPECT_EQ(run(translate + dir.path("in"), dir.path("in")), 2) << "its own input";
  EXPECT_EQ(readFile(dir.path("in")), std::string(80, '\xC1'));
}

} // namespace

} // namespace tools
