// NLS2_initLocaleObject: what the process's defaults make of a locale object.

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

std::string longName(size_t length) { return "en_US_" + std::string(length - 6, 'X'); }

TEST(InitLocaleObject, TakesTheProcessDefaults) {
  const std::string name131 = longName(131);
  const std::string name132 = longName(132);
  const std::string name133 = longName(133);
  const std::string name200 = longName(200);
  constexpr uint32_t enUs = 0x03480001;
  constexpr uint32_t esEs = 0x00DE0004;
  struct {
    const char *reason;
    const char *locale;
    const char *codepage;
    int32_t status;
    uint32_t languageId;
    std::string icuLocale;
    uint32_t codepageId;
  } const rows[] = {
      {"a record's own name", "fr_BE", "UTF-8", 0, 0x00380003, "fr_BE", 1208},
      {"the first of two records of a name", "es_ES", "UTF-8", 0, esEs, "es_ES", 1208},
      {"the base name is kept, not the record's", "en_US_POSIX", "US-ASCII", 0, enUs, "en_US_POSIX",
       367},
      {"keywords are no part of the base name", "de_DE@collation=phonebook", "UTF-8", 0, 0x01140002,
       "de_DE", 1208},
      {"a short name inside a longer one", "ses_ML", "UTF-8", 0, 0x02D40004, "ses_ML", 1208},
      {"empty", "", "UTF-8", 0, enUs, "en_US", 1208},
      {"null", nullptr, "UTF-8", 0, enUs, "en_US", 1208},
      {"a language without a country", "en", "UTF-8", 37, 0, "", 0},
      {"a locale that the table lacks", "nb_NO", "UTF-8", 37, 0, "", 0},
      {"only a keyword: the base name is empty", "@calendar=gregorian", "UTF-8", 37, 0, "", 0},
      {"as long as is stored", name131.c_str(), "UTF-8", 0, enUs, name131, 1208},
      {"fills ICU's buffer to the last byte", name132.c_str(), "UTF-8", 0, enUs, name131, 1208},
      {"one too long for ICU", name133.c_str(), "UTF-8", 37, 0, "", 0},
      {"far too long", name200.c_str(), "UTF-8", 37, 0, "", 0},
      {"no code page: US EBCDIC", "en_US", nullptr, 0, enUs, "en_US", 37},
      {"a code page that ICU lacks", "en_US", "no-such", 4, enUs, "en_US", 0},
      {"a code page without a number", "en_US", "utf-7", 37, enUs, "en_US", 0},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    Answers answers;
    answers.locale = row.locale;
    answers.codepage = row.codepage;
    [[maybe_unused]] const support::MeantLeak converterOfUtf7;
    NLS2_Locale object = {};
    EXPECT_EQ(NLS2_initLocaleObject(&object), row.status);
    EXPECT_EQ(object.languageId, row.languageId);
    EXPECT_EQ(object.icuLocale, row.icuLocale);
    EXPECT_EQ(object.codepage, row.codepageId);
    EXPECT_EQ(NLS2_ValidateLocale(&object), 38) << "it is not put on the list";

    int32_t status = -1;
    NLS2_Locale *allocated = NLS2_allocateLocale(&status);
    EXPECT_EQ(status, row.status);
    EXPECT_EQ(allocated != nullptr, row.status == 0);
    EXPECT_EQ(pLocaleObjectList, allocated);
    EXPECT_EQ(NLS2_ReleaseLocale(allocated), row.status == 0 ? 0 : 37);
  }
}

TEST(InitLocaleObject, TracesEachStep) {
  const std::string tooLong = longName(133);
  struct {
    const char *reason;
    const char *locale;
    const char *codepage;
    std::string trace;
  } const rows[] = {
      {"nothing is known", nullptr, nullptr,
       ": Locale returned is (null).\n"
       ": Locale returned null, setting locale to en_US.\n"
       ": Getting the locale basename.\n"
       ": Locale basename is en_US.\n"
       ": Locate locale basename in table.\n"
       ": Entry found in table. LangID is 55050241, ICU_Locale is en_US.\n"
       ": Retrieve codepage name using locale basename en_US.\n"
       ": ICU returned null codepage, Force it to be ASCII or EBCDIC.\n"
       ": Forced default codepage to be US EBCDIC.\n"
       ": Retrieve codepage based on codepage name. ibm-37_P100-1995.\n"
       "NLS2_GetCodepageId = 37\n"
       ": Locale object successfully initialized.\n"
       "= 0\n"},
      {"unknown code page", "ses_ML", "no-such",
       ": Locale returned is ses_ML.\n"
       ": Getting the locale basename.\n"
       ": Locale basename is ses_ML.\n"
       ": Locate locale basename in table.\n"
       ": Entry found in table. LangID is 47448068, ICU_Locale is ses_ML.\n"
       ": Retrieve codepage name using locale basename ses_ML.\n"
       ": Retrieve codepage based on codepage name. no-such.\n"
       "NLS2_GetCodepageId = 0\n"
       ": Could not get codepage based on codepage name.\n"
       "= 4\n"},
      {"no record", "nb_NO", "UTF-8",
       ": Locale returned is nb_NO.\n"
       ": Getting the locale basename.\n"
       ": Locale basename is nb_NO.\n"
       ": Locate locale basename in table.\n"
       ": Basename not found in table. Not valid Locale name.\n"
       "= 37\n"},
      {"no base name", tooLong.c_str(), "UTF-8",
       ": Locale returned is " + tooLong +
           ".\n"
           ": Getting the locale basename.\n"
           ": Error getting locale base name. 15\n"
           "= 37\n"},
  };
  for (const auto &row : rows) {
    Answers answers;
    answers.locale = row.locale;
    answers.codepage = row.codepage;
    NLS2_Locale object = {};
    const Recording recording(traceAll);
    NLS2_initLocaleObject(&object);
    EXPECT_EQ(outline(recording),
              "> NLS2_initLocaleObject\n: Get the current native locale.\n" + row.trace)
        << row.reason;
  }
}

} // namespace
