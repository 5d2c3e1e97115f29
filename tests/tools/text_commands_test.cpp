// nls2 compare, sort and find: bytes in, bytes out, messages and exit codes.

#include "tool_runner.h"

#include <cstdlib>
#include <gtest/gtest.h>

using namespace std::string_literals;

namespace tools {

namespace {

struct Case {
  const char *why;
  std::vector<std::string> arguments;
  std::string input;
  int exitCode;
  std::string out;
  std::string err; // occurs in standard error, which is empty where this is
};

// In the default locale of `environment`, as LC_ALL names it.
void check(const std::vector<Case> &cases, const char *environment = "en_US.UTF-8") {
  setenv("LC_ALL", environment, 1);
  for (const Case &c : cases) {
    SCOPED_TRACE(c.why);
    const Result result = runTool(c.arguments, c.input);
    EXPECT_EQ(result.exitCode, c.exitCode) << result.err;
    EXPECT_EQ(result.out, c.out);
    EXPECT_EQ(result.err.empty(), c.err.empty()) << result.err;
    EXPECT_NE(result.err.find(c.err), std::string::npos) << result.err;
  }
}

const std::string longest(32767, 'a');
const std::string notText = "the bytes are not text of code page 1208";

TEST(Compare, AnswersInPrintAndExitCode) {
  check({
      {"before", {"compare", "a", "b"}, "", 1, "-1\n", ""},
      {"behind", {"compare", "b", "a"}, "", 1, "1\n", ""},
      {"equal", {"compare", "a", "a"}, "", 0, "0\n", ""},
      {"empty", {"compare", "", ""}, "", 0, "0\n", ""},
      {"case counts, after the letter", {"compare", "a", "B"}, "", 1, "-1\n", ""},
      {"blanks count", {"compare", "a", "a \t"}, "", 1, "-1\n", ""},
      {"blanks ignored", {"compare", "--ignore-trailing", "a", "a \t"}, "", 0, "0\n", ""},
      {"commands' names are text", {"compare", "sort", "find"}, "", 1, "1\n", ""},
      {"EBCDIC bytes", {"compare", "--codepage", "37", "\xC1", "\x81"}, "", 1, "1\n", ""},
      {"hr_HR's code page", {"compare", "--codepage", "912", "a", "a"}, "", 0, "0\n", ""},
      {"the longest", {"compare", longest, longest}, "", 0, "0\n", ""},
      {"too long", {"compare", "a", longest + "a"}, "", 2, "", "B: 32768 bytes are too long"},
      {"bad bytes", {"compare", "a\xFF", "a"}, "", 2, "", "A: " + notText},
      {"text behind a null",
       {"compare", "--ignore-trailing", "--codepage", "57366", "a+AAA-b", "a"},
       "",
       2,
       "",
       "A: text stands behind a null"},
      {"one string", {"compare", "a"}, "", 2, "", "B"},
      {"a code page", {"compare", "--codepage", "57355", "a", "a"}, "", 2, "", "57355"},
  });
}

TEST(Compare, Locales) {
  const auto compare = [](const char *locale, const char *a, const char *b) {
    return std::vector<std::string>{"compare", "--locale", locale, a, b};
  };
  const std::vector<Case> cases{
      {"by name", compare("sv_SE", "\u00E4", "z"), "", 1, "1\n", ""},
      {"another language", compare("de_DE", "\u00E4", "z"), "", 1, "-1\n", ""},
      {"by hexadecimal id", compare("0x02F00008", "\u00E4", "z"), "", 1, "1\n", ""},
      {"by decimal id", compare("49283080", "\u00E4", "z"), "", 1, "1\n", ""},
      {"a name behind another of the same id", compare("fi_FI", "\u014Ba", "nb"), "", 1, "-1\n",
       ""},
      {"the id is the first record's", compare("0x00F6000A", "\u014Ba", "nb"), "", 1, "1\n", ""},
      {"a short name", compare("sr_LA", "\u010Da", "cb"), "", 1, "1\n", ""},
      {"an unknown name", compare("xx_XX", "a", "a"), "", 2, "", "\"xx_XX\" is no locale"},
      {"the table's end", compare("255", "a", "a"), "", 2, "", "\"255\" is no locale"},
      {"nothing", compare("", "a", "a"), "", 2, "", "\"\" is no locale"},
  };
  check(cases);
  check(cases, "nb_NO.UTF-8"); // a default that the table does not hold
  check({{"the environment's", {"compare", "\u00E4", "z"}, "", 1, "1\n", ""}}, "sv_SE.UTF-8");
  check({{"C", {"compare", "a", "B"}, "", 1, "1\n", ""}}, "C");
  check({{"no default", {"compare", "a", "a"}, "", 2, "", "locale nb_NO"}}, "nb_NO.UTF-8");
}

TEST(Sort, Lines) {
  const std::string null("a\0b\na\0a\n", 8);
  check({
      {"UTF-8", {"sort"}, "b\n\u00E9\nB\na\nz\n", 0, "a\nb\nB\n\u00E9\nz\n", ""},
      {"nothing", {"sort"}, "", 0, "", ""},
      {"empty lines, no last line feed", {"sort"}, "b\n\na", 0, "\na\nb\n", ""},
      {"EBCDIC", {"sort", "--codepage", "37"}, "\xC2\x25\xC1", 0, "\xC1\x25\xC2\x25", ""},
      {"half a unit is no line feed",
       {"sort", "--codepage", "1200"},
       "\x4E\0\x0A\x05\0\n\0a\0\n"s,
       0,
       "\0a\0\n\x4E\0\x0A\x05\0\n"s,
       ""},
      {"UTF-32",
       {"sort", "--codepage", "57361"},
       "b\0\0\0\n\0\0\0a\0\0\0"s,
       0,
       "a\0\0\0\n\0\0\0b\0\0\0\n\0\0\0"s,
       ""},
      {"equal lines stay in order",
       {"sort", "--ignore-trailing"},
       "b\na  \na\na\t\na \n",
       0,
       "a  \na\na\t\na \nb\n",
       ""},
      {"text behind nulls", {"sort"}, null, 0, null.substr(4) + null.substr(0, 4), ""},
      {"text behind nulls, which blanks are trailing?",
       {"sort", "--ignore-trailing"},
       null,
       1,
       "",
       "standard input: line 1: text stands behind a null"},
      {"nulls at the end",
       {"sort", "--ignore-trailing"},
       "b\na \0\0\na\n"s,
       0,
       "a \0\0\na\nb\n"s,
       ""},
      {"the longest", {"sort"}, longest + "\na\n", 0, "a\n" + longest + "\n", ""},
      {"too long",
       {"sort"},
       "b\na\n" + longest + "a\n",
       1,
       "",
       "standard input: line 3: 32768 bytes are too long; the most is 32767"},
      {"bad bytes", {"sort"}, "b\na\nc\xFF", 1, "", "standard input: line 3: " + notText},
      {"a cut character", {"sort"}, "\xC3\n\xA9\n", 1, "", "line 1: " + notText},
      {"a signature", {"sort", "--codepage", "57368"}, "", 2, "", "depend on the text before them"},
      {"states", {"sort", "--codepage", "57363"}, "", 2, "", "depend on the text before them"},
      {"no line feed", {"sort", "--codepage", "16684"}, "", 2, "", "16684 has no line feed"},
      {"no such file", {"sort", "-", "/nonexistent"}, "a\n", 1, "", "cannot read /nonexistent"},
  });
}

TEST(Sort, Records) {
  check({
      {"with line feeds", {"sort", "--record-length", "2"}, "b\na\n", 0, "a\nb\n", ""},
      {"signatures",
       {"sort", "--record-length", "4", "--codepage", "57368"},
       "\xFE\xFF\0b\xFF\xFE"s + "a\0"s,
       0,
       "\xFF\xFE"s + "a\0\xFE\xFF\0b"s,
       ""},
      {"a short one",
       {"sort", "--record-length", "2"},
       "b\na",
       1,
       "",
       "record 2: the input ends after 1 of 2 bytes; is --record-length 2 right?"},
      {"a bad one", {"sort", "--record-length", "1"}, "a\xFF", 1, "", "record 2: " + notText},
      {"too long", {"sort", "--record-length", "32768"}, "", 2, "", "from 1 to 32767"},
  });
}

TEST(Sort, FilesTogetherIntoOneOfThem) {
  const TempDir dir;
  writeFile(dir.path("1"), "c\na");
  writeFile(dir.path("2"), "d\nb\n");
  check({{"both", {"sort", dir.path("1"), dir.path("2"), "-o", dir.path("1")}, "", 0, "", ""}});
  EXPECT_EQ(readFile(dir.path("1")), "a\nb\nc\nd\n");
  writeFile(dir.path("2"), "a\n\xFF\n");
  check({{"a line that fails",
          {"sort", dir.path("1"), dir.path("2"), "-o", dir.path("1")},
          "",
          1,
          "",
          "2: line 2: " + notText}});
  EXPECT_EQ(readFile(dir.path("1")), "a\nb\nc\nd\n");
  EXPECT_EQ(dir.names(), (std::vector<std::string>{"1", "2"}));
}

TEST(Find, Lines) {
  const std::string wide(200000, 'x'); // more than one read
  check({
      {"found", {"find", "b"}, "b\nB\nabc", 0, "b\nabc\n", ""},
      {"not found", {"find", "bb"}, "b\nb\n", 1, "", ""},
      {"no lines", {"find", ""}, "", 1, "", ""},
      {"an empty pattern", {"find", ""}, "b\n\n", 0, "b\n\n", ""},
      {"no pattern", {"find"}, "", 2, "", "PATTERN"},
      {"numbers", {"find", "-n", "b"}, "a\nb\n", 0, "2:b\n", ""},
      {"case",
       {"find", "--ignore-case", "\u00C4B"},
       "\u00E4b\n\u00C4B\nab\n",
       0,
       "\u00E4b\n\u00C4B\n",
       ""},
      {"Turkish case",
       {"find", "--ignore-case", "--locale", "tr_TR", "I"},
       "i\n\u0131\n\u0130\n",
       0,
       "\u0131\n",
       ""},
      {"EBCDIC",
       {"find", "-n", "A", "--codepage", "37"},
       "\xC2\x25\xC1\xC2",
       0,
       "\xF2\x7A\xC1\xC2\x25",
       ""},
      {"UTF-16", {"find", "a", "--codepage", "57359"}, "b\0\n\0a\0\n\0"s, 0, "a\0\n\0"s, ""},
      {"mixed",
       {"find", "\u672C", "--codepage", "930"},
       "\x0E\x45\x66\x0F\x25\xC1\x25",
       0,
       "\x0E\x45\x66\x0F\x25",
       ""},
      {"a wide line",
       {"find", "xb"},
       wide + "b\nxa\n" + wide + "xb\n",
       0,
       wide + "b\n" + wide + "xb\n",
       ""},
      {"text behind a null",
       {"find", "b"},
       "b\na\0b\nb\n"s,
       2,
       "b\n",
       "standard input: line 2: text stands behind a null"},
      {"nulls at the end", {"find", "b"}, "b\0\0\n"s, 0, "b\0\0\n"s, ""},
      {"bad bytes", {"find", "\uFFFD"}, "a\n\xFF\n", 2, "", "line 2: " + notText},
      {"grows in lower case",
       {"find", "--ignore-case", "b"},
       "b\n\u0130b\n",
       2,
       "b\n",
       "standard input: line 2: a character grows in lower case"},
      {"a pattern that does", {"find", "--ignore-case", "\u0130"}, "b\n", 2, "", "PATTERN"},
      {"a pattern that the page lacks",
       {"find", "\u20AC", "--codepage", "37"},
       "\x3F\x25",
       2,
       "",
       "PATTERN: not UTF-8, or a character that code page 37 does not have"},
      {"a pattern that is no text", {"find", "\xFF"}, "\uFFFD\n", 2, "", "PATTERN: not UTF-8"},
      {"no such file", {"find", "a", "/nonexistent"}, "", 2, "", "cannot read /nonexistent"},
  });
}

TEST(Find, SeveralFilesAreNamed) {
  const TempDir dir;
  writeFile(dir.path("1"), "a\nb\n");
  const std::string name = dir.path("1");
  check({{"both", {"find", "b", "-n", name, "-"}, "b", 0, name + ":2:b\nstandard input:1:b\n", ""},
         {"one", {"find", "b", name}, "", 0, "b\n", ""}});
}

} // namespace

} // namespace tools
