// NLS2_Strcoll: answers, order against bare ICU, walks by character, and each way out.

#include "nls2.h"
#include "support/call_trace.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <string>
#include <unicode/localpointer.h>
#include <unicode/ucol.h>
#include <unicode/unistr.h>

namespace {

using namespace std::string_literals;
using support::exact;
using support::hex;
using support::LiveLocale;

TEST(Strcoll, Answers) {
  const uint32_t ignore = SORT_IGNORETRAILING;
  const struct {
    const char *reason;
    uint32_t codepage;
    const char *locale;
    std::string one; // whole, with a terminator where the length is negative
    int16_t length1;
    std::string two;
    int16_t length2;
    uint32_t options;
    int32_t result, status;
  } rows[] = {
      {"both empty by length", 1208, "en_US", "x", 0, "y", 0, 0, 0, 0},
      {"both empty by terminator", 1208, "en_US", "\0"s, -1, "\0"s, -1, ignore, 0, 0},
      {"the shorter first", 1208, "en_US", "abc", 3, "abc   ", 6, 0, -1, 0},
      {"the longer first", 1208, "en_US", "abc   ", 6, "abc", 3, 0, 1, 0},
      {"trailing blanks off", 1208, "en_US", "abc   ", 6, "abc", 3, ignore, 0, 0},
      {"trailing blanks of string 2 off", 1208, "en_US", "abc", 3, "abc ", 4, ignore, 0, 0},
      {"all blanks", 1208, "en_US", "   ", 3, "", 0, ignore, 0, 0},
      {"tabs are blanks", 1208, "en_US", "abc\t \t", 6, "abc", 3, ignore, 0, 0},
      {"newlines are not", 1208, "en_US", "abc\n", 4, "abc", 3, ignore, 1, 0},
      {"a newline keeps the blanks before it", 1208, "en_US", "abc \n", 5, "abc\n", 4, ignore, 1,
       0},
      {"the ideographic space is blank", 1208, "en_US", "a\xE3\x80\x80", 4, "a", 1, ignore, 0, 0},
      {"a pair of surrogates is not blank", 1208, "en_US", "\xF0\x9F\x98\x80", 4, "", 0, ignore, 1,
       0},
      {"EBCDIC blanks", 37, "en_US", "\x81\x40\x40", 3, "\x81", 1, ignore, 0, 0},
      {"case counts", 1208, "en_US", "a", 1, "A", 1, 0, -1, 0},
      {"nulls do not", 1208, "en_US", "a\0b"s, 3, "ab", 2, 0, 0, 0},
      {"what follows a null does", 1208, "en_US", "a\0b"s, 3, "a\0c"s, 3, 0, -1, 0},
      {"blanks are trailing before the first null", 1208, "en_US", "a \0b"s, 4, "ab", 2, ignore, 0,
       0},
      {"Swedish: a ring behind z", 819, "sv_SE", "\xE5", 1, "z", 1, 0, 1, 0},
      {"German: beside a", 819, "de_DE", "\xE5", 1, "z", 1, 0, -1, 0},
      {"unknown bits do not matter", 1208, "en_US", "a ", 2, "a", 1, 0xFFFDFF7F, 1, 0},
      {"a length below -1", 1208, "en_US", "a\0"s, -2, "a", 1, 0, 0, 1},
      {"string 2 too", 1208, "en_US", "a", 1, "a\0"s, -2, 0, 0, 1},
      {"which means terminated by characters", 1208, "en_US", "a\0"s, -9, "b\0"s, -2, CHARBASED, -1,
       0},
      {"a length within a character takes it whole", 1208, "en_US", "a\xE2\x82\xAC", 2,
       "a\xE2\x82\xAC", 4, CHARBASED, 0, 0},
      {"both options", 1208, "en_US", "\xC3\xA9 ", 2, "\xC3\xA9 \0"s, -1, CHARBASED | ignore, 0, 0},
      {"a walk follows a lead byte past the terminator", 819, "en_US", "\xE9\0a\0"s, -1, "\xE9\0a"s,
       3, CHARBASED, 0, 0},
      {"no such page", 57364, "en_US", "a", 1, "b", 1, 0, 0, 4},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    const LiveLocale locale(row.codepage, row.locale);
    const int before = support::openConverters();
    for (const support::TraceFlags flags : {support::traceOff, support::traceDetail}) {
      const support::Recording recording(flags);
      int32_t status = 99;
      EXPECT_EQ(NLS2_Strcoll(locale.get(), exact(row.one).get(), row.length1, exact(row.two).get(),
                             row.length2, row.options, &status),
                row.result);
      EXPECT_EQ(status, row.status);
    }
    EXPECT_EQ(support::openConverters(), before);
  }
}

TEST(Strcoll, OrdersAsBareIcuAtTertiaryStrength) {
  const char *words[] = {"",       "cote",    "coté",   "côte",     "côté",  "Cote",  "chat",
                         "cizí",   "hora",    "čas",    "llama",    "lzb",   "ñandú", "nz",
                         "Ärger",  "Arger",   "zebra",  "ångström", "öl",    "øre",   "aa",
                         "straße", "strasse", "ırmak",  "irmak",    "İzmir", "Izmir", "co-op",
                         "co op",  "coop",    "Москва", "москва",   "Ёлка",  "Αθήνα", "αθηνα",
                         "日本",   "にほん",  "ニホン", "ﾆﾎﾝ",      "中文",  "한국",  "😀"};
  for (const char *name :
       {"en_US", "de_DE", "sv_SE", "da_DK", "es_ES", "cs_CZ", "tr_TR", "ja_JP"}) {
    const LiveLocale locale(1208, name);
    UErrorCode error = U_ZERO_ERROR;
    const icu::LocalUCollatorPointer collator(ucol_open(name, &error));
    ucol_setStrength(collator.getAlias(), UCOL_TERTIARY);
    for (const char *one : words) {
      for (const char *two : words) {
        const auto u1 = icu::UnicodeString::fromUTF8(one);
        const auto u2 = icu::UnicodeString::fromUTF8(two);
        int32_t status = 99;
        EXPECT_EQ(NLS2_Strcoll(locale.get(), one, -1, two, -1, 0, &status),
                  ucol_strcoll(collator.getAlias(), u1.getBuffer(), u1.length(), u2.getBuffer(),
                               u2.length()))
            << name << ": " << one << ", " << two;
        EXPECT_EQ(status, 0);
      }
    }
  }
}

TEST(Strcoll, WalkedLengthsWrapAt16Bits) {
  const LiveLocale locale(1208);
  const struct {
    size_t length;
    int32_t result, status;
  } rows[] = {{32767, -1, 0}, {32768, 0, 1}, {40000, 0, 1}, {65534, 0, 1},
              {65535, -1, 0}, {65536, 0, 0}, {65537, 0, 0}};
  for (const auto &row : rows) { // the strings differ in their last byte
    const std::string one(row.length, 'a');
    const std::string two = one.substr(1) + "b";
    int32_t status = 99;
    EXPECT_EQ(NLS2_Strcoll(locale.get(), one.c_str(), -1, two.c_str(), -1, CHARBASED, &status),
              row.result)
        << row.length;
    EXPECT_EQ(status, row.status) << row.length;
  }
}

// Texts of 200 bytes without a terminator, and what of them a line shows.
TEST(Strcoll, TracedTextsEndAtTheirLengths) {
  const LiveLocale locale(819);
  for (const int16_t length : std::initializer_list<int16_t>{0, 1, 63, 64, 65, 200}) {
    const std::string one(static_cast<size_t>(length), 'a');
    const std::string two(static_cast<size_t>(length), 'b');
    const support::Recording recording(support::traceDetail);
    int32_t status = 99;
    NLS2_Strcoll(locale.get(), exact(one).get(), length, exact(two).get(), length, 0, &status);
    const std::string number = std::to_string(length);
    EXPECT_EQ(recording.details("NLS2_Strcoll")[0],
              "Input parameters: pLoc " + hex(locale.get()) + ", pString1 " + one +
                  ", String1Length " + number + ", pString2 " + two + ", String2Length " + number +
                  ", options 0.");
  }
}

// Strings of 7 and 3 bytes, 4 and 2 units; buffers of 10 and 6 bytes.
class StrcollTrace : public testing::Test {
protected:
  void expect(const NLS2_Locale *locale, int16_t length1, int16_t length2, uint32_t options,
              std::vector<support::Step> steps) {
    char input[160];
    std::snprintf(input, sizeof input,
                  "Input parameters: pLoc %s, pString1 x\xC3\xA9\xE2\x82\xACz, String1Length %d, "
                  "pString2 %s, String2Length %d, options %x.\n",
                  hex(locale).c_str(), length1, length2 == 2 ? "x\xC3" : "x\xC3\xA9", length2,
                  options);
    steps[0].lines = input + steps[0].lines;
    support::expectSteps("NLS2_Strcoll", steps, [&] {
      int32_t status = 99;
      NLS2_Strcoll(locale, "x\xC3\xA9\xE2\x82\xACz", length1, "x\xC3\xA9", length2, options,
                   &status);
      return status;
    });
  }

  const LiveLocale live{1208};
  const std::string acquire = "ValidateLocale= 0\nAcquire Converter for CodePage ";
  const std::string opened = acquire + "1208.\n+ucnv\nMapCodepageIdToName= converter\n";
  const std::string converted = "realloc_mem=\nrealloc_mem=\n";
  const std::string collator = "-ucnv\nPreparing to open collator using locale en_US\n+ucol\n"
                               "Setting collation strength to UCOL_TERTIARY.\n";
  const std::string compared =
      "Collation ready with dest1Cap 4 and dest2Cap 2\n"
      "Collator has processed the text buffers with results equal to 1.\n-ucol\n= 1\n";
};

TEST_F(StrcollTrace, EachWayOut) {
  static const NLS2_Locale notLive{};
  const LiveLocale none(57364);
  expect(&notLive, 7, 3, 0, {{"", {}, "ValidateLocale= 38\nInvalid locale.\n= 0\n", 38}});
  expect(none.get(), 7, 3, 0,
         {{acquire + "57364.\nMapCodepageIdToName= 0\n",
           {},
           "Error 4 acquiring Converter.\n= 0\n",
           4}});
  const std::string noMemory = "Old((nil))\nrealloc_mem=\nError allocating memory\n-ucnv\n= 0\n";
  expect(
      live.get(), 7, 3, 0,
      {{opened, {"ucnv_toUChars", 1}, "Error pre-flighting String 1 to UChars 7\n-ucnv\n= 0\n", 7},
       {"", {nullptr, 0, 10}, "Memory allocation failure: Size(10), " + noMemory, 32},
       {"realloc_mem=\n",
        {"ucnv_toUChars", 2},
        "Error converting String 1 to UChars\n-ucnv\n= 0\n",
        7},
       {"", {"ucnv_toUChars", 3}, "Error pre-flighting String 2 to UChars\n-ucnv\n= 0\n", 7},
       {"", {nullptr, 0, 6}, "Memory allocation failure: Size(6), " + noMemory, 32},
       {"realloc_mem=\n",
        {"ucnv_toUChars", 4},
        "Error converting String 2 to UChars 7\n-ucnv\n= 0\n",
        7},
       {"-ucnv\nPreparing to open collator using locale en_US\n",
        {"ucol_open", 1},
        "Error 7 opening collator for locale en_US\n= 0\n",
        7},
       {"+ucol\nSetting collation strength to UCOL_TERTIARY.\n", {}, compared, 0}});
}

TEST_F(StrcollTrace, Options) {
  // Each character of "xé€z" and "xé" is asked for twice.
  const std::string xe = "ByteLength= 1\nByteLength= 1\nByteLength= 2\nByteLength= 2\n";
  const std::string rest = "ByteLength= 3\nByteLength= 3\nByteLength= 1\nByteLength= 1\n";
  const std::string trimmed =
      "SORT_IGNORETRAILING option specified.\nRemove trailing blanks from String 1 \n"
      "Remove trailing blanks from String 2.\n";
  expect(
      live.get(), -1, -1, 0x20080,
      {{"SORT_IGNORETRAILING Option specified 20080\nCHARBASED Option specified 20080\n" + opened +
            "CHARBASED option selected.\n"
            "Determine length of string 1 by looking for null.\n" +
            xe + rest +
            "Cumulative byte length determined is 7.\nComputing length of string 2\n"
            "Determine length of string 2 by looking for null.\n" +
            xe + "Cumulative byte length determined is 3.\n" + converted + collator + trimmed,
        {},
        compared,
        0}});
  expect(live.get(), 7, 2, 0x80,
         {{"CHARBASED Option specified 80\n" + opened +
               "CHARBASED option selected.\n"
               "String 1 is not null terminated, search for last character.\n" +
               xe + rest +
               "Cumulative byte length determined to be 7.\nComputing length of string 2\n"
               "String 2 is not null terminated, search for last character.\n" +
               xe + "Cumulative byte length determined to be 3.\n" + converted + collator,
           {},
           compared,
           0}});
}

} // namespace
