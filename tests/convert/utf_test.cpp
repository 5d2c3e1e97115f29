// A locale's code page and UTF-8 or UTF-16: against the same ICU calls made bare, with every size
// of output, and traced on each way out.

#include "nls2.h"
#include "support/call_trace.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <string>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using support::exact;
using support::hex;
using support::LiveLocale;
using support::tracedCall;

#if defined(__SANITIZE_ADDRESS__)
constexpr int slack = 0; // the sanitizer guards the ends
#else
constexpr int slack = 4;
#endif

// Both calls take (target, capacity, status) and must agree on all of it, the canaries included,
// with every capacity up to two more than are needed.
template <class Unit, class Library, class Icu>
void sweep(int32_t successStatus, Library library, Icu icu) {
  UErrorCode error = U_ZERO_ERROR;
  const int32_t needed = icu(static_cast<Unit *>(nullptr), 0, &error);
  for (int32_t capacity = 0; capacity <= needed + 2; ++capacity) {
    const std::basic_string<Unit> canaries(static_cast<size_t>(capacity + slack), Unit{0x55});
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

std::string encoded(UConverter *converter, const std::u16string &text) {
  UErrorCode error = U_ZERO_ERROR;
  std::string bytes(16 + 8 * text.size(), '\0');
  bytes.resize(static_cast<size_t>(ucnv_fromUChars(converter, bytes.data(),
                                                   static_cast<int32_t>(bytes.size()), text.data(),
                                                   static_cast<int32_t>(text.size()), &error)));
  EXPECT_TRUE(U_SUCCESS(error));
  return bytes;
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
  const icu::LocalUConverterPointer utf8(ucnv_open("utf-8", &error));
  ASSERT_TRUE(U_SUCCESS(error)) << icuName;
  UConverter *converter = page.getAlias();
  withBothLengths(encoded(converter, text), [=](const char *from, int32_t n) {
    sweep<char>(
        0, [=](char *to, int32_t m, auto *e) { return NLS2_toUTF8(locale, from, n, to, m, e); },
        [=](char *to, int32_t m, auto *e) {
          return ucnv_convert("utf-8", icuName, to, m, from, n, e);
        });
    sweep<UChar>(
        0, [=](UChar *to, int32_t m, auto *e) { return NLS2_toUTF16(locale, from, n, to, m, e); },
        [=](UChar *to, int32_t m, auto *e) { return ucnv_toUChars(converter, to, m, from, n, e); });
  });
  withBothLengths(encoded(utf8.getAlias(), text), [=](const char *from, int32_t n) {
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

// One of the four functions, converting "AB" from or to 819, and its lines.
struct Way {
  const char *function;
  int32_t (*call)(const NLS2_Locale *, char *target, int32_t capacity, int32_t *status);
  std::string (*input)(const std::string &target, int32_t capacity); // behind the pointer
  std::string notLive, unopened, name, converting, failed;
  int32_t successStatus;
};

const Way ways[] = {
    {"NLS2_toUTF8",
     [](auto locale, auto target, auto capacity, auto status) {
       return NLS2_toUTF8(locale, "ABx", 2, target, capacity, status);
     },
     [](const std::string &target, int32_t capacity) {
       return ", pSource AB, sourceLength 2, pTarget " + target + ", targetLength " +
              std::to_string(capacity) + ".\n";
     },
     "", "Error opening converter for CCSID 57364.\n", "Converter name returned is ",
     "Converting source to UTF-8 string.\n", "Error converting string to UTF-8  15.\n", 0},
    {"NLS2_fromUTF8",
     [](auto locale, auto target, auto capacity, auto status) {
       return NLS2_fromUTF8(locale, target, capacity, "ABx", 2, status);
     },
     [](const std::string &target, int32_t capacity) {
       return ", pSource " + target + ", sourceLength " + std::to_string(capacity) +
              ", pTarget AB, targetLength 2.\n";
     },
     "", "Error 4 acquiring converter.\n", "", "", "Error 15 converting string from UTF8.\n", 99},
    {"NLS2_toUTF16",
     [](auto locale, auto, auto capacity, auto status) {
       UChar target[4];
       return NLS2_toUTF16(locale, "ABx", 2, target, capacity, status);
     },
     nullptr, "Invalid locale.\n", "Error 4 acquiring converter.\n", "", "",
     "Error 15 converting string from UTF16.\n", 0},
    {"NLS2_fromUTF16",
     [](auto locale, auto target, auto capacity, auto status) {
       return NLS2_fromUTF16(locale, u"ABx", capacity, target, 2, status);
     },
     nullptr, "", "Error 4 acquiring converter.\n", "", "", "Error 15 converting to utf16 .\n", 0},
};

TEST(Utf, TracesEachWayOut) {
  static const NLS2_Locale notLive{};
  const LiveLocale live(819);
  const LiveLocale none(57364);
  const std::string opened = "ValidateLocale= 0\n+ucnv\nMapCodepageIdToName= converter\n";
  for (const Way &way : ways) {
    SCOPED_TRACE(way.function);
    const auto expect = [&](const NLS2_Locale *locale, const support::Fault &fault,
                            int32_t capacity, int32_t statusAfter, const std::string &tail) {
      const std::string target = "old";
      const auto buffer = support::exact(target); // without a terminator
      int32_t status = 99;
      std::string input;
      if (way.input != nullptr) {
        const auto shown = static_cast<size_t>(std::max(capacity, 0));
        input = "Input parameters: pLocale " + hex(locale) +
                way.input(target.substr(0, shown), capacity);
      }
      EXPECT_EQ(tracedCall(way.function, fault,
                           [&] { return way.call(locale, buffer.get(), capacity, &status); }),
                "> entry\n" + input + tail);
      EXPECT_EQ(status, statusAfter) << tail;
    };
    const std::string name = way.name.empty() ? "" : way.name + "ISO-8859-1.\n";
    const std::string named = opened + name + way.converting;
    expect(live.get(), {}, 3, way.successStatus, named + "-ucnv\nLength of output 2.\n= 2\n");
    expect(&notLive, {}, 3, 38, "ValidateLocale= 38\n" + way.notLive + "= 0\n");
    expect(none.get(), {}, 3, 4,
           "ValidateLocale= 0\nMapCodepageIdToName= 0\n" + way.unopened + "= 0\n");
    expect(live.get(), {}, 1, 15, named + way.failed + "-ucnv\n= 0\n");
    if (way.input != nullptr) {
      expect(live.get(), {"ucnv_getName", 1}, 3, 7,
             opened + (way.name.empty() ? "" : way.name + "(null).\n") +
                 "Error 7 acquiring corresponding name of converter.\n-ucnv\n= 0\n");
      // A negative capacity: nothing of the output is read.
      std::string failed = way.failed;
      failed.erase(failed.find("15") + 1, 1); // status 1
      expect(live.get(), {}, -1, 1, named + failed + "-ucnv\n= 0\n");
    }
  }
}

} // namespace
