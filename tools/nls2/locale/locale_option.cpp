// The options --locale and --codepage, and the locale object that they ask for.

#include "locale/locale_option.h"

#include "errors.h"
#include "nls2.h"

#include <charconv>
#include <fmt/core.h>
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
    throw usageError("--locale: \"{}\" is no locale; `nls2 locales` lists names and language ids",
                     text);
  }
  UErrorCode error = U_ZERO_ERROR;
  uloc_setDefault(entry->localeName, &error);
  if (U_FAILURE(error)) {
    throw usageError("--locale: {}: {}", text, statusText(error));
  }
}

} // namespace

std::vector<Option> localeOptions(LocaleOptions &options) {
  return {{.name = "locale",
           .metavar = "LOCALE",
           .help = "whose rules: a name or language id of `nls2 locales`",
           .take = [&options](const std::string &text) { options.locale = text; }},
          {.name = "codepage",
           .metavar = "PAGE",
           .help = "code page of all texts; 1208 (UTF-8) by default",
           .take = [&options](const std::string &text) {
             options.codepage = parsePage("--codepage", text);
           }}};
}

LocaleObject::LocaleObject(const LocaleOptions &options) {
  const CodePage opens(options.codepage, "--codepage");
  if (options.locale) {
    makeDefault(*options.locale);
  }
  int32_t status = U_ZERO_ERROR;
  pLocale_ = NLS2_GetLocale(0, 0, 0, &status);
  if (pLocale_ == nullptr) {
    throw usageError("no locale object for the environment's locale {}: {}; give "
                     "--locale",
                     uloc_getDefault(), statusText(status));
  }
  NLS2_SetLocaleNumInfo(pLocale_, NLS2_ATTRIBUTE_CODEPAGE, static_cast<uint32_t>(options.codepage),
                        0);
}

LocaleObject::~LocaleObject() { NLS2_ReleaseLocale(pLocale_); }

} // namespace nls2::tool
