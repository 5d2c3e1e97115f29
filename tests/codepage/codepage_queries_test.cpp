// NLS2_GetCodepageName and NLS2_GetCodepageId.

#include "locale/scenario.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <unicode/ucnv.h>

namespace {

using support::Answers;
using support::expectScenario;
using support::plain;
using support::said;
using support::traced;

std::string nameOf(int32_t codepage) {
  const int open = support::openConverters();
  char name[UCNV_MAX_CONVERTER_NAME_LENGTH] = "untouched";
  const int32_t status = NLS2_GetCodepageName(codepage, name, 0);
  EXPECT_EQ(support::openConverters(), open);
  return said(status, name);
}

TEST(GetCodepageName, GivesIcusCanonicalName) {
  const Answers noCcsid{.ccsidError = U_INVALID_TABLE_FORMAT};
  const struct {
    const char *name;
    support::Trace trace;
    int32_t codepage;
    std::string answer;
    Answers answers = {};
  } rows[] = {
      {"name of a CCSID", plain, 37, "0 ibm-37_P100-1995"},
      {"name, canonical, not as it was opened", plain, 1208, "0 UTF-8"},
      {"name, a warning of the open is no failure", plain, 932, "0 ibm-943_P15A-2003"},
      {"name that lives in the converter", traced, 57365, "0 ISCII,version=0"},
      {"name, not opened", traced, 57364, "4 untouched"},
      {"name of a negative number", plain, -1, "4 untouched"},
      {"name, no CCSID", traced, 37, "13 untouched", noCcsid},
      {"name, without detail tracing no CCSID is asked for", plain, 37, "0 ibm-37_P100-1995",
       noCcsid},
      {"name, a warning with the CCSID",
       traced,
       37,
       "5 untouched",
       {.ccsidError = U_USING_DEFAULT_WARNING, .nameError = U_INTERNAL_PROGRAM_ERROR}},
      {"name, none and no error", traced, 37, "2 untouched", {.noName = true}},
  };
  for (const auto &row : rows) {
    const auto call = [&] { return nameOf(row.codepage); };
    expectScenario({row.name, row.trace, call, row.answer, "", row.answers});
  }
}

TEST(GetCodepageName, AsksForTheCcsidByDetailTracingAlone) {
  const Answers noCcsid{.ccsidError = U_INVALID_TABLE_FORMAT};
  const support::Answering answering(noCcsid);
  for (const auto flags : {support::traceEvents, support::traceDetail}) {
    const support::Recording recording(flags);
    EXPECT_EQ(nameOf(37), flags == support::traceDetail ? "13 untouched" : "0 ibm-37_P100-1995");
  }
}

std::string idOf(const char *name) {
  int32_t status = -1;
  const uint32_t codepage = NLS2_GetCodepageId(name, &status);
  return said(status, codepage);
}

// That converters are given back, but for one, shows in the traces.
TEST(GetCodepageId, GivesTheCcsidOrTheNumberOfAWindowsName) {
  const struct {
    const char *section;
    const char *name;
    std::string answer;
    UErrorCode ccsidError = U_ZERO_ERROR;
  } rows[] = {
      {"id of an alias", "UTF8", "0 1208"},
      {"id of a name of several tables", "windows-1252", "0 5348"},
      {"id, unknown to ICU: no Windows name", "windows-65000x", "4 0"},
      {"id, no answer about the CCSID", "UTF-8", "13 0", U_INVALID_TABLE_FORMAT},
      {"id of a Windows name without a CCSID", "windows-936-2000", "0 936"},
      {"id, neither CCSID nor Windows name: left open", "UTF-7", "37 0"},
  };
  for (const auto &row : rows) {
    const auto call = [&] {
      [[maybe_unused]] const support::MeantLeak converter;
      return idOf(row.name);
    };
    expectScenario({row.section, traced, call, row.answer, "", {.ccsidError = row.ccsidError}});
  }
}

// ICU opens its default converter for a null name.
TEST(GetCodepageId, NullNameIsIcusDefault) {
  const support::Recording recording(support::traceAll);
  int32_t status = -1;
  EXPECT_NE(NLS2_GetCodepageId(nullptr, &status), 0U);
  EXPECT_EQ(status, 0);
  EXPECT_EQ(recording.lines()[1], "NLS2_GetCodepageId: Input parameters: CodePageName (null).");
}

} // namespace
