// The trace frame as a host sees it: anchors, syncs, events and their flags.

#include "nls2.h"
#include "support/recording_host.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <functional>
#include <gtest/gtest.h>

namespace {

using support::Recording;
using support::seen;
using support::SeenFunction;

constexpr auto translateString = "NLS2_TranslateString";

int32_t translate(uint32_t options, int32_t destCodePage = 1208) {
  char output[16] = {};
  int32_t consumed = 0;
  int32_t status = 0;
  const int32_t written = NLS2_TranslateString(destCodePage, output, sizeof output, 37,
                                               "\xC1\xC2\x40", 3, &consumed, options, &status);
  return written * 100 + status;
}

int32_t findWindowsName(const char *name) {
  int32_t status = 0;
  return static_cast<int32_t>(NLS2_MapWindowsNameToCCSID(name, &status)) + status;
}

int32_t findLocale(uint32_t id) {
  const LocaleMapEntry *entry = NLS2_GetLocaleMapEntry(id);
  return entry != nullptr ? static_cast<int32_t>(entry - localeMap) : -1;
}

// Calls of each kind of way out.
struct Call {
  const char *reason;
  std::function<int32_t()> run;
};
const Call calls[] = {
    {"locale found", [] { return findLocale(0x03480001); }},
    {"locale not found", [] { return findLocale(0xFF); }},
    {"Windows name not found", [] { return findWindowsName("windows-1252"); }},
    {"direct translation", [] { return translate(0); }},
    {"filled translation", [] { return translate(NLS2_STRING_FILL); }},
    {"option refused", [] { return translate(1); }},
    {"destination not opened", [] { return translate(0, 57364); }},
};

void callAll() {
  for (const Call &call : calls) {
    call.run();
  }
}

TEST(Frame, AnchorsAreAsTheLibraryDescribesItself) {
  const Recording recording(support::traceEvents);
  callAll();
  const struct {
    const char *name;
    uint32_t attributes;
  } rows[] = {
      {"NLS2_GetLocaleMapEntry", 0x200},
      {"NLS2_MapCodepageIdToName", 0x200},
      {"NLS2_MapWindowsNameToCCSID", 0x200},
      {translateString, 0x200},
      {"realloc_mem", 0x800},
  };
  const TRC1_UnitBlock *unit = seen(translateString).atFirstSync.unit;
  for (const auto &row : rows) {
    SCOPED_TRACE(row.name);
    const SeenFunction function = seen(row.name);
    const TRC1_EntryBlock &anchor = function.atFirstSync;
    ASSERT_GT(function.syncs, 0U);
    EXPECT_EQ(anchor.unit, unit);
    EXPECT_STREQ(anchor.functionName, row.name);
    EXPECT_EQ(anchor.functionNameLength, std::strlen(row.name));
    EXPECT_EQ(anchor.attributes, row.attributes);
    EXPECT_EQ(anchor.entryLine, function.entryEventLine);
    EXPECT_GT(anchor.entryLine, 0U);
    EXPECT_EQ(function.wordAtFirstSync, 1U);
    EXPECT_EQ(anchor.cachedFlags | anchor.cachedSync | anchor.reserved[0] | anchor.reserved[1], 0U);
  }
}

TEST(Frame, UnitBlockTellsTheLibrary) {
  callAll();
  const TRC1_UnitBlock &unit = *seen(translateString).atFirstSync.unit;
  char told[160];
  std::snprintf(told, sizeof told, "%u %X %s %u %s %u %s %u %s %u %s %u %u %u", unit.formatVersion,
                unit.attributes, unit.fileName, unit.fileNameLength, unit.buildDate,
                unit.buildDateLength, unit.buildTime, unit.buildTimeLength, unit.level,
                unit.levelLength, unit.mark, unit.markLength, unit.reserved[0], unit.reserved[1]);
  EXPECT_STREQ(told, "400 30000000 nls2.cpp 8 Mar  9 2007 11 19:13:31 8 100 3 * 1 0 0");
  EXPECT_STREQ(unit.buildStamp(), NLS2_BuildStamp());
}

TEST(Frame, SyncsOnTheFirstCallAndWheneverTheWordHasChanged) {
  const Recording recording(support::traceEvents);
  translate(0);
  const SeenFunction before = seen(translateString);
  EXPECT_NE(before.anchor->sync, before.atFirstSync.sync) << "the host has moved the pointer";
  const TRC1_EntryBlock settled = *before.anchor;
  translate(0);
  translate(1);
  EXPECT_EQ(seen(translateString).syncs, before.syncs);
  EXPECT_EQ(before.anchor->cachedFlags, settled.cachedFlags);
  EXPECT_EQ(before.anchor->cachedSync, settled.cachedSync) << "stored by the host alone";
  support::changeSyncWord();
  translate(0);
  translate(0);
  EXPECT_EQ(seen(translateString).syncs, before.syncs + 1);
  EXPECT_EQ(*before.atFirstSync.sync, 1U) << "the library's own word is the host's to change";
}

TEST(Frame, EventsAndDetailsGoByTheirFlagsAndChangeNoResult) {
  const auto isEvent = [](const std::string &line) {
    return line.find("> entry") != std::string::npos || line.find('=') != std::string::npos;
  };
  for (const Call &call : calls) {
    SCOPED_TRACE(call.reason);
    const int32_t untraced = call.run();
    std::vector<std::string> events;
    std::vector<std::string> details;
    std::vector<std::string> all;
    const std::pair<support::TraceFlags, std::vector<std::string> *> runs[] = {
        {support::traceEvents, &events},
        {support::traceDetail, &details},
        {support::traceAll, &all}};
    for (const auto &[flags, lines] : runs) {
      const Recording recording(flags);
      EXPECT_EQ(call.run(), untraced) << flags;
      *lines = recording.lines();
    }
    const Recording quiet(support::traceOff);
    EXPECT_EQ(call.run(), untraced);
    EXPECT_TRUE(quiet.lines().empty());

    EXPECT_TRUE(std::all_of(events.begin(), events.end(), isEvent));
    EXPECT_FALSE(details.empty() || std::any_of(details.begin(), details.end(), isEvent));
    EXPECT_EQ(events.size() + details.size(), all.size());
  }
}

TEST(Frame, OtherFlagBitsMeanNothing) {
  const Recording recording(static_cast<support::TraceFlags>(~0x50U));
  callAll();
  EXPECT_TRUE(recording.lines().empty());
}

} // namespace
