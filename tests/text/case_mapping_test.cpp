// NLS2_MapString: what little it maps.

#include "nls2.h"
#include "support/icu_probe.h"
#include "support/live_locale.h"

#include <gtest/gtest.h>
#include <string>

namespace {

using namespace std::string_literals;
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

} // namespace
