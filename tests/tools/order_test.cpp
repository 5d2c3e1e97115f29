// The order of nls2 sort and nls2 compare beside the library's comparison, and whose order it is.

#include "nls2.h"
#include "tool_runner.h"

#include <algorithm>
#include <cstdlib>
#include <gtest/gtest.h>
#include <random>
#include <set>
#include <unicode/uloc.h>
#include <unicode/unistr.h>

namespace tools {

namespace {

using Lines = std::vector<std::string>;

struct Order {
  const char *locale;
  int32_t page;
  const char *converter;
};

// The names of all locales in a language, as they are and with other letters, accents and blanks at
// the end, in an order that is no language's.
Lines linesIn(const Order &order) {
  const icu::UnicodeString endings[] = {
      u"", u" ", u"\t", u"\u00A0 ", u"\u3000", u"A", u"\u0301", icu::UnicodeString(u" \0\0", 3)};
  std::minstd_rand random; // always the same
  std::set<std::string> lines;
  for (int32_t i = 0; i < uloc_countAvailable(); ++i) {
    UErrorCode error = U_ZERO_ERROR;
    char16_t name[256] = {};
    uloc_getDisplayName(uloc_getAvailable(i), order.locale, name, 256, &error);
    for (icu::UnicodeString text : {icu::UnicodeString(name), icu::UnicodeString(name).toUpper()}) {
      text += endings[random() % std::size(endings)];
      char bytes[1024];
      const int32_t length = text.extract(0, text.length(), bytes, sizeof bytes, order.converter);
      lines.emplace(bytes, static_cast<std::size_t>(length));
    }
  }
  Lines shuffled(lines.begin(), lines.end());
  std::shuffle(shuffled.begin(), shuffled.end(), random);
  return shuffled;
}

std::string joined(const Lines &lines, const std::string &end) {
  std::string text;
  for (const std::string &line : lines) {
    text += line + end;
  }
  return text;
}

int32_t strcoll(const NLS2_Locale *locale, const std::string &a, const std::string &b,
                bool ignoreTrailing) {
  int32_t status = 0;
  const int32_t order = NLS2_Strcoll(locale, a.data(), static_cast<int16_t>(a.size()), b.data(),
                                     static_cast<int16_t>(b.size()),
                                     ignoreTrailing ? uint32_t{SORT_IGNORETRAILING} : 0, &status);
  EXPECT_EQ(status, 0);
  return order;
}

void expectLibraryOrder(const Order &order, bool ignoreTrailing) {
  SCOPED_TRACE(std::string(order.locale) + (ignoreTrailing ? " --ignore-trailing" : ""));
  UErrorCode error = U_ZERO_ERROR;
  uloc_setDefault(order.locale, &error);
  int32_t status = 0;
  NLS2_Locale *const locale = NLS2_GetLocale(0, 0, 0, &status);
  ASSERT_EQ(
      NLS2_SetLocaleNumInfo(locale, NLS2_ATTRIBUTE_CODEPAGE, static_cast<uint32_t>(order.page), 0),
      0);
  const Lines lines = linesIn(order);
  ASSERT_GT(lines.size(), 1000U);
  Lines expected = lines;
  std::stable_sort(expected.begin(), expected.end(), [&](const auto &a, const auto &b) {
    return strcoll(locale, a, b, ignoreTrailing) < 0;
  });
  Lines options{"--locale", order.locale, "--codepage", std::to_string(order.page)};
  if (ignoreTrailing) {
    options.emplace_back("--ignore-trailing");
  }
  const auto run = [&](Lines arguments, const std::string &input) {
    arguments.insert(arguments.begin() + 1, options.begin(), options.end());
    return runTool(arguments, input);
  };
  const std::string end = order.page == 37 ? "%" : "\n";
  const Result sorted = run({"sort"}, joined(lines, end));
  EXPECT_EQ(sorted.exitCode, 0) << sorted.err;
  EXPECT_TRUE(sorted.out == joined(expected, end)); // too long to be shown
  for (std::size_t i = 0; i + 1 < lines.size(); i += lines.size() / 8) {
    const std::string a = lines[i].c_str(); // an argument ends at a null
    const std::string b = expected[i].c_str();
    const int32_t answer = strcoll(locale, a, b, ignoreTrailing);
    const Result compared = run({"compare", a, b}, "");
    EXPECT_EQ(compared.out, std::to_string(answer) + "\n") << compared.err;
    EXPECT_EQ(compared.exitCode, answer == 0 ? 0 : 1);
  }
  NLS2_ReleaseLocale(locale);
}

TEST(Order, IsThatOfTheLibrary) {
  const Order orders[] = {{"fr_CA", 1208, "UTF-8"}, {"de_DE", 37, "ibm-37"},
                          {"da_DK", 1208, "UTF-8"}, {"ja_JP", 57371, "windows-54936"},
                          {"tr_TR", 1208, "UTF-8"}, {"vi_VN", 1208, "UTF-8"}};
  for (const Order &order : orders) {
    for (const bool ignoreTrailing : {false, true}) {
      expectLibraryOrder(order, ignoreTrailing);
    }
  }
}

// Letters that languages put in different places tell whose order it is.
TEST(Order, FollowsTheEnvironment) {
  const struct {
    const char *why, *all, *collate, *messages, *lang, *a, *b;
    int answer;
  } cases[] = {
      {"LC_ALL first", "sv_SE.UTF-8", "de_DE", "de_DE", "de_DE", "ä", "z", 1},
      {"then LC_COLLATE", "", "sv_SE.UTF-8", "de_DE", "de_DE", "ä", "z", 1},
      {"then LANG, and not LC_MESSAGES", nullptr, nullptr, "de_DE", "sv_SE", "ä", "z", 1},
      {"nothing is C", nullptr, nullptr, "de_DE", nullptr, "a", "B", 1},
      {"C", "C", "de_DE", nullptr, "de_DE", "a", "B", 1},
      {"POSIX", "POSIX", nullptr, nullptr, nullptr, "a", "B", 1},
      {"C in UTF-8", "C.UTF-8", nullptr, nullptr, nullptr, "a", "B", 1},
      {"a modifier", "de_DE@euro", nullptr, nullptr, nullptr, "a", "B", -1},
      {"Norwegian", "nb_NO.UTF-8", nullptr, nullptr, nullptr, "å", "z", 1},
      {"a language alone", "sv", nullptr, nullptr, nullptr, "ä", "z", 1},
      {"English alone", "en", nullptr, nullptr, nullptr, "ä", "z", -1},
      {"the language in another country", "fr_SN", nullptr, nullptr, nullptr, "côte", "coté", 1},
      {"a country of its own rules", "fr_CA", nullptr, nullptr, nullptr, "côte", "coté", -1},
      {"the script of a modifier", "sr_RS@latin", nullptr, nullptr, nullptr, "ča", "cb", 1},
      {"no such language", "xx_YY", nullptr, nullptr, nullptr, "a", "b", 2},
      {"not a name", "/", nullptr, nullptr, nullptr, "a", "b", 2},
  };
  for (const auto &c : cases) {
    SCOPED_TRACE(c.why);
    const auto set = [](const char *name, const char *value) {
      value == nullptr ? unsetenv(name) : setenv(name, value, 1);
    };
    set("LC_ALL", c.all);
    set("LC_COLLATE", c.collate);
    set("LC_MESSAGES", c.messages);
    set("LANG", c.lang);
    const Result result = runTool({"compare", c.a, c.b});
    EXPECT_EQ(result.exitCode, c.answer == 2 ? 2 : 1);
    EXPECT_EQ(result.out, c.answer == 2 ? "" : std::to_string(c.answer) + "\n") << result.err;
    EXPECT_EQ(result.err.find("nls2: LC_ALL: \"") == 0, c.answer == 2) << result.err;
  }
}

} // namespace

} // namespace tools
