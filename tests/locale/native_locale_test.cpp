// NLS2_SetLocaleFromNative and NLS2_ConvertNativeLocale.

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

TEST(SetLocaleFromNative, TellsWhetherAnIdentifierIsKnown) {
  const std::string reaches = std::string(126, 'x') + "en_US";
  const std::string cut = std::string(127, 'x') + "en_US";
  const struct {
    const char *reason;
    const char *identifier;
    const char *defaultLocale;
    int32_t status;
  } rows[] = {
      {"a name", "fr_BE", "en_US", 0},
      {"a code set behind it", "en_US.ISO8859-1", "en_US", 0},
      {"anywhere inside", "ses_ML", "en_US", 0},
      {"unknown", "nb_NO.UTF-8", "en_US", 38},
      {"letter case counts", "en_us", "en_US", 38},
      {"empty", "", "en_US", 38},
      {"POSIX is no C", "POSIX", "en_US", 38},
      {"the last 5 of 131 characters", reaches.c_str(), "en_US", 0},
      {"cut before its last character", cut.c_str(), "en_US", 38},
      {"C is ICU's default, not its base name", "C", "en_US_POSIX@calendar=gregorian", 0},
      {"C, the match in a keyword", "C", "nb_NO@x=en_US", 0},
      {"C, a default that no record matches", "C", "en", 38},
      {"C, an empty default: not en_US", "C", "", 38},
      {"C, no default", "C", nullptr, 38},
  };
  for (const auto &row : rows) {
    Answers answers;
    answers.locale = row.defaultLocale;
    EXPECT_EQ(NLS2_SetLocaleFromNative(row.identifier, 0xFFFFFFFE), row.status) << row.reason;
    EXPECT_EQ(pLocaleObjectList, nullptr) << row.reason;
  }
}

TEST(SetLocaleFromNative, TracesEachPath) {
  const std::string posix = ": Posix ID fr_BE.UTF-8 is more than basename C.\n"
                            ": Posix name is fr_BE.UTF-8\n"
                            ": Locate entry within LocaleMap Table.\n"
                            ": Found locale entry in table.\n";
  const std::string thread = posix + ": This is a thread locale request.\nGetThreadLocale =\n";
  const std::string normal = ": This is a normal locale request.\n= 0\n";
  const std::string language = ": Locale language id is 3670019.\n";
  struct {
    const char *reason;
    const char *identifier;
    const char *defaultLocale;
    const char *defaultCodepage;
    const char *nextCodepage; // from the second look on, which is the request's own
    uint32_t options;
    int32_t status;
    uint32_t languageId; // of the object left behind; 0: none
    uint32_t codepage;
    const char *icuLocale;
    std::string trace;
  } const rows[] = {
      {"normal", "fr_BE.UTF-8", "en_US", "UTF-8", "UTF-8", 0, 0, 0, 0, "", posix + normal},
      {"no default", "C", nullptr, "UTF-8", "UTF-8", 0, 38, 0, 0, "",
       ": Default locale from ICU  (null).\n"
       ": Locate entry within LocaleMap Table.\n"
       ": Cannot find locale entry in table.\n"
       "= 38\n"},
      {"thread", "fr_BE.UTF-8", "en_US", "UTF-8", "US-ASCII", 1, 0, 0x00380003, 367, "fr_BE",
       thread + language +
           ": Retrieve codepage based on codepage name. US-ASCII.\n"
           "NLS2_GetCodepageId = 367\n" +
           normal},
      {"thread, no default code page", "fr_BE.UTF-8", "en_US", "UTF-8", nullptr, 1, 0, 0x00380003,
       37, "fr_BE",
       thread + language +
           ": ICU returned null codepage, Force it to be ASCII or EBCDIC.\n"
           ": Forced default codepage to be US EBCDIC.\n"
           ": Retrieve codepage based on codepage name. ibm-37_P100-1995.\n"
           "NLS2_GetCodepageId = 37\n" +
           normal},
      {"thread, the code page fails: the name stays", "fr_BE.UTF-8", "en_US", "UTF-8", "no-such", 1,
       4, 0x00380003, 0, "en_US",
       thread + language +
           ": Retrieve codepage based on codepage name. no-such.\n"
           "NLS2_GetCodepageId = 0\n"
           ": Could not get codepage based on codepage name.\n"
           "= 4\n"},
      {"thread, no object", "fr_BE.UTF-8", "en", "UTF-8", "UTF-8", 1, 38, 0, 0, "",
       thread + "= 38\n"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    Answers answers;
    answers.locale = row.defaultLocale;
    answers.codepage = row.defaultCodepage;
    answers.nextCodepage = row.nextCodepage;
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_SetLocaleFromNative(row.identifier, row.options), row.status);
    EXPECT_EQ(outline(recording), std::string("> NLS2_SetLocaleFromNative\n"
                                              ": Input parameters: pPosixID ") +
                                      row.identifier + ",options " + std::to_string(row.options) +
                                      ".\n" + row.trace);
    NLS2_Locale *const left = pLocaleObjectList;
    ASSERT_EQ(left != nullptr, row.languageId != 0);
    if (left != nullptr) {
      EXPECT_EQ(left->languageId, row.languageId);
      EXPECT_EQ(left->codepage, row.codepage);
      EXPECT_STREQ(left->icuLocale, row.icuLocale);
      EXPECT_EQ(NLS2_ReleaseLocale(left), 0);
    }
    EXPECT_EQ(pLocaleObjectList, nullptr) << "more than one object";
  }
}

TEST(ConvertNativeLocale, MakesADefaultObjectOnRequest) {
  const struct {
    const char *reason;
    uint32_t options;
    const char *defaultLocale;
    int32_t status;
    const char *trace;
  } rows[] = {
      {"no request", 0xFFFFFFFB, "de_DE", 37, "=\n"},
      {"default", 0xFFFFFFFF, "de_DE", 0,
       ": Setting the locale based on default.\nNLS2_allocateLocale = {new}\n=\n"},
      {"a failure is told by null alone", 4, "en", 0,
       ": Setting the locale based on default.\nNLS2_allocateLocale =\n"
       ": Cannot allocate a locale structure. 37\n=\n"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    Answers answers;
    answers.locale = row.defaultLocale;
    int32_t status = -1;
    const Recording recording(traceAll);
    NLS2_Locale *object = NLS2_ConvertNativeLocale(nullptr, row.options, &status);
    const support::Names names = {{object, "new"}};
    EXPECT_EQ(outline(recording, names), std::string("> NLS2_ConvertNativeLocale\n") + row.trace);
    EXPECT_EQ(status, row.status);
    if (std::string(row.reason) == "default") {
      ASSERT_NE(object, nullptr);
      EXPECT_STREQ(object->icuLocale, "de_DE");
    }
    EXPECT_EQ(NLS2_ReleaseLocale(object), object != nullptr ? 0 : 37);
  }
}

} // namespace
