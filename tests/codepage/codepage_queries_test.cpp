// NLS2_GetCodepageName and NLS2_GetCodepageId.

#include "nls2.h"
#include "support/default_probe.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"
#include "support/trace_outline.h"

#include <gtest/gtest.h>
#include <unicode/ucnv.h>

namespace {

using support::Answers;
using support::outline;
using support::Recording;
using support::traceAll;
using support::traceDetail;
using support::traceOff;

constexpr const char *untouched = "untouched";

TEST(GetCodepageName, GivesIcusCanonicalName) {
  const struct {
    const char *reason;
    int32_t codepage;
    int32_t status;
    const char *name;
  } rows[] = {
      {"as a CCSID", 37, 0, "ibm-37_P100-1995"},
      {"canonical, not as it was opened", 1208, 0, "UTF-8"},
      {"a warning of the open is no failure", 932, 0, "ibm-943_P15A-2003"},
      {"a name that lives in the converter", 57365, 0, "ISCII,version=0"},
      {"a private number without a name", 57364, 4, untouched},
      {"a negative number", -1, 4, untouched},
  };
  for (const auto &row : rows) {
    for (const auto flags : {traceOff, traceAll}) {
      SCOPED_TRACE(row.reason);
      const int open = support::openConverters();
      char name[UCNV_MAX_CONVERTER_NAME_LENGTH] = "untouched";
      const Recording recording(flags);
      EXPECT_EQ(NLS2_GetCodepageName(row.codepage, name, 0), row.status);
      EXPECT_STREQ(name, row.name);
      EXPECT_EQ(support::openConverters(), open);
    }
  }
}

// The opened converter as an outline's name: the test knows of it only what the trace tells.
support::Names converterIn(const Recording &recording) {
  const std::string exit = "NLS2_MapCodepageIdToName= ";
  uintptr_t address = 0;
  for (const std::string &line : recording.lines()) {
    if (line.rfind(exit, 0) == 0) {
      address = static_cast<uint32_t>(std::stol(line.substr(exit.size())));
    }
  }
  return {{reinterpret_cast<const void *>(address), "converter"}};
}

TEST(GetCodepageName, TracesEachPath) {
  const std::string opened = "NLS2_MapCodepageIdToName = {converter}\n";
  const struct {
    const char *reason;
    int32_t codepage;
    UErrorCode ccsidError;
    UErrorCode nameError;
    bool noName;
    int32_t status;
    std::string trace;
  } rows[] = {
      {"found", 57365, U_ZERO_ERROR, U_ZERO_ERROR, false, 0,
       opened + ": CCSID for this converter is 4902\n"
                ": Codepage name ISCII,version=0 found.\n"
                ": Release converter {converter}.\n"
                "-ucnv\n"
                ": Copy codepage name ISCII,version=0 to user buffer.\n"
                ": Compute length of name.\n"
                ": Name length is 15.\n"
                "= 0\n"},
      {"not opened", 57364, U_ZERO_ERROR, U_ZERO_ERROR, false, 4,
       "NLS2_MapCodepageIdToName = 0\n"
       ": ICU converter for codepage not found.4\n"
       "= 4\n"},
      {"no CCSID", 37, U_INVALID_TABLE_FORMAT, U_ZERO_ERROR, false, U_INVALID_TABLE_FORMAT,
       opened + ": CCSID for this converter is -1\n"
                ": Error retrieving CCSID for converter {converter}.\n"
                "-ucnv\n"
                "= 13\n"},
      {"a warning with the CCSID", 37, U_USING_DEFAULT_WARNING, U_INTERNAL_PROGRAM_ERROR, false, 5,
       opened + ": CCSID for this converter is -1\n"
                ": Converter codepage name not found.\n"
                "-ucnv\n"
                "= 5\n"},
      {"no name and no error", 37, U_ZERO_ERROR, U_ZERO_ERROR, true, 2,
       opened + ": CCSID for this converter is 37\n"
                ": Converter codepage name not found.\n"
                "-ucnv\n"
                "= 2\n"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    Answers answers;
    answers.ccsidError = row.ccsidError;
    answers.nameError = row.nameError;
    if (row.noName) {
      answers.name = nullptr;
    }
    char name[UCNV_MAX_CONVERTER_NAME_LENGTH] = "untouched";
    const support::ConverterMarks marks;
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_GetCodepageName(row.codepage, name, 0), row.status);
    EXPECT_EQ(outline(recording, converterIn(recording)),
              "> NLS2_GetCodepageName\n: Input parameters: CodePageID " +
                  std::to_string(row.codepage) + "\n" + row.trace);
    EXPECT_STREQ(name, row.status == 0 ? "ISCII,version=0" : untouched);
  }
}

TEST(GetCodepageName, AsksForTheCcsidUnderDetailTracingOnly) {
  Answers answers;
  answers.ccsidError = U_INVALID_TABLE_FORMAT;
  for (const auto flags : {traceOff, support::traceEvents, traceDetail, traceAll}) {
    char name[UCNV_MAX_CONVERTER_NAME_LENGTH] = "untouched";
    const Recording recording(flags);
    const bool detail = (flags & traceDetail) != 0;
    EXPECT_EQ(NLS2_GetCodepageName(37, name, sizeof name), detail ? 13 : 0) << flags;
    EXPECT_STREQ(name, detail ? untouched : "ibm-37_P100-1995");
  }
}

TEST(GetCodepageId, TracesEachPath) {
  const std::string opened = ": ICU converter allocated.\n"
                             ": Retrieve the CCSID for this converter.\n";
  const struct {
    const char *reason;
    const char *name;
    UErrorCode ccsidError;
    uint32_t codepage;
    int32_t status;
    int leftOpen;
    std::string trace;
  } rows[] = {
      {"an alias", "UTF8", U_ZERO_ERROR, 1208, 0, 0,
       opened + "-ucnv\n"
                ": CCSID associated with the codepage name is 1208.\n"
                "= 1208\n"},
      {"a name of several tables", "windows-1252", U_ZERO_ERROR, 5348, 0, 0,
       opened + "-ucnv\n"
                ": CCSID associated with the codepage name is 5348.\n"
                "= 5348\n"},
      {"unknown to ICU: the Windows names are not asked", "windows-65000x", U_ZERO_ERROR, 0, 4, 0,
       ": Could not open ICU converter based on codepage name.\n= 0\n"},
      {"no answer about the CCSID", "UTF-8", U_INVALID_TABLE_FORMAT, 0, 13, 0,
       opened + ": CCSID number not found for Codepage name.\n-ucnv\n= 0\n"},
      {"no CCSID, but a Windows name", "windows-936-2000", U_ZERO_ERROR, 936, 0, 0,
       opened + ": ICU cannot find a CCSID for this codepage named windows-936-2000\n"
                "NLS2_MapWindowsNameToCCSID = 936\n"
                "-ucnv\n"
                ": CCSID associated with the codepage name is 936.\n"
                "= 936\n"},
      {"no CCSID and no Windows name: left open", "UTF-7", U_ZERO_ERROR, 0, 37, 1,
       opened + ": ICU cannot find a CCSID for this codepage named UTF-7\n"
                "NLS2_MapWindowsNameToCCSID = 0\n"
                ": Codepage name is not CCSID nor Windows.\n"
                "= 0\n"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    Answers answers;
    answers.ccsidError = row.ccsidError;
    const int open = support::openConverters();
    int32_t status = -1;
    const support::ConverterMarks marks;
    const Recording recording(traceAll);
    [[maybe_unused]] const support::MeantLeak converter;
    EXPECT_EQ(NLS2_GetCodepageId(row.name, &status), row.codepage);
    EXPECT_EQ(status, row.status);
    EXPECT_EQ(support::openConverters() - open, row.leftOpen);
    EXPECT_EQ(outline(recording), support::filled("> NLS2_GetCodepageId\n"
                                                  ": Input parameters: CodePageName @.\n"
                                                  ": Getting codepage id from codepage name @.\n"
                                                  ": Opening ICU converter for codepage name @.\n",
                                                  "@", row.name) +
                                      (row.status == 4 ? "" : "+ucnv\n") + row.trace);
  }
}

// ICU opens its default converter for a null name. Without a CCSID for it the name is looked up as
// text all the same.
TEST(GetCodepageId, NullNameIsIcusDefault) {
  int32_t status = -1;
  const Recording recording(traceAll);
  EXPECT_NE(NLS2_GetCodepageId(nullptr, &status), 0U);
  EXPECT_EQ(status, 0);
  EXPECT_EQ(recording.details("NLS2_GetCodepageId")[0], "Input parameters: CodePageName (null).");
}

} // namespace
