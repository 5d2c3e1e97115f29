// NLS2_TranslateString: known answers.

#include "nls2.h"
#include "support/icu_probe.h"

#include <gtest/gtest.h>

namespace {

using namespace std::string_literals;

constexpr uint32_t terminate = 0x0008;
constexpr uint32_t fill = 0x0100;
constexpr uint32_t trailing = 0x0200;
constexpr uint32_t strip = 0x4000;

struct Row {
  const char *reason;
  int32_t destCodePage;
  int32_t destLen;
  int32_t sourceCodePage;
  std::string source;
  int32_t sourceLen;
  uint32_t options;
  int32_t result;
  int32_t status;
  int32_t consumed;
  std::string dest; // what was written; '.' stands behind it
};

const std::string twoAndThree = "\xC1\xC2\x40\x40\x40";

const Row rows[] = {
    // Refused, nothing written.
    {"option without a meaning", 819, 8, 37, "\xC1", 1, 0x0001, 0, 37, 0, ""},
    {"high bits alone", 819, 8, 37, "\xC1", 1, 0xFFFF0000, 0, 37, 0, ""},
    {"options come before an empty source", 819, 8, 37, "", 0, 0x0001, 0, 37, 0, ""},
    {"negative destLen", 819, -1, 37, "\xC1", 1, 0, 0, 37, 0, ""},
    {"negative destLen, empty source", 819, -1, 37, "", 0, 0, 0, 37, 0, ""},
    {"no destination", 819, 0, 37, "\xC1", 1, 0, 0, 37, 0, ""},
    {"no destination, null-terminated source", 819, 0, 37, "", -1, 0, 0, 37, 0, ""},
    {"source page 0", 819, 8, 0, "\xC1", 1, 0, 0, 37, 0, ""},
    {"destination page 0, empty source", 0, 8, 37, "", 0, 0, 0, 37, 0, ""},
    {"source page unknown", 819, 8, 57364, "\xC1", 1, 0, 0, 4, 0, ""},
    {"destination page unknown", 57355, 8, 37, "\xC1", 1, fill, 0, 4, 0, ""},
    {"text too long for every padding: FILL", 819, 1, 37, "\xC1\xC2\x40"s, 3, fill, 0, 15, 0, ""},
    {"TRAILING", 819, 1, 37, "\xC1\xC2\x40"s, 3, trailing, 0, 15, 0, ""},
    {"STRIP", 819, 1, 37, "\xC1\xC2\x40"s, 3, strip, 0, 15, 0, ""},
    {"room for the text, not for the null", 819, 2, 37, "\xC1\xC2"s, 2, fill | terminate, 0, 15, 0,
     ""},
    {"not even room for two nulls", 1200, 1, 37, "\x40", 1, fill | terminate, 0, 15, 0, ""},
    // As it is.
    {"empty source", 819, 8, 37, "", 0, 0, 0, 0, 0, ""},
    {"empty source, no destination", 819, 0, 37, "", 0, fill, 0, 0, 0, ""},
    {"ICU stores a null that is not counted", 819, 8, 37, "\xC1\xC2"s, 2, 0, 2, 0, 2, "AB\0"s},
    {"blanks stay", 819, 8, 37, "\xC1\x40\x40"s, 3, 0, 3, 0, 3, "A  \0"s},
    {"TERMINATE counts it", 819, 8, 37, "\xC1\xC2"s, 2, terminate, 3, 0, 2, "AB\0"s},
    {"so does -1", 819, 8, 37, "\xC1\xC2"s, -1, 0, 3, 0, 2, "AB\0"s},
    {"not -2", 819, 8, 37, "\xC1\xC2"s, -2, 0, 2, 0, 2, "AB\0"s},
    {"an exact fit has no terminator", 819, 2, 37, "\xC1\xC2"s, -1, terminate, 2, 0, 2, "AB"},
    {"two nulls", 1200, 8, 37, "\xC1"s, 1, terminate, 4, 0, 1, "\0A\0\0"s},
    {"second null behind destLen", 1200, 3, 37, "\xC1"s, 1, terminate, 4, 0, 1, "\0A\0\0"s},
    {"empty text, two nulls", 57359, 2, 37, "", -1, 0, 2, 0, 0, "\0\0"s},
    {"two-null source, one-null destination", 819, 4, 1200, "\0A"s, 2, terminate, 2, 0, 2, "A\0"s},
    {"UTF-32 has one null", 57360, 8, 819, "A", 1, terminate, 5, 0, 1, "\0\0\0A\0"s},
    {"too small: what fits is written", 819, 2, 37, "\xC1\xC2\xC3"s, 3, 0, 0, 15, 0, "AB"},
    {"ICU's warning -122 is a success", 1208, 8, 932, "A", 1, 0, 1, 0, 1, "A\0"s},
    {"ucs-2 writes a signature of this machine's order", 57372, 8, 819, "A", 1, 0, 4, 0, 1,
     __BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__ ? "\xFF\xFE\x41\0\0"s : "\xFE\xFF\0\x41\0"s},
    {"substitution", 37, 8, 1208, "\xE6\x97\xA5"s, 3, 0, 1, 0, 3, "\x3F\0"s},
    {"ICU takes page -37 for 37", 819, 8, -37, "\xC1", 1, 0, 1, 0, 1, "A\0"s},
    // Shaped.
    {"FILL", 819, 10, 37, twoAndThree, 5, fill, 10, 0, 0, "AB        "},
    {"FILL, null", 819, 10, 37, twoAndThree, 5, fill | terminate, 10, 0, 0, "AB       \0"s},
    {"TRAILING: five written, ten told", 819, 10, 37, twoAndThree, 5, trailing, 10, 0, 0,
     "AB   \0"s},
    {"TRAILING, null at the end, a gap before it", 819, 10, 37, twoAndThree, 5,
     trailing | terminate, 10, 0, 0, "AB   \0...\0"s},
    {"TRAILING as far as it fits", 819, 4, 37, twoAndThree, 5, trailing, 4, 0, 0, "AB  "},
    {"FILL wins over TRAILING", 819, 7, 37, twoAndThree, 5, fill | trailing, 7, 0, 0, "AB     "},
    {"STRIP", 819, 10, 37, twoAndThree, 5, strip, 2, 0, 0, "AB\0"s},
    {"STRIP wins over both", 819, 10, 37, twoAndThree, 5, strip | fill | trailing, 2, 0, 0,
     "AB\0"s},
    {"STRIP counts a null that it does not store", 819, 3, 37, twoAndThree, 5, strip | terminate, 3,
     0, 0, "AB"},
    {"STRIP counts units: two bytes, one unit", 1208, 4, 819, "\xDF ", 2, strip, 1, 0, 0,
     "\xC3\x9F\0"s},
    {"STRIP of blanks alone", 819, 4, 37, "\x40\x40", 2, strip, 0, 0, 0, "\0"s},
    {"a null cuts", 819, 6, 37, "\xC1\0\xC2"s, 3, fill, 6, 0, 0, "A     "},
    {"two blanks of three, since the text takes a byte more", 1208, 4, 819, "\xDF   "s, 4, fill, 4,
     0, 0, "\xC3\x9F  "s},
    {"blanks of two bytes become blanks of one", 37, 4, 939, "\x0E\x40\x40\x0F\x40"s, 5, trailing,
     4, 0, 0, "\x40\x40\0"s},
    {"FILL into UTF-16LE loses the first letter", 57359, 10, 819, "AB", 2, fill, 10, 0, 0,
     "\0\0B\0 \0 \0 \0"s},
    {"FILL into UTF-32BE fails at ICU", 57360, 4, 819, "A", 1, fill, 0, 1, 0, "\0\0\0A"s},
};

TEST(TranslateString, KnownAnswers) {
  for (const Row &row : rows) {
    SCOPED_TRACE(row.reason);
    std::string dest(20, '.');
    std::string expected = dest;
    expected.replace(0, row.dest.size(), row.dest);
    const int before = support::openConverters();
    int32_t consumed = -9;
    int32_t status = -9;
    EXPECT_EQ(NLS2_TranslateString(row.destCodePage, dest.data(), row.destLen, row.sourceCodePage,
                                   row.source.c_str(), row.sourceLen, &consumed, row.options,
                                   &status),
              row.result);
    EXPECT_EQ(status, row.status);
    EXPECT_EQ(consumed, row.consumed);
    EXPECT_EQ(dest, expected);
    EXPECT_EQ(support::openConverters(), before);
  }
}

} // namespace
