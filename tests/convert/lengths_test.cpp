// Lengths and the size ratio of code pages.

#include "nls2.h"
#include "support/call_trace.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <memory>
#include <string>

namespace {

using support::hex;
using support::LiveLocale;
using support::tracedCall;

const NLS2_Locale notLive{};
const std::string valid = "ValidateLocale= 0\n";
const std::string opened = "+ucnv\nMapCodepageIdToName= converter\n";

TEST(ConversionRatio, ByLargestCharacterSizes) {
  const struct {
    const char *reason;
    uint32_t dest, source;
    int32_t ratio, status;
  } rows[] = {
      {"one page", 1208, 1208, 1, 0},
      {"one page, and no converter for it", 57364, 57364, 1, 0},
      {"3 over 1: the destination's size itself", 1208, 819, 3, 0},
      {"1 over 3: the next multiple of the source's", 819, 1208, 3, 0},
      {"3 over 2", 1208, 1200, 4, 0},
      {"4 over 2: the size, not the quotient", 57371, 1200, 4, 0},
      {"4 over 3", 57371, 1208, 6, 0},
      {"equal sizes of two pages: the size, not 1", 1208, 930, 3, 0},
      {"1 over 1", 37, 819, 1, 0},
      {"destination does not open", 57364, 819, 1, 4},
      {"source does not open", 819, 57364, 1, 4},
  };
  for (const auto &row : rows) {
    const LiveLocale dest(row.dest);
    const LiveLocale source(row.source);
    int32_t status = 99;
    EXPECT_EQ(NLS2_ConversionRatio(dest.get(), source.get(), &status), row.ratio) << row.reason;
    EXPECT_EQ(status, row.status) << row.reason;
  }
}

TEST(ConversionRatio, TracesEachWayOut) {
  const LiveLocale one(819);
  const LiveLocale two(1208);
  const LiveLocale none(57364);
  const std::string unopened = "MapCodepageIdToName= 0\nCould not map ";
  const std::string toName = " codepage id to name. 4\n";
  const struct {
    const NLS2_Locale *dest, *source;
    std::string tail;
  } rows[] = {
      {two.get(), one.get(),
       valid + valid + opened + opened + "Computed ratio is 3.\n-ucnv\n-ucnv\n= 3\n"},
      {one.get(), one.get(),
       valid + valid + "Source and Destination Codepage are equal, return ratio 1:1\n= 1\n"},
      {&notLive, &notLive, "ValidateLocale= 38\n= 0\n"}, // the first one ends it
      {one.get(), &notLive, valid + "ValidateLocale= 38\n= 0\n"},
      {none.get(), one.get(), valid + valid + unopened + "destination" + toName + "= 1\n"},
      {one.get(), none.get(),
       valid + valid + opened + unopened + "source" + toName + "-ucnv\n= 1\n"},
  };
  for (const auto &row : rows) {
    int32_t status = 99;
    EXPECT_EQ(tracedCall("NLS2_ConversionRatio", {},
                         [&] { return NLS2_ConversionRatio(row.dest, row.source, &status); }),
              "> entry\nInput parameters: pDestinationLocale " + hex(row.dest) +
                  ", pSourceLocale " + hex(row.source) + ".\n" + row.tail);
  }
}

TEST(Strlen, CountsUnitsAndLeavesTheStatusAlone) {
  const struct {
    const char *reason;
    uint32_t codepage;
    const char *text;
    int32_t length, status;
  } rows[] = {
      {"empty", 1208, "", 0, 99},
      {"two bytes, one unit", 1208, "caf\xC3\xA9", 4, 99},
      {"a supplementary character is two units", 1208, "x\xF0\x9F\x98\x80", 3, 99},
      {"a byte that does not convert counts as its substitute", 1208, "a\xFF", 2, 99},
      {"shifted double bytes", 930, "\x0E\x44\x7E\x0F", 1, 99},
      {"a 16-bit page ends at its first zero byte", 1200, "\0A", 0, 99},
      {"a private number is no CCSID", 57352, "a", 0, 4},
  };
  for (const auto &row : rows) {
    const LiveLocale locale(row.codepage);
    int32_t status = 99;
    EXPECT_EQ(NLS2_Strlen(locale.get(), row.text, 12345, &status), row.length) << row.reason;
    EXPECT_EQ(status, row.status) << row.reason;
  }
}

TEST(Strlen, TracesEachWayOut) {
  const LiveLocale live(1208);
  const LiveLocale none(57352);
  const NLS2_Locale *locale = &notLive;
  int32_t status = 99;
  const support::Call call = [&] {
    NLS2_Strlen(locale, "abc", 0, &status);
    return status;
  };
  support::expectSteps("NLS2_Strlen", {{"", {}, "ValidateLocale= 38\n= 0\n", 38}}, call);
  locale = none.get();
  support::expectSteps("NLS2_Strlen",
                       {{valid + "Open the code page converter.\n",
                         {},
                         "Error opening converter for codepage 57352.\n= 0\n",
                         4}},
                       call);
  locale = live.get();
  support::expectSteps(
      "NLS2_Strlen",
      {{valid + "Open the code page converter.\n+ucnv\n"
                "Pre-flight to determine size of output buffer.\n",
        {"ucnv_toUChars", 1},
        "Error pre-flighting to UChars 7.\n-ucnv\n= 0\n",
        7},
       {"",
        {nullptr, 0, 8},
        "Memory allocation failure: Size(8), Old((nil))\nrealloc_mem=\nError allocating memory\n"
        "-ucnv\n= 0\n",
        32},
       {"realloc_mem=\n",
        {"ucnv_toUChars", 2},
        "Error converting string to UChar 7\n-ucnv\n= 0\n",
        7}},
      call);
  status = 99;
  EXPECT_EQ(tracedCall("NLS2_Strlen", {}, call),
            "> entry\n" + valid +
                "Open the code page converter.\n+ucnv\n"
                "Pre-flight to determine size of output buffer.\nrealloc_mem=\n-ucnv\n= 3\n");
  EXPECT_EQ(status, 99);
}

TEST(ByteLength, ByTheFirstByteAlone) {
  const LiveLocale locale(37);
  const struct {
    int first, last, length;
  } rows[] = {{0x00, 0xBF, 1}, {0xC0, 0xDF, 2}, {0xE0, 0xEF, 3}, {0xF0, 0xF4, 4}, {0xF5, 0xFF, 1}};
  for (const auto &row : rows) {
    for (int byte = row.first; byte <= row.last; ++byte) {
      const auto alone = std::make_unique<char>(static_cast<char>(byte));
      int32_t status = 99;
      EXPECT_EQ(NLS2_ByteLength(locale.get(), alone.get(), &status), row.length) << byte;
      EXPECT_EQ(status, 0);
    }
  }
}

TEST(ByteLength, TracesEachWayOut) {
  const LiveLocale live(819);
  const char euro[] = "\xE2\x82\xAC";
  for (const NLS2_Locale *locale : {live.get(), &notLive}) {
    int32_t status = 99;
    EXPECT_EQ(
        tracedCall("NLS2_ByteLength", {}, [&] { return NLS2_ByteLength(locale, euro, &status); }),
        "> entry\nInput parameters: pLocale " + hex(locale) + ", pCharacter " + hex(euro) + ".\n" +
            (locale == &notLive ? "ValidateLocale= 38\nInvalid locale.\n= 0\n"
                                : valid + "Size of the character is 3.\n= 3\n"));
    EXPECT_EQ(status, locale == &notLive ? 38 : 0);
  }
}

TEST(StringToDouble, IsZeroWhateverItIsGiven) {
  EXPECT_EQ(NLS2_StringToDouble("1.5", nullptr), 0.0);
  EXPECT_EQ(tracedCall("NLS2_StringToDouble", {},
                       [] { return static_cast<int32_t>(NLS2_StringToDouble(nullptr, "7")); }),
            "> entry\n= 0\n");
}

} // namespace
