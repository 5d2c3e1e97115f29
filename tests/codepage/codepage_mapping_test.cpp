// NLS2_MapCodepageIdToName against ICU's own opens, number by number.

#include "nls2.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <climits>
#include <gtest/gtest.h>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using support::Recording;

struct Row {
  int32_t codepage;
  const char *name; // null: opened as a CCSID
  int32_t twoNull;
};
// clang-format off
const Row rows[] = {
    {874, "windows-874", 0}, {932, "shift-jis", 0}, {936, "windows-936", 0},
    {949, "windows-949", 0}, {950, "windows-950", 0}, {1200, "utf-16be", 1},
    {1208, "utf-8", 0}, {57352, "utf-8", 0}, {57355, "sbcs", 0},
    {57356, "dbcs", 0}, {57357, "mbcs", 0}, {57358, "utf-16be", 1},
    {57359, "utf-16le", 1}, {57360, "utf-32be", 0}, {57361, "utf-32le", 0},
    {57362, "hz", 0}, {57363, "scsu", 0}, {57365, "iscii,version=0", 0},
    {57366, "utf-7", 0}, {57367, "bocu1", 0}, {57368, "utf-16", 1},
    {57369, "utf-32", 0}, {57370, "cesu-8", 0}, {57371, "gb18030", 0},
    {57372, "ucs-2", 0},
    // Numbers beside them, and the ends of the range.
    {37, nullptr, 0}, {819, nullptr, 0}, {875, nullptr, 0},
    {943, nullptr, 0}, {1201, nullptr, 0}, {1202, nullptr, 0},
    {57351, nullptr, 0}, {57353, nullptr, 0}, {57354, nullptr, 0},
    {57364, nullptr, 0}, {57373, nullptr, 0}, {0, nullptr, 0},
    {-1, nullptr, 0}, {INT32_MAX, nullptr, 0}, {INT32_MIN, nullptr, 0},
};
// clang-format on

std::string converterName(const LocalUConverterPointer &converter) {
  UErrorCode error = U_ZERO_ERROR;
  return converter.isNull() ? "none" : ucnv_getName(converter.getAlias(), &error);
}

std::string expectedTrace(const Row &row, int32_t status, const UConverter *converter) {
  const std::string number = std::to_string(row.codepage);
  std::string text = "M> entry\nM: Open a converter for codepage number " + number + ".\n";
  if (row.name != nullptr) {
    text += "M: Open a converter for codepage " + std::string(row.name) + ".\n";
  } else {
    text += "M: Codepage " + number + " not mapped to name. Using codepage as CCSID instead.\n";
  }
  if (row.twoNull != 0) {
    text += "M: Codepage uses two null character as a string terminator..\n";
  }
  text += converter != nullptr ? "+ucnv\n" : "";
  return text + "M: Open converter results " + std::to_string(status) +
         ".\nM= " + support::exitValue(converter) + "\n";
}

LocalUConverterPointer openTraced(const Row &row, int32_t &twoNull, int32_t &status,
                                  std::string &trace) {
  const Recording recording(support::traceAll);
  const support::ConverterMarks marks;
  LocalUConverterPointer converter(NLS2_MapCodepageIdToName(row.codepage, &twoNull, &status));
  trace = recording.text({{"NLS2_MapCodepageIdToName", "M"}});
  return converter;
}

TEST(CodepageMapping, OpensWhatIcuOpensForTheNameOrTheNumber) {
  for (const Row &row : rows) {
    SCOPED_TRACE(row.codepage);
    UErrorCode error = U_ZERO_ERROR;
    const LocalUConverterPointer expected(row.name != nullptr
                                              ? ucnv_open(row.name, &error)
                                              : ucnv_openCCSID(row.codepage, UCNV_IBM, &error));
    int32_t twoNull = 99;
    int32_t status = 99;
    std::string trace;
    const LocalUConverterPointer converter = openTraced(row, twoNull, status, trace);
    EXPECT_EQ(converterName(converter), converterName(expected));
    EXPECT_EQ(status, error);
    EXPECT_EQ(twoNull, row.twoNull);
    EXPECT_EQ(trace, expectedTrace(row, status, converter.getAlias()));
  }
}

TEST(CodepageMapping, IcusFailureComesBackAndTheFlagStays) {
  for (const Row &row : {Row{57368, "utf-16", 1}, Row{37, nullptr, 0}}) {
    const support::FailingOpens failing(U_MEMORY_ALLOCATION_ERROR);
    int32_t twoNull = 99;
    int32_t status = 99;
    std::string trace;
    EXPECT_TRUE(openTraced(row, twoNull, status, trace).isNull());
    EXPECT_EQ(status, U_MEMORY_ALLOCATION_ERROR);
    EXPECT_EQ(twoNull, row.twoNull);
    EXPECT_EQ(trace, expectedTrace(row, status, nullptr));
  }
}

// Known answers of ICU's standard data, which a comparison with the installed ICU would not hold.
TEST(CodepageMapping, KnownStatuses) {
  const struct {
    const char *reason;
    int32_t codepage;
    int32_t status;
  } known[] = {
      {"shift-jis names several tables: ICU's warning is stored", 932, U_AMBIGUOUS_ALIAS_WARNING},
      {"not one of the named numbers, and no CCSID", 57364, U_FILE_ACCESS_ERROR},
      {"no table of this name", 57355, U_FILE_ACCESS_ERROR},
      {"utf-8", 1208, U_ZERO_ERROR},
  };
  for (const auto &row : known) {
    int32_t twoNull = 0;
    int32_t status = 99;
    const LocalUConverterPointer converter(
        NLS2_MapCodepageIdToName(row.codepage, &twoNull, &status));
    EXPECT_EQ(status, row.status) << row.reason;
    EXPECT_EQ(converter.isNull(), row.status > 0) << row.reason;
  }
}

} // namespace
