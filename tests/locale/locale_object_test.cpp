// Locale objects: put on the list, validated, read, changed, released.

#include "locale/scenario.h"
#include "support/recording_host.h"
#include "sys1.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <thread>

namespace {

using support::described;
using support::expectScenario;
using support::live;
using support::never;
using support::plain;
using support::said;
using support::traced;

const std::string a = "A en_US 03480001 1208";
const std::string b = "B en_US 03480001 1208";
const std::string c = "C en_US 03480001 1208";

std::string allocate() {
  int32_t status = -1;
  return said(NLS2_allocateLocale(&status) != nullptr, status);
}

std::string releaseTwice(int nth) {
  NLS2_Locale *const object = live(nth);
  const int32_t first = NLS2_ReleaseLocale(object);
  return said(first, NLS2_ReleaseLocale(object));
}

std::string validateCopy() {
  const NLS2_Locale copy = *live(0);
  return said(NLS2_ValidateLocale(&copy));
}

std::string number(NLS2_Locale *object, uint32_t type) {
  int32_t status = -1;
  const uint32_t value = NLS2_GetLocaleNumInfo(object, type, &status);
  return said(status, value);
}

std::string codepage(const NLS2_Locale *object) {
  int32_t status = -1;
  const uint32_t value = NLS2_GetLocaleCodepageId(object, &status);
  return said(status, value);
}

TEST(LocaleObject, IsMadeUsedAndReleased) {
  const support::Scenario rows[] = {
      {"allocate three", traced, [] { return allocate() + ", " + allocate() + ", " + allocate(); },
       "1 0, 1 0, 1 0", said(a, b, c)},
      {"validate a live one",
       traced,
       [] { return said(NLS2_ValidateLocale(live(1))); },
       "0",
       said(a, b),
       {},
       2},
      {"validate a copy", plain, validateCopy, "38", a, {}, 1},
      {"validate null", traced, [] { return said(NLS2_ValidateLocale(nullptr)); }, "38", a, {}, 1},
      {"release the only one", traced, [] { return releaseTwice(0); }, "0 37", "", {}, 1},
      {"release the head", traced, [] { return releaseTwice(0); }, "0 37", said(b, c), {}, 3},
      {"release from the middle",
       traced,
       [] { return releaseTwice(1); },
       "0 37",
       said(a, c),
       {},
       3},
      {"release from the end", traced, [] { return releaseTwice(2); }, "0 37", said(a, b), {}, 3},
      {"release what is not live", traced, [] { return said(NLS2_ReleaseLocale(&never)); }, "37"},
      {"release null", traced, [] { return said(NLS2_ReleaseLocale(nullptr)); }, "37"},
      {"read the language id", traced, [] { return number(live(0), 1); }, "0 55050241", a, {}, 1},
      {"read the code page", traced, [] { return number(live(0), 9); }, "0 1208", a, {}, 1},
      {"read by no selector", traced, [] { return number(live(0), 10); }, "37 0", a, {}, 1},
      {"read what is not live", traced, [] { return number(&never, 9); }, "38 0"},
      {"code page by its own reader", traced, [] { return codepage(live(0)); }, "0 1208", a, {}, 1},
      {"code page of what is not live", traced, [] { return codepage(&never); }, "38 0"},
  };
  for (const auto &row : rows) {
    expectScenario(row);
  }
  if (support::objectsCanFail) {
    expectScenario({"allocate without memory", traced, allocate, "0 32", "", {.noObjects = true}});
  }
}

TEST(LocaleObject, IsChanged) {
  const struct {
    const char *name;
    support::Trace trace;
    uint32_t attribute;
    uint32_t value;
    int32_t status;
    std::string left;
  } rows[] = {
      {"change language and name", traced, 1, 0x00380003, 0, "A fr_BE 00380003 1208"},
      {"change to the second record of a name", plain, 1, 0x02D40004, 0, "A es_ES 02D40004 1208"},
      {"change to a language id that the table lacks", traced, 1, 7, 38, a},
      {"change the code page, unchecked", traced, 9, 0xFFFFFFFF, 0, "A en_US 03480001 4294967295"},
      {"change the language id to 255: kept", traced, 1, 255, 0, a},
      {"change the code page to 255: kept", plain, 9, 255, 0, a},
      {"change by no selector, also with 255", traced, 5, 255, 38, a},
  };
  for (const auto &row : rows) {
    const auto change = [&] {
      return said(NLS2_SetLocaleNumInfo(live(0), row.attribute, row.value, 77));
    };
    expectScenario({row.name, row.trace, change, said(row.status), row.left, {}, 1});
  }
  expectScenario({"change what is not live", traced,
                  [] { return said(NLS2_SetLocaleNumInfo(&never, 9, 37, 77), described(never)); },
                  "38 en_US 03480001 1208"});
}

// Both threads have found the object valid before either gets the lock.
TEST(LocaleObject, IsGoneWhenAnotherThreadReleasedItFaster) {
  const support::Answers defaults;
  const support::Answering answering(defaults);
  for (const bool behindAnother : {false, true}) {
    int32_t status = -1;
    NLS2_Locale *const before = behindAnother ? NLS2_allocateLocale(&status) : nullptr;
    NLS2_Locale *const shared = NLS2_allocateLocale(&status);
    SYS1_GetLock(&LocaleObjectList_Lock);
    const support::Recording recording(support::traceAll);
    int32_t results[2] = {-1, -1};
    std::thread first([&] { results[0] = NLS2_ReleaseLocale(shared); });
    std::thread second([&] { results[1] = NLS2_ReleaseLocale(shared); });
    const auto times = [&](const char *text) {
      const auto lines = recording.lines();
      return std::count(lines.begin(), lines.end(), std::string("NLS2_ReleaseLocale: ") + text);
    };
    while (times("Acquire lock on linked-list.") < 2) {
      std::this_thread::yield();
    }
    SYS1_ReleaseLock(&LocaleObjectList_Lock);
    first.join();
    second.join();
    EXPECT_EQ(said(results[0], results[1]), "0 0");
    EXPECT_EQ(times("Locale structure removed from list."), 1);
    EXPECT_EQ(times("Linked-list has entries"), behindAnother ? 2 : 1);
    EXPECT_EQ(times("Release lock on linked-list."), 2);
    EXPECT_EQ(pLocaleObjectList, before);
    EXPECT_EQ(NLS2_ReleaseLocale(before), behindAnother ? 0 : 37);
  }
}

} // namespace
