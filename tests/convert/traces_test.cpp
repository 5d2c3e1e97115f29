// Lengths, Unicode and UTF: the known trace of each way out.

#include "nls2.h"
#include "support/known_call.h"
#include "support/table.h"

#include <gtest/gtest.h>
#include <map>
#include <memory>

namespace {

// `locale` is the row's, `latin1` a live one of 819; `text` is "abcd", as
// large as it is long, and "abc" with its null where the length is to be found.
struct Call {
  const NLS2_Locale *locale, *latin1;
  char *text;
  int32_t capacity, length, *status;
};

// A heap whose first block of a size has an address that ends in 32 zero bits, as the thread
// sanitizer's has, gives it away here: in a trace it would look like 0.
[[maybe_unused]] const auto firstObject = std::make_unique<NLS2_Locale>();

const char euro[] = "\xE2\x82\xAC";
UChar units[4];

// clang-format off
const std::map<std::string, int32_t (*)(const Call &)> functions = {
    {"ConversionRatio to 819", [](const Call &c) { return NLS2_ConversionRatio(c.latin1, c.locale, c.status); }},
    {"ConversionRatio from 819", [](const Call &c) { return NLS2_ConversionRatio(c.locale, c.latin1, c.status); }},
    {"Strlen", [](const Call &c) { return NLS2_Strlen(c.locale, "abc", 0, c.status); }},
    {"ByteLength", [](const Call &c) { return NLS2_ByteLength(c.locale, euro, c.status); }},
    {"StringToDouble", [](const Call &) { return static_cast<int32_t>(NLS2_StringToDouble("1.5", nullptr)); }},
    {"StringToUnicode", [](const Call &c) { return NLS2_StringToUnicode(c.locale, c.text + 2, c.capacity, c.text, c.length, c.status); }},
    {"UnicodeToString", [](const Call &c) { return NLS2_UnicodeToString(c.locale, c.text + 2, c.capacity, c.text, c.length, c.status); }},
    {"toUTF8", [](const Call &c) { return NLS2_toUTF8(c.locale, "ABx", c.length, c.text, c.capacity, c.status); }},
    {"fromUTF8", [](const Call &c) { return NLS2_fromUTF8(c.locale, c.text, c.capacity, "ABx", c.length, c.status); }},
    {"toUTF16", [](const Call &c) { return NLS2_toUTF16(c.locale, "ABx", c.length, units, c.capacity, c.status); }},
    {"fromUTF16", [](const Call &c) { return NLS2_fromUTF16(c.locale, u"ABx", c.capacity, c.text, c.length, c.status); }},
};
// clang-format on

TEST(ConvertTraces, EachWayOut) {
  static const NLS2_Locale unlisted{};
  const support::LiveLocale latin1(819);
  for (const auto &row : support::tableRows(WAYS_OUT_TSV)) {
    const auto codepage = static_cast<uint32_t>(std::stoul(row.at(2)));
    const support::LiveLocale live(codepage != 0 ? codepage : 819);
    const NLS2_Locale *locale = codepage != 0 ? live.get() : &unlisted;
    support::expectKnownCall(
        row.at(0) + ", " + row.at(1), row.at(5),
        {{locale, "locale"}, {latin1.get(), "latin1"}, {euro, "character"}}, [&](int32_t *status) {
          const auto text = support::exact(std::string(row.at(4) == "-1" ? "abc\0" : "abcd", 4));
          const int32_t result =
              functions.at(row.at(0))({locale, latin1.get(), text.get(), std::stoi(row.at(3)),
                                       std::stoi(row.at(4)), status});
          support::mark("text" + support::hexBytes(std::string(text.get(), 4)));
          return result;
        });
  }
}

} // namespace
