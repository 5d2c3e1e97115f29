// The calls of this room's case files, the numbers with names, and the table of Windows names.

#include "support/dispatch.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <set>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

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

const std::pair<int32_t, const char *> namedPages[] = {
    {874, "windows-874"}, {932, "shift-jis"},   {936, "windows-936"},
    {949, "windows-949"}, {950, "windows-950"}, {1200, "utf-16be"},
    {1208, "utf-8"},      {57352, "utf-8"},     {57355, "sbcs"},
    {57356, "dbcs"},      {57357, "mbcs"},      {57358, "utf-16be"},
    {57359, "utf-16le"},  {57360, "utf-32be"},  {57361, "utf-32le"},
    {57362, "hz"},        {57363, "scsu"},      {57365, "iscii,version=0"},
    {57366, "utf-7"},     {57367, "bocu1"},     {57368, "utf-16"},
    {57369, "utf-32"},    {57370, "cesu-8"},    {57371, "gb18030"},
    {57372, "ucs-2"}};
const std::set<int32_t> twoNullPages = {1200, 57358, 57359, 57368};

std::string nameOf(const LocalUConverterPointer &converter) {
  UErrorCode error = U_ZERO_ERROR;
  return converter.isNull() ? "none" : ucnv_getName(converter.getAlias(), &error);
}

TEST(NamedPages, AreWhatIcuOpensByThatName) {
  for (const auto &[page, name] : namedPages) {
    SCOPED_TRACE(page);
    UErrorCode error = U_ZERO_ERROR;
    const LocalUConverterPointer bare(ucnv_open(name, &error));
    int32_t twoNulls = 99;
    int32_t status = 99;
    const support::Recording recording(support::traceDetail);
    const LocalUConverterPointer converter(NLS2_MapCodepageIdToName(page, &twoNulls, &status));
    EXPECT_EQ(nameOf(converter), nameOf(bare));
    EXPECT_EQ(twoNulls, twoNullPages.contains(page) ? 1 : 0);
    EXPECT_EQ(status, error);
    EXPECT_EQ(recording.lines().at(1), std::string("NLS2_MapCodepageIdToName: ") +
                                           "Open a converter for codepage " + name + ".");
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
