// nls2 translate: bytes in, bytes out, messages and exit codes.

#include "tool_runner.h"

#include <algorithm>
#include <bit>
#include <gtest/gtest.h>

using namespace std::string_literals;

namespace tools {

namespace {

// UTF-16 or UTF-32 in the machine's byte order, as ICU writes it behind a signature.
std::string native(std::string bigEndian, std::size_t unit) {
  if (std::endian::native == std::endian::little) {
    for (std::size_t i = 0; i < bigEndian.size(); i += unit) {
      std::reverse(bigEndian.begin() + static_cast<std::ptrdiff_t>(i),
                   bigEndian.begin() + static_cast<std::ptrdiff_t>(i + unit));
    }
  }
  return bigEndian;
}

struct Case {
  const char *why;
  std::string arguments; // behind "translate --record-length"
  std::string input;
  int exitCode;
  std::string out;
  std::string err; // occurs in standard error, which is empty where this is
};

void check(const std::vector<Case> &cases) {
  for (const Case &c : cases) {
    SCOPED_TRACE(std::string(c.why) + ": " + c.arguments);
    const Result result = runTool("translate --record-length " + c.arguments, c.input);
    EXPECT_EQ(result.exitCode, c.exitCode) << result.err;
    EXPECT_EQ(result.out, c.out);
    EXPECT_EQ(result.err.empty(), c.err.empty()) << result.err;
    EXPECT_NE(result.err.find(c.err), std::string::npos) << result.err;
  }
}

const std::string ab = "\xC1\xC2\x40\x40\x40"; // "AB   " in 37
const std::string kanji =
    "\x0E\x45\x62\x45\x66\x0F\x40\x40"; // two kanji and two blanks in 930, 939
const std::string kanjiUtf8 = "\u65E5\u672C";
const std::string smile = "\xF0\x9F\x98\x80"; // one code point, two UTF-16 units

TEST(Translate, WithoutPadding) {
  check({
      {"blanks are text", "5 --from 37 --to 1208", ab, 0, "AB   ", ""},
      {"code page 037 is decimal", "5 --from 037 --to 1208", ab, 0, "AB   ", ""},
      {"records one after another", "1 --from 37 --to 1208", "\xC1\xC2", 0, "AB", ""},
      {"nothing in, nothing out", "5 --from 37 --to 1208 --newline lf", "", 0, "", ""},
      {"a null is text", "3 --from 37 --to 1208", "\xC1\0\xC2"s, 0, "A\0B"s, ""},
      {"the output fits exactly", "5 --from 37 --to 1208 --out-length 5", ab, 0, "AB   ", ""},
      {"one byte too little", "5 --from 37 --to 1208 --out-length 4", ab, 1, "",
       "record 1 at byte 0: U_BUFFER_OVERFLOW_ERROR (15): the text takes 5 bytes; give a larger "
       "--out-length"},
      {"mixed to mixed", "8 --from 930 --to 939", kanji, 0, kanji, ""},
      {"a signature for every record", "1 --from 37 --to 57368", "\xC1\xC2", 0,
       native("\xFE\xFF\0A\xFE\xFF\0B"s, 2), ""},
      {"a character that the page has not", "3 --from 1208 --to 37", "\u20AC", 0, "\x3F", ""},
  });
}

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

TEST(Translate, Newline) {
  check({
      {"UTF-8", "1 --from 37 --to 1208 --newline lf", "\xC1\xC2", 0, "A\nB\n", ""},
      {"none is said", "1 --from 37 --to 1208 --newline none", "\xC1\xC2", 0, "AB", ""},
      {"EBCDIC", "1 --from 37 --to 1141 --newline lf", "\xC1", 0, "\xC1\x25", ""},
      {"two bytes", "1 --from 37 --to 57359 --newline lf", "\xC1", 0, "A\0\n\0"s, ""},
      {"no second signature", "1 --from 37 --to 57368 --newline lf", "\xC1", 0,
       native("\xFE\xFF\0A\0\n"s, 2), ""},
      {"not counted in the length", "1 --from 37 --to 1208 --out-length 1 --newline lf", "\xC1", 0,
       "A\n", ""},
  });
}

TEST(Translate, Strip) {
  check({
      {"single byte", "5 --from 37 --to 1208 --strip", ab + ab, 0, "ABAB", ""},
      {"blank records", "2 --from 37 --to 1208 --strip --newline lf", "\x40\x40\x40\x40", 0, "\n\n",
       ""},
      {"two bytes a character", "2 --from 37 --to 1208 --strip", "\x43\x40", 0, "\u00E4", ""},
      {"mixed", "8 --from 939 --to 1208 --strip", kanji, 0, kanjiUtf8, ""},
      {"an ideographic space is a blank", "6 --from 939 --to 1208 --strip",
       "\x0E\x45\x62\x40\x40\x0F", 0, "\u65E5", ""},
      {"zero bytes of UTF-16 are not its end", "4 --from 37 --to 1200 --strip", "\xC1\xC2\x40\x40",
       0, "\0A\0B"s, ""},
      {"a last character that ends in a zero byte", "3 --from 1208 --to 1200 --strip", "\u4E00", 0,
       "\x4E\0"s, ""},
      {"the text's length is the limit's", "5 --from 37 --to 1208 --strip --out-length 2", ab, 0,
       "AB", ""},
      {"one byte too little", "5 --from 37 --to 1208 --strip --out-length 1", ab, 1, "",
       "the text takes 2 bytes"},
      {"an empty text has no signature", "1 --from 37 --to 57368 --strip", "\x40", 0, "", ""},
      {"tabs and no-break spaces too", "4 --from 37 --to 1208 --strip", "\xC1\x41\x05\x40", 0, "A",
       ""},
      {"a shifting page", "6 --from 930 --to 57366 --strip", kanji.substr(0, 6), 0, "+ZeVnLA-", ""},
  });
}

TEST(Translate, Fill) {
  check({
      {"single byte", "5 --from 37 --to 1141 --fill --out-length 8", ab, 0,
       "\xC1\xC2\x40\x40\x40\x40\x40\x40", ""},
      {"shorter than the record", "5 --from 37 --to 1208 --fill --out-length 3", ab, 0, "AB ", ""},
      {"text as long as the field", "5 --from 37 --to 1208 --fill --out-length 2", ab, 0, "AB", ""},
      {"two-byte characters", "2 --from 37 --to 1208 --fill --out-length 4", "\x43\x43", 0,
       "\u00E4\u00E4", ""},
      {"two-byte characters and blanks", "2 --from 37 --to 1208 --fill --out-length 5", "\x43\x43",
       0, "\u00E4\u00E4 ", ""},
      {"a pair of units that becomes one byte", "6 --from 1208 --to 37 --fill --out-length 6",
       smile + "A ", 0, "\x3F\xC1\x40\x40\x40\x40", ""},
      {"more units than bytes asked for", "16 --from 1208 --to 37 --fill --out-length 5",
       smile + smile + smile + smile, 0, "\x3F\x3F\x3F\x3F\x40", ""},
      {"mixed", "8 --from 939 --to 930 --fill --out-length 10", kanji, 0, kanji + "\x40\x40", ""},
      {"too long", "5 --from 37 --to 1208 --fill --out-length 1", ab, 1, "",
       "U_BUFFER_OVERFLOW_ERROR (15): the text takes 2 bytes"},
      {"two-byte blanks", "5 --from 37 --to 57359 --fill --out-length 10", ab, 0,
       "A\0B\0 \0 \0 \0"s, ""},
      {"two-byte blanks, text too long", "5 --from 37 --to 57359 --fill --out-length 2", ab, 1, "",
       "the text takes 4 bytes"},
      {"an odd rest", "5 --from 37 --to 1200 --fill --out-length 9", ab, 1, "",
       "with blanks of 2 bytes it can be 8 bytes long, but not 9; give another --out-length"},
      {"four-byte blanks", "2 --from 37 --to 57360 --fill --out-length 8", "\xC1\x40", 0,
       "\0\0\0A\0\0\0 "s, ""},
      {"one signature, with a text", "2 --from 37 --to 57368 --fill --out-length 8", "\xC1\x40", 0,
       native("\xFE\xFF\0A\0 \0 "s, 2), ""},
      {"one signature, without", "2 --from 37 --to 57372 --fill --out-length 6", "\x40\x40", 0,
       native("\xFE\xFF\0 \0 "s, 2), ""},
      {"one signature of four bytes", "1 --from 37 --to 57369 --fill --out-length 12", "\x40", 0,
       native("\0\0\xFE\xFF\0\0\0 \0\0\0 "s, 4), ""},
      {"UTF-7 leaves its shift at the blank", "6 --from 930 --to 57366 --fill --out-length 9",
       kanji.substr(0, 6), 0, "+ZeVnLA  ", ""},
      {"HZ shifts back before the blank", "4 --from 930 --to 57362 --fill --out-length 8",
       "\x0E\x45\x62\x0F", 0, "~{HU~}  ", ""},
      {"no blank fits between HZ's shift and its end",
       "4 --from 930 --to 57362 --fill --out-length 6", "\x0E\x45\x62\x0F", 1, "",
       "can be 4 bytes long, but not 6"},
  });
}

TEST(Translate, KeepBlanks) {
  check({
      {"all of them", "5 --from 37 --to 1208 --keep-blanks", ab, 0, "AB   ", ""},
      {"all of them, with room left", "5 --from 37 --to 1208 --keep-blanks --out-length 9", ab, 0,
       "AB   ", ""},
      {"as many as fit", "5 --from 37 --to 1208 --keep-blanks --out-length 4", ab, 0, "AB  ", ""},
      {"none fits", "5 --from 37 --to 1208 --keep-blanks --out-length 2", ab, 0, "AB", ""},
      {"the text does not fit", "5 --from 37 --to 1208 --keep-blanks --out-length 1", ab, 1, "",
       "the text takes 2 bytes"},
      {"mixed", "8 --from 939 --to 1208 --keep-blanks", kanji, 0, kanjiUtf8 + "  ", ""},
      {"a pair of units that becomes one byte",
       "6 --from 1208 --to 37 --keep-blanks --out-length 3", smile + "  ", 0, "\x3F\x40\x40", ""},
      {"two-byte blanks", "5 --from 37 --to 57359 --keep-blanks", ab, 0, "A\0B\0 \0 \0 \0"s, ""},
      {"two-byte blanks, as many as fit", "5 --from 37 --to 57359 --keep-blanks --out-length 7", ab,
       0, "A\0B\0 \0"s, ""},
      {"nulls at the end are dropped", "4 --from 37 --to 1208 --keep-blanks", "\xC1\x40\0\x40"s, 0,
       "A  ", ""},
      {"one signature for blanks alone", "2 --from 37 --to 57368 --keep-blanks", "\x40\x40", 0,
       native("\xFE\xFF\0 \0 "s, 2), ""},
      {"no room for the signature and a blank",
       "2 --from 37 --to 57368 --keep-blanks --out-length 3", "\x40\x40", 0, "", ""},
  });
}

TEST(Translate, NullsUnderPadding) {
  const std::string refused = "a null (U+0000) stands inside the text";
  check({
      {"strip", "3 --from 37 --to 1208 --strip", "\xC1\0\xC2"s, 1, "", refused},
      {"fill", "3 --from 37 --to 1208 --fill --out-length 9", "\xC1\0\xC2"s, 1, "", refused},
      {"keep", "3 --from 37 --to 1208 --keep-blanks", "\0\xC1\x40"s, 1, "", refused},
      {"at the end it is a blank", "4 --from 37 --to 1208 --strip", "\xC1\x40\0\x40"s, 0, "A", ""},
      {"nulls alone", "2 --from 37 --to 1208 --fill --out-length 2", "\0\0"s, 0, "  ", ""},
      {"zero bytes that are no null", "4 --from 57359 --to 1208 --strip", "A\0 \0"s, 0, "A", ""},
      {"a null of UTF-16", "6 --from 57359 --to 1208 --strip", "A\0\0\0B\0"s, 1, "", refused},
      {"a null without a zero byte", "7 --from 57366 --to 1208 --strip", "A+AAA-B", 1, "", refused},
  });
}

TEST(Translate, ShortLastRecord) {
  check({
      {"behind whole records", "5 --from 37 --to 1208 --strip", ab + "\xC1\xC2", 1, "AB",
       "standard input: record 2 at byte 5: the input ends after 2 of 5 bytes; is --record-length 5 "
       "right?"},
      {"alone", "1073741824 --from 37 --to 1208", ab, 1, "", "ends after 5 of 1073741824 bytes"},
      {"behind a record that fails", "3 --from 37 --to 1208 --strip", "\xC1\0\xC2\xC1"s, 1, "",
       "record 1 at byte 0"},
  });
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
    const Result result = runTool(std::string(c.arguments), ab);
    EXPECT_EQ(result.exitCode, 2) << c.arguments;
    EXPECT_EQ(result.out, "") << c.arguments;
    EXPECT_NE(result.err.find(c.err), std::string::npos) << c.arguments << "\n" << result.err;
  }
}

} // namespace

} // namespace tools
