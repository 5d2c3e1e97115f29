// Owners, and what makes them: code pages, languages, locale objects and bundles.

#include "nls2.hpp"
#include "nls2/bundle.hpp"
#include "support/probe.h"

#include <gtest/gtest.h>

namespace {

using namespace nls2;

int closed = 0;
void close(int * /*handle*/) { ++closed; }
using Owner = detail::owner<int, close>;

template <class Locale, class Bundle>
concept Dangles = requires {
  Locale().name();
}
|| requires { Bundle().string("x"); };
static_assert(!Dangles<locale, bundle>);

TEST(Owners, CloseOnceWhatTheyOwn) {
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

TEST(CodePages, AreWhatTheirNamesOpen) {
  const interpose::Held before = interpose::held();
  const page_facts facts = code_page("ibm-37,swaplfnl").facts();
  EXPECT_TRUE(facts.name == "ibm-37_P100-1995,swaplfnl" && facts.number == 0);
  EXPECT_TRUE(facts.kind == page_kind::single_byte && !facts.has_states && !facts.has_signature);
  EXPECT_TRUE(code_page(57368).facts().has_signature && code_page(930).facts().has_states);
  const auto names = page_names();
  EXPECT_EQ(std::count(names.begin(), names.end(), "ibm-37_P100-1995"), 1);
  EXPECT_EQ(interpose::held(), before);
}

TEST(Locales, HaveLanguagesPagesAndBundles) {
  const language_id austrian("de_AT");
  EXPECT_TRUE(austrian.country() == 40 && austrian.language() == 2);
  EXPECT_TRUE(name_of(austrian) == "de_AT" && iso_language(austrian) == "de");
  const language_id polish("pl_PL");
  locale where(polish, 912); // in both columns of hr_HR
  EXPECT_TRUE(where.language() == polish && where.page() == 912);
  where.set_language(language_id("de"));
  where.set_page(1141);
  EXPECT_TRUE(where.name() == "de_DE" && where.page() == 1141);
  const bundle messages(MESSAGES_DIR, where);
  EXPECT_TRUE(messages.string("greeting") == u"Guten Tag" && bundle(where));
  where.reset();
  EXPECT_EQ(pLocaleObjectList, nullptr) << "objects left behind";
}

} // namespace
