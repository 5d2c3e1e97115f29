// Collation, search and case mapping: the known trace of each way out.

#include "nls2.h"
#include "support/known_call.h"
#include "support/table.h"

#include <gtest/gtest.h>
#include <map>
#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/lsan_interface.h>
#endif

namespace {

using namespace std::string_literals;
using support::exact;

const char empty[] = "";
const char letter[] = "a";
char field[4];
// A heap whose first block of a size has an address that ends in 32 zero bits, as the thread
// sanitizer's has, gives it away here: in a trace it would look like 0.
[[maybe_unused]] const auto firstObject = std::make_unique<NLS2_Locale>();
// Without terminators, so that no line may read past the lengths; and with them.
const auto one = exact("xé€z"s);
const auto two = exact("xé"s);
const char ended[] = "xé\0xé€z";

struct Arguments {
  const NLS2_Locale *locale;
  uint32_t options;
  int32_t *status;
};

const std::map<std::string, int32_t (*)(const Arguments &)> functions = {
    {"Strcoll",
     [](const Arguments &a) {
       return NLS2_Strcoll(a.locale, one.get(), 7, two.get(), 3, a.options, a.status);
     }},
    {"Strcoll by terminators",
     [](const Arguments &a) {
       return NLS2_Strcoll(a.locale, ended + 4, -1, ended, -1, a.options, a.status);
     }},
    {"Findstr", // the texts end at their nulls, and have more characters where case counts
     [](const Arguments &a) {
#if defined(__SANITIZE_ADDRESS__)
       const __lsan::ScopedDisabler aLeakIsMeant;
#endif
       return NLS2_Findstr(a.locale, exact("AB\0CD"s).get(), 5, exact("b\0wxyz"s).get(), 6,
                           a.options);
     }},
    {"MapString",
     [](const Arguments &a) {
       return NLS2_MapString(a.locale, field, sizeof field, empty, 77, a.options);
     }},
    {"MapString of text",
     [](const Arguments &a) {
       return NLS2_MapString(a.locale, field, sizeof field, letter, 77, a.options);
     }},
};

TEST(TextTraces, EachWayOut) {
  static const NLS2_Locale unlisted{};
  for (const auto &row : support::tableRows(WAYS_OUT_TSV)) {
    const auto codepage = static_cast<uint32_t>(std::stoul(row.at(2)));
    const support::LiveLocale live(codepage != 0 ? codepage : 819);
    const NLS2_Locale *locale = codepage != 0 ? live.get() : &unlisted;
    const auto options = static_cast<uint32_t>(std::stoul(row.at(3), nullptr, 16));
    support::Names names = {{locale, "locale"}, {field, "dest"}, {empty, "src"}, {letter, "src"}};
    for (const size_t offset :
         std::initializer_list<size_t>{0, 1, 3, 6}) { // where the characters begin
      const std::string behind = offset == 0 ? "" : "+" + std::to_string(offset);
      names.insert(names.end(),
                   {{one.get() + offset, "one" + behind}, {ended + 4 + offset, "one" + behind}});
      if (offset < 3) {
        names.insert(names.end(),
                     {{two.get() + offset, "two" + behind}, {ended + offset, "two" + behind}});
      }
    }
    support::expectKnownCall(row[0] + ", " + row[1], row.at(4), names, [&](int32_t *status) {
      return functions.at(row[0])({locale, options, status});
    });
  }
}

} // namespace
