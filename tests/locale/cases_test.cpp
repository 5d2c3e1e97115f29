// The calls of this room's case files, and the table of locales.

#include "support/dispatch.h"

#include <gtest/gtest.h>

namespace {

using support::shown;
using support::Words;

std::string mapEntry(const Words &w) {
  const LocaleMapEntry *entry = NLS2_GetLocaleMapEntry(w.number<uint32_t>(0));
  w.name(entry, entry == nullptr ? "" : "row " + shown(entry - localeMap));
  return shown(entry);
}

// The word may say what ICU's default locale is.
std::string init(const Words &w) {
  support::world.locale = w.size() > 0 ? w[0] : support::world.locale;
  NLS2_Locale object = {};
  const int32_t status = NLS2_initLocaleObject(&object);
  return shown(status) + ", " + shown(object);
}

TEST(Locale, Cases) {
  support::expectCases(CASES_FOLDER, {
                                         CALL(NLS2_Init),
                                         CALL(NLS2_allocateLocale),
                                         {"NLS2_initLocaleObject", init},
                                         CALL(NLS2_GetLocale),
                                         {"GetThreadLocale", support::call<NLS2_GetThreadLocale>},
                                         CALL(NLS2_ConvertNativeLocale),
                                         CALL(NLS2_SetLocaleFromNative),
                                         CALL(NLS2_ValidateLocale),
                                         CALL(NLS2_ReleaseLocale),
                                         CALL(NLS2_GetLocaleNumInfo),
                                         CALL(NLS2_SetLocaleNumInfo),
                                         CALL(NLS2_GetLocaleCodepageId),
                                         {"NLS2_GetLocaleMapEntry", mapEntry},
                                         CALL(NLS2_GetLanguageName),
                                         CALL(NLS2_GetShortPosixName),
                                         CALL(NLS2_LanguageIDFromShortPosixName),
                                     });
}

TEST(LocaleMap, IsFrozen) {
  support::Digest digest;
  for (const LocaleMapEntry &entry : localeMap) {
    digest.number(entry.languageId).number(entry.asciiCcsid).number(entry.ebcdicCcsid);
    digest.bytes(entry.localeName).bytes(entry.shortName);
  }
  EXPECT_EQ(digest.value, 14162261733260850383U);
}

} // namespace
