// The order of nls2 sort and nls2 compare beside the library's comparison.

#include "nls2.hpp"
#include "tool_runner.h"

#include <algorithm>
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

void expectLibraryOrder(const Order &order, bool ignoreTrailing) {
  SCOPED_TRACE(std::string(order.locale) + (ignoreTrailing ? " --ignore-trailing" : ""));
  const nls2::locale locale(nls2::language_id(order.locale), order.page);
  const auto collate = [&](const std::string &a, const std::string &b) {
    int32_t status = 0;
    const uint32_t option = ignoreTrailing ? uint32_t{SORT_IGNORETRAILING} : 0;
    const int32_t answer = NLS2_Strcoll(locale.get(), a.data(), static_cast<int16_t>(a.size()),
                                        b.data(), static_cast<int16_t>(b.size()), option, &status);
    EXPECT_EQ(status, 0);
    return answer;
  };
  const Lines lines = linesIn(order);
  ASSERT_GT(lines.size(), 1000U);
  Lines expected = lines;
  std::stable_sort(expected.begin(), expected.end(),
                   [&](const auto &a, const auto &b) { return collate(a, b) < 0; });
  const auto run = [&](Lines arguments, const std::string &input) {
    arguments.insert(arguments.begin() + 1,
                     {"--locale", order.locale, "--codepage", std::to_string(order.page)});
    if (ignoreTrailing) {
      arguments.insert(arguments.begin() + 1, "--ignore-trailing");
    }
    return runTool(arguments, input);
  };
  const std::string end = order.page == 37 ? "%" : "\n";
  const Result sorted = run({"sort"}, joined(lines, end));
  EXPECT_EQ(sorted.exitCode, 0) << sorted.err;
  EXPECT_TRUE(sorted.out == joined(expected, end)); // too long to be shown
  for (std::size_t i = 0; i + 1 < lines.size(); i += lines.size() / 8) {
    const std::string a = lines[i].c_str(); // an argument ends at a null
    const std::string b = expected[i].c_str();
    const Result compared = run({"compare", a, b}, "");
    EXPECT_EQ(compared.out, std::to_string(collate(a, b)) + "\n") << compared.err;
    EXPECT_EQ(compared.exitCode, collate(a, b) == 0 ? 0 : 1);
  }
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

} // namespace

} // namespace tools
