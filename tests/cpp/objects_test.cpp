// Owners, and what makes them: code pages, languages, locale objects and bundles.

#include "nls2.hpp"

#include <gtest/gtest.h>

namespace {

using namespace nls2;

int closed = 0;
void close(int * /*handle*/) { ++closed; }
using Owner = detail::owner<int, close>;
static_assert(!std::is_copy_constructible_v<locale> && !std::is_copy_assignable_v<Owner>);

TEST(Owners, GiveBackOnceWhatTheyOwn) {
  int one = 1;
  Owner owner(&one);
  Owner other(std::move(owner));
  other = std::move(*&other);
  other.reset(other.get());
  EXPECT_TRUE(!owner && other && closed == 0);
  owner = Owner(std::exchange(other, Owner()).release());
  EXPECT_TRUE(owner.get() == &one && closed == 0);
  owner = Owner();
  EXPECT_EQ(closed, 1);
}

TEST(CodePagesAndLanguages, HaveNumbersAndNames) {
  EXPECT_EQ(code_page::from_name("ibm-1141"), code_page(1141));
  EXPECT_EQ(code_page::from_name("windows-936"), code_page(936)) << "not ICU's number";
  EXPECT_EQ(name_of(utf8_page), "UTF-8");
  EXPECT_STREQ(windows_names().back().name, "BIG5");
  const language_id german = language_id::from_name("de_AT");
  EXPECT_TRUE(german.country() == 40 && german.language() == 2);
  EXPECT_TRUE(name_of(german) == "de_AT" && iso_language(german) == "de");
  EXPECT_EQ(locale_records().size(), 161U);
  EXPECT_TRUE(is_known_locale("en_US" + std::string(126, '.')));
  EXPECT_FALSE(is_known_locale("en_US" + std::string(127, '.')));
}

TEST(Locales, AreMadeChangedAndGivenBack) {
  EXPECT_EQ(default_locale().name(), "en_US");
  const language_id polish = language_id::from_name("pl_PL");
  locale where = make_locale(polish, code_page(912)); // in both columns of hr_HR
  EXPECT_TRUE(where.language() == polish && where.page() == code_page(912));
  where.set_language(language_id::from_name("de"));
  where.set_page(code_page(1141));
  EXPECT_TRUE(where.name() == "de_DE" && where.page() == code_page(1141));
  EXPECT_EQ(conversion_ratio(make_locale(polish, code_page(1200)), where), 2);
  where.reset();
  EXPECT_EQ(pLocaleObjectList, nullptr) << "objects left behind";
}

TEST(Locales, HaveBundlesWithStrings) {
  const locale german = make_locale(language_id::from_name("de_AT"), utf8_page);
  EXPECT_EQ(open_bundle(MESSAGES_DIR, german).string("greeting"), u"Servus");
  EXPECT_TRUE(open_bundle(german));
}

} // namespace
