// The calls of this room's case files, the numbers with names, and the table of Windows names.

#include "support/dispatch.h"
#include "support/pages.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>

namespace {

using icu::LocalUConverterPointer;
using support::shown;
using support::Words;

std::string mapToName(const Words &w) {
  int32_t twoNulls = 99;
  int32_t status = 99;
  const LocalUConverterPointer converter(NLS2_MapCodepageIdToName(w.number(0), &twoNulls, &status));
  return shown(converter.getAlias()) + ", " + shown(twoNulls) + ", " + shown(status);
}

TEST(Codepage, Cases) {
  support::expectCases(CASES_FOLDER, {{"NLS2_MapCodepageIdToName", mapToName},
                                      CALL(NLS2_MapWindowsNameToCCSID),
                                      CALL(NLS2_GetCodepageName),
                                      CALL(NLS2_GetCodepageId)});
}

std::string nameOf(const LocalUConverterPointer &converter) {
  UErrorCode error = U_ZERO_ERROR;
  return converter.isNull() ? "none" : ucnv_getName(converter.getAlias(), &error);
}

TEST(NamedPages, AreWhatIcuOpensByThatName) {
  for (const support::Page &page : support::pages) {
    SCOPED_TRACE(page.number);
    int32_t twoNulls = 99;
    int32_t status = 99;
    const support::Recording recording(support::traceDetail);
    const LocalUConverterPointer converter(
        NLS2_MapCodepageIdToName(page.number, &twoNulls, &status));
    EXPECT_EQ(nameOf(converter), nameOf(open(page)));
    EXPECT_EQ(twoNulls, page.terminator - 1);
    EXPECT_LE(status, 0);
    const std::string opened = std::string("Open a converter for codepage ") + page.icuName + ".";
    EXPECT_EQ(recording.lines().at(1) == "NLS2_MapCodepageIdToName: " + opened, page.isNamed);
  }
}

TEST(WindowsNames, AreFrozen) {
  support::Digest digest;
  for (const CcsidMapEntry &entry : ccsidMap) {
    digest.bytes(entry.name).number(entry.ccsid);
  }
  EXPECT_EQ(digest.value, 15296640311129246981U);
}

} // namespace
