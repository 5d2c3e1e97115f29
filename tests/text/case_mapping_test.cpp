// NLS2_MapString: what little it maps, and each way out.

#include "nls2.h"
#include "support/call_trace.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <string>

namespace {

using namespace std::string_literals;
using support::hex;
using support::LiveLocale;

const uint32_t optionSets[] = {NLS2_MAP_FOLDCASE, NLS2_MAP_UPPERCASE, NLS2_MAP_LOWERCASE, 0, 0x410};

TEST(MapString, MapsTheEmptyTextIntoTwoNulls) {
  const struct {
    const char *reason;
    uint32_t codepage;
    std::string src; // up to its first null
    int32_t dlen, result;
    std::string dest; // what becomes of "########"
  } rows[] = {
      {"two nulls", 819, ""s, 2, 2, "\0\0######"s},
      {"and ICU's own where there is room", 819, ""s, 8, 2, "\0\0\0#####"s},
      {"too small", 819, ""s, 1, 15, "\0#######"s},
      {"no room at all", 819, ""s, 0, 15, "########"s},
      {"a negative size", 819, ""s, -1, 1, "########"s},
      {"a big-endian page", 1200, ""s, 4, 4, "\0\0\0\0####"s},
      {"where ASCII text counts as empty", 1200, "\0A\0"s, 4, 4, "\0\0\0\0####"s},
      {"a little-endian page, where it does not", 1202, "A\0\0"s, 8, 15, "########"s},
      {"text", 819, "a"s, 8, 15, "########"s},
      {"text that would not change", 1208, "\xE6\x97\xA5"s, 8, 15, "########"s},
      {"shifts alone are no text", 930, "\x0E\x0F"s, 2, 2, "\0\0######"s},
      {"a private number is no CCSID", 57352, ""s, 8, 4, "########"s},
  };
  for (const auto &row : rows) {
    const LiveLocale locale(row.codepage);
    const int before = support::openConverters();
    for (const uint32_t options : optionSets) {
      for (const int32_t slen : {0, 1, -1, 12345}) {
        std::string dest = "########";
        EXPECT_EQ(
            NLS2_MapString(locale.get(), dest.data(), row.dlen, row.src.c_str(), slen, options),
            row.result)
            << row.reason << ", options " << options;
        EXPECT_EQ(dest, row.dest) << row.reason << ", options " << options;
      }
    }
    EXPECT_EQ(support::openConverters(), before) << row.reason;
  }
}

TEST(MapString, TracesEachWayOut) {
  static const NLS2_Locale notLive{};
  const LiveLocale live(819);
  const LiveLocale none(57364);
  const auto expect = [&](const NLS2_Locale *locale, const char *src, int32_t dlen,
                          uint32_t options, std::vector<support::Step> steps) {
    char dest[4];
    char input[160];
    std::snprintf(input, sizeof input,
                  "Input parameters: pLocale %s, dest %s, dlen %d, src %s, slen 77,options %x.\n",
                  hex(locale).c_str(), hex(dest).c_str(), dlen, hex(src).c_str(), options);
    steps[0].lines = input + steps[0].lines;
    support::expectSteps("NLS2_MapString", steps,
                         [&] { return NLS2_MapString(locale, dest, dlen, src, 77, options); });
  };
  const std::string opened = "ValidateLocale= 0\n+ucnv\n";
  const std::string both = opened + "realloc_mem=\nrealloc_mem=\n";
  expect(&notLive, "", 4, 0x400, {{"", {}, "ValidateLocale= 38\n= 38\n", 38}});
  expect(none.get(), "", 4, 0x400, {{"", {}, "ValidateLocale= 0\n= 4\n", 4}});
  expect(live.get(), "a", 4, 0x400, {{opened, {}, "-ucnv\n= 15\n", 15}});
  expect(
      live.get(), "", 4, 0x400,
      {{opened, {"ucnv_toUChars", 1}, "-ucnv\n= 7\n", 7},
       {"",
        {nullptr, 0, 2},
        "Memory allocation failure: Size(2), Old((nil))\nrealloc_mem=\n-ucnv\n"
        "Invalid locale.\n= 32\n",
        32},
       {"realloc_mem=\n", {"ucnv_toUChars", 2}, "-ucnv\n= 7\n", 7},
       {"",
        {nullptr, 0, 4},
        "Memory allocation failure: Size(4), Old((nil))\nrealloc_mem=\n-ucnv\n= 32\n",
        32},
       {"realloc_mem=\n", {"u_strToUpper", 1}, "Error occurred during mapping 7.\n-ucnv\n= 7\n", 7},
       {"", {"ucnv_fromUChars", 1}, "Error occurred during conversion 7.\n-ucnv\n= 7\n", 7},
       {"-ucnv\n= 2\n", {}, "", 2}});
  expect(live.get(), "", 4, 0x800,
         {{both, {"u_strToLower", 1}, "Error occurred during mapping 7.\n-ucnv\n= 7\n", 7}});
  expect(live.get(), "", 4, 0x10,
         {{both, {"u_strFoldCase", 1}, "Error occurred during mapping 7.\n-ucnv\n= 7\n", 7}});
  expect(live.get(), "", 4, 0x410, {{both, {}, "No opiton specified.\n-ucnv\n= 2\n", 2}});
}

} // namespace
