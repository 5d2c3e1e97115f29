// NLS2_StringToUnicode and NLS2_UnicodeToString: the in-place layout.

#include "nls2.h"
#include "support/live_locale.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <unicode/ucnv.h>

namespace {

using support::LiveLocale;

using Function = decltype(&NLS2_StringToUnicode);

TEST(Unicode, OneBufferForInputAndOutput) {
  const struct {
    const char *reason;
    Function function;
    uint32_t codepage;
    const char *from, *to;
    std::string text;
    size_t times = 1;
  } rows[] = {
      {"empty", NLS2_StringToUnicode, 819, "ibm-819", "utf-8", ""},
      {"as long", NLS2_StringToUnicode, 37, "ibm-37", "utf-8", "\xC1\xC2\xC3", 2000},
      {"grows within ICU's pivot", NLS2_StringToUnicode, 819, "ibm-819", "utf-8", "\xE9", 1024},
      {"shrinks", NLS2_StringToUnicode, 930, "ibm-930", "utf-8", "\x0E\x44\x7E\x0F\xC1"},
      {"shrinks, at any length", NLS2_UnicodeToString, 819, "utf-8", "ibm-819", "caf\xC3\xA9",
       2000},
      {"the CCSID's table, not the Windows one", NLS2_UnicodeToString, 932, "utf-8", "ibm-942",
       "\xE2\x80\xBE\xEF\xBD\xB1"},
      {"what does not convert is substituted", NLS2_UnicodeToString, 819, "utf-8", "ibm-819",
       "\xE2\x82\xAC\xFF"},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    const LiveLocale locale(row.codepage);
    std::string text;
    for (size_t i = 0; i < row.times; ++i) {
      text += row.text;
    }
    const auto length = static_cast<int32_t>(text.size());
    std::string expected(2 * text.size(), '\0');
    UErrorCode error = U_ZERO_ERROR;
    expected.resize(static_cast<size_t>(
        ucnv_convert(row.to, row.from, expected.data(), 2 * length, text.data(), length, &error)));
    for (const size_t room : {0U, 3U}) {
      // dest lies inside the buffer; only its sum with dlen counts.
      const size_t size = std::max(text.size(), expected.size() + room);
      std::string buffer = text + std::string(size + 4 - text.size(), '#');
      const auto dlen = static_cast<int32_t>(expected.size() + room);
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

} // namespace
