// nls2 translate: bytes in, bytes out, messages and exit codes.

#include "tool_runner.h"

#include <gtest/gtest.h>

namespace tools {

namespace {

const std::string smile = "\xF0\x9F\x98\x80"; // one code point, two UTF-16 units

// One byte of SCSU can be a character that takes more than five bytes in UTF-7.
TEST(Translate, OutputBeyondEveryUsualRatio) {
  const std::string smiles = "\x0B\x01\xEC" + std::string(97, static_cast<char>(0x80));
  std::string expected;
  for (int i = 0; i < 97; ++i) {
    expected += smile;
  }
  for (const char *padding : {"", " --strip", " --keep-blanks"}) {
    const Result wide = runTool(
        std::string("translate --from 57363 --to 57366 --record-length 100") + padding, smiles);
    EXPECT_GT(wide.out.size(), 4 * smiles.size() + 64) << wide.err;
    const Result back = runTool("translate --from 57366 --to 1208 --record-length " +
                                    std::to_string(wide.out.size()),
                                wide.out);
    EXPECT_EQ(back.out, expected) << padding;
  }
}

TEST(Translate, UsageErrors) {
  const struct {
    const char *arguments;
    const char *err;
  } cases[] = {
      {"", "subcommand"},
      {"nonsense", "subcommand"},
      {"translate --to 37 --record-length 1", "--from"},
      {"translate --from 37 --record-length 1", "--to"},
      {"translate --from 37 --to 1208", "--record-length"},
      {"translate --from 37 --to 1208 --record-length 0", "\"0\" is not a number from 1"},
      {"translate --from 37 --to 1208 --record-length 8k", "\"8k\" is not a number"},
      {"translate --from 37 --to 1208 --record-length 99999999999", "is not a number"},
      {"translate --from 37 --to 1208 --record-length 1 --out-length 0", "--out-length"},
      {"translate --from ibm-37 --to 1208 --record-length 1", "\"ibm-37\" is not a number"},
      {"translate --from 57355 --to 1208 --record-length 1",
       "--from: code page 57355 does not open: U_FILE_ACCESS_ERROR (4); `nls2 codepages`"},
      {"translate --from 37 --to 0 --record-length 1", "--to: code page 0 does not open"},
      {"translate --from 37 --to -5 --record-length 1", "--to: code page -5 does not open"},
      {"translate --from 37 --to 1208 --record-length 1 --fill", "--out-length"},
      {"translate --from 37 --to 1208 --record-length 1 --fill --out-length 1 --strip", "--strip"},
      {"translate --from 37 --to 1208 --record-length 1 --keep-blanks --strip", "--strip"},
      {"translate --from 37 --to 1208 --record-length 1 --newline crlf", "crlf"},
      {"translate --from 37 --to 1208 --record-length 1 --wrong", "--wrong"},
      {"translate --from 37 --to 1208 --record-length 1 in out", "out"},
      {"locales en_US extra", "extra"},
  };
  for (const auto &c : cases) {
    const Result result = runTool(std::string(c.arguments));
    EXPECT_EQ(result.exitCode, 2) << c.arguments;
    EXPECT_EQ(result.out, "") << c.arguments;
    EXPECT_NE(result.err.find(c.err), std::string::npos) << c.arguments << "\n" << result.err;
  }
}

} // namespace

} // namespace tools
