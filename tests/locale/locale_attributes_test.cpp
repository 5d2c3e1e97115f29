// NLS2_GetLocaleNumInfo, NLS2_SetLocaleNumInfo and NLS2_GetLocaleCodepageId.

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

class LocaleAttributes : public testing::Test {
protected:
  void SetUp() override {
    const Answers answers;
    int32_t status = -1;
    object = NLS2_GetLocale(0x03480001, 819, 0, &status);
    ASSERT_NE(object, nullptr);
  }
  void TearDown() override { EXPECT_EQ(NLS2_ReleaseLocale(object), 0); }

  NLS2_Locale *object = nullptr;
  NLS2_Locale never = {0x03480001, 819, "en_US", nullptr};
};

TEST_F(LocaleAttributes, AreRead) {
  const struct {
    const char *reason;
    bool live;
    uint32_t type;
    uint32_t value;
    int32_t status;
    std::string trace;
  } rows[] = {
      {"language id", true, 1, 0x03480001, 0,
       "NLS2_ValidateLocale = 0\n: Option selected is  LANGUAGE ID.\n= 55050241\n"},
      {"code page", true, 9, 819, 0,
       "NLS2_ValidateLocale = 0\n: Option selected is  CODEPAGEID.\n= 819\n"},
      {"no selector", true, 10, 0, 37,
       "NLS2_ValidateLocale = 0\n: Invalid type selected A.\n= 0\n"},
      {"not live", false, 9, 0, 38, "NLS2_ValidateLocale = 38\n: Invalid locale.\n= 0\n"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    NLS2_Locale *const asked = row.live ? object : &never;
    int32_t status = -1;
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_GetLocaleNumInfo(asked, row.type, &status), row.value);
    EXPECT_EQ(status, row.status);
    EXPECT_EQ(outline(recording, {{asked, "P"}}),
              "> NLS2_GetLocaleNumInfo\n: Input parameters: pLocale {P}, type " +
                  std::to_string(row.type) + ".\n" + row.trace);
  }
}

TEST_F(LocaleAttributes, AreChanged) {
  const struct {
    const char *reason;
    bool live;
    uint32_t attribute;
    uint32_t value;
    int32_t status;
    uint32_t languageId; // afterwards
    uint32_t codepage;
    const char *icuLocale;
    std::string trace;
  } rows[] = {
      {"language and name, not the code page", true, 1, 0x00380003, 0, 0x00380003, 819, "fr_BE",
       ": Request to change language id.\n"
       ": Found language id 3670019 in table.\n"
       ": Set language id to 3670019.\n"
       ": Set locale name to fr_BE.\n"},
      {"the second record of a name", true, 1, 0x02D40004, 0, 0x02D40004, 819, "es_ES",
       ": Request to change language id.\n"
       ": Found language id 47448068 in table.\n"
       ": Set language id to 47448068.\n"
       ": Set locale name to es_ES.\n"},
      {"a language id that the table lacks", true, 1, 7, 38, 0x02D40004, 819, "es_ES",
       ": Request to change language id.\n: Matching entry not found.\n"},
      {"code page, unchecked", true, 9, 0xFFFFFFFF, 0, 0x02D40004, 0xFFFFFFFF, "es_ES",
       ": Request to set the code page to -1\n: Set codepage to -1.\n"},
      {"255 keeps the language", true, 1, 255, 0, 0x02D40004, 0xFFFFFFFF, "es_ES", ""},
      {"255 keeps the code page", true, 9, 255, 0, 0x02D40004, 0xFFFFFFFF, "es_ES", ""},
      {"no selector, also with 255", true, 5, 255, 38, 0x02D40004, 0xFFFFFFFF, "es_ES",
       ": Requested option not valid.\n"},
      {"not live", false, 9, 37, 38, 0x03480001, 819, "en_US", ""},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    NLS2_Locale *const changed = row.live ? object : &never;
    const auto number = [](uint32_t value) { return std::to_string(static_cast<int32_t>(value)); };
    std::string trace = "> NLS2_SetLocaleNumInfo\n: Input parameters: pLocaleToChange {P}, "
                        "attribute " +
                        number(row.attribute) + ", value " + number(row.value) +
                        ", options 77.\nNLS2_ValidateLocale = ";
    if (row.live) {
      trace += "0\n" + row.trace + ": Locale Object {P}\n: \tICU_Locale " + row.icuLocale +
               "\n: \tCodepage " + number(row.codepage) + "\n: \tLanguage ID " +
               number(row.languageId) + "\n= " + number(static_cast<uint32_t>(row.status)) + "\n";
    } else {
      trace += "38\n: Invalid locale structure.\n= 38\n";
    }
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_SetLocaleNumInfo(changed, row.attribute, row.value, 77), row.status);
    EXPECT_EQ(outline(recording, {{changed, "P"}}), trace);
    EXPECT_EQ(changed->languageId, row.languageId);
    EXPECT_EQ(changed->codepage, row.codepage);
    EXPECT_STREQ(changed->icuLocale, row.icuLocale);
  }
}

TEST_F(LocaleAttributes, CodepageHasAReaderOfItsOwn) {
  for (const bool live : {true, false}) {
    NLS2_Locale *const asked = live ? object : &never;
    int32_t status = -1;
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_GetLocaleCodepageId(asked, &status), live ? 819U : 0U);
    EXPECT_EQ(status, live ? 0 : 38);
    EXPECT_EQ(outline(recording, {{asked, "P"}}),
              std::string("> NLS2_GetLocaleCodepageId\n: Input parameter: pLocale {P}.\n") +
                  (live ? "NLS2_ValidateLocale = 0\n: Codepage value is 819\n= 819\n"
                        : "NLS2_ValidateLocale = 38\n: Invalid locale.\n= 0\n"));
  }
}

} // namespace
