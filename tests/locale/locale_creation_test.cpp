// Locale objects from the process's defaults, from callers' numbers, and from native names.

#include "locale/scenario.h"

#include <gtest/gtest.h>

namespace {

using support::Answers;
using support::expectScenario;
using support::plain;
using support::said;
using support::traced;

constexpr uint32_t enUs = 0x03480001;
const Answers german{.locale = "de_DE"};
const Answers withoutRecord{.locale = "en"};

std::string longName(size_t length) { return "en_US_" + std::string(length - 6, 'X'); }

// The status and object of NLS2_initLocaleObject, then those of NLS2_allocateLocale.
TEST(InitLocaleObject, TakesTheProcessDefaults) {
  const std::string name131 = longName(131);
  const std::string name132 = longName(132);
  const std::string name133 = longName(133);
  const struct {
    const char *name;
    support::Trace trace;
    Answers answers;
    int32_t status;
    std::string object;
  } rows[] = {
      {"default: a record's own name", plain, {"fr_BE"}, 0, "fr_BE 00380003 1208"},
      {"default: the first of two records", plain, {"es_ES"}, 0, "es_ES 00DE0004 1208"},
      {"default: the base name, not the record's",
       plain,
       {"en_US_POSIX", {"US-ASCII"}},
       0,
       "en_US_POSIX 03480001 367"},
      {"default: keywords", plain, {"de_DE@collation=phonebook"}, 0, "de_DE 01140002 1208"},
      {"default: a short name inside", plain, {"ses_ML"}, 0, "ses_ML 02D40004 1208"},
      {"default: empty", plain, {""}, 0, "en_US 03480001 1208"},
      {"default: nothing is known", traced, {nullptr, {nullptr}}, 0, "en_US 03480001 37"},
      {"default: a language without a country", plain, {"en"}, 37, " 00000000 0"},
      {"default: no record", traced, {"nb_NO"}, 37, " 00000000 0"},
      {"default: only a keyword", plain, {"@calendar=gregorian"}, 37, " 00000000 0"},
      {"default: as long as is stored", plain, {name131.c_str()}, 0, name131 + " 03480001 1208"},
      {"default: fills ICU's buffer", plain, {name132.c_str()}, 0, name131 + " 03480001 1208"},
      {"default: too long for ICU", traced, {name133.c_str()}, 37, " 00000000 0"},
      {"default: a code page that ICU lacks",
       traced,
       {"ses_ML", {"no-such"}},
       4,
       "ses_ML 02D40004 0"},
      {"default: a code page without a number",
       plain,
       {"en_US", {"utf-7"}},
       37,
       "en_US 03480001 0"},
  };
  for (const auto &row : rows) {
    const auto init = [] {
      [[maybe_unused]] const support::MeantLeak converterOfUtf7;
      NLS2_Locale object = {};
      const int32_t status = NLS2_initLocaleObject(&object);
      int32_t allocated = -1;
      NLS2_allocateLocale(&allocated);
      return said(status, support::described(object), allocated);
    };
    expectScenario({row.name, row.trace, init, said(row.status, row.object, row.status),
                    row.status == 0 ? said("A", row.object) : "", row.answers});
  }
}

TEST(GetLocale, FindsTheRecordAndFillsTheObject) {
  const struct {
    const char *name;
    support::Trace trace;
    uint32_t languageId;
    uint32_t codepage;
    uint32_t options;
    std::string left; // empty: status 37
    Answers answers = german;
  } rows[] = {
      {"get: both 0", traced, 0, 0, 0xAB, "A de_DE 01140002 1208"},
      {"get: both 0, defaults fail", traced, 0, 0, 0, "", withoutRecord},
      {"get: the default code page stays", plain, enUs, 0, 0, "A en_US 03480001 1208"},
      {"get: user inputs", traced, enUs, 819, 0, "A en_US 03480001 819"},
      {"get: user inputs, defaults fail", traced, enUs, 819, 0, "", withoutRecord},
      {"get: code pages are not checked", plain, enUs, 0xFFFFFFFF, 0,
       "A en_US 03480001 4294967295"},
      {"get: an id of two records", plain, 0x01140002, 37, 0, "A de_DE 01140002 37"},
      {"get: the one code page in both columns", plain, 0, 912, 0, "A hr_HR 00BF0014 912"},
      {"get: it wins over ids behind it", plain, 0x02680043, 912, 0, "A hr_HR 00BF0014 912"},
      {"get: it loses to ids before it", plain, enUs, 912, 0, "A en_US 03480001 912"},
      {"get: a code page in one column", plain, 0, 819, 0, ""},
      {"get: no record", traced, 0xFFFFFFFF, 1, 0, ""},
      {"get: the terminator's id", plain, 0xFF, 0, 0, ""},
      {"get: 0x2 keeps the defaults", traced, enUs, 819, 0x2, "A de_DE 01140002 1208"},
      {"get: 0x4 keeps the defaults", plain, enUs, 819, 0x4, "A de_DE 01140002 1208"},
      {"get: other bits do not", plain, enUs, 819, 0xFFFFFFF9, "A en_US 03480001 819"},
      {"get: 0x4 still needs a record", plain, 0x12345678, 0, 0x4, ""},
  };
  for (const auto &row : rows) {
    const auto get = [&] {
      int32_t status = -1;
      const auto *object = NLS2_GetLocale(row.languageId, row.codepage, row.options, &status);
      return said(object == pLocaleObjectList, status);
    };
    expectScenario(
        {row.name, row.trace, get, row.left.empty() ? "1 37" : "1 0", row.left, row.answers});
  }
}

std::string thread() { return said(NLS2_GetThreadLocale() != nullptr); }

std::string convert(uint32_t options) {
  int32_t status = -1;
  return said(NLS2_ConvertNativeLocale(nullptr, options, &status) != nullptr, status);
}

TEST(DefaultLocale, IsMadeForThreadsAndNativeNames) {
  const support::Scenario rows[] = {
      {"init", traced, [] { return said(NLS2_Init()); }, "0"},
      {"thread: a new object each time", traced, [] { return said(thread(), thread()); }, "1 1",
       "A de_DE 01140002 1208 B de_DE 01140002 1208", german},
      {"thread: no object", traced, thread, "0", "", {"en_US", {"no-such"}}},
      {"convert: no request", traced, [] { return convert(0xFFFFFFFB); }, "0 37", "", german},
      {"convert: default", traced, [] { return convert(0xFFFFFFFF); }, "1 0",
       "A de_DE 01140002 1208", german},
      {"convert: null alone tells a failure", traced, [] { return convert(4); }, "0 0", "",
       withoutRecord},
  };
  for (const auto &row : rows) {
    expectScenario(row);
  }
}

TEST(SetLocaleFromNative, TellsWhetherAnIdentifierIsKnown) {
  const std::string reaches = std::string(126, 'x') + "en_US";
  const std::string cut = std::string(127, 'x') + "en_US";
  const char *const french = "fr_BE.UTF-8";
  const struct {
    const char *name;
    support::Trace trace;
    std::string identifier;
    uint32_t options;
    Answers answers; // the second code page is the request's own
    int32_t status;
    std::string left = {};
  } rows[] = {
      {"native: a name", plain, "fr_BE", 0, {}, 0},
      {"native: a code set behind it", traced, french, 0, {}, 0},
      {"native: anywhere inside", plain, "ses_ML", 0xFFFFFFFE, {}, 0},
      {"native: unknown", plain, "nb_NO.UTF-8", 0, {}, 38},
      {"native: letter case counts", plain, "en_us", 0, {}, 38},
      {"native: empty", plain, "", 0, {}, 38},
      {"native: POSIX is no C", plain, "POSIX", 0, {}, 38},
      {"native: the last 5 of 131 characters", plain, reaches, 0, {}, 0},
      {"native: cut before its last character", plain, cut, 0, {}, 38},
      {"native: C is the default", plain, "C", 0, {"en_US_POSIX@calendar=gregorian"}, 0},
      {"native: C, the match in a keyword", plain, "C", 0, {"nb_NO@x=en_US"}, 0},
      {"native: C, no record matches", plain, "C", 0, {"en"}, 38},
      {"native: C, an empty default", plain, "C", 0, {""}, 38},
      {"native: C, no default", traced, "C", 0, {nullptr}, 38},
      {"native: thread",
       traced,
       french,
       1,
       {"en_US", {"UTF-8", "US-ASCII"}},
       0,
       "A fr_BE 00380003 367"},
      {"native: thread, no default code page",
       traced,
       french,
       1,
       {"en_US", {"UTF-8", nullptr}},
       0,
       "A fr_BE 00380003 37"},
      {"native: thread, unknown code page",
       traced,
       french,
       1,
       {"en_US", {"UTF-8", "no-such"}},
       4,
       "A en_US 00380003 0"},
      {"native: thread, no object", traced, french, 1, withoutRecord, 38},
  };
  for (const auto &row : rows) {
    const auto set = [&] {
      return said(NLS2_SetLocaleFromNative(row.identifier.c_str(), row.options));
    };
    expectScenario({row.name, row.trace, set, said(row.status), row.left, row.answers});
  }
}

} // namespace
