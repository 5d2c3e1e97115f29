// The options --locale and --codepage, and the locale that a command follows without --locale.

#include "locale/locale_option.h"

#include "errors.h"
#include "near_names.h"
#include "nls2.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <string_view>
#include <unicode/uloc.h>

namespace nls2::tool {

namespace {

constexpr const char *byCodePoint = "en_US_POSIX"; // ICU's name of the locale C

using Name = std::array<char, ULOC_FULLNAME_CAPACITY>;

template <typename Wanted>
const LocaleMapEntry *firstRecord(Wanted wanted) {
  for (const LocaleMapEntry *entry = localeMap; entry->languageId != NLS2_LANGUAGE_ID_END;
       ++entry) {
    if (wanted(*entry)) {
      return entry;
    }
  }
  return nullptr;
}

// A locale's own name wins over a short name, which may be another locale's own name. A short name
// means the first record with its id.
const LocaleMapEntry *recordNamed(const std::string &name) {
  const LocaleMapEntry *entry =
      firstRecord([&](const LocaleMapEntry &candidate) { return name == candidate.localeName; });
  if (entry != nullptr) {
    return entry;
  }
  int32_t status = 0;
  const uint32_t id = NLS2_LanguageIDFromShortPosixName(name.c_str(), &status);
  return status > 0 ? nullptr : NLS2_GetLocaleMapEntry(id);
}

// Without an encoding and a modifier: de_DE.UTF-8, de_DE@euro, de_DE.ISO-8859-15@euro.
std::string withoutSuffixes(const std::string &name) {
  return name.substr(0, name.find_first_of(".@"));
}

// The script that a POSIX name's modifier asks for, as a part of a BCP 47 tag. Other modifiers,
// such as @euro, do not change the order.
std::string scriptAsked(const std::string &name) {
  return name.ends_with("@latin") ? "-Latn" : name.ends_with("@cyrillic") ? "-Cyrl" : "";
}

// ICU's spelling of a POSIX name or a BCP 47 tag; empty where it is neither.
std::string icuName(const std::string &name) {
  std::string tag = withoutSuffixes(name);
  std::replace(tag.begin(), tag.end(), '_', '-');
  tag.insert(std::min(tag.find('-'), tag.size()), scriptAsked(name));
  Name icu = {};
  int32_t parsed = 0;
  UErrorCode error = U_ZERO_ERROR;
  const int32_t length =
      uloc_forLanguageTag(tag.c_str(), icu.data(), icu.size() - 1, &parsed, &error);
  const bool isTag = U_SUCCESS(error) && parsed == static_cast<int32_t>(tag.size());
  return isTag ? std::string(icu.data(), static_cast<std::size_t>(length)) : "";
}

// The record with a name in any spelling.
const LocaleMapEntry *recordSpelled(const std::string &name) {
  const LocaleMapEntry *entry =
      scriptAsked(name).empty() ? recordNamed(withoutSuffixes(name)) : nullptr;
  return entry != nullptr ? entry : recordNamed(icuName(name));
}

bool isPosix(const std::string &name) {
  const std::string plain = withoutSuffixes(name);
  return plain == "C" || plain == "POSIX" || icuName(name) == byCodePoint;
}

// A locale whose language, script and region are all there: de_Latn_DE for de.
struct FullLocale {
  std::string language, script, region;
};

FullLocale fullLocale(const std::string &name) {
  Name full = {};
  Name part = {};
  UErrorCode error = U_ZERO_ERROR;
  uloc_addLikelySubtags(name.c_str(), full.data(), full.size() - 1, &error);
  const auto get = [&](auto getPart) {
    part = {};
    getPart(full.data(), part.data(), part.size() - 1, &error);
    return std::string(part.data());
  };
  FullLocale locale{get(uloc_getLanguage), get(uloc_getScript), get(uloc_getCountry)};
  if (locale.language == "nb" || locale.language == "no") {
    locale.language = "nn"; // localeMap has one of the Norwegian languages, with the same order
  }
  return locale;
}

// The record that suits best among those of a locale's language: of its script before others, and
// then of its region, of the language's main one, or the first. Null where there is none.
const LocaleMapEntry *recordOfLanguage(const std::string &name) {
  const FullLocale wanted = fullLocale(name);
  const FullLocale main = fullLocale(wanted.language + "_" + wanted.script);
  const LocaleMapEntry *best = nullptr;
  int bestScore = -1;
  firstRecord([&](const LocaleMapEntry &entry) {
    const FullLocale candidate = fullLocale(entry.localeName);
    const int score = candidate.language != wanted.language
                          ? -1
                          : 4 * (candidate.script == wanted.script) +
                                2 * (candidate.region == wanted.region) +
                                (candidate.region == main.region);
    if (score > bestScore) {
      best = &entry;
      bestScore = score;
    }
    return false;
  });
  return best;
}

// " (did you mean ...?)": the language's record first, then names of similar spelling.
std::string suggestions(const std::string &name) {
  std::vector<std::string> known;
  firstRecord([&](const LocaleMapEntry &entry) {
    known.emplace_back(entry.localeName);
    known.emplace_back(entry.shortName);
    return false;
  });
  std::sort(known.begin(), known.end());
  known.erase(std::unique(known.begin(), known.end()), known.end());
  std::vector<std::string> names = nearNames(withoutSuffixes(name), known);
  const std::string icu = icuName(name);
  if (const LocaleMapEntry *entry = icu.empty() ? nullptr : recordOfLanguage(icu)) {
    std::erase(names, entry->localeName);
    names.insert(names.begin(), entry->localeName);
  }
  return didYouMean(names);
}

std::string parseLocale(const std::string &text) {
  const std::optional<uint32_t> id = wholeNumber(text);
  const LocaleMapEntry *entry = id ? NLS2_GetLocaleMapEntry(*id) : recordSpelled(text);
  if (entry != nullptr) {
    return entry->localeName;
  }
  if (isPosix(text)) {
    return byCodePoint;
  }
  throw usageError("--locale: \"{}\" is not a known locale{}; `nls2 locales` lists names and "
                   "language ids",
                   printable(text), suggestions(text));
}

struct EnvironmentLocale {
  const char *variable;
  std::string name;
};

EnvironmentLocale environmentLocale() {
  for (const char *variable : {"LC_ALL", "LC_COLLATE", "LANG"}) {
    const char *value = std::getenv(variable);
    if (value != nullptr && *value != '\0') {
      return {variable, value};
    }
  }
  return {"LANG", "C"};
}

} // namespace

std::string localesNear(const std::string &name) { return suggestions(name); }

std::vector<Option> localeOptions(LocaleOptions &options) {
  return {{.name = "locale",
           .metavar = "LOCALE",
           .help = "whose rules: a name or language id of `nls2 locales`",
           .take = [&options](const std::string &text) { options.locale = parseLocale(text); }},
          {.name = "codepage",
           .metavar = "PAGE",
           .help = "code page of all texts; 1208 (UTF-8) by default",
           .take = [&options](const std::string &text) {
             options.codepage = parsePage("--codepage", text);
           }}};
}

std::string orderLocale(const LocaleOptions &options) {
  if (options.locale) {
    return *options.locale;
  }
  const auto [variable, name] = environmentLocale();
  if (isPosix(name)) {
    return byCodePoint;
  }
  const LocaleMapEntry *entry = recordSpelled(name);
  if (const std::string icu = icuName(name); entry == nullptr && !icu.empty()) {
    entry = recordOfLanguage(icu);
  }
  if (entry == nullptr) {
    throw usageError("{}: \"{}\" is not a known locale{}; give --locale", variable, printable(name),
                     suggestions(name));
  }
  return entry->localeName;
}

bool hasDotlessI(const LocaleOptions &options) {
  const std::string name = options.locale ? *options.locale : icuName(environmentLocale().name);
  const std::string language = name.substr(0, name.find('_'));
  return language == "tr" || language == "az";
}

} // namespace nls2::tool
