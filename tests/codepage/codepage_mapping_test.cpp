// NLS2_MapCodepageIdToName: traces, and the converter against ICU's own opens.

#include "nls2.h"
#include "support/known_call.h"

#include <climits>
#include <gtest/gtest.h>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;

struct Row {
  int32_t codepage;
  const char *name; // null: opened as a CCSID
};
// clang-format off
const Row rows[] = {
    {874, "windows-874"}, {932, "shift-jis"}, {936, "windows-936"}, {949, "windows-949"},
    {950, "windows-950"}, {1200, "utf-16be"}, {1208, "utf-8"}, {57352, "utf-8"}, {57355, "sbcs"},
    {57356, "dbcs"}, {57357, "mbcs"}, {57358, "utf-16be"}, {57359, "utf-16le"},
    {57360, "utf-32be"}, {57361, "utf-32le"}, {57362, "hz"}, {57363, "scsu"},
    {57365, "iscii,version=0"}, {57366, "utf-7"}, {57367, "bocu1"}, {57368, "utf-16"},
    {57369, "utf-32"}, {57370, "cesu-8"}, {57371, "gb18030"}, {57372, "ucs-2"},
    // Numbers beside them, and the ends of the range.
    {37, nullptr}, {819, nullptr}, {875, nullptr}, {943, nullptr}, {1201, nullptr},
    {1202, nullptr}, {57351, nullptr}, {57353, nullptr}, {57354, nullptr}, {57364, nullptr},
    {57373, nullptr}, {0, nullptr}, {-1, nullptr}, {INT32_MAX, nullptr}, {INT32_MIN, nullptr},
};
// clang-format on

std::string nameOf(const LocalUConverterPointer &converter) {
  UErrorCode error = U_ZERO_ERROR;
  return converter.isNull() ? "none" : ucnv_getName(converter.getAlias(), &error);
}

// The trace ends in the two-null flag and the status.
void expectOpen(const Row &row, const std::string &section, const std::string &fault,
                const std::string &expected) {
  LocalUConverterPointer converter;
  support::expectKnownCall(section, fault, {}, [&](int32_t *status) {
    int32_t twoNull = 99;
    converter.adoptInstead(NLS2_MapCodepageIdToName(row.codepage, &twoNull, status));
    return twoNull;
  });
  EXPECT_EQ(nameOf(converter), expected) << row.codepage;
}

TEST(CodepageMapping, OpensWhatIcuOpensForTheNameOrTheNumber) {
  for (const Row &row : rows) {
    UErrorCode error = U_ZERO_ERROR;
    const LocalUConverterPointer icu(row.name != nullptr
                                         ? ucnv_open(row.name, &error)
                                         : ucnv_openCCSID(row.codepage, UCNV_IBM, &error));
    expectOpen(row, "code page " + std::to_string(row.codepage), "", nameOf(icu));
  }
}

TEST(CodepageMapping, IcusFailureComesBackAndTheFlagStays) {
  expectOpen({57368, "utf-16"}, "code page 57368, ICU fails", "ucnv_open 1", "none");
  expectOpen({37, nullptr}, "code page 37, ICU fails", "ucnv_openCCSID 1", "none");
}

} // namespace
