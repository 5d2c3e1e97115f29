// Resource bundles compiled by genrb: languages, fallback and statuses.

#include "support/live_locale.h"
#include "support/table.h"

#include <unicode/unistr.h>

namespace {

std::string utf8(const UChar *string, int32_t length) {
  std::string text = "(null)";
  if (string != nullptr) {
    text.clear();
    EXPECT_EQ(string[length], 0);
    icu::UnicodeString(string, length).toUTF8String(text);
  }
  return text;
}

TEST(Bundles, StringsAndWarningsByLanguage) {
  for (const auto &row : support::tableRows(BUNDLES_TSV)) {
    SCOPED_TRACE(row.at(0) + " " + row.at(2));
    const support::LiveLocale locale(1208, row.at(0).c_str());
    int32_t length = -9;
    int32_t status = -9;
    UResourceBundle *bundle = NLS2_ResourceOpen(MESSAGES_DIR, locale.get(), &status);
    EXPECT_EQ(std::to_string(status), row.at(1));
    const UChar *string = NLS2_GetStringByKey(bundle, row.at(2).c_str(), &length, &status);
    EXPECT_EQ(utf8(string, length), row.at(3));
    EXPECT_EQ(std::to_string(status), row.at(4));
    NLS2_ResourceClose(bundle);
  }
}

} // namespace
