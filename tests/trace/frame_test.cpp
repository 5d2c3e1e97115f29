// The trace frame from the host's side: anchors, syncs, events and their flags.

#include "nls2.h"
#include "support/recording_host.h"

#include <algorithm>
#include <gtest/gtest.h>

namespace {

using support::Recording;
using support::seen;
using support::SeenFunction;

int32_t translate(uint32_t options) {
  char output[16] = {};
  int32_t consumed = 0;
  int32_t status = 0;
  return NLS2_TranslateString(1208, output, sizeof output, 37, "\xC1\xC2\x40", 3, &consumed,
                              options, &status);
}

// The trace of a call with these flags.
std::vector<std::string> linesOf(uint32_t flags, uint32_t options) {
  const Recording recording(flags);
  EXPECT_EQ(translate(options), options == 0 ? 3 : options == NLS2_STRING_FILL ? 16 : 0);
  return recording.lines();
}

TEST(Frame, AnchorsAreAsTheLibraryDescribesItself) {
  linesOf(support::traceEvents, NLS2_STRING_FILL);
  for (const auto &[name, attributes] :
       {std::pair("NLS2_TranslateString", 0x200U), std::pair("NLS2_MapCodepageIdToName", 0x200U),
        std::pair("realloc_mem", 0x800U)}) {
    SCOPED_TRACE(name);
    const SeenFunction function = seen(name);
    const TRC1_EntryBlock &anchor = function.atFirstSync;
    ASSERT_GT(function.syncs, 0U);
    EXPECT_EQ(anchor.unit, seen("NLS2_TranslateString").atFirstSync.unit);
    EXPECT_EQ(std::string(anchor.functionName), name);
    EXPECT_EQ(anchor.functionNameLength, std::string(name).size());
    EXPECT_EQ(anchor.attributes, attributes);
    EXPECT_TRUE(anchor.entryLine == function.entryEventLine && anchor.entryLine > 0);
    EXPECT_EQ(function.wordAtFirstSync, 1U);
    EXPECT_EQ(anchor.cachedFlags | anchor.cachedSync | anchor.reserved[0] | anchor.reserved[1], 0U);
  }
}

TEST(Frame, UnitBlockDescribesTheLibrary) {
  translate(0);
  const TRC1_UnitBlock &unit = *seen("NLS2_TranslateString").atFirstSync.unit;
  char text[160];
  std::snprintf(text, sizeof text, "%u %X %s %u %s %u %s %u %s %u %s %u %u %u", unit.formatVersion,
                unit.attributes, unit.fileName, unit.fileNameLength, unit.buildDate,
                unit.buildDateLength, unit.buildTime, unit.buildTimeLength, unit.level,
                unit.levelLength, unit.mark, unit.markLength, unit.reserved[0], unit.reserved[1]);
  EXPECT_STREQ(text, "400 30000000 nls2.cpp 8 Mar  9 2007 11 19:13:31 8 100 3 * 1 0 0");
  EXPECT_STREQ(unit.buildStamp(), NLS2_BuildStamp());
}

TEST(Frame, SyncsOnTheFirstCallAndWheneverTheWordHasChanged) {
  const Recording recording(support::traceEvents);
  translate(0);
  const SeenFunction before = seen("NLS2_TranslateString");
  EXPECT_NE(before.anchor->sync, before.atFirstSync.sync) << "the host has moved the pointer";
  const uint32_t cached = before.anchor->cachedSync;
  translate(0);
  EXPECT_EQ(seen("NLS2_TranslateString").syncs, before.syncs);
  EXPECT_EQ(before.anchor->cachedFlags, support::traceEvents);
  EXPECT_EQ(before.anchor->cachedSync, cached) << "stored by the host alone";
  support::changeSyncWord();
  translate(0);
  translate(0);
  EXPECT_EQ(seen("NLS2_TranslateString").syncs, before.syncs + 1);
  EXPECT_EQ(*before.atFirstSync.sync, 1U) << "the library's own word is the host's to change";
}

TEST(Frame, EachKindOfLineHasItsFlagAndNoFlagChangesAResult) {
  const auto isEvent = [](const std::string &line) {
    return line.find("> entry") != line.npos || line.find('=') != line.npos;
  };
  for (const uint32_t options : {0U, uint32_t{NLS2_STRING_FILL}, 1U}) {
    const auto events = linesOf(support::traceEvents, options);
    const auto details = linesOf(support::traceDetail, options);
    EXPECT_TRUE(std::ranges::all_of(events, isEvent));
    EXPECT_TRUE(!details.empty() && std::ranges::none_of(details, isEvent));
    EXPECT_EQ(events.size() + details.size(), linesOf(support::traceAll, options).size());
    EXPECT_TRUE(linesOf(~support::traceAll, options).empty());
  }
}

} // namespace
