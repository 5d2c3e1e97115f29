// The calls of this room's case files, and the table of Windows names.

#include "support/dispatch.h"

#include <gtest/gtest.h>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using support::shown;
using support::Words;

std::string nameOf(const LocalUConverterPointer &converter) {
  UErrorCode error = U_ZERO_ERROR;
  return converter.isNull() ? "none" : ucnv_getName(converter.getAlias(), &error);
}

// The second word is the name that ICU should open the page by, or "ccsid".
std::string mapToName(const Words &w) {
  int32_t twoNulls = 99;
  int32_t status = 99;
  const LocalUConverterPointer converter(NLS2_MapCodepageIdToName(w.number(0), &twoNulls, &status));
  UErrorCode error = U_ZERO_ERROR;
  const LocalUConverterPointer bare(w[1] == "ccsid" ? ucnv_openCCSID(w.number(0), UCNV_IBM, &error)
                                                    : ucnv_open(w[1].c_str(), &error));
  EXPECT_EQ(nameOf(converter), nameOf(bare)) << w[1];
  return shown(converter.getAlias()) + ", " + shown(twoNulls) + ", " + shown(status);
}

TEST(Codepage, Cases) {
  support::expectCases(CASES_FOLDER, {{"NLS2_MapCodepageIdToName", mapToName},
                                      CALL(NLS2_MapWindowsNameToCCSID),
                                      CALL(NLS2_GetCodepageName),
                                      CALL(NLS2_GetCodepageId)});
}

TEST(WindowsNames, AreFrozen) {
  support::Digest digest;
  for (const CcsidMapEntry &entry : ccsidMap) {
    digest.bytes(entry.name).number(entry.ccsid);
  }
  EXPECT_EQ(digest.value, 15296640311129246981U);
}

} // namespace
