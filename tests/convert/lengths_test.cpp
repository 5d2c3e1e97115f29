// Lengths and the size ratio of code pages.

#include "nls2.h"
#include "support/live_locale.h"

#include <gtest/gtest.h>

namespace {

using support::LiveLocale;

TEST(Lengths, ConversionRatioByLargestCharacterSizes) {
  const struct {
    const char *reason;
    uint32_t dest, source;
    int32_t ratio;
  } rows[] = {
      {"one page, and no converter for it", 57364, 57364, 1},
      {"3 over 1: the destination's size itself", 1208, 819, 3},
      {"1 over 3: the next multiple of the source's", 819, 1208, 3},
      {"3 over 2", 1208, 1200, 4},
      {"4 over 2: the size, not the quotient", 57371, 1200, 4},
      {"4 over 3", 57371, 1208, 6},
      {"equal sizes of two pages: the size, not 1", 1208, 930, 3},
      {"1 over 1", 37, 819, 1},
  };
  for (const auto &row : rows) {
    int32_t status = 99;
    EXPECT_EQ(
        NLS2_ConversionRatio(LiveLocale(row.dest).get(), LiveLocale(row.source).get(), &status),
        row.ratio)
        << row.reason;
    EXPECT_EQ(status, 0) << row.reason;
  }
}

TEST(Lengths, StrlenCountsUnits) {
  const struct {
    const char *reason;
    uint32_t codepage;
    const char *text;
    int32_t length;
  } rows[] = {
      {"empty", 1208, "", 0},
      {"two bytes, one unit", 1208, "caf\xC3\xA9", 4},
      {"a supplementary character is two units", 1208, "x\xF0\x9F\x98\x80", 3},
      {"a byte that does not convert counts as its substitute", 1208, "a\xFF", 2},
      {"shifted double bytes", 930, "\x0E\x44\x7E\x0F", 1},
      {"a 16-bit page ends at its first zero byte", 1200, "\0A", 0},
  };
  for (const auto &row : rows) {
    int32_t status = 99;
    EXPECT_EQ(NLS2_Strlen(LiveLocale(row.codepage).get(), row.text, 12345, &status), row.length)
        << row.reason;
    EXPECT_EQ(status, 99) << row.reason;
  }
}

TEST(Lengths, ByteLengthByTheFirstByteAlone) {
  const LiveLocale locale(37);
  for (int byte = 0; byte <= 0xFF; ++byte) {
    const char alone[] = {static_cast<char>(byte)};
    const int32_t length = byte < 0xC0 || byte > 0xF4 ? 1 : byte < 0xE0 ? 2 : byte < 0xF0 ? 3 : 4;
    int32_t status = 99;
    EXPECT_EQ(NLS2_ByteLength(locale.get(), alone, &status), length) << byte;
    EXPECT_EQ(status, 0) << byte;
  }
}

} // namespace
