// Records of the library's table of locales: which ones are meant.

#include "locale/locale_lookup.h"

#include "near_names.h"
#include "options.h"

#include <algorithm>
#include <set>
#include <string_view>
#include <strings.h>
#include <unicode/uloc.h>

namespace nls2::tool {

namespace {

template <class IsWanted>
LocaleRecords recordsThat(IsWanted isWanted) {
  LocaleRecords records;
  for (const LocaleMapEntry *entry = localeMap; entry->languageId != NLS2_LANGUAGE_ID_END;
       ++entry) {
    if (isWanted(*entry)) {
      records.push_back(entry);
    }
  }
  return records;
}

FoundLocales recordsWith(uint32_t number) {
  LocaleRecords records =
      recordsThat([=](const auto &entry) { return entry.languageId == number; });
  if (!records.empty()) {
    return {"language id", std::move(records), {}};
  }
  return {"code page",
          recordsThat([=](const auto &entry) {
            return entry.asciiCcsid == number || entry.ebcdicCcsid == number;
          }),
          {}};
}

FoundLocales recordsWith(const std::string &name) {
  return {"name",
          recordsThat([&](const auto &entry) {
            return entry.localeName == name || entry.shortName == name;
          }),
          {}};
}

std::vector<std::string> namesOf(const LocaleRecords &records) {
  std::vector<std::string> names;
  for (const LocaleMapEntry *entry : records) {
    names.emplace_back(entry->localeName);
  }
  return names;
}

// As the table spells names, but for case: without code set and modifier, and with underscores.
std::string plainName(const std::string &asked) {
  std::string name = asked.substr(0, asked.find_first_of(".@"));
  std::replace(name.begin(), name.end(), '-', '_');
  return name;
}

// The locale that people mean by a language alone: en_US by en.
std::string usualLocaleOf(const std::string &language) {
  char full[ULOC_FULLNAME_CAPACITY];
  char country[ULOC_COUNTRY_CAPACITY];
  UErrorCode status = U_ZERO_ERROR;
  uloc_addLikelySubtags(language.c_str(), full, sizeof full, &status);
  const int32_t length = uloc_getCountry(full, country, sizeof country, &status);
  return U_SUCCESS(status) && length > 0 ? language + "_" + country : language;
}

} // namespace

LocaleRecords allLocales() {
  return recordsThat([](const auto &) { return true; });
}

FoundLocales lookUpLocale(const std::string &asked) {
  const auto number = wholeNumber(asked);
  FoundLocales found = number ? recordsWith(*number) : recordsWith(asked);
  if (found.records.empty()) {
    throw failure("no locale has the {} {}{}; `nls2 locales` lists them all",
                  number ? "language id or code page" : "locale name or short name",
                  printable(asked), number ? "" : didYouMean(nearLocales(asked)));
  }
  std::set<int32_t> pages;
  for (const LocaleMapEntry *entry : found.records) {
    pages.insert(static_cast<int32_t>(entry->asciiCcsid));
    pages.insert(static_cast<int32_t>(entry->ebcdicCcsid));
  }
  for (const int32_t page : pages) {
    found.pages.push_back(describePage(page));
  }
  return found;
}

std::vector<std::string> nearLocales(const std::string &asked) {
  const std::string name = plainName(asked);
  const std::string language = name.substr(0, name.find('_'));
  const auto spelled = [](const std::string &wanted) {
    return namesOf(recordsThat(
        [&](const auto &entry) { return strcasecmp(entry.localeName, wanted.c_str()) == 0; }));
  };
  for (const std::string &wanted : {name, usualLocaleOf(language)}) {
    if (std::vector<std::string> names = spelled(wanted); !names.empty()) {
      return names;
    }
  }
  return nearNames(name, namesOf(allLocales()));
}

} // namespace nls2::tool
