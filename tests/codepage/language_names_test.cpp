// NLS2_GetLanguageName, NLS2_GetShortPosixName and NLS2_LanguageIDFromShortPosixName.

#include "nls2.h"
#include "support/recording_host.h"
#include "support/trace_outline.h"

#include <cstring>
#include <gtest/gtest.h>

namespace {

using support::outline;
using support::Recording;
using support::traceAll;

TEST(GetLanguageName, WritesAsIcuDoes) {
  const struct {
    const char *reason;
    uint32_t languageId;
    int32_t length;
    int32_t status;
    const char *buffer; // "...." before
    const char *end;
  } rows[] = {
      {"with its terminator", 0x03480001, 3, 0, "en\0.", ": Found languageID in table.\n= 0\n"},
      {"no room for the terminator", 0x03480001, 2, 0, "en..",
       ": Found languageID in table.\n= 0\n"},
      {"too small", 0x03480001, 1, 15, "....",
       ": Found languageID in table.\n: Error 15 retrieving language name from ICU.\n= 15\n"},
      {"a negative length", 0x03480001, -1, 1, "....",
       ": Found languageID in table.\n: Error 1 retrieving language name from ICU.\n= 1\n"},
      {"unknown", 0x03480002, 4, 39, "....",
       ": Could not find matching languageID in table.\n= 39\n"},
      {"the terminator's id", 0xFF, 4, 39, "....",
       ": Could not find matching languageID in table.\n= 39\n"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    char buffer[4] = {'.', '.', '.', '.'};
    char input[100];
    std::snprintf(input, sizeof input,
                  ": Input parameters: languageID %X, buflen %d.\n: Locate languageID %d in table.",
                  row.languageId, row.length, static_cast<int32_t>(row.languageId));
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_GetLanguageName(row.languageId, buffer, row.length), row.status);
    if (row.status != U_BUFFER_OVERFLOW_ERROR) { // what ICU then leaves depends on its version
      EXPECT_EQ(std::string(buffer, 4), std::string(row.buffer, 4));
    }
    EXPECT_EQ(outline(recording), std::string("> NLS2_GetLanguageName\n") + input + "\n" + row.end);
  }
}

TEST(GetShortPosixName, CopiesTheFirstRecordsName) {
  const struct {
    const char *reason;
    uint32_t languageId;
    int32_t status;
    const char *name;
  } rows[] = {
      {"the first of two records", 0x01140002, 0, "de_DE"},
      {"not the posix record", 0x03480001, 0, "en_US"},
      {"unknown", 1, 39, "untouched"},
      {"the terminator's id", 0xFF, 39, "untouched"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    char name[16] = "untouched";
    char input[100];
    std::snprintf(input, sizeof input, ": Input parameters: languageID %X, buflen -7.\n",
                  row.languageId);
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_GetShortPosixName(row.languageId, name, -7), row.status);
    EXPECT_STREQ(name, row.name);
    EXPECT_EQ(
        outline(recording),
        std::string("> NLS2_GetShortPosixName\n") + input + ": Locate name in the table.\n" +
            (row.status == 0 ? ": Found matching languageID in the table.\n= 0\n" : "= 39\n"));
  }
}

TEST(LanguageIDFromShortPosixName, ComparesWholeNames) {
  const struct {
    const char *reason;
    const char *name;
    uint32_t languageId; // 0: status 37
  } rows[] = {
      {"a name", "en_US", 0x03480001},        {"the last record", "posix", 0x03480001},
      {"a language alone", "de", 0x01140002}, {"letter case counts", "en_us", 0},
      {"only a beginning", "en_U", 0},        {"empty, as the terminator's", "", 0},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    int32_t status = -1;
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_LanguageIDFromShortPosixName(row.name, &status), row.languageId);
    EXPECT_EQ(status, row.languageId != 0 ? 0 : 37);
    EXPECT_EQ(outline(recording),
              std::string("> NLS2_LanguageIDFromShortPosixName\n"
                          ": Input parameter: pShortPosixName ") +
                  row.name + ".\n: Locate matching Short Posix Name in the table.\n" +
                  (row.languageId != 0 ? ": Found matching name in the table.\n= " +
                                             std::to_string(row.languageId) + "\n"
                                       : ": No matching name in the table.\n= 0\n"));
  }
}

} // namespace
