// Owners, and what makes them: code pages, languages, locale objects and bundles.

#include "cpp/failure.h"
#include "support/probe.h"

namespace {

using namespace std::string_literals;
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

TEST(CodePages, HaveNumbersAndNames) {
  const interpose::Held before = interpose::held();
  EXPECT_EQ(code_page::from_name("ibm-1141"), code_page(1141));
  EXPECT_EQ(code_page::from_name("windows-936"), code_page(936)) << "not ICU's number";
  EXPECT_EQ(STATUS_OF(code_page::from_name("hz", error)), 37) << "it has no number";
  EXPECT_EQ(STATUS_OF(code_page::from_name("", error)), 37);
  EXPECT_EQ(STATUS_OF(code_page::from_name("cp37\0x"s, error)), 37);
  EXPECT_EQ(STATUS_OF(code_page::from_name("no-such-page", error)), 4);
  EXPECT_EQ(STATUS_OF(code_page::from_name(std::string(256, 'x'), error)), 31);
  EXPECT_EQ(name_of(utf8_page), "UTF-8");
  EXPECT_EQ(STATUS_OF(name_of(code_page(57364), error)), 4);
  EXPECT_EQ(interpose::held(), before);
  EXPECT_STREQ(windows_names().back().name, "BIG5");
}

TEST(Languages, HaveNumbersAndNames) {
  const language_id german = language_id::from_name("de_AT");
  EXPECT_TRUE(german.country() == 40 && german.language() == 2);
  EXPECT_TRUE(name_of(german) == "de_AT" && iso_language(german) == "de");
  EXPECT_EQ(STATUS_OF(language_id::from_name("de_at", error)), 37);
  EXPECT_EQ(STATUS_OF(name_of(language_id(255), error)), 39);
  EXPECT_EQ(STATUS_OF(iso_language(language_id(1), error)), 39);
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
  EXPECT_EQ(STATUS_OF(where.set_language(language_id(255), error)), 39);
  EXPECT_EQ(STATUS_OF(where.set_page(code_page(255), error)), 37);
  EXPECT_EQ(conversion_ratio(make_locale(polish, code_page(1200)), where), 2);
  EXPECT_EQ(STATUS_OF(make_locale(polish, code_page(0), error)), 37);
  EXPECT_EQ(STATUS_OF(make_locale(language_id(0), code_page(37), error)), 39);
  where.reset();
  EXPECT_EQ(pLocaleObjectList, nullptr) << "objects left behind";
}

TEST(Locales, ThatAreNotLiveAreRefused) {
  locale none;
  EXPECT_TRUE(!none.is_live() && none.name().empty());
  EXPECT_THROW(none.page(), error);
  EXPECT_EQ(STATUS_OF(none.set_page(code_page(37), error)), 38);
  EXPECT_EQ(STATUS_OF(none.set_language(language_id(0), error)), 38);
  EXPECT_EQ(STATUS_OF(conversion_ratio(none, none, error)), 38);
  EXPECT_EQ(STATUS_OF(open_bundle("x", none, error)), 38);
  support::world.locale = "nb_NO";
  EXPECT_EQ(STATUS_OF(default_locale(error)), 37);
  support::world = {};
}

TEST(Locales, HaveBundlesWithStrings) {
  const locale german = make_locale(language_id::from_name("de_AT"), utf8_page);
  const bundle messages = open_bundle(MESSAGES_DIR, german);
  EXPECT_EQ(messages.string("greeting"), u"Servus");
  EXPECT_TRUE(open_bundle(german));
  EXPECT_EQ(STATUS_OF(messages.string("none", error)), 2);
  EXPECT_EQ(STATUS_OF(messages.string("greeting\0"s, error)), 37);
  EXPECT_EQ(STATUS_OF(bundle().string("greeting", error)), 1);
  EXPECT_EQ(STATUS_OF(open_bundle("", german, error)), 37);
  EXPECT_EQ(STATUS_OF(open_bundle("/nowhere", german, error)), 2);
}

} // namespace
