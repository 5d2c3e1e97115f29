// The options --locale and --codepage, and the locale object that they ask for.

#include "locale/locale_option.h"

#include "errors.h"
#include "nls2.h"
#include "number_option.h"
#include "status.h"

#include <charconv>
#include <fmt/core.h>
#include <limits>
#include <string_view>
#include <unicode/uloc.h>
#include <unicode/utypes.h>

namespace nls2::tool {

namespace {

// 0, which is no language's id, where the text is not a number.
uint32_t languageIdIn(std::string_view text) {
  const bool hex = text.starts_with("0x") || text.starts_with("0X");
  text.remove_prefix(hex ? 2 : 0);
  const char *end = text.data() + text.size();
  uint32_t id = 0;
  const auto [stop, error] = std::from_chars(text.data(), end, id, hex ? 16 : 10);
  return error == std::errc() && stop == end ? id : 0;
}

// A locale's own name wins over a short name, which may be another locale's own name.
const LocaleMapEntry *findLocale(const std::string &text) {
  if (const uint32_t id = languageIdIn(text); id != 0) {
    return NLS2_GetLocaleMapEntry(id);
  }
  for (const LocaleMapEntry *entry = localeMap; entry->languageId != NLS2_LANGUAGE_ID_END;
       ++entry) {
    if (text == entry->localeName) {
      return entry;
    }
  }
  int32_t status = U_ZERO_ERROR;
  const uint32_t id = NLS2_LanguageIDFromShortPosixName(text.c_str(), &status);
  return status > U_ZERO_ERROR ? nullptr : NLS2_GetLocaleMapEntry(id);
}

// Asked for by its language id, fi_FI would be sv_FI, the first record that has the id; and no
// object at all is made while the process's default locale is one that the table does not hold.
// As the process's default every locale of the table is itself.
void makeDefault(const std::string &text) {
  const LocaleMapEntry *entry = findLocale(text);
  if (entry == nullptr) {
    throw UsageError(fmt::format(
        "--locale: \"{}\" is no locale; `nls2 locales` lists names and language ids", text));
  }
  UErrorCode error = U_ZERO_ERROR;
  uloc_setDefault(entry->localeName, &error);
  if (U_FAILURE(error)) {
    throw UsageError(fmt::format("--locale: {}: {}", text, statusName(error)));
  }
}

} // namespace

void addLocaleOptions(CLI::App &command, LocaleOptions &options) {
  command
      .add_option("--locale", options.locale,
                  "whose rules: a name or a language id (decimal or 0x...) of `nls2 locales`; the "
                  "default is the environment's locale (LC_ALL, LC_MESSAGES or LANG), of which C "
                  "sorts ASCII by its codes")
      ->type_name("NAME-OR-ID");
  addNumber(command, "--codepage", options.codepage, std::numeric_limits<int32_t>::min(),
            std::numeric_limits<int32_t>::max(), "code page of all texts; 1208 (UTF-8) by default");
}

LocaleObject::LocaleObject(const LocaleOptions &options) {
  requireCodePage(options.codepage, "--codepage");
  if (options.locale) {
    makeDefault(*options.locale);
  }
  int32_t status = U_ZERO_ERROR;
  pLocale_ = NLS2_GetLocale(0, 0, 0, &status);
  if (pLocale_ == nullptr) {
    throw UsageError(fmt::format("no locale object for the environment's locale {}: {}; give "
                                 "--locale",
                                 uloc_getDefault(), statusName(status)));
  }
  NLS2_SetLocaleNumInfo(pLocale_, NLS2_ATTRIBUTE_CODEPAGE, static_cast<uint32_t>(options.codepage),
                        0);
}

LocaleObject::~LocaleObject() { NLS2_ReleaseLocale(pLocale_); }

} // namespace nls2::tool
