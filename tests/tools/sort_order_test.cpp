// nls2 sort against bare ICU, with French and German words of Debian's word lists.

#include "tool_runner.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <random>
#include <unicode/localpointer.h>
#include <unicode/ucol.h>
#include <unicode/unistr.h>

namespace tools {

namespace {

struct Line {
  icu::UnicodeString word;
  std::string blanks;
};
using Lines = std::vector<Line>;

// Every 250th word of both lists, each with 0 to 3 blanks behind it and then without, in an order
// that is no language's.
Lines wordLines() {
  Lines lines;
  for (const char *path : {"/usr/share/dict/french", "/usr/share/dict/ngerman"}) {
    std::ifstream file(path);
    std::string word;
    for (std::size_t i = 0; std::getline(file, word); ++i) {
      if (i % 250 == 0) {
        const icu::UnicodeString text = icu::UnicodeString::fromUTF8(word);
        lines.push_back({text, std::string(i / 250 % 4, ' ')});
        lines.push_back({text, ""});
      }
    }
  }
  std::shuffle(lines.begin(), lines.end(), std::minstd_rand()); // always the same
  return lines;
}

void sortBare(Lines &lines, const char *locale, bool ignoreTrailing) {
  UErrorCode error = U_ZERO_ERROR;
  const icu::LocalUCollatorPointer collator(ucol_open(locale, &error));
  ASSERT_TRUE(U_SUCCESS(error));
  ucol_setStrength(collator.getAlias(), UCOL_TERTIARY);
  const auto textOf = [=](const Line &line) {
    return ignoreTrailing ? line.word : line.word + icu::UnicodeString::fromUTF8(line.blanks);
  };
  std::stable_sort(lines.begin(), lines.end(), [&](const Line &a, const Line &b) {
    const icu::UnicodeString textA = textOf(a);
    const icu::UnicodeString textB = textOf(b);
    return ucol_strcoll(collator.getAlias(), textA.getBuffer(), textA.length(), textB.getBuffer(),
                        textB.length()) == UCOL_LESS;
  });
}

std::string bytesOf(const Lines &lines, const char *converter) {
  icu::UnicodeString all;
  for (const Line &line : lines) {
    all += line.word + icu::UnicodeString::fromUTF8(line.blanks) + u'\n';
  }
  std::string bytes(static_cast<std::size_t>(4 * all.length()), '\0');
  bytes.resize(static_cast<std::size_t>(
      all.extract(0, all.length(), bytes.data(), static_cast<uint32_t>(bytes.size()), converter)));
  return bytes;
}

TEST(SortOrder, IsThatOfBareIcu) {
  const struct {
    const char *why;
    const char *locale;
    bool ignoreTrailing;
    const char *codepage;
    const char *converter;
  } cases[] = {
      {"French", "fr_FR", false, "1208", "UTF-8"},
      {"accents from the end", "fr_CA", false, "1208", "UTF-8"},
      {"German, equal lines in order", "de_DE", true, "1208", "UTF-8"},
      {"letters behind z", "sv_SE", false, "57359", "UTF-16LE"},
      {"z before t", "et_EE", true, "57371", "gb18030"},
      {"by code", "en_US_POSIX", false, nullptr, "UTF-8"},
  };
  const Lines words = wordLines();
  ASSERT_GT(words.size(), 5000U) << "install the packages wfrench and wngerman";
  for (const auto &c : cases) {
    SCOPED_TRACE(c.why);
    Lines lines = words;
    std::vector<std::string> arguments{"sort"};
    setenv("LC_ALL", "C", 1);
    if (c.codepage != nullptr) {
      arguments.insert(arguments.end(), {"--locale", c.locale, "--codepage", c.codepage});
    }
    if (c.ignoreTrailing) {
      arguments.emplace_back("--ignore-trailing");
    }
    const Result result = runTool(arguments, bytesOf(lines, c.converter));
    sortBare(lines, c.locale, c.ignoreTrailing);
    EXPECT_EQ(result.exitCode, 0) << result.err;
    EXPECT_TRUE(result.out == bytesOf(lines, c.converter)); // too long to be shown
  }
}

} // namespace

} // namespace tools
