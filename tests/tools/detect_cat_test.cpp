// nls2 detect and nls2 cat.

#include "tool_runner.h"

#include <cstdlib>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace tools {

namespace {

#define BYTES(literal) std::string(literal, sizeof(literal) - 1)

TEST(Detect, NamesSignatureAndLengthOfEveryFile) {
  const TempDir dir;
  const std::string utf16 = dir.path("utf16");
  const std::string plain = dir.path("plain");
  const std::string missing = dir.path("missing");
  writeFile(utf16, BYTES("\xFF\xFE"
                         "A\0"));
  writeFile(plain, "A");
  const struct {
    const char *reason;
    std::vector<std::string> files;
    int exitCode;
    std::string out;
    bool complains;
  } cases[] = {
      {"found", {utf16}, 0, utf16 + ": UTF-16LE, 2 bytes\n", false},
      {"not found", {plain}, 1, plain + ": no signature\n", false},
      {"an empty file", {"/dev/null"}, 1, "/dev/null: no signature\n", false},
      {"standard input", {"-"}, 0, "-: UTF-8, 3 bytes\n", false},
      {"one of two",
       {plain, utf16},
       1,
       plain + ": no signature\n" + utf16 + ": UTF-16LE, 2 bytes\n",
       false},
      {"a missing one does not hide the next",
       {missing, utf16, plain},
       2,
       utf16 + ": UTF-16LE, 2 bytes\n" + plain + ": no signature\n",
       true},
      {"no file", {}, 2, "", true},
  };
  for (const auto &c : cases) {
    std::vector<std::string> arguments{"detect"};
    arguments.insert(arguments.end(), c.files.begin(), c.files.end());
    const Result result = runTool(arguments, "\xEF\xBB\xBF");
    EXPECT_EQ(result.exitCode, c.exitCode) << c.reason;
    EXPECT_EQ(result.out, c.out) << c.reason;
    EXPECT_EQ(!result.err.empty(), c.complains) << c.reason << ": " << result.err;
  }
}

TEST(Detect, AsJsonWhateverTheFilesName) {
  const TempDir dir;
  const std::string odd = dir.path("\xFF");
  writeFile(odd, BYTES("\0\0\xFE\xFF"));
  const Result result = runTool({"detect", "--json", odd, "/dev/null"});
  EXPECT_EQ(result.exitCode, 1);
  const nlohmann::json rows = nlohmann::json::parse(result.out);
  ASSERT_EQ(rows.size(), 2U);
  EXPECT_EQ(rows[0]["encoding"], "UTF-32BE");
  EXPECT_EQ(rows[0]["signatureLength"], 4);
  EXPECT_EQ(rows[1]["encoding"], nullptr);
  EXPECT_EQ(rows[1]["signatureLength"], 0);
}

TEST(Cat, WritesUtf8) {
  const struct {
    const char *reason;
    std::string encoding;
    std::string input;
    std::string out;
  } cases[] = {
      {"EBCDIC, new line and line feed kept apart", "ibm-1141", "\xC7\xD0\xA1\x15\x25",
       "G\xC3\xBC\xC3\x9F\xC2\x85\n"},
      {"marks taken off", "UTF-16", BYTES("\xFE\xFF\0A\xD8\x3D\xDE\x00"), "A\xF0\x9F\x98\x80"},
      {"nulls and line ends stay", "utf8", BYTES("a\0\r\n\0b\r"), BYTES("a\0\r\n\0b\r")},
      {"single byte", "latin1", "\xE4\r\n", "\xC3\xA4\r\n"},
      {"nothing", "UTF-8", "", ""},
  };
  const TempDir dir;
  for (const auto &c : cases) {
    writeFile(dir.path("in"), c.input);
    for (const std::string &file : {dir.path("in"), std::string("-")}) {
      const Result result = runTool({"cat", "--encoding", c.encoding, file}, c.input);
      EXPECT_EQ(result.exitCode, 0) << c.reason << result.err;
      EXPECT_EQ(result.out, c.out) << c.reason << " " << file;
    }
  }
}

// Pairs at every position of a chunk's end, and far more than one chunk.
TEST(Cat, PairsCutAtAChunksEndComeOutWhole) {
  std::string text;
  for (int i = 0; i < 40000; ++i) {
    text += i % 5 == 0 ? "a\xF0\x9F\x98\x80" : "\xF0\x9F\x98\x80";
  }
  for (const std::string prefix : {"", "b"}) {
    const Result result = runTool("cat --encoding UTF-8 -", prefix + text);
    EXPECT_EQ(result.exitCode, 0) << result.err;
    EXPECT_TRUE(result.out == prefix + text) << prefix;
  }
}

TEST(Cat, Failures) {
  const TempDir dir;
  const struct {
    std::string encoding;
    std::string file;
    int exitCode;
    std::string out;
    const char *message;
  } cases[] = {
      {"UTF-8", dir.path("missing"), 1, "", "No such file"},
      {"UTF-8", "/", 1, "", "Is a directory"},
      {"no-such", "-", 2, "", "U_FILE_ACCESS_ERROR (4)"},
      {"", "-", 2, "", "a name is needed"},
      {"UTF-8", "-", 1, "x\xEF\xBF\xBDy\xEF\xBF\xBD", "2 byte sequences are no text of UTF-8"},
  };
  for (const auto &c : cases) {
    const Result result = runTool({"cat", "--encoding", c.encoding, c.file}, "x\xFFy\xE2\x82");
    EXPECT_EQ(result.exitCode, c.exitCode) << c.message;
    EXPECT_EQ(result.out, c.out) << c.message;
    EXPECT_NE(result.err.find(c.message), std::string::npos) << result.err;
  }
}

// No object can be made under a default locale that the library does not know.
TEST(Cat, AnyDefaultLocaleWillDo) {
  setenv("LC_ALL", "nb_NO.UTF-8", 1);
  const Result result = runTool("cat --encoding UTF-8 -", "text");
  unsetenv("LC_ALL");
  EXPECT_EQ(result.exitCode, 0) << result.err;
  EXPECT_EQ(result.out, "text");
}

} // namespace

} // namespace tools
