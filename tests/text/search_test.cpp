// NLS2_Findstr: answers, each way out, and the buffer that two of them leave behind.

#include "nls2.h"
#include "support/call_trace.h"
#include "support/heap_probe.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <malloc.h>
#include <string>
#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/lsan_interface.h>
#endif

namespace {

using namespace std::string_literals;
using support::exact;
using support::hex;
using support::LiveLocale;

TEST(Findstr, Answers) {
  const char *en = "en_US";
  const char *tr = "tr_TR";
  const struct {
    const char *reason;
    uint32_t codepage;
    const char *locale;
    std::string one;
    int32_t length1; // -1: with a terminator, else the bytes alone
    std::string two;
    int32_t length2;
    uint32_t options;
    int32_t result;
  } rows[] = {
      {"found", 1208, en, "Zürich", 7, "rich", 4, 0, 1},
      {"not found", 1208, en, "Zürich", 7, "reich", 5, 0, 0},
      {"by terminators", 1208, en, "Zürich\0"s, -1, "ü\0"s, -1, 0, 1},
      {"only to the length", 1208, en, "Zürich", 6, "ch", 2, 0, 0},
      {"nothing is everywhere", 1208, en, "abc", 3, "", 0, 0, 1},
      {"in nothing too", 1208, en, "", 0, "", 0, IGNORECASE, 1},
      {"something is not in nothing", 1208, en, "", 0, "a", 1, IGNORECASE, 0},
      {"case counts", 1208, en, "grün", 5, "RÜN", 4, 0, 0},
      {"or not", 1208, en, "grün", 5, "RÜN", 4, IGNORECASE, 1},
      {"other bits do not matter", 1208, en, "abc", 3, "B", 1, ~uint32_t{IGNORECASE}, 0},
      {"string 1 ends at a null", 1208, en, "ab\0cd"s, 5, "cd", 2, 0, 0},
      {"and in lower case", 1208, en, "AB\0CD"s, 5, "cd", 2, IGNORECASE, 0},
      {"string 2 ends at a null", 1208, en, "abc", 3, "b\0x"s, 3, IGNORECASE, 1},
      {"EBCDIC", 37, en, "\xC1\xC2\xC3", 3, "\x82", 1, IGNORECASE, 1},
      {"U+0130 grows to i and a dot above", 1208, en, "İzmir", 6, "z", 1, IGNORECASE, -1},
      {"string 2 grows", 1208, en, "izmir", 5, "İ", 2, IGNORECASE, -1},
      {"not in Turkish", 1208, tr, "İzmir", 6, "i", 1, IGNORECASE, 1},
      {"Turkish I is dotless", 1208, tr, "ISPARTA", 7, "i", 1, IGNORECASE, 0},
      {"and found as such", 1208, tr, "ISPARTA", 7, "ı", 2, IGNORECASE, 1},
      {"English I is not", 1208, en, "ISPARTA", 7, "i", 1, IGNORECASE, 1},
      {"a bad length", 1208, en, "abc\0"s, -2, "b", 1, 0, -1},
      {"no such page", 57364, en, "abc", 3, "b", 1, 0, -1},
  };
  for (const auto &row : rows) {
    const LiveLocale locale(row.codepage, row.locale);
    const int before = support::openConverters();
    for (const support::TraceFlags flags : {support::traceOff, support::traceDetail}) {
      const support::Recording recording(flags);
      EXPECT_EQ(NLS2_Findstr(locale.get(), exact(row.one).get(), row.length1, exact(row.two).get(),
                             row.length2, row.options),
                row.result)
          << row.reason;
    }
    EXPECT_EQ(support::openConverters(), before) << row.reason;
  }
}

std::string noMemory(int size) {
  return "Memory allocation failure: Size(" + std::to_string(size) +
         "), Old((nil))\nrealloc_mem=\n";
}

void expectWay(const NLS2_Locale *locale, const std::string &one, const std::string &two,
               uint32_t options, std::vector<support::Step> steps) {
  const auto length1 = static_cast<int32_t>(one.size());
  const auto length2 = static_cast<int32_t>(two.size());
  char input[160];
  std::snprintf(input, sizeof input,
                "Input parameters: pLocale %s, pString1 %s, len1 %d, pString2 %s, len2 %d, options "
                "%x.\n",
                hex(locale).c_str(), one.c_str(), length1, two.c_str(), length2, options);
  steps[0].lines = input + steps[0].lines;
  support::expectSteps("NLS2_Findstr", steps, [&] {
#if defined(__SANITIZE_ADDRESS__)
    const __lsan::ScopedDisabler twoLeaksAreMeant;
#endif
    return NLS2_Findstr(locale, exact(one).get(), length1, exact(two).get(), length2, options);
  });
}

TEST(Findstr, TracesEachWayOut) {
  static const NLS2_Locale notLive{};
  const LiveLocale live(1208);
  const LiveLocale none(57364);
  expectWay(&notLive, "a", "b", 0,
            {{"", {}, "ValidateLocale= 38\nInvalid locale object.\n= -1\n", -1}});
  expectWay(none.get(), "a", "b", 0,
            {{"ValidateLocale= 0\nOpening converter for codepage 57364.\nMapCodepageIdToName= 0\n",
              {},
              "Could not map Codepage ID 57364 to Name\n= -1\n",
              -1}});
  // Blocks of 12 and 14 bytes, and of 6 and 4 in lower case, where a null ends the text.
  const std::string one = "AB\0CD"s;
  const std::string two = "b\0wxyz"s;
  const std::string refused = "-ucnv\nCould not allocate memory.\n= -1\n";
  const std::vector<support::Step> toUtf16 = {
      {"ValidateLocale= 0\nOpening converter for codepage 1208.\n+ucnv\n"
       "MapCodepageIdToName= converter\nConverter opened.\n"
       "Pre-flight string1 to determine size of output needed.\n",
       {"ucnv_toUChars", 1},
       "Could not pre-flight first string to UChars\n-ucnv\n= -1\n",
       -1},
      {"Buffer size of 5 bytes needed, allocate memory.\n",
       {nullptr, 0, 12},
       noMemory(12) + "Could not allocate memory.\n-ucnv\n= -1\n",
       -1},
      {"realloc_mem=\nConvert string1 to UChars.\n",
       {"ucnv_toUChars", 2},
       "-ucnv\nCould convert string1 to UChars 7\n= -1\n",
       -1},
      {"Pre-flight string2 to determine buffer size needed.\n",
       {"ucnv_toUChars", 3},
       "-ucnv\nCould not pre-flight string2 to UChars 7\n= -1\n",
       -1},
      {"Buffer size 6 bytes needed, allocate memory.\n",
       {nullptr, 0, 14},
       noMemory(14) + refused,
       -1},
      {"realloc_mem=\nConvert string2 to UChars.\n",
       {"ucnv_toUChars", 4},
       "-ucnv\nCould convert string 2 to UChars 7\n= -1\n",
       -1}};
  auto plain = toUtf16;
  plain.push_back({"Locate string2 within string1\n",
                   {},
                   "Did not find occurence of string2 in string1.\n-ucnv\n= 0\n",
                   0});
  expectWay(live.get(), one, two, 0, plain);
  auto ignoring = toUtf16;
  ignoring.insert(
      ignoring.end(),
      {{"IGNORECASE option detected\nBuffer size for string1 to allocate is 6  bytes.\n"
        "Allocate memory to hold converted string.\n",
        {nullptr, 0, 6},
        noMemory(6) + refused,
        -1},
       {"realloc_mem=\nMemory allocated.\nConvert string1 to lower.\n",
        {"u_strToLower", 1},
        "-ucnv\nCould not convert to lower case 7\n= -1\n",
        -1},
       {"String1 converted to lower case.\nBuffer size for string2 to allocate is 4  bytes.\n"
        "Allocate memory to hold converted string.\n",
        {nullptr, 0, 4},
        noMemory(4) + refused,
        -1},
       {"realloc_mem=\nMemory allocated.\nConvert string2 to lower.\n",
        {"u_strToLower", 2},
        "-ucnv\nCould convert to lower case 7\n= -1\n",
        -1},
       {"Look for string2 in string1.\n",
        {},
        "Found occurence of string2 in string1.\n-ucnv\n= 1\n",
        1}});
  expectWay(live.get(), one, two, IGNORECASE, ignoring);
}

// What a call leaves on the heap, by the heap's own count; its blocks are too large for a cache.
TEST(Findstr, TwoFailuresLeaveTheFirstBufferBehind) {
  if (!support::heapCanRefuse) {
    GTEST_SKIP() << "a sanitizer's heap does not tell";
  }
  const LiveLocale live(819);
  const std::string one(20000, 'a'); // 40,002 bytes
  const std::string two(15000, 'b'); // 30,002
  const struct {
    const char *function; // fails at this call
    int call;
    size_t reallocSize; // fails
    size_t left;
  } rows[] = {{"none", 0, 0, 0},
              {"ucnv_toUChars", 2, 0, 0},
              {"ucnv_toUChars", 3, 0, 40002},
              {"none", 0, 30002, 40002},
              {"ucnv_toUChars", 4, 0, 0}};
  for (const auto &row : rows) {
    constexpr size_t calls = 8;
    const size_t before = mallinfo2().uordblks;
    for (size_t i = 0; i < calls; ++i) {
      const support::FailingConversion failing(row.function, row.call, U_MEMORY_ALLOCATION_ERROR);
      const support::FailingReallocs refused(row.reallocSize);
      NLS2_Findstr(live.get(), one.data(), 20000, two.data(), 15000, IGNORECASE);
    }
    const auto left = static_cast<double>(mallinfo2().uordblks - before) / calls;
    EXPECT_NEAR(left, static_cast<double>(row.left), 1024) << row.function << ' ' << row.call;
  }
}

} // namespace
