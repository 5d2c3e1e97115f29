// NLS2_Strcoll and NLS2_Findstr: answers, and orders against bare ICU.

#include "nls2.h"
#include "support/icu_probe.h"
#include "support/live_locale.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <unicode/localpointer.h>
#include <unicode/ucol.h>
#include <unicode/unistr.h>

namespace {

using namespace std::string_literals;
using support::exact;
using support::LiveLocale;

struct Place {
  uint32_t codepage;
  const char *locale;
};
constexpr Place en{1208, "en_US"};
constexpr Place tr{1208, "tr_TR"};
constexpr Place ebcdic{37, "en_US"};
constexpr Place nowhere{57364, "en_US"};

struct Row {
  const char *reason;
  Place place;
  std::string one; // whole, with a terminator where the length is negative
  int16_t length1;
  std::string two;
  int16_t length2;
  uint32_t options;
  int32_t result;
  int32_t status = 0;
};

constexpr uint32_t ignore = SORT_IGNORETRAILING;

const Row comparisons[] = {
    {"both empty by length", en, "x", 0, "y", 0, 0, 0},
    {"both empty by terminator", en, "\0"s, -1, "\0"s, -1, ignore, 0},
    {"the longer first", en, "abc   ", 6, "abc", 3, 0, 1},
    {"trailing blanks off", en, "abc   ", 6, "abc", 3, ignore, 0},
    {"trailing blanks of string 2 off", en, "abc", 3, "abc ", 4, ignore, 0},
    {"all blanks", en, "   ", 3, "", 0, ignore, 0},
    {"tabs are blanks", en, "abc\t \t", 6, "abc", 3, ignore, 0},
    {"a newline is not, and keeps the blanks before it", en, "a \n", 3, "a\n", 2, ignore, 1},
    {"the ideographic space is blank", en, "a\u3000", 4, "a", 1, ignore, 0},
    {"a pair of surrogates is not blank", en, "\U0001F600", 4, "", 0, ignore, 1},
    {"EBCDIC blanks", ebcdic, "\x81\x40\x40", 3, "\x81", 1, ignore, 0},
    {"case counts", en, "a", 1, "A", 1, 0, -1},
    {"nulls do not", en, "a\0b"s, 3, "ab", 2, 0, 0},
    {"what follows a null does", en, "a\0b"s, 3, "a\0c"s, 3, 0, -1},
    {"blanks trail before the first null", en, "a \0b"s, 4, "ab", 2, ignore, 0},
    {"unknown bits do not matter", en, "a ", 2, "a", 1, 0xFFFDFF7F, 1},
    {"a length below -1", en, "a\0"s, -2, "a", 1, 0, 0, 1},
    {"string 2 too", en, "a", 1, "a\0"s, -2, 0, 0, 1},
    {"which means a terminator, by characters", en, "a\0"s, -9, "b\0"s, -2, CHARBASED, -1},
    {"a length within a character takes it whole", en, "a€", 2, "a€", 4, CHARBASED, 0},
    {"both options", en, "é ", 3, "é \0"s, -1, CHARBASED | ignore, 0},
    {"a lead byte leads past the null",
     {819, "en_US"},
     "\xE9\0a\0"s,
     -1,
     "\xE9\0a"s,
     3,
     CHARBASED,
     0},
    {"no such page", nowhere, "a", 1, "b", 1, 0, 0, 4},
};

const Row searches[] = {
    {"found", en, "Zürich", 7, "rich", 4, 0, 1},
    {"not found", en, "Zürich", 7, "reich", 5, 0, 0},
    {"by terminators", en, "Zürich\0"s, -1, "ü\0"s, -1, 0, 1},
    {"only to the length", en, "Zürich", 6, "ch", 2, 0, 0},
    {"nothing is everywhere", en, "abc", 3, "", 0, 0, 1},
    {"in nothing too", en, "", 0, "", 0, IGNORECASE, 1},
    {"something is not in nothing", en, "", 0, "a", 1, IGNORECASE, 0},
    {"case counts", en, "grün", 5, "RÜN", 4, 0, 0},
    {"or not", en, "grün", 5, "RÜN", 4, IGNORECASE, 1},
    {"other bits do not matter", en, "abc", 3, "B", 1, ~uint32_t{IGNORECASE}, 0},
    {"string 1 ends at a null", en, "ab\0cd"s, 5, "cd", 2, 0, 0},
    {"and in lower case", en, "AB\0CD"s, 5, "cd", 2, IGNORECASE, 0},
    {"string 2 ends at a null", en, "abc", 3, "b\0x"s, 3, IGNORECASE, 1},
    {"EBCDIC", ebcdic, "\xC1\xC2\xC3", 3, "\x82", 1, IGNORECASE, 1},
    {"U+0130 grows to i and a dot above", en, "İzmir", 6, "z", 1, IGNORECASE, -1},
    {"string 2 grows", en, "izmir", 5, "İ", 2, IGNORECASE, -1},
    {"not in Turkish", tr, "İzmir", 6, "i", 1, IGNORECASE, 1},
    {"Turkish I is dotless", tr, "ISPARTA", 7, "i", 1, IGNORECASE, 0},
    {"and found as such", tr, "ISPARTA", 7, "ı", 2, IGNORECASE, 1},
    {"a bad length", en, "abc\0"s, -2, "b", 1, 0, -1},
    {"no such page", nowhere, "abc", 3, "b", 1, 0, -1},
};

// Calls without and with detail lines, which must not read more of the texts than the call.
template <class Rows, class Call>
void expectAnswers(const Rows &rows, Call call) {
  for (const Row &row : rows) {
    SCOPED_TRACE(row.reason);
    const LiveLocale locale(row.place.codepage, row.place.locale);
    const int before = support::openConverters();
    for (const support::TraceFlags flags : {support::traceOff, support::traceDetail}) {
      const support::Recording recording(flags);
      int32_t status = 0;
      EXPECT_EQ(call(locale.get(), exact(row.one).get(), row.length1, exact(row.two).get(),
                     row.length2, row.options, &status),
                row.result);
      EXPECT_EQ(status, row.status);
    }
    EXPECT_EQ(support::openConverters(), before);
  }
}

TEST(Strcoll, Answers) { expectAnswers(comparisons, NLS2_Strcoll); }

TEST(Findstr, Answers) {
  expectAnswers(searches, [](const NLS2_Locale *locale, const char *one, int32_t length1,
                             const char *two, int32_t length2, uint32_t options, int32_t *) {
    return NLS2_Findstr(locale, one, length1, two, length2, options);
  });
}

TEST(Strcoll, OrdersAsBareIcuAtTertiaryStrength) {
  const char *words[] = {"",     "cote",   "coté",  "côte",  "Cote",  "chat",   "cizí",   "čas",
                         "hora", "llama",  "lzb",   "ñandú", "nz",    "Ärger",  "Arger",  "zebra",
                         "öl",   "øre",    "aa",    "ırmak", "irmak", "straße", "co-op",  "coop",
                         "Ёлка", "Москва", "αθήνα", "日本",  "ﾆﾎﾝ",   "にほん", "ニホン", "😀"};
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
  } rows[] = {{32767, -1, 0}, {32768, 0, 1}, {65534, 0, 1}, {65535, -1, 0}, {65537, 0, 0}};
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

} // namespace
