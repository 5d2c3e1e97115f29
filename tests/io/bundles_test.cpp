// Resource bundles compiled by genrb: languages, fallback and statuses.

#include "io/io_fixture.h"

#include <unicode/uloc.h>

namespace {

using io_test::makeLocale;

constexpr int32_t fallback = U_USING_FALLBACK_WARNING;
constexpr int32_t defaulted = U_USING_DEFAULT_WARNING;
constexpr int32_t missing = U_MISSING_RESOURCE_ERROR;

class Bundles : public testing::Test {
protected:
  // A default locale without a bundle, and one that objects can be made in.
  void SetUp() override {
    UErrorCode error = U_ZERO_ERROR;
    uloc_setDefault("en_US", &error);
    ASSERT_EQ(error, U_ZERO_ERROR);
  }
};

TEST_F(Bundles, StringsAndWarningsByLanguage) {
  const struct {
    const char *locale;
    int32_t openStatus;
    const char *key;
    const char16_t *string; // null: not found
    int32_t keyStatus;
  } cases[] = {
      {"de_AT", 0, "greeting", u"Servus", 0},
      {"de_AT", 0, "farewell", u"Auf Wiedersehen, sch\u00F6ne Gr\u00FC\u00DFe", fallback},
      {"de_AT", 0, "version", u"1.0", defaulted},
      {"de_DE", fallback, "greeting", u"Guten Tag", 0},
      {"fr_FR", fallback, "greeting", u"Bonjour", 0},
      {"fr_FR", fallback, "farewell", u"\u00C0 bient\u00F4t", 0},
      {"fr_FR", fallback, "version", u"1.0", defaulted},
      {"fr_FR", fallback, "no_such_key", nullptr, missing},
      {"fr_FR", fallback, "", nullptr, missing},
      {"fr_FR", fallback, "colours", nullptr, U_RESOURCE_TYPE_MISMATCH},
      {"ja_JP", defaulted, "greeting", u"Hello", 0},
  };
  for (const auto &c : cases) {
    SCOPED_TRACE(std::string(c.locale) + " " + c.key);
    const auto locale = makeLocale(c.locale);
    int32_t status = -9;
    UResourceBundle *bundle = NLS2_ResourceOpen(MESSAGES_DIR, locale.get(), &status);
    ASSERT_NE(bundle, nullptr);
    EXPECT_EQ(status, c.openStatus);
    int32_t length = -9;
    status = -9;
    const UChar *string = NLS2_GetStringByKey(bundle, c.key, &length, &status);
    EXPECT_EQ(status, c.keyStatus);
    if (c.string == nullptr) {
      EXPECT_EQ(string, nullptr);
    } else {
      ASSERT_NE(string, nullptr);
      EXPECT_EQ(std::u16string(string), c.string);
      EXPECT_EQ(length, static_cast<int32_t>(std::u16string(c.string).size()));
    }
    NLS2_ResourceClose(bundle);
  }
}

TEST_F(Bundles, WhatDoesNotOpen) {
  const auto locale = makeLocale("de_DE");
  int32_t status = 0;
  EXPECT_EQ(NLS2_ResourceOpen(MESSAGES_DIR "/no_such_name", locale.get(), &status), nullptr);
  EXPECT_EQ(status, missing);
  EXPECT_EQ(NLS2_ResourceOpen(MESSAGES_DIR, nullptr, &status), nullptr);
  EXPECT_EQ(status, NLS2_ERR_INVALID_LOCALE);
  int32_t length = 0;
  EXPECT_EQ(NLS2_GetStringByKey(nullptr, "greeting", &length, &status), nullptr);
  EXPECT_EQ(status, U_ILLEGAL_ARGUMENT_ERROR);
}

} // namespace
