// The options --locale and --codepage, and the locale that applies without --locale.

#include "locale/locale_option.h"

#include "base/errors.h"
#include "base/near_names.h"
#include "nls2/language.hpp"

#include <algorithm>
#include <cstdlib>
#include <string_view>
#include <unicode/locid.h>
#include <utility>

namespace nls2::tool {

namespace {

// A locale name wins over a short name, because a short name may be the name of another locale. A
// short name means the first record with its id.
const LocaleMapEntry *recordNamed(const std::string &name) {
  for (const LocaleMapEntry &entry : locale_records()) {
    if (name == entry.localeName) {
      return &entry;
    }
  }
  std::error_code error;
  const language_id id(name, error);
  return error ? nullptr : find_record(id);
}

// The name without encoding and modifier: de_DE.UTF-8, de_DE@euro, de_DE.ISO-8859-15@euro.
std::string withoutSuffixes(const std::string &name) {
  return name.substr(0, name.find_first_of(".@"));
}

// The script that a POSIX modifier means, as part of a BCP 47 tag. Other modifiers, such as @euro,
// do not affect the order.
std::string scriptAsked(const std::string &name) {
  return name.ends_with("@latin") ? "-Latn" : name.ends_with("@cyrillic") ? "-Cyrl" : "";
}

// ICU's spelling of a POSIX name or BCP 47 tag; empty if it is neither.
std::string icuName(const std::string &name) {
  std::string tag = withoutSuffixes(name);
  std::replace(tag.begin(), tag.end(), '_', '-');
  tag.insert(std::min(tag.find('-'), tag.size()), scriptAsked(name));
  char icu[ULOC_FULLNAME_CAPACITY] = "";
  int32_t parsed = 0;
  UErrorCode error = U_ZERO_ERROR;
  uloc_forLanguageTag(tag.c_str(), icu, sizeof icu - 1, &parsed, &error);
  return U_SUCCESS(error) && parsed == static_cast<int32_t>(tag.size()) ? icu : "";
}

// ICU's name of the locale that a name means in any spelling; empty if localeMap lacks it.
std::string knownLocale(const std::string &name) {
  const std::string plain = withoutSuffixes(name);
  const std::string icu = icuName(name);
  if (plain == "C" || plain == "POSIX" || icu == byCodePoint) {
    return std::string(byCodePoint);
  }
  const LocaleMapEntry *entry = scriptAsked(name).empty() ? recordNamed(plain) : nullptr;
  entry = entry != nullptr ? entry : recordNamed(icu);
  return entry != nullptr ? entry->localeName : "";
}

// The locale with its likely script and region: de_Latn_DE for de.
icu::Locale fullLocale(const std::string &name) {
  icu::Locale locale(name.c_str());
  UErrorCode error = U_ZERO_ERROR;
  locale.addLikelySubtags(error);
  return locale;
}

// localeMap has only one of the Norwegian languages; the order is the same. Some languages had
// other codes.
std::string_view languageOf(const icu::Locale &locale) {
  const std::string_view language = locale.getLanguage();
  return language == "nb" || language == "no" ? "nn"
         : language == "iw"                   ? "he"
         : language == "in"                   ? "id"
                                              : language;
}

// The locale in localeMap that suits a language best: of the same script, then of the same region,
// then of the language's main region; else the first. Empty if the language has none.
std::string localeOfLanguage(const std::string &name) {
  const std::string icu = icuName(name);
  if (icu.empty()) {
    return "";
  }
  const icu::Locale wanted = fullLocale(icu);
  const std::string_view script = wanted.getScript();
  const icu::Locale main = fullLocale(fmt::format("{}_{}", languageOf(wanted), script));
  std::string best;
  int bestScore = -1;
  for (const LocaleMapEntry &entry : locale_records()) {
    const icu::Locale candidate = fullLocale(entry.localeName);
    const std::string_view region = candidate.getCountry();
    const int score = 4 * (candidate.getScript() == script) + 2 * (region == wanted.getCountry()) +
                      (region == main.getCountry());
    if (languageOf(candidate) == languageOf(wanted) && score > bestScore) {
      best = entry.localeName;
      bestScore = score;
    }
  }
  return best;
}

std::string parseLocale(const std::string &text) {
  const std::optional<uint32_t> id = wholeNumber(text);
  const LocaleMapEntry *entry = id ? find_record(language_id(*id)) : nullptr;
  std::string known = entry != nullptr ? entry->localeName : knownLocale(text);
  if (known.empty()) {
    throw usageError("--locale: \"{}\" is not a known locale{}; `nls2 locales` lists names and "
                     "language ids",
                     printable(text), localeNear(text));
  }
  return known;
}

// The environment variable that sets the locale, and its value.
std::pair<const char *, std::string> environmentLocale() {
  for (const char *variable : {"LC_ALL", "LC_COLLATE", "LANG"}) {
    if (const char *value = std::getenv(variable); value != nullptr && *value != '\0') {
      return {variable, value};
    }
  }
  return {"LANG", "C"};
}

} // namespace

std::string localeNear(const std::string &name) {
  const std::string ofLanguage = localeOfLanguage(name);
  return ofLanguage.empty() ? "" : didYouMean({ofLanguage});
}

std::vector<Option> localeOptions(LocaleOptions &options, std::vector<Option> own) {
  const auto takeLocale = [&](const std::string &text) { options.locale = parseLocale(text); };
  own.insert(
      own.begin(),
      {value("locale", "LOCALE", "locale whose rules apply: a name or id from `nls2 locales`",
             takeLocale),
       pageValue("codepage", "code page of all texts; 1208 (UTF-8) by default", options.codepage)});
  return own;
}

std::string orderLocale(const LocaleOptions &options) {
  if (options.locale) {
    return *options.locale;
  }
  const auto [variable, name] = environmentLocale();
  const std::string known = knownLocale(name);
  std::string locale = known.empty() ? localeOfLanguage(name) : known;
  if (locale.empty()) {
    throw usageError(
        "{}: \"{}\" is not a known locale{}; use --locale with a name that `nls2 locales` lists",
        variable, printable(name), localeNear(name));
  }
  return locale;
}

std::string caseLocale(const LocaleOptions &options) {
  return options.locale ? *options.locale : icuName(environmentLocale().second);
}

} // namespace nls2::tool
