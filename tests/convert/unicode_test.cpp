// NLS2_StringToUnicode and NLS2_UnicodeToString: the in-place layout, and each way out.

#include "nls2.h"
#include "support/call_trace.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <string>
#include <unicode/ucnv.h>

namespace {

using support::hex;
using support::LiveLocale;

using Function = decltype(&NLS2_StringToUnicode);

std::string repeat(const std::string &text, int times) {
  std::string all;
  for (int i = 0; i < times; ++i) {
    all += text;
  }
  return all;
}

TEST(Unicode, OneBufferForInputAndOutput) {
  const struct {
    const char *reason;
    Function function;
    uint32_t codepage;
    const char *from, *to;
    std::string text;
  } rows[] = {
      {"empty", NLS2_StringToUnicode, 819, "ibm-819", "utf-8", ""},
      {"as long", NLS2_StringToUnicode, 37, "ibm-37", "utf-8", repeat("\xC1\xC2\xC3", 2000)},
      {"grows within ICU's pivot", NLS2_StringToUnicode, 819, "ibm-819", "utf-8",
       repeat("\xE9", 1024)},
      {"shrinks", NLS2_StringToUnicode, 930, "ibm-930", "utf-8", "\x0E\x44\x7E\x0F\xC1"},
      {"shrinks, at any length", NLS2_UnicodeToString, 819, "utf-8", "ibm-819",
       repeat("caf\xC3\xA9", 2000)},
      {"the CCSID's table, not the Windows one", NLS2_UnicodeToString, 932, "utf-8", "ibm-942",
       "\xE2\x80\xBE\xEF\xBD\xB1"},
      {"what does not convert is substituted", NLS2_UnicodeToString, 819, "utf-8", "ibm-819",
       "\xE2\x82\xAC\xFF"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    const LiveLocale locale(row.codepage);
    const auto length = static_cast<int32_t>(row.text.size());
    std::string expected(2 * row.text.size(), '\0');
    UErrorCode error = U_ZERO_ERROR;
    expected.resize(static_cast<size_t>(ucnv_convert(row.to, row.from, expected.data(), 2 * length,
                                                     row.text.data(), length, &error)));
    for (const int32_t room : {0, 3}) {
      // dest lies inside the buffer; only its sum with dlen counts.
      const size_t size = std::max(row.text.size(), expected.size() + static_cast<size_t>(room));
      std::string buffer = row.text + std::string(size + 4 - row.text.size(), '#');
      const auto dlen = static_cast<int32_t>(expected.size()) + room;
      const int32_t offset = dlen / 2;
      int32_t status = 99;
      EXPECT_EQ(row.function(locale.get(), buffer.data() + offset, dlen - offset, buffer.data(),
                             length, &status),
                static_cast<int32_t>(expected.size()) - length);
      EXPECT_EQ(status, 0);
      EXPECT_EQ(buffer.substr(0, expected.size()), expected);
      EXPECT_EQ(buffer.substr(size), "####");
    }
  }
}

TEST(Unicode, RefusesOtherLayouts) {
  const LiveLocale locale(819);
  const struct {
    const char *reason;
    int32_t destOffset, dlen, slen, status;
  } rows[] = {
      {"no room for the last character", 4, 3, 4, 15},
      {"the end lies before the input", 0, 3, 4, 1},
      {"a negative capacity", 4, -1, 4, 1},
      {"a negative length", 4, 8, -1, 1},
  };
  for (const auto &row : rows) {
    for (const Function function : {&NLS2_StringToUnicode, &NLS2_UnicodeToString}) {
      std::string buffer = "....abcd####";
      const int before = support::openConverters();
      int32_t status = 99;
      EXPECT_EQ(function(locale.get(), buffer.data() + row.destOffset, row.dlen, buffer.data() + 4,
                         row.slen, &status),
                0)
          << row.reason;
      EXPECT_EQ(status, row.status) << row.reason;
      EXPECT_EQ(buffer, "....abcd####") << row.reason;
      EXPECT_EQ(support::openConverters(), before) << row.reason;
    }
  }
}

TEST(Unicode, TracesEachWayOut) {
  static const NLS2_Locale notLive{};
  const LiveLocale live(819);
  const LiveLocale byName(57372);
  const std::string valid = "ValidateLocale= 0\n";
  for (const bool toUnicode : {true, false}) {
    const Function function = toUnicode ? &NLS2_StringToUnicode : &NLS2_UnicodeToString;
    const char *name = toUnicode ? "NLS2_StringToUnicode" : "NLS2_UnicodeToString";
    const NLS2_Locale *locale = nullptr;
    const auto expect = [&](std::vector<support::Step> steps) {
      steps[0].lines = "Input parameters: pLocale " + hex(locale) + ", dest cd, dlen 2, src abc, " +
                       (toUnicode ? "slen2" : "slen ") + "3.\n" + steps[0].lines;
      support::expectSteps(name, steps, [&] {
        const auto buffer = support::exact<char>("abcd");
        int32_t status = 99;
        function(locale, buffer.get() + 2, 2, buffer.get(), 3, &status);
        return status;
      });
    };
    locale = &notLive;
    expect({{"", {}, "ValidateLocale= 38\n= 0\n", 38}});
    locale = byName.get();
    expect({{valid,
             {},
             toUnicode ? "Error opening source code converter. 4\n= 0\n"
                       : "+ucnv\nCould not open CCSID converter for codepage 57372\n-ucnv\n= 0\n",
             4}});
    locale = live.get();
    expect({{valid + (toUnicode ? "+ucnv\n" : ""),
             {"ucnv_open", 1},
             toUnicode ? "Error opening UTF-8 Converter. 7\n-ucnv\n= 0\n" : "= 0\n",
             7},
            {toUnicode ? "+ucnv\n" : "+ucnv\n+ucnv\n",
             {"ucnv_convertEx", 1},
             toUnicode ? "Could not map source codepage id to name. 7\n-ucnv\n-ucnv\n= 0\n"
                       : "Could not convert source to destination 7\n-ucnv\n-ucnv\n= 0\n",
             7},
            {"-ucnv\n-ucnv\n= 0\n", {}, "", 0}});
  }
}

} // namespace
