// A locale's code page and UTF-8 or UTF-16: against the same ICU calls made bare, with every size
// of output.

#include "convert/translate_oracle.h"
#include "nls2.h"
#include "support/call_cases.h"
#include "support/recording_host.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <string>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using support::exact;
using support::LiveLocale;

// Both calls take (target, capacity, status) and must agree on all of it, the canaries included,
// with every capacity up to two more than are needed.
template <class Unit, class Library, class Icu>
void sweep(int32_t successStatus, Library library, Icu icu) {
  UErrorCode error = U_ZERO_ERROR;
  const int32_t needed = icu(static_cast<Unit *>(nullptr), 0, &error);
  for (int32_t capacity = 0; capacity <= needed + 2; ++capacity) {
    const std::basic_string<Unit> canaries(static_cast<size_t>(capacity) + support::canaries,
                                           Unit{0x55});
    const auto ours = exact(canaries);
    const auto bare = exact(canaries);
    int32_t status = 99;
    const int32_t length = library(ours.get(), capacity, &status);
    error = U_ZERO_ERROR;
    const int32_t expected = icu(bare.get(), capacity, &error);
    EXPECT_EQ(status, U_FAILURE(error) ? error : successStatus) << "capacity " << capacity;
    EXPECT_EQ(length, U_FAILURE(error) ? 0 : expected) << "capacity " << capacity;
    EXPECT_TRUE(std::equal(ours.get(), ours.get() + canaries.size(), bare.get())) << capacity;
  }
}

// The length itself, and -1 where a terminator can stand for it.
template <class Unit, class Check>
void withBothLengths(const std::basic_string<Unit> &text, Check check) {
  check(exact(text).get(), static_cast<int32_t>(text.size()));
  if (text.find(Unit{0}) == text.npos) {
    check(exact(text + Unit{0}).get(), -1);
  }
}

void sweepAll(const NLS2_Locale *locale, const char *icuName, const std::u16string &text) {
  UErrorCode error = U_ZERO_ERROR;
  const icu::LocalUConverterPointer page(ucnv_open(icuName, &error));
  ASSERT_TRUE(U_SUCCESS(error)) << icuName;
  UConverter *converter = page.getAlias();
  withBothLengths(oracle::encode({0, icuName, 1}, text), [=](const char *from, int32_t n) {
    sweep<char>(
        0, [=](char *to, int32_t m, auto *e) { return NLS2_toUTF8(locale, from, n, to, m, e); },
        [=](char *to, int32_t m, auto *e) {
          return ucnv_convert("utf-8", icuName, to, m, from, n, e);
        });
    sweep<UChar>(
        0, [=](UChar *to, int32_t m, auto *e) { return NLS2_toUTF16(locale, from, n, to, m, e); },
        [=](UChar *to, int32_t m, auto *e) { return ucnv_toUChars(converter, to, m, from, n, e); });
  });
  withBothLengths(oracle::encode({0, "utf-8", 1}, text), [=](const char *from, int32_t n) {
    sweep<char>( // whose status a success never sets
        99, [=](char *to, int32_t m, auto *e) { return NLS2_fromUTF8(locale, to, m, from, n, e); },
        [=](char *to, int32_t m, auto *e) {
          return ucnv_convert(icuName, "utf-8", to, m, from, n, e);
        });
  });
  withBothLengths(text, [=](const UChar *from, int32_t n) {
    sweep<char>(
        0, [=](char *to, int32_t m, auto *e) { return NLS2_fromUTF16(locale, from, m, to, n, e); },
        [=](char *to, int32_t m, auto *e) {
          return ucnv_fromUChars(converter, to, m, from, n, e);
        });
  });
}

TEST(Utf, AsBareIcuWithEveryCapacity) {
  const struct {
    uint32_t codepage;
    const char *icuName;
  } pages[] = {{37, "ibm-37"},     {819, "iso-8859-1"}, {930, "ibm-930"}, {932, "shift-jis"},
               {1200, "utf-16be"}, {1208, "utf-8"},     {57363, "scsu"},  {57368, "utf-16"},
               {57371, "gb18030"}, {57372, "ucs-2"}};
  const std::u16string texts[] = {u"", u"Gr\u00FC\u00DFe", u"\u65E5\u672C\u8A9E abc",
                                  u"\U0001F600x", std::u16string(u"a\0b", 3)};
  for (const auto &[codepage, icuName] : pages) {
    const LiveLocale locale(codepage);
    const int before = support::openConverters();
    const support::Recording detail(support::traceDetail); // reads texts and outputs too
    for (const std::u16string &text : texts) {
      SCOPED_TRACE(std::string(icuName) + ", a text of " + std::to_string(text.size()));
      sweepAll(locale.get(), icuName, text);
    }
    EXPECT_EQ(support::openConverters(), before) << icuName;
  }
}

} // namespace
