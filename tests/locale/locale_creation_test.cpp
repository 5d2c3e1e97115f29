// NLS2_Init, NLS2_GetLocale and NLS2_GetThreadLocale.

#include "nls2.h"
#include "support/default_probe.h"
#include "support/recording_host.h"
#include "support/trace_outline.h"

#include <gtest/gtest.h>

namespace {

using support::Answers;
using support::outline;
using support::Recording;
using support::traceAll;

constexpr uint32_t enUs = 0x03480001;
constexpr uint32_t deDe = 0x01140002;

TEST(Init, StartsIcu) {
  const Recording recording(traceAll);
  EXPECT_EQ(NLS2_Init(), 0);
  EXPECT_EQ(outline(recording), "> NLS2_Init\n= 0\n");
}

TEST(GetLocale, FindsTheRecordAndFillsTheObject) {
  Answers answers;
  answers.locale = "de_DE";
  const struct {
    const char *reason;
    uint32_t languageId;
    uint32_t codepage;
    uint32_t options;
    uint32_t foundLanguageId; // 0: status 37
    const char *icuLocale;
    uint32_t foundCodepage;
  } rows[] = {
      {"both 0: the defaults", 0, 0, 0, deDe, "de_DE", 1208},
      {"both 0: options are ignored", 0, 0, 0xFFFFFFFF, deDe, "de_DE", 1208},
      {"the default code page stays", enUs, 0, 0, enUs, "en_US", 1208},
      {"a code page of its own", enUs, 819, 0, enUs, "en_US", 819},
      {"code pages are not checked", enUs, 0xFFFFFFFF, 0, enUs, "en_US", 0xFFFFFFFF},
      {"an id of two records finds the first", deDe, 37, 0, deDe, "de_DE", 37},
      {"the one record with a code page in both columns", 0, 912, 0, 0x00BF0014, "hr_HR", 912},
      {"it wins over the ids behind it", 0x02680043, 912, 0, 0x00BF0014, "hr_HR", 912},
      {"it loses to the ids before it", enUs, 912, 0, enUs, "en_US", 912},
      {"a code page in one column only", 0, 819, 0, 0, "", 0},
      {"an id that the table lacks", 0x12345678, 1208, 0, 0, "", 0},
      {"the terminator's id", 0xFF, 0, 0, 0, "", 0},
      {"0x2 keeps the defaults", enUs, 819, 0x2, deDe, "de_DE", 1208},
      {"0x4 keeps the defaults", enUs, 819, NLS2_LOCALE_DEFAULT, deDe, "de_DE", 1208},
      {"other bits do not", enUs, 819, 0xFFFFFFF9, enUs, "en_US", 819},
      {"0x4 still needs a record", 0x12345678, 0, 0x4, 0, "", 0},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    int32_t status = -1;
    NLS2_Locale *object = NLS2_GetLocale(row.languageId, row.codepage, row.options, &status);
    EXPECT_EQ(status, row.foundLanguageId != 0 ? 0 : 37);
    ASSERT_EQ(object != nullptr, row.foundLanguageId != 0);
    EXPECT_EQ(pLocaleObjectList, object);
    if (object != nullptr) {
      EXPECT_EQ(object->languageId, row.foundLanguageId);
      EXPECT_STREQ(object->icuLocale, row.icuLocale);
      EXPECT_EQ(object->codepage, row.foundCodepage);
      EXPECT_EQ(NLS2_ReleaseLocale(object), 0);
    }
  }
}

TEST(GetLocale, TracesEachPath) {
  const std::string requested =
      ": Input parameters: languageId 55050241, codepage 819, options 0.\n"
      ": Locating caller's language id 55050241, codepage 819 in table\n"
      ": Located language id 55050241, codepage 819 in table\n";
  const struct {
    const char *reason;
    const char *defaultLocale; // "en": no object can be made
    uint32_t languageId;
    uint32_t codepage;
    uint32_t options;
    int32_t status;
    std::string trace;
  } rows[] = {
      {"defaults", "de_DE", 0, 0, 0xAB, 0,
       ": Input parameters: languageId 0, codepage 0, options ab.\n"
       ": Zero language Id and codepage defined.\n"
       "NLS2_allocateLocale = {new}\n"
       "= {new}\n"},
      {"defaults fail", "en", 0, 0, 0, 37,
       ": Input parameters: languageId 0, codepage 0, options 0.\n"
       ": Zero language Id and codepage defined.\n"
       "NLS2_allocateLocale =\n"
       ": Could not allocate a locale structure.\n"
       "= 0\n"},
      {"no record", "de_DE", 0xFFFFFFFF, 1, 0, 37,
       ": Input parameters: languageId -1, codepage 1, options 0.\n"
       ": Locating caller's language id -1, codepage 1 in table\n"
       ": Could not find entry within LocaleMap Table.\n"
       "= 0\n"},
      {"user inputs", "de_DE", enUs, 819, 0, 0,
       requested + "NLS2_allocateLocale = {new}\n"
                   ": Initialize Locale based on user inputs\n"
                   ": Locale Object {new}\n"
                   ": \tICU_Locale en_US\n"
                   ": \tCodepage 819\n"
                   ": \tLanguage ID 55050241\n"
                   "= {new}\n"},
      {"user inputs fail", "en", enUs, 819, 0, 37,
       requested + "NLS2_allocateLocale =\n"
                   ": Could not allocate a locale structure.\n"
                   "= 0\n"},
      {"the default option", "de_DE", enUs, 0, 2, 0,
       ": Input parameters: languageId 55050241, codepage 0, options 2.\n"
       ": Locating caller's language id 55050241, codepage 0 in table\n"
       ": Located language id 55050241, codepage 0 in table\n"
       "NLS2_allocateLocale = {new}\n"
       ": Locale Object {new}\n"
       ": \tICU_Locale de_DE\n"
       ": \tCodepage 1208\n"
       ": \tLanguage ID 18087938\n"
       "= {new}\n"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    Answers answers;
    answers.locale = row.defaultLocale;
    int32_t status = -1;
    const Recording recording(traceAll);
    NLS2_Locale *object = NLS2_GetLocale(row.languageId, row.codepage, row.options, &status);
    const support::Names names = {{object, "new"}};
    EXPECT_EQ(outline(recording, names), "> NLS2_GetLocale\n" + row.trace);
    EXPECT_EQ(status, row.status);
    EXPECT_EQ(NLS2_ReleaseLocale(object), row.status == 0 ? 0 : 37);
  }
}

TEST(GetThreadLocale, MakesADefaultObjectAndTellsNoStatus) {
  Answers answers;
  answers.locale = "de_DE";
  NLS2_Locale *objects[2];
  for (NLS2_Locale *&object : objects) {
    const Recording recording(traceAll);
    object = NLS2_GetThreadLocale();
    ASSERT_NE(object, nullptr);
    EXPECT_EQ(object->languageId, deDe);
    EXPECT_EQ(outline(recording, {{object, "new"}}),
              "> GetThreadLocale\nNLS2_GetLocale = {new}\n=\n");
  }
  EXPECT_NE(objects[0], objects[1]) << "there is no object of a thread's own";
  EXPECT_EQ(NLS2_ReleaseLocale(objects[0]), 0);
  EXPECT_EQ(NLS2_ReleaseLocale(objects[1]), 0);

  answers.codepage = "no-such";
  const Recording recording(traceAll);
  EXPECT_EQ(NLS2_GetThreadLocale(), nullptr);
  EXPECT_EQ(outline(recording),
            "> GetThreadLocale\nNLS2_GetLocale = 0\n: Error 4 obtaining Thread Locale.\n=\n");
}

} // namespace
